// The runs of characters whose case forms lie at one distance from them (bmp_data.inc).
#pragma once

namespace platform {

// Every `step`-th character from first to last, and the distance to its image; for classes, the bits.
struct BmpRun {
  int first, last, step, delta;
};

inline constexpr BmpRun kLowerRuns[] = {
#define LOWER(first, last, step, delta) {first, last, step, delta},
#define UPPER(first, last, step, delta)
#define CLASS(first, last, bits)
#include "qxcore/platform/bmp_data.inc"
#undef LOWER
#undef UPPER
#undef CLASS
};

}  // namespace platform
