#include "qxcore/stream/input_pushback_stream.h"

#include <algorithm>
#include <cstring>
#include <limits>

#include "qxcore/core/io_exceptions.h"
#include "qxcore/core/memory.h"

QXCORE_IMPLEMENT_CLASS(SInputPushbackStream, SInputStream, 0)

SInputPushbackStream::SInputPushbackStream(SInputStream& in, unsigned long size)
    : SInputPushbackStream(&in, size, false) {}

SInputPushbackStream::SInputPushbackStream(SInputStream* in, unsigned long size, bool owns)
    : m_in(in), m_owns(owns), m_area(static_cast<unsigned char*>(SMemAlloc(size))), m_size(size), m_position(size) {}

SInputPushbackStream::~SInputPushbackStream() {
  SMemFree(m_area);
  SMemFree(m_savedArea);
  if (m_owns) delete m_in;
}

unsigned long SInputPushbackStream::Read(void* buffer, unsigned long count) {
  constexpr unsigned long kFailure = std::numeric_limits<unsigned long>::max();
  if (count == 0) return 0;
  unsigned long pushed = std::min(count, m_size - m_position);
  std::memcpy(buffer, m_area + m_position, pushed);
  m_position += pushed;
  if (pushed == count) return pushed;
  unsigned long got = m_in->Read(static_cast<unsigned char*>(buffer) + pushed, count - pushed);
  if (got == kFailure) return pushed > 0 ? pushed : kFailure;
  return pushed + got;
}

unsigned long SInputPushbackStream::Skip(unsigned long count) {
  unsigned long pushed = std::min(count, m_size - m_position);
  m_position += pushed;
  return count > pushed ? pushed + m_in->Skip(count - pushed) : pushed;
}

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
  if (m_savedArea == nullptr) return;
  std::memcpy(m_area, m_savedArea, m_size);
  m_position = m_savedPosition;
}

void SInputPushbackStream::Close() {
  m_position = m_size;
  m_in->Close();
}
