// Searching texts without regard to case: letters match by their one-to-one lower-case forms.
//
// Safe for several threads, as nothing is kept between calls.
#pragma once

#include "qxcore/platform/export.h"
#include "qxcore/platform/win32.h"

// Case-insensitive substring search; a pointer into `haystack`, or null. A null text is an empty one.
QXCORE_API const WCHAR* _tcsistr(const WCHAR* haystack, const WCHAR* needle);
// The same, but only the first `count` characters of the needle are looked for.
QXCORE_API const WCHAR* _tcsistr(const WCHAR* haystack, const WCHAR* needle, int count);
