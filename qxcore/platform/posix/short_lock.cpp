#include <sched.h>
#include <time.h>

#include "qxcore/platform/interlocked.h"

namespace platform {
namespace {

inline void Pause() {
#if defined(__x86_64__) || defined(__i386__)
  __builtin_ia32_pause();
#endif
}

}  // namespace

void ShortLock::Wait() noexcept {
  // Longer and longer pauses: while the others stay away, the holder takes the lock again and again
  // without losing the cache line, which is several times as fast as passing it on each time.
  constexpr int kFirstPauses = 16, kMostPauses = 1024;
  int pauses = kFirstPauses;
  for (int round = 0;; ++round) {
    for (int i = 0; i < pauses; ++i) Pause();
    // Look before locking the cache line; the holder needs it to let go.
    if (m_taken.load(std::memory_order_relaxed) == 0 && m_taken.exchange(1, std::memory_order_acquire) == 0) return;
    if (pauses < kMostPauses) {
      pauses *= 2;
      continue;
    }
    // A holder of lower priority never runs while its betters only yield to each other.
    if (round < 32) {
      sched_yield();
    } else {
      timespec nap{0, 100'000};
      nanosleep(&nap, nullptr);
    }
  }
}

}  // namespace platform
