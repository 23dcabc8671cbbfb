// Control words of the Rich Text Format, version 1.9.1: a backslash, letters, a number or none, and one
// blank that belongs to the word.
//
// A word is known by a key that is made of its letters while they are read, so that a switch or one look
// into a table finds it: case RtfKey("fonttbl"): ...
#pragma once

#include <cstddef>
#include <cstdint>
#include <string_view>

namespace platform {

// Keys of words of at most 12 small letters are different from each other and from those of all words with
// capital letters; longer ones differ but for an accident.
class RtfKeyMaker {
 public:
  template <class Char>
  constexpr void Add(Char letter) {
    m_key = (m_key << 5 | m_key >> 59) ^ (static_cast<std::uint64_t>(letter) & 31);
    m_capitals |= static_cast<std::uint64_t>(~letter & 0x20) << 58;
  }
  constexpr std::uint64_t Key() const { return m_key | m_capitals; }

 private:
  std::uint64_t m_key = 0;
  std::uint64_t m_capitals = 0;
};

constexpr std::uint64_t RtfKey(std::string_view letters) {
  RtfKeyMaker key;
  for (const char letter : letters) key.Add(letter);
  return key.Key();
}

template <class Char>
constexpr bool IsRtfLetter(Char c) {
  return static_cast<unsigned>((c | 0x20) - 'a') < 26;
}
template <class Char>
constexpr bool IsRtfDigit(Char c) {
  return static_cast<unsigned>(c - '0') < 10;
}

// The value of a hexadecimal digit, or -1.
template <class Char>
constexpr int RtfHexValue(Char c) {
  if (IsRtfDigit(c)) return c - '0';
  const unsigned letter = static_cast<unsigned>((c | 0x20) - 'a');
  return c < 0x80 && letter < 6 ? static_cast<int>(letter) + 10 : -1;
}

// Where a text ends: at an address, or at its NUL.
struct RtfTerminated {};
template <class Char>
constexpr bool IsRtfEnd(const Char* at, const Char* end) {
  return at == end;
}
template <class Char>
constexpr bool IsRtfEnd(const Char* at, RtfTerminated) {
  return *at == 0;
}

template <class Char>
struct RtfWord {
  std::uint64_t key;
  std::int32_t number;  // 0 without one; what exceeds 32 bits is clipped
  bool hasNumber;
  const Char* lettersEnd;  // where the number begins, or would begin
  const Char* numberEnd;   // behind the number
  const Char* end;         // behind the blank

  // The number, or what a word means that has none.
  std::int32_t NumberOr(std::int32_t value) const { return hasNumber ? number : value; }
};

// Reads the number at `at`, which may begin with a minus; moves `at` behind it. False when there is none.
template <class Char, class End>
inline bool ReadRtfNumber(const Char*& at, End end, std::int32_t& number) {
  const Char* digit = at;
  const bool isNegative = !IsRtfEnd(digit, end) && *digit == '-';
  if (isNegative) ++digit;
  if (IsRtfEnd(digit, end) || !IsRtfDigit(*digit)) return false;
  std::int64_t value = 0;
  for (; !IsRtfEnd(digit, end) && IsRtfDigit(*digit); ++digit) {
    if (value <= INT32_MAX) value = value * 10 + (*digit - '0');
  }
  if (value > INT32_MAX) value = std::int64_t{INT32_MAX} + isNegative;
  number = static_cast<std::int32_t>(isNegative ? -value : value);
  at = digit;
  return true;
}

// Reads the word whose first letter is at `at`, behind its backslash.
template <class Char, class End>
inline RtfWord<Char> ReadRtfWord(const Char* at, End end) {
  RtfKeyMaker key;
  for (; !IsRtfEnd(at, end) && IsRtfLetter(*at); ++at) key.Add(*at);
  RtfWord<Char> word{key.Key(), 0, false, at, at, at};
  word.hasNumber = ReadRtfNumber(word.numberEnd, end, word.number);
  word.end = word.numberEnd;
  if (!IsRtfEnd(word.end, end) && *word.end == ' ') ++word.end;
  return word;
}

// Behind the binary data of a \bin word; the end of the text where it has less.
template <class Char>
inline const Char* SkipRtfBinary(const RtfWord<Char>& word, const Char* end) {
  return word.number <= 0 ? word.end : word.number < end - word.end ? word.end + word.number : end;
}
template <class Char>
inline const Char* SkipRtfBinary(const RtfWord<Char>& word, RtfTerminated end) {
  const Char* at = word.end;
  for (std::int32_t left = word.number; left > 0 && !IsRtfEnd(at, end); --left) ++at;
  return at;
}

// From inside a group to its closing brace, or to the end of the text where it has none. Braces that are
// escaped or stand in binary data do not count.
template <class Char, class End>
inline const Char* FindRtfGroupEnd(const Char* at, End end) {
  for (std::size_t depth = 0; !IsRtfEnd(at, end);) {
    const Char c = *at++;
    if (c == '{') {
      ++depth;
    } else if (c == '}') {
      if (depth-- == 0) return at - 1;
    } else if (c == '\\' && !IsRtfEnd(at, end)) {
      if (*at == 'b') {
        const RtfWord<Char> word = ReadRtfWord(at, end);
        at = word.key == RtfKey("bin") ? SkipRtfBinary(word, end) : word.end;
      } else {
        ++at;
      }
    }
  }
  return at;
}

}  // namespace platform
