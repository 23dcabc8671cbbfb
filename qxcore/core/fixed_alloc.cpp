#include "qxcore/core/fixed_alloc.h"

#include <atomic>
#include <cstdlib>
#include <limits>

#include "qxcore/core/debug_counter.h"
#include "qxcore/core/exception.h"
#include "qxcore/core/memory.h"

// The first word of a block; its elements follow.
struct SFixedAlloc::Block {
  Block* m_next;

  char* Elements() { return reinterpret_cast<char*>(this + 1); }
};

namespace {

// Atomic, because two allocators may add at the same time, each under its own lock.
constinit std::atomic<long> g_totalBytes{0};

unsigned ElementsForBlock(unsigned elementSize) {
  constexpr unsigned kWorthwhile = 17;  // a block holds that many elements, else it should be larger
  constexpr unsigned kOverhead = 16;    // what the heap and the link word take of a page
  SYSTEM_INFO system;
  GetSystemInfo(&system);
  unsigned page = static_cast<unsigned>(system.dwPageSize);
  unsigned granularity = static_cast<unsigned>(system.dwAllocationGranularity);
  if (page / elementSize >= kWorthwhile) return (page - kOverhead) / elementSize;
  if (granularity / elementSize >= kWorthwhile) return (granularity / 2 - kOverhead) / elementSize;
  return granularity / elementSize < 2 ? 4 : 0;
}

// --- chains: memory linked through its first word, in elements that may be less than aligned ---

void* NextOf(const void* item) {
  void* next;
  std::memcpy(&next, item, sizeof next);
  return next;
}

void LinkTo(void* item, void* next) { std::memcpy(item, &next, sizeof next); }

std::uintptr_t AddressOf(const void* item) { return reinterpret_cast<std::uintptr_t>(item); }

void* MergeChains(void* a, void* b) {
  void* first = nullptr;
  void* last = &first;
  while (a != nullptr && b != nullptr) {
    void*& lower = AddressOf(a) < AddressOf(b) ? a : b;
    LinkTo(last, lower);
    last = lower;
    lower = NextOf(lower);
  }
  LinkTo(last, a != nullptr ? a : b);
  return first;
}

// Cuts off the run at the front of the chain that is in order, or in reverse order, and returns it in
// order. A chain of freed elements mostly consists of few such runs.
void* TakeRun(void*& chain) {
  void* first = chain;
  void* last = chain;
  void* next = NextOf(chain);
  if (next != nullptr && AddressOf(next) < AddressOf(first)) {
    LinkTo(last, nullptr);
    while (next != nullptr && AddressOf(next) < AddressOf(first)) {
      void* behind = NextOf(next);
      LinkTo(next, first);
      first = next;
      next = behind;
    }
  } else {
    while (next != nullptr && AddressOf(last) < AddressOf(next)) {
      last = next;
      next = NextOf(next);
    }
    LinkTo(last, nullptr);
  }
  chain = next;
  return first;
}

// Orders a chain by address, without any memory of its own: a merge sort of the runs it consists of.
void* SortChain(void* chain) {
  void* sorted[std::numeric_limits<std::size_t>::digits] = {};  // sorted[i] is made of 2^i runs
  while (chain != nullptr) {
    void* run = TakeRun(chain);
    int i = 0;
    for (; sorted[i] != nullptr; ++i) {
      run = MergeChains(sorted[i], run);
      sorted[i] = nullptr;
    }
    sorted[i] = run;
  }
  void* all = nullptr;
  for (void* part : sorted) all = MergeChains(part, all);
  return all;
}

}  // namespace

SFixedAlloc::SFixedAlloc(unsigned int elementSize, unsigned int elementsPerBlock, const WCHAR* name,
                         SIdleConsumerList* list)
    : SIdleConsumer(list),
      m_elementSize(elementSize < sizeof(void*) ? sizeof(void*) : elementSize),
      m_elementsPerBlock(elementsPerBlock != 0 ? elementsPerBlock : ElementsForBlock(m_elementSize)),
      m_trimThreshold(m_elementsPerBlock),
      m_bytes(name != nullptr ? 0 : -1) {
  if (name == nullptr) return;
  SDbgAddCounter(name, WTEXT("bytes"), &m_bytes);
  SDbgAddCounter(name, WTEXT("elements"), &m_elementsInUse);
}

SFixedAlloc::SFixedAlloc(const SFixedAlloc& other)
    : SFixedAlloc(other.m_elementSize, other.m_elementsPerBlock, nullptr, other.GetIdleList()) {}

