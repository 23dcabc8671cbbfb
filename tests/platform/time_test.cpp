// The platform's file times, records and packed times: conversions, limits, error codes.

#include <gtest/gtest.h>

#include <cmath>
#include <ctime>

#include "qxcore/platform/win32.h"
#include "tests/support/text.h"
#include "tests/support/wine.h"

namespace {

using Ticks = ULONGLONG;

FILETIME ToFileTime(Ticks ticks) { return {static_cast<DWORD>(ticks), static_cast<DWORD>(ticks >> 32)}; }
Ticks FromFileTime(const FILETIME& time) { return static_cast<Ticks>(time.dwHighDateTime) << 32 | time.dwLowDateTime; }

constexpr Ticks kSecond = 10'000'000;
constexpr Ticks kTo1970 = 11644473600 * kSecond;

// The calendar's rules counted day by day, from 1 January 1601, a Monday.
TEST(FileTimes, EveryDayOfSixHundredYears) {
  static const int kDays[] = {31, 28, 31, 30, 31, 30, 31, 31, 30, 31, 30, 31};
  Ticks ticks = 0;
  int weekday = 1;
  for (int year = 1601; year <= 2200; ++year) {
    const bool isLeap = year % 4 == 0 && (year % 100 != 0 || year % 400 == 0);
    for (int month = 1; month <= 12; ++month) {
      for (int day = 1; day <= kDays[month - 1] + (month == 2 && isLeap); ++day, ticks += 86400 * kSecond) {
        const Ticks inDay = (static_cast<Ticks>(day) * 2741 % 86400) * kSecond + static_cast<Ticks>(day) * 10000;
        const FILETIME time = ToFileTime(ticks + inDay);
        SYSTEMTIME fields;
        ASSERT_TRUE(FileTimeToSystemTime(&time, &fields));
        ASSERT_EQ(fields.wYear, year);
        ASSERT_EQ(fields.wMonth, month);
        ASSERT_EQ(fields.wDay, day);
        ASSERT_EQ(fields.wDayOfWeek, weekday);
        ASSERT_EQ(fields.wMilliseconds, day);
        fields.wDayOfWeek = 99;
        FILETIME back;
        ASSERT_TRUE(SystemTimeToFileTime(&fields, &back));
        ASSERT_EQ(FromFileTime(back), ticks + inDay);
        weekday = (weekday + 1) % 7;
      }
    }
  }
}

TEST(FileTimes, LimitsOfRecords) {
  const SYSTEMTIME good = {2024, 2, 0, 29, 23, 59, 59, 999};
  FILETIME time;
  EXPECT_TRUE(SystemTimeToFileTime(&good, &time));
  const auto refuses = [&](WORD SYSTEMTIME::*field, WORD value) {
    SYSTEMTIME bad = good;
    bad.*field = value;
    SetLastError(0);
    return !SystemTimeToFileTime(&bad, &time) && GetLastError() == ERROR_INVALID_PARAMETER;
  };
  EXPECT_TRUE(refuses(&SYSTEMTIME::wYear, 1600));
  if (!IsWine()) {  // which takes these
    EXPECT_TRUE(refuses(&SYSTEMTIME::wYear, 30828));
    EXPECT_TRUE(refuses(&SYSTEMTIME::wYear, 2023));  // no leap year
  }
  EXPECT_TRUE(refuses(&SYSTEMTIME::wMonth, 0));
  EXPECT_TRUE(refuses(&SYSTEMTIME::wMonth, 13));
  EXPECT_TRUE(refuses(&SYSTEMTIME::wDay, 0));
  EXPECT_TRUE(refuses(&SYSTEMTIME::wDay, 30));
  EXPECT_TRUE(refuses(&SYSTEMTIME::wHour, 24));
  EXPECT_TRUE(refuses(&SYSTEMTIME::wMinute, 60));
  EXPECT_TRUE(refuses(&SYSTEMTIME::wSecond, 60));
  EXPECT_TRUE(refuses(&SYSTEMTIME::wMilliseconds, 1000));
  SYSTEMTIME fields;
  time = ToFileTime(0x7FFFFFFFFFFFFFFF);
  EXPECT_TRUE(FileTimeToSystemTime(&time, &fields));
  EXPECT_EQ(fields.wYear, 30828);
  time = ToFileTime(0x8000000000000000);
  SetLastError(0);
  EXPECT_FALSE(FileTimeToSystemTime(&time, &fields));
  EXPECT_EQ(GetLastError(), static_cast<DWORD>(ERROR_INVALID_PARAMETER));
}

TEST(FileTimes, LocalTimeHasTodaysBias) {
  SYSTEMTIME utc, local;
  FILETIME now, expected;
  GetSystemTime(&utc);
  GetLocalTime(&local);
  SystemTimeToFileTime(&utc, &now);
  SystemTimeToFileTime(&local, &expected);
  // In minutes; the two clocks were read one after the other, and zones differ by quarters of an hour.
  const double ticks = static_cast<double>(static_cast<LONGLONG>(FromFileTime(expected) - FromFileTime(now)));
  const LONGLONG bias = std::llround(ticks / (900.0 * kSecond)) * 15;
  // The same difference in winter and in summer.
  for (const Ticks seconds : {0ull, 1700000000ull, 1720000000ull}) {
    const FILETIME time = ToFileTime(kTo1970 + seconds * kSecond);
    FILETIME there;
    ASSERT_TRUE(FileTimeToLocalFileTime(&time, &there));
    EXPECT_EQ(static_cast<LONGLONG>(FromFileTime(there) - FromFileTime(time)) / 600000000, bias);
  }
}

TEST(FileTimes, EveryPackedDateAndTime) {
  int valid = 0;
  for (unsigned date = 0; date < 0x10000; ++date) {
    FILETIME time;
    const BOOL isDate = DosDateTimeToFileTime(static_cast<WORD>(date), 0xBF7D, &time);  // 23:59:58
    const unsigned month = date >> 5 & 15, day = date & 31;
    static const unsigned kDays[] = {0, 31, 28, 31, 30, 31, 30, 31, 31, 30, 31, 30, 31, 0, 0, 0};
    const unsigned year = 1980 + (date >> 9);
    const unsigned days = kDays[month] + (month == 2 && year % 4 == 0 && year != 2100);
    const bool isKnown = day >= 1 && day <= days;
    // Wine carries days beyond a month's end over into the next month.
    if (isKnown || !IsWine()) {
      ASSERT_EQ(isDate != 0, isKnown) << date;
    }
    if (!isKnown) continue;
    ++valid;
    SYSTEMTIME fields;
    ASSERT_TRUE(FileTimeToSystemTime(&time, &fields));
    ASSERT_EQ((unsigned{fields.wYear} - 1980) << 9 | fields.wMonth << 5 | fields.wDay, date);
    ASSERT_EQ(fields.wHour << 11 | fields.wMinute << 5 | fields.wSecond / 2, 0xBF7D);
  }
  EXPECT_EQ(valid, 46751);  // days of 1980 to 2107
  FILETIME time;
  EXPECT_TRUE(IsWine() || !DosDateTimeToFileTime(0x2821, 0xC000, &time));  // 24:00
}

TEST(FileTimes, ClocksAgree) {
  FILETIME before, after;
  GetSystemTimeAsFileTime(&before);
  SYSTEMTIME fields;
  GetSystemTime(&fields);
  const std::time_t seconds = std::time(nullptr);
  GetSystemTimeAsFileTime(&after);
  FILETIME broken;
  ASSERT_TRUE(SystemTimeToFileTime(&fields, &broken));
  EXPECT_LE(CompareFileTime(&before, &after), 0);
  EXPECT_LE(FromFileTime(before) / 10000, FromFileTime(broken) / 10000);
  EXPECT_LE(FromFileTime(broken), FromFileTime(after));
  // The runtime's clock is a coarser one and can lag behind a full second.
  EXPECT_LE(FromFileTime(before) / kSecond, kTo1970 / kSecond + static_cast<Ticks>(seconds) + 1);
  const DWORD start = GetTickCount();
  while (GetTickCount() == start) {  // it goes on
  }
}

}  // namespace
