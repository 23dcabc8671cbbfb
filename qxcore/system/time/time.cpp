#include "qxcore/system/time/time.h"

#include <chrono>

#include "qxcore/platform/internal/calendar.h"
#include "qxcore/system/time/internal/locale_time.h"

namespace {

constexpr int kLongestText = 128;  // characters of a formatted time

std::int32_t FromLocalFields(int year, int month, int day, int hour, int minute, int second, int dst) {
  std::tm fields = {};
  // Wraps instead of overflowing; years like that are out of range in any case.
  fields.tm_year = static_cast<int>(static_cast<unsigned>(year) - 1900u);
  fields.tm_mon = static_cast<int>(static_cast<unsigned>(month) - 1u);
  fields.tm_mday = day;
  fields.tm_hour = hour;
  fields.tm_min = minute;
  fields.tm_sec = second;
  fields.tm_isdst = dst;
  std::int32_t time;
  platform::LocalToTime(fields, time);
  return time;
}

std::int32_t FromSystemTime(const SYSTEMTIME& time, int dst) {
  return FromLocalFields(time.wYear, time.wMonth, time.wDay, time.wHour, time.wMinute, time.wSecond, dst);
}

SString FormatRecord(const std::tm& fields, const WCHAR* format) {
  WCHAR text[kLongestText + 1];
  const std::size_t length = format == nullptr ? 0 : platform::FormatCalendar(text, kLongestText + 1, format, fields);
  return SString(SStringView(text, length));
}

// Seconds since 1970 of a record in UTC, whatever its fields.
std::int64_t UtcSeconds(const std::tm& fields) {
  const std::int64_t months = static_cast<std::int64_t>(fields.tm_year) * 12 + fields.tm_mon;
  const std::int64_t yearsFrom1900 = months >= 0 ? months / 12 : (months - 11) / 12;
  // The calendar repeats every 400 years, 146,097 days; std::chrono knows 16-bit years only.
  const std::int64_t cycles = yearsFrom1900 >= 0 ? yearsFrom1900 / 400 : (yearsFrom1900 - 399) / 400;
  const std::chrono::sys_days monthStart = std::chrono::year(static_cast<int>(yearsFrom1900 - cycles * 400 + 1900)) /
                                           std::chrono::month(static_cast<unsigned>(months - yearsFrom1900 * 12 + 1)) /
                                           1;
  const std::int64_t days = monthStart.time_since_epoch().count() + cycles * 146097 + fields.tm_mday - 1;
  return ((days * 24 + fields.tm_hour) * 60 + fields.tm_min) * 60 + fields.tm_sec;
}

}  // namespace

STime::STime(int year, int month, int day, int hour, int minute, int second, int dst)
    : m_time(FromLocalFields(year, month, day, hour, minute, second, dst)) {}

STime::STime(unsigned short dosDate, unsigned short dosTime, int dst)
    : m_time(FromLocalFields(1980 + (dosDate >> 9), dosDate >> 5 & 15, dosDate & 31, dosTime >> 11, dosTime >> 5 & 63,
                             (dosTime & 31) * 2, dst)) {}

STime::STime(const SYSTEMTIME& time, int dst) : m_time(FromSystemTime(time, dst)) {}

STime::STime(const FILETIME& time, int dst) {
  FILETIME local;
  SYSTEMTIME fields;
  if (!FileTimeToLocalFileTime(&time, &local) || !FileTimeToSystemTime(&local, &fields) || fields.wYear < 1900) return;
  m_time = FromSystemTime(fields, dst);
}

STime STime::GetTickCount() { return STime(static_cast<std::int32_t>(std::time(nullptr))); }

int STime::GetLocalTm(std::tm* fields) const { return platform::BreakDownLocal(m_time, *fields); }

int STime::GetGmtTm(std::tm* fields) const { return platform::BreakDownUtc(m_time, *fields); }

int STime::SetLocalTm(std::tm* fields) { return platform::LocalToTime(*fields, m_time); }

