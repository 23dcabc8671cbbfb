#include "qxcore/platform/bmp.h"

#include <array>

#include "qxcore/platform/internal/bmp_runs.h"

namespace platform {
namespace {

constexpr BmpRun kUpperRuns[] = {
#define LOWER(first, last, step, delta)
#define CLASS(first, last, bits)
#define UPPER(first, last, step, delta) {first, last, step, delta},
#include "qxcore/platform/bmp_data.inc"
#undef LOWER
#undef UPPER
#undef CLASS
};

constexpr BmpRun kClassRuns[] = {
#define LOWER(first, last, step, delta)
#define UPPER(first, last, step, delta)
#define CLASS(first, last, bits) {first, last, 1, bits},
#include "qxcore/platform/bmp_data.inc"
};

template <std::size_t n>
constexpr BmpTable<WCHAR> MakeCase(const BmpRun (&runs)[n]) {
  BmpTable<WCHAR> table{};
  for (int c = 0; c < 65536; ++c) table.values[c] = static_cast<WCHAR>(c);
  for (const BmpRun& run : runs)
    for (int c = run.first; c <= run.last; c += run.step) table.values[c] = static_cast<WCHAR>(c + run.delta);
  return table;
}

template <std::size_t n>
constexpr BmpTable<std::uint8_t> MakeClasses(const BmpRun (&runs)[n]) {
  BmpTable<std::uint8_t> table{};
  for (const BmpRun& run : runs)
    for (int c = run.first; c <= run.last; ++c) table.values[c] = static_cast<std::uint8_t>(run.delta);
  return table;
}

}  // namespace

// Made by the compiler: the tables are there before any constructor runs.
constinit const BmpTable<WCHAR> g_lowerBmp = MakeCase(kLowerRuns);
constinit const BmpTable<WCHAR> g_upperBmp = MakeCase(kUpperRuns);
constinit const BmpTable<std::uint8_t> g_classBmp = MakeClasses(kClassRuns);

}  // namespace platform
