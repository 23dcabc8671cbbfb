// Selecting an object that is already found.
#pragma once

#include "qxcore/platform/posix/draw/context.h"

namespace draw {

// Returns the handle of the former object, which may be stale; null with the last error when it is refused.
HGDIOBJ Select(Context& dc, Object* object);

}  // namespace draw
