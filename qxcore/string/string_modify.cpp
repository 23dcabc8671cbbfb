// Extraction and in-place changes of SString.

#include <algorithm>

#include "qxcore/platform/wide.h"
#include "qxcore/string/internal/text_search.h"
#include "qxcore/string/string.h"

// --- extraction ---

SString SString::Left(int count) const { return Mid(0, count); }

SString SString::Right(int count) const { return Mid(Length() - std::clamp(count, 0, Length())); }

SString SString::Mid(int first, int count) const {
  first = std::clamp(first, 0, Length());
  count = std::clamp(count, 0, Length() - first);
  if (count == Length()) return *this;
  return SString(SStringView(m_text + first, static_cast<std::size_t>(count)));
}

SString SString::Mid(int first) const { return Mid(first, Length()); }

SString SString::Split(WCHAR separator) const { return Split(nullptr, separator); }

SString SString::Split(SString* rest, WCHAR separator) const {
  SString left;
  Split(&left, rest, separator);
  return left;
}

int SString::Split(SString* left, SString* right, WCHAR separator) const {
  int at = FindPos(separator, 0);
  SString whole = *this;  // either result may be this string
  if (left != nullptr) *left = at >= 0 ? whole.Left(at) : whole;
  if (right != nullptr) *right = at >= 0 ? whole.Mid(at + 1) : null;
  return at >= 0;
}

// --- single characters ---

void SString::SetAt(int index, WCHAR character) {
  if (index < 0 || index >= Length()) return;
  CopyBeforeWrite();
  m_text[index] = character;
}

int SString::Insert(WCHAR character, int index) {
  const WCHAR text[2] = {character, 0};
  return Insert(text, index);
}

int SString::Insert(const WCHAR* text, int index) {
  SStringView inserted = ViewOf(text);
  if (inserted.empty()) return Length();
  index = std::clamp(index, 0, Length());
  int count = static_cast<int>(inserted.size());
  int length = Length();
  SString joined(Adopt{}, AllocBuffer(static_cast<int>(std::min<long long>(0x7FFFFFFF, 0LL + length + count))));
  WCHAR* out = std::copy_n(m_text, index, joined.m_text);
  out = std::copy(inserted.begin(), inserted.end(), out);
  std::copy_n(m_text + index, length - index, out);
  Swap(joined);
  return Length();
}

int SString::Delete(int index, int count) {
  int from = std::clamp(index, 0, Length());
  int to = static_cast<int>(std::clamp<long long>(0LL + index + std::max(count, 0), from, Length()));
  if (from == to) return Length();
  CopyBeforeWrite();
  std::copy(m_text + to, m_text + Length(), m_text + from);
  Unlock(Length() - (to - from));
  return Length();
}

void SString::MakeReverse() {
  CopyBeforeWrite();
  std::reverse(m_text, m_text + Length());
}

// --- case ---

void SString::ToUpper() {
  CopyBeforeWrite();
  std::transform(m_text, m_text + Length(), m_text, platform::ToUpperBmp);
}

void SString::ToLower() {
  CopyBeforeWrite();
  std::transform(m_text, m_text + Length(), m_text, platform::ToLowerBmp);
}

void SString::ToUpper(int index) {
  if (index >= 0 && index < Length()) SetAt(index, platform::ToUpperBmp(m_text[index]));
}

void SString::ToLower(int index) {
  if (index >= 0 && index < Length()) SetAt(index, platform::ToLowerBmp(m_text[index]));
}

// --- trimming ---

template <class IsStripped>
void SString::TrimBy(bool left, bool right, IsStripped isStripped) {
  int first = 0;
  int last = Length();
  while (left && first < last && isStripped(m_text[first])) ++first;
  while (right && last > first && isStripped(m_text[last - 1])) --last;
  if (last - first == Length()) return;
  CopyBeforeWrite();
  std::copy(m_text + first, m_text + last, m_text);
  Unlock(last - first);
}

static bool IsWhite(WCHAR c) { return platform::IsSpace(c); }
static auto IsOneOf(const WCHAR* set) {
  return [view = SString::ViewOf(set)](WCHAR c) { return view.find(c) != SStringView::npos; };
}
static auto IsSame(WCHAR wanted) {
  return [wanted](WCHAR c) { return c == wanted; };
}

void SString::Trim() { TrimBy(true, true, IsWhite); }
void SString::Trim(WCHAR character) { TrimBy(true, true, IsSame(character)); }
void SString::Trim(const WCHAR* set) { TrimBy(true, true, IsOneOf(set)); }
void SString::TrimLeft() { TrimBy(true, false, IsWhite); }
void SString::TrimLeft(WCHAR character) { TrimBy(true, false, IsSame(character)); }
void SString::TrimLeft(const WCHAR* set) { TrimBy(true, false, IsOneOf(set)); }
void SString::TrimRight() { TrimBy(false, true, IsWhite); }
void SString::TrimRight(WCHAR character) { TrimBy(false, true, IsSame(character)); }
void SString::TrimRight(const WCHAR* set) { TrimBy(false, true, IsOneOf(set)); }

// --- replacing ---

