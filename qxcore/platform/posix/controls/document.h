// What a rich-edit control holds: a text, and from where in it which format applies.
//
// The text has CR LF between paragraphs and lines, a tab between the cells of a table, a line for each of its
// rows and a form feed between pages. It does not end with the end of the last paragraph.
#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include "qxcore/platform/posix/controls/text_buffer.h"

namespace platform::rich {

// How characters look. Measures as RTF counts them: sizes in half points; fonts and colours by their places in
// the document's lists, kNone for the document's default.
struct CharFormat {
  static constexpr std::int32_t kNone = -1;
  enum Flag : std::uint16_t {
    kBold = 1,
    kItalic = 2,
    kUnderline = 4,
    kStrike = 8,
    kSuper = 16,
    kSub = 32,
    kHidden = 64,
    kCaps = 128,
    kSmallCaps = 256,
  };

  std::int32_t font = kNone;
  std::int32_t color = kNone;
  std::int32_t back = kNone;
  std::int16_t size = 24;
  std::uint16_t flags = 0;

  friend bool operator==(const CharFormat&, const CharFormat&) = default;
};

// How paragraphs lie. Indents in twentieths of a point.
struct ParagraphFormat {
  enum Alignment : std::uint8_t { kLeft, kCenter, kRight, kJustified };

  std::int32_t left = 0, first = 0, right = 0;
  Alignment alignment = kLeft;

  friend bool operator==(const ParagraphFormat&, const ParagraphFormat&) = default;
};

// From this place in the text to that of the next one.
template <class Format>
struct FormatRun {
  std::size_t start;
  Format format;
};

struct Font {
  std::int32_t number = 0;
  std::int32_t charset = -1;  // \fcharset, or -1
  std::int32_t codePage = 0;  // \cpg, or 0
  std::u16string family;      // \froman and the like
  std::u16string name;
};

struct Color {
  bool isDefault = true;
  std::uint8_t red = 0, green = 0, blue = 0;

  friend bool operator==(const Color&, const Color&) = default;
};

struct Document {
  TextBuffer text;
  std::vector<FormatRun<CharFormat>> characters;
  std::vector<FormatRun<ParagraphFormat>> paragraphs;
  std::vector<Font> fonts;
  std::vector<Color> colors;
  std::int32_t defaultFont = 0;  // a font's number
};

}  // namespace platform::rich
