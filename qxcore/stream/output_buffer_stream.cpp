#include "qxcore/stream/output_buffer_stream.h"

#include <cstring>

#include "qxcore/core/internal/quietly.h"
#include "qxcore/core/memory.h"

QXCORE_IMPLEMENT_CLASS(SOutputBufferStream, SOutputFilterStream, 0)

SOutputBufferStream::SOutputBufferStream(SOutputStream& out, unsigned long size)
    : SOutputBufferStream(&out, size, false) {}

SOutputBufferStream::SOutputBufferStream(SOutputStream* out, unsigned long size, bool owns)
    : m_out(out, owns), m_capacity(size != 0 ? size : 256) {
  m_buffer = static_cast<unsigned char*>(SMemAlloc(m_capacity));
}

SOutputBufferStream::~SOutputBufferStream() {
  SQuietly([this] { FlushBuffer(); });
  SMemFree(m_buffer);
}

void SOutputBufferStream::FlushBuffer() {
  if (m_count == 0) return;
  m_out->Write(m_buffer, m_count);
  m_count = 0;
}

unsigned long SOutputBufferStream::Write(const void* buffer, unsigned long count) {
  if (count >= m_capacity) {
    FlushBuffer();
    return m_out->Write(buffer, count);
  }
  if (count > m_capacity - m_count) FlushBuffer();
  if (count > 0) std::memcpy(m_buffer + m_count, buffer, count);
  m_count += count;
  return count;
}

void SOutputBufferStream::Flush() {
  FlushBuffer();
  m_out->Flush();
}

void SOutputBufferStream::Close() {
  FlushBuffer();
  m_out->Close();
}
