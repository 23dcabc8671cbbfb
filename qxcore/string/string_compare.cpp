// The comparing members of SString: five orders, four forms each.

#include <algorithm>

#include "qxcore/platform/wide.h"
#include "qxcore/string/natural_compare.h"
#include "qxcore/string/string.h"

namespace {

constexpr int kWhole = -1;

bool Ends(int i, int count) { return count != kWhole && i >= count; }

// The first difference of two terminated texts in an order given by a mapping of characters.
template <class Map>
int CompareMapped(const WCHAR* a, const WCHAR* b, int count, Map map) {
  for (int i = 0; !Ends(i, count); ++i) {
    WCHAR x = map(a[i]);
    WCHAR y = map(b[i]);
    if (x != y) return x < y ? -1 : 1;
    if (a[i] == 0) return 0;
  }
  return 0;
}

struct ByCodeUnit {
  int count = kWhole;
  int operator()(const WCHAR* a, const WCHAR* b) const {
    return CompareMapped(a, b, count, [](WCHAR c) { return c; });
  }
};

struct ByLowerCase {
  int count = kWhole;
  int operator()(const WCHAR* a, const WCHAR* b) const {
    return CompareMapped(a, b, count, [](WCHAR c) { return platform::ToLowerBmp(c); });
  }
};

struct ByLocale {
  int count = kWhole;
  int operator()(const WCHAR* a, const WCHAR* b) const {
    return count == kWhole ? platform::WideCollate(a, b) : platform::WideCollate(a, b, static_cast<std::size_t>(count));
  }
};

struct ByLocaleNoCase {
  int count = kWhole;
  int operator()(const WCHAR* a, const WCHAR* b) const {
    return count == kWhole ? platform::WideCollateNoCase(a, b)
                           : platform::WideCollateNoCase(a, b, static_cast<std::size_t>(count));
  }
};

struct ByNumber {
  int count = kWhole;
  int operator()(const WCHAR* a, const WCHAR* b) const {
    return count == kWhole ? _tcscmpi(a, b) : _tcsncmpi(a, b, count);
  }
};

struct ByNumberNoCase {
  int count = kWhole;
  int operator()(const WCHAR* a, const WCHAR* b) const {
    return count == kWhole ? _tcsicmpi(a, b) : _tcsnicmpi(a, b, count);
  }
};

}  // namespace

template <class Order>
int SString::CompareBy(int start, const WCHAR* text, Order order) const {
  if (text == nullptr) return IsEmpty() ? 0 : 1;
  return order(m_text + start, text);
}

#define QXCORE_FOUR_FORMS(Member, Order)                                                                            \
  int SString::Member(const WCHAR* text) const { return CompareBy(0, text, Order{}); }                              \
  int SString::Member(const WCHAR* text, int count) const { return CompareBy(0, text, Order{std::max(count, 0)}); } \
  int SString::Member(int start, const WCHAR* text) const { return CompareBy(start, text, Order{}); }               \
  int SString::Member(int start, const WCHAR* text, int count) const {                                              \
    return CompareBy(start, text, Order{std::max(count, 0)});                                                       \
  }

QXCORE_FOUR_FORMS(Compare, ByCodeUnit)
QXCORE_FOUR_FORMS(CompareNoCase, ByLowerCase)
QXCORE_FOUR_FORMS(Collate, ByLocale)
QXCORE_FOUR_FORMS(CollateNoCase, ByLocaleNoCase)
QXCORE_FOUR_FORMS(CompareNb, ByNumber)
QXCORE_FOUR_FORMS(CompareNbNoCase, ByNumberNoCase)
