// The desktop's font catalogue, loaded on request; without it nothing is found.
#pragma once

#include "qxcore/platform/posix/draw/font_files.h"

namespace draw::fontconfig {

// A file of a family; empty when the catalogue has none of this name (a generic name takes any).
FontFile Named(const std::string& family, bool bold, bool italic);

// A file with a glyph for a character; empty when there is none.
FontFile With(char32_t character, bool fixed);

}  // namespace draw::fontconfig
