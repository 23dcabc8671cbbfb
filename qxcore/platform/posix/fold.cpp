// FoldStringW.

#include <unicode/unorm2.h>

#include "qxcore/platform/posix/failure.h"
#include "qxcore/platform/wide.h"

namespace {

using platform::FailWith;

int Fail(DWORD error) { return FailWith(error, 0); }

int FoldWith(const UNormalizer2* normalizer, const WCHAR* text, int count, WCHAR* folded, int capacity) {
  UErrorCode error = U_ZERO_ERROR;
  const std::int32_t length =
      unorm2_normalize(normalizer, text, count, capacity > 0 ? folded : nullptr, capacity, &error);
  if (error == U_BUFFER_OVERFLOW_ERROR && capacity == 0) return length;
  if (error == U_BUFFER_OVERFLOW_ERROR) return Fail(ERROR_INSUFFICIENT_BUFFER);
  if (U_FAILURE(error))
    return Fail(error == U_MEMORY_ALLOCATION_ERROR ? ERROR_NOT_ENOUGH_MEMORY : ERROR_INVALID_PARAMETER);
  return length;
}

}  // namespace

int FoldStringW(DWORD flags, LPCWSTR text, int count, LPWSTR folded, int capacity) {
  if (text == nullptr || count == 0 || capacity < 0 || (capacity > 0 && folded == nullptr) || text == folded)
    return Fail(ERROR_INVALID_PARAMETER);
  if (flags != MAP_COMPOSITE && flags != MAP_PRECOMPOSED) return Fail(ERROR_INVALID_FLAGS);
  if (count < 0) count = static_cast<int>(platform::WideLength(text)) + 1;
  UErrorCode error = U_ZERO_ERROR;
  const UNormalizer2* normalizer =
      flags == MAP_COMPOSITE ? unorm2_getNFDInstance(&error) : unorm2_getNFCInstance(&error);
  if (U_FAILURE(error)) return Fail(ERROR_NOT_ENOUGH_MEMORY);
  return FoldWith(normalizer, text, count, folded, capacity);
}
