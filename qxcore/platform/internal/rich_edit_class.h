// The window class of rich-edit controls.
#pragma once

#include "qxcore/platform/win32.h"

namespace platform {

// Its name, once the class is there; null where it cannot be had.
const WCHAR* LoadRichEditClass();

}  // namespace platform
