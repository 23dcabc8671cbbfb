// Orders of map keys. A comparer has one static function Compare(a, b): negative, 0 or positive.
// Threads: comparers keep no state and serve any thread.
#pragma once

#include "qxcore/platform/bmp.h"
#include "qxcore/string/string.h"

// By code unit, up to the first NUL.
struct SAscStrCas {
  // Negative when a comes first, positive when b does, else 0.
  static int Compare(const WCHAR* a, const WCHAR* b) {
    if (a == b) return 0;
    while (*a == *b && *a != 0) ++a, ++b;
    return static_cast<int>(*a) - static_cast<int>(*b);
  }
};

// The same after mapping to lower case, one to one and without regard to a locale.
struct SAscStrNoC {
  // Negative when a comes first, positive when b does, else 0.
  static int Compare(const WCHAR* a, const WCHAR* b) {
    if (a == b) return 0;
    for (;; ++a, ++b) {
      int order = static_cast<int>(platform::ToLowerBmp(*a)) - static_cast<int>(platform::ToLowerBmp(*b));
      if (order != 0 || *a == 0) return order;
    }
  }
};

// By operator <.
template <class K>
struct SAscending {
  // Negative when a comes first, positive when b does, else 0.
  static int Compare(const K& a, const K& b) { return a < b ? -1 : b < a ? 1 : 0; }
};
