// IsTextUnicode: tests whose names and meanings are published, with the details that programs see on
// Windows: a NUL at the very end is left out, and statistics, controls and NULs look at the first 256
// characters. ASCII16 and illegal characters look at all of them.

#include <algorithm>
#include <cstdint>

#include "platform/win32.h"

namespace {

constexpr int kSampleChars = 256;

struct Text {
  const std::uint8_t* bytes;
  int chars;  // whole ones

  unsigned Little(int i) const { return bytes[2 * i] | bytes[2 * i + 1] << 8; }
  unsigned Big(int i) const { return bytes[2 * i] << 8 | bytes[2 * i + 1]; }
};

bool IsControl(unsigned c) { return c == 0 || c == 0x09 || c == 0x0A || c == 0x0D || c == 0x20; }

int TestSample(const Text& text) {
  int latin = 0, result = 0;
  const int count = std::min(text.chars, kSampleChars);
  for (int i = 0; i < count; ++i) {
    const unsigned c = text.Little(i);
    if (c < 0x100) ++latin;
    if (IsControl(c) || c == 0x3000) result |= IS_TEXT_UNICODE_CONTROLS;
    // The ideographic space is left out here: reversed it is the digit zero.
    if (IsControl(text.Big(i))) result |= IS_TEXT_UNICODE_REVERSE_CONTROLS;
  }
  if (latin > count / 2) result |= IS_TEXT_UNICODE_STATISTICS;
  return result;
}

int TestAscii16(const Text& text) {
  bool little = text.chars > 0, big = little, content = false;
  for (int i = 0; i < text.chars && (little || big); ++i) {
    little = little && text.Little(i) < 0x80;
    big = big && text.Big(i) < 0x80;
    content = content || text.Little(i) != 0;
  }
  if (!content) return 0;
  return (little ? IS_TEXT_UNICODE_ASCII16 : 0) | (big ? IS_TEXT_UNICODE_REVERSE_ASCII16 : 0);
}

// The published list: an inner reversed byte order mark, NUL, a carriage return and a line feed packed into
// one character, and U+FFFF.
bool HasIllegal(const Text& text) {
  for (int i = 0; i < text.chars; ++i) {
    const unsigned c = text.Little(i);
    if (c == 0xFFFF || c == 0 || c == 0x0A0D || (c == 0xFFFE && i > 0)) return true;
  }
  return false;
}

}  // namespace

BOOL IsTextUnicode(const void* data, int size, LPINT tests) {
  const int wanted = tests != nullptr ? *tests : -1;
  const auto* bytes = static_cast<const std::uint8_t*>(data);
  const int counted = size > 0 && bytes[size - 1] == 0 ? size - 1 : size;
  int result = 0;
  if (counted >= 2) {
    const Text whole{bytes, size / 2}, trimmed{bytes, counted / 2};
    const std::uint8_t* sampleEnd = bytes + std::min(counted, 2 * kSampleChars);
    result = TestSample(trimmed);
    if (whole.Little(0) == 0xFEFF) result |= IS_TEXT_UNICODE_SIGNATURE;
    if (whole.Little(0) == 0xFFFE) result |= IS_TEXT_UNICODE_REVERSE_SIGNATURE;
    if ((size & 1) != 0) result |= IS_TEXT_UNICODE_ODD_LENGTH;
    if (std::find(bytes, sampleEnd, 0) != sampleEnd) result |= IS_TEXT_UNICODE_NULL_BYTES;
    if ((wanted & (IS_TEXT_UNICODE_ASCII16 | IS_TEXT_UNICODE_REVERSE_ASCII16)) != 0) result |= TestAscii16(whole);
    if ((wanted & IS_TEXT_UNICODE_ILLEGAL_CHARS) != 0 && HasIllegal(trimmed)) result |= IS_TEXT_UNICODE_ILLEGAL_CHARS;
  }
  result &= wanted;
  if (tests != nullptr) *tests = result;
  return result != 0 && (result & (IS_TEXT_UNICODE_REVERSE_MASK | IS_TEXT_UNICODE_NOT_UNICODE_MASK)) == 0;
}
