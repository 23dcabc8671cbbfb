// Formatting with the conventions of the Microsoft runtime; the digits of floating-point numbers are
// the C library's, their rounding and exponents are brought into the other form.

#include <cfenv>
#include <climits>
#include <cmath>
#include <cstring>
#include <string>

#include "qxcore/platform/posix/failure.h"
#include "qxcore/platform/wide.h"

namespace platform {
namespace {

// Takes characters up to a capacity and counts them all.
class Sink {
 public:
  Sink(WCHAR* buffer, std::size_t capacity) : m_buffer(buffer), m_capacity(capacity) {}

  void Put(WCHAR c) {
    if (m_count < m_capacity) m_buffer[m_count] = c;
    ++m_count;
  }
  void Repeat(WCHAR c, std::size_t times) {
    const std::size_t room = m_count < m_capacity ? m_capacity - m_count : 0;
    for (std::size_t i = 0; i < times && i < room; ++i) m_buffer[m_count + i] = c;
    m_count += times;
  }
  template <class Char>
  void Text(const Char* text, std::size_t length) {
    for (std::size_t i = 0; i < length; ++i) Put(static_cast<WCHAR>(text[i]));
  }
  std::size_t Count() const { return m_count; }

 private:
  WCHAR* m_buffer;
  std::size_t m_capacity;
  std::size_t m_count = 0;
};

enum class Size { kPlain, kHalf, kLong, kLongLong, kPointer };

struct Conversion {
  bool left = false, plus = false, blank = false, zero = false, alternate = false;
  int width = 0;
  int precision = -1;
  Size size = Size::kPlain;
  WCHAR letter = 0;
};

// Prefix (sign, 0x), zeros, digits: padded to the width.
void PutNumber(Sink& sink, const Conversion& to, const char* prefix, const char* digits, std::size_t length,
               bool zeroPad) {
  const std::size_t prefixLength = std::strlen(prefix);
  const std::size_t used = prefixLength + length;
  const std::size_t width = static_cast<std::size_t>(to.width);
  const std::size_t padding = width > used ? width - used : 0;
  if (!to.left && !zeroPad) sink.Repeat(' ', padding);
  sink.Text(prefix, prefixLength);
  if (!to.left && zeroPad) sink.Repeat('0', padding);
  sink.Text(digits, length);
  if (to.left) sink.Repeat(' ', padding);
}

void PutInteger(Sink& sink, const Conversion& to, std::uint64_t magnitude, bool negative, bool isSigned) {
  const unsigned base = to.letter == 'o' ? 8 : to.letter == 'x' || to.letter == 'X' || to.letter == 'p' ? 16 : 10;
  const char* alphabet = to.letter == 'x' ? "0123456789abcdef" : "0123456789ABCDEF";
  char reversed[24];
  std::size_t length = 0;
  for (std::uint64_t rest = magnitude; rest != 0; rest /= base) reversed[length++] = alphabet[rest % base];
  std::size_t wanted = to.precision < 0 ? 1 : static_cast<std::size_t>(to.precision);
  const char* prefix = "";
  if (isSigned) prefix = negative ? "-" : to.plus ? "+" : to.blank ? " " : "";
  if (to.alternate && base == 16 && (magnitude != 0 || to.letter == 'p')) prefix = to.letter == 'x' ? "0x" : "0X";
  if (to.alternate && base == 8 && wanted <= length) wanted = length + 1;
  std::string digits(wanted > length ? wanted - length : 0, '0');
  while (length > 0) digits += reversed[--length];
  // With a precision the flag 0 is ignored.
  PutNumber(sink, to, prefix, digits.data(), digits.size(), to.zero && to.precision < 0);
}

std::string Print(const char* format, int precision, double value) {
  std::string text(64, '\0');
  for (;;) {
    const int length = std::snprintf(text.data(), text.size(), format, precision, value);
    if (length < 0) return std::string();
    if (static_cast<std::size_t>(length) < text.size()) {
      text.resize(static_cast<std::size_t>(length));
      return text;
    }
    text.resize(static_cast<std::size_t>(length) + 1);
  }
}

// True when the value stands exactly between two numbers of `precision` digits (behind the point for
// "f", significant ones less one for "e"). Thirty more digits settle it for every double.
bool IsTie(char style, int precision, double value) {
  if (precision > 60) return false;
  std::string text = Print(style == 'f' ? "%.*f" : "%.*e", precision + 30, value);
  const std::size_t exponent = text.find('e');
  if (exponent != std::string::npos) text.resize(exponent);
  const std::size_t from = text.size() - 30;
  return text[from] == '5' && text.find_first_not_of('0', from + 1) == std::string::npos;
}

// The C library rounds a tie to even, the Microsoft runtime away from zero.
std::string PrintRounded(const char* format, char style, int precision, double magnitude) {
  const bool tie = style == 'g' ? IsTie('e', precision - 1, magnitude) : IsTie(style, precision, magnitude);
  if (!tie) return Print(format, precision, magnitude);
  const int mode = std::fegetround();
  std::fesetround(FE_UPWARD);
  std::string text = Print(format, precision, magnitude);
  std::fesetround(mode);
  return text;
}

void WidenExponent(std::string& text) {
  const std::size_t at = text.find_first_of("eE");
  if (at == std::string::npos) return;
  const std::size_t digits = text.size() - at - 2;
  if (digits < 3) text.insert(at + 2, 3 - digits, '0');
}

std::string NotANumber(double value, int precision, char style) {
  std::string text = std::isinf(value) ? "1.#INF" : std::signbit(value) ? "1.#IND" : "1.#QNAN";
  const std::size_t wanted = 2 + static_cast<std::size_t>(precision);
  if (style != 'g' && text.size() < wanted) text.append(wanted - text.size(), '0');
  if (style == 'e') text += "e+000";
  if (style == 'a') text = "0x" + text + "p+0";
  return text;
}

void PutDouble(Sink& sink, const Conversion& to, double value) {
  const bool upper = to.letter >= 'A' && to.letter <= 'Z';
  const char style = static_cast<char>(upper ? to.letter + 32 : to.letter);
  int precision = to.precision < 0 ? (style == 'a' ? 13 : 6) : to.precision;
  if (style == 'g' && precision == 0) precision = 1;
  std::string text;
  if (!std::isfinite(value)) {
    text = NotANumber(value, precision, style);
  } else {
    char format[8] = {'%', '.', '*', style, 0, 0};
    if (to.alternate) std::strcpy(format, (std::string("%#.*") + style).c_str());
    text = style == 'a' ? Print(format, precision, std::fabs(value))
                        : PrintRounded(format, style, precision, std::fabs(value));
    if (style != 'a') WidenExponent(text);
  }
  std::string prefix = std::signbit(value) ? "-" : to.plus ? "+" : to.blank ? " " : "";
  if (style == 'a') {
    prefix += "0x";
    text.erase(0, 2);
  }
  if (upper) {
    for (std::string* part : {&prefix, &text})
      for (char& c : *part)
        if (c >= 'a' && c <= 'z') c = static_cast<char>(c - 32);
  }
  PutNumber(sink, to, prefix.c_str(), text.data(), text.size(), to.zero);
}

template <class Char>
std::size_t BoundedLength(const Char* text, int precision) {
  std::size_t length = 0;
  while ((precision < 0 || length < static_cast<std::size_t>(precision)) && text[length] != 0) ++length;
  return length;
}

void PutText(Sink& sink, const Conversion& to, const WCHAR* text, std::size_t length) {
  const std::size_t width = static_cast<std::size_t>(to.width);
  const std::size_t padding = width > length ? width - length : 0;
  if (!to.left) sink.Repeat(to.zero ? '0' : ' ', padding);
  sink.Text(text, length);
  if (to.left) sink.Repeat(' ', padding);
}

void PutNarrow(Sink& sink, const Conversion& to, const char* text, std::size_t length) {
  std::u16string wide(length, u'\0');
  if (length > 0) {
    const int count =
        MultiByteToWideChar(CP_ACP, 0, text, static_cast<int>(length), wide.data(), static_cast<int>(length));
    wide.resize(count > 0 ? static_cast<std::size_t>(count) : 0);
  }
  PutText(sink, to, wide.data(), wide.size());
}

// %s and %S with their sizes: is the argument narrow?
bool IsNarrow(const Conversion& to) {
  if (to.size == Size::kHalf) return true;
  if (to.size == Size::kLong) return false;
  return to.letter == 'S' || to.letter == 'C';
}

class Reader {
 public:
  explicit Reader(const WCHAR* at) : m_at(at) {}

