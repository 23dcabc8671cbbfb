// SStringTable beside a vector, its orders beside plain readings of their rules, its list forms round.

#include "qxcore/container/string_table.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <functional>
#include <random>
#include <set>
#include <vector>

#include "qxcore/core/exception.h"
#include "qxcore/platform/wide.h"
#include "qxcore/string/natural_compare.h"
#include "tests/support/failing_allocations.h"
#include "tests/support/text.h"
#include "tests/support/wine.h"

static_assert(std::random_access_iterator<SStringTable::iterator>);
static_assert(std::random_access_iterator<SStringTable::const_iterator>);
static_assert(std::random_access_iterator<SStringTable::reverse_iterator>);
static_assert(std::random_access_iterator<SStringTable::const_reverse_iterator>);
static_assert(std::convertible_to<SStringTable::iterator, SStringTable::const_iterator>);

namespace {

using Texts = std::vector<WideString>;

Texts TextsOf(const SStringTable& table) {
  Texts texts;
  for (const SString& text : table) texts.emplace_back(text.View());
  return texts;
}

SStringTable TableOf(const Texts& texts) {
  SStringTable table;
  for (const WideString& text : texts) table.Add(SStringView(text));
  return table;
}

const WCHAR* const kThree[] = {WTEXT("x"), WTEXT(""), WTEXT("z"), nullptr};

TEST(StringTable, RandomChanges_AreThoseOfAVector) {
  RandomText random(1);
  SStringTable table;
  Texts peer;
  for (int step = 0; step < 20000; ++step) {
    const int count = table.GetCount();
    const WideString text = random.Make(6, WTEXT("abc"));
    const int at = random.Number(count + 1), from = count != 0 ? random.Number(count) : 0;
    const SStringTable holder = table;
    const Texts held = peer;
    switch (random.Number(count > 60 ? 12 : 10)) {
      case 0:
      case 1:
        ASSERT_EQ(table.Add(SStringView(text)), count);
        peer.push_back(text);
        break;
      case 2:
        table.Insert(at, SStringView(text));
        peer.insert(peer.begin() + at, text);
        break;
      case 3:
        if (count == 0) break;
        table.Insert(at, table[from]);  // one of its own
        peer.insert(peer.begin() + at, WideString(peer[static_cast<std::size_t>(from)]));
        break;
      case 4:
        if (count == 0) break;
        ASSERT_EQ(table.Remove(table.cbegin() + from).GetIndex(), from);
        peer.erase(peer.begin() + from);
        break;
      case 5:
        if (count == 0) break;
        ASSERT_EQ(table.Remove(table.crend() - 1 - from).GetIndex(), from - 1);
        peer.erase(peer.begin() + from);
        break;
      case 6:
        if (at == count) break;
        table.MoveTo(table.begin() + from, at);
        peer.insert(peer.begin() + at + (at > from), WideString(peer[static_cast<std::size_t>(from)]));
        peer.erase(peer.begin() + from + (at < from));
        break;
      case 7:
        table += kThree;
        peer.insert(peer.end(), {WTEXT("x"), WTEXT(""), WTEXT("z")});
        break;
      case 8:
        table.Reverse();
        std::reverse(peer.begin(), peer.end());
        break;
      case 9:
        if (count == 0) break;
        table.Reserve(count + from);
        table.GetAt(from) += WTEXT('!');
        peer[static_cast<std::size_t>(from)] += WTEXT('!');
        break;
      case 10:
        table += table;
        for (int i = 0; i < count; ++i) peer.push_back(WideString(peer[static_cast<std::size_t>(i)]));
        break;
      case 11:
        table = table[from];
        peer = {WideString(peer[static_cast<std::size_t>(from)])};
    }
    ASSERT_EQ(TextsOf(table), peer) << "step " << step;
    ASSERT_EQ(TextsOf(holder), held) << "a copy must not change, step " << step;
  }
}

TEST(StringTable, CopiesAndAssignments_TakeEveryForm) {
  SStringTable table(kThree);
  EXPECT_EQ(TextsOf(table), (Texts{WTEXT("x"), WTEXT(""), WTEXT("z")}));
  SStringTable copy = table;
  copy[0] = WTEXT("other");
  EXPECT_EQ(table[0], WTEXT("x"));
  EXPECT_EQ(table[2].GetSafePointer(), copy[2].GetSafePointer()) << "the text itself is shared";
  table = *&table;
  EXPECT_EQ(table.GetCount(), 3);
  table = SString(WTEXT("one"));
  EXPECT_EQ(TextsOf(table), Texts{WTEXT("one")});
  EXPECT_TRUE(SStringTable::null.IsEmpty());
}

TEST(StringTable, Iterators_TellWhetherTheyAreInside) {
  const SStringTable table(kThree);
  std::vector<int> seen;
  for (SStringTable::const_iterator at = table.begin(); at; ++at) seen.push_back(at.GetIndex());
  for (SStringTable::const_reverse_iterator at = table.rbegin(); at; ++at) seen.push_back(at.GetIndex());
  EXPECT_EQ(seen, (std::vector<int>{0, 1, 2, 2, 1, 0}));
  EXPECT_FALSE(SStringTable::null.begin());
  EXPECT_FALSE(SStringTable::const_iterator());
  SStringTable sorted{WTEXT("b"), WTEXT("c"), WTEXT("a")};
  std::sort(sorted.begin(), sorted.end());
  EXPECT_EQ(TextsOf(sorted), (Texts{WTEXT("a"), WTEXT("b"), WTEXT("c")}));
  std::sort(sorted.rbegin(), sorted.rend());
  EXPECT_EQ(TextsOf(sorted), (Texts{WTEXT("c"), WTEXT("b"), WTEXT("a")}));
}

TEST(StringTable, Compare_CountsBeforeTexts_AndNeverEqualsItself) {
  const SStringTable two{WTEXT("y"), WTEXT("z")}, three{WTEXT("a"), WTEXT("b"), WTEXT("c")};
  EXPECT_EQ(two.Compare(three), -1);
  EXPECT_EQ(three.Compare(two), 1);
  SStringTable other = two;
  EXPECT_TRUE(two == other && two <= other && two >= other && !(two != other) && !(two < other));
  other[1] = WTEXT("za");
  EXPECT_TRUE(two < other && other > two && two != other);
  EXPECT_EQ(two.Compare(two), 1);
  EXPECT_FALSE(two == *&two);
}

// --- sorting ---

using Order = std::function<int(const WideString&, const WideString&)>;

struct NamedSort {
  const char* name;
  void (SStringTable::*sort)(int);
  Order order;
};

// A reading of the natural order that shares nothing with the library's: both texts in tokens first.
struct Token {
  bool isNumber;
  WideString digits;  // without leading zeros
  std::size_t zeros;
  WCHAR character;
};

std::vector<Token> Tokens(const WideString& text, bool fold) {
  std::vector<Token> tokens;
  for (std::size_t i = 0; i < text.size();) {
    Token token{};
    if (text[i] >= '0' && text[i] <= '9') {
      std::size_t end = i;
      while (end < text.size() && text[end] >= '0' && text[end] <= '9') ++end;
      token.isNumber = true;
      while (i < end && text[i] == '0') ++i, ++token.zeros;
      token.digits = text.substr(i, end - i);
      token.character = text[end - token.digits.size() - token.zeros];
      i = end;
    } else {
      token.character = fold ? platform::ToLowerBmp(text[i]) : text[i];
      ++i;
    }
    tokens.push_back(token);
  }
  return tokens;
}

int CompareNumbers(const Token& a, const Token& b) {
  if (a.digits.size() != b.digits.size()) return a.digits.size() < b.digits.size() ? -1 : 1;
  if (int order = a.digits.compare(b.digits)) return order;
  return a.zeros < b.zeros ? -1 : a.zeros > b.zeros ? 1 : 0;
}

int CompareNaturally(const WideString& a, const WideString& b, bool fold) {
  const std::vector<Token> left = Tokens(a, fold), right = Tokens(b, fold);
  for (std::size_t i = 0; i < left.size() && i < right.size(); ++i) {
    const bool areNumbers = left[i].isNumber && right[i].isNumber;
    const int order = areNumbers ? CompareNumbers(left[i], right[i])
                                 : static_cast<int>(left[i].character) - static_cast<int>(right[i].character);
    if (order != 0) return order;
  }
  return left.size() < right.size() ? -1 : left.size() > right.size() ? 1 : 0;
}

WideString Lower(WideString text) {
  for (WCHAR& c : text) c = platform::ToLowerBmp(c);
  return text;
}

const NamedSort kSorts[] = {
    {"Sort", &SStringTable::Sort, [](auto& a, auto& b) { return a.compare(b); }},
    {"SortNoCase", &SStringTable::SortNoCase, [](auto& a, auto& b) { return Lower(a).compare(Lower(b)); }},
    {"SortNumbered", &SStringTable::SortNumbered, [](auto& a, auto& b) { return CompareNaturally(a, b, false); }},
    {"SortNumberedNoCase", &SStringTable::SortNumberedNoCase,
     [](auto& a, auto& b) { return CompareNaturally(a, b, true); }},
    {"SortOnLength", &SStringTable::SortOnLength,
     [](auto& a, auto& b) { return static_cast<int>(a.size()) - static_cast<int>(b.size()); }},
};

void ExpectSorts(const Texts& texts, const char* what) {
  for (const NamedSort& sort : kSorts) {
    for (const int direction : {SStringTable::kAscending, SStringTable::kDescending}) {
      SStringTable table = TableOf(texts);
      (table.*sort.sort)(direction);
      Texts sorted = TextsOf(table);
      for (std::size_t i = 1; i < sorted.size(); ++i) {
        const int order = sort.order(sorted[i - 1], sorted[i]);
        ASSERT_TRUE(direction == SStringTable::kAscending ? order <= 0 : order >= 0)
            << sort.name << ", " << what << ", at " << i;
      }
      Texts before = texts;
      std::sort(before.begin(), before.end());
      std::sort(sorted.begin(), sorted.end());
      ASSERT_EQ(sorted, before) << sort.name << ", " << what << ": texts were lost";
    }
  }
}

TEST(StringTableSort, AllOrders_HoldForEveryShapeOfInput) {
  RandomText random(2);
  const WideString prefix(300, 'p');
  for (const int n : {0, 1, 2, 12, 13, 100, 3000}) {
    Texts any, alike(static_cast<std::size_t>(n), WTEXT("same text")), prefixed, pipe, stairs;
    for (int i = 0; i < n; ++i) {
      any.push_back(random.Make(12, WTEXT("aAbB019\x00C4\x00E4\xD83D\xFFFF")));
      if (i % 4 == 0) any.back().insert(0, random.Make(25, WTEXT("0999")));  // numbers beyond any machine's
      prefixed.push_back(prefix + random.Make(6, WTEXT("ab0")));
      const int step = i < n / 2 ? i : n - i;
      const std::string digits = std::to_string(step);
      pipe.emplace_back(digits.begin(), digits.end());
      stairs.emplace_back(static_cast<std::size_t>(i % 400), WCHAR('s'));
    }
    ExpectSorts(any, "random");
    ExpectSorts(alike, "all alike");
    ExpectSorts(prefixed, "a long common start");
    ExpectSorts(pipe, "up and down");
    ExpectSorts(stairs, "each the start of the next");
    std::sort(any.begin(), any.end());
    ExpectSorts(any, "sorted");
    std::reverse(any.begin(), any.end());
    ExpectSorts(any, "reversed");
  }
}

TEST(StringTableSort, NaturalOrder_IsTotal) {
  RandomText random(3);
  auto sign = [](int order) { return (order > 0) - (order < 0); };
  for (int round = 0; round < 200000; ++round) {
    WideString texts[3];
    for (WideString& text : texts) text = random.Make(6, WTEXT("a0019B"));
    const WCHAR *a = texts[0].c_str(), *b = texts[1].c_str(), *c = texts[2].c_str();
    for (auto compare : {_tcscmpi, _tcsicmpi}) {
      ASSERT_EQ(sign(compare(a, b)), -sign(compare(b, a)));
      if (compare(a, b) <= 0 && compare(b, c) <= 0) {
        ASSERT_LE(compare(a, c), 0);
      }
      ASSERT_EQ(sign(compare(a, b)), sign(CompareNaturally(texts[0], texts[1], compare == _tcsicmpi)));
    }
  }
}

// Names of the files below a folder, at most `limit`.
void CollectNames(const WideString& folder, std::size_t limit, SStringTable& names) {
  WIN32_FIND_DATAW found;
  const HANDLE search = FindFirstFileW((folder + WTEXT("\\*")).c_str(), &found);
  if (search == INVALID_HANDLE_VALUE) return;
  Texts folders;
  do {
    const WideString name = found.cFileName;
    if (name == WTEXT(".") || name == WTEXT("..")) continue;
    names.Add(SStringView(name));
    const bool isLink = (found.dwFileAttributes & FILE_ATTRIBUTE_REPARSE_POINT) != 0;
    if ((found.dwFileAttributes & FILE_ATTRIBUTE_DIRECTORY) != 0 && !isLink)
      folders.push_back(folder + WTEXT("\\") + name);
  } while (names.size() < limit && FindNextFileW(search, &found) != 0);
  FindClose(search);
  for (const WideString& below : folders) {
    if (names.size() < limit) CollectNames(below, limit, names);
  }
}

TEST(StringTableSort, RealFileNames_StandInNaturalOrder) {
  WCHAR windows[MAX_PATH];
  ASSERT_NE(GetWindowsDirectoryW(windows, MAX_PATH), 0u);  // the system's own tree: "C:\usr" on Linux
  SStringTable names;
  CollectNames(IsWine() ? WideString(WTEXT("Z:\\usr")) : WideString(windows), 100'000, names);
  ASSERT_GT(names.GetCount(), 1000);
  names.SortNumbered();
  const Texts sorted = TextsOf(names);
  for (std::size_t i = 1; i < sorted.size(); ++i) {
    ASSERT_LE(CompareNaturally(sorted[i - 1], sorted[i], false), 0) << "at " << i;
  }
  std::mt19937 random(4);
  std::vector<std::size_t> sample(400);
  for (std::size_t& one : sample) one = random() % sorted.size();
  for (const std::size_t i : sample) {
    for (const std::size_t j : sample) {
      if (i < j) {
        ASSERT_LE(CompareNaturally(sorted[i], sorted[j], false), 0) << i << " and " << j;
      }
    }
  }
}

// --- joining and lists ---

TEST(StringTable, Format_JoinsWithTrailingSeparatorOrBetweenBrackets) {
  const SStringTable table{WTEXT("a"), WTEXT("b")};
  EXPECT_EQ(table.Format(WTEXT(", ")), WTEXT("a, b, "));
  EXPECT_EQ(table.Format(WTEXT("["), WTEXT(", "), WTEXT("]")), WTEXT("[a, b]"));
  EXPECT_EQ(table.Format(), WTEXT("a\r\nb\r\n"));
  EXPECT_EQ(SStringTable::null.Format(WTEXT(", ")), SString::null);
  EXPECT_EQ(SStringTable::null.Format(WTEXT("["), WTEXT(", "), WTEXT("]")), SString::null);
}

TEST(StringTable, Lists_BreakWhereTheRulesSayIt) {
  struct Case {
    const WCHAR *list, *separators;
    Texts parts;
  };
  const Case cases[] = {
      {WTEXT("x\r\ny"), WTEXT("\r\n"), {WTEXT("x"), WTEXT("y")}},
      {WTEXT("x\r\n\r\ny"), WTEXT("\r\n"), {WTEXT("x"), WTEXT("y")}},  // meant: every one differs from the one before
      {WTEXT("x\n\ny"), WTEXT("\r\n"), {WTEXT("x"), WTEXT(""), WTEXT("y")}},
      {WTEXT("x,,y"), WTEXT(","), {WTEXT("x"), WTEXT(""), WTEXT("y")}},
      {WTEXT(",x,"), WTEXT(","), {WTEXT(""), WTEXT("x"), WTEXT("")}},
      {WTEXT("x;,;y"), WTEXT(",;"), {WTEXT("x"), WTEXT("y")}},
      {WTEXT("a\\,b,c\\\\,\\"), WTEXT(","), {WTEXT("a,b"), WTEXT("c\\"), WTEXT("\\")}},
      {WTEXT("x\x2028y\x2029z"), WTEXT("\x2028"), {WTEXT("x"), WTEXT("y\x2029z")}},
      {WTEXT("x,y"), nullptr, {WTEXT("x,y")}},
      {WTEXT(""), WTEXT(","), {}},
  };
  for (const Case& one : cases) {
    SStringTable table{WTEXT("former")};
    EXPECT_EQ(table.SetFromList(one.list, one.separators, '\\'), static_cast<int>(one.parts.size()));
    EXPECT_EQ(TextsOf(table), one.parts) << SString(one.list).Length();
  }
}

TEST(StringTable, Lists_GoRound) {
  EXPECT_EQ((SStringTable{WTEXT("a,b"), WTEXT("c")}).GetAsList(',', '\\'), WTEXT("a\\,b,c"));
  EXPECT_EQ(SString(SStringTable{WTEXT("a\\"), WTEXT("b")}), WTEXT("a\\\\\nb"));
  RandomText random(5);
  for (int round = 0; round < 20000; ++round) {
    Texts texts(static_cast<std::size_t>(random.Number(5)));
    for (WideString& text : texts) text = random.Make(5, SStringView(WTEXT("ab,\\\n\0"), 6));
    if (texts == Texts{WideString()}) continue;  // the same list as no element
    SStringTable back;
    back.SetFromList(TableOf(texts).GetAsList(',', '\\'), WTEXT(","), '\\');
    ASSERT_EQ(TextsOf(back), texts) << "round " << round;
  }
}

TEST(StringTable, ListsComeFromTheTableItself_AndFromResources) {
  SStringTable table{WTEXT("a,b")};
  EXPECT_EQ(table.AddFromList(table[0], WTEXT(","), 0), 2);
  EXPECT_EQ(table.AddFromList(table), 3);
  EXPECT_EQ(table.GetCount(), 6);
  EXPECT_EQ(table.SetFromList(196u, WTEXT(" "), 0), 4);  // "Unexpected end of file."
  EXPECT_EQ(table[3], WTEXT("file."));
  EXPECT_EQ(table.SetFromList(999'999u, WTEXT(" "), 0), 0);
}

TEST(StringTable, FailedAllocation_LeavesTheTableAsItWas) {
  const SString list = WTEXT("one,two,three,four,five\\,5");
  SStringTable table, lent;  // strings that are lent out are copied, and long ones come from no pool
  for (const WCHAR character : {WTEXT('a'), WTEXT('b'), WTEXT('c')}) {
    SString text;
    std::fill_n(text.GetBufferSetLength(3000), 3000, character);
    lent.Add(text);
  }
  for (SString& text : lent) text.LockBuffer(text.Length());
  Texts expected;  // after the last step that succeeded
  auto step = [&](auto change) {
    change();
    expected = TextsOf(table);
  };
  const int failures = WithEachAllocationFailing(
      [&] {
        step([&] { table = SStringTable::null; });
        step([&] { table.AddFromList(list, WTEXT(","), '\\'); });
        step([&] { table += kThree; });
        step([&] { table += lent; });
        step([&] { table = lent; });
        step([&] { table.Insert(2, WTEXT("two and a half")); });
        step([&] { table.SetFromList(list, WTEXT(","), '\\'); });
        step([&] { table = kThree; });
        step([&] { table.Format(WTEXT("----------------------------------------")); });
      },
      [&] { EXPECT_EQ(TextsOf(table), expected); });
  EXPECT_GT(failures, 10);
}

}  // namespace
