// Moves windows in one batch, so that each is erased and painted once, in its new place.
#pragma once

#include <algorithm>

#include "qxcore/graphics/rect.h"
#include "qxcore/ui/window/thread_state.h"

class SDeferredMoves {
 public:
  explicit SDeferredMoves(int count) : m_batch(::BeginDeferWindowPos(count)) {}
  SDeferredMoves(const SDeferredMoves&) = delete;
  SDeferredMoves& operator=(const SDeferredMoves&) = delete;

  // Without a batch, which the system may refuse, a window moves at once.
  void Move(HWND window, const SRect& rect, UINT flags = 0) {
    const UINT all = flags | SWP_NOZORDER | SWP_NOACTIVATE | SWP_DEFERERASE;
    const int width = std::max(rect.Width(), 0), height = std::max(rect.Height(), 0);
    if (m_batch != nullptr) {
      m_batch = ::DeferWindowPos(m_batch, window, nullptr, rect.left, rect.top, width, height, all);
    } else {
      SSent(::SetWindowPos(window, nullptr, rect.left, rect.top, width, height, all));
    }
  }

  // Moves them all. Throws what a handler threw.
  void End() {
    if (m_batch != nullptr) SSent(::EndDeferWindowPos(m_batch));
    m_batch = nullptr;
  }

 private:
  HDWP m_batch;
};
