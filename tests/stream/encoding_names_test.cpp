// Names of encodings, both ways.

#include <set>

#include "qxcore/stream/encoding/multi_format_support.h"
#include "tests/support/text.h"

namespace {

using Support = SAbstractIO::SMultiFormatSupport;
using Encoding = Support::Encoding;

struct Row {
  Encoding value;
  const WCHAR* name;
};
#define E(value, name) {value, WTEXT(name)},
constexpr Row kRows[] = {
#include "qxcore/stream/encoding/encoding_names.inc"
};

bool IsPattern(const SString& name) { return name.Find(WTEXT('%')) != nullptr; }

TEST(EncodingNames, EveryRow_NamesItsValueInAnyCase) {
  std::set<WideString> seen;
  for (const Row& row : kRows) {
    SString name = row.name;
    if (IsPattern(name)) continue;
    SString upper = name;
    upper.ToUpper();
    int matched = 0;
    EXPECT_EQ(Support::MatchEncodingName(name, 0, &matched), row.value) << testing::PrintToString(name);
    EXPECT_EQ(matched, name.Length());
    EXPECT_EQ(Support::MatchEncodingName(WTEXT(" \t") + upper + WTEXT("\r\n")), row.value)
        << testing::PrintToString(name);
    name.ToLower();
    EXPECT_TRUE(seen.insert(name.GetSafePointer()).second) << "twice: " << testing::PrintToString(name);
    unsigned page = row.value & 0xFFFF;
    if (Support::IsANSI(row.value)) {
      EXPECT_TRUE(page != 65000 && page != 65001);
    }
  }
}

// The fixed table: its groups one after the other, pages ascending; names of our own stand behind it.
TEST(EncodingNames, FixedTable_ComesFirstInItsOrder) {
  constexpr std::size_t kFixedRows = 259, kPages = 210, kFirstPage = 14;
  ASSERT_GT(std::size(kRows), kFixedRows);
  EXPECT_EQ(SString(kRows[0].name), WTEXT("ASCII"));
  EXPECT_EQ(SString(kRows[kFirstPage - 4].name), WTEXT("ANSI+Detect"));
  for (std::size_t i = kFirstPage; i < kFirstPage + kPages; ++i) {
    EXPECT_TRUE(Support::IsANSI(kRows[i].value) && (kRows[i].value & 0xFFFF) != 0) << i;
    EXPECT_LE(i == kFirstPage ? 0 : kRows[i - 1].value, kRows[i].value) << i;
  }
  EXPECT_EQ(SString(kRows[kFirstPage + kPages].name), WTEXT("Cp%d"));
  EXPECT_EQ(SString(kRows[kFirstPage + kPages + 1].name), WTEXT("OEM"));
  EXPECT_EQ(SString(kRows[kFixedRows - 1].name), WTEXT("Unicode(0x%0.4X)"));
}

TEST(EncodingNames, DisplayNames_ReadBackWithEveryPolicy) {
  for (const Row& row : kRows) {
    for (Encoding level : {0u, 0x200000u, 0x400000u, 0x600000u, 0x800000u, 0xA00000u, 0xC00000u, 0xE00000u}) {
      for (Encoding rest : {0u, 0x100000u, 0x1000000u, 0x4000000u, 0x3100000u}) {
        Encoding encoding = (row.value & 0xFFFFF) | level | rest;
        if (IsPattern(row.name) || encoding == 0) continue;
        SString name = Support::GetEncodingName(encoding, 1);
        name.Replace(WTEXT(" * NOT INSTALLED *"), WTEXT(""));
        ASSERT_EQ(Support::MatchEncodingName(name), encoding) << testing::PrintToString(name);
      }
    }
  }
}

TEST(EncodingNames, Patterns_ScanTheirNumbers) {
  EXPECT_EQ(Support::MatchEncodingName(WTEXT("cp1252")), 0x204E4u);
  EXPECT_EQ(Support::MatchEncodingName(WTEXT("Cp850+Detect")), 0x820352u);
  EXPECT_EQ(Support::MatchEncodingName(WTEXT("Cp65001")), Support::kUTF8);
  EXPECT_EQ(Support::MatchEncodingName(WTEXT("Cp65000")), 0u);
  EXPECT_EQ(Support::MatchEncodingName(WTEXT("Cp70000")), 0u);
  EXPECT_EQ(Support::MatchEncodingName(WTEXT("Cp0")), 0u);
  EXPECT_EQ(Support::MatchEncodingName(WTEXT("Cp")), 0u);
  int matched = 0;
  EXPECT_EQ(Support::MatchEncodingName(WTEXT("Cp1252-1"), 0, &matched), 0x204E4u);
  EXPECT_EQ(matched, 6);
  for (const WCHAR* unfinished : {WTEXT("Unicode(0x"), WTEXT("Unicode(0x)"), WTEXT("Unicode(0x1C"),
                                  WTEXT("Unicode(0x1C+"), WTEXT("Unicode(0x10000)")}) {
    EXPECT_EQ(Support::MatchEncodingName(unfinished, 0, &matched), Support::kUTF16LE);
    EXPECT_EQ(matched, 7) << "the name alone";
  }
  EXPECT_EQ(Support::MatchEncodingName(WTEXT("Unicode(0x001C)")), 0x4001Cu);
  EXPECT_EQ(Support::GetEncodingName(0x40003), WTEXT("Unicode(0x0003)"));
  EXPECT_EQ(Support::MatchEncodingName(Support::GetEncodingName(0x40003)), 0x40003u);
  EXPECT_EQ(Support::GetEncodingName(0x2FFF0).Left(7), WTEXT("Cp65520"));
  EXPECT_NE(Support::GetEncodingName(0x2FFF0).Find(WTEXT(" * NOT INSTALLED *")), nullptr);
}

TEST(EncodingNames, LongestPrefixWins_AndTheRestIsToldOf) {
  int matched = 0;
  EXPECT_EQ(Support::MatchEncodingName(WTEXT("UTF-8 and more"), 0, &matched), Support::kUTF8);
  EXPECT_EQ(matched, 5);
  EXPECT_EQ(Support::MatchEncodingName(WTEXT("utf-8+detect+favorhint(XML)"), 0, &matched), 0x3840004u);
  EXPECT_EQ(matched, 27);
  EXPECT_EQ(Support::MatchEncodingName(WTEXT("no such thing"), 0, &matched), 0u);
  EXPECT_EQ(matched, 0);
  EXPECT_EQ(Support::MatchEncodingName(WTEXT("<undefined>"), 0, &matched), 0u);
  EXPECT_EQ(matched, 11);
  EXPECT_EQ(Support::MatchEncodingName(WTEXT("")), 0u);
  EXPECT_EQ(Support::MatchEncodingName(WTEXT("1252"), 0, &matched), 0u);
  EXPECT_EQ(Support::MatchEncodingName(WTEXT("1252"), 1, &matched), 0x204E4u) << "the platform's own list";
}

TEST(EncodingNames, UndefinedFriendlyAndApplication) {
  EXPECT_EQ(Support::GetEncodingName(0), WTEXT("<Undefined>"));
  EXPECT_EQ(Support::GetEncodingName(0, 0, 0, 1), WTEXT(""));
  EXPECT_EQ(Support::GetEncodingName(0x4001C, 0, 1), WTEXT("UTF-8 (with signature)"));
  EXPECT_EQ(Support::GetEncodingName(0xE20000, 1, 1), WTEXT("ANSI (Active Code Page)+FullDetect"));
  EXPECT_EQ(Support::GetEncodingName(0x820000, 1), WTEXT("ANSI+Detect"));
  EXPECT_EQ(Support::GetAppEncodingName(), WTEXT("Unicode"));
  EXPECT_TRUE(Support::IsSameFormat(0x4001C, 0xE40004));
  EXPECT_FALSE(Support::IsSameFormat(0x204E4, 0x204E5)) << "code pages compare whole";
  EXPECT_FALSE(Support::IsSameFormat(0x20000 | 874, 0x20000 | (874 ^ 8)));
}

TEST(EncodingNames, Listing_IsSortedAndKeepsToWhatIsInstalled) {
  Support::EncodingMap all;
  Support::EncodingMap installed;
  int count = Support::ListAvailableEncodings(all, 0, 1);
  EXPECT_EQ(count, all.GetCount());
  EXPECT_GT(count, 259);
  EXPECT_LT(Support::ListAvailableEncodings(installed, 1, 0), count);
  ASSERT_NE(installed.Retrieve(SString(WTEXT("utf-8"))), nullptr);
  EXPECT_EQ(installed.Retrieve(SString(WTEXT("UTF8"))), nullptr) << "an alias";
  for (const auto& [name, value] : installed)
    EXPECT_TRUE(Support::MachineSupports(value)) << testing::PrintToString(name);
}

TEST(PolicyLabels, SayWhatUsersRead) {
  EXPECT_EQ(Support::GetLevelLabel(0), WTEXT("<No Detection>"));
  EXPECT_EQ(Support::GetLevelLabel(0xC00000), WTEXT("<No Detection>"));
  EXPECT_EQ(Support::GetLevelLabel(Support::kANSI | Support::kQuickDetect), WTEXT("Quick detection"));
  EXPECT_EQ(Support::GetLevelLabel(Support::kDetect), WTEXT("Fair detection"));
  EXPECT_EQ(Support::GetLevelLabel(Support::kFullDetect), WTEXT("Full detection"));
  EXPECT_EQ(Support::GetLevelLabel(Support::kWholeInOnce), WTEXT("Read whole in once"));
  EXPECT_EQ(Support::GetFavorLabel(0), WTEXT("Use encoding hint and display warning"));
  EXPECT_EQ(Support::GetFavorLabel(Support::kFavorHint), WTEXT("Use encoding hint"));
  EXPECT_EQ(Support::GetFavorLabel(Support::kFavorGuess), WTEXT("Use detected encoding"));
  EXPECT_EQ(Support::GetFlagLabels(Support::kLossless | Support::kXML), WTEXT("Abort on loss, (XML)"));
}

}  // namespace
