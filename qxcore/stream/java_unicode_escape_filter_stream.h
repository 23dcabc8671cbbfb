// SJavaUnicodeEscapeFilterStream: characters as pure 7-bit text, and back.
//
// Characters above 127 become escapes of six: a backslash, "u" and four upper-case hexadecimal digits; those above
// U+FFFF are two escapes, one for each surrogate. What looks like an escape already gets one more "u", so that Unescape
// restores what went in, for every text without NUL. (The scheme is that of
// Java source files, JLS 3.3.)
//
// The inner stream returns 16-bit characters, as SMultiFormatReaderUnicode does; those of a stream of bytes
// count as U+0000 to U+00FF. At most one character more is taken from it than the output needs. When it throws in
// the middle of a block, the read returns what it has, and the next one throws.
// Threads: a stream and its inner stream belong to one thread at a time; the static functions serve any thread.
#pragma once

#include <cstddef>

#include "qxcore/platform/export.h"
#include "qxcore/stream/inner_stream.h"
#include "qxcore/stream/input_stream.h"
#include "qxcore/stream/pending_failure.h"
#include "qxcore/string/string.h"

class QXCORE_API SJavaUnicodeEscapeFilterStream : public SInputStream {
  QXCORE_DECLARE_CLASS(SJavaUnicodeEscapeFilterStream)

  // Reads from `in`, which must stay alive; the second form deletes it at the end when `owns` is set.
  explicit SJavaUnicodeEscapeFilterStream(SInputStream& in) : m_in(in) {}
  SJavaUnicodeEscapeFilterStream(SInputStream* in, bool owns) : m_in(in, owns) {}
  SJavaUnicodeEscapeFilterStream(const SJavaUnicodeEscapeFilterStream&) = delete;
  SJavaUnicodeEscapeFilterStream& operator=(const SJavaUnicodeEscapeFilterStream&) = delete;
  ~SJavaUnicodeEscapeFilterStream() override;

  // The next character of the escaped text, 0 to 127, or -1 at the end.
  int Read() override;
  // Up to `count` characters, a byte each; returns how many, fewer only at the end.
  unsigned long Read(void* buffer, unsigned long count) override;
  // Passes over up to `count` characters of the escaped text; returns how many.
  unsigned long Skip(unsigned long count) override;
  // What the inner stream has, at a byte a character, and what waits here.
  unsigned long Available() override;
  int IsEOF() override;
  // Closes the inner stream; what waits here is given up.
  void Close() override;
  int GetError() const override { return m_in->GetError(); }

  // The text without its escapes, up to the NUL, or up to `end` if that comes first. A backslash, one "u" and
  // four hexadecimal digits of either case are one character; with more than one "u", one of them goes.
  // Everything else stands for itself, bytes above 127 as U+0080 to U+00FF. A null text becomes an empty string. The
  // result is also put into *copy, unless that is null. Throws SEOutOfMemory.
  static SString Unescape(const char* text, SString* copy = nullptr);
  static SString Unescape(const char* begin, const char* end, SString* copy = nullptr);
  // Without a copy: a null that is spelled out is no end of the text.
  static SString Unescape(const char* text, std::nullptr_t) { return Unescape(text); }

 private:
  static constexpr int kNone = -1;

  int Take();
  int TakeAhead();
  int EscapeBackslash();
  bool HasPending() const { return m_letters != 0 || m_digitCount != 0 || m_next != kNone; }
  unsigned long ReadBlock(char* out, unsigned long count);
  unsigned long ReadRun(char* out, unsigned long room);

  SInnerStream<SInputStream> m_in;
  int m_next = kNone;           // the look-ahead character
  int m_letters = 0;            // "u" still to be delivered
  int m_digitCount = 0;         // digits still to be delivered, 0 to 4
  char m_digits[4] = {};        // the first one is next
  const WCHAR* m_at = nullptr;  // characters taken from the inner stream in one go, within a block read
  const WCHAR* m_end = nullptr;
  SPendingFailure m_failure;
};
