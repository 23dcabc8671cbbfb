// Searching in plain arrays of UTF-16 code units, sixteen bytes at a time where the processor can.
//
// All functions take ranges by address and count, look at every character (a NUL is like any other),
// and return the first match, or null. A text of no characters is found at once.
#pragma once

#include <cstddef>

#include "qxcore/platform/win32.h"

const WCHAR* SFindCharacter(const WCHAR* text, std::size_t length, WCHAR character);
const WCHAR* SFindText(SStringView text, SStringView wanted);
// Letters match by their one-to-one lower-case forms.
const WCHAR* SFindTextNoCase(SStringView text, SStringView wanted);
// The last match.
const WCHAR* SFindLastText(SStringView text, SStringView wanted);
const WCHAR* SFindLastTextNoCase(SStringView text, SStringView wanted);
