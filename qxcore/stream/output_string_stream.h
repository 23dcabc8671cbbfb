// Writes UTF-16 text into a byte stream in a chosen encoding, or keeps it as a string.
//
// Formats with bit kOptionalBOM or kRequiredBOM begin with a byte order mark, also when no text follows.
// A character that cannot be mapped is replaced ('?' unless changed) or dropped, and the encoding warning
// says so; with the lossless policy it throws an exception of the SEIOCantMap family. A surrogate pair may
// come in two calls: its first half waits, until Close at the latest.
// Threads: a stream belongs to one thread at a time.
#pragma once

#include <memory>

#include "qxcore/platform/export.h"
#include "qxcore/stream/encoding/multi_format_support.h"
#include "qxcore/stream/inner_stream.h"
#include "qxcore/stream/output_stream.h"
#include "qxcore/string/string_buffer.h"

class STextEncoder;

class QXCORE_API SOutputStringStream : public SOutputStream {
  QXCORE_DECLARE_CREATABLE_CLASS(SOutputStringStream)

  using Support = SAbstractIO::SMultiFormatSupport;
  using Encoding = Support::Encoding;

  // Keeps the text in memory, for GetString.
  SOutputStringStream();
  // Writes to `out`, which must stay alive; the second form deletes it at the end when `owns` is set.
  explicit SOutputStringStream(SOutputStream& out, Encoding format = Support::kUTF16LE);
  SOutputStringStream(SOutputStream* out, Encoding format, bool owns);
  SOutputStringStream(const SOutputStringStream&) = delete;
  SOutputStringStream& operator=(const SOutputStringStream&) = delete;
  // Writes what waits; a failure is lost here, so call Close before.
  ~SOutputStringStream() override;

  // One 16-bit character.
  void Write(int character) override;
  // `count` bytes of 16-bit characters, whole ones only; returns the number of bytes taken.
  unsigned long Write(const void* buffer, unsigned long count) override;
  // `count` characters; returns their number.
  unsigned long Write(const WCHAR* text, unsigned int count);
  unsigned long Write(const SString& text) {
    return Write(text.GetSafePointer(), static_cast<unsigned>(text.Length()));
  }
  // The same and a line end, carriage return and line feed on every target.
  unsigned long WriteLn(const WCHAR* text, unsigned int count);
  void WriteLn();
  // Flushes the target; half of a surrogate pair goes on waiting.
  void Flush() override;
  // Writes what waits and closes the target.
  void Close() override;

  // The text so far, when it is kept in memory; returns 1, else 0 and an empty string.
  int GetString(SString* text) const;

  // The format of what follows. A mark stands only at the very beginning. Throws SEIOInvalidEncoding when
  // the machine does not support it.
  void SetFormat(Encoding format);
  Encoding GetFormat() const;
  // What stands for characters that cannot be mapped; 0 drops them. Returns the former one.
  WCHAR SetReplacement(WCHAR replacement);
  WCHAR GetReplacement() const;
  // That characters were replaced or dropped; empty while none was.
  SString GetEncodingWarning() const;
  unsigned long long GetReplacedCount() const;
  unsigned long long GetDroppedCount() const;

 private:
  void Begin();
  void WriteWaiting();

  SInnerStream<SOutputStream> m_out;
  bool m_hasBegun = false;
  WCHAR m_waitingHalf = 0;  // the first half of a surrogate pair
  std::unique_ptr<STextEncoder> m_encoder;
  SStringBuffer m_text;
};
