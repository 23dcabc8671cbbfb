#include <unistd.h>

#include <cerrno>
#include <cstdlib>

#include "qxcore/platform/win32.h"

namespace {

// The code page that an environment variable names; `standard` where it is unset or no number.
UINT CodePageFromEnvironment(const char* variable, UINT standard) {
  const char* text = std::getenv(variable);
  if (text == nullptr || *text == 0) return standard;
  char* end = nullptr;
  unsigned long page = std::strtoul(text, &end, 10);
  return *end == 0 && page > 0 && page <= 65535 && IsValidCodePage(static_cast<UINT>(page)) ? static_cast<UINT>(page)
                                                                                            : standard;
}

}  // namespace

// Both pages stay what they were at the first question, as they do for a process on Windows.
UINT GetACP() {
  static const UINT page = CodePageFromEnvironment("QXCORE_ACP", 1252);
  return page;
}

UINT GetOEMCP() {
  static const UINT page = CodePageFromEnvironment("QXCORE_OEMCP", 437);
  return page;
}

void GetSystemInfo(SYSTEM_INFO* info) {
  *info = SYSTEM_INFO{};
  info->dwPageSize = static_cast<DWORD>(sysconf(_SC_PAGESIZE));
  info->dwAllocationGranularity = 65536;
  info->dwNumberOfProcessors = static_cast<DWORD>(sysconf(_SC_NPROCESSORS_ONLN));
}

DWORD GetVersion() { return 10; }

int MulDiv(int number, int numerator, int denominator) {
  if (denominator == 0) return -1;
  // Rounded half away from zero, on magnitudes, so that both signs round alike.
  const std::int64_t product = static_cast<std::int64_t>(number) * numerator;
  const bool negative = (product < 0) != (denominator < 0);
  const std::uint64_t magnitude =
      product < 0 ? 0 - static_cast<std::uint64_t>(product) : static_cast<std::uint64_t>(product);
  const std::uint64_t divisor =
      denominator < 0 ? 0 - static_cast<std::uint64_t>(denominator) : static_cast<std::uint64_t>(denominator);
  const std::uint64_t result = (magnitude + divisor / 2) / divisor;
  if (result > 0x7FFFFFFF) return -1;
  return negative ? -static_cast<int>(result) : static_cast<int>(result);
}
