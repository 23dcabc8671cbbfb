#include "qxcore/graphics/rtf/color_table.h"

#include "qxcore/core/raise_error.h"
#include "qxcore/graphics/rtf/internal/merge.h"
#include "qxcore/graphics/rtf/internal/tag.h"
#include "qxcore/string/string_buffer.h"

namespace {

constexpr unsigned kEntryRoom = 40;  // characters that most definitions fit into

// Walks over the definitions of a colour table group.
class ColorReader {
 public:
  explicit ColorReader(SStringView text) : m_at(text.data()), m_end(text.data() + text.size()) {
    m_at = rtf::SkipSpace(m_at, m_end);
    if (m_at != m_end && *m_at == '{') m_at = rtf::SkipSpace(m_at + 1, m_end);
    if (m_at == m_end || *m_at != '\\') return;
    const auto word = platform::ReadRtfWord(m_at + 1, m_end);
    m_at = word.end;
    m_isTable = word.key == platform::RtfKey("colortbl");
  }

  // The next definition; false behind the last one.
  bool Next(SStringView& definition) {
    if (!m_isTable) return false;
    const WCHAR* start = m_at = rtf::SkipSpace(m_at, m_end);
    while (m_at != m_end && *m_at != ';' && *m_at != '}') {
      if (*m_at == '{') {
        // A group has no place here, nor has what stands before it.
        start = m_at = rtf::SkipSpace(rtf::SkipGroup(m_at, m_end), m_end);
      } else {
        ++m_at;
      }
    }
    definition = rtf::TrimRight(SStringView(start, static_cast<std::size_t>(m_at - start)));
    m_isTable = m_at != m_end && *m_at == ';';
    if (m_isTable) ++m_at;
    return m_isTable || !definition.empty();
  }

 private:
  const WCHAR* m_at;
  const WCHAR* m_end;
  bool m_isTable = false;
};

void AppendEntry(SStringBuffer& text, const SRtfColorEntry& entry) {
  text += entry.m_text;
  text += static_cast<WCHAR>(';');
}

}  // namespace

SString SRtfColorEntry::GetColorEntry() const {
  SStringBuffer text(kEntryRoom);
  AppendEntry(text, *this);
  return text.Detach();
}

int SRtfColorEntry::SetColorEntry(const SString& text) {
  SStringView definition = text.View();
  if (!definition.empty() && definition.back() == ';') definition.remove_suffix(1);
  m_text = rtf::TrimRight(definition);
  m_number = 0;
  return 1;
}

SString SRtfColorTable::GetColorTable() const {
  SStringBuffer text(kEntryRoom * static_cast<unsigned>(GetCount() < 10000 ? GetCount() + 1 : 10000));
  text += WTEXT("{\\colortbl\r\n");
  for (const SRtfColorEntry& entry : *this) {
    AppendEntry(text, entry);
    text += SString::CrLf;
  }
  text += WTEXT("}\r\n");
  return text.Detach();
}

SMap<int, int> SRtfColorTable::AddColorTable(const SString& text) {
  SMap<int, int> numbers;
  try {
    rtf::TableMerge<rtf::ExactText, SRtfColorTable, SRtfColorEntry> merge(*this, &SRtfColorEntry::m_text);
    const SString kept(text);
    ColorReader definitions(kept);
    SStringView definition;
    for (int number = 0; definitions.Next(definition); ++number) {
      int place = merge.Find(definition);
      if (place < 0) place = merge.Append({0, SString(definition)});
      numbers.Add(number, place);
    }
  } catch (...) {
    g_RaiseError(WTEXT("RTF Color table: Add color table"));
  }
  return numbers;
}
