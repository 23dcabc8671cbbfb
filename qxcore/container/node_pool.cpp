#include "qxcore/container/node_pool.h"

#include <new>

namespace {

// Raw storage: containers of other modules' static objects may outlive everything here.
alignas(SFixedAlloc) std::byte g_storage[16][sizeof(SFixedAlloc)];

}  // namespace

constinit std::atomic<SFixedAlloc*> SNodePools::m_pools[kCount] = {};

// All are made while the library is loaded, because they register themselves as idle consumers, which is
// not safe in other threads later; static objects of other files may only need some of them earlier.
const bool SNodePools::m_made = SNodePools::MakeAllPools();

bool SNodePools::MakeAllPools() {
  for (std::size_t i = 0; i < kCount; ++i) {
    if (m_pools[i].load() == nullptr) MakePool(i);
  }
  return true;
}

SFixedAlloc& SNodePools::MakePool(std::size_t index) {
  static_assert(sizeof g_storage / sizeof g_storage[0] == kCount);
  unsigned elementSize = static_cast<unsigned>((index + 1) * kStep);
  auto* pool =
      new (g_storage[index]) SFixedAlloc(elementSize, 0, WTEXT(" Allocator Nodes"), SIdleConsumerList::Common());
  m_pools[index].store(pool, std::memory_order_release);
  return *pool;
}
