// The two halves of a character above the Basic Multilingual Plane (Unicode 15, 3.8).
#pragma once

#include "qxcore/platform/win32.h"

// Whether a code unit is the first half of a surrogate pair.
constexpr bool SIsHighSurrogate(WCHAR unit) { return (unit & 0xFC00) == 0xD800; }
// Whether a code unit is the second half of a surrogate pair.
constexpr bool SIsLowSurrogate(WCHAR unit) { return (unit & 0xFC00) == 0xDC00; }
