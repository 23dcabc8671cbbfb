// The wide functions that msvcrt provides.

#include "qxcore/platform/wide.h"

#include <wchar.h>

#include <clocale>
#include <cstdlib>
#include <cstring>

namespace platform {
namespace {

bool IsCLocale() {
  const char* locale = std::setlocale(LC_COLLATE, nullptr);
  return locale == nullptr || std::strcmp(locale, "C") == 0;
}

// %n writes through a pointer that a text named; nobody needs it.
bool HasCountStore(const WCHAR* format) {
  while ((format = wcschr(format, L'%')) != nullptr) {
    ++format;
    format += wcsspn(format, L"-+ #0123456789.*hlwLIjzt");
    if (*format == L'n') return true;
    if (*format == 0) return false;
    ++format;
  }
  return false;
}

}  // namespace

int WideCollate(const WCHAR* a, const WCHAR* b) { return IsCLocale() ? WideCompare(a, b) : wcscoll(a, b); }

int WideCollate(const WCHAR* a, const WCHAR* b, std::size_t count) {
  return IsCLocale() ? WideCompare(a, b, count) : _wcsncoll(a, b, count);
}

int WideCollateNoCase(const WCHAR* a, const WCHAR* b) {
  return IsCLocale() ? WideCompareNoCase(a, b) : _wcsicoll(a, b);
}

int WideCollateNoCase(const WCHAR* a, const WCHAR* b, std::size_t count) {
  return IsCLocale() ? WideCompareNoCase(a, b, count) : _wcsnicoll(a, b, count);
}

int WideFormatV(WCHAR* buffer, std::size_t capacity, const WCHAR* format, std::va_list arguments) {
  if (capacity == 0) return -1;
  buffer[0] = 0;
  if (HasCountStore(format)) return -1;
  const int length = _vsnwprintf(buffer, capacity, format, arguments);
  if (length >= 0 && static_cast<std::size_t>(length) < capacity) return length;
  buffer[capacity - 1] = 0;
  return -1;
}

int WideFormatLengthV(const WCHAR* format, std::va_list arguments) {
  return HasCountStore(format) ? -1 : _vscwprintf(format, arguments);
}

std::FILE* WideFileOpen(const WCHAR* path, const WCHAR* mode) { return _wfopen(path, mode); }

WCHAR* WideFullPath(WCHAR* buffer, const WCHAR* path, std::size_t capacity) {
  return _wfullpath(buffer, path, capacity);
}

// A successful seek clears the end-of-file flag, which not every msvcrt does by itself.
int FileSeek(std::FILE* file, std::int64_t offset, int origin) {
  const int result = fseeko64(file, offset, origin);
  if (result == 0 && std::feof(file) != 0 && std::ferror(file) == 0) std::clearerr(file);
  return result;
}

std::int64_t FileTell(std::FILE* file) { return ftello64(file); }

}  // namespace platform
