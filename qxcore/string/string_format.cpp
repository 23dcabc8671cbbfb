// printf-like formatting: first the bound of the output is computed from the format and its
// arguments, then the runtime formats into a buffer of that size.

#include <algorithm>

#include "qxcore/core/module_state.h"
#include "qxcore/platform/wide.h"
#include "qxcore/string/string.h"

namespace {

enum class Size { kNone, kShort, kLong, kLongLong, kPointerWide };

// One conversion of a format, its argument not yet taken.
struct Conversion {
  int extra = 0;  // for '#'
  int width = 0;
  int precision = -1;
  Size size = Size::kNone;
  WCHAR type = 0;
};

// Adds up what each conversion can put out.
class BoundFinder {
 public:
  BoundFinder(const WCHAR* format, std::va_list arguments) : m_at(format) { va_copy(m_arguments, arguments); }
  ~BoundFinder() { va_end(m_arguments); }
  BoundFinder(const BoundFinder&) = delete;
  BoundFinder& operator=(const BoundFinder&) = delete;

  long long Find() {
    long long bound = 0;
    while (*m_at != 0) {
      if (*m_at++ != WTEXT('%')) {
        ++bound;
      } else if (*m_at == WTEXT('%')) {
        ++m_at;
        ++bound;
      } else if (*m_at != 0) {
        Conversion conversion = ReadConversion();
        long long allowance = Allowance(conversion);
        bound += std::max<long long>({allowance, conversion.width, conversion.precision}) + conversion.extra;
      }
    }
    return bound;
  }

 private:
  Conversion ReadConversion() {
    Conversion conversion;
    for (;; ++m_at) {
      if (*m_at == WTEXT('#')) {
        conversion.extra = 2;
      } else if (*m_at != WTEXT('-') && *m_at != WTEXT('+') && *m_at != WTEXT('0') && *m_at != WTEXT(' ')) {
        break;
      }
    }
    conversion.width = ReadCount();
    if (conversion.width < 0) conversion.width = conversion.width == kLeast ? kMost : -conversion.width;
    if (*m_at == WTEXT('.')) {
      ++m_at;
      conversion.precision = ReadCount();
    }
    ReadSize(conversion);
    conversion.type = *m_at;
    if (*m_at != 0) ++m_at;
    return conversion;
  }

  int ReadCount() {
    if (*m_at == WTEXT('*')) {
      ++m_at;
      return va_arg(m_arguments, int);
    }
    long long count = 0;
    for (; *m_at >= WTEXT('0') && *m_at <= WTEXT('9'); ++m_at) {
      count = std::min<long long>(count * 10 + (*m_at - WTEXT('0')), kMost);
    }
    return static_cast<int>(count);
  }

  void ReadSize(Conversion& conversion) {
    if (SStringView(m_at).starts_with(WTEXT("I64"))) {
      conversion.size = Size::kLongLong;
      m_at += 3;
    } else if (SStringView(m_at).starts_with(WTEXT("I32"))) {
      m_at += 3;
    } else {
      for (;; ++m_at) {
        switch (*m_at) {
          case WTEXT('h'):
            conversion.size = Size::kShort;
            continue;
          case WTEXT('l'):
            conversion.size = conversion.size == Size::kLong ? Size::kLongLong : Size::kLong;
            continue;
          case WTEXT('w'):
            conversion.size = Size::kLong;
            continue;
          case WTEXT('I'):
          case WTEXT('z'):
          case WTEXT('t'):
          case WTEXT('j'):
            conversion.size = *m_at == WTEXT('j') ? Size::kLongLong : Size::kPointerWide;
            continue;
          case WTEXT('L'):
          case WTEXT('F'):
          case WTEXT('N'):
            continue;
          default:
            return;
        }
      }
    }
  }

