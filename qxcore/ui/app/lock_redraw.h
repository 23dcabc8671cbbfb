// SLockRedraw: suspends a window's redrawing until the end of a block.
//
// Locks nest by window: it is drawn again when the last one is gone. A window that is destroyed meanwhile is forgotten.
// For the user-interface thread.
#pragma once

#include "qxcore/platform/export.h"
#include "qxcore/platform/win32.h"

class SWnd;

class QXCORE_API SLockRedraw {
 public:
  SLockRedraw() noexcept = default;                     // locks nothing
  explicit SLockRedraw(SWnd* window) { Lock(window); }  // locks the window
  SLockRedraw(const SLockRedraw&) = delete;
  SLockRedraw& operator=(const SLockRedraw&) = delete;
  ~SLockRedraw();  // unlocks and draws anew; what a handler throws meanwhile is kept

  // Locks a window, and unlocks the one that was locked before; `redraw` is what Unlock without an argument does.
  // A null or destroyed window is not locked. Throws SEOutOfMemory.
  void Lock(SWnd* window, int redraw = 1);
  // Unlocks it; nonzero draws it anew, with all its children, when this was the last lock; -1 as Lock was told.
  void Unlock(int redraw = -1);

  // How many locks the window has.
  static int LockCount(SWnd* window);

 private:
  HWND m_window = nullptr;  // null while nothing is locked
  int m_redraw = 1;
};
