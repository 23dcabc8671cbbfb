// The one entrance of input, for SendInput and for displays alike: tests and users take the same road.
#pragma once

#include "qxcore/platform/posix/display/display.h"
#include "qxcore/platform/posix/window/thread.h"

namespace platform::model {

// Reports what a device did. With the lock held; throws std::bad_alloc.
// A mouse message (WM_MOUSEMOVE, a button, a wheel) at a point of the screen; `data` is the wheel's delta.
void ReportMouse(UINT message, POINT point, int data);
// A key, by its virtual number; a character without a key as VK_PACKET with the character in `scan`.
// `typed` is what the keyboard's own layout makes of the key; kByLayout leaves that to TranslateMessage.
void ReportKey(WORD key, WORD scan, bool isUp, bool isExtended, WCHAR typed = DisplayEvents::kByLayout);

// The window below a point of the screen, by WM_NCHITTEST of the caller's own windows. Without the lock.
struct Hit {
  HWND window = nullptr;
  int part = HTNOWHERE;
};
Hit HitTest(POINT point);

// Turns a mouse message of the queue, whose point is on the screen, into the one its window gets, with all that
// is sent before it; false when it is swallowed. Without the lock.
bool RouteMouse(MSG* message, bool remove);
// The same for a key. Without the lock.
bool RouteKey(MSG* message, bool remove);

// The state of the shift keys and buttons as mouse messages carry it. Under the lock.
WORD MouseKeys(const Thread* thread);

}  // namespace platform::model
