// What the merges of both tables do: find each read entry by its text, append what is new, and note which
// number became which.
#pragma once

#include "qxcore/container/map.h"
#include "qxcore/graphics/rtf/internal/text_index.h"

namespace rtf {

// `Table` holds entries with a number and a text; `text` is the member that entries are known by.
template <class Rule, class Table, class Entry>
class TableMerge {
 public:
  TableMerge(Table& table, SString Entry::*text) : m_table(table), m_text(text), m_index(table.GetCount()) {
    for (int i = 0; i < m_table.GetCount(); ++i) {
      if (Find(TextOf(i)) < 0) m_index.Add(TextOf(i), i);
    }
  }

  // The entry with that text, or -1.
  int Find(SStringView text) const {
    return m_index.Find(text, [this](int i) { return TextOf(i); });
  }
  // Appends an entry, numbered by its place. Returns its place.
  int Append(Entry entry) {
    const int place = entry.m_number = m_table.GetCount();
    m_table.Add(entry);
    m_index.Add(TextOf(place), place);
    return place;
  }

 private:
  SStringView TextOf(int i) const { return (m_table.GetConst(i).*m_text).View(); }

  Table& m_table;
  SString Entry::*m_text;
  TextIndex<Rule> m_index;
};

}  // namespace rtf
