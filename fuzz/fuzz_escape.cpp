// Unicode escapes: escaping is the same in every way of reading and goes back; unescaping takes any bytes.

#include "fuzz/fuzz_input.h"
#include "qxcore/stream/java_unicode_escape_filter_stream.h"

namespace {

using Filter = SJavaUnicodeEscapeFilterStream;
using Text = std::basic_string<WCHAR>;

// Gives characters, at most `piece` at a time; 0 for as many as are asked for.
class Characters : public SInputStream {
 public:
  Characters(const Text& text, unsigned long piece) : m_text(text), m_piece(piece) {}
  using SInputStream::Read;
  int Read() override { return m_at == m_text.size() ? -1 : m_text[m_at++]; }
  unsigned long ReadCharacters(WCHAR* buffer, unsigned long count) override {
    if (m_piece != 0 && count > m_piece) count = m_piece;
    const unsigned long got = static_cast<unsigned long>(m_text.copy(buffer, count, m_at));
    m_at += got;
    return got;
  }
  int IsEOF() override { return m_at == m_text.size(); }

 private:
  const Text& m_text;
  std::size_t m_at = 0;
  unsigned long m_piece;
};

std::string Escaped(const Text& text, unsigned long inPiece, unsigned long outPiece) {
  Characters in(text, inPiece);
  Filter filter(in);
  std::string escaped;
  char buffer[257];
  if (outPiece == 0) {
    for (int c; (c = filter.Read()) >= 0;) escaped += static_cast<char>(c);
    return escaped;
  }
  while (unsigned long got = filter.Read(buffer, outPiece)) escaped.append(buffer, got);
  return escaped;
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  FuzzInput input(data, size);
  const unsigned long inPiece = input.Byte(), outPiece = input.Byte() + 1ul;
  const std::string_view bytes = input.Rest();

  const Text text = ToText(bytes);
  const std::string escaped = Escaped(text, 0, 0);
  for (char c : escaped) FUZZ_CHECK(static_cast<unsigned char>(c) < 128);
  FUZZ_CHECK(Escaped(text, inPiece, outPiece) == escaped);
  FUZZ_CHECK(Filter::Unescape(escaped.c_str()).View() == SStringView(text));

  // Bytes of any kind, in a block of their own size, so that no read goes beyond.
  const std::string any(bytes);
  const SString unescaped = Filter::Unescape(any.data(), any.data() + any.size());
  FUZZ_CHECK(static_cast<std::size_t>(unescaped.Length()) <= any.size());
  return 0;
}
