// Searching in plain arrays of UTF-16 code units, sixteen bytes at a time where the processor can.
//
// All functions take ranges by address and count, look at every character (a NUL is like any other),
// and give the first match, or null. A text of no characters is found at once.
#pragma once

#include <cstddef>

#include "platform/win32.h"
#include "qxcore/core/export.h"

const WCHAR* SFindCharacter(const WCHAR* text, std::size_t length, WCHAR character);
const WCHAR* SFindText(SStringView text, SStringView wanted);
// Letters match by their one-to-one lower-case forms.
const WCHAR* SFindTextNoCase(SStringView text, SStringView wanted);
// The last match.
const WCHAR* SFindLastText(SStringView text, SStringView wanted);
const WCHAR* SFindLastTextNoCase(SStringView text, SStringView wanted);

// Case-insensitive substring search; a pointer into `haystack`, or null. A null text is an empty one.
QXCORE_API const WCHAR* _tcsistr(const WCHAR* haystack, const WCHAR* needle);
// The same, but only the first `count` characters of the needle are looked for.
QXCORE_API const WCHAR* _tcsistr(const WCHAR* haystack, const WCHAR* needle, int count);
