// The reader that delivers text of any encoding as UTF-16 characters.
// ```cpp
// SInputFile file(path);
// SMultiFormatReaderUnicode reader(file, SMultiFormatReaderUnicode::Support::kANSI |
//                                            SMultiFormatReaderUnicode::Support::kFullDetect);
// while (!reader.IsEOF()) Show(reader.ReadLn());
// Show(reader.GetDetectionWarning(), reader.GetEncodingWarning());
// ```
// A character that cannot be mapped is replaced (U+FFFD unless changed) or dropped, and the encoding
// warning says so; with the lossless policy it throws an exception of the SEIOCantMap family, after
// everything before it was delivered, and again at each further read. Whatever throws in the middle of a
// block, a line or the rest: the read returns what it has, and the next one throws.
// Read errors of the source look like the end of the data; ask GetError.
// Threads: a reader and its source belong to one thread at a time.
#pragma once

#include "qxcore/stream/encoding/multi_format_reader_base.h"
#include "qxcore/stream/pending_failure.h"
#include "qxcore/stream/seekable_char_reader.h"

class QXCORE_API SMultiFormatReaderUnicode : public SMultiFormatReaderBase, public SAbstractIO::SIOSeekableCharReader {
  QXCORE_DECLARE_CLASS(SMultiFormatReaderUnicode)

  // Reads from `in`, which must stay alive; the second form deletes it at the end when `owns` is set.
  explicit SMultiFormatReaderUnicode(SInputStream& in, Encoding requested = Support::kANSI);
  SMultiFormatReaderUnicode(SInputStream* in, Encoding requested, bool owns);
  ~SMultiFormatReaderUnicode() override;

  // The next character, 0 to 0xFFFF, or -1 at the end. May throw what CheckFormat throws, the first time.
  int Read() override {
    if (TextLength() == 0 && !fetch()) return -1;
    int character = *TextStart();
    Deliver(1);
    return character;
  }
  // Up to `count` bytes of 16-bit characters, whole ones only; returns the number of bytes.
  unsigned long Read(void* buffer, unsigned long count) override;
  unsigned long ReadCharacters(WCHAR* buffer, unsigned long count) override {
    return SMultiFormatReaderUnicode::Read(buffer, count * sizeof(WCHAR)) / sizeof(WCHAR);
  }
  // Passes over characters; returns how many.
  unsigned long Skip(unsigned long count) override;
  // The next line, without its end: a line feed, or a carriage return and one. Empty at the end, too: ask
  // IsEOF before.
  SString ReadLn() override;
  // Everything that is left.
  SString ReadAll();

  // As a character reader: positions count the characters delivered, and only forward seeking works.
  int ReadChar() override { return SMultiFormatReaderUnicode::Read(); }
  bool SeekPos(unsigned long position) override;
  unsigned long GetPos() const override { return m_delivered; }
  bool SeekSupported() const override { return false; }
  unsigned long Available() override { return SMultiFormatReaderBase::Available(); }
  int IsEOF() override { return !m_failure.IsThere() && SMultiFormatReaderBase::IsEOF(); }
  void SetFormat(Encoding requested) override;
  void Reset() override;

  // What stands for characters that cannot be mapped; 0 drops them. Returns the former one.
  WCHAR SetReplacement(WCHAR replacement);
  WCHAR GetReplacement() const;

 protected:
  // Decodes the next run of raw bytes; false at the end.
  bool fetch() {
    m_failure.Throw();
    return DecodeNextRun();
  }
  // The next character, or -1.
  int get_char() { return SMultiFormatReaderUnicode::Read(); }

 private:
  bool FetchMore(bool hasSome);

  SPendingFailure m_failure;
};
