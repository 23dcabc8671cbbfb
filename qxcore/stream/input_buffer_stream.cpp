#include "qxcore/stream/input_buffer_stream.h"

#include <algorithm>
#include <cstring>
#include <limits>

#include "qxcore/core/io_exceptions.h"
#include "qxcore/core/memory.h"

QXCORE_IMPLEMENT_CLASS(SInputBufferStream, SInputStream, 0)

namespace {

constexpr unsigned long kDefaultSize = 256;
constexpr unsigned long kDefaultMarkLimit = 8192;

}  // namespace

SInputBufferStream::SInputBufferStream(SInputStream& in, unsigned long size) : SInputBufferStream(&in, size, false) {}

SInputBufferStream::SInputBufferStream(SInputStream* in, unsigned long size, bool owns)
    : m_in(in), m_owns(owns), m_capacity(size != 0 ? size : kDefaultSize), m_markLimit(m_capacity) {
  m_buffer = static_cast<unsigned char*>(SMemAlloc(m_capacity));
}

SInputBufferStream::~SInputBufferStream() {
  SMemFree(m_buffer);
  if (m_owns) delete m_in;
}

void SInputBufferStream::Fill() {
  if (m_mark == kNoMark) {
    m_count = m_position = 0;
  } else if (m_count == m_capacity) {
    if (m_mark > 0) {
      unsigned long kept = m_count - static_cast<unsigned long>(m_mark);
      std::memmove(m_buffer, m_buffer + m_mark, kept);
      m_position -= static_cast<unsigned long>(m_mark);
      m_count = kept;
      m_mark = 0;
    } else if (m_capacity < m_markLimit) {
      unsigned long grown = std::min(m_count * 2, m_markLimit);
      m_buffer = static_cast<unsigned char*>(SMemRealloc(m_buffer, grown));
      m_capacity = grown;
    } else {
      m_mark = kNoMark;
      m_count = m_position = 0;
    }
  }
  // A source that fails may give all ones: nothing came.
  const unsigned long room = m_capacity - m_count, got = m_in->Read(m_buffer + m_count, room);
  if (got <= room) m_count += got;
}

int SInputBufferStream::ReadRefilled() {
  Fill();
  return m_position < m_count ? m_buffer[m_position++] : -1;
}

unsigned long SInputBufferStream::Read(void* buffer, unsigned long count) {
  unsigned char* out = static_cast<unsigned char*>(buffer);
  unsigned long done = 0;
  while (done < count) {
    if (m_position == m_count) {
      if (m_mark == kNoMark && count - done >= m_capacity) {
        const unsigned long got = m_in->Read(out + done, count - done);
        return got <= count - done ? done + got : done;
      }
      Fill();
      if (m_position == m_count) break;
    }
    unsigned long taken = std::min(count - done, m_count - m_position);
    std::memcpy(out + done, m_buffer + m_position, taken);
    m_position += taken;
    done += taken;
  }
  return done;
}

unsigned long SInputBufferStream::Skip(unsigned long count) {
  unsigned long done = 0;
  while (done < count) {
    if (m_position == m_count) {
      if (m_mark == kNoMark) return done + m_in->Skip(count - done);
      Fill();
      if (m_position == m_count) break;
    }
    unsigned long taken = std::min(count - done, m_count - m_position);
    m_position += taken;
    done += taken;
  }
  return done;
}

unsigned long SInputBufferStream::Available() {
  const unsigned long buffered = m_count - m_position, behind = m_in->Available();
  return behind <= std::numeric_limits<unsigned long>::max() - buffered ? buffered + behind
                                                                        : std::numeric_limits<unsigned long>::max();
}

int SInputBufferStream::IsEOF() { return m_position == m_count && m_in->IsEOF(); }

void SInputBufferStream::Mark(unsigned long limit) {
  m_mark = static_cast<long>(m_position);
  m_markLimit = limit != 0 ? limit : kDefaultMarkLimit;
}

void SInputBufferStream::Reset() {
  if (m_mark == kNoMark) throw SEIOResetInvalid();
  m_position = static_cast<unsigned long>(m_mark);
}

void SInputBufferStream::Close() {
  m_count = m_position = 0;
  m_mark = kNoMark;
  m_in->Close();
}