  WCHAR Peek() const { return *m_at; }
  WCHAR Next() { return *m_at == 0 ? u'\0' : *m_at++; }

  // Digits, clipped so that no width overflows.
  int Number() {
    int value = 0;
    while (*m_at >= '0' && *m_at <= '9') {
      if (value < 100'000'000) value = value * 10 + (*m_at - '0');
      ++m_at;
    }
    return value;
  }

  void Flags(Conversion& to) {
    for (;; ++m_at) {
      switch (*m_at) {
        case '-':
          to.left = true;
          break;
        case '+':
          to.plus = true;
          break;
        case ' ':
          to.blank = true;
          break;
        case '0':
          to.zero = true;
          break;
        case '#':
          to.alternate = true;
          break;
        default:
          return;
      }
    }
  }

  void SizePrefix(Conversion& to) {
    for (;;) {
      if (m_at[0] == 'I' && m_at[1] == '6' && m_at[2] == '4') {
        to.size = Size::kLongLong, m_at += 3;
      } else if (m_at[0] == 'I' && m_at[1] == '3' && m_at[2] == '2') {
        to.size = Size::kPlain, m_at += 3;
      } else if (*m_at == 'l' && m_at[1] == 'l') {
        to.size = Size::kLongLong, m_at += 2;
      } else if (*m_at == 'I' || *m_at == 'z' || *m_at == 't') {
        to.size = Size::kPointer, ++m_at;
      } else if (*m_at == 'h') {
        to.size = Size::kHalf, ++m_at;
      } else if (*m_at == 'l' || *m_at == 'w') {
        to.size = Size::kLong, ++m_at;
      } else if (*m_at == 'j') {
        to.size = Size::kLongLong, ++m_at;
      } else if (*m_at == 'L') {
        ++m_at;
      } else {
        return;
      }
    }
  }

