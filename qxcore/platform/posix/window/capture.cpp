#include "qxcore/platform/posix/window/send.h"

using namespace platform::model;

HWND GetCapture() {
  Thread* thread = CurrentThread();
  const Guard guard;
  return FindWindowObject(thread->capture) != nullptr ? thread->capture : nullptr;
}

// The window that loses the mouse hears WM_CAPTURECHANGED.
HWND SetCapture(HWND handle) {
  Thread* thread = CurrentThread();
  HWND previous = nullptr;
  {
    const Guard guard;
    if (handle != nullptr) {
      const Window* window = Expect(handle);
      if (window == nullptr || window->thread != thread) return nullptr;
    }
    previous = FindWindowObject(thread->capture) != nullptr ? thread->capture : nullptr;
    thread->capture = handle;
  }
  if (previous != nullptr && previous != handle) Send(previous, WM_CAPTURECHANGED, 0, reinterpret_cast<LPARAM>(handle));
  return previous;
}

BOOL ReleaseCapture() {
  SetCapture(nullptr);
  return TRUE;
}
