// A press in a scroll bar, followed until the button comes up.

#include "qxcore/platform/posix/window/frame.h"
#include "qxcore/platform/posix/window/scroll.h"
#include "qxcore/platform/posix/window/send.h"
#include "qxcore/platform/posix/window/tree.h"

namespace platform::model {
namespace {

enum class Part { Nothing, ArrowBack, PageBack, Thumb, PageOn, ArrowOn };

Part PartAt(const ScrollBar& bar, int length, int at) {
  const ScrollParts parts = PartsOf(bar, length);
  if (at < 0 || at >= length) return Part::Nothing;
  if (at < parts.arrow) return Part::ArrowBack;
  if (at >= length - parts.arrow) return Part::ArrowOn;
  if (parts.thumbSize == 0) return Part::Nothing;
  if (at < parts.thumb) return Part::PageBack;
  return at < parts.thumb + parts.thumbSize ? Part::Thumb : Part::PageOn;
}

UINT CodeOf(Part part) {
  switch (part) {
    case Part::ArrowBack:
      return SB_LINEUP;
    case Part::PageBack:
      return SB_PAGEUP;
    case Part::PageOn:
      return SB_PAGEDOWN;
    default:
      return SB_LINEDOWN;
  }
}

constexpr UINT kFirstDelay = 200, kNextDelay = 50;  // milliseconds

// Whether the bar is where the window, or the control, has its own copy: read again after every message.
ScrollBar Present(HWND owner, HWND control, int which, const ScrollBar& fallback) {
  SCROLLINFO info{sizeof info, SIF_RANGE | SIF_PAGE | SIF_POS, 0, 0, 0, 0, 0};
  if (!GetScrollInfo(control != nullptr ? control : owner, control != nullptr ? SB_CTL : which, &info)) return fallback;
  ScrollBar bar = fallback;
  bar.lowest = info.nMin;
  bar.highest = info.nMax;
  bar.page = info.nPage;
  bar.position = info.nPos;
  return bar;
}

void KeepTrackPosition(HWND owner, HWND control, int which, int position) {
  if (control != nullptr) return;
  const Guard guard;
  Window* window = FindWindowObject(owner);
  if (window == nullptr || window->scrollBars == nullptr) return;
  (which == SB_HORZ ? window->scrollBars->horizontal : window->scrollBars->vertical).trackPosition = position;
}

}  // namespace

void TrackBar(HWND captured, HWND owner, HWND control, int which, const RECT& rect, const ScrollBar& start,
              POINT point) {
  const bool isHorizontal = which == SB_HORZ;
  const int length = isHorizontal ? Width(rect) : Height(rect);
  const auto along = [&](POINT p) { return isHorizontal ? p.x - rect.left : p.y - rect.top; };
  const UINT message = isHorizontal ? WM_HSCROLL : WM_VSCROLL;
  const auto tell = [&](UINT code, int position) {
    Send(owner, message, MAKEWPARAM(code, position), reinterpret_cast<LPARAM>(control));
  };
  ScrollBar bar = start;
  const Part pressed = PartAt(bar, length, along(point));
  if (pressed == Part::Nothing) return;
  const int grip = along(point) - PartsOf(bar, length).thumb;
  int tracked = bar.position;

  SetCapture(captured);
  UINT_PTR timer = 0;
  if (pressed != Part::Thumb) {
    tell(CodeOf(pressed), 0);
    timer = SetTimer(nullptr, 0, kFirstDelay, nullptr);
  }
  MSG next;
  while (GetCapture() == captured && GetMessageW(&next, nullptr, 0, 0) > 0) {
    if (next.message == WM_LBUTTONUP) break;
    if (next.message == WM_MOUSEMOVE) {
      point = next.pt;
      if (pressed != Part::Thumb) continue;
      const int position = PositionOfThumb(bar, length, along(point) - grip);
      if (position == tracked) continue;
      tracked = position;
      KeepTrackPosition(owner, control, which, tracked);
      tell(SB_THUMBTRACK, tracked);
    } else if (next.message == WM_TIMER && next.hwnd == nullptr && next.wParam == timer && timer != 0) {
      KillTimer(nullptr, timer);
      timer = SetTimer(nullptr, 0, kNextDelay, nullptr);
      bar = Present(owner, control, which, bar);
      if (PartAt(bar, length, along(point)) == pressed) tell(CodeOf(pressed), 0);
    } else {
      TranslateMessage(&next);
      DispatchMessageW(&next);
    }
  }
  if (timer != 0) KillTimer(nullptr, timer);
  if (GetCapture() == captured) ReleaseCapture();
  if (!IsWindow(owner)) return;
  if (pressed == Part::Thumb) tell(SB_THUMBPOSITION, tracked);
  tell(SB_ENDSCROLL, 0);
}

void TrackScrollBar(HWND handle, int which, POINT point) {
  RECT rect{};
  ScrollBar bar;
  {
    const Guard guard;
    const Window* window = FindWindowObject(handle);
    if (window == nullptr) return;
    const RECT whole = ScreenRect(window);
    rect = Moved(which == SB_HORZ ? HorizontalBarRect(window) : VerticalBarRect(window), whole.left, whole.top);
    if (window->scrollBars != nullptr)
      bar = which == SB_HORZ ? window->scrollBars->horizontal : window->scrollBars->vertical;
  }
  TrackBar(handle, handle, nullptr, which, rect, bar, point);
}

}  // namespace platform::model
