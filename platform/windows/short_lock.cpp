#include <emmintrin.h>

#include "platform/interlocked.h"
#include "platform/win32.h"

namespace platform {

void ShortLock::Wait() noexcept {
  for (int round = 0;; ++round) {
    // Look before locking the cache line again; the holder needs it to let go.
    for (int spin = 0; spin < 64; ++spin) {
      if (m_taken.load(std::memory_order_relaxed) == 0 && m_taken.exchange(1, std::memory_order_acquire) == 0) return;
      _mm_pause();
    }
    // A holder of lower priority never runs while its betters only yield to each other.
    if (round < 16) {
      SwitchToThread();
    } else {
      Sleep(1);
    }
  }
}

}  // namespace platform
