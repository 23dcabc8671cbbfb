// Finding and wildcard matching in SString.

#include <algorithm>

#include "qxcore/platform/wide.h"
#include "qxcore/string/internal/text_search.h"
#include "qxcore/string/string.h"

namespace {

// What lies between `from`, a pointer into the text, and the text's end; `from` null means all of it.
SStringView RestOf(const SString& text, const WCHAR* from) {
  if (from == nullptr) return text.View();
  from = std::clamp(from, text.begin(), text.end());
  return SStringView(from, static_cast<std::size_t>(text.end() - from));
}

// The beginning of the text in which a match may lie that begins at `from` at the latest.
SStringView HeadFor(const SString& text, const WCHAR* from, std::size_t wantedLength) {
  if (from == nullptr) return text.View();
  std::size_t start = static_cast<std::size_t>(std::clamp(from, text.begin(), text.end()) - text.begin());
  return text.View().substr(0, start + std::min(wantedLength, text.View().size() - start));
}

// Walks text and pattern once; on a mismatch only the last '*' takes one character more, which is
// enough, because an earlier '*' could not do better.
template <class Map>
int MatchWhole(SStringView text, SStringView pattern, Map map) {
  constexpr std::size_t kNone = static_cast<std::size_t>(-1);
  std::size_t t = 0;
  std::size_t p = 0;
  std::size_t starPattern = kNone;  // behind the last '*'
  std::size_t starText = 0;         // where the text goes on behind the run that it took
  while (t < text.size() || p < pattern.size()) {
    if (p < pattern.size() && pattern[p] == WTEXT('*')) {
      starPattern = ++p;
      starText = t;
      continue;
    }
    if (t < text.size() && p < pattern.size()) {
      bool escaped = pattern[p] == WTEXT('\\') && p + 1 < pattern.size();
      WCHAR wanted = pattern[escaped ? p + 1 : p];
      if ((!escaped && wanted == WTEXT('?')) || map(wanted) == map(text[t])) {
        p += escaped ? 2 : 1;
        ++t;
        continue;
      }
    }
    if (starPattern == kNone || starText >= text.size()) return 0;
    p = starPattern;
    t = ++starText;
  }
  return 1;
}

}  // namespace

const WCHAR* SString::Find(WCHAR character) const { return Find(character, m_text); }

const WCHAR* SString::Find(WCHAR character, const WCHAR* from) const {
  SStringView rest = RestOf(*this, from);
  return SFindCharacter(rest.data(), rest.size(), character);
}

const WCHAR* SString::Find(const WCHAR* text) const { return SFindText(View(), ViewOf(text)); }

const WCHAR* SString::Find(const WCHAR* text, const WCHAR* from) const {
  return SFindText(RestOf(*this, from), ViewOf(text));
}

const WCHAR* SString::FindNoCase(const WCHAR* text) const { return SFindTextNoCase(View(), ViewOf(text)); }

const WCHAR* SString::FindNoCase(const WCHAR* text, const WCHAR* from) const {
  return SFindTextNoCase(RestOf(*this, from), ViewOf(text));
}

const WCHAR* SString::ReverseFind(WCHAR character) const { return SFindLastText(View(), SStringView(&character, 1)); }

const WCHAR* SString::ReverseFind(const WCHAR* text) const { return SFindLastText(View(), ViewOf(text)); }

const WCHAR* SString::ReverseFind(const WCHAR* text, const WCHAR* from) const {
  SStringView wanted = ViewOf(text);
  return SFindLastText(HeadFor(*this, from, wanted.size()), wanted);
}

const WCHAR* SString::ReverseFindNoCase(const WCHAR* text) const { return SFindLastTextNoCase(View(), ViewOf(text)); }

const WCHAR* SString::ReverseFindNoCase(const WCHAR* text, const WCHAR* from) const {
  SStringView wanted = ViewOf(text);
  return SFindLastTextNoCase(HeadFor(*this, from, wanted.size()), wanted);
}

int SString::FindPos(WCHAR character, int start) const {
  if (start < 0 || start > Length() - 1) return -1;
  const WCHAR* found = Find(character, m_text + start);
  return found != nullptr ? static_cast<int>(found - m_text) : -1;
}

int SString::ReverseFindPos(WCHAR character, int start) const {
  if (start < 0 || start > Length() - 1) return -1;
  int at = start;
  while (at >= 0 && m_text[at] != character) --at;
  return at;
}

int SString::Match(const WCHAR* pattern) const {
  return MatchWhole(View(), ViewOf(pattern), [](WCHAR c) { return c; });
}

int SString::MatchNoCase(const WCHAR* pattern) const {
  return MatchWhole(View(), ViewOf(pattern), [](WCHAR c) { return platform::ToLowerBmp(c); });
}
