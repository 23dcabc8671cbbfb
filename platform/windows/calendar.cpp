#include "platform/calendar.h"

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

std::int32_t LocalToTime(std::tm& fields) { return _mktime32(&fields); }

std::size_t FormatCalendar(WCHAR* buffer, std::size_t capacity, const WCHAR* format, const std::tm& fields) {
  if (capacity == 0) return 0;
  const std::size_t length = wcsftime(buffer, capacity, format, &fields);
  if (length == 0) buffer[0] = 0;
  return length;
}

}  // namespace platform
