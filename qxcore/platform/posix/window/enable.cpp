#include "qxcore/platform/posix/window/send.h"

using namespace platform::model;

namespace {

bool FocusIsIn(HWND handle) {
  const HWND focus = GetFocus();
  return focus == handle || IsChild(handle, focus);
}

}  // namespace

BOOL IsWindowEnabled(HWND handle) {
  const Guard guard;
  const Window* window = Expect(handle);
  return window != nullptr && !(window->style & WS_DISABLED);
}

// Disabling: WM_CANCELMODE, the focus leaves, WM_ENABLE. Enabling: WM_ENABLE.
BOOL EnableWindow(HWND handle, BOOL enable) {
  if (!IsWindow(handle)) return Fail(ERROR_INVALID_WINDOW_HANDLE);
  const BOOL wasDisabled = !IsWindowEnabled(handle);
  if ((enable == 0) == (wasDisabled != 0)) return wasDisabled;
  if (!enable) Send(handle, WM_CANCELMODE);
  {
    const Guard guard;
    Window* window = FindWindowObject(handle);
    if (window == nullptr) return wasDisabled;
    window->style = enable ? window->style & ~WS_DISABLED : window->style | WS_DISABLED;
  }
  if (!enable) {
    if (FocusIsIn(handle)) SetFocus(nullptr);
    if (GetCapture() == handle) ReleaseCapture();
  }
  Send(handle, WM_ENABLE, enable != 0);
  return wasDisabled;
}
