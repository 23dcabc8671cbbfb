#include "qxcore/stream/input_buffer_stream.h"

#include <algorithm>
#include <cstring>

#include "qxcore/core/io_exceptions.h"
#include "qxcore/core/memory.h"
#include "qxcore/stream/internal/add_clipped.h"
#include "qxcore/stream/internal/read_fully.h"

QXCORE_IMPLEMENT_CLASS(SInputBufferStream, SInputStream, 0)

namespace {

constexpr unsigned long kDefaultSize = 256;
constexpr unsigned long kDefaultMarkLimit = 8192;

}  // namespace

SInputBufferStream::SInputBufferStream(SInputStream& in, unsigned long size) : SInputBufferStream(&in, size, false) {}

SInputBufferStream::SInputBufferStream(SInputStream* in, unsigned long size, bool owns)
    : m_in(in, owns), m_capacity(size != 0 ? size : kDefaultSize), m_markLimit(m_capacity) {
  m_buffer = static_cast<unsigned char*>(SMemAlloc(m_capacity));
}

SInputBufferStream::~SInputBufferStream() { SMemFree(m_buffer); }

void SInputBufferStream::Fill() {
  m_failure.Throw();
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
  m_count += SReadSome(*m_in, m_buffer + m_count, m_capacity - m_count);
}

int SInputBufferStream::ReadRefilled() {
  Fill();
  return m_position < m_count ? m_buffer[m_position++] : -1;
}

unsigned long SInputBufferStream::Read(void* buffer, unsigned long count) {
  unsigned long done = 0;
  try {
    ReadInto(static_cast<unsigned char*>(buffer), count, done);
  } catch (...) {
    if (done == 0) throw;
    m_failure.Keep();
  }
  return done;
}

void SInputBufferStream::ReadInto(unsigned char* out, unsigned long count, unsigned long& done) {
  while (done < count) {
    if (m_position == m_count) {
      if (m_mark == kNoMark && count - done >= m_capacity) {
        m_failure.Throw();
        const unsigned long got = SReadSome(*m_in, out + done, count - done);
        if (got == 0) break;
        done += got;
        continue;
      }
      Fill();
      if (m_position == m_count) break;
    }
    unsigned long taken = std::min(count - done, m_count - m_position);
    std::memcpy(out + done, m_buffer + m_position, taken);
    m_position += taken;
    done += taken;
  }
}

unsigned long SInputBufferStream::Skip(unsigned long count) {
  unsigned long done = 0;
  try {
    while (done < count) {
      if (m_position == m_count) {
        if (m_mark == kNoMark) {
          m_failure.Throw();
          const unsigned long passed = m_in->Skip(count - done);
          if (passed == 0) break;
          done += passed;
          continue;
        }
        Fill();
        if (m_position == m_count) break;
      }
      unsigned long taken = std::min(count - done, m_count - m_position);
      m_position += taken;
      done += taken;
    }
  } catch (...) {
    if (done == 0) throw;
    m_failure.Keep();
  }
  return done;
}

unsigned long SInputBufferStream::Available() { return SAddClipped(m_count - m_position, m_in->Available()); }

int SInputBufferStream::IsEOF() { return m_position == m_count && !m_failure.IsThere() && m_in->IsEOF(); }

bool SInputBufferStream::GetPlace(std::uint64_t* place) {
  if (!m_in->GetPlace(place)) return false;
  *place -= m_count - m_position;
  return true;
}

bool SInputBufferStream::GoToPlace(std::uint64_t place) {
  if (!m_in->GoToPlace(place)) return false;
  m_count = m_position = 0;
  m_mark = kNoMark;
  m_failure.Forget();
  return true;
}

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
  m_failure.Forget();
  m_in->Close();
}
