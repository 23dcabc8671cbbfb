// The font and colour tables in front of a document.
#pragma once

#include "qxcore/platform/posix/controls/document.h"

namespace platform::rich {

// Add what stands between the word \fonttbl or \colortbl and the group's end. `documentPage` is the code page
// of names in fonts without a character set.
template <class Char>
void ReadFonts(const Char* at, const Char* end, unsigned documentPage, std::vector<Font>& fonts);
template <class Char>
void ReadColors(const Char* at, const Char* end, std::vector<Color>& colors);

}  // namespace platform::rich
