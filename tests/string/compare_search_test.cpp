// Orders, searches, wildcards and natural comparison, against slow and plain readings of their rules.

#include <algorithm>
#include <string>

#include "qxcore/platform/wide.h"
#include "qxcore/string/natural_compare.h"
#include "qxcore/string/string.h"
#include "qxcore/string/text_search.h"
#include "tests/support/text.h"

namespace {

// Each character is found by each other one that has the same lower-case form, and by no further one.
TEST(SearchWithoutCase, EveryCharacterFindsItsWholeClass) {
  WideString haystack;
  for (unsigned c = 1; c < 0x10000; ++c) haystack += static_cast<WCHAR>(c);
  const SString all{SStringView(haystack)};
  for (unsigned c = 1; c < 0x10000; c += c < 0x600 ? 1 : 13) {
    const WCHAR wanted[] = {static_cast<WCHAR>(c), 0};
    const WCHAR lower = platform::ToLowerBmp(wanted[0]);
    unsigned expected = 1;
    while (platform::ToLowerBmp(static_cast<WCHAR>(expected)) != lower) ++expected;
    ASSERT_EQ(all.FindNoCase(wanted) - all.begin() + 1, static_cast<std::ptrdiff_t>(expected)) << c;
  }
}

int Sign(int value) { return (value > 0) - (value < 0); }

TEST(Compare, NullText_IsBelowEverythingButTheEmptyString) {
  EXPECT_EQ(SString().Compare(nullptr), 0);
  EXPECT_EQ(SString(WTEXT("a")).Compare(nullptr), 1);
  EXPECT_EQ(SString(WTEXT("a")).CollateNoCase(nullptr), 1);
  EXPECT_EQ(SString(WTEXT("a")).CompareNb(0, nullptr, 3), 1);
}

TEST(Compare, FourForms_CutWhereTheySay) {
  SString text = WTEXT("xxABC1");
  EXPECT_EQ(text.Compare(2, WTEXT("ABC1")), 0);
  EXPECT_EQ(text.Compare(2, WTEXT("ABD"), 2), 0);
  EXPECT_LT(text.Compare(2, WTEXT("ABD"), 3), 0);
  EXPECT_EQ(text.CompareNoCase(WTEXT("XXab"), 4), 0);
  EXPECT_EQ(text.Compare(WTEXT("zz"), 0), 0);
  EXPECT_EQ(text.CollateNoCase(2, WTEXT("abc1")), 0);
  EXPECT_EQ(text.CompareNbNoCase(2, WTEXT("abc01"), 3), 0);
}

TEST(Compare, NoCase_FoldsToLowerOneToOne) {
  EXPECT_LT(SString(WTEXT("_")).CompareNoCase(WTEXT("A")), 0) << "the underscore stands before letters";
  EXPECT_EQ(SString(WTEXT("\u00C4\u0416\u03A9")).CompareNoCase(WTEXT("\u00E4\u0436\u03C9")), 0);
  EXPECT_NE(SString(WTEXT("\u00DF")).CompareNoCase(WTEXT("ss")), 0);
}

// The rules of natural order read literally, with digit runs as texts.
int NaturalModel(const WideString& a, const WideString& b) {
  std::size_t i = 0;
  std::size_t j = 0;
  auto isDigit = [](WCHAR c) { return c >= WTEXT('0') && c <= WTEXT('9'); };
  for (;;) {
    WCHAR x = i < a.size() ? a[i] : WCHAR(0);
    WCHAR y = j < b.size() ? b[j] : WCHAR(0);
    if (!isDigit(x) || !isDigit(y)) {
      if (x != y) return Sign(static_cast<int>(x) - static_cast<int>(y));
      if (x == 0) return 0;
      ++i, ++j;
      continue;
    }
    auto run = [&](const WideString& text, std::size_t& at) {
      WideString digits;
      while (at < text.size() && isDigit(text[at])) digits += text[at++];
      return digits;
    };
    WideString runA = run(a, i);
    WideString runB = run(b, j);
    std::size_t zerosA = std::min(runA.find_first_not_of(WTEXT('0')), runA.size());
    std::size_t zerosB = std::min(runB.find_first_not_of(WTEXT('0')), runB.size());
    WideString numberA = runA.substr(zerosA);
    WideString numberB = runB.substr(zerosB);
    if (numberA.size() != numberB.size()) return numberA.size() < numberB.size() ? -1 : 1;
    if (numberA != numberB) return numberA < numberB ? -1 : 1;
    if (zerosA != zerosB) return zerosA < zerosB ? -1 : 1;
  }
}

TEST(NaturalOrder, RandomTexts_FollowTheRulesAndAreTotallyOrdered) {
  RandomText random(7);
  std::vector<WideString> texts;
  for (int i = 0; i < 120; ++i) texts.push_back(random.Make(12, WTEXT("0019a")));
  for (const WideString& a : texts) {
    for (const WideString& b : texts) {
      int order = _tcscmpi(a.c_str(), b.c_str());
      ASSERT_EQ(Sign(order), NaturalModel(a, b))
          << testing::PrintToString(SString(a.c_str())) << testing::PrintToString(SString(b.c_str()));
      ASSERT_EQ(Sign(_tcscmpi(b.c_str(), a.c_str())), -Sign(order));
      ASSERT_EQ(order == 0, a == b);
    }
  }
  std::sort(texts.begin(), texts.end(),
            [](const WideString& a, const WideString& b) { return _tcscmpi(a.c_str(), b.c_str()) < 0; });
  for (std::size_t i = 0; i < texts.size(); ++i) {
    for (std::size_t j = i; j < texts.size(); ++j) ASSERT_LE(_tcscmpi(texts[i].c_str(), texts[j].c_str()), 0);
  }
}

TEST(NaturalOrder, Differences_AreGivenWhereTheyFit) {
  EXPECT_EQ(_tcscmpi(WTEXT("a10"), WTEXT("a9")), 1);
  EXPECT_EQ(_tcscmpi(WTEXT("x100"), WTEXT("x7")), 93);
  EXPECT_EQ(_tcscmpi(WTEXT("98765432109876543210"), WTEXT("98765432109876543217")), -7);
  EXPECT_GT(_tcscmpi(WTEXT("99999999999999999999"), WTEXT("1")), 1000000);
  EXPECT_GT(_tcscmpi(WTEXT("a01"), WTEXT("a1")), 0);
  EXPECT_GT(_tcscmpi(WTEXT("a05"), WTEXT("a00")), 0);
  EXPECT_EQ(_tcsicmpi(WTEXT("FILE9"), WTEXT("file9")), 0);
  EXPECT_EQ(_tcsncmpi(WTEXT("a123"), WTEXT("a129"), 3), 0) << "the run ends at the count";
  EXPECT_LT(_tcsnicmpi(WTEXT("A123"), WTEXT("a129"), 4), 0);
  EXPECT_EQ(_tcscmpi(nullptr, WTEXT("")), 0);
}

TEST(Search, AllFinders_AgreeWithPlainSearch) {
  RandomText random(99);
  for (int round = 0; round < 20000; ++round) {
    WideString hay = random.Make(round % 4 == 0 ? 300 : 30, WTEXT("abAB\u00E9\u00C9\u212A"));
    WideString needle = random.Make(4, WTEXT("abAB\u00E9\u00C9k"));
    WideString lowHay = hay;
    WideString lowNeedle = needle;
    for (WCHAR& c : lowHay) c = platform::ToLowerBmp(c);
    for (WCHAR& c : lowNeedle) c = platform::ToLowerBmp(c);
    SString text(hay.c_str());
    auto position = [&](const WCHAR* found) {
      return found != nullptr ? static_cast<std::size_t>(found - text.GetSafePointer()) : WideString::npos;
    };
    std::size_t from = static_cast<std::size_t>(random.Number(static_cast<int>(hay.size()) + 1));
    const WCHAR* start = text.GetPointerAt(static_cast<int>(from));
    ASSERT_EQ(position(text.Find(needle.c_str())), hay.find(needle));
    ASSERT_EQ(position(text.Find(needle.c_str(), start)), hay.find(needle, from));
    ASSERT_EQ(position(text.FindNoCase(needle.c_str(), start)), lowHay.find(lowNeedle, from));
    ASSERT_EQ(position(text.ReverseFind(needle.c_str())), hay.rfind(needle));
    ASSERT_EQ(position(text.ReverseFind(needle.c_str(), start)), hay.rfind(needle, from));
    ASSERT_EQ(position(text.ReverseFindNoCase(needle.c_str(), start)), lowHay.rfind(lowNeedle, from));
    ASSERT_EQ(_tcsistr(text, needle.c_str()), text.FindNoCase(needle.c_str()));
  }
}

TEST(Search, Positions_RefuseWhatLiesOutside) {
  SString text = WTEXT("abcabc");
  EXPECT_EQ(text.FindPos(WTEXT('c'), 3), 5);
  EXPECT_EQ(text.FindPos(WTEXT('c'), 6), -1);
  EXPECT_EQ(text.FindPos(WTEXT('c'), -1), -1);
  EXPECT_EQ(SString().FindPos(WTEXT('c'), 0), -1);
  EXPECT_EQ(text.ReverseFindPos(WTEXT('c'), 4), 2);
  EXPECT_EQ(text.ReverseFindPos(WTEXT('a'), 6), -1);
  const WCHAR* haystack = WTEXT("xABx");
  EXPECT_EQ(_tcsistr(haystack, WTEXT("abz"), 2), haystack + 1);
}

// Backtracking over every split: right, and slow.
bool MatchModel(SStringView text, SStringView pattern) {
  if (pattern.empty()) return text.empty();
  if (pattern[0] == WTEXT('*')) {
    for (std::size_t i = 0; i <= text.size(); ++i) {
      if (MatchModel(text.substr(i), pattern.substr(1))) return true;
    }
    return false;
  }
  if (text.empty()) return false;
  if (pattern[0] == WTEXT('\\') && pattern.size() > 1) {
    return text[0] == pattern[1] && MatchModel(text.substr(1), pattern.substr(2));
  }
  return (pattern[0] == WTEXT('?') || pattern[0] == text[0]) && MatchModel(text.substr(1), pattern.substr(1));
}

TEST(Wildcards, RandomPatterns_AgreeWithBacktracking) {
  RandomText random(4);
  for (int round = 0; round < 30000; ++round) {
    WideString text = random.Make(8, WTEXT("ab*"));
    WideString pattern = random.Make(7, WTEXT("ab*?\\"));
    ASSERT_EQ(SString(text.c_str()).Match(pattern.c_str()) != 0, MatchModel(text, pattern))
        << testing::PrintToString(SString(text.c_str())) << testing::PrintToString(SString(pattern.c_str()));
  }
  EXPECT_EQ(SString(WTEXT("ABC")).MatchNoCase(WTEXT("a?C")), 1);
  EXPECT_EQ(SString(WTEXT("abc")).Match(WTEXT("***")), 1);
  EXPECT_EQ(SString().Match(nullptr), 1);
  // Many stars against a long text that never matches: no exponential time.
  SString longText(SStringView(WideString(20000, WTEXT('a'))));
  EXPECT_EQ(longText.Match(WTEXT("*a*a*a*a*a*a*a*a*a*b")), 0);
}

}  // namespace
