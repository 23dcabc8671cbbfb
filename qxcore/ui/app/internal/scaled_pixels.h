// Sizes that follow the resolution.
#pragma once

#include <algorithm>
#include <cstdint>
#include <limits>

// A size at `former` dots an inch, as it is at `dpi`: rounded to the nearest number, and kept within the range of int.
inline int SScaledPixels(int pixels, int dpi, int former) {
  using Limits = std::numeric_limits<int>;
  const std::int64_t product = std::int64_t{pixels} * dpi;
  const std::int64_t half = product < 0 ? -(former / 2) : former / 2;
  return static_cast<int>(std::clamp<std::int64_t>((product + half) / former, Limits::min(), Limits::max()));
}
