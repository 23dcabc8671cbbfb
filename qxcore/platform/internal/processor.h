// What the processor can do beyond the instructions that every build relies on.
//
// The environment variable QXCORE_PROCESSOR=base leaves all of that unused, for tests of the ways that other processors
// take, and to rule these instructions out when a fault is looked for. It is read when a way is chosen for the first
// time.
#pragma once

namespace platform {

// Sets of instructions that are used together.
enum class Instructions {
  kAvx2,       // AVX2 alone
  kAvx512,     // AVX-512 F, BW and VL, with POPCNT, BMI1 and BMI2
  kAvx512Vbmi  // the same and VBMI2
};

// Whether they may be used: the processor and the system have them, and nobody forbids it.
bool CanUse(Instructions instructions);

}  // namespace platform
