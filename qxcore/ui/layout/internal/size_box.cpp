#include "qxcore/ui/layout/internal/size_box.h"

#include "qxcore/ui/window/thread_state.h"

static constexpr LONG kKinds = SBS_SIZEGRIP | SBS_SIZEBOX;

bool SIsInSizingCorner(HWND window) {
  const HWND top = ::GetAncestor(window, GA_ROOT);
  if (top == nullptr || ::IsZoomed(top) || (::GetWindowLongW(top, GWL_STYLE) & WS_THICKFRAME) == 0) return false;
  RECT own, client;
  if (!::GetWindowRect(window, &own) || !::GetClientRect(top, &client)) return false;
  ::MapWindowPoints(top, nullptr, reinterpret_cast<POINT*>(&client), 2);
  return own.right == client.right && own.bottom == client.bottom;
}

void SUpdateSizeBox(HWND box, HWND container) {
  const bool isGrip = SIsInSizingCorner(container);
  const LONG style = ::GetWindowLongW(box, GWL_STYLE);
  const LONG kind = isGrip ? SBS_SIZEGRIP : SBS_SIZEBOX;
  if ((style & kKinds) == kind) return;
  ::SetWindowLongW(box, GWL_STYLE, (style & ~kKinds) | kind);
  ::EnableWindow(box, isGrip);
  ::InvalidateRect(box, nullptr, TRUE);
  SWndThreadState::Get().ThrowException();
}

bool SPassOnSizing(HWND container, UINT id, LPARAM lParam) {
  if ((id & 0xFFF0) != SC_SIZE || (::GetWindowLongW(container, GWL_STYLE) & WS_CHILD) == 0) return false;
  SSent(::SendMessageW(::GetAncestor(container, GA_ROOT), WM_SYSCOMMAND, id, lParam));
  return true;
}
