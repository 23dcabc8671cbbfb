#include "tools/qxtool/file_time.h"

#include "qxcore/system/time/time.h"

TimeTexts::TimeTexts(const FILETIME& time) {
  SYSTEMTIME fields;
  if (!FileTimeToSystemTime(&time, &fields)) return;
  std::tm gmt = {};
  gmt.tm_year = fields.wYear - 1900;
  gmt.tm_mon = fields.wMonth - 1;
  gmt.tm_mday = fields.wDay;
  gmt.tm_hour = fields.wHour;
  gmt.tm_min = fields.wMinute;
  gmt.tm_sec = fields.wSecond;
  STime seconds;
  if (!seconds.SetGmtTm(&gmt)) return;
  local = seconds.Format(WTEXT("%Y-%m-%d %H:%M:%S"));
  utc = seconds.FormatGmt(WTEXT("%Y-%m-%dT%H:%M:%SZ"));
}
