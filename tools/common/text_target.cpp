#include "tools/common/text_target.h"

#include <cstdio>

#include "qxcore/core/io_exceptions.h"
#include "qxcore/platform/internal/utf.h"
#include "tools/common/failure.h"
#include "tools/common/utf8.h"

namespace {

bool IsPair(SStringView text, std::size_t at) {
  return platform::IsHighSurrogate(text[at]) && at + 1 < text.size() && platform::IsLowSurrogate(text[at + 1]);
}

std::string CodePoint(SStringView character) {
  const WCHAR* at = character.data();
  const char32_t value = platform::TakeUtf16(at, at + character.size());
  char text[16];
  std::snprintf(text, sizeof text, "U+%04X", static_cast<unsigned>(value));
  return text;
}

}  // namespace

void TextPosition::Pass(SStringView text) {
  for (const WCHAR c : text) {
    const bool endsPair = c == '\n' && m_last == '\r';
    m_last = c;
    if (endsPair || platform::IsLowSurrogate(c)) continue;  // counted with what was before
    if (c == '\n' || c == '\r') {
      ++line;
      character = 1;
    } else {
      ++character;
    }
  }
}

std::string TextPosition::Text() const {
  return "line " + std::to_string(line) + ", character " + std::to_string(character);
}

void TextTarget::Write(const std::string& source, SStringView text) {
  try {
    m_stream.Write(text.data(), static_cast<unsigned>(text.size()));
  } catch (const SEEncodingException&) {
    FailAtCharacter(source, text);
  }
  if (m_isLossless) m_position.Pass(text);
}

// Writes the piece once more, character by character.
void TextTarget::FailAtCharacter(const std::string& source, SStringView text) {
  Nowhere nowhere;
  SOutputStringStream probe(nowhere, m_format & ~(Encodings::kOptionalBOM | Encodings::kRequiredBOM));
  for (std::size_t at = 0; at < text.size();) {
    const SStringView character = text.substr(at, IsPair(text, at) ? 2 : 1);
    try {
      probe.Write(character.data(), static_cast<unsigned>(character.size()));
    } catch (const SEEncodingException&) {
      throw Failure{m_position.Text() + " (" + CodePoint(character) + "): " + ReasonOfCurrentException(), kFailed,
                    source};
    }
    m_position.Pass(character);
    at += character.size();
  }
  throw;
}
