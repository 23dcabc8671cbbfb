// The five sort orders of SStringTable, all over the pointers in place.
//
// The two text orders run a three-way quicksort that takes four characters at a time as one number
// (J. Bentley and R. Sedgewick, "Fast algorithms for sorting and searching strings", 1997): what a
// group of texts begins with alike is read once, not in every comparison. The other orders compare
// whole texts. When partitions go badly, std::sort takes over, which is never quadratic.

#include <algorithm>
#include <bit>
#include <cstdint>

#include "platform/bmp.h"
#include "qxcore/container/string_table.h"
#include "qxcore/string/natural_compare.h"

namespace {

using Text = const WCHAR*;

static_assert(sizeof(SString) == sizeof(Text), "strings are sorted as the pointers that they are");
Text* TextsOf(SStringTable& table) { return reinterpret_cast<Text*>(table.GetArray()); }

struct Exactly {
  static WCHAR Fold(WCHAR c) { return c; }
};
struct NoCase {
  static WCHAR Fold(WCHAR c) { return platform::ToLowerBmp(c); }
};

template <class Case>
class TextSort {
 public:
  explicit TextSort(bool isAscending) : m_flip(isAscending ? 0 : ~std::uint64_t{0}) {}

  // `nesting` is how many calls deep it may still go.
  void Sort(Text* first, Text* last, int depth, int nesting) const {
    while (last - first > kFew && nesting > 0) {
      const std::uint64_t pivot = Median(first, last, depth);
      const auto [below, above] = Partition(first, last, depth, pivot);
      Sort(first, below, depth, nesting - 1);
      Sort(above, last, depth, nesting - 1);
      if (IsAtEnd(pivot)) return;
      first = below;
      last = above;
      depth += kUnits;
    }
    const auto isBefore = [this, depth](Text a, Text b) { return IsBefore(a + depth, b + depth); };
    if (last - first > kFew) {
      std::sort(first, last, isBefore);
    } else {
      SortFew(first, last, isBefore);
    }
  }

 private:
  static constexpr int kUnits = 4;  // characters in a number
  static constexpr std::ptrdiff_t kFew = 12;

  // The next four characters, the first one highest; zeros from the end of the text on. Reversed in a
  // descending sort.
  std::uint64_t Key(Text text, int depth) const {
    text += depth;
    std::uint64_t key = 0;
    for (int shift = 48; shift >= 0; shift -= 16, ++text) {
      if (*text == 0) break;
      key |= std::uint64_t{Case::Fold(*text)} << shift;
    }
    return key ^ m_flip;
  }
  bool IsAtEnd(std::uint64_t key) const { return ((key ^ m_flip) & 0xFFFF) == 0; }

  bool IsBefore(Text a, Text b) const {
    while (*a != 0 && Case::Fold(*a) == Case::Fold(*b)) ++a, ++b;
    return m_flip == 0 ? Case::Fold(*a) < Case::Fold(*b) : Case::Fold(*b) < Case::Fold(*a);
  }

  std::uint64_t Median(Text* first, Text* last, int depth) const {
    const std::ptrdiff_t n = last - first;
    auto at = [&](std::ptrdiff_t eighth) { return Key(first[n * eighth / 8], depth); };
    auto middle = [](std::uint64_t a, std::uint64_t b, std::uint64_t c) {
      return (std::max)((std::min)(a, b), (std::min)((std::max)(a, b), c));
    };
    if (n < 64) return middle(at(1), at(4), at(7));
    return middle(middle(at(0), at(1), at(2)), middle(at(3), at(4), at(5)), middle(at(6), at(7), Key(last[-1], depth)));
  }

  struct Equals {
    Text* first;
    Text* last;
  };
  Equals Partition(Text* first, Text* last, int depth, std::uint64_t pivot) const {
    Text* at = first;
    while (at != last) {
      const std::uint64_t key = Key(*at, depth);
      if (key < pivot) {
        std::swap(*first++, *at++);
      } else if (key > pivot) {
        std::swap(*at, *--last);
      } else {
        ++at;
      }
    }
    return {first, last};
  }

  template <class Order>
  static void SortFew(Text* first, Text* last, Order isBefore) {
    for (Text* next = first; next < last; ++next) {
      const Text text = *next;
      Text* place = next;
      for (; place != first && isBefore(text, place[-1]); --place) *place = place[-1];
      *place = text;
    }
  }

  std::uint64_t m_flip;
};

template <class Case>
void SortTexts(SStringTable& table, int direction) {
  Text* texts = TextsOf(table);
  const int nesting = 32 + 4 * static_cast<int>(std::bit_width(table.size()));
  TextSort<Case>(direction != SStringTable::kDescending).Sort(texts, texts + table.size(), 0, nesting);
}

template <class Compare>
void SortBy(SStringTable& table, int direction, Compare compare) {
  Text* texts = TextsOf(table);
  if (direction != SStringTable::kDescending) {
    std::sort(texts, texts + table.size(), [compare](Text a, Text b) { return compare(a, b) < 0; });
  } else {
    std::sort(texts, texts + table.size(), [compare](Text a, Text b) { return compare(b, a) < 0; });
  }
}

}  // namespace

void SStringTable::Sort(int direction) { SortTexts<Exactly>(*this, direction); }
void SStringTable::SortNoCase(int direction) { SortTexts<NoCase>(*this, direction); }
void SStringTable::SortNumbered(int direction) { SortBy(*this, direction, _tcscmpi); }
void SStringTable::SortNumberedNoCase(int direction) { SortBy(*this, direction, _tcsicmpi); }

void SStringTable::SortOnLength(int direction) {
  SortBy(*this, direction, [](Text a, Text b) { return SStringData::Of(a)->m_length - SStringData::Of(b)->m_length; });
}
