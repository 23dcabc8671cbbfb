// Bytes in an RTF text: hexadecimal escapes \'hh, and bytes that stand for themselves. `Char` is char16_t or
// unsigned char.
#pragma once

#include <string>

#include "qxcore/platform/internal/rtf_word.h"
#include "qxcore/platform/posix/controls/rtf_charset.h"

namespace platform::rich {

// Whether \' stands at `at`.
template <class Char>
bool IsHexByte(const Char* at, const Char* end) {
  return end - at >= 2 && at[0] == '\\' && at[1] == '\'';
}

// Reads the byte of the escape at `at` and moves behind it; -1 when its digits are invalid: then behind \'.
template <class Char>
int ReadHexByte(const Char*& at, const Char* end) {
  at += 2;
  const int high = at != end ? RtfHexValue(*at) : -1;
  if (high < 0) return -1;
  const int low = end - at >= 2 ? RtfHexValue(at[1]) : -1;
  at += low < 0 ? 1 : 2;
  return low < 0 ? -1 : high * 16 + low;
}

// The byte that could follow a lead byte, behind line ends, which do not count; moves behind it. -1 where
// something else stands, and `at` stays.
template <class Char>
int ReadTrailByte(const Char*& at, const Char* end) {
  const Char* next = at;
  while (next != end && (*next == '\r' || *next == '\n')) ++next;
  if (next == end || *next < ' ' || *next == '{' || *next == '}' || *next > 0xFF) return -1;
  int byte;
  if (*next != '\\') {
    byte = *next++;
  } else if (IsHexByte(next, end)) {
    byte = ReadHexByte(next, end);
  } else if (end - next >= 2 && (next[1] == '\\' || next[1] == '{' || next[1] == '}')) {
    byte = next[1];  // a trail byte that had to be escaped
    next += 2;
  } else {
    return -1;
  }
  if (byte >= 0) at = next;
  return byte;
}

// Appends the character whose first byte is at `at`, and moves behind its last one. Of a text of
// characters, one above 0x7F stands for itself.
template <class Char, class Text>
void DecodeByte(const Char*& at, const Char* end, const Charset& charset, Text& text) {
  int byte;
  if (*at == '\\') {
    byte = ReadHexByte(at, end);
    if (byte < 0) return;
  } else {
    if (sizeof(Char) > 1) {
      text += static_cast<char16_t>(*at++);
      return;
    }
    byte = static_cast<unsigned char>(*at++);
  }
  DecodeByteBefore(static_cast<unsigned char>(byte), at, end, charset, text);
}

// The same for a byte that has been read already; `at` is behind it.
template <class Char, class Text>
void DecodeByteBefore(unsigned char byte, const Char*& at, const Char* end, const Charset& charset, Text& text) {
  if (const WCHAR single = charset.Single(byte)) {
    text += single;
  } else if (charset.IsLong()) {
    std::string bytes(1, static_cast<char>(byte));
    for (const Char* next = at; next != end && (IsHexByte(next, end) || (sizeof(Char) == 1 && *next >= 0x80));) {
      const int more = ReadTrailByte(next, end);
      if (more < 0) break;
      bytes += static_cast<char>(more);
      at = next;
    }
    for (const char16_t unit : charset.Decode(bytes)) {
      if (unit != 0) text += unit;
    }
  } else if (byte != 0) {
    const Char* next = at;
    const int trail = ReadTrailByte(next, end);
    const WCHAR both = trail >= 0 ? charset.Double(byte, static_cast<unsigned char>(trail)) : u'\0';
    // Not one of the page's characters: often one of windows-1252 that a writer put under the wrong page.
    text += both != 0 ? both : Charset::Of(1252)->Single(byte);
    if (both != 0) at = next;
  }
}

// Behind what a reader without Unicode shows in place of a character: `count` characters, escapes or control
// words, but nothing behind a brace.
template <class Char>
const Char* SkipFallback(const Char* at, const Char* end, std::int32_t count) {
  while (count > 0 && at != end && *at != '{' && *at != '}') {
    if (*at == '\r' || *at == '\n') {
      ++at;
      continue;
    }
    --count;
    if (*at != '\\') {
      ++at;
    } else if (IsHexByte(at, end)) {
      ReadHexByte(at, end);
    } else if (end - at >= 2 && IsRtfLetter(at[1])) {
      const RtfWord<Char> word = ReadRtfWord(at + 1, end);
      at = word.key == RtfKey("bin") ? SkipRtfBinary(word, end) : word.end;
    } else {
      at += end - at >= 2 ? 2 : 1;
    }
  }
  return at;
}

}  // namespace platform::rich
