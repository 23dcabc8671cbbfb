#include "tools/qxtool/utf8.h"

#include <algorithm>
#include <cstddef>

namespace {

constexpr char32_t kReplacement = 0xFFFD;

// One character from the front of `text`, which is not empty. Follows the practice that the Unicode
// standard recommends: one U+FFFD for each longest part that could have begun a character.
char32_t TakeCharacter(std::string_view& text) {
  auto at = [&text](std::size_t i) { return i < text.size() ? static_cast<unsigned char>(text[i]) : 0u; };
  unsigned lead = at(0);
  std::size_t length = lead < 0x80                   ? 1
                       : lead >= 0xC2 && lead < 0xE0 ? 2
                       : lead >= 0xE0 && lead < 0xF0 ? 3
                       : lead >= 0xF0 && lead < 0xF5 ? 4
                                                     : 0;
  if (length <= 1) {
    text.remove_prefix(1);
    return length == 1 ? lead : kReplacement;
  }
  unsigned low = lead == 0xE0 ? 0xA0 : lead == 0xF0 ? 0x90 : 0x80;
  unsigned high = lead == 0xED ? 0x9F : lead == 0xF4 ? 0x8F : 0xBF;
  char32_t character = lead & (0x7Fu >> length);
  for (std::size_t i = 1; i < length; ++i) {
    unsigned next = at(i);
    if (next < low || next > high) {
      text.remove_prefix(i);
      return kReplacement;
    }
    character = character << 6 | (next & 0x3F);
    low = 0x80;
    high = 0xBF;
  }
  text.remove_prefix(length);
  return character;
}

void AppendCharacter(std::string& text, char32_t c) {
  auto put = [&text](char32_t byte) { text += static_cast<char>(byte); };
  if (c < 0x80) {
    put(c);
  } else if (c < 0x800) {
    put(0xC0 | c >> 6);
    put(0x80 | (c & 0x3F));
  } else if (c < 0x10000) {
    put(0xE0 | c >> 12);
    put(0x80 | (c >> 6 & 0x3F));
    put(0x80 | (c & 0x3F));
  } else {
    put(0xF0 | c >> 18);
    put(0x80 | (c >> 12 & 0x3F));
    put(0x80 | (c >> 6 & 0x3F));
    put(0x80 | (c & 0x3F));
  }
}

bool IsHigh(WCHAR c) { return (c & 0xFC00) == 0xD800; }
bool IsLow(WCHAR c) { return (c & 0xFC00) == 0xDC00; }

}  // namespace

SString FromUtf8(std::string_view text) {
  std::basic_string<WCHAR> wide;
  wide.reserve(text.size());
  while (!text.empty()) {
    char32_t c = TakeCharacter(text);
    if (c >= 0x10000) {
      wide += static_cast<WCHAR>(0xD800 + ((c - 0x10000) >> 10));
      wide += static_cast<WCHAR>(0xDC00 + ((c - 0x10000) & 0x3FF));
    } else {
      wide += static_cast<WCHAR>(c);
    }
  }
  return SString(SStringView(wide));
}

std::string ToUtf8(SStringView text) {
  std::string bytes;
  bytes.reserve(text.size());
  for (std::size_t i = 0; i < text.size(); ++i) {
    char32_t c = text[i];
    if (IsHigh(text[i]) && i + 1 < text.size() && IsLow(text[i + 1])) {
      c = 0x10000 + ((c - 0xD800) << 10) + (text[++i] - 0xDC00u);
    } else if (IsHigh(text[i]) || IsLow(text[i])) {
      c = kReplacement;
    }
    AppendCharacter(bytes, c);
  }
  return bytes;
}

int DisplayWidth(SStringView text) {
  int width = 0;
  for (WCHAR c : text) {
    bool none = (c >= 0x300 && c < 0x370) || c == 0x200B || c == 0x200D || (c >= 0xFE00 && c < 0xFE10);
    bool two = (c >= 0x1100 && c < 0x1160) || (c >= 0x2E80 && c < 0xA4D0) || (c >= 0xAC00 && c < 0xD7A4) ||
               (c >= 0xF900 && c < 0xFB00) || (c >= 0xFE30 && c < 0xFE70) || (c >= 0xFF00 && c < 0xFF61);
    // The two halves of a surrogate pair make two columns, as most of those characters take.
    width += none ? 0 : two ? 2 : 1;
  }
  return width;
}
