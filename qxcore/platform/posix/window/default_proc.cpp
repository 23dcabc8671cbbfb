// DefWindowProcW: which default answer belongs to which message.

#include "qxcore/platform/posix/window/default_proc.h"

#include "qxcore/platform/posix/window/controls.h"
#include "qxcore/platform/posix/window/send.h"
#include "qxcore/platform/posix/window/tree.h"

namespace platform::model {
namespace {

HWND ParentOf(HWND handle) {
  const Guard guard;
  const Window* window = FindWindowObject(handle);
  return window != nullptr && window->IsChild() ? HandleOf(window->parent) : nullptr;
}

LRESULT AskParent(HWND handle, UINT message, WPARAM wParam, LPARAM lParam) {
  const HWND parent = ParentOf(handle);
  return parent != nullptr ? Send(parent, message, wParam, lParam) : 0;
}

LRESULT NcCreate(HWND handle, const CREATESTRUCTW* create) {
  const bool hasName = create != nullptr && create->lpszName != nullptr && !IS_INTRESOURCE(create->lpszName);
  return !hasName || SetText(handle, create->lpszName);
}

LRESULT Activated(HWND handle, WPARAM wParam) {
  if (LOWORD(wParam) != WA_INACTIVE && !IsIconic(handle)) SetFocus(handle);
  return 0;
}

LRESULT CancelMode(HWND handle) {
  if (CurrentThread()->menuOwner == handle) EndMenu();
  if (GetCapture() == handle) ReleaseCapture();
  return 0;
}

LRESULT Icon(HWND handle, UINT which, const HICON* icon) {
  const Guard guard;
  Window* window = FindWindowObject(handle);
  if (window == nullptr || which > ICON_BIG) return 0;
  const HICON old = window->icons[which];
  if (icon != nullptr) window->icons[which] = *icon;
  return reinterpret_cast<LRESULT>(old);
}

LRESULT RightButtonUp(HWND handle, LPARAM lParam) {
  POINT point = PointOf(lParam);
  ClientToScreen(handle, &point);
  Send(handle, WM_CONTEXTMENU, reinterpret_cast<WPARAM>(handle), PointParam(point.x, point.y));
  return 0;
}

LRESULT ControlColor(UINT message, WPARAM context) {
  if (g_painter.controlBrush == nullptr) return 0;
  return reinterpret_cast<LRESULT>(g_painter.controlBrush(reinterpret_cast<HDC>(context), message));
}

}  // namespace
}  // namespace platform::model

using namespace platform::model;

LRESULT DefWindowProcW(HWND window, UINT message, WPARAM wParam, LPARAM lParam) {
  switch (message) {
    case WM_NCCREATE:
      return NcCreate(window, reinterpret_cast<const CREATESTRUCTW*>(lParam));
    case WM_SETTEXT:
      return DefaultSetText(window, reinterpret_cast<LPCWSTR>(lParam));
    case WM_GETTEXT:
      return DefaultGetText(window, wParam, reinterpret_cast<LPWSTR>(lParam));
    case WM_GETTEXTLENGTH:
      return DefaultGetTextLength(window);
    case WM_NCCALCSIZE:
      return DefaultCalcSize(window, static_cast<BOOL>(wParam), lParam);
    case WM_NCHITTEST:
      return DefaultHitTest(window, PointOf(lParam));
    case WM_NCPAINT:
      PaintFrame(window);
      return 0;
    case WM_NCACTIVATE:
      return DefaultNcActivate(window, static_cast<BOOL>(wParam));
    case WM_WINDOWPOSCHANGING:
      return DefaultPosChanging(window, reinterpret_cast<WINDOWPOS*>(lParam));
    case WM_WINDOWPOSCHANGED:
      return DefaultPosChanged(window, reinterpret_cast<const WINDOWPOS*>(lParam));
    case WM_SHOWWINDOW:
      return DefaultShowWindow(window, static_cast<BOOL>(wParam), lParam);
    case WM_SETREDRAW:
      return DefaultSetRedraw(window, static_cast<BOOL>(wParam));
    case WM_ERASEBKGND:
    case WM_ICONERASEBKGND:
      return DefaultEraseBackground(window, reinterpret_cast<HDC>(wParam));
    case WM_PAINT:
      return DefaultPaint(window);
    case WM_ACTIVATE:
      return Activated(window, wParam);
    case WM_MOUSEACTIVATE:
      return DefaultMouseActivate(window, wParam, lParam);
    case WM_SETCURSOR:
      return DefaultSetCursor(window, wParam, lParam);
    case WM_CANCELMODE:
      return CancelMode(window);
    case WM_CLOSE:
      DestroyWindow(window);
      return 0;
    case WM_NCLBUTTONDOWN:
      return DefaultNcButtonDown(window, wParam, lParam);
    case WM_NCLBUTTONDBLCLK:
      return DefaultNcDoubleClick(window, wParam, lParam);
    case WM_SYSCOMMAND:
      return DefaultSysCommand(window, wParam, lParam);
    case WM_KEYDOWN:
    case WM_KEYUP:
    case WM_SYSKEYDOWN:
    case WM_SYSKEYUP:
    case WM_SYSCHAR:
      return DefaultKey(window, message, wParam, lParam);
    case WM_RBUTTONUP:
      return RightButtonUp(window, lParam);
    case WM_MOUSEWHEEL:
    case WM_MOUSEHWHEEL:
    case WM_CONTEXTMENU:
    case WM_HELP:
      return AskParent(window, message, wParam, lParam);
    case WM_GETICON:
      return Icon(window, static_cast<UINT>(wParam), nullptr);
    case WM_SETICON: {
      const HICON icon = reinterpret_cast<HICON>(lParam);
      return Icon(window, static_cast<UINT>(wParam), &icon);
    }
    case WM_CTLCOLORMSGBOX:
    case WM_CTLCOLOREDIT:
    case WM_CTLCOLORLISTBOX:
    case WM_CTLCOLORBTN:
    case WM_CTLCOLORDLG:
    case WM_CTLCOLORSCROLLBAR:
    case WM_CTLCOLORSTATIC:
      return ControlColor(message, wParam);
    case WM_NOTIFYFORMAT:
      return lParam == NF_QUERY ? NFR_UNICODE : 0;
    case WM_QUERYOPEN:
    case WM_QUERYENDSESSION:
      return TRUE;
    case WM_VKEYTOITEM:
    case WM_CHARTOITEM:
      return -1;
    default:
      return 0;
  }
}
