// A filter that buffers an input stream and can go back to a mark.
// Threads: a stream and its inner stream belong to one thread at a time.
#pragma once

#include "qxcore/stream/inner_stream.h"
#include "qxcore/stream/input_stream.h"
#include "qxcore/stream/pending_failure.h"

class QXCORE_API SInputBufferStream : public SInputStream {
  QXCORE_DECLARE_CLASS(SInputBufferStream)

  // Reads from `in`, which must stay alive; the second form deletes it at the end when `owns` is set. `size` is
  // the first capacity in bytes and the first limit of a mark; 0 means 256. Throws SEOutOfMemory.
  explicit SInputBufferStream(SInputStream& in, unsigned long size = 0);
  SInputBufferStream(SInputStream* in, unsigned long size, bool owns);
  SInputBufferStream(const SInputBufferStream&) = delete;
  SInputBufferStream& operator=(const SInputBufferStream&) = delete;
  ~SInputBufferStream() override;

  int Read() override {
    if (m_position < m_count) [[likely]]
      return m_buffer[m_position++];
    return ReadRefilled();
  }
  // Blocks as large as the buffer go straight to the caller while no mark is set. When the inner stream throws in
  // the middle of a block, the read returns what it has, and the next one throws.
  unsigned long Read(void* buffer, unsigned long count) override;
  unsigned long Skip(unsigned long count) override;
  unsigned long Available() override;
  // Every buffered byte was read, and the inner stream is at its end.
  int IsEOF() override;
  // Keeps at least `limit` bytes (0: 8192) from here on for Reset; the mark is dropped when more are read.
  void Mark(unsigned long limit) override;
  // Throws SEIOResetInvalid without a mark.
  void Reset() override;
  // Drops the buffer's content and closes the inner stream.
  void Close() override;
  int GetError() const override { return m_in->GetError(); }
  // Places are those of the inner stream. Going to one drops the mark.
  bool GetPlace(std::uint64_t* place) override;
  bool GoToPlace(std::uint64_t place) override;

 protected:
  // Reads more behind what is buffered, or anew from the buffer's start while no mark is set.
  void Fill();

 private:
  static constexpr long kNoMark = -1;

  int ReadRefilled();
  void ReadInto(unsigned char* out, unsigned long count, unsigned long& done);

  SInnerStream<SInputStream> m_in;
  unsigned char* m_buffer;
  unsigned long m_capacity;
  unsigned long m_count = 0;     // valid bytes
  unsigned long m_position = 0;  // the next one
  long m_mark = kNoMark;
  unsigned long m_markLimit;  // the largest capacity while a mark is set
  SPendingFailure m_failure;
};
