// Which file holds a font.
#pragma once

#include <string>

#include "qxcore/platform/win32.h"

namespace draw {

struct FontFile {
  std::string path;                      // empty when there is no font at all
  std::string family;                    // its own name
  int index = 0;                         // of the face within the file
  bool embolden = false, slant = false;  // what the file lacks of what was asked for
};

// The file for a description: a face of this name, or one that stands for it, or else a general one.
FontFile FindFontFile(const LOGFONTW& description);

// A file with a glyph for a character; empty when none is known.
FontFile FindFontFileWith(char32_t character, const FontFile& like);

}  // namespace draw
