#include "qxcore/system/time/internal/locale_time.h"

namespace {

constexpr int kLongestText = 256;  // long dates of all known locales take less than half of it

SString FromCount(const WCHAR* text, int countWithNul) {
  return countWithNul <= 0 ? SString() : SString(SStringView(text, static_cast<std::size_t>(countWithNul) - 1));
}

}  // namespace

SString SLocaleDate(const SYSTEMTIME& date, DWORD style) {
  WCHAR text[kLongestText];
  return FromCount(text, GetDateFormatW(LOCALE_USER_DEFAULT, style, &date, nullptr, text, kLongestText));
}

SString SLocaleTime(const SYSTEMTIME& time) {
  WCHAR text[kLongestText];
  return FromCount(text, GetTimeFormatW(LOCALE_USER_DEFAULT, 0, &time, nullptr, text, kLongestText));
}
