// Memory for the nodes of lists and trees: pools shared by all containers of the library's clients.
//
// There is one pool for every eight bytes of size up to 128; larger nodes, and those that want more than the
// alignment of a pointer, come from the heap. A class
// with the same two functions can be given to the containers instead. Safe for several threads.
#pragma once

#include <atomic>
#include <cstddef>

#include "qxcore/core/fixed_alloc.h"
#include "qxcore/core/memory.h"
#include "qxcore/platform/export.h"

class QXCORE_API SNodePools {
 public:
  // Memory of `size` bytes with an alignment of at most two pointers. Throws SEOutOfMemory.
  static void* Alloc(std::size_t size, std::size_t alignment) {
    if (!IsPooled(size, alignment)) return SMemAlloc(size);
    return Pool(size).Alloc();
  }
  // Frees what Alloc returned for the same size and alignment.
  static void Free(void* node, std::size_t size, std::size_t alignment) noexcept {
    if (!IsPooled(size, alignment)) return SMemFree(node);
    m_pools[IndexOf(size)].load(std::memory_order_relaxed)->Free(node);
  }

 private:
  static constexpr std::size_t kStep = 8;
  static constexpr std::size_t kLargest = 128;
  static constexpr std::size_t kCount = kLargest / kStep;

  static constexpr bool IsPooled(std::size_t size, std::size_t alignment) {
    return size <= kLargest && alignment <= alignof(void*);
  }
  static constexpr std::size_t IndexOf(std::size_t size) { return size == 0 ? 0 : (size - 1) / kStep; }
  static SFixedAlloc& Pool(std::size_t size) {
    SFixedAlloc* pool = m_pools[IndexOf(size)].load(std::memory_order_acquire);
    return pool != nullptr ? *pool : MakePool(IndexOf(size));
  }
  static SFixedAlloc& MakePool(std::size_t index);
  static bool MakeAllPools();

  static std::atomic<SFixedAlloc*> m_pools[kCount];  // made when the library is loaded, never destroyed
  static const bool m_made;
};
