// Who uses menus: the keyboard and the mouse on a window, and TrackPopupMenu.

#include "qxcore/platform/posix/window/controls.h"
#include "qxcore/platform/posix/window/default_proc.h"
#include "qxcore/platform/posix/window/menu_loop.h"
#include "qxcore/platform/posix/window/send.h"

namespace platform::model {

void UseMenuBarByKey(HWND window, WCHAR key) {
  const HMENU menu = GetMenu(window);
  if (!IsMenu(menu) || GetMenuItemCount(menu) == 0) return;
  OrNoMemory<int>(0, [&] {
    MenuLoop loop(window, menu, 0, true, false);
    if (!loop.Begin()) return 0;
    if (key == 0) {
      loop.SelectNext(1);
      loop.Run();
    } else if (loop.ChooseMnemonic(key)) {
      loop.Run();
    } else {
      MessageBeep(0);
    }
    loop.End();
    return 0;
  });
}

void UseMenuBarByMouse(HWND window, POINT point) {
  const HMENU menu = GetMenu(window);
  if (!IsMenu(menu)) return;
  OrNoMemory<int>(0, [&] {
    MenuLoop loop(window, menu, 0, true, false);
    if (!loop.Begin()) return 0;
    if (loop.PressAt(point)) loop.Run();
    loop.End();
    return 0;
  });
}

// What cannot be done to the window as it is now is grey.
static void UpdateSystemMenu(HWND window, HMENU menu) {
  const auto style = static_cast<DWORD>(GetWindowLongW(window, GWL_STYLE));
  const bool isSmall = style & WS_MINIMIZE, isLarge = style & WS_MAXIMIZE;
  const auto allow = [menu](UINT command, bool isPossible) {
    EnableMenuItem(menu, command, isPossible ? MF_ENABLED : MF_GRAYED);
  };
  allow(SC_RESTORE, isSmall || isLarge);
  allow(SC_MOVE, !isLarge);
  allow(SC_SIZE, (style & WS_THICKFRAME) && !isSmall && !isLarge);
  allow(SC_MINIMIZE, (style & WS_MINIMIZEBOX) && !isSmall);
  allow(SC_MAXIMIZE, (style & WS_MAXIMIZEBOX) && !isLarge);
}

void UseSystemMenu(HWND window) {
  const HMENU menu = GetSystemMenu(window, FALSE);
  if (menu == nullptr) return;
  UpdateSystemMenu(window, menu);
  OrNoMemory<int>(0, [&] {
    MenuLoop loop(window, menu, 0, false, true);
    if (!loop.Begin()) return 0;
    RECT rect;
    GetWindowRect(window, &rect);
    Send(window, WM_INITMENUPOPUP, reinterpret_cast<WPARAM>(menu), MAKELPARAM(0, 1));
    loop.ShowTop({rect.left, rect.top + GetSystemMetrics(SM_CYCAPTION)});
    loop.SelectNext(1);
    loop.Run();
    loop.End();
    return 0;
  });
}

// The window that shows a popup; the loop does everything else.
LRESULT CALLBACK MenuWindowProcedure(HWND window, UINT message, WPARAM wParam, LPARAM lParam) {
  switch (message) {
    case WM_MOUSEACTIVATE:
      return MA_NOACTIVATE;
    case WM_ERASEBKGND:
      return TRUE;
    case WM_PAINT:
      if (g_painter.popupMenu != nullptr)
        g_painter.popupMenu(window, reinterpret_cast<HMENU>(GetWindowLongPtrW(window, 0)));
      ValidateRect(window, nullptr);
      return 0;
    default:
      return DefWindowProcW(window, message, wParam, lParam);
  }
}

}  // namespace platform::model

using namespace platform::model;

BOOL TrackPopupMenu(HMENU menu, UINT flags, int x, int y, int, HWND owner, const RECT*) {
  if (!IsMenu(menu)) return Fail(ERROR_INVALID_MENU_HANDLE);
  if (!IsWindow(owner)) return Fail(ERROR_INVALID_WINDOW_HANDLE);
  return OrNoMemory<BOOL>(FALSE, [&]() -> BOOL {
    MenuLoop loop(owner, menu, flags, false, false);
    if (!loop.Begin()) return FALSE;
    if (!(flags & TPM_NONOTIFY)) Send(owner, WM_INITMENUPOPUP, reinterpret_cast<WPARAM>(menu), 0);
    const SIZE size = MeasurePopup(menu);
    if (flags & TPM_RIGHTALIGN) x -= size.cx;
    if (flags & TPM_CENTERALIGN) x -= size.cx / 2;
    if (flags & TPM_BOTTOMALIGN) y -= size.cy;
    if (flags & TPM_VCENTERALIGN) y -= size.cy / 2;
    loop.ShowTop({x, y});
    const UINT command = loop.Run();
    loop.End();
    return flags & TPM_RETURNCMD ? static_cast<BOOL>(command) : TRUE;
  });
}

BOOL TrackPopupMenuEx(HMENU menu, UINT flags, int x, int y, HWND owner, TPMPARAMS*) {
  return TrackPopupMenu(menu, flags, x, y, 0, owner, nullptr);
}

// The loop sees that its window is no longer the owner of a menu.
BOOL EndMenu() {
  Thread* thread = CurrentThread();
  const Guard guard;
  thread->menuOwner = nullptr;
  Wake(thread);
  return TRUE;
}
