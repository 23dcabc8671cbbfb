#include "qxcore/platform/posix/controls/rtf_writer.h"

#include <string_view>

namespace platform::rich {
namespace {

class Writer {
 public:
  Writer(const Document& document, std::string& rtf) : m_document(document), m_rtf(rtf) {}

  void Run() {
    m_rtf.clear();
    m_rtf.reserve(m_document.text.Length() + m_document.text.Length() / 4 + 1024);
    WriteHeader();
    WriteBody();
    m_rtf += "\\par\r\n}\r\n";
  }

 private:
  void Word(const char* name, long number) {
    m_rtf += name;
    m_rtf += std::to_string(number);
  }

  // --- header ---

  void WriteHeader() {
    m_rtf += "{\\rtf1\\ansi\\ansicpg1252";
    Word("\\deff", DefaultFont());
    WriteFonts();
    WriteColors();
    m_rtf += "\\uc1";
  }
  // The last font of a number is the one that counts.
  long DefaultFont() const {
    long place = 0;
    for (std::size_t i = 0; i < m_document.fonts.size(); ++i) {
      if (m_document.fonts[i].number == m_document.defaultFont) place = static_cast<long>(i);
    }
    return place;
  }
  void WriteFonts() {
    m_rtf += "{\\fonttbl";
    long place = 0;
    for (const Font& font : m_document.fonts) WriteFont(font, place++);
    if (place == 0) m_rtf += "{\\f0\\fnil\\fcharset0 Arial;}";
    m_rtf += "}\r\n";
  }
  void WriteFont(const Font& font, long place) {
    Word("{\\f", place);
    m_rtf += '\\';
    if (font.family.empty()) m_rtf += "fnil";
    for (const char16_t c : font.family) m_rtf += static_cast<char>(c);
    if (font.charset >= 0) Word("\\fcharset", font.charset);
    if (font.codePage > 0) Word("\\cpg", font.codePage);
    m_rtf += ' ';
    WriteText(font.name);
    m_rtf += ";}";
  }
  void WriteColors() {
    if (m_document.colors.empty()) return;
    m_rtf += "{\\colortbl ";
    for (const Color& color : m_document.colors) {
      if (!color.isDefault) {
        Word("\\red", color.red);
        Word("\\green", color.green);
        Word("\\blue", color.blue);
      }
      m_rtf += ';';
    }
    m_rtf += "}\r\n";
  }

  // --- body ---

  void WriteBody() {
    const std::u16string_view text = m_document.text.View();
    std::size_t at = 0, character = 0, paragraph = 0;
    do {
      std::size_t end = text.size();
      const bool isNewParagraph = Enter(m_document.paragraphs, paragraph, at, end);
      const bool isNewCharacter = Enter(m_document.characters, character, at, end);
      if (isNewParagraph) WriteParagraph(m_document.paragraphs[paragraph - 1].format);
      if (isNewCharacter) WriteCharacters(m_document.characters[character - 1].format);
      WriteText(text.substr(at, end - at));
      at = end;
    } while (at < text.size());
  }
  // Moves `next` behind the run that begins at `at`, if one does, and `end` to where the next one begins.
  template <class Format>
  static bool Enter(const std::vector<FormatRun<Format>>& runs, std::size_t& next, std::size_t at, std::size_t& end) {
    const bool isNew = next < runs.size() && runs[next].start <= at;
    if (isNew) ++next;
    if (next < runs.size() && runs[next].start < end) end = runs[next].start;
    return isNew;
  }
  void WriteParagraph(const ParagraphFormat& format) {
    constexpr const char* kAlignments[] = {"", "\\qc", "\\qr", "\\qj"};
    m_rtf += "\\pard";
    m_rtf += kAlignments[format.alignment];
    if (format.left != 0) Word("\\li", format.left);
    if (format.first != 0) Word("\\fi", format.first);
    if (format.right != 0) Word("\\ri", format.right);
    m_rtf += ' ';
  }
  void WriteCharacters(const CharFormat& format) {
    m_rtf += "\\plain";
    if (format.font >= 0) Word("\\f", format.font);
    Word("\\fs", format.size);
    WriteColor("\\cf", format.color);
    WriteColor("\\highlight", format.back);
    constexpr struct {
      std::uint16_t flag;
      const char* word;
    } kFlags[] = {
        {CharFormat::kBold, "\\b"},        {CharFormat::kItalic, "\\i"},    {CharFormat::kUnderline, "\\ul"},
        {CharFormat::kStrike, "\\strike"}, {CharFormat::kSuper, "\\super"}, {CharFormat::kSub, "\\sub"},
        {CharFormat::kHidden, "\\v"},      {CharFormat::kCaps, "\\caps"},   {CharFormat::kSmallCaps, "\\scaps"}};
    for (const auto& [flag, word] : kFlags) {
      if ((format.flags & flag) != 0) m_rtf += word;
    }
    m_rtf += ' ';
  }
  void WriteColor(const char* word, std::int32_t color) {
    if (color >= 0 && static_cast<std::size_t>(color) < m_document.colors.size()) Word(word, color);
  }
  void WriteText(std::u16string_view text) {
    for (const char16_t c : text) WriteCharacter(c);
  }
  void WriteCharacter(char16_t c) {
    if (c == '\\' || c == '{' || c == '}') {
      m_rtf += '\\';
      m_rtf += static_cast<char>(c);
    } else if (c >= ' ' && c < 0x7F) {
      m_rtf += static_cast<char>(c);
    } else if (c == '\r') {
      m_rtf += "\\par\r\n";
    } else if (c == '\t') {
      m_rtf += "\\tab ";
    } else if (c == '\f') {
      m_rtf += "\\page ";
    } else if (c != '\n') {
      Word("\\u", static_cast<std::int16_t>(c));
      m_rtf += '?';
    }
  }

  const Document& m_document;
  std::string& m_rtf;
};

}  // namespace

void WriteRtf(const Document& document, std::string& rtf) { Writer(document, rtf).Run(); }

}  // namespace platform::rich
