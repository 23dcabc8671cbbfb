// The road of a mouse message from the queue to its window: hit test, parents, activation, cursor, double clicks,
// capture.

#include "qxcore/platform/posix/window/activate.h"
#include "qxcore/platform/posix/window/default_proc.h"
#include "qxcore/platform/posix/window/destroy.h"
#include "qxcore/platform/posix/window/input.h"
#include "qxcore/platform/posix/window/queue.h"
#include "qxcore/platform/posix/window/send.h"
#include "qxcore/platform/posix/window/tree.h"

namespace platform::model {
namespace {

constexpr UINT kDoubleClickTime = 500;  // milliseconds

bool IsDown(UINT message) {
  return message == WM_LBUTTONDOWN || message == WM_RBUTTONDOWN || message == WM_MBUTTONDOWN;
}

bool IsWheel(UINT message) { return message == WM_MOUSEWHEEL || message == WM_MOUSEHWHEEL; }

// The same button event in the non-client area.
UINT NonClient(UINT message) { return message - WM_MOUSEMOVE + WM_NCMOUSEMOVE; }

// A second press of the button in time and nearly at the same place, in a window that cares.
bool IsDoubleClick(Thread* thread, const MSG& message, bool isClient) {
  const Guard guard;
  const Window* window = FindWindowObject(message.hwnd);
  if (window == nullptr) return false;
  if (isClient && !(window->windowClass->style & CS_DBLCLKS)) return false;
  const MSG& last = thread->lastClick;
  return last.message == message.message && last.hwnd == message.hwnd && message.time - last.time < kDoubleClickTime &&
         std::abs(message.pt.x - last.pt.x) < GetSystemMetrics(SM_CXDOUBLECLK) / 2 + 1 &&
         std::abs(message.pt.y - last.pt.y) < GetSystemMetrics(SM_CYDOUBLECLK) / 2 + 1;
}

void RememberClick(Thread* thread, const MSG& message, bool isDouble) {
  const Guard guard;
  thread->lastClick = message;
  if (isDouble) thread->lastClick.message = 0;  // a third press begins anew
}

HWND TopLevelHandle(HWND handle) { return GetAncestor(handle, GA_ROOT); }

// All parents hear of a press in a child, at a point of their own client area.
void TellParents(const MSG& message) {
  HWND child = message.hwnd;
  for (;;) {
    HWND parent = nullptr;
    {
      const Guard guard;
      const Window* window = FindWindowObject(child);
      if (window == nullptr || !window->IsChild() || (window->exStyle & WS_EX_NOPARENTNOTIFY)) return;
      parent = HandleOf(window->parent);
    }
    POINT point = message.pt;
    ScreenToClient(parent, &point);
    Send(parent, WM_PARENTNOTIFY, MAKEWPARAM(message.message, 0), PointParam(point.x, point.y));
    child = parent;
  }
}

// Asks whether the press activates the window, and whether the message is eaten. False for eaten.
bool ActivateByPress(const MSG& message, int part) {
  const HWND top = TopLevelHandle(message.hwnd);
  if (top == nullptr) return true;
  // The window is asked when the press lies in a child, or in a window that is not active.
  if (top == GetActiveWindow() && top == message.hwnd) return true;
  const LRESULT answer =
      Send(message.hwnd, WM_MOUSEACTIVATE, reinterpret_cast<WPARAM>(top), MAKELPARAM(part, message.message));
  if ((answer == MA_ACTIVATE || answer == MA_ACTIVATEANDEAT || answer == 0) && top != GetActiveWindow())
    Activate(top, By::Mouse, true);
  return answer != MA_ACTIVATEANDEAT && answer != MA_NOACTIVATEANDEAT;
}

// A press in a disabled window only sounds; WM_SETCURSOR has HTERROR in it.
bool IsDisabled(HWND handle) {
  const Guard guard;
  const Window* window = FindWindowObject(handle);
  return window == nullptr || (window->style & WS_DISABLED);
}

bool RouteCaptured(Thread* thread, MSG* message, HWND capture) {
  POINT point = message->pt;
  ScreenToClient(capture, &point);
  const Guard guard;
  message->hwnd = capture;
  message->wParam = MAKEWPARAM(MouseKeys(thread), HIWORD(message->wParam));
  message->lParam = IsWheel(message->message) ? PointParam(message->pt.x, message->pt.y) : PointParam(point.x, point.y);
  return true;
}

void TrackLeave(Thread* thread, HWND now) {
  HWND left = nullptr;
  {
    const Guard guard;
    if (thread->trackedLeave == nullptr || thread->trackedLeave == now) return;
    left = thread->trackedLeave;
    thread->trackedLeave = nullptr;
  }
  PostMessageW(left, WM_MOUSELEAVE, 0, 0);
}

}  // namespace

bool RouteMouse(MSG* message, bool remove) {
  Thread* thread = CurrentThread();
  const HWND capture = GetCapture();
  const UINT raw = message->message;
  if (capture != nullptr) {
    const bool isDouble = IsDown(raw) && (message->hwnd = capture, IsDoubleClick(thread, *message, true));
    if (remove && IsDown(raw)) RememberClick(thread, *message, isDouble);
    if (isDouble) message->message += WM_LBUTTONDBLCLK - WM_LBUTTONDOWN;
    return RouteCaptured(thread, message, capture);
  }

  const Hit hit = HitTest(message->pt);
  TrackLeave(thread, hit.window);
  if (hit.window == nullptr) return false;
  message->hwnd = hit.window;
  if (IsDisabled(hit.window)) {
    if (remove) Send(hit.window, WM_SETCURSOR, reinterpret_cast<WPARAM>(hit.window), MAKELPARAM(HTERROR, raw));
    return false;
  }
  if (remove && IsDown(raw)) {
    TellParents(*message);
    if (!ActivateByPress(*message, hit.part)) return false;
  }
  if (remove) Send(hit.window, WM_SETCURSOR, reinterpret_cast<WPARAM>(hit.window), MAKELPARAM(hit.part, raw));
  if (!IsWindow(hit.window)) return false;

  const bool isClient = hit.part == HTCLIENT || IsWheel(raw);
  const bool isDouble = IsDown(raw) && IsDoubleClick(thread, *message, isClient);
  if (remove && IsDown(raw)) RememberClick(thread, *message, isDouble);
  if (isDouble) message->message += WM_LBUTTONDBLCLK - WM_LBUTTONDOWN;
  if (!isClient) {
    message->message = NonClient(message->message);
    message->wParam = static_cast<WPARAM>(hit.part);
    message->lParam = PointParam(message->pt.x, message->pt.y);
    return true;
  }
  return RouteCaptured(thread, message, hit.window);
}

LRESULT DefaultMouseActivate(HWND handle, WPARAM wParam, LPARAM lParam) {
  HWND parent = nullptr;
  {
    const Guard guard;
    const Window* window = FindWindowObject(handle);
    if (window != nullptr && window->IsChild()) parent = HandleOf(window->parent);
  }
  if (parent != nullptr) {
    const LRESULT answer = Send(parent, WM_MOUSEACTIVATE, wParam, lParam);
    if (answer != 0) return answer;
  }
  // A press on the caption activates when the button comes up again, after a possible move.
  const bool onCaption = HIWORD(lParam) == WM_LBUTTONDOWN && LOWORD(lParam) == HTCAPTION;
  return onCaption ? MA_NOACTIVATE : MA_ACTIVATE;
}

LRESULT DefaultSetCursor(HWND handle, WPARAM wParam, LPARAM lParam) {
  HWND parent = nullptr;
  HCURSOR own = nullptr;
  {
    const Guard guard;
    const Window* window = FindWindowObject(handle);
    if (window == nullptr) return FALSE;
    if (window->IsChild()) parent = HandleOf(window->parent);
    own = window->windowClass->cursor;
  }
  const int part = static_cast<short>(LOWORD(lParam));
  // The parent comes first, except over the borders that size the window.
  const bool isBorder = part >= HTLEFT && part <= HTBOTTOMRIGHT;
  if (!isBorder && parent != nullptr && Send(parent, WM_SETCURSOR, wParam, lParam)) return TRUE;
  switch (part) {
    case HTLEFT:
    case HTRIGHT:
      SetCursor(LoadCursorW(nullptr, IDC_SIZEWE));
      return TRUE;
    case HTTOP:
    case HTBOTTOM:
      SetCursor(LoadCursorW(nullptr, IDC_SIZENS));
      return TRUE;
    case HTTOPLEFT:
    case HTBOTTOMRIGHT:
      SetCursor(LoadCursorW(nullptr, IDC_SIZENWSE));
      return TRUE;
    case HTTOPRIGHT:
    case HTBOTTOMLEFT:
      SetCursor(LoadCursorW(nullptr, IDC_SIZENESW));
      return TRUE;
    case HTERROR:
      if (IsDown(HIWORD(lParam))) MessageBeep(0);
      break;
    case HTCLIENT:
      if (own != nullptr) {
        SetCursor(own);
        return TRUE;
      }
      return FALSE;
    default:
      break;
  }
  SetCursor(LoadCursorW(nullptr, IDC_ARROW));
  return FALSE;
}

}  // namespace platform::model

