#include "tools/common/text_pass.h"

#include "qxcore/core/io_exceptions.h"
#include "tools/common/console.h"
#include "tools/common/failure.h"

namespace {

constexpr std::size_t kPiece = 32768;  // characters

// Where the text of a source cannot be read on: read once more, character by character.
void FailAtUnreadable(const std::string& name, Encoding format) {
  const std::string reason = ReasonOfCurrentException();
  TextPosition position;
  try {
    TextSource again(name, format);
    again.Select();
    for (WCHAR c; again.Reader().Read(&c, sizeof c) == sizeof c;) position.Pass({&c, 1});
  } catch (const SEEncodingException&) {
    throw Failure{position.Text() + ": " + reason, kFailed, name};
  }
}

}  // namespace

unsigned ReadPiece(PipeSource& source, void* buffer, unsigned size,
                   const std::function<unsigned long(void*, unsigned long)>& read) {
  try {
    if (console::Interrupted()) throw SEIOAbortedException();
    const unsigned long bytes = read(buffer, size);
    if (bytes == 0) source.text.CheckRead();
    return static_cast<unsigned>(bytes);
  } catch (const SEEncodingException&) {
    if (source.name != "-") FailAtUnreadable(source.name, source.text.Reader().GetRequestedFormat());
    FailAt(source.name);
  } catch (...) {
    FailAt(source.name);
  }
}

TextPass::TextPass(const std::string& name, TextSource& source, SOutputStream& out, Encoding format,
                   std::optional<WCHAR> replacement)
    : m_source{name, source}, m_stream(out, format), m_target(m_stream, format) {
  if (!replacement) return;
  source.Reader().SetReplacement(*replacement);
  m_stream.SetReplacement(*replacement);
}

bool TextPass::CopyPiece() {
  m_piece.resize(kPiece);
  const auto read = [this](void* buffer, unsigned long bytes) { return m_source.text.Reader().Read(buffer, bytes); };
  const unsigned bytes = ReadPiece(m_source, m_piece.data(), static_cast<unsigned>(kPiece * sizeof(WCHAR)), read);
  if (bytes == 0) return false;
  m_target.Write(m_source.name, {m_piece.data(), bytes / sizeof(WCHAR)});
  return true;
}

TextOutcome TextPass::Finish() {
  m_stream.Close();
  const SMultiFormatReaderUnicode& reader = m_source.text.Reader();
  return {reader.GetDetectionWarning(), reader.GetEncodingWarning(), m_stream.GetEncodingWarning(),
          ShownName(reader.GetFormat())};
}
