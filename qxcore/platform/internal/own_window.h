// Whether a window belongs to the calling thread: asked before each message that is sent.
#pragma once

#include "qxcore/platform/win32.h"

namespace platform {

// False for an unknown handle as well. Sets no last error.
bool IsOwnWindow(HWND window) noexcept;

}  // namespace platform
