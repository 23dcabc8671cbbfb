// What the three tables share inside: how they grow, and a place for one element in transit.
#pragma once

#include <cstddef>
#include <cstdint>
#include <limits>

#include "qxcore/core/exception.h"
#include "qxcore/core/memory.h"

namespace table_storage {

constexpr int kFirstCapacity = 4;  // elements that a table has room for at first

// The capacity after the given one, which is full.
inline int NextCapacity(int capacity) {
  constexpr std::int64_t kMost = (std::numeric_limits<std::int32_t>::max)();
  if (capacity == kMost) throw SEOutOfMemory();
  std::int64_t next = std::int64_t{capacity} * 3 / 2 + 1;
  return static_cast<int>(next < kMost ? next : kMost);
}

// Bytes of n elements behind a header. Throws SEOutOfMemory for more than can be addressed.
inline std::size_t BytesFor(int n, int elementSize, std::size_t header = 0) {
  constexpr std::size_t kMost = (std::numeric_limits<std::ptrdiff_t>::max)();
  std::size_t size = static_cast<std::size_t>(elementSize);
  if (n < 0 || (size != 0 && static_cast<std::size_t>(n) > (kMost - header) / size)) throw SEOutOfMemory();
  return header + static_cast<std::size_t>(n) * size;
}

// Raw room for one element: on the stack, or on the heap for a large one. Throws SEOutOfMemory.
class TransitSlot {
 public:
  // For an element of that many bytes.
  explicit TransitSlot(int elementSize)
      : m_heap(static_cast<std::size_t>(elementSize) > sizeof m_inline
                   ? SMemAlloc(static_cast<std::size_t>(elementSize))
                   : nullptr) {}
  TransitSlot(const TransitSlot&) = delete;
  TransitSlot& operator=(const TransitSlot&) = delete;
  ~TransitSlot() { SMemFree(m_heap); }
  void* Address() { return m_heap != nullptr ? m_heap : m_inline; }  // where the element goes

 private:
  alignas(std::max_align_t) std::byte m_inline[128];
  void* m_heap;
};

}  // namespace table_storage
