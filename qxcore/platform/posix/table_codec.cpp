#include "qxcore/platform/posix/table_codec.h"

#include <cstring>

#if defined(__SSE2__)
#include <emmintrin.h>
#endif

namespace platform {
namespace {

// Widens leading ASCII; returns the number of bytes done.
std::size_t WidenAscii(const char* bytes, std::size_t count, WCHAR* text) {
  std::size_t done = 0;
#if defined(__SSE2__)
  const __m128i zero = _mm_setzero_si128();
  for (; done + 16 <= count; done += 16) {
    const __m128i block = _mm_loadu_si128(reinterpret_cast<const __m128i*>(bytes + done));
    if (_mm_movemask_epi8(block) != 0) break;
    _mm_storeu_si128(reinterpret_cast<__m128i*>(text + done), _mm_unpacklo_epi8(block, zero));
    _mm_storeu_si128(reinterpret_cast<__m128i*>(text + done + 8), _mm_unpackhi_epi8(block, zero));
  }
#endif
  while (done < count && static_cast<signed char>(bytes[done]) >= 0) {
    text[done] = static_cast<WCHAR>(bytes[done]);
    ++done;
  }
  return done;
}

Decoded MeasureSingle(const DecodeTable& table, const std::uint8_t* bytes, std::size_t count) {
  if (!table.hasInvalid) return {count, true};
  std::size_t at = 0;
  while (at < count) {
    if (table.asciiIdentity) at += AsciiPrefix(reinterpret_cast<const char*>(bytes) + at, count - at);
    // A run of 64 whatever they are, so that text without long ASCII runs is no slower.
    const std::size_t end = count - at < 64 ? count : at + 64;
    std::uint8_t bad0 = 0, bad1 = 0;
    for (; at + 2 <= end; at += 2) {
      bad0 |= table.kind[bytes[at]];
      bad1 |= table.kind[bytes[at + 1]];
    }
    for (; at < end; ++at) bad0 |= table.kind[bytes[at]];
    if ((bad0 | bad1) != 0) return {count, false};
  }
  return {count, true};
}

// Whether something follows the lead byte that can belong to it: a terminator never does.
bool HasTrail(const std::uint8_t* bytes, std::size_t at, std::size_t count) {
  return at + 1 < count && bytes[at + 1] != 0;
}

Decoded MeasureDouble(const DecodeTable& table, const std::uint8_t* bytes, std::size_t count) {
  std::size_t at = 0, length = 0;
  bool valid = true;
  while (at < count) {
    const std::uint8_t byte = bytes[at];
    if (byte < 0x80 && table.asciiIdentity) {
      const std::size_t run = AsciiPrefix(reinterpret_cast<const char*>(bytes) + at, count - at);
      at += run;
      length += run;
      continue;
    }
    const std::uint8_t kind = table.kind[byte];
    if (kind == DecodeTable::kLead) {
      if (HasTrail(bytes, at, count)) {
        valid &= table.doubles[byte * 256u + bytes[at + 1]] != 0;
        at += 2;
      } else {
        valid = false;
        ++at;
      }
    } else {
      valid &= kind == 0;
      ++at;
    }
    ++length;
  }
  return {length, valid};
}

Decoded DecodeDouble(const DecodeTable& table, const std::uint8_t* bytes, std::size_t count, WCHAR* text,
                     std::size_t capacity) {
  std::size_t at = 0, length = 0;
  bool valid = true;
  while (at < count && length < capacity) {
    const std::uint8_t byte = bytes[at];
    if (byte < 0x80 && table.asciiIdentity) {
      const std::size_t room = count - at < capacity - length ? count - at : capacity - length;
      const std::size_t run = WidenAscii(reinterpret_cast<const char*>(bytes) + at, room, text + length);
      at += run;
      length += run;
      continue;
    }
    if (table.kind[byte] == DecodeTable::kLead) {
      const bool isPair = HasTrail(bytes, at, count);
      const WCHAR value = isPair ? table.doubles[byte * 256u + bytes[at + 1]] : u'\0';
      valid &= value != 0;
      text[length++] = value != 0 ? value : table.defaultChar;
      at += isPair ? 2 : 1;
    } else {
      valid &= table.kind[byte] == 0;
      text[length++] = table.single[byte];
      ++at;
    }
  }
  if (at < count) {
    const Decoded rest = MeasureDouble(table, bytes + at, count - at);
    return {length + rest.length, valid && rest.valid};
  }
  return {length, valid};
}

}  // namespace

std::size_t AsciiPrefix(const char* bytes, std::size_t count) {
  std::size_t done = 0;
#if defined(__SSE2__)
  for (; done + 64 <= count; done += 64) {
    const auto* block = reinterpret_cast<const __m128i*>(bytes + done);
    const __m128i ab = _mm_or_si128(_mm_loadu_si128(block), _mm_loadu_si128(block + 1));
    const __m128i cd = _mm_or_si128(_mm_loadu_si128(block + 2), _mm_loadu_si128(block + 3));
    if (_mm_movemask_epi8(_mm_or_si128(ab, cd)) != 0) break;
  }
  for (; done + 16 <= count; done += 16) {
    const int mask = _mm_movemask_epi8(_mm_loadu_si128(reinterpret_cast<const __m128i*>(bytes + done)));
    if (mask != 0) return done + static_cast<std::size_t>(__builtin_ctz(static_cast<unsigned>(mask)));
  }
#endif
  for (; done + 8 <= count; done += 8) {
    std::uint64_t block;
    std::memcpy(&block, bytes + done, 8);
    if ((block & 0x8080808080808080u) != 0) break;
  }
  while (done < count && static_cast<signed char>(bytes[done]) >= 0) ++done;
  return done;
}

Decoded MeasureTable(const DecodeTable& table, const char* bytes, std::size_t count) {
  const auto* data = reinterpret_cast<const std::uint8_t*>(bytes);
  return table.doubles != nullptr ? MeasureDouble(table, data, count) : MeasureSingle(table, data, count);
}

Decoded DecodeTableText(const DecodeTable& table, const char* bytes, std::size_t count, WCHAR* text,
                        std::size_t capacity) {
  const auto* data = reinterpret_cast<const std::uint8_t*>(bytes);
  if (table.doubles != nullptr) return DecodeDouble(table, data, count, text, capacity);
  const std::size_t writable = count < capacity ? count : capacity;
  std::size_t at = 0;
  while (at < writable) {
    if (table.asciiIdentity) at += WidenAscii(bytes + at, writable - at, text + at);
    const std::size_t end = writable - at < 64 ? writable : at + 64;
    for (; at < end; ++at) text[at] = table.single[data[at]];
  }
  return {count, MeasureSingle(table, data, count).valid};
}

Decoded EncodeTableText(const EncodeTable& table, const EncodeOptions& options, const WCHAR* text, std::size_t count,
                        char* bytes, std::size_t capacity) {
  const std::uint16_t* codes = options.bestFit ? table.fit : table.exact;
  const bool onlyMeasures = capacity == 0;
  std::size_t length = 0;
  bool valid = true;
  for (std::size_t i = 0; i < count; ++i) {
    const std::uint16_t c = static_cast<std::uint16_t>(text[i]);
    std::uint16_t code = codes[c];
    const bool isDefault = code == 0 && c != 0;
    if (isDefault) code = options.defaultCode;
    const std::size_t size = code > 0xFF ? 2 : 1;
    const bool fits = length + size <= capacity;
    if (fits) {
      if (size == 2) bytes[length] = static_cast<char>(code >> 8);
      bytes[length + size - 1] = static_cast<char>(code);
    } else {
      capacity = 0;  // what does not fit ends the writing
    }
    if (isDefault && (fits || onlyMeasures)) valid = false;
    length += size;
  }
  return {length, valid};
}

}  // namespace platform
