// A filter that gathers small writes into large ones.
// Threads: a stream and its inner stream belong to one thread at a time.
#pragma once

#include "qxcore/stream/inner_stream.h"
#include "qxcore/stream/output_stream.h"

class QXCORE_API SOutputBufferStream : public SOutputFilterStream {
  QXCORE_DECLARE_CLASS(SOutputBufferStream)

  // Writes to `out`, which must stay alive; the second form deletes it at the end when `owns` is set. `size` is
  // the capacity in bytes; 0 means 256. Throws SEOutOfMemory.
  explicit SOutputBufferStream(SOutputStream& out, unsigned long size = 0);
  SOutputBufferStream(SOutputStream* out, unsigned long size, bool owns);
  SOutputBufferStream(const SOutputBufferStream&) = delete;
  SOutputBufferStream& operator=(const SOutputBufferStream&) = delete;
  // Writes what waits, without flushing or closing the inner stream; a failure is lost here.
  ~SOutputBufferStream() override;

  void Write(int value) override {
    if (m_count == m_capacity) FlushBuffer();
    m_buffer[m_count++] = static_cast<unsigned char>(value);
  }
  // Blocks as large as the buffer go straight to the inner stream, whose result is given.
  unsigned long Write(const void* buffer, unsigned long count) override;
  void Flush() override;  // the buffer, then the inner stream
  void Close() override;  // flushes the buffer and closes the inner stream

 protected:
  // Hands the waiting bytes to the inner stream in one write; they stay when that throws.
  void FlushBuffer();

 private:
  SInnerStream<SOutputStream> m_out;
  unsigned char* m_buffer;
  unsigned long m_capacity;
  unsigned long m_count = 0;  // bytes that wait
};
