// FoldStringW, and the OEM conversions of whole texts.

#include <unicode/unorm2.h>

#include <cstring>
#include <new>
#include <string>

#include "qxcore/platform/wide.h"

namespace {

int Fail(DWORD error) {
  SetLastError(error);
  return 0;
}

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

BOOL CharToOemBuffW(LPCWSTR text, LPSTR bytes, DWORD count) {
  if (text == nullptr || bytes == nullptr) return FALSE;
  if (count > 0 && static_cast<const void*>(text) == bytes) {
    std::u16string copy(text, count);
    WideCharToMultiByte(CP_OEMCP, 0, copy.data(), static_cast<int>(count), bytes, static_cast<int>(count * 2), nullptr,
                        nullptr);
  } else if (count > 0) {
    WideCharToMultiByte(CP_OEMCP, 0, text, static_cast<int>(count), bytes, static_cast<int>(count * 2), nullptr,
                        nullptr);
  }
  return TRUE;
}

BOOL OemToCharBuffW(LPCSTR bytes, LPWSTR text, DWORD count) {
  if (bytes == nullptr || text == nullptr || static_cast<const void*>(bytes) == text) return FALSE;
  if (count > 0)
    MultiByteToWideChar(CP_OEMCP, MB_PRECOMPOSED, bytes, static_cast<int>(count), text, static_cast<int>(count));
  return TRUE;
}

BOOL CharToOemW(LPCWSTR text, LPSTR bytes) {
  return text != nullptr && CharToOemBuffW(text, bytes, static_cast<DWORD>(platform::WideLength(text) + 1));
}

BOOL OemToCharW(LPCSTR bytes, LPWSTR text) {
  return bytes != nullptr && OemToCharBuffW(bytes, text, static_cast<DWORD>(std::strlen(bytes) + 1));
}
