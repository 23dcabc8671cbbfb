#include "qxcore/stream/input_pushback_stream.h"

#include <algorithm>
#include <cstring>
#include <limits>

#include "qxcore/core/io_exceptions.h"
#include "qxcore/core/memory.h"
#include "qxcore/stream/internal/add_clipped.h"

QXCORE_IMPLEMENT_CLASS(SInputPushbackStream, SInputStream, 0)

SInputPushbackStream::SInputPushbackStream(SInputStream& in, unsigned long size)
    : SInputPushbackStream(&in, size, false) {}

SInputPushbackStream::SInputPushbackStream(SInputStream* in, unsigned long size, bool owns)
    : m_in(in, owns), m_area(static_cast<unsigned char*>(SMemAlloc(size))), m_size(size), m_position(size) {}

SInputPushbackStream::~SInputPushbackStream() {
  SMemFree(m_area);
  SMemFree(m_savedArea);
}

unsigned long SInputPushbackStream::Read(void* buffer, unsigned long count) {
  constexpr unsigned long kFailure = std::numeric_limits<unsigned long>::max();
  if (count == 0) return 0;
  unsigned char* out = static_cast<unsigned char*>(buffer);
  unsigned long done = std::min(count, m_size - m_position);
  std::memcpy(out, m_area + m_position, done);
  m_position += done;
  try {
    while (done < count) {
      m_failure.Throw();
      const unsigned long got = m_in->Read(out + done, count - done);
      if (got == kFailure && done == 0) return kFailure;
      if (got == 0 || got > count - done) break;
      done += got;
    }
  } catch (...) {
    if (done == 0) throw;
    m_failure.Keep();
  }
  return done;
}

unsigned long SInputPushbackStream::Skip(unsigned long count) {
  unsigned long done = std::min(count, m_size - m_position);
  m_position += done;
  try {
    while (done < count) {
      m_failure.Throw();
      const unsigned long passed = m_in->Skip(count - done);
      if (passed == 0) break;
      done += passed;
    }
  } catch (...) {
    if (done == 0) throw;
    m_failure.Keep();
  }
  return done;
}

unsigned long SInputPushbackStream::Available() { return SAddClipped(m_size - m_position, m_in->Available()); }

void SInputPushbackStream::Unread(unsigned char byte) { Unread(&byte, 1); }

void SInputPushbackStream::Unread(const void* buffer, unsigned long count) {
  if (count > m_position) throw SEIOPushBackFull();
  if (count == 0) return;
  m_position -= count;
  std::memcpy(m_area + m_position, buffer, count);
}

void SInputPushbackStream::Mark(unsigned long limit) {
  if (m_savedArea == nullptr) m_savedArea = static_cast<unsigned char*>(SMemAlloc(m_size));
  m_in->Mark(limit);
  std::memcpy(m_savedArea, m_area, m_size);
  m_savedPosition = m_position;
}

void SInputPushbackStream::Reset() {
  m_in->Reset();
  m_failure.Forget();
  if (m_savedArea == nullptr) return;
  std::memcpy(m_area, m_savedArea, m_size);
  m_position = m_savedPosition;
}

void SInputPushbackStream::Close() {
  m_position = m_size;
  m_failure.Forget();
  m_in->Close();
}
