#include "qxcore/platform/internal/processor.h"

#include <cstdlib>
#include <cstring>

namespace platform {

#if defined(__x86_64__) || defined(__i386__)
static bool Has(Instructions instructions) {
  if (instructions == Instructions::kAvx2) return __builtin_cpu_supports("avx2");
  const bool hasAvx512 = __builtin_cpu_supports("avx512f") && __builtin_cpu_supports("avx512bw") &&
                         __builtin_cpu_supports("avx512vl") && __builtin_cpu_supports("popcnt") &&
                         __builtin_cpu_supports("bmi") && __builtin_cpu_supports("bmi2");
  return hasAvx512 && (instructions == Instructions::kAvx512 || __builtin_cpu_supports("avx512vbmi2"));
}
#else
static bool Has(Instructions) { return false; }
#endif

bool CanUse(Instructions instructions) {
  const char* wanted = std::getenv("QXCORE_PROCESSOR");
  const bool isForbidden = wanted != nullptr && std::strcmp(wanted, "base") == 0;
  return !isForbidden && Has(instructions);
}

}  // namespace platform
