// The time of a file as text.
#pragma once

#include "qxcore/platform/win32.h"
#include "qxcore/string/string.h"

// Both are empty when the time lies outside the range of STime. Each time is shown with the rules for
// daylight-saving time of its own date; STime's conversion of file times takes today's.
struct TimeTexts {
  TimeTexts() = default;
  explicit TimeTexts(const FILETIME& time);

  SString local;  // "2026-11-21 13:05:00"
  SString utc;    // "2026-11-21T13:05:00Z"
};
