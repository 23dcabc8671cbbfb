// Files that are dropped on a window.
#pragma once

#include "qxcore/platform/posix/window/memory.h"

namespace platform::model {

// Posts WM_DROPFILES to the window at a point of the screen, or to the nearest one around it that accepts files. False
// when none does. `top` is the top-level window there. Throws std::bad_alloc.
bool PostDroppedFiles(HWND top, POINT point, const List<Text>& files);

}  // namespace platform::model
