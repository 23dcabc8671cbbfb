// The tag reader: cuts an RTF text into braces, control words and runs of text, and remembers nothing.
//
// It is coarser than the format: a control word runs to the next backslash, brace, blank or line end, whatever
// its letters are. The three escapes "\\", "\{" and "\}" are tags of two characters; hexadecimal escapes are
// part of a text.
#pragma once

#include "qxcore/platform/internal/rtf_word.h"
#include "qxcore/platform/win32.h"

namespace rtf {

inline bool IsSpace(WCHAR c) { return c == ' ' || c == '\t' || c == '\r' || c == '\n'; }

using platform::IsRtfEnd;

template <class End>
const WCHAR* SkipSpace(const WCHAR* at, End end) {
  while (!IsRtfEnd(at, end) && IsSpace(*at)) ++at;
  return at;
}

// A backslash at `at`, and behind it one of the characters that it makes literal.
template <class End>
bool IsEscape(const WCHAR* at, End end) {
  return !IsRtfEnd(at + 1, end) && (at[1] == '\\' || at[1] == '{' || at[1] == '}');
}
template <class End>
bool IsHexEscape(const WCHAR* at, End end) {
  return !IsRtfEnd(at + 1, end) && at[1] == '\'';
}

// Behind the group whose brace is at `at`; the end of the text where it is not closed.
template <class End>
const WCHAR* SkipGroup(const WCHAR* at, End end) {
  at = platform::FindRtfGroupEnd(at + 1, end);
  return IsRtfEnd(at, end) ? at : at + 1;
}

template <class End>
const WCHAR* SkipControlWord(const WCHAR* at, End end) {
  for (++at; !IsRtfEnd(at, end); ++at) {
    if (*at == ' ' || *at == '\t') return at + 1;
    if (*at == '\\' || *at == '{' || *at == '}' || *at == '\r' || *at == '\n') break;
  }
  return at;
}

template <class End>
const WCHAR* SkipText(const WCHAR* at, End end) {
  for (; !IsRtfEnd(at, end) && *at != '{' && *at != '}'; ++at) {
    if (*at == '\\' && !IsHexEscape(at, end)) break;
  }
  return at;
}

// Behind the tag that begins at `at`, which is no blank.
template <class End>
const WCHAR* SkipTag(const WCHAR* at, End end, bool wholeGroup) {
  if (IsRtfEnd(at, end)) return at;
  if (*at == '{' && wholeGroup) return SkipGroup(at, end);
  if (*at == '{' || *at == '}') return at + 1;
  if (*at != '\\' || IsHexEscape(at, end)) return SkipText(at, end);
  return IsEscape(at, end) ? at + 2 : SkipControlWord(at, end);
}

// Whether a tag is a control word that a line end closed, so that text behind it needs a blank when the two are
// put together.
inline bool IsOpenWord(SStringView tag) {
  const WCHAR* end = tag.data() + tag.size();
  return tag.size() > 1 && tag[0] == '\\' && !IsEscape(tag.data(), end) && !IsHexEscape(tag.data(), end) &&
         !IsSpace(tag.back());
}

// Whether a tag is the word \binN. Binary data has no place in an entry of a table, and the word would swallow what is
// written behind it.
inline bool IsBinary(SStringView tag) {
  return tag[0] == '\\' &&
         platform::ReadRtfWord(tag.data() + 1, tag.data() + tag.size()).key == platform::RtfKey("bin");
}

// Walks over the tags of a text that ends at an address. A backslash alone, in front of a line end, is left out.
class TagReader {
 public:
  explicit TagReader(SStringView text) : m_at(text.data()), m_end(text.data() + text.size()) {}

  // The next tag; empty at the end.
  SStringView Next(bool wholeGroup) {
    const WCHAR* start;
    do {
      start = SkipSpace(m_at, m_end);
      m_at = SkipTag(start, m_end, wholeGroup);
    } while (m_at - start == 1 && *start == '\\');
    return SStringView(start, static_cast<std::size_t>(m_at - start));
  }

 private:
  const WCHAR* m_at;
  const WCHAR* m_end;
};

// The text without the blanks at its end.
inline SStringView TrimRight(SStringView text) {
  while (!text.empty() && IsSpace(text.back())) text.remove_suffix(1);
  return text;
}

}  // namespace rtf
