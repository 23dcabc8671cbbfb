#include "qxcore/ui/app/lock_redraw.h"

#include <utility>

#include "qxcore/container/map.h"
#include "qxcore/ui/window/thread_state.h"
#include "qxcore/ui/window/window.h"

static SMap<HWND, int>& Locks() {
  static SMap<HWND, int>& locks = *new SMap<HWND, int>;
  return locks;
}

static void Release(HWND window, bool redraw) {
  int* count = Locks().Retrieve(window);
  if (count == nullptr || --*count > 0) return;
  Locks().Remove(window);
  if (!::IsWindow(window)) return;
  ::SendMessageW(window, WM_SETREDRAW, 1, 0);
  if (redraw) ::RedrawWindow(window, nullptr, nullptr, RDW_INVALIDATE | RDW_ERASE | RDW_FRAME | RDW_ALLCHILDREN);
}

SLockRedraw::~SLockRedraw() { Release(std::exchange(m_window, nullptr), m_redraw != 0); }

void SLockRedraw::Lock(SWnd* window, int redraw) {
  Unlock();
  const HWND handle = window->GetSafeHwnd();
  if (!::IsWindow(handle)) return;
  const bool isFirst = ++Locks()[handle] == 1;
  m_window = handle;
  m_redraw = redraw;
  if (isFirst) SSent(::SendMessageW(handle, WM_SETREDRAW, 0, 0));
}

void SLockRedraw::Unlock(int redraw) {
  if (m_window == nullptr) return;
  Release(std::exchange(m_window, nullptr), (redraw < 0 ? m_redraw : redraw) != 0);
  SWndThreadState::Get().ThrowException();
}

int SLockRedraw::LockCount(SWnd* window) {
  const int* count = Locks().Retrieve(window->GetSafeHwnd());
  return count != nullptr ? *count : 0;
}
