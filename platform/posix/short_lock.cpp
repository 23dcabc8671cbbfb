#include <sched.h>
#include <time.h>

#include "platform/interlocked.h"

namespace platform {
namespace {

inline void Pause() {
#if defined(__x86_64__) || defined(__i386__)
  __builtin_ia32_pause();
#endif
}

}  // namespace

void ShortLock::Wait() noexcept {
  for (int round = 0;; ++round) {
    // Look before locking the cache line again; the holder needs it to let go.
    for (int spin = 0; spin < 64; ++spin) {
      if (m_taken.load(std::memory_order_relaxed) == 0 && m_taken.exchange(1, std::memory_order_acquire) == 0) return;
      Pause();
    }
    // A holder of lower priority never runs while its betters only yield to each other.
    if (round < 16) {
      sched_yield();
    } else {
      timespec nap{0, 100'000};
      nanosleep(&nap, nullptr);
    }
  }
}

}  // namespace platform
