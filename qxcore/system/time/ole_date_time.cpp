#include "qxcore/system/time/ole_date_time.h"

#include <chrono>
#include <cmath>

#include "qxcore/platform/internal/calendar.h"
#include "qxcore/system/time/internal/locale_time.h"

namespace {

using std::chrono::sys_days;

constexpr sys_days kDayZero = std::chrono::year(1899) / 12 / 30;
constexpr int kFirstDay = -657434;    // 1 January 100
constexpr int kBehindLast = 2958466;  // 1 January 10000

struct Fields {
  std::chrono::year_month_day date;
  int day;      // from day zero
  int seconds;  // in the day
};

bool IsInRange(double value) { return value > kFirstDay - 1.0 && value < kBehindLast; }

// The value must be in range.
Fields BreakDown(double value) {
  const double whole = std::trunc(value);
  Fields fields;
  fields.day = static_cast<int>(whole);
  fields.seconds = static_cast<int>(std::lround(std::fabs(value - whole) * 86400));
  if (fields.seconds == 86400) {
    if (fields.day + 1 < kBehindLast) {
      ++fields.day;
      fields.seconds = 0;
    } else {
      fields.seconds = 86399;
    }
  }
  fields.date = kDayZero + std::chrono::days(fields.day);
  return fields;
}

double ToValue(int day, int seconds) {
  const double fraction = seconds / 86400.0;
  return day < 0 ? day - fraction : day + fraction;
}

bool MakeValue(int year, int month, int day, int hour, int minute, int second, double& value) {
  if (year < 100 || year > 9999 || month < 1 || month > 12 || day < 1 || day > 31 || hour < 0 || hour > 23 ||
      minute < 0 || minute > 59 || second < 0 || second > 59)
    return false;
  const auto date = std::chrono::year(year) / month / day;
  if (!date.ok()) return false;
  value = ToValue((sys_days(date) - kDayZero).count(), (hour * 60 + minute) * 60 + second);
  return true;
}

bool MakeValue(const std::tm& fields, double& value) {
  return MakeValue(fields.tm_year + 1900, fields.tm_mon + 1, fields.tm_mday, fields.tm_hour, fields.tm_min,
                   fields.tm_sec, value);
}

}  // namespace

SOleDateTime& SOleDateTime::operator=(double days) {
  m_value = days;
  m_status = IsInRange(days) ? kValid : kInvalid;
  return *this;
}

SOleDateTime& SOleDateTime::operator=(long time) {
  std::tm fields;
  const bool isTime = time >= INT32_MIN && time <= INT32_MAX &&
                      platform::BreakDownLocal(static_cast<std::int32_t>(time), fields) && MakeValue(fields, m_value);
  m_status = isTime ? kValid : kInvalid;
  return *this;
}

SOleDateTime& SOleDateTime::operator=(const SYSTEMTIME& time) {
  SetDateTime(time.wYear, time.wMonth, time.wDay, time.wHour, time.wMinute, time.wSecond);
  return *this;
}

SOleDateTime& SOleDateTime::operator=(const FILETIME& time) {
  FILETIME local;
  SYSTEMTIME fields;
  if (FileTimeToLocalFileTime(&time, &local) && FileTimeToSystemTime(&local, &fields)) return *this = fields;
  m_status = kInvalid;
  return *this;
}

int SOleDateTime::SetDateTime(int year, int month, int day, int hour, int minute, int second) {
  m_status = MakeValue(year, month, day, hour, minute, second, m_value) ? kValid : kInvalid;
  return m_status;
}

int SOleDateTime::GetAsSystemTime(SYSTEMTIME& time) const {
  if (m_status != kValid) return 0;
  const Fields fields = BreakDown(m_value);
  time.wYear = static_cast<WORD>(static_cast<int>(fields.date.year()));
  time.wMonth = static_cast<WORD>(static_cast<unsigned>(fields.date.month()));
  time.wDay = static_cast<WORD>(static_cast<unsigned>(fields.date.day()));
  time.wDayOfWeek = static_cast<WORD>(std::chrono::weekday(kDayZero + std::chrono::days(fields.day)).c_encoding());
  time.wHour = static_cast<WORD>(fields.seconds / 3600);
  time.wMinute = static_cast<WORD>(fields.seconds / 60 % 60);
  time.wSecond = static_cast<WORD>(fields.seconds % 60);
  time.wMilliseconds = 0;
  return 1;
}

namespace {

int Field(const SOleDateTime& date, WORD SYSTEMTIME::*field) {
  SYSTEMTIME time;
  return date.GetAsSystemTime(time) ? time.*field : -1;
}

}  // namespace

int SOleDateTime::GetYear() const { return Field(*this, &SYSTEMTIME::wYear); }
int SOleDateTime::GetMonth() const { return Field(*this, &SYSTEMTIME::wMonth); }
int SOleDateTime::GetDay() const { return Field(*this, &SYSTEMTIME::wDay); }
int SOleDateTime::GetHour() const { return Field(*this, &SYSTEMTIME::wHour); }
int SOleDateTime::GetMinute() const { return Field(*this, &SYSTEMTIME::wMinute); }
int SOleDateTime::GetSecond() const { return Field(*this, &SYSTEMTIME::wSecond); }
int SOleDateTime::GetDayOfWeek() const { return Field(*this, &SYSTEMTIME::wDayOfWeek); }

int SOleDateTime::GetDayOfYear() const {
  if (m_status != kValid) return -1;
  const Fields fields = BreakDown(m_value);
  return (sys_days(fields.date) - sys_days(fields.date.year() / 1 / 1)).count() + 1;
}

std::int32_t SOleDateTime::GetTime() const {
  SOleDateTime start;
  start = 0L;
  if (start.m_status != kValid) start.SetDate(1970, 1, 1);
  if (*this == start) return 0;
  SYSTEMTIME time;
  if (!GetAsSystemTime(time)) return -1;
  std::tm fields = {};
  fields.tm_year = time.wYear - 1900;
  fields.tm_mon = time.wMonth - 1;
  fields.tm_mday = time.wDay;
  fields.tm_hour = time.wHour;
  fields.tm_min = time.wMinute;
  fields.tm_sec = time.wSecond;
  std::int32_t result;
  platform::LocalToTime(fields, result);
  return result > 3600 && fields.tm_isdst > 0 ? result - 3600 : result;
}

double SOleDateTime::Linear() const {
  if (!(m_value < 0)) return m_value;
  const double day = std::ceil(m_value);
  return day - (m_value - day);
}

SString SOleDateTime::GetShortDateString() const {
  SYSTEMTIME time;
  return GetAsSystemTime(time) ? SLocaleDate(time, DATE_SHORTDATE) : SString();
}

SString SOleDateTime::GetLongDateString() const {
  SYSTEMTIME time;
  return GetAsSystemTime(time) ? SLocaleDate(time, DATE_LONGDATE) : SString();
}

SString SOleDateTime::GetTimeStr() const {
  SYSTEMTIME time;
  return GetAsSystemTime(time) ? SLocaleTime(time) : SString();
}

SString SOleDateTime::GetShortDateTimeString() const { return GetShortDateString() + WTEXT(" ") + GetTimeStr(); }

SString SOleDateTime::GetLongDateTimeString() const { return GetLongDateString() + WTEXT(" ") + GetTimeStr(); }
