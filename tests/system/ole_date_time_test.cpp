// SOleDateTime: the day count against the system's own conversion, order, the way to seconds, limits.

#include "qxcore/system/time/ole_date_time.h"

#include <gtest/gtest.h>

#include <cmath>
#include <limits>
#include <random>

#include "tests/support/text.h"
#include "tests/support/wine.h"
#include "tests/support/zone_peer.h"

namespace {

bool AreSame(const SYSTEMTIME& a, const SYSTEMTIME& b) {
  return a.wYear == b.wYear && a.wMonth == b.wMonth && a.wDayOfWeek == b.wDayOfWeek && a.wDay == b.wDay &&
         a.wHour == b.wHour && a.wMinute == b.wMinute && a.wSecond == b.wSecond;
}

TEST(OleDates, EveryDayThereAndBack) {
  const WORD kHours[] = {0, 6, 23};
  double previous = -1e9;
  int dayOfWeek = 5;  // 1 January 100 was a Friday
  for (int year = 100; year <= 9999; ++year) {
    int dayOfYear = 0;
    for (int month = 1; month <= 12; ++month) {
      for (int day = 1; day <= 31; ++day) {
        const int hour = kHours[day % 3], minute = day * 7 % 60, second = day * 11 % 60;
        const SOleDateTime date(year, month, day, hour, minute, second);
        if (date.GetStatus() != SOleDateTime::kValid) continue;
        SYSTEMTIME time;
        ASSERT_EQ(date.GetAsSystemTime(time), 1);
        const SYSTEMTIME expected = {
            static_cast<WORD>(year), static_cast<WORD>(month),  static_cast<WORD>(dayOfWeek), static_cast<WORD>(day),
            static_cast<WORD>(hour), static_cast<WORD>(minute), static_cast<WORD>(second),    0};
        ASSERT_TRUE(AreSame(time, expected)) << year << "-" << month << "-" << day << " " << date.GetValue();
        ASSERT_EQ(date.GetDayOfYear(), ++dayOfYear);
        ASSERT_EQ(date.GetDayOfWeek(), dayOfWeek);
        const double whole = std::trunc(date.GetValue());
        ASSERT_TRUE(previous == -1e9 || whole == previous + 1) << whole;
        previous = whole;
        dayOfWeek = (dayOfWeek + 1) % 7;
      }
    }
    ASSERT_EQ(dayOfYear, year % 4 == 0 && (year % 100 != 0 || year % 400 == 0) ? 366 : 365);
  }
  EXPECT_EQ(previous, 2958465);
}

TEST(OleDates, KnownValues) {
  EXPECT_EQ(SOleDateTime(1899, 12, 30, 0, 0, 0).GetValue(), 0.0);
  EXPECT_EQ(SOleDateTime(1899, 12, 29, 6, 0, 0).GetValue(), -1.25);
  EXPECT_EQ(SOleDateTime(1900, 1, 1, 12, 0, 0).GetValue(), 2.5);
  EXPECT_EQ(SOleDateTime(2000, 1, 1, 0, 0, 0).GetValue(), 36526.0);
  EXPECT_EQ(SOleDateTime(100, 1, 1, 0, 0, 0).GetValue(), -657434.0);
  SOleDateTime date;
  EXPECT_EQ(date.SetTime(6, 0, 0), 0);
  EXPECT_EQ(date.GetValue(), 0.25);
  EXPECT_EQ(SOleDateTime(-0.25).GetHour(), 6);  // the same time of the same day
  EXPECT_EQ(SOleDateTime(-0.25).GetDay(), 30);
  // The last half second of a day belongs to the next.
  EXPECT_EQ(SOleDateTime(36526.999999).GetDay(), 2);
  EXPECT_EQ(SOleDateTime(-1.999999).GetDay(), 30);
  EXPECT_EQ(SOleDateTime(2958465.9999999).GetSecond(), 59);
}

TEST(OleDates, LimitsAndStatus) {
  SOleDateTime date(36526.5);
  EXPECT_EQ(date.SetDateTime(2023, 12, 31, 24, 0, 0), SOleDateTime::kInvalid);
  EXPECT_EQ(date.GetDayOfWeek(), -1);
  EXPECT_EQ(date.SetDateTime(2000, 1, 1, 12, 0, 0), SOleDateTime::kValid);
  EXPECT_EQ(date.SetDate(2023, 2, 29), SOleDateTime::kInvalid);
  EXPECT_EQ(date.GetStatus(), 1);
  EXPECT_EQ(date.GetValue(), 36526.5);
  EXPECT_EQ(date.GetYear(), -1);
  EXPECT_EQ(date.GetDayOfYear(), -1);
  EXPECT_EQ(date.GetTime(), -1);
  EXPECT_EQ(date.GetShortDateString(), SString());
  EXPECT_EQ(date.GetLongDateTimeString(), SString::Space);
  SYSTEMTIME time = {1, 2, 3, 4, 5, 6, 7, 8};
  EXPECT_EQ(date.GetAsSystemTime(time), 0);
  EXPECT_EQ(time.wYear, 1);
  EXPECT_NE(date, SOleDateTime(36526.5));  // by status
  EXPECT_EQ(date.SetDate(2024, 2, 29), SOleDateTime::kValid);
  EXPECT_EQ(date.SetDate(99, 1, 1), 1);
  EXPECT_EQ(date.SetDate(10000, 1, 1), 1);
  EXPECT_EQ(date.SetDate(2000, 0, 1), 1);
  EXPECT_EQ(date.SetDate(2000, 13, 1), 1);
  EXPECT_EQ(date.SetDate(2000, 1, 0), 1);
  EXPECT_EQ(date.SetTime(24, 0, 0), 1);
  EXPECT_EQ(date.SetTime(0, 60, 0), 1);
  EXPECT_EQ(date.SetTime(0, 0, -1), 1);
  for (const double bad : {2958466.0, -657435.0, 1e300, -1e300, std::nan(""), std::numeric_limits<double>::infinity()})
    EXPECT_EQ(SOleDateTime(bad).GetStatus(), 1) << bad;
  for (const double good : {2958465.99, -657434.99}) EXPECT_EQ(SOleDateTime(good).GetStatus(), 0) << good;
  date = SYSTEMTIME{2000, 2, 0, 30, 0, 0, 0, 0};
  EXPECT_EQ(date.GetStatus(), 1);
  date = FILETIME{0, 0x90000000};
  EXPECT_EQ(date.GetStatus(), 1);
}

TEST(OleDates, OrderIsThatOfTheTimes) {
  EXPECT_GT(SOleDateTime(-1.25), SOleDateTime(-1.0));
  EXPECT_LT(SOleDateTime(-1.25), SOleDateTime(0.0));
  EXPECT_LT(SOleDateTime(-1.25), SOleDateTime(-1.75));
  EXPECT_GE(SOleDateTime(-1.25), SOleDateTime(-1.25));
  EXPECT_NE(SOleDateTime(-1.25), SOleDateTime(-1.0));
  std::mt19937 random(9);
  SOleDateTime previous(1890, 1, 1, 0, 0, 0);
  SYSTEMTIME time;
  previous.GetAsSystemTime(time);
  for (int i = 0; i < 10000; ++i) {
    const int hour = static_cast<int>(random() % 24), minute = static_cast<int>(random() % 60);
    const SOleDateTime a(1880 + static_cast<int>(random() % 40), 1 + static_cast<int>(random() % 12), 7, hour, minute,
                         0);
    const SOleDateTime b(1880 + static_cast<int>(random() % 40), 1 + static_cast<int>(random() % 12), 7, minute % 24,
                         hour, 0);
    SYSTEMTIME timeA, timeB;
    a.GetAsSystemTime(timeA);
    b.GetAsSystemTime(timeB);
    FILETIME fileA, fileB;
    SystemTimeToFileTime(&timeA, &fileA);
    SystemTimeToFileTime(&timeB, &fileB);
    const int order = CompareFileTime(&fileA, &fileB);
    ASSERT_EQ(a < b, order < 0);
    ASSERT_EQ(a > b, order > 0);
    ASSERT_EQ(a <= b, order <= 0);
    ASSERT_EQ(a >= b, order >= 0);
    ASSERT_EQ(a == b, order == 0);
  }
}

// Seconds to a date and back, the hours that come twice apart; the correction makes summer come out right,
// and takes nothing off within the first hour of 1970.
TEST(OleDates, SecondsThereAndBack) {
  const test::ZonePeer peer;
  SOleDateTime date;
  date = 0L;
  EXPECT_EQ(date.GetTime(), 0);
  for (std::int64_t seconds = 86400; seconds < INT32_MAX - 86400; seconds += 86400 * 3 + 4321) {
    const auto time = static_cast<std::int32_t>(seconds);
    date = static_cast<long>(time);
    ASSERT_EQ(date.GetStatus(), 0);
    ASSERT_EQ(date, SOleDateTime(STime(time)));
    bool isNearChange = false;
    for (const int distance : {-7200, 7200}) isNearChange |= peer.Offset(time + distance) != peer.Offset(time);
    std::tm fields;
    STime(time).GetLocalTm(&fields);
    // Other savings than an hour are off by the rest of it; that is meant.
    std::tm winter = fields;
    winter.tm_isdst = 0;
    STime asStandard;
    asStandard.SetLocalTm(&winter);
    const int saving = fields.tm_isdst > 0 ? asStandard.GetTime() - time : 3600;
    ASSERT_TRUE(isNearChange || date.GetTime() == time + saving - 3600) << time << " " << date.GetTime();
  }
  date = SOleDateTime(2050, 1, 1, 0, 0, 0);
  EXPECT_EQ(date.GetTime(), -1);
  date = static_cast<long>(IsWindows() ? -1000000 : 0);
  EXPECT_EQ(date.GetStatus(), IsWindows() ? 1 : 0);
}

TEST(OleDates, FileTimesAndTexts) {
  const SYSTEMTIME utc = {2015, 6, 0, 15, 12, 30, 15, 999};
  FILETIME file;
  SystemTimeToFileTime(&utc, &file);
  EXPECT_EQ(SOleDateTime(file).GetYear(), 2015);
  EXPECT_EQ(SOleDateTime(file).GetMinute() % 15, 0);
  EXPECT_EQ(SOleDateTime(file).GetSecond(), 15);
  std::tm fields = {};
  fields.tm_year = 103;
  fields.tm_mon = 3;
  fields.tm_mday = 5;
  fields.tm_hour = 16;
  fields.tm_isdst = -1;
  STime time;
  time.SetLocalTm(&fields);
  const SOleDateTime date(2003, 4, 5, 16, 0, 0);
  EXPECT_EQ(date.GetShortDateString(), time.GetShortDateString());
  EXPECT_EQ(date.GetLongDateTimeString(), time.GetLongDateTimeString());
  EXPECT_EQ(date.GetShortDateTimeString(), date.GetShortDateString() + WTEXT(" ") + date.GetTimeStr());
  EXPECT_FALSE(SOleDateTime(1601, 1, 1, 0, 0, 0).GetShortDateString().IsEmpty());
  EXPECT_EQ(SOleDateTime(1600, 12, 31, 0, 0, 0).GetShortDateString(), SString());
}

#ifdef _WIN32
// The system's own day counts.
TEST(OleDates, AgreeWithTheSystem) {
  const HMODULE module = LoadLibraryW(L"oleaut32.dll");
  ASSERT_NE(module, nullptr);
  using ToSystem = INT(WINAPI*)(double, SYSTEMTIME*);
  using FromSystem = INT(WINAPI*)(SYSTEMTIME*, double*);
  const auto toSystem =
      reinterpret_cast<ToSystem>(reinterpret_cast<void*>(GetProcAddress(module, "VariantTimeToSystemTime")));
  const auto fromSystem =
      reinterpret_cast<FromSystem>(reinterpret_cast<void*>(GetProcAddress(module, "SystemTimeToVariantTime")));
  std::mt19937 random(3);
  for (int i = 0; i < 200000; ++i) {
    // Whole seconds: at their borders rounding may go either way.
    const int day = static_cast<int>(random() % (2958466 + 657434)) - 657434,
              second = static_cast<int>(random() % 86400);
    const double value = day < 0 ? day - second / 86400.0 : day + second / 86400.0;
    SYSTEMTIME ours, theirs;
    ASSERT_EQ(SOleDateTime(value).GetAsSystemTime(ours), 1);
    ASSERT_EQ(toSystem(value, &theirs), 1);
    ASSERT_TRUE(AreSame(ours, theirs)) << value;
    double back = 0;
    ASSERT_EQ(fromSystem(&theirs, &back), 1);
    SOleDateTime date;
    date = theirs;
    ASSERT_NEAR(date.GetValue(), back, 1e-9) << value;
  }
  FreeLibrary(module);
}
#endif

}  // namespace
