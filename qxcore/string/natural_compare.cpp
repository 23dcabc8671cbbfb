#include "qxcore/string/natural_compare.h"

#include <algorithm>
#include <climits>
#include <cstddef>

#include "qxcore/platform/wide.h"

namespace {

bool IsDigit(WCHAR c) { return c >= WTEXT('0') && c <= WTEXT('9'); }

// A text that ends at its NUL or at a count, whichever comes first.
class Cursor {
 public:
  Cursor(const WCHAR* text, long long count)
      : m_at(text != nullptr ? text : WTEXT("")), m_left(text != nullptr ? count : 0) {}

  WCHAR Get() const { return m_left > 0 ? *m_at : WCHAR(0); }
  bool IsDigit() const { return ::IsDigit(Get()); }
  void Next() {
    ++m_at;
    --m_left;
  }
  long long SkipZeros() {
    long long zeros = 0;
    for (; Get() == WTEXT('0'); Next()) ++zeros;
    return zeros;
  }
  long long CountDigits() const {
    Cursor ahead = *this;
    for (; ahead.IsDigit(); ahead.Next()) {
    }
    return ahead.m_at - m_at;
  }
  int TakeDigit() {
    int digit = *m_at - WTEXT('0');
    Next();
    return digit;
  }

 private:
  const WCHAR* m_at;
  long long m_left;
};

int Clip(long long difference) { return static_cast<int>(std::clamp<long long>(difference, -INT_MAX, INT_MAX)); }

// The difference of two digit runs, leading zeros gone; both cursors end behind their runs. Digits are
// aligned at the right end. Once the difference exceeds an int, further digits cannot bring it back.
int CompareRuns(Cursor& a, Cursor& b) {
  long long lengthA = a.CountDigits();
  long long lengthB = b.CountDigits();
  long long difference = 0;
  for (long long left = std::max(lengthA, lengthB); left > 0; --left) {
    int digitA = left <= lengthA ? a.TakeDigit() : 0;
    int digitB = left <= lengthB ? b.TakeDigit() : 0;
    if (difference >= -INT_MAX && difference <= INT_MAX) difference = difference * 10 + digitA - digitB;
  }
  return Clip(difference);
}

template <class Fold>
int CompareNatural(Cursor a, Cursor b, Fold fold) {
  for (;;) {
    if (a.IsDigit() && b.IsDigit()) {
      long long zeros = a.SkipZeros();
      zeros -= b.SkipZeros();
      if (int result = CompareRuns(a, b)) return result;
      if (zeros != 0) return Clip(zeros);
      continue;
    }
    int difference = static_cast<int>(fold(a.Get())) - static_cast<int>(fold(b.Get()));
    if (difference != 0) return difference;
    if (a.Get() == 0) return 0;
    a.Next();
    b.Next();
  }
}

// The same for whole texts. Most of a comparison of names is their common start: it is passed over without a
// look at digits, and then the run of digits that it may end in is read again.
template <class Fold>
int CompareWhole(const WCHAR* a, const WCHAR* b, Fold fold) {
  if (a == b) return 0;
  if (a == nullptr || b == nullptr) return CompareNatural(Cursor(a, LLONG_MAX), Cursor(b, LLONG_MAX), fold);
  std::ptrdiff_t same = 0;
  while (fold(a[same]) == fold(b[same]) && a[same] != 0) ++same;
  if (!IsDigit(a[same]) && !IsDigit(b[same])) {
    // Neither a longer run of digits nor a new one begins here: the runs before are equal.
    return static_cast<int>(fold(a[same])) - static_cast<int>(fold(b[same]));
  }
  while (same > 0 && IsDigit(a[same - 1])) --same;
  return CompareNatural(Cursor(a + same, LLONG_MAX), Cursor(b + same, LLONG_MAX), fold);
}

WCHAR Same(WCHAR c) { return c; }
WCHAR Lower(WCHAR c) { return platform::ToLowerBmp(c); }

}  // namespace

int _tcscmpi(const WCHAR* a, const WCHAR* b) { return CompareWhole(a, b, Same); }
int _tcsicmpi(const WCHAR* a, const WCHAR* b) { return CompareWhole(a, b, Lower); }
int _tcsncmpi(const WCHAR* a, const WCHAR* b, int count) {
  return a == b ? 0 : CompareNatural(Cursor(a, count), Cursor(b, count), Same);
}
int _tcsnicmpi(const WCHAR* a, const WCHAR* b, int count) {
  return a == b ? 0 : CompareNatural(Cursor(a, count), Cursor(b, count), Lower);
}
