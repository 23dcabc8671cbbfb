// Comparison by the runtime's locale, with ICU's collation.

#include <unicode/ucol.h>

#include <clocale>
#include <cstring>
#include <string>

#include "qxcore/platform/wide.h"

namespace platform {
namespace {

// One collator a thread, made anew when the runtime's locale changes.
class Collator {
 public:
  ~Collator() { ucol_close(m_collator); }

  // Null in the "C" locale and where ICU cannot serve.
  static UCollator* ForCurrentLocale() {
    const char* locale = std::setlocale(LC_COLLATE, nullptr);
    if (locale == nullptr || std::strcmp(locale, "C") == 0 || std::strcmp(locale, "POSIX") == 0 ||
        std::strncmp(locale, "C.", 2) == 0)
      return nullptr;
    thread_local Collator current;
    if (current.m_locale != locale) current.Open(locale);
    return current.m_collator;
  }

 private:
  void Open(const char* locale) {
    ucol_close(m_collator);
    m_locale = locale;
    UErrorCode error = U_ZERO_ERROR;
    m_collator = ucol_open(m_locale.substr(0, m_locale.find('.')).c_str(), &error);
    if (U_FAILURE(error)) m_collator = nullptr;
  }

  UCollator* m_collator = nullptr;
  std::string m_locale;
};

int CompareWith(UCollator* collator, UCollationStrength strength, const WCHAR* a, std::size_t lengthA, const WCHAR* b,
                std::size_t lengthB) {
  ucol_setStrength(collator, strength);
  return ucol_strcoll(collator, a, static_cast<std::int32_t>(lengthA), b, static_cast<std::int32_t>(lengthB));
}

}  // namespace

int WideCollate(const WCHAR* a, const WCHAR* b) {
  UCollator* collator = Collator::ForCurrentLocale();
  return collator == nullptr ? WideCompare(a, b)
                             : CompareWith(collator, UCOL_TERTIARY, a, WideLength(a), b, WideLength(b));
}

int WideCollate(const WCHAR* a, const WCHAR* b, std::size_t count) {
  UCollator* collator = Collator::ForCurrentLocale();
  return collator == nullptr ? WideCompare(a, b, count)
                             : CompareWith(collator, UCOL_TERTIARY, a, WideLength(a, count), b, WideLength(b, count));
}

int WideCollateNoCase(const WCHAR* a, const WCHAR* b) {
  UCollator* collator = Collator::ForCurrentLocale();
  return collator == nullptr ? WideCompareNoCase(a, b)
                             : CompareWith(collator, UCOL_SECONDARY, a, WideLength(a), b, WideLength(b));
}

int WideCollateNoCase(const WCHAR* a, const WCHAR* b, std::size_t count) {
  UCollator* collator = Collator::ForCurrentLocale();
  return collator == nullptr ? WideCompareNoCase(a, b, count)
                             : CompareWith(collator, UCOL_SECONDARY, a, WideLength(a, count), b, WideLength(b, count));
}

}  // namespace platform
