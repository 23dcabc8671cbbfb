#include "qxcore/platform/posix/draw/text_layout.h"

#include <unicode/ubidi.h>
#include <unicode/uchar.h>
#include <unicode/ushape.h>
#include <unicode/utf16.h>

#include <algorithm>
#include <memory>
#include <string>

namespace draw {

namespace {

using Text = std::basic_string<WCHAR>;

struct Character {
  char32_t code;
  std::int32_t unit;   // where it stands in the text
  std::int32_t units;  // 1 or 2
};

bool IsMark(char32_t code) {
  int type = u_charType(static_cast<UChar32>(code));
  return type == U_NON_SPACING_MARK || type == U_ENCLOSING_MARK;
}

// Directions and joiners shape the line and are not drawn.
bool IsInvisible(char32_t code) {
  return (code >= 0x200B && code <= 0x200F) || (code >= 0x202A && code <= 0x202E) ||
         (code >= 0x2060 && code <= 0x2069) || code == 0xFEFF;
}

// Arabic letters in the form that their neighbours ask for; every letter keeps its place.
Text Joined(SStringView text) {
  bool arabic = false;
  for (WCHAR unit : text) arabic |= unit >= 0x600 && unit < 0x700;
  if (!arabic) return Text(text);
  Text joined(text.size(), WCHAR{0});
  UErrorCode error = U_ZERO_ERROR;
  u_shapeArabic(text.data(), static_cast<std::int32_t>(text.size()), joined.data(),
                static_cast<std::int32_t>(text.size()),
                U_SHAPE_LETTERS_SHAPE | U_SHAPE_TEXT_DIRECTION_LOGICAL | U_SHAPE_LENGTH_FIXED_SPACES_NEAR, &error);
  return U_FAILURE(error) ? Text(text) : joined;
}

void AppendRun(const Text& text, std::int32_t start, std::int32_t end, bool backward, std::vector<Character>& line) {
  std::size_t first = line.size();
  for (std::int32_t i = start; i < end;) {
    Character character{0, i, 1};
    UChar32 code;
    U16_NEXT(text.data(), i, end, code);
    character.code = static_cast<char32_t>(code);
    character.units = i - character.unit;
    line.push_back(character);
  }
  if (!backward) return;
  std::reverse(line.begin() + static_cast<std::ptrdiff_t>(first), line.end());
  for (std::size_t i = first; i < line.size(); ++i)
    line[i].code = static_cast<char32_t>(u_charMirror(static_cast<UChar32>(line[i].code)));
  // A mark follows its letter in either direction.
  for (std::size_t i = first; i < line.size(); ++i) {
    std::size_t marks = i;
    while (marks < line.size() && IsMark(line[marks].code)) ++marks;
    if (marks > i && marks < line.size())
      std::rotate(line.begin() + static_cast<std::ptrdiff_t>(i), line.begin() + static_cast<std::ptrdiff_t>(marks),
                  line.begin() + static_cast<std::ptrdiff_t>(marks) + 1);
    i = marks;
  }
}

std::vector<Character> InVisualOrder(const Text& text, bool rightToLeft) {
  std::vector<Character> line;
  std::int32_t length = static_cast<std::int32_t>(text.size());
  UErrorCode error = U_ZERO_ERROR;
  std::unique_ptr<UBiDi, decltype(&ubidi_close)> order(ubidi_openSized(length, 0, &error), &ubidi_close);
  if (U_SUCCESS(error))
    ubidi_setPara(order.get(), text.data(), length, rightToLeft ? UBIDI_RTL : UBIDI_LTR, nullptr, &error);
  std::int32_t runs = U_SUCCESS(error) ? ubidi_countRuns(order.get(), &error) : 0;
  if (U_FAILURE(error)) {
    AppendRun(text, 0, length, false, line);
    return line;
  }
  for (std::int32_t i = 0; i < runs; ++i) {
    std::int32_t start = 0, count = 0;
    bool backward = ubidi_getVisualRun(order.get(), i, &start, &count) == UBIDI_RTL;
    AppendRun(text, start, start + count, backward, line);
  }
  return line;
}

int AdvanceOf(const Character& character, const Glyph& glyph, const int* advances) {
  if (advances) return advances[character.unit] + (character.units == 2 ? advances[character.unit + 1] : 0);
  return IsMark(character.code) ? 0 : glyph.advance;
}

std::vector<PlacedGlyph> LayOutPlain(SizedFace& face, SStringView text, const int* advances) {
  std::vector<PlacedGlyph> line;
  line.reserve(text.size());
  for (std::size_t i = 0; i < text.size(); ++i) {
    const Glyph& glyph = face.Of(text[i]);
    line.push_back({&glyph, advances ? advances[i] : glyph.advance});
  }
  return line;
}

}  // namespace

std::vector<PlacedGlyph> LayOut(SizedFace& face, SStringView text, const int* advances, bool rightToLeft) {
  if (!rightToLeft && IsPlain(text.data(), text.size())) return LayOutPlain(face, text, advances);
  static const Glyph kNothing;
  std::vector<PlacedGlyph> line;
  for (const Character& character : InVisualOrder(Joined(text), rightToLeft)) {
    const Glyph& glyph = IsInvisible(character.code) ? kNothing : face.Of(character.code);
    line.push_back({&glyph, AdvanceOf(character, glyph, advances)});
  }
  return line;
}

int WidthOf(SizedFace& face, SStringView text) {
  int width = 0;
  if (IsPlain(text.data(), text.size())) {
    for (WCHAR unit : text) width += face.Of(unit).advance;
    return width;
  }
  for (const PlacedGlyph& placed : LayOut(face, text, nullptr, false)) width += placed.advance;
  return width;
}

}  // namespace draw
