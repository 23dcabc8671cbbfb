#include "qxcore/stream/encoding/internal/raw_input.h"

#include <cstring>

void SRawInput::DropBefore(std::uint64_t position) {
  // What is borrowed takes no room, and is not ours to move.
  if (position <= m_dropped || m_buffer.isBorrowed) return;
  const auto count = static_cast<std::size_t>(position - m_dropped);
  std::memmove(m_buffer.block, m_buffer.block + count, static_cast<std::size_t>(m_buffer.end - m_buffer.block) - count);
  m_buffer.start -= count;
  m_buffer.end -= count;
  m_dropped = position;
}

void SRawInput::Borrow(const void* bytes, unsigned long size) {
  m_buffer.block = m_buffer.start = const_cast<unsigned char*>(static_cast<const unsigned char*>(bytes));
  m_buffer.end = m_buffer.start + size;
  m_buffer.capacity = size;
  m_buffer.isBorrowed = true;
  m_isAtEnd = true;
}
