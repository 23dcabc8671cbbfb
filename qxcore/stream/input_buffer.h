// Input from a block of memory that the caller keeps. Threads: an object belongs to one thread at a time.
#pragma once

#include <concepts>

#include "qxcore/stream/input_stream.h"

class QXCORE_API SInputBuffer : public SInputStream {
  QXCORE_DECLARE_CLASS(SInputBuffer)

  // `size` bytes from `block` on, which must stay as they are meanwhile; negative sizes count as 0.
  SInputBuffer(const void* block, int size);
  // The same for blocks of any size, and for sizes of any integer type.
  SInputBuffer(const void* block, unsigned long size);
  template <std::integral Size>
  SInputBuffer(const void* block, Size size) : SInputBuffer(block, static_cast<unsigned long>(size > 0 ? size : 0)) {}
  ~SInputBuffer() override;

  int Read() override { return m_position < m_size ? m_block[m_position++] : -1; }
  unsigned long Read(void* buffer, unsigned long count) override;
  unsigned long Skip(unsigned long count) override;
  unsigned long Available() override { return m_size - m_position; }
  int IsEOF() override { return m_position == m_size; }
  // Marks last for ever.
  void Mark(unsigned long limit) override;
  void Reset() override;
  const void* TakeRest(unsigned long* size) override;

  // Moves to a position from the start; true on failure (behind the end), which changes nothing.
  bool SeekPos(unsigned long position);
  unsigned long GetPos() const { return m_position; }

 protected:
  SInputBuffer() = default;
  // Reads the block from its start; it stays its owner's. A negative size counts as 0.
  void Init(const void* block, int size) { Init(block, static_cast<unsigned long>(size > 0 ? size : 0)); }
  void Init(const void* block, unsigned long size);

 private:
  const unsigned char* m_block = nullptr;
  unsigned long m_size = 0;
  unsigned long m_position = 0;
  unsigned long m_mark = 0;
  bool m_hasMark = false;
};
