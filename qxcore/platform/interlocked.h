// Interlocked counters and a short lock, which cost next to nothing while the process has one thread.
//
// Where the runtime knows that no second thread was ever started, the locked instructions are left
// out; they cost more than the rest of a small allocation.
#pragma once

#include <atomic>
#include <cstdint>

#if defined(__GLIBC__)
#include <sys/single_threaded.h>
// Whether the runtime knows that the process has never had a second thread.
#define PLATFORM_SINGLE_THREADED() (__libc_single_threaded)
#else
#define PLATFORM_SINGLE_THREADED() (false)
#endif

#include "qxcore/platform/export.h"

namespace platform {

// Adds one to the counter and returns the new value.
inline std::int32_t InterlockedAddOne(std::int32_t& counter) noexcept {
  if (PLATFORM_SINGLE_THREADED()) return ++counter;
  return __atomic_add_fetch(&counter, 1, __ATOMIC_RELAXED);
}

// Takes one from the counter and returns the new value; what other threads did to the guarded data
// before their own call is seen after the call that returns 0.
inline std::int32_t InterlockedTakeOne(std::int32_t& counter) noexcept {
  if (PLATFORM_SINGLE_THREADED()) return --counter;
  return __atomic_sub_fetch(&counter, 1, __ATOMIC_ACQ_REL);
}

// A lock for sections of a few instructions. Not recursive. Waiting threads spin briefly, then give
// their time slice away.
class ShortLock {
 public:
  constexpr ShortLock() noexcept = default;
  ShortLock(const ShortLock&) = delete;
  ShortLock& operator=(const ShortLock&) = delete;

  // Takes the lock; waits while another thread holds it.
  void lock() noexcept {
    if (PLATFORM_SINGLE_THREADED()) {
      m_taken.store(1, std::memory_order_relaxed);
      return;
    }
    if (m_taken.exchange(1, std::memory_order_acquire) != 0) Wait();
  }
  // Returns it. The caller must hold it.
  void unlock() noexcept { m_taken.store(0, std::memory_order_release); }

 private:
  QXCORE_API void Wait() noexcept;

  std::atomic<std::int32_t> m_taken{0};
};

}  // namespace platform
