// Dates and times as texts in the style of the user's locale.
#pragma once

#include "qxcore/platform/win32.h"
#include "qxcore/string/string.h"

// The date in the short or long style (DATE_SHORTDATE, DATE_LONGDATE). Empty when the record is no date
// that the platform knows, which are those from 1601 on. The record's day of the week is not looked at.
SString SLocaleDate(const SYSTEMTIME& date, DWORD style);

// The time of day, with seconds. Empty when it is invalid.
SString SLocaleTime(const SYSTEMTIME& time);
