// Calendar records over the C library's, with its strftime for what depends on a locale or a zone.

#include "qxcore/platform/internal/calendar.h"

#include <langinfo.h>
#include <unicode/ucnv.h>

#include <climits>
#include <clocale>
#include <cstring>
#include <string_view>

#include "qxcore/platform/wide.h"

namespace platform {
namespace {

// Characters up to a capacity; remembers when one did not fit.
class Output {
 public:
  Output(WCHAR* buffer, std::size_t capacity) : m_buffer(buffer), m_capacity(capacity) {}

  void Put(WCHAR c) {
    if (m_length < m_capacity)
      m_buffer[m_length++] = c;
    else
      m_isFull = true;
  }
  void Ascii(const char* text) {
    for (; *text != 0; ++text) Put(static_cast<unsigned char>(*text));
  }
  // `digits` at least, filled up with zeros or blanks.
  void Number(int value, int digits, bool plain, char fill = '0') {
    char text[16];
    int count = 0;
    unsigned rest = value < 0 ? 0u - static_cast<unsigned>(value) : static_cast<unsigned>(value);
    do text[count++] = static_cast<char>('0' + rest % 10);
    while ((rest /= 10) != 0);
    if (value < 0) Put('-');
    for (int i = count; i < digits && !plain; ++i) Put(static_cast<WCHAR>(fill));
    while (count > 0) Put(static_cast<WCHAR>(text[--count]));
  }
  std::size_t Length() const { return m_length; }
  bool IsFull() const { return m_isFull; }

