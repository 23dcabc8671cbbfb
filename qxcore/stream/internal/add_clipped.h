// Sums of counts that stay at the largest value instead of beginning anew at 0.
#pragma once

#include <limits>

// What streams have in all, when each part says how much it has.
inline unsigned long SAddClipped(unsigned long a, unsigned long b) {
  return b <= std::numeric_limits<unsigned long>::max() - a ? a + b : std::numeric_limits<unsigned long>::max();
}
