// UTF-8, which the tool speaks to the outside, and UTF-16, which the library speaks.
#pragma once

#include <string>
#include <string_view>

#include "qxcore/string/string.h"

// The text in UTF-16; bytes that are no UTF-8 become U+FFFD.
SString FromUtf8(std::string_view text);

// The text in UTF-8; a surrogate without its partner becomes U+FFFD.
std::string ToUtf8(SStringView text);

// How many columns a terminal gives the text, as far as that can be told without a table: one each,
// two for East Asian scripts, none for combining marks of the common blocks.
int DisplayWidth(SStringView text);
