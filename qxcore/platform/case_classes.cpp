#include "qxcore/platform/internal/case_classes.h"

#include <algorithm>
#include <array>

#include "qxcore/platform/internal/bmp_runs.h"

namespace platform {
namespace {

constexpr std::size_t kCount = [] {
  std::size_t count = 0;
  for (const BmpRun& run : kLowerRuns) count += static_cast<std::size_t>((run.last - run.first) / run.step) + 1;
  return count;
}();

constexpr bool ComesFirst(const CaseVariant& a, const CaseVariant& b) { return a.lower < b.lower; }

// Made by the compiler, ordered by the lower-case forms.
constexpr std::array<CaseVariant, kCount> kVariants = [] {
  std::array<CaseVariant, kCount> variants{};
  auto out = variants.begin();
  for (const BmpRun& run : kLowerRuns) {
    for (int c = run.first; c <= run.last; c += run.step) {
      *out++ = {static_cast<WCHAR>(c + run.delta), static_cast<WCHAR>(c)};
    }
  }
  std::sort(variants.begin(), variants.end(), ComesFirst);
  return variants;
}();

}  // namespace

std::span<const CaseVariant> CaseVariantsOf(WCHAR lower) {
  const auto [first, last] = std::equal_range(kVariants.begin(), kVariants.end(), CaseVariant{lower, 0}, ComesFirst);
  return {first, last};
}

}  // namespace platform
