// UTF-8, which the tool speaks to the outside, and UTF-16, which the library speaks.
#pragma once

#include <string>
#include <string_view>

#include "qxcore/string/string.h"

// The text in UTF-16; bytes that are no UTF-8 become U+FFFD.
inline SString FromUtf8(std::string_view text) { return SString::FromUtf8(text); }

// The text in UTF-8; a surrogate without its partner becomes U+FFFD.
inline std::string ToUtf8(const SString& text) { return text.ToUtf8(); }
inline std::string ToUtf8(SStringView text) { return SString(text).ToUtf8(); }
inline std::string ToUtf8(const WCHAR* text) { return SString(text).ToUtf8(); }

// An argument that names a file, as JSON shows it: bytes that are no UTF-8 stand as the library maps them.
SString ShownArgument(const std::string& argument);

// A path of the library, as the system spells it; the same for bytes that are no UTF-8.
SString ShownPath(const SString& path);

// How many columns a terminal gives the text, as far as that can be told without a table: one each,
// two for East Asian scripts, none for combining marks of the common blocks.
int DisplayWidth(SStringView text);
