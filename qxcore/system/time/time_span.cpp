#include "qxcore/system/time/time_span.h"

#include "qxcore/platform/wide.h"

namespace {

constexpr int kLongestText = 128;

// Appends one code's number; returns the new length.
int AppendNumber(WCHAR* text, int length, const WCHAR* format, long number) {
  WCHAR digits[16];
  const int count = platform::WideFormat(digits, 16, format, number);
  for (int i = 0; i < count && length < kLongestText; ++i) text[length++] = digits[i];
  return length;
}

}  // namespace

SString STimeSpan::Format(const WCHAR* format) const {
  WCHAR text[kLongestText];
  int length = 0;
  if (format == nullptr) format = WTEXT("");
  for (; *format != 0 && length < kLongestText; ++format) {
    if (*format != '%' || format[1] == 0) {
      text[length++] = *format;
      continue;
    }
    switch (*++format) {
      case 'D':
        length = AppendNumber(text, length, WTEXT("%ld"), GetDays());
        break;
      case 'H':
        length = AppendNumber(text, length, WTEXT("%02ld"), GetHours());
        break;
      case 'M':
        length = AppendNumber(text, length, WTEXT("%02ld"), GetMinutes());
        break;
      case 'S':
        length = AppendNumber(text, length, WTEXT("%02ld"), GetSeconds());
        break;
      default:
        text[length++] = *format;
    }
  }
  return SString(SStringView(text, static_cast<std::size_t>(length)));
}

SString STimeSpan::Format(unsigned int id) const {
  SString format;
  format.LoadStringW(id);
  return Format(format);
}
