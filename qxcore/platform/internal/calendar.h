// The runtime's calendar: seconds since 1970 broken down into a calendar record and back, and the record
// as text.
//
// Times are 32-bit, 13 December 1901 to 19 January 2038, whatever the runtime's own time_t is. Zone and
// daylight saving come from the runtime: of the TZ variable or the system's settings. On Windows the
// runtime breaks down no time before 1970 and applies one rule for daylight saving to all years; on
// Linux both follow the zone's history. The runtime looks at TZ again when the program calls tzset.
#pragma once

#include <cstddef>
#include <cstdint>
#include <ctime>

#include "qxcore/platform/win32.h"

namespace platform {

// The time in local time or UTC; false when the runtime cannot break it down.
bool BreakDownLocal(std::int32_t time, std::tm& fields);
bool BreakDownUtc(std::int32_t time, std::tm& fields);

// The time of a record in local time (mktime): fields out of range carry over into the next, and the
// record is normalised. tm_isdst says whether daylight saving applies; negative: whatever is in force then.
// False, and a time of -1, when it is out of range.
bool LocalToTime(std::tm& fields, std::int32_t& time);

// strftime: at most capacity - 1 characters and the terminator. Returns their number; 0 when they do not
// fit, for an unknown code and for an empty result, and the buffer holds an empty text then.
//
// On both targets: %a %A %b %B %c %d %H %I %j %m %M %p %S %U %w %W %x %X %y %Y %Z %%, and the mark # behind
// the percent sign (without leading zeros; %#c and %#x the long forms). On Linux the codes of C99 besides:
// %C %D %e %F %g %G %h %n %r %R %t %T %u %V %z. Names follow the runtime's LC_TIME locale.
std::size_t FormatCalendar(WCHAR* buffer, std::size_t capacity, const WCHAR* format, const std::tm& fields);

}  // namespace platform
