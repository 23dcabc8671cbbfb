// UTF-8, strictly: shortest forms only, no surrogates, nothing above U+10FFFF.

#include <cstring>

#include "qxcore/platform/posix/code_page.h"
#include "qxcore/platform/posix/table_codec.h"

namespace platform {
namespace {

bool IsTrail(std::uint8_t byte) { return (byte & 0xC0) == 0x80; }

// The smallest and largest second byte that a lead byte takes; an empty range for what leads nothing.
struct SecondRange {
  std::uint8_t low, high;
};
SecondRange SecondOf(std::uint8_t lead) {
  switch (lead) {
    case 0xE0:
      return {0xA0, 0xBF};
    case 0xED:
      return {0x80, 0x9F};
    case 0xF0:
      return {0x90, 0xBF};
    case 0xF4:
      return {0x80, 0x8F};
    default:
      return lead >= 0xC2 && lead <= 0xF4 ? SecondRange{0x80, 0xBF} : SecondRange{1, 0};
  }
}

// Length of the sequence at `at`: positive when it is whole, negative (of the longest part that could begin
// one, at least 1) when it is not.
int SequenceLength(const std::uint8_t* at, std::size_t left) {
  const std::uint8_t lead = at[0];
  if (lead < 0x80) return 1;
  const SecondRange second = SecondOf(lead);
  const int wanted = lead < 0xE0 ? 2 : lead < 0xF0 ? 3 : 4;
  if (left < 2 || at[1] < second.low || at[1] > second.high) return -1;
  if (wanted == 2) return 2;
  if (left < 3 || !IsTrail(at[2])) return -2;
  if (wanted == 3) return 3;
  return left >= 4 && IsTrail(at[3]) ? 4 : -3;
}

}  // namespace

Decoded DecodeUtf8(const char* bytes, std::size_t count, WCHAR* text, std::size_t capacity, bool stopAtInvalid) {
  const auto* data = reinterpret_cast<const std::uint8_t*>(bytes);
  std::size_t at = 0, length = 0;
  bool valid = true;
  const auto put = [&](char32_t c) {
    if (length < capacity) text[length] = static_cast<WCHAR>(c);
    ++length;
  };
  while (at < count) {
    const std::uint8_t lead = data[at];
    if (lead < 0x80) {
      const std::size_t run = AsciiPrefix(bytes + at, count - at);
      if (length < capacity) {
        const std::size_t room = run < capacity - length ? run : capacity - length;
        for (std::size_t i = 0; i < room; ++i) text[length + i] = data[at + i];
      }
      at += run;
      length += run;
      continue;
    }
    // The two common lengths, without further questions.
    if (lead >= 0xC2 && lead < 0xE0 && at + 1 < count && IsTrail(data[at + 1])) {
      put(static_cast<char32_t>((lead & 0x1F) << 6 | (data[at + 1] & 0x3F)));
      at += 2;
      continue;
    }
    if (lead > 0xE0 && lead < 0xF0 && lead != 0xED && at + 2 < count && IsTrail(data[at + 1]) &&
        IsTrail(data[at + 2])) {
      put(static_cast<char32_t>((lead & 0x0F) << 12 | (data[at + 1] & 0x3F) << 6 | (data[at + 2] & 0x3F)));
      at += 3;
      continue;
    }
    const int size = SequenceLength(data + at, count - at);
    if (size < 0) {
      valid = false;
      if (stopAtInvalid) return {length, false};
      put(0xFFFD);
      at += static_cast<std::size_t>(-size);
      continue;
    }
    char32_t c = lead & (0x7F >> size);
    for (int i = 1; i < size; ++i) c = c << 6 | (data[at + static_cast<std::size_t>(i)] & 0x3F);
    if (c >= 0x10000) {
      put(0xD7C0 + (c >> 10));
      put(0xDC00 + (c & 0x3FF));
    } else {
      put(c);
    }
    at += static_cast<std::size_t>(size);
  }
  return {length, valid};
}

Decoded EncodeUtf8(const WCHAR* text, std::size_t count, char* bytes, std::size_t capacity) {
  std::size_t length = 0;
  bool valid = true;
  for (std::size_t i = 0; i < count; ++i) {
    char32_t c = text[i];
    if (c >= 0xD800 && c <= 0xDFFF) {
      if (c < 0xDC00 && i + 1 < count && text[i + 1] >= 0xDC00 && text[i + 1] <= 0xDFFF) {
        c = 0x10000 + ((c - 0xD800) << 10) + (text[++i] - 0xDC00);
      } else {
        c = 0xFFFD;
        valid = false;
      }
    }
    const std::size_t size = c < 0x80 ? 1 : c < 0x800 ? 2 : c < 0x10000 ? 3 : 4;
    if (length + size <= capacity) {
      char* at = bytes + length;
      switch (size) {
        case 1:
          at[0] = static_cast<char>(c);
          break;
        case 2:
          at[0] = static_cast<char>(0xC0 | c >> 6);
          at[1] = static_cast<char>(0x80 | (c & 0x3F));
          break;
        case 3:
          at[0] = static_cast<char>(0xE0 | c >> 12);
          at[1] = static_cast<char>(0x80 | (c >> 6 & 0x3F));
          at[2] = static_cast<char>(0x80 | (c & 0x3F));
          break;
        default:
          at[0] = static_cast<char>(0xF0 | c >> 18);
          at[1] = static_cast<char>(0x80 | (c >> 12 & 0x3F));
          at[2] = static_cast<char>(0x80 | (c >> 6 & 0x3F));
          at[3] = static_cast<char>(0x80 | (c & 0x3F));
      }
    } else {
      capacity = 0;
    }
    length += size;
  }
  return {length, valid};
}

}  // namespace platform
