#include "qxcore/graphics/rtf/internal/parts.h"

#include <algorithm>

#include "qxcore/graphics/rtf/internal/tag.h"

namespace rtf {
namespace {

using platform::RtfKey;
using Word = platform::RtfWord<WCHAR>;

constexpr std::uint64_t kHeaderWords[] = {
    RtfKey("ansi"),
    RtfKey("mac"),
    RtfKey("pc"),
    RtfKey("pca"),
    RtfKey("ansicpg"),
    RtfKey("fbidis"),
    RtfKey("fromtext"),
    RtfKey("fromhtml"),
    RtfKey("deff"),
    RtfKey("adeff"),
    RtfKey("deflang"),
    RtfKey("deflangfe"),
    RtfKey("adeflang"),
    RtfKey("stshfdbch"),
    RtfKey("stshfloch"),
    RtfKey("stshfhich"),
    RtfKey("stshfbi"),
    RtfKey("themelang"),
    RtfKey("themelangfe"),
    RtfKey("themelangcs"),
    RtfKey("uc"),
    RtfKey("noqfpromote"),
    RtfKey("cocoartf"),
    RtfKey("cocoasubrtf"),
    RtfKey("cocoaplatform"),
    RtfKey("cocoatextscaling"),
};

constexpr std::uint64_t kHeaderGroups[] = {
    RtfKey("fonttbl"),       RtfKey("filetbl"),
    RtfKey("colortbl"),      RtfKey("stylesheet"),
    RtfKey("latentstyles"),  RtfKey("listtable"),
    RtfKey("listpicture"),   RtfKey("listoverridetable"),
    RtfKey("revtbl"),        RtfKey("rsidtbl"),
    RtfKey("mmathPr"),       RtfKey("generator"),
    RtfKey("themedata"),     RtfKey("colorschememapping"),
    RtfKey("datastore"),     RtfKey("defchp"),
    RtfKey("defpap"),        RtfKey("pgptbl"),
    RtfKey("userprops"),     RtfKey("xmlnstbl"),
    RtfKey("wgrffmtfilter"), RtfKey("protusertbl"),
    RtfKey("passwordhash"),  RtfKey("info"),
    RtfKey("docvar"),        RtfKey("expandedcolortbl"),
    RtfKey("template"),      RtfKey("fchars"),
    RtfKey("lchars"),        RtfKey("nextfile"),
};

template <std::size_t kCount>
bool Contains(const std::uint64_t (&keys)[kCount], std::uint64_t key) {
  return std::find(keys, keys + kCount, key) != keys + kCount;
}

// The word whose backslash is at `at`; false when there is another character behind the backslash, or none.
bool ReadWordAt(const WCHAR* at, const WCHAR* end, Word& word) {
  if (at == end || *at != '\\' || at + 1 == end || !platform::IsRtfLetter(at[1])) return false;
  word = platform::ReadRtfWord(at + 1, end);
  return true;
}

// The destination of the group whose brace is at `at`; 0 when it has none.
std::uint64_t DestinationOf(const WCHAR* at, const WCHAR* end) {
  at = SkipSpace(at + 1, end);
  if (end - at >= 2 && at[0] == '\\' && at[1] == '*') at = SkipSpace(at + 2, end);
  Word word;
  return ReadWordAt(at, end, word) ? word.key : 0;
}

// Behind the control word, escape or symbol whose backslash is at `at`, binary data included.
const WCHAR* SkipControl(const WCHAR* at, const WCHAR* end) {
  Word word;
  if (!ReadWordAt(at, end, word)) return end - at > 2 ? at + 2 : end;
  return word.key == RtfKey("bin") ? platform::SkipRtfBinary(word, end) : word.end;
}

SStringView Between(const WCHAR* start, const WCHAR* end) {
  return SStringView(start, static_cast<std::size_t>(end - start));
}

// Behind the brace and the word \rtf or \urtf; null when the text does not begin so.
const WCHAR* SkipVersion(const WCHAR* at, const WCHAR* end) {
  at = SkipSpace(at, end);
  if (at == end || *at != '{') return nullptr;
  Word word;
  if (!ReadWordAt(SkipSpace(at + 1, end), end, word)) return nullptr;
  return word.key == RtfKey("rtf") || word.key == RtfKey("urtf") ? word.end : nullptr;
}

// Behind the part of the header at `at`; null when what is there belongs to the body.
const WCHAR* SkipHeaderPart(const WCHAR* at, const WCHAR* end, std::int32_t& fallback) {
  if (at == end) return nullptr;
  if (*at == '{') return Contains(kHeaderGroups, DestinationOf(at, end)) ? SkipGroup(at, end) : nullptr;
  Word word;
  if (!ReadWordAt(at, end, word) || !Contains(kHeaderWords, word.key)) return nullptr;
  if (word.key == RtfKey("uc")) fallback = word.NumberOr(1);
  return word.end;
}

}  // namespace

SStringView FindGroup(SStringView text, std::uint64_t key) {
  const WCHAR* end = text.data() + text.size();
  for (const WCHAR* at = text.data(); at != end;) {
    if (*at == '{' && DestinationOf(at, end) == key) return Between(at, SkipGroup(at, end));
    at = *at == '\\' ? SkipControl(at, end) : at + 1;
  }
  return SStringView();
}

SStringView FindHeader(SStringView text, std::int32_t& fallback) {
  fallback = 1;
  const WCHAR* end = text.data() + text.size();
  const WCHAR* at = SkipVersion(text.data(), end);
  if (at == nullptr) return SStringView();
  while (const WCHAR* behind = SkipHeaderPart(SkipSpace(at, end), end, fallback)) at = behind;
  while (at != end && (*at == '\r' || *at == '\n')) ++at;  // a blank would be text
  return Between(text.data(), at);
}

}  // namespace rtf