int STime::SetGmtTm(std::tm* fields) {
  const std::int64_t seconds = UtcSeconds(*fields);
  m_time = static_cast<std::int32_t>(seconds);
  if (m_time == seconds && platform::BreakDownUtc(m_time, *fields)) return 1;
  m_time = -1;
  return 0;
}

namespace {

using BreakDown = int (STime::*)(std::tm*) const;

// -1 where the time cannot be broken down.
int Field(const STime& time, BreakDown breakDown, int std::tm::*field, int base = 0) {
  std::tm fields;
  return (time.*breakDown)(&fields) ? fields.*field + base : -1;
}

}  // namespace

int STime::GetYear() const { return Field(*this, &STime::GetLocalTm, &std::tm::tm_year, 1900); }
int STime::GetMonth() const { return Field(*this, &STime::GetLocalTm, &std::tm::tm_mon, 1); }
int STime::GetDay() const { return Field(*this, &STime::GetLocalTm, &std::tm::tm_mday); }
int STime::GetHour() const { return Field(*this, &STime::GetLocalTm, &std::tm::tm_hour); }
int STime::GetMinute() const { return Field(*this, &STime::GetLocalTm, &std::tm::tm_min); }
int STime::GetSecond() const { return Field(*this, &STime::GetLocalTm, &std::tm::tm_sec); }
int STime::GetDayOfWeek() const { return Field(*this, &STime::GetLocalTm, &std::tm::tm_wday); }
int STime::GetGmtYear() const { return Field(*this, &STime::GetGmtTm, &std::tm::tm_year, 1900); }
int STime::GetGmtMonth() const { return Field(*this, &STime::GetGmtTm, &std::tm::tm_mon, 1); }
int STime::GetGmtDay() const { return Field(*this, &STime::GetGmtTm, &std::tm::tm_mday); }
int STime::GetGmtHour() const { return Field(*this, &STime::GetGmtTm, &std::tm::tm_hour); }
int STime::GetGmtMinute() const { return Field(*this, &STime::GetGmtTm, &std::tm::tm_min); }
int STime::GetGmtSecond() const { return Field(*this, &STime::GetGmtTm, &std::tm::tm_sec); }
int STime::GetGmtDayOfWeek() const { return Field(*this, &STime::GetGmtTm, &std::tm::tm_wday); }

SString STime::Format(const WCHAR* format) const {
  std::tm fields;
  return GetLocalTm(&fields) ? FormatRecord(fields, format) : SString();
}

SString STime::Format(unsigned int id) const {
  SString format;
  format.LoadStringW(id);
  return Format(format);
}

SString STime::FormatGmt(const WCHAR* format) const {
  std::tm fields;
  return GetGmtTm(&fields) ? FormatRecord(fields, format) : SString();
}

SString STime::FormatGmt(unsigned int id) const {
  SString format;
  format.LoadStringW(id);
  return FormatGmt(format);
}

namespace {

// The text of a breakdown in local time; empty on failure.
SString LocaleText(const STime& time, bool wantsDate, DWORD dateFlags) {
  std::tm fields;
  if (!time.GetLocalTm(&fields)) return SString();
  const SYSTEMTIME record = {static_cast<WORD>(fields.tm_year + 1900), static_cast<WORD>(fields.tm_mon + 1),
                             static_cast<WORD>(fields.tm_wday),        static_cast<WORD>(fields.tm_mday),
                             static_cast<WORD>(fields.tm_hour),        static_cast<WORD>(fields.tm_min),
                             static_cast<WORD>(fields.tm_sec),         0};
  return wantsDate ? SLocaleDate(record, dateFlags) : SLocaleTime(record);
}

}  // namespace

SString STime::GetShortDateString() const { return LocaleText(*this, true, DATE_SHORTDATE); }

SString STime::GetLongDateString() const { return LocaleText(*this, true, DATE_LONGDATE); }

SString STime::GetTimeStr() const { return LocaleText(*this, false, 0); }

SString STime::GetShortDateTimeString() const { return GetShortDateString() + WTEXT(" ") + GetTimeStr(); }

SString STime::GetLongDateTimeString() const { return GetLongDateString() + WTEXT(" ") + GetTimeStr(); }
