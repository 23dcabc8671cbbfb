// Elements of 48 bytes: one thread beside malloc, two threads on one allocator beside a free list under
// std::mutex.

#include <cstdlib>
#include <mutex>
#include <thread>
#include <vector>

#include "bench/bench.h"
#include "qxcore/core/fixed_alloc.h"

namespace {

constexpr unsigned kSize = 48;

// A batch stays alive at a time, as with any real use; then all of it is freed.
template <class Alloc, class Free>
void Batches(int batches, int batch, Alloc alloc, Free release) {
  std::vector<void*> elements(static_cast<std::size_t>(batch));
  for (; batches > 0; --batches) {
    for (void*& element : elements) {
      element = alloc();
      benchmark::DoNotOptimize(element);
    }
    for (void* element : elements) release(element);
  }
}

template <class Alloc, class Free>
void InTwoThreads(Alloc alloc, Free release) {
  std::thread other([&] { Batches(20000, 16, alloc, release); });
  Batches(20000, 16, alloc, release);
  other.join();
}

BENCH("allocate and free 48 bytes/ours") {
  SFixedAlloc pool(kSize, 0, nullptr, nullptr);
  for (auto _ : state)
    Batches(
        1, 1000, [&] { return pool.Alloc(); }, [&](void* p) { pool.Free(p); });
}

BENCH("48 bytes, two threads/ours") {
  SFixedAlloc pool(kSize, 0, nullptr, nullptr);
  for (auto _ : state) InTwoThreads([&] { return pool.Alloc(); }, [&](void* p) { pool.Free(p); });
}

#if BENCH_PEERS

BENCH("allocate and free 48 bytes/malloc") {
  for (auto _ : state)
    Batches(
        1, 1000, [] { return std::malloc(kSize); }, [](void* p) { std::free(p); });
}

// What one writes by hand: blocks of a page, a free list through the elements, a standard mutex.
class LockedFreeList {
 public:
  ~LockedFreeList() {
    for (void* block : m_blocks) std::free(block);
  }
  void* Alloc() {
    std::lock_guard guard(m_mutex);
    if (m_free == nullptr) AddBlock();
    void* element = m_free;
    m_free = *static_cast<void**>(element);
    return element;
  }
  void Free(void* element) {
    std::lock_guard guard(m_mutex);
    *static_cast<void**>(element) = m_free;
    m_free = element;
  }

 private:
  void AddBlock() {
    char* block = static_cast<char*>(std::malloc(4096));
    m_blocks.push_back(block);
    for (unsigned at = 0; at + kSize <= 4096; at += kSize) {
      *reinterpret_cast<void**>(block + at) = m_free;
      m_free = block + at;
    }
  }
  std::mutex m_mutex;
  void* m_free = nullptr;
  std::vector<void*> m_blocks;
};

BENCH("48 bytes, two threads/std::mutex") {
  LockedFreeList pool;
  for (auto _ : state) InTwoThreads([&] { return pool.Alloc(); }, [&](void* p) { pool.Free(p); });
}

#endif

}  // namespace