 private:
  WCHAR* m_buffer;
  std::size_t m_capacity;
  std::size_t m_length = 0;
  bool m_isFull = false;
};

// Text in the charset of the runtime's locale.
bool PutLocaleText(Output& out, const char* text) {
  const char* byte = text;
  while (*byte != 0 && static_cast<unsigned char>(*byte) < 0x80) ++byte;
  if (*byte == 0) {
    out.Ascii(text);
    return true;
  }
  UErrorCode error = U_ZERO_ERROR;
  UConverter* converter = ucnv_open(nl_langinfo(CODESET), &error);
  WCHAR wide[512];
  const std::int32_t length = ucnv_toUChars(converter, wide, 512, text, -1, &error);
  ucnv_close(converter);
  if (U_FAILURE(error)) return false;
  for (std::int32_t i = 0; i < length; ++i) out.Put(wide[i]);
  return true;
}

bool PutByRuntime(Output& out, WCHAR code, const std::tm& fields) {
  const char format[] = {'%', static_cast<char>(code), 0};
  char text[512];
  text[0] = 0;
  if (std::strftime(text, sizeof text, format, &fields) == 0) text[0] = 0;  // %p and %Z can be empty
  return PutLocaleText(out, text);
}

bool IsPlainLocale() {
  const std::string_view locale = std::setlocale(LC_TIME, nullptr);
  return locale == "C" || locale == "POSIX" || locale.starts_with("C.");
}

int Hour12(const std::tm& fields) { return fields.tm_hour % 12 == 0 ? 12 : fields.tm_hour % 12; }

// The week of the year, weeks beginning with `firstDay`.
int WeekOfYear(const std::tm& fields, int firstDay) {
  return (fields.tm_yday + 7 - (fields.tm_wday + 7 - firstDay) % 7) / 7;
}

bool PutAll(Output& out, const WCHAR* format, const std::tm& fields);

// One code; `plain` is the mark #. False for an unknown one.
bool PutCode(Output& out, WCHAR code, bool plain, const std::tm& fields) {
  const int year = fields.tm_year > INT_MAX - 1900 ? INT_MAX : fields.tm_year + 1900;
  switch (code) {
    case 'd':
      out.Number(fields.tm_mday, 2, plain);
      return true;
    case 'e':
      out.Number(fields.tm_mday, 2, plain, ' ');
      return true;
    case 'H':
      out.Number(fields.tm_hour, 2, plain);
      return true;
    case 'I':
      out.Number(Hour12(fields), 2, plain);
      return true;
    case 'j':
      out.Number(fields.tm_yday + 1, 3, plain);
      return true;
    case 'm':
      out.Number(fields.tm_mon + 1, 2, plain);
      return true;
    case 'M':
      out.Number(fields.tm_min, 2, plain);
      return true;
    case 'S':
      out.Number(fields.tm_sec, 2, plain);
      return true;
    case 'U':
      out.Number(WeekOfYear(fields, 0), 2, plain);
      return true;
    case 'W':
      out.Number(WeekOfYear(fields, 1), 2, plain);
      return true;
    case 'w':
      out.Number(fields.tm_wday, 1, plain);
      return true;
    case 'u':
      out.Number(fields.tm_wday == 0 ? 7 : fields.tm_wday, 1, plain);
      return true;
    case 'y':
      out.Number(year % 100, 2, plain);
      return true;
    case 'Y':
      out.Number(year, 1, plain);
      return true;
    case 'C':
      out.Number(year / 100, 2, plain);
      return true;
    case 'D':
      return PutAll(out, u"%m/%d/%y", fields);
    case 'F':
      return PutAll(out, u"%Y-%m-%d", fields);
    case 'R':
      return PutAll(out, u"%H:%M", fields);
    case 'T':
      return PutAll(out, u"%H:%M:%S", fields);
    case 'n':
      out.Put('\n');
      return true;
    case 't':
      out.Put('\t');
      return true;
    case '%':
      out.Put('%');
      return true;
    case 'c':
      if (plain) return PutAll(out, u"%A, %B %d, %Y %H:%M:%S", fields);
      // Without a locale the C library and msvcrt have their own ideas; msvcrt's holds.
      return IsPlainLocale() ? PutAll(out, u"%m/%d/%y %H:%M:%S", fields) : PutByRuntime(out, code, fields);
    case 'x':
      if (plain) return PutAll(out, u"%A, %B %d, %Y", fields);
      return PutByRuntime(out, code, fields);
    case 'a':
    case 'A':
    case 'b':
    case 'B':
    case 'g':
    case 'G':
    case 'h':
    case 'p':
    case 'r':
    case 'V':
    case 'X':
    case 'z':
    case 'Z':
      return PutByRuntime(out, code, fields);
    default:
      return false;
  }
}

bool PutAll(Output& out, const WCHAR* format, const std::tm& fields) {
  for (; *format != 0; ++format) {
    if (*format != '%') {
      out.Put(*format);
      continue;
    }
    const bool plain = *++format == '#';
    if (plain) ++format;
    if (*format == 0 || !PutCode(out, *format, plain, fields)) return false;
  }
  return true;
}

bool BreakDown(std::tm* (*with)(const std::time_t*, std::tm*), std::int32_t time, std::tm& fields) {
  const std::time_t value = time;
  std::tm result;
  if (with(&value, &result) == nullptr) return false;
  fields = result;
  return true;
}

}  // namespace

bool BreakDownLocal(std::int32_t time, std::tm& fields) { return BreakDown(localtime_r, time, fields); }

bool BreakDownUtc(std::int32_t time, std::tm& fields) { return BreakDown(gmtime_r, time, fields); }

bool LocalToTime(std::tm& fields, std::int32_t& time) {
  // -1 is a failure unless the day of the week was worked out for it.
  fields.tm_wday = -1;
  const std::time_t value = std::mktime(&fields);
  const bool isTime = (value != -1 || fields.tm_wday >= 0) && value >= INT32_MIN && value <= INT32_MAX;
  time = isTime ? static_cast<std::int32_t>(value) : -1;
  return isTime;
}

std::size_t FormatCalendar(WCHAR* buffer, std::size_t capacity, const WCHAR* format, const std::tm& fields) {
  if (capacity == 0) return 0;
  Output out(buffer, capacity - 1);
  const bool isWhole = PutAll(out, format, fields) && !out.IsFull();
  const std::size_t length = isWhole ? out.Length() : 0;
  buffer[length] = 0;
  return length;
}

}  // namespace platform
