// A modal loop of a window: announced from its construction, so that it can be ended before it runs.
#pragma once

#include "qxcore/ui/window/thread_state.h"

class SModalLoop {
 public:
  explicit SModalLoop(SWnd* window);
  SModalLoop(const SModalLoop&) = delete;
  SModalLoop& operator=(const SModalLoop&) = delete;
  ~SModalLoop();

  // Takes messages as SWnd::RunModalLoop says, whose flags these are; not at all when the loop has been ended already.
  // Returns what EndModalLoop was given, or -1.
  int Run(DWORD flags);

  // The innermost loop of the window that has not ended, or null.
  static SWndThreadState::ModalLoop* InnermostOf(const SWnd* window);
  // Whether the window has a loop, though it may have ended and not returned yet.
  static bool Exists(const SWnd* window);

 private:
  bool Continues() const;

  SWndThreadState& m_state;
  SWndThreadState::ModalLoop m_record;
};