SFixedAlloc::~SFixedAlloc() {
  FreeAll();
  if (m_bytes == -1) return;
  SDbgRemoveCounter(&m_bytes);
  SDbgRemoveCounter(&m_elementsInUse);
}

long SFixedAlloc::GetTotalBytes() noexcept { return g_totalBytes.load(std::memory_order_relaxed); }

// Called under the lock with an empty free list; returns the first element of the free list.
void* SFixedAlloc::AddBlock() {
  constexpr std::size_t kMost = std::numeric_limits<std::int32_t>::max();  // the statistics have 32 bits
  if (m_elementsPerBlock == 0 || m_elementsPerBlock > (kMost - sizeof(Block)) / m_elementSize) throw SEOutOfMemory();
  auto* block = static_cast<Block*>(SMemAlloc(BlockBytes()));
  block->m_next = m_blocks;
  m_blocks = block;
  CountBlocks(1);

  char* element = block->Elements();
  m_freeElements = element;
  for (std::uint32_t i = 1; i < m_elementsPerBlock; ++i, element += m_elementSize)
    LinkTo(element, element + m_elementSize);
  LinkTo(element, nullptr);
  return m_freeElements;
}

void SFixedAlloc::ResetTrim() noexcept {
  m_freesSinceTrim = 0;
  m_trimThreshold = m_elementsPerBlock;
}

void SFixedAlloc::CountBlocks(long blocks) noexcept {
  long bytes = blocks * static_cast<long>(BlockBytes());
  if (m_bytes != -1) m_bytes += static_cast<std::int32_t>(bytes);
  g_totalBytes.fetch_add(bytes, std::memory_order_relaxed);
}

long SFixedAlloc::FreeAll() noexcept {
  std::lock_guard guard(m_lock);
  long released = 0;
  while (m_blocks != nullptr) {
    Block* block = m_blocks;
    m_blocks = block->m_next;
    SMemFree(block);
    ++released;
  }
  m_freeElements = nullptr;
  m_elementsInUse = 0;
  ResetTrim();
  CountBlocks(-released);
  return released;
}

// Finding the block of each free element takes an index of the blocks by address. Memory for one may
// not be there, so the blocks and the free elements are both put in the order of their addresses, in
// place; then the free elements of each block follow each other, and one pass over both chains is enough.
long SFixedAlloc::FreeUnused() noexcept {
  std::lock_guard guard(m_lock);
  bool worthwhile = m_blocks != nullptr && m_freesSinceTrim != 0;
  ResetTrim();
  if (!worthwhile) return 0;

  auto* block = static_cast<Block*>(SortChain(m_blocks));
  void* element = SortChain(m_freeElements);
  void* keptBlocks = nullptr;
  void* keptElements = nullptr;
  void* lastBlock = &keptBlocks;
  void* lastElement = &keptElements;
  long released = 0;
  while (block != nullptr) {
    Block* nextBlock = block->m_next;
    std::uintptr_t blockEnd = AddressOf(block) + BlockBytes();
    void* firstFree = element;
    void* lastFree = nullptr;
    std::uint32_t freeCount = 0;
    for (; element != nullptr && AddressOf(element) < blockEnd; element = NextOf(element), ++freeCount)
      lastFree = element;
    if (freeCount == m_elementsPerBlock) {
      SMemFree(block);
      ++released;
    } else {
      LinkTo(lastBlock, block);
      lastBlock = block;
      if (freeCount != 0) {
        LinkTo(lastElement, firstFree);
        lastElement = lastFree;
      }
    }
    block = nextBlock;
  }
  LinkTo(lastBlock, nullptr);
  LinkTo(lastElement, nullptr);
  m_blocks = static_cast<Block*>(keptBlocks);
  m_freeElements = keptElements;
  CountBlocks(-released);
  return released;
}

int SFixedAlloc::OnIdle(int count) {
  bool due;
  {
    std::lock_guard guard(m_lock);
    due = m_freesSinceTrim != 0 && (count != 0 || (m_trimThreshold != 0 && m_freesSinceTrim >= m_trimThreshold));
  }
  if (due) FreeUnused();
  return 0;
}

SObjectFixedAllocatorBase::~SObjectFixedAllocatorBase() = default;

SIdleConsumerList* SObjectFixedAllocatorBase::IdleQueue() {
  static SIdleConsumerList queue;
  return &queue;
}
