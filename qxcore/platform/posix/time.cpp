// File times, broken-down times and packed times of the FAT file system.
//
// A file time counts 100 nanoseconds from 1 January 1601 UTC; all calendars here are Gregorian.

#include <time.h>

#include <chrono>

#include "qxcore/platform/posix/path.h"

namespace {

using platform::FailWith;
using Ticks = ULONGLONG;

constexpr Ticks kSecond = 10'000'000;
constexpr Ticks kDay = 86400 * kSecond;
constexpr Ticks kTo1970 = 11644473600 * kSecond;
constexpr Ticks kEnd = 0x8000000000000000;  // of what is a date at all
constexpr auto kFirstDay = std::chrono::sys_days(std::chrono::year(1601) / 1 / 1);

Ticks FromFileTime(const FILETIME& time) { return static_cast<Ticks>(time.dwHighDateTime) << 32 | time.dwLowDateTime; }

FILETIME ToFileTime(Ticks ticks) { return {static_cast<DWORD>(ticks), static_cast<DWORD>(ticks >> 32)}; }

Ticks Now() {
  timespec now;
  clock_gettime(CLOCK_REALTIME, &now);
  return kTo1970 + static_cast<Ticks>(now.tv_sec) * kSecond + static_cast<Ticks>(now.tv_nsec) / 100;
}

// What is to be added to UTC now.
Ticks LocalOffset() {
  const time_t now = ::time(nullptr);
  struct tm fields;
  return localtime_r(&now, &fields) == nullptr ? 0 : static_cast<Ticks>(fields.tm_gmtoff) * kSecond;
}

SYSTEMTIME BreakDown(Ticks ticks) {
  const std::chrono::days days(static_cast<int>(ticks / kDay));
  const std::chrono::year_month_day date(kFirstDay + days);
  const auto milliseconds = static_cast<unsigned>(ticks % kDay / (kSecond / 1000));
  return {static_cast<WORD>(static_cast<int>(date.year())),
          static_cast<WORD>(static_cast<unsigned>(date.month())),
          static_cast<WORD>(std::chrono::weekday(kFirstDay + days).c_encoding()),
          static_cast<WORD>(static_cast<unsigned>(date.day())),
          static_cast<WORD>(milliseconds / 3600000),
          static_cast<WORD>(milliseconds / 60000 % 60),
          static_cast<WORD>(milliseconds / 1000 % 60),
          static_cast<WORD>(milliseconds % 1000)};
}

bool PutTogether(const SYSTEMTIME& time, Ticks& ticks) {
  const auto date = std::chrono::year(time.wYear) / std::chrono::month(time.wMonth) /
                    std::chrono::day(static_cast<unsigned>(time.wDay));
  if (!date.ok() || time.wYear < 1601 || time.wYear > 30827 || time.wHour > 23 || time.wMinute > 59 ||
      time.wSecond > 59 || time.wMilliseconds > 999)
    return false;
  const auto days = static_cast<Ticks>((std::chrono::sys_days(date) - kFirstDay).count());
  const Ticks milliseconds = ((time.wHour * 60u + time.wMinute) * 60u + time.wSecond) * 1000u + time.wMilliseconds;
  ticks = days * kDay + milliseconds * (kSecond / 1000);
  return ticks < kEnd;
}

}  // namespace

void GetSystemTimeAsFileTime(FILETIME* time) { *time = ToFileTime(Now()); }

void GetSystemTime(SYSTEMTIME* time) { *time = BreakDown(Now()); }

void GetLocalTime(SYSTEMTIME* time) { *time = BreakDown(Now() + LocalOffset()); }

DWORD GetTickCount() {
  timespec now;
  clock_gettime(CLOCK_BOOTTIME, &now);
  return static_cast<DWORD>(static_cast<ULONGLONG>(now.tv_sec) * 1000 + static_cast<ULONGLONG>(now.tv_nsec) / 1000000);
}

BOOL FileTimeToSystemTime(const FILETIME* fileTime, SYSTEMTIME* time) {
  const Ticks ticks = FromFileTime(*fileTime);
  if (ticks >= kEnd) return FailWith(ERROR_INVALID_PARAMETER);
  *time = BreakDown(ticks);
  return TRUE;
}

BOOL SystemTimeToFileTime(const SYSTEMTIME* time, FILETIME* fileTime) {
  Ticks ticks;
  if (!PutTogether(*time, ticks)) return FailWith(ERROR_INVALID_PARAMETER);
  *fileTime = ToFileTime(ticks);
  return TRUE;
}

// A result before 1601 wraps to a huge count, which is no date for FileTimeToSystemTime.
BOOL FileTimeToLocalFileTime(const FILETIME* fileTime, FILETIME* localTime) {
  *localTime = ToFileTime(FromFileTime(*fileTime) + LocalOffset());
  return TRUE;
}

BOOL DosDateTimeToFileTime(WORD date, WORD time, FILETIME* fileTime) {
  const SYSTEMTIME fields = {static_cast<WORD>(1980 + (date >> 9)),
                             static_cast<WORD>(date >> 5 & 15),
                             0,
                             static_cast<WORD>(date & 31),
                             static_cast<WORD>(time >> 11),
                             static_cast<WORD>(time >> 5 & 63),
                             static_cast<WORD>((time & 31) * 2),
                             0};
  return SystemTimeToFileTime(&fields, fileTime);
}

LONG CompareFileTime(const FILETIME* a, const FILETIME* b) {
  const Ticks first = FromFileTime(*a), second = FromFileTime(*b);
  return first < second ? -1 : first > second ? 1 : 0;
}
