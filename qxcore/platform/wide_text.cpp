// The wide functions that are one code on both targets. They are our own on Windows, too, where they
// differ from the runtime's (lower case) or where the runtime's are no faster.

#include <cerrno>
#include <charconv>
#include <cstring>
#include <limits>
#include <memory>
#include <new>
#include <system_error>

#include "qxcore/platform/wide.h"

namespace platform {
namespace {

using Unit = std::uint16_t;

int Compare(Unit a, Unit b) { return static_cast<int>(a) - static_cast<int>(b); }

bool IsMember(const WCHAR* set, WCHAR c) {
  for (; *set != 0; ++set)
    if (*set == c) return true;
  return false;
}

int DigitValue(WCHAR c) {
  if (c >= '0' && c <= '9') return c - '0';
  if (c >= 'a' && c <= 'z') return c - 'a' + 10;
  if (c >= 'A' && c <= 'Z') return c - 'A' + 10;
  return 99;
}

struct Integer {
  std::uint64_t magnitude = 0;  // stays at its largest once it exceeds 32 bits
  bool negative = false;
  const WCHAR* end;
};

Integer ReadInteger(const WCHAR* text, int base) {
  Integer number;
  number.end = text;
  const WCHAR* at = text;
  while (IsSpace(*at)) ++at;
  if (*at == '-' || *at == '+') number.negative = *at++ == '-';
  const bool hex = at[0] == '0' && (at[1] == 'x' || at[1] == 'X') && DigitValue(at[2]) < 16;
  if (base == 0) base = hex ? 16 : *at == '0' ? 8 : 10;
  if (base == 16 && hex) at += 2;
  for (; DigitValue(*at) < base; number.end = ++at) {
    if (number.magnitude <= 0xFFFFFFFF) number.magnitude = number.magnitude * base + DigitValue(*at);
  }
  return number;
}

// The power of ten of a number's first digit other than 0, clipped; distinguishes too big from too small.
long DecimalMagnitude(const char* at, const char* end) {
  long beforePoint = 0, zerosBehind = 0, exponent = 0;
  bool point = false, significant = false;
  for (; at != end && *at != 'e' && *at != 'E'; ++at) {
    if (*at == '.') {
      point = true;
    } else {
      significant = significant || *at != '0';
      if (!point && significant) ++beforePoint;
      if (point && !significant) ++zerosBehind;
    }
  }
  if (at != end && ++at != end) {
    const bool negative = *at == '-';
    if (*at == '-' || *at == '+') ++at;
    for (; at != end; ++at)
      if (exponent < 100'000'000) exponent = exponent * 10 + (*at - '0');
    if (negative) exponent = -exponent;
  }
  return beforePoint - zerosBehind + exponent;
}

}  // namespace

std::size_t WideLength(const WCHAR* text, std::size_t limit) {
  std::size_t length = 0;
  while (length < limit && text[length] != 0) ++length;
  return length;
}

int WideCompare(const WCHAR* a, const WCHAR* b) {
  while (*a == *b && *a != 0) ++a, ++b;
  return Compare(*a, *b);
}

int WideCompare(const WCHAR* a, const WCHAR* b, std::size_t count) {
  for (; count > 0; --count, ++a, ++b)
    if (*a != *b || *a == 0) return Compare(*a, *b);
  return 0;
}

int WideCompareNoCase(const WCHAR* a, const WCHAR* b) {
  for (;; ++a, ++b) {
    const WCHAR x = ToLowerBmp(*a), y = ToLowerBmp(*b);
    if (x != y || x == 0) return Compare(x, y);
  }
}

int WideCompareNoCase(const WCHAR* a, const WCHAR* b, std::size_t count) {
  for (; count > 0; --count, ++a, ++b) {
    const WCHAR x = ToLowerBmp(*a), y = ToLowerBmp(*b);
    if (x != y || x == 0) return Compare(x, y);
  }
  return 0;
}

const WCHAR* WideFind(const WCHAR* text, WCHAR character) {
  for (;; ++text) {
    if (*text == character) return text;
    if (*text == 0) return nullptr;
  }
}

const WCHAR* WideReverseFind(const WCHAR* text, WCHAR character) {
  for (const WCHAR* at = text + WideLength(text);; --at) {
    if (*at == character) return at;
    if (at == text) return nullptr;
  }
}

const WCHAR* WideFind(const WCHAR* text, const WCHAR* wanted) {
  const SStringView view(text);
  const std::size_t at = view.find(SStringView(wanted));
  return at == SStringView::npos ? nullptr : text + at;
}

std::size_t WideSpan(const WCHAR* text, const WCHAR* set) {
  std::size_t length = 0;
  while (text[length] != 0 && IsMember(set, text[length])) ++length;
  return length;
}

std::size_t WideSpanNot(const WCHAR* text, const WCHAR* set) {
  std::size_t length = 0;
  while (text[length] != 0 && !IsMember(set, text[length])) ++length;
  return length;
}

long WideToLong(const WCHAR* text, const WCHAR** end, int base) {
  const Integer number = ReadInteger(text, base);
  if (end != nullptr) *end = number.end;
  const std::uint64_t limit = number.negative ? 0x80000000u : 0x7FFFFFFFu;
  if (number.magnitude > limit) errno = ERANGE;
  const std::int64_t magnitude = static_cast<std::int64_t>(number.magnitude > limit ? limit : number.magnitude);
  return static_cast<long>(number.negative ? -magnitude : magnitude);
}

unsigned long WideToULong(const WCHAR* text, const WCHAR** end, int base) {
  const Integer number = ReadInteger(text, base);
  if (end != nullptr) *end = number.end;
  if (number.magnitude > 0xFFFFFFFF) {
    errno = ERANGE;
    return 0xFFFFFFFFu;
  }
  const auto magnitude = static_cast<std::uint32_t>(number.magnitude);
  return number.negative ? 0u - magnitude : magnitude;
}

double WideToDouble(const WCHAR* text, const WCHAR** end) {
  if (end != nullptr) *end = text;
  const WCHAR* at = text;
  while (IsSpace(*at)) ++at;
  const bool negative = *at == '-';
  if (*at == '-' || *at == '+') ++at;
  // Find the end of the number; then its ASCII form is read exactly, whatever its length.
  const WCHAR* start = at;
  std::size_t digits = 0;
  while (*at >= '0' && *at <= '9') ++at, ++digits;
  if (*at == '.') {
    ++at;
    while (*at >= '0' && *at <= '9') ++at, ++digits;
  }
  if (digits == 0) return 0.0;
  if (*at == 'e' || *at == 'E') {
    const WCHAR* exponent = at + 1;
    if (*exponent == '-' || *exponent == '+') ++exponent;
    if (*exponent >= '0' && *exponent <= '9') {
      at = exponent;
      while (*at >= '0' && *at <= '9') ++at;
    }
  }
  if (end != nullptr) *end = at;

  const std::size_t length = static_cast<std::size_t>(at - start);
  char local[128];
  std::unique_ptr<char[]> heap;
  char* ascii = local;
  if (length > sizeof local) {
    heap.reset(new (std::nothrow) char[length]);
    if (heap == nullptr) {
      errno = ENOMEM;
      return 0.0;
    }
    ascii = heap.get();
  }
  for (std::size_t i = 0; i < length; ++i) ascii[i] = static_cast<char>(start[i]);
  double value = 0.0;
  const std::from_chars_result read = std::from_chars(ascii, ascii + length, value);
  if (read.ec == std::errc::result_out_of_range) {
    errno = ERANGE;
    value = DecimalMagnitude(ascii, ascii + length) > 0 ? std::numeric_limits<double>::infinity() : 0.0;
  }
  return negative ? -value : value;
}

int WideFormat(WCHAR* buffer, std::size_t capacity, const WCHAR* format, ...) {
  std::va_list arguments;
  va_start(arguments, format);
  const int length = WideFormatV(buffer, capacity, format, arguments);
  va_end(arguments);
  return length;
}

}  // namespace platform
