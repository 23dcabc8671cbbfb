// IsTextUnicode: tests whose names and meanings are published, with the details that programs see on
// Windows: a NUL at the very end is left out, and statistics, controls and NULs look at the first 256
// characters. ASCII16 and illegal characters look at all of them.

#include <algorithm>
#include <cstdint>

#if defined(__SSE2__)
#include <emmintrin.h>
#endif

#include "qxcore/platform/win32.h"

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

// All units joined by "or", as they lie in memory; stops early once neither order can be ASCII.
unsigned JoinedUnits(const Text& text) {
  int i = 0;
  unsigned joined = 0;
#if defined(__SSE2__)
  constexpr int kBlock = 1024;
  for (; i + kBlock <= text.chars; i += kBlock) {
    const auto* block = reinterpret_cast<const __m128i*>(text.bytes + 2 * i);
    __m128i even = _mm_setzero_si128(), odd = even;
    for (int k = 0; k < kBlock / 8; k += 2) {
      even = _mm_or_si128(even, _mm_loadu_si128(block + k));
      odd = _mm_or_si128(odd, _mm_loadu_si128(block + k + 1));
    }
    __m128i units = _mm_or_si128(even, odd);
    units = _mm_or_si128(units, _mm_srli_si128(units, 8));
    units = _mm_or_si128(units, _mm_srli_si128(units, 4));
    const unsigned two = static_cast<unsigned>(_mm_cvtsi128_si32(units));
    joined |= (two | two >> 16) & 0xFFFF;
    if ((joined & 0xFF80) != 0 && (joined & 0x80FF) != 0) return joined;
  }
#endif
  for (; i < text.chars; ++i) joined |= text.Little(i);
  return joined;
}

int TestAscii16(const Text& text) {
  const unsigned joined = JoinedUnits(text);
  if (joined == 0) return 0;  // nothing but NULs is no text
  return ((joined & 0xFF80) == 0 ? IS_TEXT_UNICODE_ASCII16 : 0) |
         ((joined & 0x80FF) == 0 ? IS_TEXT_UNICODE_REVERSE_ASCII16 : 0);
}

bool IsIllegal(unsigned c) { return c == 0xFFFF || c == 0 || c == 0x0A0D || c == 0xFFFE; }

// The published list: an inner reversed byte order mark, NUL, a carriage return and a line feed packed into
// one character, and U+FFFF.
bool HasIllegal(const Text& text) {
  if (text.chars == 0) return false;
  if (IsIllegal(text.Little(0)) && text.Little(0) != 0xFFFE) return true;
  int i = 1;
#if defined(__SSE2__)
  const __m128i crLf = _mm_set1_epi16(0x0A0D), zero = _mm_setzero_si128(), ones = _mm_set1_epi16(-1),
                twos = _mm_set1_epi16(-2);
  for (; i + 8 <= text.chars; i += 8) {
    const __m128i units = _mm_loadu_si128(reinterpret_cast<const __m128i*>(text.bytes + 2 * i));
    const __m128i found = _mm_or_si128(_mm_or_si128(_mm_cmpeq_epi16(units, crLf), _mm_cmpeq_epi16(units, zero)),
                                       _mm_or_si128(_mm_cmpeq_epi16(units, ones), _mm_cmpeq_epi16(units, twos)));
    if (_mm_movemask_epi8(found) != 0) return true;
  }
#endif
  for (; i < text.chars; ++i)
    if (IsIllegal(text.Little(i))) return true;
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
