// Renumbering of font and colour references. The words are those of RTF 1.9.1, as Microsoft has published it.

#include "qxcore/graphics/rtf/internal/tag.h"
#include "qxcore/string/string_buffer.h"
#include "qxcore/ui/rtf/document.h"

namespace {

using platform::RtfKey;
using Numbers = SMap<int, int>;

bool IsFontReference(std::uint64_t key) {
  switch (key) {
    case RtfKey("f"):
    case RtfKey("af"):
    case RtfKey("deff"):
    case RtfKey("adeff"):
    case RtfKey("pnf"):
    case RtfKey("stshfdbch"):
    case RtfKey("stshfloch"):
    case RtfKey("stshfhich"):
    case RtfKey("stshfbi"):
      return true;
    default:
      return false;
  }
}

bool IsColorReference(std::uint64_t key) {
  switch (key) {
    case RtfKey("cf"):  // characters
    case RtfKey("cb"):
    case RtfKey("highlight"):
    case RtfKey("chcfpat"):
    case RtfKey("chcbpat"):
    case RtfKey("ulc"):
    case RtfKey("cfpat"):  // paragraphs and borders
    case RtfKey("cbpat"):
    case RtfKey("brdrcf"):
    case RtfKey("pncf"):
    case RtfKey("clcfpat"):  // tables
    case RtfKey("clcbpat"):
    case RtfKey("clcfpatraw"):
    case RtfKey("clcbpatraw"):
    case RtfKey("trcfpat"):
    case RtfKey("trcbpat"):
    case RtfKey("tscellcfpat"):
    case RtfKey("tscellcbpat"):
      return true;
    default:
      return false;
  }
}

bool IsTable(std::uint64_t key) { return key == RtfKey("fonttbl") || key == RtfKey("colortbl"); }

class Renumbering {
 public:
  Renumbering(const SString& text, const Numbers& fonts, const Numbers& colors)
      : m_fonts(fonts),
        m_colors(colors),
        m_at(text.begin()),
        m_copied(m_at),
        m_end(text.end()),
        m_result(static_cast<unsigned>(text.Length()) + 64) {}

  SString Run() {
    while ((m_at = std::char_traits<WCHAR>::find(m_at, Left(), '\\')) != nullptr && Left() > 1) {
      ++m_at;
      if (platform::IsRtfLetter(*m_at)) {
        TakeWord(platform::ReadRtfWord(m_at, m_end));
      } else {
        ++m_at;
      }
    }
    m_result.Concat(m_copied, m_end);
    return m_result.Detach();
  }

 private:
  std::size_t Left() const { return static_cast<std::size_t>(m_end - m_at); }

  void TakeWord(const platform::RtfWord<WCHAR>& word) {
    m_at = word.key == RtfKey("bin") ? platform::SkipRtfBinary(word, m_end) : word.end;
    if (IsTable(word.key)) m_at = platform::FindRtfGroupEnd(m_at, m_end);
    if (!word.hasNumber) return;
    if (IsFontReference(word.key)) Replace(word, m_fonts);
    if (IsColorReference(word.key)) Replace(word, m_colors);
  }
  void Replace(const platform::RtfWord<WCHAR>& word, const Numbers& numbers) {
    const int* number = numbers.Retrieve(word.number);
    if (number == nullptr || *number == word.number) return;
    m_result.Concat(m_copied, word.lettersEnd);
    m_result += SString(static_cast<long>(*number));
    m_copied = word.numberEnd;
  }

  const Numbers& m_fonts;
  const Numbers& m_colors;
  const WCHAR* m_at;
  const WCHAR* m_copied;  // up to here the result has everything
  const WCHAR* m_end;
  SStringBuffer m_result;
};

}  // namespace

int SRtfDocument::ChangeFontAndColor(const SString& rtf, SString& result, const SMap<int, int>& fontMap,
                                     const SMap<int, int>& colorMap) {
  try {
    const SString text(rtf);  // may be the result
    result = Renumbering(text, fontMap, colorMap).Run();
    return 1;
  } catch (...) {
    return 0;
  }
}
