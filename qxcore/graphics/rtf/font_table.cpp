#include "qxcore/graphics/rtf/font_table.h"

#include "qxcore/core/raise_error.h"
#include "qxcore/graphics/rtf/internal/merge.h"
#include "qxcore/graphics/rtf/internal/tag.h"
#include "qxcore/string/string_buffer.h"

namespace {

constexpr unsigned kEntryRoom = 96;  // characters that most entries fit into

// \fN, the word that numbers an entry; its number is stored.
bool IsNumberWord(SStringView tag, int& number) {
  const WCHAR* at = tag.data() + 2;
  return tag.size() > 2 && tag[1] == 'f' && platform::ReadRtfNumber(at, tag.data() + tag.size(), number);
}

// \uN, a character and so the beginning of a name.
bool IsCharacterWord(SStringView tag) {
  return tag.size() > 2 && tag[1] == 'u' && (tag[2] == '-' || platform::IsRtfDigit(tag[2]));
}

bool IsName(SStringView tag) {
  return tag[0] != '\\' || rtf::IsHexEscape(tag.data(), tag.data() + tag.size()) ||
         rtf::IsEscape(tag.data(), tag.data() + tag.size()) || IsCharacterWord(tag);
}

// Tags put together in their order; copied only when something stood between them.
class Pieces {
 public:
  void Clear() {
    m_joined.Clear();
    m_view = SStringView();
    m_isOpenWord = false;
  }
  void Add(SStringView tag) {
    const bool needsBlank = m_isOpenWord && tag[0] != '\\';
    m_isOpenWord = rtf::IsOpenWord(tag);
    if (m_view.empty()) {
      m_view = tag;
    } else if (m_view.data() + m_view.size() == tag.data()) {
      m_view = SStringView(m_view.data(), m_view.size() + tag.size());
    } else {
      if (m_joined.IsEmpty()) m_joined += m_view;
      if (needsBlank) m_joined += SString::Space;
      m_joined += tag;
      m_view = m_joined.View();
    }
  }
  SStringView View() const { return m_view; }

 private:
  SStringView m_view;
  SStringBuffer m_joined{kEntryRoom};
  bool m_isOpenWord = false;
};

// One entry, as views into its text where that is possible.
class EntryReader {
 public:
  // False when the text is no entry.
  bool Read(SStringView text) {
    rtf::TagReader tags(text);
    m_words.Clear();
    m_name.Clear();
    m_hasNumber = false;
    if (tags.Next(false) != WTEXT("{")) return false;
    ReadName(tags, ReadWords(tags));
    return m_hasNumber && !Name().empty();
  }

  int Number() const { return m_number; }
  SStringView Words() const { return m_words.View(); }
  SStringView Name() const {
    SStringView name = m_name.View();
    while (!name.empty() && rtf::IsSpace(name.front())) name.remove_prefix(1);
    name = rtf::TrimRight(name);
    if (!name.empty() && name.back() == ';') name.remove_suffix(1);
    return name;
  }

 private:
  static bool IsGroup(SStringView tag) { return tag[0] == '{'; }
  static bool IsEnd(SStringView tag) { return tag.empty() || tag[0] == '}'; }

  // Up to the name; returns its first tag, or the entry's end.
  SStringView ReadWords(rtf::TagReader& tags) {
    SStringView tag = tags.Next(true);
    for (; !IsEnd(tag) && (IsGroup(tag) || !IsName(tag)); tag = tags.Next(true)) {
      if (IsGroup(tag)) continue;
      while (!tag.empty() && (rtf::IsSpace(tag.back()) || tag.back() == ';')) tag.remove_suffix(1);
      if (!m_hasNumber && IsNumberWord(tag, m_number)) {
        m_hasNumber = true;
      } else if (tag.size() > 1 && !rtf::IsBinary(tag)) {  // a lone backslash would make an escape with the next word
        m_words.Add(tag);
      }
    }
    return tag;
  }
  void ReadName(rtf::TagReader& tags, SStringView tag) {
    for (; !IsEnd(tag); tag = tags.Next(true)) {
      if (!IsGroup(tag) && !rtf::IsBinary(tag)) m_name.Add(tag);
    }
  }

  int m_number = 0;
  bool m_hasNumber = false;
  Pieces m_words, m_name;
};

using FontMerge = rtf::TableMerge<rtf::TextNoCase, SRtfFontTable, SRtfFontEntry>;

int NumberInTable(FontMerge& merge, const SRtfFontTable& table, const EntryReader& entry) {
  const int place = merge.Find(entry.Name());
  if (place >= 0) return table.GetConst(place).m_number;
  return merge.Append({0, SString(entry.Name()), SString(entry.Words())});
}

void AppendEntry(SStringBuffer& text, const SRtfFontEntry& entry) {
  text += WTEXT("{\\f");
  text += SString(static_cast<long>(entry.m_number));
  text += entry.m_controlWords;
  text += SString::Space;
  text += entry.m_name;
  text += WTEXT(";}");
}

}  // namespace

SString SRtfFontEntry::GetFontEntry() const {
  SStringBuffer text(kEntryRoom);
  AppendEntry(text, *this);
  return text.Detach();
}

int SRtfFontEntry::SetFontEntry(const SString& text) {
  const SString kept(text);  // may be one of this entry's own
  *this = SRtfFontEntry();
  try {
    EntryReader entry;
    if (!entry.Read(kept)) return 0;
    *this = {entry.Number(), SString(entry.Name()), SString(entry.Words())};
    return 1;
  } catch (...) {
    return 0;
  }
}

SString SRtfFontTable::GetFontTable() const {
  SStringBuffer text(kEntryRoom * static_cast<unsigned>(GetCount() < 10000 ? GetCount() + 1 : 10000));
  text += WTEXT("{\\fonttbl\r\n");
  for (const SRtfFontEntry& entry : *this) {
    AppendEntry(text, entry);
    text += SString::CrLf;
  }
  text += WTEXT("}\r\n");
  return text.Detach();
}

SMap<int, int> SRtfFontTable::AddFontTable(const SString& text) {
  SMap<int, int> numbers;
  try {
    FontMerge merge(*this, &SRtfFontEntry::m_name);
    const SString kept(text);
    rtf::TagReader tags(kept);
    tags.Next(false);
    tags.Next(false);
    EntryReader entry;
    for (SStringView tag = tags.Next(true); !tag.empty() && tag[0] == '{'; tag = tags.Next(true)) {
      if (entry.Read(rtf::TrimRight(tag))) numbers.Add(entry.Number(), NumberInTable(merge, *this, entry));
    }
  } catch (...) {
    g_RaiseError(WTEXT("RTF Font table: Add font table"));
  }
  return numbers;
}
