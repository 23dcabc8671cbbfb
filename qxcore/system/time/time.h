// STime: a point in time in whole seconds since 1 January 1970 00:00 UTC, in 32 bits.
//
// Calendar fields and texts come from the runtime library, in its local time or in UTC. The range is
// 13 December 1901 to 19 January 2038; on Windows the runtime breaks down no time before 1970: fields
// are -1 and texts empty there. Arithmetic wraps around at the ends of the range. Differences between
// the targets: docs/time.md. Threads: an object belongs to one thread at a time.
#pragma once

#include <compare>
#include <cstdint>
#include <ctime>

#include "qxcore/platform/export.h"
#include "qxcore/platform/win32.h"
#include "qxcore/string/string.h"
#include "qxcore/system/time/time_span.h"

class QXCORE_API STime {
 public:
  // --- construction ---
  // `dst` says what the fields mean: 1 daylight-saving time, 0 standard time, -1 whichever is in force at
  // that time. Fields out of range carry over (31 February is 2 or 3 March); what lies outside the
  // 32 bits yields -1, the runtime's sign of an impossible date.
  constexpr STime() noexcept = default;  // 1 January 1970 00:00 UTC
  constexpr explicit STime(std::int32_t time) noexcept : m_time(time) {}
  // Local time; month 1 to 12.
  STime(int year, int month, int day, int hour, int minute, int second, int dst = -1);
  // Local time, packed as the FAT file system and zip archives have it; seconds are even.
  STime(unsigned short dosDate, unsigned short dosTime, int dst = -1);
  // Local time; milliseconds are dropped, the day of the week is not looked at.
  explicit STime(const SYSTEMTIME& time, int dst = -1);
  // A file time in UTC, brought to local time with the difference to UTC that is in force today, whatever
  // its date, and then read as local time of its date. So a time in the other half of the year can come
  // out an hour off, on purpose, as the platform's own dialogs show file times like this. 0 when it
  // cannot be converted or lies before 1900.
  explicit STime(const FILETIME& time, int dst = -1);

  // The present time. (The name is what the Windows headers make of GetCurrentTime(), which a client may
  // write as well; it has nothing to do with the system's count of milliseconds.)
  static STime GetTickCount();

  std::int32_t GetTime() const { return m_time; }

  // --- fields; -1 where the runtime cannot break the time down ---
  int GetYear() const;       // all four digits
  int GetMonth() const;      // 1 to 12
  int GetDay() const;        // 1 to 31
  int GetHour() const;       // 0 to 23
  int GetMinute() const;     // 0 to 59
  int GetSecond() const;     // 0 to 59
  int GetDayOfWeek() const;  // 0 Sunday to 6 Saturday
  int GetGmtYear() const;    // the same in UTC
  int GetGmtMonth() const;
  int GetGmtDay() const;
  int GetGmtHour() const;
  int GetGmtMinute() const;
  int GetGmtSecond() const;
  int GetGmtDayOfWeek() const;

  // All fields as the runtime's record. 1, or 0 when the time cannot be broken down; *fields is as it was then.
  int GetLocalTm(std::tm* fields) const;
  int GetGmtTm(std::tm* fields) const;
  // Take the time from a record in local time or UTC; its fields may be out of range and are brought into
  // range. 1, or 0 when the time lies outside the 32 bits; it is -1 then. tm_isdst means nothing in UTC.
  int SetLocalTm(std::tm* fields);
  int SetGmtTm(std::tm* fields);

  // --- texts ---
  // By the codes of the runtime's strftime, on both targets those of msvcrt. Empty when the time cannot be broken
  // down, a code is unknown, or the text has more than 128 characters.
  SString Format(const WCHAR* format) const;
  SString Format(unsigned int id) const;  // the format is a text of the library's string table
  SString FormatGmt(const WCHAR* format) const;
  SString FormatGmt(unsigned int id) const;
  // Local time in the style of the user's locale; empty when the time cannot be broken down.
  SString GetShortDateString() const;
  SString GetLongDateString() const;
  SString GetTimeStr() const;
  SString GetShortDateTimeString() const;  // short date, a space, time; the space alone on failure
  SString GetLongDateTimeString() const;   // long date, a space, time

  // --- arithmetic and order ---
  STime& operator+=(STimeSpan span) {
    m_time = STimeSpan(m_time).Plus(span);
    return *this;
  }
  STime& operator-=(STimeSpan span) {
    m_time = STimeSpan(m_time).Minus(span);
    return *this;
  }
  friend STime operator+(STime time, STimeSpan span) { return time += span; }
  friend STime operator-(STime time, STimeSpan span) { return time -= span; }
  friend STimeSpan operator-(STime a, STime b) { return STimeSpan(a.m_time) - STimeSpan(b.m_time); }
  friend constexpr auto operator<=>(STime a, STime b) = default;

 private:
  std::int32_t m_time = 0;
};

static_assert(sizeof(STime) == 4, "a time is its count of seconds");
