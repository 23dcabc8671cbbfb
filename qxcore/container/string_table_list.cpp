// The list form of SStringTable.

#include <cstdint>

#include "qxcore/container/internal/list_escape.h"
#include "qxcore/container/string_table.h"

namespace {

// Whether a character is in a set: a table for ASCII, a search for the others.
class CharacterSet {
 public:
  explicit CharacterSet(const WCHAR* characters) : m_characters(characters) {
    for (; characters != nullptr && *characters != 0; ++characters) Add(*characters);
  }
  // Lets Contains be true for the character.
  void Add(WCHAR character) {
    if (character < 128) {
      m_ascii[character >> 5] |= std::uint32_t{1} << (character & 31);
    } else {
      m_hasOthers = true;
    }
  }
  bool Contains(WCHAR character) const {
    if (character < 128) return (m_ascii[character >> 5] >> (character & 31) & 1) != 0;
    return m_hasOthers && ContainsOther(character);
  }

 private:
  bool ContainsOther(WCHAR character) const {
    for (const WCHAR* at = m_characters; *at != 0; ++at) {
      if (*at == character) return true;
    }
    return false;
  }

  std::uint32_t m_ascii[4] = {};
  bool m_hasOthers = false;
  const WCHAR* m_characters;
};

// Takes the parts of a list from front to back.
class ListReader {
 public:
  ListReader(SStringView list, const WCHAR* separators, WCHAR escape)
      : m_at(list.data()), m_end(list.data() + list.size()), m_separators(separators), m_escape(escape) {}

  // There are no parts in an empty list; else one more than breaks.
  bool HasMore() const { return m_at != m_end || m_isBehindBreak; }

  SString Next() {
    const WCHAR* run = m_at;
    SString start;  // of a part with escapes: what comes before the present run
    for (; m_at != m_end && !m_separators.Contains(*m_at); ++m_at) {
      if (*m_at != m_escape || m_escape == 0 || m_at + 1 == m_end) continue;
      start += Run(run);
      run = ++m_at;
    }
    SString part = start.IsEmpty() ? SString(Run(run)) : start += Run(run);
    SkipBreak();
    return part;
  }

 private:
  SStringView Run(const WCHAR* from) const { return SStringView(from, static_cast<std::size_t>(m_at - from)); }

  // A separator, and those behind it that differ from the one before.
  void SkipBreak() {
    m_isBehindBreak = m_at != m_end;
    if (!m_isBehindBreak) return;
    for (++m_at; m_at != m_end && *m_at != m_at[-1] && m_separators.Contains(*m_at); ++m_at) {
    }
  }

  const WCHAR* m_at;
  const WCHAR* m_end;
  CharacterSet m_separators;
  WCHAR m_escape;
  bool m_isBehindBreak = false;
};

}  // namespace

SString SStringTable::GetAsList(WCHAR separator, WCHAR escape) const {
  SStringBuffer list(256);
  for (int i = 0; i < GetCount(); ++i) {
    if (i != 0) list += separator;
    AppendEscaped(list, (*this)[i].View(), separator, escape);
  }
  return list.Detach();
}

int SStringTable::AddFromList(const SString& list, const WCHAR* separators, WCHAR escape) {
  SString text = list;  // which may be an element of this table
  int before = GetCount();
  ListReader reader(text.View(), separators, escape);
  try {
    while (reader.HasMore()) Add(reader.Next());
  } catch (...) {
    CutTo(before);
    throw;
  }
  return GetCount() - before;
}

int SStringTable::AddFromList(unsigned int id, const WCHAR* separators, WCHAR escape) {
  SString list;
  list.LoadStringW(id);
  return AddFromList(list, separators, escape);
}

int SStringTable::AddFromList(const SStringTable& other) {
  int count = other.GetCount();
  *this += other;
  return count;
}

int SStringTable::SetFromList(const SString& list, const WCHAR* separators, WCHAR escape) {
  SStringTable parts;
  int count = parts.AddFromList(list, separators, escape);
  SwapWith(parts);
  return count;
}

int SStringTable::SetFromList(unsigned int id, const WCHAR* separators, WCHAR escape) {
  SStringTable parts;
  int count = parts.AddFromList(id, separators, escape);
  SwapWith(parts);
  return count;
}

int SStringTable::SetFromList(const SStringTable& other) {
  *this = other;
  return GetCount();
}
