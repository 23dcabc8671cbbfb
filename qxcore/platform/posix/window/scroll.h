// The scroll bars of windows, and the sums that scroll bar controls share with them.
#pragma once

#include "qxcore/platform/posix/window/window.h"

namespace platform::model {

// Puts a request into a bar, keeping its values in order; true when something changed.
bool ChangeScrollBar(ScrollBar& bar, const SCROLLINFO& info);
void ReadScrollBar(const ScrollBar& bar, SCROLLINFO& info);
// The largest position: the last at which a page is full.
int LastPosition(const ScrollBar& bar);

// The parts of a bar along its length, in pixels from its start.
struct ScrollParts {
  int arrow = 0;      // the length of an arrow at each end
  int thumb = 0;      // where the thumb begins
  int thumbSize = 0;  // 0 where there is no room or nothing to scroll
};
ScrollParts PartsOf(const ScrollBar& bar, int length);
int PositionOfThumb(const ScrollBar& bar, int length, int thumb);

// Follows a press in a window's bar until the button comes up, with WM_HSCROLL and WM_VSCROLL. Without the lock.
void TrackScrollBar(HWND window, int which, POINT point);
// The same for any bar: `owner` gets the messages, `control` is what they carry, `rect` is on the screen.
void TrackBar(HWND captured, HWND owner, HWND control, int which, const RECT& rect, const ScrollBar& bar, POINT point);

}  // namespace platform::model
