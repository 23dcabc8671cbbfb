// Dates and times in the styles of the user's locale, by ICU.

#include <unicode/ucal.h>
#include <unicode/udat.h>
#include <unicode/udatpg.h>

#include <algorithm>
#include <cctype>
#include <chrono>
#include <cstdlib>
#include <string>
#include <string_view>

#include "qxcore/platform/posix/path.h"

namespace {

using platform::FailWith;
using platform::Guarded;

enum Style { kShortDate, kLongDate, kTime, kStyleCount };

std::string UserLocale() {
  for (const char* variable : {"LC_ALL", "LC_TIME", "LANG"}) {
    const char* name = std::getenv(variable);
    if (name != nullptr && *name != 0) return name;
  }
  return "C";
}

// Language and region of a locale's name; what is no such name, which not every version of ICU survives, and
// the "C" locale are those of the United States.
std::string LanguageAndRegion(const std::string& name) {
  const std::string base = name.substr(0, name.find_first_of(".@"));
  const std::size_t language = base.find('_');
  const std::string_view region =
      language == std::string::npos ? std::string_view() : std::string_view(base).substr(language + 1);
  const auto isOf = [](std::string_view text, std::size_t least, std::size_t most) {
    return text.size() >= least && text.size() <= most &&
           std::all_of(text.begin(), text.end(), [](unsigned char c) { return std::isalnum(c) != 0 && c < 0x80; });
  };
  const bool isName =
      isOf(std::string_view(base).substr(0, language), 2, 3) && (language == std::string::npos || isOf(region, 2, 3));
  return isName ? base : "en_US";
}

// One set of formatters a thread, made anew when the user's locale changes.
class Formatters {
 public:
  ~Formatters() { Close(); }

  // Null where ICU cannot serve.
  static UDateFormat* For(Style style) {
    thread_local Formatters current;
    std::string locale = UserLocale();
    if (current.m_locale != locale) {
      current.Close();
      current.m_locale = std::move(locale);
    }
    if (current.m_formats[style] == nullptr) current.m_formats[style] = Open(current.m_locale, style);
    return current.m_formats[style];
  }

 private:
  static UDateFormat* Open(const std::string& userLocale, Style style) {
    const std::string locale = LanguageAndRegion(userLocale);
    UErrorCode error = U_ZERO_ERROR;
    if (style != kShortDate) {
      const UDateFormatStyle date = style == kLongDate ? UDAT_FULL : UDAT_NONE;
      const UDateFormatStyle time = style == kTime ? UDAT_MEDIUM : UDAT_NONE;
      return udat_open(time, date, locale.c_str(), u"UTC", 3, nullptr, 0, &error);
    }
    // ICU's own short style has two digits of the year in many locales.
    WCHAR pattern[64];
    UDateTimePatternGenerator* generator = udatpg_open(locale.c_str(), &error);
    const std::int32_t length = udatpg_getBestPattern(generator, u"yMd", 3, pattern, 64, &error);
    udatpg_close(generator);
    return udat_open(UDAT_PATTERN, UDAT_PATTERN, locale.c_str(), u"UTC", 3, pattern, length, &error);
  }

  void Close() {
    for (UDateFormat*& format : m_formats) {
      udat_close(format);
      format = nullptr;
    }
  }

  std::string m_locale;
  UDateFormat* m_formats[kStyleCount] = {};
};

// The text with its terminator; its length alone when the capacity is 0.
int Format(Style style, UDate milliseconds, LPWSTR text, int capacity) {
  UDateFormat* format = Formatters::For(style);
  if (format == nullptr) return FailWith<int>(ERROR_OUTOFMEMORY);
  WCHAR buffer[256];
  UErrorCode error = U_ZERO_ERROR;
  const int length = udat_format(format, milliseconds, buffer, 256, nullptr, &error);
  if (U_FAILURE(error)) return FailWith<int>(ERROR_INVALID_PARAMETER);
  if (capacity == 0) return length + 1;
  if (capacity <= length) return FailWith<int>(ERROR_INSUFFICIENT_BUFFER);
  // Programs expect the plain space that Windows puts before AM and PM.
  for (int i = 0; i < length; ++i) text[i] = buffer[i] == 0x202F ? u' ' : buffer[i];
  text[length] = 0;
  return length + 1;
}

bool AreFlagsKnown(LCID locale, LPCWSTR picture, int capacity) {
  return locale == LOCALE_USER_DEFAULT && picture == nullptr && capacity >= 0;
}

}  // namespace

int GetDateFormatW(LCID locale, DWORD flags, const SYSTEMTIME* date, LPCWSTR format, LPWSTR text, int capacity) {
  if (!AreFlagsKnown(locale, format, capacity)) return FailWith<int>(ERROR_INVALID_PARAMETER);
  if (flags > DATE_LONGDATE) return FailWith<int>(ERROR_INVALID_FLAGS);
  SYSTEMTIME now, midnight;
  if (date == nullptr) GetLocalTime(&now);
  midnight = date == nullptr ? now : *date;
  midnight.wHour = midnight.wMinute = midnight.wSecond = midnight.wMilliseconds = 0;
  FILETIME check;
  if (!SystemTimeToFileTime(&midnight, &check)) return 0;
  const auto day = std::chrono::sys_days(std::chrono::year(midnight.wYear) / midnight.wMonth / midnight.wDay);
  const double milliseconds = day.time_since_epoch().count() * 86400000.0;
  return Guarded(0,
                 [&] { return Format(flags == DATE_LONGDATE ? kLongDate : kShortDate, milliseconds, text, capacity); });
}

int GetTimeFormatW(LCID locale, DWORD flags, const SYSTEMTIME* time, LPCWSTR format, LPWSTR text, int capacity) {
  if (!AreFlagsKnown(locale, format, capacity)) return FailWith<int>(ERROR_INVALID_PARAMETER);
  if (flags != 0) return FailWith<int>(ERROR_INVALID_FLAGS);
  SYSTEMTIME of;
  if (time == nullptr) GetLocalTime(&of);
  if (time != nullptr) of = *time;
  if (of.wHour > 23 || of.wMinute > 59 || of.wSecond > 59 || of.wMilliseconds > 999)
    return FailWith<int>(ERROR_INVALID_PARAMETER);
  const double milliseconds = ((of.wHour * 60.0 + of.wMinute) * 60 + of.wSecond) * 1000;
  return Guarded(0, [&] { return Format(kTime, milliseconds, text, capacity); });
}
