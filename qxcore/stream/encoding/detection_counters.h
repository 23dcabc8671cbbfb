// The evidence that a detection found for each candidate encoding.
// Threads: an object belongs to one thread at a time.
#pragma once

#include <cstdint>

// Any negative counter says that the candidate is rejected; larger ones mean more evidence. Several scans may add to
// the same counters; what was rejected once stays so.
struct SDetectionCounters {
  static constexpr std::int32_t kRejected = -1;          // any negative value says so
  static constexpr std::int32_t kCertain = 0x3FFFFFFF;   // UTF-16: every unit is an ASCII character, or the like
  static constexpr std::int32_t kLikely = 0x1FFFFFFF;    // UTF-16: by the platform's statistics
  static constexpr std::int32_t kControls = 0x0FFFFFFF;  // UTF-16: 16-bit line ends, blanks, tabs

  std::int32_t ascii = 0;              // minus the lead and stray bytes above 0x7F
  std::int32_t utf8 = 0;               // continuation bytes in place, and characters that convert
  std::int32_t active = 0;             // the active code page
  std::int32_t utf16 = 0;              // either order
  std::int32_t littleZeros = 0;        // zero bytes at odd offsets
  std::int32_t bigZeros = 0;           // and at even ones
  std::int32_t specified = kRejected;  // a code page that the hint names
};
