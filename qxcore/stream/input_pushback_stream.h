// A filter that lets the reader push bytes back.
// Threads: a stream and its inner stream belong to one thread at a time.
#pragma once

#include "qxcore/stream/inner_stream.h"
#include "qxcore/stream/input_stream.h"
#include "qxcore/stream/pending_failure.h"

class QXCORE_API SInputPushbackStream : public SInputStream {
  QXCORE_DECLARE_CLASS(SInputPushbackStream)

  // Reads from `in`, which must stay alive; the second form deletes it at the end when `owns` is set. `size` is
  // how many bytes can be pushed back at a time. Throws SEOutOfMemory.
  explicit SInputPushbackStream(SInputStream& in, unsigned long size = 1);
  SInputPushbackStream(SInputStream* in, unsigned long size, bool owns);
  SInputPushbackStream(const SInputPushbackStream&) = delete;
  SInputPushbackStream& operator=(const SInputPushbackStream&) = delete;
  ~SInputPushbackStream() override;

  int Read() override {
    if (m_position < m_size) return m_area[m_position++];
    m_failure.Throw();
    return m_in->Read();
  }
  // What was pushed back, then the inner stream. When an inner read reports failure (all ones) the result is the
  // number of bytes delivered before, or the failure when there were none; when it throws after some were delivered,
  // the next read throws.
  unsigned long Read(void* buffer, unsigned long count) override;
  unsigned long Skip(unsigned long count) override;
  unsigned long Available() override;
  int IsEOF() override { return m_position == m_size && !m_failure.IsThere() && m_in->IsEOF(); }
  // Marks the inner stream and keeps what is pushed back. Throws SEOutOfMemory.
  void Mark(unsigned long limit) override;
  void Reset() override;
  void Close() override;
  int GetError() const override { return m_in->GetError(); }

  // Pushes one byte back, or a block, which is read again in its order. Throws SEIOPushBackFull and
  // changes nothing when there is no room.
  void Unread(unsigned char byte);
  void Unread(const void* buffer, unsigned long count);

 private:
  SInnerStream<SInputStream> m_in;
  unsigned char* m_area;  // filled from its end towards its start
  unsigned long m_size;
  unsigned long m_position;  // first byte that was pushed back; m_size when none is
  unsigned char* m_savedArea = nullptr;
  unsigned long m_savedPosition = 0;
  SPendingFailure m_failure;
};
