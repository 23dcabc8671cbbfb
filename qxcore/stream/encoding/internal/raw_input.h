// The bytes of a reader's input that are in memory, and where they lie in the input.
#pragma once

#include <cstdint>

#include "qxcore/stream/encoding/raw_buffer.h"

// A view on a buffer that the reader owns. Positions count from the beginning of the input, so that they stay what
// they are when bytes before them are dropped.
class SRawInput {
 public:
  using Buffer = SRawBuffer;

  explicit SRawInput(Buffer& buffer) : m_buffer(buffer) {}
  SRawInput(const SRawInput&) = delete;
  SRawInput& operator=(const SRawInput&) = delete;

  // Whether no more bytes follow those in memory.
  bool IsAtEnd() const { return m_isAtEnd; }
  void SetAtEnd(bool isAtEnd = true) { m_isAtEnd = isAtEnd; }

  // The position of the first byte not used yet.
  std::uint64_t Position() const { return PositionOf(m_buffer.start); }
  std::uint64_t PositionOf(const unsigned char* byte) const {
    return m_dropped + static_cast<std::uint64_t>(byte - m_buffer.block);
  }
  // Goes to a position whose bytes are in memory.
  void GoTo(std::uint64_t position) { m_buffer.start = m_buffer.block + (ByteAt(position) - m_buffer.block); }
  const unsigned char* ByteAt(std::uint64_t position) const {
    return m_buffer.block + static_cast<std::size_t>(position - m_dropped);
  }
  // Whether the input is held from its very beginning.
  bool HasBeginning() const { return m_dropped == 0; }
  // Gives up the bytes before a position.
  void DropBefore(std::uint64_t position);

  // Takes bytes that lie in memory as a whole and end the input; they are neither copied nor written nor freed.
  void Borrow(const void* bytes, unsigned long size);

 private:
  Buffer& m_buffer;
  std::uint64_t m_dropped = 0;  // bytes of the input before the buffer
  bool m_isAtEnd = false;
};
