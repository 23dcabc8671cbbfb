#include "qxcore/core/memory.h"

#include <atomic>

#include "qxcore/core/exception.h"
#include "qxcore/core/internal/memory_failures.h"
#include "qxcore/platform/internal/heap.h"

namespace {

// 0 while no failure is ordered, else the number of allocations up to and including the failing one.
constinit std::atomic<long> g_countdown{0};
constinit std::atomic<bool> g_failForever{false};
constinit std::atomic<bool> g_hasFailed{false};

bool MustFail() noexcept {
  if (g_countdown.load(std::memory_order_relaxed) == 0) [[likely]]
    return false;
  if (g_countdown.fetch_sub(1) > 1) return false;
  g_countdown = g_failForever ? 1 : 0;
  g_hasFailed = true;
  return true;
}

}  // namespace

void* SMemTryAlloc(std::size_t size) noexcept {
  if (MustFail()) return nullptr;
  return platform::AllocateMemory(size != 0 ? size : 1);
}

void* SMemAlloc(std::size_t size) {
  void* block = SMemTryAlloc(size);
  if (block == nullptr) throw SEOutOfMemory();
  return block;
}

void* SMemRealloc(void* block, std::size_t size) {
  void* resized = MustFail() ? nullptr : platform::ResizeMemory(block, size != 0 ? size : 1);
  if (resized == nullptr) throw SEOutOfMemory();
  return resized;
}

void SMemFree(void* block) noexcept { platform::FreeMemory(block); }

bool SMemMustFail() noexcept { return MustFail(); }

void SMemFailAt(long n, bool forever) noexcept {
  g_hasFailed = false;
  g_failForever = forever;
  g_countdown = n;
}

bool SMemHasFailed() noexcept { return g_hasFailed; }
