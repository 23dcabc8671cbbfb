// The parts of a text, as SRtfDocument hands them out.

#include "qxcore/graphics/rtf/internal/parts.h"
#include "qxcore/graphics/rtf/internal/tag.h"
#include "qxcore/string/string_buffer.h"
#include "qxcore/ui/rtf/document.h"

namespace {

void Cut(SString& text, SStringView part) {
  text.Delete(static_cast<int>(part.data() - text.GetSafePointer()), static_cast<int>(part.size()));
}

// Goes over the brace and the word of a table, without the "\*" that may stand between them. Returns whether it does.
bool ReadHead(rtf::TagReader& tags, SStringView& brace, SStringView& word) {
  brace = tags.Next(false);
  word = tags.Next(false);
  const bool isStarred = rtf::TrimRight(word) == WTEXT("\\*");
  if (isStarred) word = tags.Next(false);
  return isStarred;
}

// Puts braces around the entries of a font table that have none, and leaves out a "\*" of the table.
class EntryGrouper {
 public:
  explicit EntryGrouper(SStringView table) : m_text(static_cast<unsigned>(table.size()) + 64), m_tags(table) {}

  SString Run() {
    SStringView brace, word;
    ReadHead(m_tags, brace, word);
    m_text += brace;
    m_text += word;
    for (SStringView tag = m_tags.Next(true); !tag.empty() && tag[0] != '}'; tag = m_tags.Next(true)) Take(tag);
    if (m_isInEntry) m_text += WTEXT(";}");
    m_text += static_cast<WCHAR>('}');
    return m_text.Detach();
  }

 private:
  void Take(SStringView tag) {
    if (!m_isInEntry && tag[0] != '{') {
      m_text += static_cast<WCHAR>('{');
      m_isInEntry = true;
    }
    if (m_isOpenWord && tag[0] != '\\' && tag[0] != '{') m_text += SString::Space;
    m_isOpenWord = rtf::IsOpenWord(tag);
    const std::size_t last = tag[0] == '{' ? SStringView::npos : tag.find(static_cast<WCHAR>(';'));
    m_text += tag.substr(0, last == SStringView::npos ? last : last + 1);
    if (last == SStringView::npos) return;
    m_text += static_cast<WCHAR>('}');
    m_isInEntry = m_isOpenWord = false;
  }

  SStringBuffer m_text;
  rtf::TagReader m_tags;
  bool m_isInEntry = false;
  bool m_isOpenWord = false;  // the last tag was a control word without its blank
};

// Whether a table has to be written anew so that merging reads it, and can be: binary data among the entries would
// move.
bool NeedsGrouping(SStringView table) {
  rtf::TagReader tags(table);
  SStringView brace, word;
  bool isNeeded = ReadHead(tags, brace, word);
  for (SStringView tag = tags.Next(true); !tag.empty() && tag[0] != '}'; tag = tags.Next(true)) {
    if (rtf::IsBinary(tag)) return false;
    isNeeded = isNeeded || tag[0] != '{';
  }
  return isNeeded;
}

int ExtractGroup(SString& text, SString& part, int cut, std::uint64_t key) {
  part = SString::null;
  try {
    const SStringView group = rtf::FindGroup(text, key);
    if (group.empty()) return 0;
    const bool isRegrouped = key == platform::RtfKey("fonttbl") && NeedsGrouping(group);
    part = isRegrouped ? EntryGrouper(group).Run() : SString(group);
    if (cut != 0) Cut(text, group);
    return 1;
  } catch (...) {
    part = SString::null;
    return 0;
  }
}

}  // namespace

int SRtfDocument::ExtractHeader(SString& rtf, SString& header, int cut) {
  header = SString::null;
  try {
    std::int32_t fallback;
    const SStringView found = rtf::FindHeader(rtf, fallback);
    if (found.empty()) return 0;
    header = found;
    if (cut == 0) return 1;
    // Unicode characters of the body count their substitutes by the header's last word.
    SString prefix;
    if (fallback != 1) prefix.Format(WTEXT("\\uc%d "), static_cast<int>(fallback));
    rtf = prefix + rtf.Mid(header.Length());
    return 1;
  } catch (...) {
    header = SString::null;
    return 0;
  }
}

int SRtfDocument::ExtractFontTable(SString& rtf, SString& table, int cut) {
  return ExtractGroup(rtf, table, cut, platform::RtfKey("fonttbl"));
}

int SRtfDocument::ExtractColorTable(SString& rtf, SString& table, int cut) {
  return ExtractGroup(rtf, table, cut, platform::RtfKey("colortbl"));
}

int SRtfDocument::ExtractStyleTable(SString& rtf, SString& table, int cut) {
  return ExtractGroup(rtf, table, cut, platform::RtfKey("stylesheet"));
}