  long long Allowance(const Conversion& conversion) {
    constexpr int kInteger = 32;
    constexpr int kFloating = 128;
    switch (conversion.type) {
      case WTEXT('s'):
      case WTEXT('S'):
        return TextLength(conversion);
      case WTEXT('e'):
      case WTEXT('E'):
      case WTEXT('f'):
      case WTEXT('g'):
      case WTEXT('G'):
      case WTEXT('a'):
      case WTEXT('A'): {
        static_cast<void>(va_arg(m_arguments, double));
        // The precision counts behind the point; what stands in front of it comes on top.
        return kFloating + std::max(conversion.precision, 0);
      }
      case WTEXT('p'):
      case WTEXT('n'):
        static_cast<void>(va_arg(m_arguments, void*));
        return kInteger;
      case WTEXT('c'):
      case WTEXT('C'):
        static_cast<void>(va_arg(m_arguments, int));
        return kInteger;
      case WTEXT('d'):
      case WTEXT('i'):
      case WTEXT('u'):
      case WTEXT('o'):
      case WTEXT('x'):
      case WTEXT('X'):
        TakeInteger(conversion.size);
        return kInteger;
      default:
        return 1;
    }
  }

  void TakeInteger(Size size) {
    switch (size) {
      case Size::kLong:
        static_cast<void>(va_arg(m_arguments, long));
        break;
      case Size::kLongLong:
        static_cast<void>(va_arg(m_arguments, long long));
        break;
      case Size::kPointerWide:
        static_cast<void>(va_arg(m_arguments, std::size_t));
        break;
      default:
        static_cast<void>(va_arg(m_arguments, int));
    }
  }

  // A precision bounds what is read: the text need not be terminated behind it.
  long long TextLength(const Conversion& conversion) {
    constexpr int kNullText = 6;  // "(null)"
    const void* text = va_arg(m_arguments, const void*);
    if (text == nullptr) return kNullText;
    bool isWide = conversion.size == Size::kLong || (conversion.size == Size::kNone && conversion.type == WTEXT('s'));
    return isWide ? Measure(static_cast<const WCHAR*>(text), conversion.precision)
                  : Measure(static_cast<const char*>(text), conversion.precision);
  }

  template <class Character>
  static long long Measure(const Character* text, int limit) {
    long long length = 0;
    while ((limit < 0 || length < limit) && text[length] != 0) ++length;
    return length;
  }

  static constexpr int kMost = 0x7FFFFFFF;
  static constexpr int kLeast = -kMost - 1;

  const WCHAR* m_at;
  std::va_list m_arguments;
};

int FormatInto(WCHAR* buffer, int capacity, const WCHAR* format, std::va_list arguments) {
  std::va_list copy;
  va_copy(copy, arguments);
  int written = platform::WideFormatV(buffer, static_cast<std::size_t>(capacity), format, copy);
  va_end(copy);
  return written;
}

}  // namespace

void SString::FormatV(const WCHAR* format, std::va_list arguments) {
  if (format == nullptr || *format == 0) {
    AssignActual(0, nullptr);
    return;
  }
  constexpr long long kOnStack = 512;
  constexpr long long kLongest = 0x3FFFFE00;
  long long bound = BoundFinder(format, arguments).Find() + 1;
  // Formatted apart from this string's buffer, in which an argument may lie. The bound is no promise
  // (a large double takes more than its allowance): what does not fit is tried again with more room.
  if (bound <= kOnStack) {
    WCHAR text[kOnStack];
    int written = FormatInto(text, kOnStack, format, arguments);
    if (written >= 0 && written < kOnStack) {
      AssignActual(written, text);
      return;
    }
    bound = kOnStack * 2;
  }
  for (; bound <= kLongest; bound *= 2) {
    SString formatted;
    int capacity = static_cast<int>(bound);
    int written = FormatInto(formatted.LockTchar(capacity), capacity, format, arguments);
    if (written >= 0 && written < capacity) {
      formatted.Unlock(written);
      Data()->Refs() == SStringData::kLocked ? AssignActual(written, formatted) : Swap(formatted);
      return;
    }
    constexpr long long kHopeless = 1 << 20;  // beyond what a conversion can exceed its allowance by
    if (bound > kHopeless && bound > 4 * static_cast<long long>(SStringView(format).size())) break;
  }
  AssignActual(0, nullptr);
}

void SString::Format(const WCHAR* format, ...) {
  std::va_list arguments;
  va_start(arguments, format);
  FormatV(format, arguments);
  va_end(arguments);
}

void SString::Format(unsigned int id, ...) {
  SString format;
  format.LoadStringW(id);
  std::va_list arguments;
  va_start(arguments, id);
  FormatV(format, arguments);
  va_end(arguments);
}
