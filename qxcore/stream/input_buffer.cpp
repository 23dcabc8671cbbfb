#include "qxcore/stream/input_buffer.h"

#include <algorithm>
#include <cstring>

#include "qxcore/core/io_exceptions.h"

QXCORE_IMPLEMENT_CLASS(SInputBuffer, SInputStream, 0)

SInputBuffer::SInputBuffer(const void* block, int size) { Init(block, size); }
SInputBuffer::SInputBuffer(const void* block, unsigned long size) { Init(block, size); }
SInputBuffer::~SInputBuffer() = default;

void SInputBuffer::Init(const void* block, unsigned long size) {
  m_block = static_cast<const unsigned char*>(block);
  m_size = block != nullptr ? size : 0;
  m_position = 0;
  m_hasMark = false;
}

unsigned long SInputBuffer::Read(void* buffer, unsigned long count) {
  count = std::min(count, m_size - m_position);
  if (count == 1) {  // lengths and flags: not worth a call
    *static_cast<unsigned char*>(buffer) = m_block[m_position++];
    return 1;
  }
  if (count > 0) std::memcpy(buffer, m_block + m_position, count);
  m_position += count;
  return count;
}

unsigned long SInputBuffer::Skip(unsigned long count) {
  count = std::min(count, m_size - m_position);
  m_position += count;
  return count;
}

void SInputBuffer::Mark(unsigned long) {
  m_mark = m_position;
  m_hasMark = true;
}

void SInputBuffer::Reset() {
  if (!m_hasMark) throw SEIOResetInvalid();
  m_position = m_mark;
}

const void* SInputBuffer::TakeRest(unsigned long* size) {
  if (m_block == nullptr) return nullptr;
  *size = m_size - m_position;
  const void* rest = m_block + m_position;
  m_position = m_size;
  return rest;
}

bool SInputBuffer::SeekPos(unsigned long position) {
  if (position > m_size) return true;
  m_position = position;
  return false;
}
