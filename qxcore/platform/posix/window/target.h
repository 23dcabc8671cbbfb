// Where a window's pixels lie, for contexts of windows.
#pragma once

#include "qxcore/platform/posix/window/window.h"

namespace platform::model {

// A top-level window and what is below it share one surface.
struct Target {
  HWND top = nullptr;
  SIZE size{};               // of the surface
  POINT origin{};            // of the client area, or of the whole window, on the surface
  Region visible;            // on the surface
  void** surface = nullptr;  // the top-level window's slot; only its own thread uses it
};

// False, with ERROR_INVALID_WINDOW_HANDLE, for no window. Without the lock.
bool FindTarget(HWND window, bool isWhole, Target* target);

}  // namespace platform::model
