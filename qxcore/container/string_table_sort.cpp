// The five sort orders of SStringTable, all over the pointers in place.
//
// The orders by text run a three-way quicksort that takes the next few characters of a text as one number
// (J. Bentley and R. Sedgewick, "Fast algorithms for sorting and searching strings", 1997): what a group of
// texts begins with alike is read once, not in every comparison. Where numbers do not decide, or partitions
// go badly, std::sort takes over, which is never quadratic.

#include <algorithm>
#include <bit>
#include <cstdint>

#include "qxcore/container/string_table.h"
#include "qxcore/platform/bmp.h"
#include "qxcore/platform/wide.h"
#include "qxcore/string/natural_compare.h"

namespace {

using Text = const WCHAR*;

static_assert(sizeof(SString) == sizeof(Text), "strings are sorted as the pointers that they are");
Text* TextsOf(SStringTable& table) { return reinterpret_cast<Text*>(table.GetArray()); }

// An order makes numbers of the start of a text so that a smaller number comes first. Texts with the same number
// begin with the same Step::characters, and have ended (isEnd), or can be compared by what follows.
struct Step {
  int characters;
  bool isEnd;
  bool isWhole = true;  // else the number stands for a part of the text only
};

constexpr int kUnits = 4;  // 16-bit units in a number
constexpr std::uint64_t UnitAt(int i, std::uint64_t unit) { return unit << (48 - 16 * i); }

WCHAR Same(WCHAR c) { return c; }
WCHAR Lower(WCHAR c) { return platform::ToLowerBmp(c); }

// By code unit: the next four characters, zeros from the end of the text on.
template <WCHAR (*kFold)(WCHAR), int (*kCompare)(Text, Text)>
struct ByUnits {
  static std::uint64_t Key(Text text) {
    std::uint64_t key = 0;
    for (int i = 0; i < kUnits && text[i] != 0; ++i) key |= UnitAt(i, kFold(text[i]));
    return key;
  }
  static Step StepOver(Text text) {
    int i = 0;
    while (i < kUnits && text[i] != 0) ++i;
    return {i, i < kUnits};
  }
  static int Compare(Text a, Text b) { return kCompare(a, b); }
};

// In natural order: characters as before, but a run of digits takes a whole number of its own: that it is one (the
// place of '0'), its value in 32 bits, and its leading zeros. A run behind other characters only shows that it is
// there, and comes first in the next number.
template <WCHAR (*kFold)(WCHAR), int (*kCompare)(Text, Text)>
struct Naturally {
  static bool IsDigit(WCHAR c) { return c >= WTEXT('0') && c <= WTEXT('9'); }

  struct Run {
    explicit Run(Text at) : begin(at) {
      while (*at == WTEXT('0')) ++at;
      zeros = at - begin;
      for (; IsDigit(*at); ++at) {
        value = value * 10 + static_cast<unsigned>(*at - WTEXT('0'));
        if (value > kMost) value = kMost;
      }
      length = at - begin;
    }
    static constexpr std::uint64_t kMost = 0xFFFFFFFF;
    static constexpr std::ptrdiff_t kMostZeros = 0xFFFF;
    Text begin;
    std::ptrdiff_t zeros;
    std::ptrdiff_t length;
    std::uint64_t value = 0;
  };

  static std::uint64_t Key(Text text) {
    if (IsDigit(*text)) {
      const Run run(text);
      // Beyond the largest, values compare equal, and so must zeros.
      const auto zeros =
          run.value == Run::kMost ? 0 : static_cast<std::uint64_t>((std::min)(run.zeros, Run::kMostZeros));
      return UnitAt(0, WTEXT('0')) | run.value << 16 | zeros;
    }
    std::uint64_t key = 0;
    for (int i = 0; i < kUnits && text[i] != 0; ++i) {
      if (IsDigit(text[i])) return key | UnitAt(i, WTEXT('0'));
      key |= UnitAt(i, kFold(text[i]));
    }
    return key;
  }
  static Step StepOver(Text text) {
    if (IsDigit(*text)) {
      const Run run(text);
      return {static_cast<int>(run.length), false, run.value < Run::kMost && run.zeros < Run::kMostZeros};
    }
    int i = 0;
    while (i < kUnits && text[i] != 0 && !IsDigit(text[i])) ++i;
    return {i, i < kUnits && text[i] == 0};
  }
  static int Compare(Text a, Text b) { return kCompare(a, b); }
};

template <class Order>
class TextSort {
 public:
  explicit TextSort(bool isAscending) : m_flip(isAscending ? 0 : ~std::uint64_t{0}) {}