int SString::ReplaceFirst(const WCHAR* found, int oldLength, const WCHAR* newText) {
  if (found == nullptr || oldLength == 0) return 0;
  SStringView replacement = ViewOf(newText);
  int head = static_cast<int>(found - m_text);
  int tail = Length() - head - oldLength;
  SString whole(*this);
  SString changed = ConcatCopy(head, whole.m_text, static_cast<int>(replacement.size()), replacement.data());
  changed.ConcatInPlace(tail, whole.m_text + head + oldLength);
  Swap(changed);
  return 1;
}

int SString::Replace(const WCHAR* oldText, const WCHAR* newText) {
  return ReplaceFirst(Find(oldText), static_cast<int>(ViewOf(oldText).size()), newText);
}

int SString::ReplaceNoCase(const WCHAR* oldText, const WCHAR* newText) {
  return ReplaceFirst(FindNoCase(oldText), static_cast<int>(ViewOf(oldText).size()), newText);
}

int SString::Replace(WCHAR oldCharacter, WCHAR newCharacter) {
  int at = FindPos(oldCharacter, 0);
  if (at < 0) return 0;
  SetAt(at, newCharacter);
  return 1;
}

int SString::ReplaceAll(WCHAR oldCharacter, WCHAR newCharacter) {
  if (FindPos(oldCharacter, 0) < 0) return 0;
  CopyBeforeWrite();
  int count = 0;
  for (WCHAR* at = m_text; at != m_text + Length(); ++at) {
    if (*at != oldCharacter) continue;
    *at = newCharacter;
    ++count;
  }
  return count;
}

// Writes the source with its matches replaced; `firstAt` is the first of them. With texts of one length
// the source may be where it is written: what is searched lies behind what was written.
template <class Finder>
static void ReplaceOnto(SStringView source, std::size_t firstAt, SStringView wanted, SStringView replacement,
                        WCHAR* out, Finder find) {
  const WCHAR* from = source.data();
  const WCHAR* end = from + source.size();
  for (const WCHAR* at = from + firstAt; at != nullptr;) {
    out = std::copy(from, at, out);
    out = std::copy(replacement.begin(), replacement.end(), out);
    from = at + wanted.size();
    at = find(SStringView(from, static_cast<std::size_t>(end - from)), wanted);
  }
  std::copy(from, end, out);
}

template <class Finder>
int SString::ReplaceEvery(const WCHAR* oldText, const WCHAR* newText, Finder find) {
  SStringView wanted = ViewOf(oldText);
  if (IsEmpty() || wanted.empty()) return 0;
  // Counted first, so that one allocation of the right size is enough.
  const auto restFrom = [this](const WCHAR* at) { return SStringView(at, static_cast<std::size_t>(end() - at)); };
  const WCHAR* first = find(View(), wanted);
  int count = 0;
  for (const WCHAR* at = first; at != nullptr; at = find(restFrom(at + wanted.size()), wanted)) ++count;
  if (count == 0) return 0;

  SString oldKept(wanted);  // either argument may lie in this string's own buffer
  SString newKept(ViewOf(newText));
  const std::size_t firstAt = static_cast<std::size_t>(first - m_text);
  if (oldKept.Length() == newKept.Length()) {
    CopyBeforeWrite();
    ReplaceOnto(View(), firstAt, oldKept.View(), newKept.View(), m_text, find);
    return count;
  }
  long long length = Length() + count * (0LL + newKept.Length() - oldKept.Length());
  SString result(Adopt{}, AllocBuffer(static_cast<int>(std::min<long long>(length, 0x7FFFFFFF))));
  if (length > 0) ReplaceOnto(View(), firstAt, oldKept.View(), newKept.View(), result.m_text, find);
  Swap(result);
  return count;
}

int SString::ReplaceAll(const WCHAR* oldText, const WCHAR* newText) {
  return ReplaceEvery(oldText, newText, SFindText);
}

int SString::ReplaceAllNoCase(const WCHAR* oldText, const WCHAR* newText) {
  return ReplaceEvery(oldText, newText, SFindTextNoCase);
}

int SString::Translate(const WCHAR* from, const WCHAR* to) {
  SStringView set = ViewOf(from);
  SStringView images = ViewOf(to);
  set = set.substr(0, std::min(set.size(), images.size()));
  SString changed(*this);
  int count = 0;
  for (int i = 0; i < Length(); ++i) {
    std::size_t place = set.find(m_text[i]);
    if (place == SStringView::npos) continue;
    changed.SetAt(i, images[place]);
    ++count;
  }
  if (count > 0) Swap(changed);
  return count;
}

int SString::NoAccent(int first, int count) {
  constexpr int kScratch = 16;
  first = std::clamp(first, 0, Length());
  int end = count < 0 ? Length() : static_cast<int>(std::min<long long>(0LL + first + count, Length()));
  int changed = 0;
  for (int i = first; i < end; ++i) {
    WCHAR folded[kScratch];
    WCHAR character = m_text[i];
    if (character < 0x80) continue;
    int length = FoldStringW(MAP_COMPOSITE, &character, 1, folded, kScratch);
    if (length < 2 || folded[0] == character) continue;
    SetAt(i, folded[0]);
    ++changed;
  }
  return changed;
}
