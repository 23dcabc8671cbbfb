// SOleDateTime: a calendar date and time as a count of days, with a status that says whether it is valid.
//
// The value counts days from 30 December 1899 00:00 and belongs to no zone. Its fraction is the time of
// day, and for negative values, too, it counts forward from the whole day: -1.25 is 29 December 1899
// 06:00 (the automation date convention; so -0.25 and 0.25 are the same time). Valid are the years
// 100 to 9999. Times are whole seconds: fractions of one are rounded when fields are asked for.
// Threads: an object belongs to one thread at a time.
#pragma once

#include <cstdint>

#include "qxcore/platform/export.h"
#include "qxcore/platform/win32.h"
#include "qxcore/string/string.h"
#include "qxcore/system/time/time.h"

class QXCORE_API SOleDateTime {
 public:
  // Whether the value is a date.
  enum Status : int { kValid = 0, kInvalid = 1 };

  // --- construction and assignment: as the operators and SetDateTime do ---
  SOleDateTime() = default;  // 30 December 1899 00:00, valid
  explicit SOleDateTime(double days) { *this = days; }
  explicit SOleDateTime(STime time) { *this = time; }
  explicit SOleDateTime(const SYSTEMTIME& time) { *this = time; }
  explicit SOleDateTime(const FILETIME& time) { *this = time; }
  SOleDateTime(int year, int month, int day, int hour, int minute, int second) {
    SetDateTime(year, month, day, hour, minute, second);
  }

  // A value outside the valid years, and one that is no number, is taken but invalid. What the others cannot
  // convert makes the object invalid and leaves the value.
  SOleDateTime& operator=(double days);
  // Seconds since 1970, in local time.
  SOleDateTime& operator=(long time);
  SOleDateTime& operator=(int time) { return *this = static_cast<long>(time); }
  SOleDateTime& operator=(STime time) { return *this = static_cast<long>(time.GetTime()); }
  // Milliseconds are dropped, the day of the week is not looked at.
  SOleDateTime& operator=(const SYSTEMTIME& time);
  // In local time, by the difference to UTC that is in force today (see STime).
  SOleDateTime& operator=(const FILETIME& time);

  // The new status: kInvalid when the fields are no date of the valid years and no time from 0:00:00 to
  // 23:59:59; the value stays then. SetDate sets 00:00, SetTime 30 December 1899.
  int SetDate(int year, int month, int day) { return SetDateTime(year, month, day, 0, 0, 0); }
  int SetTime(int hour, int minute, int second) { return SetDateTime(1899, 12, 30, hour, minute, second); }
  int SetDateTime(int year, int month, int day, int hour, int minute, int second);

  double GetValue() const { return m_value; }
  int GetStatus() const { return m_status; }

  // --- fields; -1 when the object is invalid ---
  int GetYear() const;
  int GetMonth() const;      // 1 to 12
  int GetDay() const;        // 1 to 31
  int GetHour() const;       // 0 to 23
  int GetMinute() const;     // 0 to 59
  int GetSecond() const;     // 0 to 59
  int GetDayOfWeek() const;  // 0 Sunday to 6 Saturday
  int GetDayOfYear() const;  // 1 to 366

  // All fields, milliseconds 0. 1, or 0 when the object is invalid; the record is as it was then.
  int GetAsSystemTime(SYSTEMTIME& time) const;
  // Seconds since 1970 of this date and time as local time; -1 when it is invalid or the runtime cannot
  // convert it. It is read as standard time, and when daylight saving turns out to be in force an hour is
  // taken off, unless the result is 3600 or less, on purpose.
  std::int32_t GetTime() const;

  // --- order ---
  // Equal are the same values with the same status; so the two ways to write a time of the day 0 differ.
  friend bool operator==(const SOleDateTime& a, const SOleDateTime& b) {
    return a.m_value == b.m_value && a.m_status == b.m_status;
  }
  // By time, whatever the status: -1.25 comes after -1.0.
  friend bool operator<(const SOleDateTime& a, const SOleDateTime& b) { return a.Linear() < b.Linear(); }
  friend bool operator>(const SOleDateTime& a, const SOleDateTime& b) { return b < a; }
  friend bool operator<=(const SOleDateTime& a, const SOleDateTime& b) { return a.Linear() <= b.Linear(); }
  friend bool operator>=(const SOleDateTime& a, const SOleDateTime& b) { return b <= a; }

  // --- texts in the style of the user's locale; empty when invalid, dates also before 1601 ---
  SString GetShortDateString() const;
  SString GetLongDateString() const;
  SString GetTimeStr() const;
  SString GetShortDateTimeString() const;  // short date, a space, time; the space also where a part is empty
  SString GetLongDateTimeString() const;   // long date, a space, time

 private:
  double Linear() const;

  double m_value = 0;
  int m_status = kValid;
};

static_assert(sizeof(SOleDateTime) == 16, "the value, then the status");
