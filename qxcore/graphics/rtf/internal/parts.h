// Where the parts of an RTF text lie.
#pragma once

#include <cstdint>

#include "qxcore/platform/win32.h"

namespace rtf {

// The first group whose destination has that key (see RtfKey), braces included; empty when no group has it.
SStringView FindGroup(SStringView text, std::uint64_t key);

// The header, from the text's first character; empty when the text is no RTF. `fallback` is set to the number of
// the header's last \uc, or to 1.
SStringView FindHeader(SStringView text, std::int32_t& fallback);

}  // namespace rtf
