// Memory for many elements of one size: taken in blocks, reused through a free list, given back whole.
//
// An SFixedAlloc costs two or three instructions an element beyond its lock and no header, so it suits
// classes that make many small objects. Freed elements stay with the allocator until a trim
// (FreeUnused, or idle time: it is an idle consumer) finds blocks that are free as a whole.
//
// Threads: every operation takes the allocator's own lock, so one allocator may serve several threads.
// Making and destroying allocators, and OnIdle, belong to the user-interface thread.
#pragma once

#include <cstddef>
#include <cstdint>
#include <cstring>
#include <mutex>

#include "qxcore/core/idle_consumer.h"
#include "qxcore/platform/export.h"
#include "qxcore/platform/interlocked.h"
#include "qxcore/platform/win32.h"

class QXCORE_API SFixedAlloc : public SIdleConsumer {
 public:
  // `elementSize` is in bytes; less than a pointer is raised to a pointer. Elements follow each other
  // without gaps behind one pointer, so they are aligned to a pointer at most, and to no more than
  // their size. With 0 elements per block the number follows from the system's page size; for elements
  // of 1/16 to 1/2 of the allocation granularity (4 to 32 KB) it then is 0 and Alloc
  // always throws: pass a number. With a name the two statistics are debug counters;
  // the name is copied. A null `list` is the common idle-consumer list. Throws SEOutOfMemory.
  SFixedAlloc(unsigned int elementSize, unsigned int elementsPerBlock, const WCHAR* name, SIdleConsumerList* list);

  // A second, empty allocator without a name, with the same sizes and on the same idle-consumer list.
  SFixedAlloc(const SFixedAlloc& other);
  SFixedAlloc& operator=(const SFixedAlloc&) = delete;

  // Releases every block, also those with elements in use.
  ~SFixedAlloc() override;

  // An element, not initialised: the one freed last, else the lowest one of a new block. Throws
  // SEOutOfMemory.
  void* Alloc() {
    std::lock_guard guard(m_lock);
    void* element = m_freeElements;
    if (element == nullptr) [[unlikely]]
      element = AddBlock();
    std::memcpy(&m_freeElements, element, sizeof(void*));
    ++m_elementsInUse;
    return element;
  }

  // Takes an element back, which must come from this allocator; not null. Touches its first word only.
  void Free(void* element) noexcept {
    std::lock_guard guard(m_lock);
    std::memcpy(element, &m_freeElements, sizeof(void*));
    m_freeElements = element;
    --m_elementsInUse;
    ++m_freesSinceTrim;
  }

  // Releases every block; elements still in use become invalid. Returns the number of blocks released.
  long FreeAll() noexcept;

  // Releases the blocks all of whose elements are free, and orders the free list by address. Takes no
  // memory, so it helps when memory is out. Returns the number of blocks released, 0 when nothing was
  // freed since the last trim.
  long FreeUnused() noexcept;

  // Trims when something was freed since the last trim; with a count of 0 only when that is as many
  // elements as a block holds. Always returns 0: no further idle time is wanted.
  int OnIdle(int count) override;

  unsigned int GetAllocSize() const { return m_elementSize; }  // bytes of one element
  // Elements that are taken from the heap at a time.
  unsigned int GetElementsPerBlock() const { return m_elementsPerBlock; }
  // Bytes of all blocks held, or -1 for an allocator without a name.
  std::int32_t GetBytes() const { return m_bytes; }
  std::int32_t GetElementsInUse() const { return m_elementsInUse; }
  // Bytes of all blocks that all allocators hold. Each allocator adds under its own lock only.
  static long GetTotalBytes() noexcept;

 private:
  struct Block;

  std::size_t BlockBytes() const { return sizeof(void*) + std::size_t{m_elementSize} * m_elementsPerBlock; }
  void* AddBlock();
  void ResetTrim() noexcept;
  void CountBlocks(long blocks) noexcept;

  std::uint32_t m_elementSize;
  std::uint32_t m_elementsPerBlock;
  Block* m_blocks = nullptr;       // the newest first; after a trim in the order of their addresses
  void* m_freeElements = nullptr;  // the first word of a free element links to the next
  std::uint32_t m_freesSinceTrim = 0;
  std::uint32_t m_trimThreshold;
  std::int32_t m_bytes;
  std::int32_t m_elementsInUse = 0;
  platform::ShortLock m_lock;
};

static_assert(sizeof(void*) != 4 || sizeof(SFixedAlloc) == 44, "the layout is public");

// The same, on a queue of the library's own when no list is given.
class QXCORE_API SObjectFixedAllocatorBase : public SFixedAlloc {
 public:
  // As SFixedAlloc.
  SObjectFixedAllocatorBase(unsigned int elementSize, unsigned int elementsPerBlock, const WCHAR* name,
                            SIdleConsumerList* list)
      : SFixedAlloc(elementSize, elementsPerBlock, name, list != nullptr ? list : IdleQueue()) {}
  SObjectFixedAllocatorBase(const SObjectFixedAllocatorBase&) = default;
  ~SObjectFixedAllocatorBase() override;

  // Made on first use, destroyed at process exit.
  static SIdleConsumerList* IdleQueue();
};
