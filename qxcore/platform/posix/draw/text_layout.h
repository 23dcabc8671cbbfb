// A line of text as glyphs from left to right.
#pragma once

#include <vector>

#include "qxcore/platform/posix/draw/sized_face.h"

namespace draw {

struct PlacedGlyph {
  const Glyph* glyph;
  int advance;
};

// True when the text needs no care: each unit is a character, drawn in the order in which it stands.
inline bool IsPlain(const WCHAR* text, std::size_t count) {
  WCHAR all = 0;
  bool plain = true;
  for (std::size_t i = 0; i < count; ++i) plain &= (all = text[i]) < 0x300;
  return plain;
}

// The glyphs of a text in the order in which they are seen: right-to-left runs turned (the whole line reads that way
// with `rightToLeft`), Arabic letters joined, combining marks without width over the letter before, a surrogate pair
// as one character. `advances` (one a unit, or null) replaces the font's.
std::vector<PlacedGlyph> LayOut(SizedFace& face, SStringView text, const int* advances, bool rightToLeft);

// The width of a text in pixels.
int WidthOf(SizedFace& face, SStringView text);

}  // namespace draw
