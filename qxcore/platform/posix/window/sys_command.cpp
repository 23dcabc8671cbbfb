// What the non-client area does: system commands, moving and sizing with the mouse or the keyboard.

#include "qxcore/platform/posix/window/activate.h"
#include "qxcore/platform/posix/window/default_proc.h"
#include "qxcore/platform/posix/window/frame.h"
#include "qxcore/platform/posix/window/menu.h"
#include "qxcore/platform/posix/window/place.h"
#include "qxcore/platform/posix/window/scroll.h"
#include "qxcore/platform/posix/window/send.h"
#include "qxcore/platform/posix/window/tree.h"

namespace platform::model {
namespace {

DWORD StyleOf(HWND handle) {
  const Guard guard;
  const Window* window = FindWindowObject(handle);
  return window != nullptr ? window->style : 0;
}

// WMSZ_ values say which edges follow the mouse; 0 moves the window.
bool HasLeft(UINT edge) { return edge == WMSZ_LEFT || edge == WMSZ_TOPLEFT || edge == WMSZ_BOTTOMLEFT; }
bool HasRight(UINT edge) { return edge == WMSZ_RIGHT || edge == WMSZ_TOPRIGHT || edge == WMSZ_BOTTOMRIGHT; }
bool HasTop(UINT edge) { return edge == WMSZ_TOP || edge == WMSZ_TOPLEFT || edge == WMSZ_TOPRIGHT; }
bool HasBottom(UINT edge) { return edge == WMSZ_BOTTOM || edge == WMSZ_BOTTOMLEFT || edge == WMSZ_BOTTOMRIGHT; }

// Keeps a dragged size within the limits, by the edge that is dragged.
void Limit(RECT& rect, UINT edge, const MINMAXINFO& limits) {
  const int width = std::clamp<int>(Width(rect), limits.ptMinTrackSize.x, limits.ptMaxTrackSize.x);
  const int height = std::clamp<int>(Height(rect), limits.ptMinTrackSize.y, limits.ptMaxTrackSize.y);
  (HasLeft(edge) ? rect.left : rect.right) = HasLeft(edge) ? rect.right - width : rect.left + width;
  (HasTop(edge) ? rect.top : rect.bottom) = HasTop(edge) ? rect.bottom - height : rect.top + height;
}

RECT Dragged(const RECT& start, UINT edge, int dx, int dy) {
  if (edge == 0) return Moved(start, dx, dy);
  return {start.left + (HasLeft(edge) ? dx : 0), start.top + (HasTop(edge) ? dy : 0),
          start.right + (HasRight(edge) ? dx : 0), start.bottom + (HasBottom(edge) ? dy : 0)};
}

RECT PlaceInParent(HWND handle) {
  const Guard guard;
  const Window* window = FindWindowObject(handle);
  return window != nullptr ? window->window : RECT{};
}

// Follows the mouse until the button comes up; the arrow keys move by a step, Enter ends, Escape goes back.
void DragWindow(HWND handle, UINT edge, POINT start, bool byMouse) {
  const RECT before = PlaceInParent(handle);
  const MINMAXINFO limits = AskLimits(handle);
  if (CbtRefuses(HCBT_MOVESIZE, reinterpret_cast<WPARAM>(handle), reinterpret_cast<LPARAM>(&before))) return;
  SetCapture(handle);
  Send(handle, WM_ENTERSIZEMOVE);
  RECT now = before;
  POINT point = start;
  const auto follow = [&] {
    RECT wanted = Dragged(before, edge, point.x - start.x, point.y - start.y);
    if (edge != 0) Limit(wanted, edge, limits);
    if (Same(wanted, now)) return;
    Send(handle, edge != 0 ? WM_SIZING : WM_MOVING, edge, reinterpret_cast<LPARAM>(&wanted));
    now = wanted;
    SetWindowPos(handle, nullptr, now.left, now.top, Width(now), Height(now), edge == 0 ? SWP_NOSIZE : 0u);
  };
  MSG message;
  bool wasCancelled = false;
  while (GetCapture() == handle && GetMessageW(&message, nullptr, 0, 0) > 0) {
    if (message.message == WM_MOUSEMOVE) {
      point = message.pt;
      follow();
    } else if (message.message == WM_LBUTTONUP && byMouse) {
      break;
    } else if (message.message == WM_KEYDOWN) {
      constexpr int kStep = 8;
      if (message.wParam == VK_RETURN) break;
      if (message.wParam == VK_ESCAPE) {
        wasCancelled = true;
        break;
      }
      if (message.wParam == VK_LEFT) point.x -= kStep;
      if (message.wParam == VK_RIGHT) point.x += kStep;
      if (message.wParam == VK_UP) point.y -= kStep;
      if (message.wParam == VK_DOWN) point.y += kStep;
      follow();
    } else {
      TranslateMessage(&message);
      DispatchMessageW(&message);
    }
  }
  if (GetCapture() == handle) ReleaseCapture();
  if (!IsWindow(handle)) return;
  if (wasCancelled && !Same(now, before))
    SetWindowPos(handle, nullptr, before.left, before.top, Width(before), Height(before), SWP_NOZORDER);
  Send(handle, WM_EXITSIZEMOVE);
}

void SizeOrMove(HWND handle, UINT command, POINT point) {
  const UINT edge = command & 0x0F;
  const bool sizes = (command & 0xFFF0) == SC_SIZE;
  const DWORD style = StyleOf(handle);
  if (style & WS_MAXIMIZE || (sizes && !(style & WS_THICKFRAME))) return;
  // Without an edge the keyboard drives: a move, or sizing from the lower right corner.
  const bool byMouse = edge != 0;
  if (!sizes) {
    DragWindow(handle, 0, point, byMouse);
  } else {
    DragWindow(handle, byMouse ? edge : WMSZ_BOTTOMRIGHT, point, byMouse);
  }
}

// A button of the caption acts when it is released over itself.
bool IsReleasedOver(HWND handle, int part) {
  SetCapture(handle);
  bool isOver = true;
  MSG message;
  while (GetCapture() == handle && GetMessageW(&message, nullptr, 0, 0) > 0) {
    if (message.message == WM_LBUTTONUP || message.message == WM_MOUSEMOVE)
      isOver = DefaultHitTest(handle, message.pt) == part;
    if (message.message == WM_LBUTTONUP) break;
    if (message.message < WM_MOUSEFIRST || message.message > WM_MOUSELAST) {
      TranslateMessage(&message);
      DispatchMessageW(&message);
    }
  }
  const bool keeps = GetCapture() == handle;
  if (keeps) ReleaseCapture();
  return keeps && isOver;
}

void PressButton(HWND handle, int part) {
  const DWORD style = StyleOf(handle);
  const bool isEnabled = part == HTCLOSE || (part == HTMINBUTTON && style & WS_MINIMIZEBOX) ||
                         (part == HTMAXBUTTON && style & WS_MAXIMIZEBOX);
  if (!isEnabled || !IsReleasedOver(handle, part)) return;
  POINT point;
  GetCursorPos(&point);
  const UINT command = part == HTCLOSE       ? SC_CLOSE
                       : part == HTMINBUTTON ? SC_MINIMIZE
                       : style & WS_MAXIMIZE ? SC_RESTORE
                                             : SC_MAXIMIZE;
  Send(handle, WM_SYSCOMMAND, command, PointParam(point.x, point.y));
}

}  // namespace

LRESULT DefaultNcButtonDown(HWND handle, WPARAM hit, LPARAM lParam) {
  switch (hit) {
    case HTCAPTION: {
      const HWND top = GetAncestor(handle, GA_ROOT);
      if (top != GetActiveWindow()) Activate(top, By::Mouse, true);
      Send(handle, WM_SYSCOMMAND, SC_MOVE | HTCAPTION, lParam);
      break;
    }
    case HTSYSMENU:
      Send(handle, WM_SYSCOMMAND, SC_MOUSEMENU | HTSYSMENU, lParam);
      break;
    case HTMENU:
      Send(handle, WM_SYSCOMMAND, SC_MOUSEMENU | HTMENU, lParam);
      break;
    case HTVSCROLL:
      Send(handle, WM_SYSCOMMAND, SC_VSCROLL | HTVSCROLL, lParam);
      break;
    case HTHSCROLL:
      Send(handle, WM_SYSCOMMAND, SC_HSCROLL | HTHSCROLL, lParam);
      break;
    case HTCLOSE:
    case HTMINBUTTON:
    case HTMAXBUTTON:
      PressButton(handle, static_cast<int>(hit));
      break;
    default:
      if (hit >= HTLEFT && hit <= HTBOTTOMRIGHT)
        Send(handle, WM_SYSCOMMAND, SC_SIZE + hit - HTLEFT + WMSZ_LEFT, lParam);
  }
  return 0;
}

LRESULT DefaultNcDoubleClick(HWND handle, WPARAM hit, LPARAM lParam) {
  if (hit == HTCAPTION && StyleOf(handle) & WS_MAXIMIZEBOX)
    Send(handle, WM_SYSCOMMAND, StyleOf(handle) & (WS_MAXIMIZE | WS_MINIMIZE) ? SC_RESTORE : SC_MAXIMIZE, lParam);
  if (hit == HTSYSMENU) Send(handle, WM_SYSCOMMAND, SC_CLOSE, lParam);
  if (hit == HTVSCROLL || hit == HTHSCROLL) return DefaultNcButtonDown(handle, hit, lParam);
  return 0;
}

LRESULT DefaultSysCommand(HWND handle, WPARAM command, LPARAM lParam) {
  if (CbtRefuses(HCBT_SYSCOMMAND, command, lParam)) return 0;
  const POINT point = PointOf(lParam);
  switch (command & 0xFFF0) {
    case SC_SIZE:
    case SC_MOVE:
      SizeOrMove(handle, static_cast<UINT>(command), point);
      break;
    case SC_MINIMIZE:
      ShowWindow(handle, SW_MINIMIZE);
      break;
    case SC_MAXIMIZE:
      ShowWindow(handle, SW_MAXIMIZE);
      break;
    case SC_RESTORE:
      ShowWindow(handle, SW_RESTORE);
      break;
    case SC_CLOSE:
      return Send(handle, WM_CLOSE);
    case SC_VSCROLL:
    case SC_HSCROLL:
      TrackScrollBar(handle, (command & 0xFFF0) == SC_VSCROLL ? SB_VERT : SB_HORZ, point);
      break;
    case SC_MOUSEMENU:
      if ((command & 0x0F) == HTSYSMENU) {
        UseSystemMenu(handle);
      } else {
        UseMenuBarByMouse(handle, point);
      }
      break;
    case SC_KEYMENU:
      // A child has no menu: its top-level window's is meant.
      if (lParam == VK_SPACE) {
        UseSystemMenu(GetAncestor(handle, GA_ROOT));
      } else {
        UseMenuBarByKey(GetAncestor(handle, GA_ROOT), static_cast<WCHAR>(lParam));
      }
      break;
    default:
      break;
  }
  return 0;
}

}  // namespace platform::model
