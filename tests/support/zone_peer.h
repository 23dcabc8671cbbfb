// Another reading of the zone that a program runs in, to compare with: on Linux ICU's zone of the name in
// TZ; on Windows the system's one rule for all years, worked out from its record.
#pragma once

#include <gtest/gtest.h>

#include <chrono>
#include <cstdint>
#include <cstdlib>
#include <ctime>
#include <vector>

#include "qxcore/platform/win32.h"

#ifdef _WIN32
#include <time.h>
#else
#include <unicode/ucal.h>
#endif

namespace test {

// What lies between two calendar breakdowns of the same moment: fields in UTC plus an offset.
inline std::tm FieldsOf(std::int64_t secondsWithOffset) {
  using namespace std::chrono;
  const sys_seconds moment{seconds(secondsWithOffset)};
  const sys_days day = floor<days>(moment);
  const year_month_day date(day);
  const auto inDay = static_cast<int>((moment - day).count());
  std::tm fields = {};
  fields.tm_year = static_cast<int>(date.year()) - 1900;
  fields.tm_mon = static_cast<int>(static_cast<unsigned>(date.month())) - 1;
  fields.tm_mday = static_cast<int>(static_cast<unsigned>(date.day()));
  fields.tm_hour = inDay / 3600;
  fields.tm_min = inDay / 60 % 60;
  fields.tm_sec = inDay % 60;
  fields.tm_wday = static_cast<int>(weekday(day).c_encoding());
  fields.tm_yday = static_cast<int>((day - sys_days(date.year() / January / 1)).count());
  return fields;
}

#ifdef _WIN32

class ZonePeer {
 public:
  ZonePeer() {
    // The runtime would read TZ in a form of its own; without it, it asks the system, whose zone the
    // environment has chosen before the program began.
    _putenv("TZ=");
    _tzset();
    GetTimeZoneInformation(&m_zone);
  }
  std::int32_t First() const { return 86400; }  // what the runtime breaks down in every zone

  int Offset(std::int32_t time) const {
    const int standard = -60 * static_cast<int>(m_zone.Bias + m_zone.StandardBias);
    if (m_zone.DaylightDate.wMonth == 0) return standard;
    const int daylight = -60 * static_cast<int>(m_zone.Bias + m_zone.DaylightBias);
    const int year = FieldsOf(std::int64_t{time} + standard).tm_year + 1900;
    const std::int64_t start = Change(m_zone.DaylightDate, year) - standard;
    const std::int64_t end = Change(m_zone.StandardDate, year) - daylight;
    const bool isDaylight = start < end ? time >= start && time < end : time >= start || time < end;
    return isDaylight ? daylight : standard;
  }

  std::vector<std::int32_t> Changes() const {
    std::vector<std::int32_t> changes;
    for (std::int64_t time = First(), previous = Offset(First()); time < INT32_MAX; time += 1800) {
      const int offset = Offset(static_cast<std::int32_t>(time));
      if (offset != previous) changes.push_back(static_cast<std::int32_t>(time));
      previous = offset;
    }
    return changes;
  }

 private:
  // Wall time of a rule "the n-th weekday of a month", in seconds.
  static std::int64_t Change(const SYSTEMTIME& rule, int year) {
    using namespace std::chrono;
    const weekday day(rule.wDayOfWeek);
    const auto inMonth = std::chrono::year(year) / month(rule.wMonth);
    const sys_days date = rule.wDay == 5 ? sys_days(inMonth / weekday_last(day)) : sys_days(inMonth / day[rule.wDay]);
    return std::int64_t{date.time_since_epoch().count()} * 86400 + rule.wHour * 3600 + rule.wMinute * 60;
  }

  TIME_ZONE_INFORMATION m_zone;
};

#else

class ZonePeer {
 public:
  ZonePeer() {
    const char* name = std::getenv("TZ");
    std::u16string wide;
    for (const char* c = name == nullptr || *name == 0 ? "UTC" : name; *c != 0; ++c) wide += static_cast<char16_t>(*c);
    UErrorCode error = U_ZERO_ERROR;
    m_calendar = ucal_open(wide.c_str(), -1, "en_US", UCAL_GREGORIAN, &error);
    EXPECT_TRUE(U_SUCCESS(error)) << u_errorName(error);
  }
  ZonePeer(const ZonePeer&) = delete;
  ZonePeer& operator=(const ZonePeer&) = delete;
  ~ZonePeer() { ucal_close(m_calendar); }
  std::int32_t First() const { return INT32_MIN; }

  int Offset(std::int32_t time) const {
    UErrorCode error = U_ZERO_ERROR;
    ucal_setMillis(m_calendar, time * 1000.0, &error);
    const int offset = ucal_get(m_calendar, UCAL_ZONE_OFFSET, &error) + ucal_get(m_calendar, UCAL_DST_OFFSET, &error);
    EXPECT_TRUE(U_SUCCESS(error));
    return offset / 1000;
  }

  std::vector<std::int32_t> Changes() const {
    std::vector<std::int32_t> changes;
    UErrorCode error = U_ZERO_ERROR;
    UDate at = INT32_MIN * 1000.0;
    while (true) {
      ucal_setMillis(m_calendar, at, &error);
      if (!ucal_getTimeZoneTransitionDate(m_calendar, UCAL_TZ_TRANSITION_NEXT, &at, &error) || U_FAILURE(error)) break;
      if (at > INT32_MAX * 1000.0) break;
      changes.push_back(static_cast<std::int32_t>(at / 1000));
    }
    return changes;
  }

 private:
  UCalendar* m_calendar;
};

#endif

}  // namespace test