 private:
  const WCHAR* m_at;
};

// A va_list that can be handed down by reference on every machine.
struct Arguments {
  std::va_list list;
};

std::int64_t SignedArgument(Arguments& from, Size size) {
  switch (size) {
    case Size::kHalf:
      return static_cast<short>(va_arg(from.list, int));
    case Size::kLong:
      return va_arg(from.list, long);
    case Size::kLongLong:
      return va_arg(from.list, long long);
    case Size::kPointer:
      return va_arg(from.list, std::ptrdiff_t);
    default:
      return va_arg(from.list, int);
  }
}

std::uint64_t UnsignedArgument(Arguments& from, Size size) {
  switch (size) {
    case Size::kHalf:
      return static_cast<unsigned short>(va_arg(from.list, unsigned int));
    case Size::kLong:
      return va_arg(from.list, unsigned long);
    case Size::kLongLong:
      return va_arg(from.list, unsigned long long);
    case Size::kPointer:
      return va_arg(from.list, std::size_t);
    default:
      return va_arg(from.list, unsigned int);
  }
}

void PutString(Sink& sink, const Conversion& to, Arguments& from) {
  if (IsNarrow(to)) {
    const char* text = va_arg(from.list, const char*);
    if (text == nullptr) text = "(null)";
    PutNarrow(sink, to, text, BoundedLength(text, to.precision));
  } else {
    const WCHAR* text = va_arg(from.list, const WCHAR*);
    if (text == nullptr) text = u"(null)";
    PutText(sink, to, text, BoundedLength(text, to.precision));
  }
}

void PutCharacter(Sink& sink, const Conversion& to, Arguments& from) {
  const int value = va_arg(from.list, int);
  if (IsNarrow(to)) {
    const char narrow = static_cast<char>(value);
    PutNarrow(sink, to, &narrow, 1);
  } else {
    const WCHAR wide = static_cast<WCHAR>(value);
    PutText(sink, to, &wide, 1);
  }
}

// False for what no conversion is.
bool PutConversion(Sink& sink, Conversion& to, Arguments& from) {
  switch (to.letter) {
    case 'd':
    case 'i': {
      const std::int64_t value = SignedArgument(from, to.size);
      const std::uint64_t bits = static_cast<std::uint64_t>(value);
      PutInteger(sink, to, value < 0 ? 0 - bits : bits, value < 0, true);
      return true;
    }
    case 'u':
    case 'o':
    case 'x':
    case 'X':
      PutInteger(sink, to, UnsignedArgument(from, to.size), false, false);
      return true;
    case 'p':
      to.precision = 2 * sizeof(void*);
      PutInteger(sink, to, reinterpret_cast<std::uintptr_t>(va_arg(from.list, void*)), false, false);
      return true;
    case 'e':
    case 'E':
    case 'f':
    case 'F':
    case 'g':
    case 'G':
    case 'a':
    case 'A':
      PutDouble(sink, to, va_arg(from.list, double));
      return true;
    case 's':
    case 'S':
      PutString(sink, to, from);
      return true;
    case 'c':
    case 'C':
      PutCharacter(sink, to, from);
      return true;
    case 'n':
      return false;
    default:
      sink.Put(to.letter);
      return true;  // "%%", and any other letter stands for itself
  }
}

bool FormatTo(Sink& sink, const WCHAR* format, Arguments& from) {
  Reader reader(format);
  while (reader.Peek() != 0) {
    const WCHAR c = reader.Next();
    if (c != '%') {
      sink.Put(c);
      continue;
    }
    Conversion to;
    reader.Flags(to);
    if (reader.Peek() == '*') {
      reader.Next();
      const int width = va_arg(from.list, int);
      to.left = to.left || width < 0;
      to.width = width == INT_MIN ? 0 : width < 0 ? -width : width;
    } else {
      to.width = reader.Number();
    }
    if (reader.Peek() == '.') {
      reader.Next();
      if (reader.Peek() == '*') {
        reader.Next();
        const int precision = va_arg(from.list, int);
        to.precision = precision < 0 ? -1 : precision;
      } else {
        to.precision = reader.Number();
      }
    }
    reader.SizePrefix(to);
    to.letter = reader.Next();
    if (to.letter == 0) return true;  // an unfinished conversion prints nothing
    if (!PutConversion(sink, to, from)) return false;
    if (sink.Count() > INT_MAX) return false;
  }
  return true;
}

int FormatAll(Sink& sink, const WCHAR* format, std::va_list arguments) {
  Arguments from;
  va_copy(from.list, arguments);
  const bool good = Guarded(false, [&] { return FormatTo(sink, format, from); });  // a precision in the millions
  va_end(from.list);
  return good && sink.Count() <= INT_MAX ? static_cast<int>(sink.Count()) : -1;
}

}  // namespace

int WideFormatV(WCHAR* buffer, std::size_t capacity, const WCHAR* format, std::va_list arguments) {
  if (capacity == 0) return -1;
  Sink sink(buffer, capacity - 1);
  const int length = FormatAll(sink, format, arguments);
  const bool fits = length >= 0 && static_cast<std::size_t>(length) < capacity;
  buffer[fits ? static_cast<std::size_t>(length) : sink.Count() < capacity ? sink.Count() : capacity - 1] = 0;
  return fits ? length : -1;
}

int WideFormatLengthV(const WCHAR* format, std::va_list arguments) {
  Sink sink(nullptr, 0);
  return FormatAll(sink, format, arguments);
}

}  // namespace platform
