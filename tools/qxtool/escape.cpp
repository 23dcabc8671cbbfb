// qxtool escape and unescape: text as 7-bit text with Unicode escapes, and back.

#include <string>
#include <vector>

#include "qxcore/stream/java_unicode_escape_filter_stream.h"
#include "tools/qxtool/text_pipe.h"

namespace {

constexpr unsigned kPiece = 65536;

// Text with escapes that comes in pieces.
class Unescaper {
 public:
  Unescaper(const std::string& source, TextTarget& target) : m_source(source), m_target(target) {}

  void Write(const WCHAR* text, unsigned count) {
    for (const WCHAR* end = text + count; text != end;) {
      while (text != end && IsPlain(*text)) m_plain += static_cast<char>(*text++);
      if (text == end) break;
      // No escape reaches across a character that is not plain.
      Flush(m_plain.size());
      const WCHAR* start = text;
      while (text != end && !IsPlain(*text)) ++text;
      m_target.Write(m_source, {start, static_cast<std::size_t>(text - start)});
    }
    Flush(m_plain.size() - OpenTail());
  }
  void Finish() { Flush(m_plain.size()); }

 private:
  static bool IsPlain(WCHAR c) { return c < 128 && c != 0; }

  // How many characters at the end may be the beginning of an escape.
  std::size_t OpenTail() const {
    constexpr std::size_t kDigits = 4;
    const std::size_t backslash = m_plain.rfind('\\');
    if (backslash == std::string::npos) return 0;
    const std::size_t digits = m_plain.find_first_not_of('u', backslash + 1);
    if (digits == std::string::npos) return m_plain.size() - backslash;
    const bool isOpen = digits > backslash + 1 && m_plain.size() - digits < kDigits &&
                        m_plain.find_first_not_of("0123456789ABCDEFabcdef", digits) == std::string::npos;
    return isOpen ? m_plain.size() - backslash : 0;
  }
  void Flush(std::size_t count) {
    if (count == 0) return;
    const SString text = SJavaUnicodeEscapeFilterStream::Unescape(m_plain.data(), m_plain.data() + count);
    m_target.Write(m_source, text.View());
    m_plain.erase(0, count);
  }

  const std::string& m_source;
  TextTarget& m_target;
  std::string m_plain;  // 7-bit text that was not written yet
};

}  // namespace

int Escape(const TextPipeOptions& options) {
  return PipeText(options, [](TextPass& pass) {
    PipeSource& source = pass.Source();
    SJavaUnicodeEscapeFilterStream filter(source.text.Reader());
    std::vector<char> escaped(kPiece);
    std::vector<WCHAR> text(kPiece);
    auto read = [&filter](void* buffer, unsigned long size) { return filter.Read(buffer, size); };
    while (unsigned count = ReadPiece(source, escaped.data(), kPiece, read)) {
      text.assign(escaped.begin(), escaped.begin() + count);
      pass.Target().Write(source.name, {text.data(), count});
    }
  });
}

int Unescape(const TextPipeOptions& options) {
  return PipeText(options, [](TextPass& pass) {
    PipeSource& source = pass.Source();
    Unescaper unescaper(source.name, pass.Target());
    std::vector<WCHAR> text(kPiece / sizeof(WCHAR));
    auto read = [&source](void* buffer, unsigned long size) { return source.text.Reader().Read(buffer, size); };
    while (unsigned bytes = ReadPiece(source, text.data(), kPiece, read)) {
      unescaper.Write(text.data(), bytes / static_cast<unsigned>(sizeof(WCHAR)));
    }
    unescaper.Finish();
  });
}
