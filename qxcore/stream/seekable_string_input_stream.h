// An input stream over a seekable character reader.
//
// Like the multi-format readers it delivers 16-bit characters: single reads return one character, block
// reads bytes of whole characters. Threads: a stream belongs to one thread at a time.
#pragma once

#include "qxcore/stream/inner_stream.h"
#include "qxcore/stream/input_stream.h"
#include "qxcore/stream/seekable_char_reader.h"

class QXCORE_API SSeekableStringInputStream : public SInputStream {
  QXCORE_DECLARE_CLASS(SSeekableStringInputStream)

  using Reader = SAbstractIO::SIOSeekableCharReader;

  // Reads from `reader`, which must stay alive; the second form deletes it at the end when `owns` is set.
  explicit SSeekableStringInputStream(Reader& reader);
  SSeekableStringInputStream(Reader* reader, bool owns);
  SSeekableStringInputStream(const SSeekableStringInputStream&) = delete;
  SSeekableStringInputStream& operator=(const SSeekableStringInputStream&) = delete;
  ~SSeekableStringInputStream() override;

  // The next character, 0 to 0xFFFF, or -1.
  int Read() override { return m_reader->ReadChar(); }
  // Up to `count` bytes of 16-bit characters, whole ones only; returns the number of bytes.
  unsigned long Read(void* buffer, unsigned long count) override;
  SString ReadLn() { return m_reader->ReadLn(); }
  bool SeekPos(unsigned long position) { return m_reader->SeekPos(position); }
  unsigned long GetPos() const { return m_reader->GetPos(); }
  unsigned long Available() override { return m_reader->Available(); }
  int IsEOF() override { return m_reader->IsEOF(); }
  // Marks last for ever, where the reader can seek.
  void Mark(unsigned long limit) override;
  // Throws SEIOResetInvalid without a mark, or when the reader cannot go back.
  void Reset() override;

 private:
  SInnerStream<Reader> m_reader;
  bool m_hasMark = false;
  unsigned long m_mark = 0;
};
