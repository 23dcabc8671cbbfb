// Where converted text goes; says which character a lossless conversion failed at.
#pragma once

#include <string>

#include "qxcore/stream/output_string_stream.h"
#include "tools/common/encoding_option.h"

// A place in a text, both counted from 1.
struct TextPosition {
  unsigned long long line = 1, character = 1;

  // Moves behind the text. CR LF, LF and CR end a line.
  void Pass(SStringView text);
  std::string Text() const;

 private:
  WCHAR m_last = 0;
};

// A stream into which text is written only to see what would be lost.
class Nowhere final : public SOutputStream {
 public:
  using SOutputStream::Write;
  void Write(int) override {}
  unsigned long Write(const void*, unsigned long count) override { return count; }
};

class TextTarget {
 public:
  TextTarget(SOutputStringStream& stream, Encoding format)
      : m_stream(stream), m_format(format), m_isLossless((format & Encodings::kLossless) != 0) {}

  // Throws what the stream throws; a character that cannot be written as a Failure of the file `source`.
  void Write(const std::string& source, SStringView text);

 private:
  [[noreturn]] void FailAtCharacter(const std::string& source, SStringView text);

  SOutputStringStream& m_stream;
  Encoding m_format;
  bool m_isLossless;
  TextPosition m_position;
};
