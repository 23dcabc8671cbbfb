// SInflaterInputStream: a filter that decompresses raw deflate data.
// Threads: a stream and its inner stream belong to one thread at a time.
#pragma once

#include "qxcore/stream/inner_stream.h"
#include "qxcore/stream/input_stream.h"
#include "qxcore/stream/zip/inflater.h"

class QXCORE_API SInflaterInputStream : public SInputStream {
  QXCORE_DECLARE_CLASS(SInflaterInputStream)

  // Decompresses what `in` delivers; it must stay alive; the second form deletes it at the end when `owns` is
  // set. `size` is how many bytes are read from it at a time, at least 1. Throws SEOutOfMemory.
  explicit SInflaterInputStream(SInputStream& in, unsigned long size = 512);
  SInflaterInputStream(SInputStream* in, unsigned long size, bool owns);
  SInflaterInputStream(const SInflaterInputStream&) = delete;
  SInflaterInputStream& operator=(const SInflaterInputStream&) = delete;
  ~SInflaterInputStream() override;

  int Read() override;
  // Returns what one step of the inflater yields: at least 1 byte, often fewer than `count` before the end; 0 is
  // the end, or data that needs a dictionary. Whatever goes wrong, an inner stream that ends too early or throws
  // included, is SEZipException with "Invalid ZLIB data format", on purpose; only SEOutOfMemory
  // passes. GetError says whether the inner stream failed.
  unsigned long Read(void* buffer, unsigned long count) override;
  unsigned long Skip(unsigned long count) override;
  // 1 when the end of the compressed data was read.
  int IsEOF() override { return m_inflater.IsFinished(); }
  void Close() override { m_in->Close(); }
  int GetError() const override { return m_in->GetError(); }

 protected:
  // For a derived class whose own member is the inner stream; it sets m_in before the first read.
  explicit SInflaterInputStream(unsigned long size);
  // Passes the next input to the inflater. Throws SEEOFException at the end.
  void Fill();

  // Where the compressed data comes from.
  SInnerStream<SInputStream> m_in;
  // In raw mode.
  SInflater m_inflater{1};

 private:
  unsigned char* m_buffer;
  unsigned long m_size;
};
