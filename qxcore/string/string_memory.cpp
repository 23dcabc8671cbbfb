// The buffers of SString: eight pools of fixed size classes, and the heap above them.

#include <atomic>
#include <bit>
#include <new>

#include "qxcore/core/exception.h"
#include "qxcore/core/fixed_alloc.h"
#include "qxcore/core/memory.h"
#include "qxcore/string/string.h"

namespace {

constexpr int kPools = 8;
constexpr int kSmallestClass = 16;
constexpr int kLargestClass = 2048;
constexpr int kLargeStep = 512;
constexpr int kLongest = 0x3FFFFE00;  // the bytes of a longer buffer would not fit a 32-bit count

struct PoolSetup {
  const WCHAR* name;  // the leading blank sorts the pools before other counters
  unsigned elementsPerBlock;
};
constexpr PoolSetup kSetups[kPools] = {{WTEXT(" Allocator Str16"), 128},  {WTEXT(" Allocator Str32"), 128},
                                       {WTEXT(" Allocator Str64"), 64},   {WTEXT(" Allocator Str128"), 64},
                                       {WTEXT(" Allocator Str256"), 64},  {WTEXT(" Allocator Str512"), 32},
                                       {WTEXT(" Allocator Str1024"), 16}, {WTEXT(" Allocator Str2048"), 4}};

// The pools live in raw storage and are never destroyed: strings of other modules' static objects may
// outlive everything here.
alignas(SFixedAlloc) std::byte g_poolStorage[kPools][sizeof(SFixedAlloc)];
constinit SFixedAlloc* g_pools[kPools] = {};

constinit std::atomic<long> g_largeBytes{0};
constinit std::atomic<long> g_largeCount{0};

constexpr std::size_t BufferBytes(int allocLength) {
  return sizeof(SStringData) + (static_cast<std::size_t>(allocLength) + 1) * sizeof(WCHAR);
}

constexpr int PoolOf(int length) {
  return length <= kSmallestClass ? 0 : std::bit_width(static_cast<unsigned>(length - 1)) - 4;
}
static_assert(PoolOf(16) == 0 && PoolOf(17) == 1 && PoolOf(32) == 1 && PoolOf(33) == 2 && PoolOf(2048) == 7);

void MakePools() {
  for (int i = 0; i < kPools; ++i) {
    if (g_pools[i] != nullptr) continue;
    unsigned elementSize = static_cast<unsigned>((BufferBytes(kSmallestClass << i) + 15) / 16 * 16);
    g_pools[i] = new (g_poolStorage[i]) SFixedAlloc(elementSize, kSetups[i].elementsPerBlock, kSetups[i].name, nullptr);
  }
}

// At start-up, or earlier when the static object of another file makes a string first.
[[maybe_unused]] const bool g_poolsMade = (MakePools(), true);

SFixedAlloc& Pool(int index) {
  if (g_pools[index] == nullptr) [[unlikely]]
    MakePools();
  return *g_pools[index];
}

SStringData* AllocPooled(int length, int& allocLength) {
  int pool = PoolOf(length);
  allocLength = kSmallestClass << pool;
  try {
    return static_cast<SStringData*>(Pool(pool).Alloc());
  } catch (const SEOutOfMemory&) {
    SString::FreeUnused();
    return static_cast<SStringData*>(Pool(pool).Alloc());
  }
}

int LargeAllocLength(int length) {
  if (length > kLongest) throw SEOutOfMemory();
  return (length + kLargeStep - 1) / kLargeStep * kLargeStep;
}

SStringData* AllocLarge(int length, int& allocLength) {
  allocLength = LargeAllocLength(length);
  std::size_t bytes = BufferBytes(allocLength);
  void* block = SMemTryAlloc(bytes);
  if (block == nullptr) {
    SString::FreeUnused();
    block = SMemAlloc(bytes);
  }
  g_largeBytes += static_cast<long>(bytes);
  ++g_largeCount;
  return static_cast<SStringData*>(block);
}

}  // namespace

WCHAR* SString::AllocBuffer(int n) {
  if (n <= 0) return EmptyText();
  int allocLength;
  SStringData* data = n <= kLargestClass ? AllocPooled(n, allocLength) : AllocLarge(n, allocLength);
  data->m_refs = 1;
  data->m_length = n;
  data->m_allocLength = allocLength;
  WCHAR* text = data->Text();
  text[n] = 0;
  return text;
}

bool SString::IsLarge(const SStringData* data) { return data->m_allocLength > kLargestClass; }

void SString::GrowLarge(int n) {
  SStringData* data = Data();
  const int allocLength = LargeAllocLength(n);
  const std::size_t before = BufferBytes(data->m_allocLength), bytes = BufferBytes(allocLength);
  try {
    data = static_cast<SStringData*>(SMemRealloc(data, bytes));
  } catch (const SEOutOfMemory&) {
    FreeUnused();
    data = static_cast<SStringData*>(SMemRealloc(data, bytes));
  }
  g_largeBytes += static_cast<long>(bytes) - static_cast<long>(before);
  data->m_allocLength = allocLength;
  m_text = data->Text();
}

void SString::FreeData(SStringData* data) noexcept {
  if (data == nullptr || data->m_refs == SStringData::kStatic) return;
  if (!IsLarge(data)) {
    g_pools[PoolOf(data->m_allocLength)]->Free(data);
    return;
  }
  g_largeBytes -= static_cast<long>(BufferBytes(data->m_allocLength));
  --g_largeCount;
  SMemFree(data);
}

long SString::FreeUnused() {
  long released = 0;
  for (SFixedAlloc* pool : g_pools) {
    if (pool != nullptr) released += pool->FreeUnused();
  }
  return released;
}

long SString::GetLargeBufferBytes() { return g_largeBytes; }
long SString::GetLargeBufferCount() { return g_largeCount; }
