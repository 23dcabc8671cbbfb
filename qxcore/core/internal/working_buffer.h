// Room for a conversion: on the stack below 64 KB, else on the heap.
#pragma once

#include <cstddef>

#include "qxcore/core/memory.h"

// Room for `count` elements of T, without construction. Throws SEOutOfMemory.
template <class T>
class SWorkingBuffer {
 public:
  // On the stack while it takes less than 65536 bytes.
  explicit SWorkingBuffer(std::size_t count)
      : m_heap(count < kInline ? nullptr : static_cast<T*>(SMemAlloc(count * sizeof(T)))) {}
  SWorkingBuffer(const SWorkingBuffer&) = delete;
  SWorkingBuffer& operator=(const SWorkingBuffer&) = delete;
  ~SWorkingBuffer() { SMemFree(m_heap); }
  // The first element.
  T* Get() { return m_heap != nullptr ? m_heap : m_inline; }

 private:
  static constexpr std::size_t kInline = 65536 / sizeof(T);
  T* m_heap;
  T m_inline[kInline];
};
