// JSON output: literals only, no document in memory.
#pragma once

#include <string>
#include <string_view>

#include "qxcore/string/string.h"

// The text as a JSON string with its quotation marks, in UTF-8. A surrogate without its partner is
// written as an escape, so that nothing is lost and the output stays valid UTF-8.
std::string JsonString(SStringView text);

// The same, or null for an empty text.
std::string JsonStringOrNull(SStringView text);

// An encoding's value as a JSON string: "0x0004001C".
std::string JsonValue(unsigned long value);

inline const char* JsonBool(bool truth) { return truth ? "true" : "false"; }
