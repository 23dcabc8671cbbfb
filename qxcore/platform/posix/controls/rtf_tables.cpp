#include "qxcore/platform/posix/controls/rtf_tables.h"

#include "qxcore/platform/internal/rtf_word.h"
#include "qxcore/platform/posix/controls/rtf_bytes.h"
#include "qxcore/platform/posix/controls/rtf_charset.h"

namespace platform::rich {
namespace {

// Reads entries, in braces or not; each ends with a ";", a brace, or the next number.
template <class Char>
class FontReader {
 public:
  FontReader(const Char* at, const Char* end, unsigned documentPage, std::vector<Font>& fonts)
      : m_at(at), m_end(end), m_documentPage(documentPage), m_fonts(fonts) {}

  void Run() {
    while (m_at != m_end) {
      const Char c = *m_at;
      if (c == '{') {
        OpenGroup();
      } else if (c == '}' || c == ';') {
        ++m_at;
        EndEntry();
      } else if (c == '\\' && !IsHexByte(m_at, m_end)) {
        ReadControl();
      } else if (c == '\r' || c == '\n') {
        ++m_at;
      } else {
        DecodeByte(m_at, m_end, *Charset::Of(CodePageOf(m_font, m_documentPage)), m_font.name);
      }
    }
    EndEntry();
  }

 private:
  // Groups inside an entry (other names, embedded fonts) are skipped, with or without "\*".
  void OpenGroup() {
    ++m_at;
    const bool isInside = m_isEntry;
    const bool isOptional = m_end - m_at >= 2 && m_at[0] == '\\' && m_at[1] == '*';
    if (isInside || isOptional) {
      m_at = FindRtfGroupEnd(m_at, m_end);
      if (m_at != m_end) ++m_at;
    }
  }
  void ReadControl() {
    ++m_at;
    if (m_at == m_end) return;
    if (!IsRtfLetter(*m_at)) {
      m_font.name += static_cast<char16_t>(*m_at++);
      return;
    }
    const RtfWord<Char> word = ReadRtfWord(m_at, m_end);
    switch (word.key) {
      case RtfKey("f"):
        EndEntry();
        m_font.number = word.number;
        m_isEntry = true;
        break;
      case RtfKey("fcharset"):
        m_font.charset = word.number;
        break;
      case RtfKey("cpg"):
        m_font.codePage = word.number;
        break;
      case RtfKey("froman"):
      case RtfKey("fswiss"):
      case RtfKey("fmodern"):
      case RtfKey("fscript"):
      case RtfKey("fdecor"):
      case RtfKey("ftech"):
      case RtfKey("fbidi"):
        m_font.family.assign(m_at, word.lettersEnd);
        break;
      case RtfKey("u"):
        m_font.name += static_cast<char16_t>(word.number);
        m_at = SkipFallback(word.end, m_end, 1);
        return;
      default:
        break;
    }
    m_at = word.end;
  }
  void EndEntry() {
    while (!m_font.name.empty() && m_font.name.back() == ' ') m_font.name.pop_back();
    if (m_isEntry && !m_font.name.empty()) m_fonts.push_back(m_font);
    m_font = Font();
    m_isEntry = false;
  }

  const Char* m_at;
  const Char* m_end;
  unsigned m_documentPage;
  std::vector<Font>& m_fonts;
  Font m_font;
  bool m_isEntry = false;
};

}  // namespace

template <class Char>
void ReadFonts(const Char* at, const Char* end, unsigned documentPage, std::vector<Font>& fonts) {
  FontReader<Char>(at, end, documentPage, fonts).Run();
}

template <class Char>
void ReadColors(const Char* at, const Char* end, std::vector<Color>& colors) {
  Color color;
  while (at != end) {
    const Char c = *at++;
    if (c == ';') {
      colors.push_back(color);
      color = Color();
    }
    if (c != '\\' || at == end || !IsRtfLetter(*at)) continue;
    const RtfWord<Char> word = ReadRtfWord(at, end);
    at = word.end;
    const auto value = static_cast<std::uint8_t>(word.number);
    if (word.key == RtfKey("red")) color.red = value, color.isDefault = false;
    if (word.key == RtfKey("green")) color.green = value, color.isDefault = false;
    if (word.key == RtfKey("blue")) color.blue = value, color.isDefault = false;
  }
  if (!color.isDefault) colors.push_back(color);
}

template void ReadFonts(const char16_t*, const char16_t*, unsigned, std::vector<Font>&);
template void ReadFonts(const unsigned char*, const unsigned char*, unsigned, std::vector<Font>&);
template void ReadColors(const char16_t*, const char16_t*, std::vector<Color>&);
template void ReadColors(const unsigned char*, const unsigned char*, std::vector<Color>&);

}  // namespace platform::rich