using namespace platform::model;

UINT GetDoubleClickTime() { return kDoubleClickTime; }

// Waits whether the button is moved by more than the metrics allow before it comes up.
BOOL DragDetect(HWND handle, POINT point) {
  const int dx = GetSystemMetrics(SM_CXDRAG), dy = GetSystemMetrics(SM_CYDRAG);
  SetCapture(handle);
  MSG message;
  while (GetMessageW(&message, nullptr, 0, 0) > 0) {
    if (message.message == WM_LBUTTONUP || (message.message == WM_KEYDOWN && message.wParam == VK_ESCAPE)) break;
    if (GetCapture() != handle) return FALSE;
    if (message.message == WM_MOUSEMOVE &&
        (std::abs(message.pt.x - point.x) > dx || std::abs(message.pt.y - point.y) > dy)) {
      ReleaseCapture();
      return TRUE;
    }
    if (message.message < WM_MOUSEFIRST || message.message > WM_MOUSELAST) DispatchMessageW(&message);
  }
  ReleaseCapture();
  return FALSE;
}

// Leaving only: nobody in the library waits for the mouse to rest.
BOOL TrackMouseEvent(LPTRACKMOUSEEVENT event) {
  Thread* thread = CurrentThread();
  const Guard guard;
  if (event == nullptr || event->cbSize != sizeof *event) return Fail(ERROR_INVALID_PARAMETER);
  if (event->dwFlags == TME_QUERY) {
    event->dwFlags = thread->trackedLeave != nullptr ? TME_LEAVE : 0u;
    event->hwndTrack = thread->trackedLeave;
    return TRUE;
  }
  if (Expect(event->hwndTrack) == nullptr) return FALSE;
  if (event->dwFlags & TME_CANCEL) {
    if (thread->trackedLeave == event->hwndTrack) thread->trackedLeave = nullptr;
  } else if (event->dwFlags & TME_LEAVE) {
    thread->trackedLeave = event->hwndTrack;
  }
  return TRUE;
}
