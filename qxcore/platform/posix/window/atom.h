// Names as numbers: of classes, registered messages and properties. Without regard to case.
#pragma once

#include "qxcore/platform/posix/window/memory.h"

namespace platform::model {

// The atom of a name; a name that is a small number (MAKEINTATOM, "#123") is that number. The first of a new
// name throws std::bad_alloc when memory is out. 0 for an empty name. Under the lock.
ATOM InternName(LPCWSTR name);
// The same, but 0 for a name that nobody has used yet.
ATOM FindName(LPCWSTR name);
// The name as it was spelled first; "#123", written to `digits`, for a number. Takes no memory.
using NumberText = WCHAR[8];
SStringView NameOf(ATOM atom, NumberText& digits);

}  // namespace platform::model