  // The texts are alike up to `depth`. `nesting` is how many calls deep it may still go.
  void Sort(Text* first, Text* last, int depth, int nesting) const {
    bool isWhole = true;
    while (isWhole && last - first > kFew && nesting > 0) {
      const auto [below, above] = Partition(first, last, depth, Median(first, last, depth));
      Sort(first, below, depth, nesting - 1);
      Sort(above, last, depth, nesting - 1);
      const Step step = Order::StepOver(*below + depth);
      if (step.isEnd) return;
      isWhole = step.isWhole;
      first = below;
      last = above;
      if (isWhole) depth += step.characters;
    }
    SortWhole(first, last, depth);
  }

 private:
  static constexpr std::ptrdiff_t kFew = 12;

  // Reversed in a descending sort.
  std::uint64_t Key(Text text, int depth) const { return Order::Key(text + depth) ^ m_flip; }

  std::uint64_t Median(Text* first, Text* last, int depth) const {
    const std::ptrdiff_t n = last - first;
    auto at = [&](std::ptrdiff_t eighth) { return Key(first[(n - 1) * eighth / 8], depth); };
    auto middle = [](std::uint64_t a, std::uint64_t b, std::uint64_t c) {
      return (std::max)((std::min)(a, b), (std::min)((std::max)(a, b), c));
    };
    if (n < 64) return middle(at(1), at(4), at(7));
    return middle(middle(at(0), at(1), at(2)), middle(at(3), at(4), at(5)), middle(at(6), at(7), at(8)));
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

  void SortWhole(Text* first, Text* last, int depth) const {
    auto isBefore = [this, depth](Text a, Text b) {
      const int order = Order::Compare(a + depth, b + depth);
      return m_flip == 0 ? order < 0 : order > 0;
    };
    if (last - first > kFew) {
      std::sort(first, last, isBefore);
      return;
    }
    for (Text* next = first; next < last; ++next) {
      const Text text = *next;
      Text* place = next;
      for (; place != first && isBefore(text, place[-1]); --place) *place = place[-1];
      *place = text;
    }
  }

  std::uint64_t m_flip;
};

template <class Order>
void SortTexts(SStringTable& table, int direction) {
  Text* texts = TextsOf(table);
  const int nesting = 32 + 4 * static_cast<int>(std::bit_width(table.size()));
  TextSort<Order>(direction != SStringTable::kDescending).Sort(texts, texts + table.size(), 0, nesting);
}

int CompareExactly(Text a, Text b) { return platform::WideCompare(a, b); }
int CompareNoCase(Text a, Text b) { return platform::WideCompareNoCase(a, b); }

int LengthOf(Text text) { return SStringData::Of(text)->m_length; }

}  // namespace

void SStringTable::Sort(int direction) { SortTexts<ByUnits<Same, CompareExactly>>(*this, direction); }
void SStringTable::SortNoCase(int direction) { SortTexts<ByUnits<Lower, CompareNoCase>>(*this, direction); }
void SStringTable::SortNumbered(int direction) { SortTexts<Naturally<Same, _tcscmpi>>(*this, direction); }
void SStringTable::SortNumberedNoCase(int direction) { SortTexts<Naturally<Lower, _tcsicmpi>>(*this, direction); }

void SStringTable::SortOnLength(int direction) {
  Text* texts = TextsOf(*this);
  if (direction != kDescending) {
    std::sort(texts, texts + size(), [](Text a, Text b) { return LengthOf(a) < LengthOf(b); });
  } else {
    std::sort(texts, texts + size(), [](Text a, Text b) { return LengthOf(b) < LengthOf(a); });
  }
}
