#include "qxcore/platform/internal/calendar.h"

#include <time.h>
#include <wchar.h>

namespace platform {

// The runtime's results lie in a record a thread.
bool BreakDownLocal(std::int32_t time, std::tm& fields) {
  const __time32_t value = time;
  const std::tm* result = _localtime32(&value);
  if (result != nullptr) fields = *result;
  return result != nullptr;
}

bool BreakDownUtc(std::int32_t time, std::tm& fields) {
  const __time32_t value = time;
  const std::tm* result = _gmtime32(&value);
  if (result != nullptr) fields = *result;
  return result != nullptr;
}

// Times before 1970 are out of range here, so that -1 is always a failure.
bool LocalToTime(std::tm& fields, std::int32_t& time) {
  time = _mktime32(&fields);
  return time != -1;
}

// Code by code: what lies between them the runtime copies by bytes of the code page, and not every one
// tells when the text fills the buffer.
std::size_t FormatCalendar(WCHAR* buffer, std::size_t capacity, const WCHAR* format, const std::tm& fields) {
  if (capacity == 0) return 0;
  buffer[0] = 0;
  std::size_t length = 0;
  for (; *format != 0; ++format) {
    WCHAR code[] = {'!', 0, 0, 0, 0}, text[128] = {0, *format};
    std::size_t count = 2;
    if (*format == '%') {
      // The mark in front distinguishes a code without text from an unknown one.
      code[1] = '%';
      code[2] = *++format;
      if (code[2] == '#') code[3] = *++format;
      count = *format == 0 ? 0 : wcsftime(text, 128, code, &fields);
    }
    if (count == 0 || length + count > capacity) {
      buffer[0] = 0;
      return 0;
    }
    for (std::size_t i = 1; i < count; ++i) buffer[length++] = text[i];
  }
  buffer[length] = 0;
  return length;
}

}  // namespace platform
