// UTF-8 and UTF-16 character by character: the one codec under everything that reads or writes them.
//
// Long plain stretches go through widen.h; what is left comes here. Lengths and ranges are those of Unicode 15,
// 3.8 and table 3-7 (RFC 3629).
#pragma once

#include <cstddef>
#include <cstdint>

#include "qxcore/platform/win32.h"

namespace platform {

// What stands for what is no character (U+FFFD).
inline constexpr WCHAR kReplacementCharacter = 0xFFFD;

// --- UTF-16 ---

// Whether a code unit is the first half of a surrogate pair, the second half, or either.
constexpr bool IsHighSurrogate(char32_t unit) { return (unit & 0xFFFFFC00) == 0xD800; }
constexpr bool IsLowSurrogate(char32_t unit) { return (unit & 0xFFFFFC00) == 0xDC00; }
constexpr bool IsSurrogate(char32_t unit) { return (unit & 0xFFFFF800) == 0xD800; }

// Takes the character at `at`, which is not `end`, and moves behind it. A half without its partner is returned as
// it stands.
constexpr char32_t TakeUtf16(const WCHAR*& at, const WCHAR* end) {
  const char32_t first = static_cast<std::uint16_t>(*at++);
  if (!IsHighSurrogate(first) || at == end || !IsLowSurrogate(static_cast<std::uint16_t>(*at))) return first;
  return 0x10000 + ((first & 0x3FF) << 10) + (static_cast<std::uint16_t>(*at++) & 0x3FF);
}

// Writes a character as one or two units; returns the place behind them.
constexpr WCHAR* PutUtf16(char32_t character, WCHAR* out) {
  if (character < 0x10000) {
    *out++ = static_cast<WCHAR>(character);
  } else {
    *out++ = static_cast<WCHAR>(0xD7C0 + (character >> 10));
    *out++ = static_cast<WCHAR>(0xDC00 + (character & 0x3FF));
  }
  return out;
}

// --- UTF-8 ---

// How many bytes a character takes.
constexpr std::size_t Utf8Length(char32_t character) {
  return character < 0x80 ? 1 : character < 0x800 ? 2 : character < 0x10000 ? 3 : 4;
}

// Writes a character, a surrogate in three bytes like any other; returns the place behind it. `Byte` is any
// character type of one byte.
template <class Byte>
constexpr Byte* PutUtf8(char32_t character, Byte* out) {
  const auto put = [&out](char32_t byte) { *out++ = static_cast<Byte>(byte); };
  if (character < 0x80) {
    put(character);
    return out;
  }
  if (character < 0x800) {
    put(0xC0 | character >> 6);
  } else {
    if (character < 0x10000) {
      put(0xE0 | character >> 12);
    } else {
      put(0xF0 | character >> 18);
      put(0x80 | (character >> 12 & 0x3F));
    }
    put(0x80 | (character >> 6 & 0x3F));
  }
  put(0x80 | (character & 0x3F));
  return out;
}

constexpr bool IsUtf8Continuation(unsigned char byte) { return (byte & 0xC0) == 0x80; }

// Whether a surrogate in three bytes is a character: by the standard it is not; files of old programs hold them.
enum class Utf8Surrogates { kRefused, kTaken };

// What stands at a place of UTF-8 text.
struct Utf8Step {
  char32_t character;  // valid while isValid
  int length;          // bytes of the character, or of the longest part that could have begun one (at least 1)
  bool isValid;
  bool isCut;  // the text ends before the sequence could be judged; isValid is false then
};

// Looks at the sequence at `at`, which is not `end`.
constexpr Utf8Step StepUtf8(const unsigned char* at, const unsigned char* end,
                            Utf8Surrogates surrogates = Utf8Surrogates::kRefused) {
  const unsigned lead = *at;
  if (lead < 0x80) return {lead, 1, true, false};
  const int length = lead < 0xC2 ? 0 : lead < 0xE0 ? 2 : lead < 0xF0 ? 3 : lead < 0xF5 ? 4 : 0;
  if (length == 0) return {0, 1, false, false};
  // The range of the second byte is what rules out overlong forms, surrogates and values above U+10FFFF.
  unsigned low = lead == 0xE0 ? 0xA0 : lead == 0xF0 ? 0x90 : 0x80;
  unsigned high = lead == 0xF4 ? 0x8F : lead == 0xED && surrogates == Utf8Surrogates::kRefused ? 0x9F : 0xBF;
  char32_t character = lead & (0x7Fu >> length);
  for (int i = 1; i < length; ++i) {
    if (at + i == end) return {0, i, false, true};
    if (at[i] < low || at[i] > high) return {0, i, false, false};
    character = character << 6 | (at[i] & 0x3F);
    low = 0x80;
    high = 0xBF;
  }
  return {character, length, true, false};
}

}  // namespace platform
