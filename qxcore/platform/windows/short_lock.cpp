#include <emmintrin.h>

#include "qxcore/platform/interlocked.h"
#include "qxcore/platform/win32.h"

namespace platform {

void ShortLock::Wait() noexcept {
  // Longer and longer pauses: while the others stay away, the holder takes the lock again and again
  // without losing the cache line, which is several times as fast as passing it on each time.
  constexpr int kFirstPauses = 16, kMostPauses = 1024;
  int pauses = kFirstPauses;
  for (int round = 0;; ++round) {
    for (int i = 0; i < pauses; ++i) _mm_pause();
    // Look before locking the cache line; the holder needs it to let go.
    if (m_taken.load(std::memory_order_relaxed) == 0 && m_taken.exchange(1, std::memory_order_acquire) == 0) return;
    if (pauses < kMostPauses) {
      pauses *= 2;
      continue;
    }
    // A holder of lower priority never runs while its betters only yield to each other.
    if (round < 32) {
      SwitchToThread();
    } else {
      Sleep(1);
    }
  }
}

}  // namespace platform
