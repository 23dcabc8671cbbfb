// What tests of windows have to know of the display that they are shown on.
#pragma once

#include "qxcore/platform/win32.h"

namespace test {

// Waits until all that the display says of the calls so far has arrived; the next look at the queue handles it. Wine
// hears from the X server late that a window lost the input focus, and ends a menu or another mode that has begun
// meanwhile. It asks the server where the pointer is when it has not heard of it for 100 ms; the answer comes after all
// that the server said before.
inline void HearTheDisplay() {
#ifdef _WIN32
  Sleep(120);
  POINT point;
  GetCursorPos(&point);
#endif
}

}  // namespace test
