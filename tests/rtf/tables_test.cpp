// Font and colour tables: entries, texts, merging.

#include <gtest/gtest.h>

#include "qxcore/core/raise_error.h"
#include "qxcore/graphics/rtf/color_table.h"
#include "qxcore/graphics/rtf/font_table.h"
#include "tests/support/failing_allocations.h"
#include "tests/support/text.h"

namespace {

using Numbers = SMap<int, int>;

std::string ToString(const Numbers& numbers) {
  std::string text;
  for (const auto& [from, to] : numbers) text += std::to_string(from) + ">" + std::to_string(to) + " ";
  return text;
}

struct FontCase {
  const WCHAR* text;
  int number;
  const WCHAR* words;
  const WCHAR* name;  // null: no entry
};

TEST(FontEntry, ReadsWhatWritersWrite) {
  const FontCase cases[] = {
      {WTEXT("{\\f2\\fswiss\\fcharset0 Arial;}"), 2, WTEXT("\\fswiss\\fcharset0"), WTEXT("Arial")},
      {WTEXT("{ \\f0 \\froman\r\n\\fprq2\tTimes New Roman;}"), 0, WTEXT("\\froman\\fprq2"), WTEXT("Times New Roman")},
      {WTEXT("{\\f31\\fnil{\\*\\panose 0202;}Verdana{\\*\\falt Geneva};}"), 31, WTEXT("\\fnil"), WTEXT("Verdana")},
      {WTEXT("{\\flomajor\\f31500\\fbidi \\froman Cambria;}"), 31500, WTEXT("\\flomajor\\fbidi\\froman"),
       WTEXT("Cambria")},
      {WTEXT("{\\f7\\fnil\\'82\\'6c Gothic;}"), 7, WTEXT("\\fnil"), WTEXT("\\'82\\'6c Gothic")},
      {WTEXT("{\\f7\\fnil\\u23435?\\u20307?;}"), 7, WTEXT("\\fnil"), WTEXT("\\u23435?\\u20307?")},
      {WTEXT("{\\f1 A\\\\B;}"), 1, WTEXT(""), WTEXT("A\\\\B")},
      {WTEXT("{\\f-5 X}"), -5, WTEXT(""), WTEXT("X")},
      {WTEXT("{\\f1 Two;;}"), 1, WTEXT(""), WTEXT("Two;")},
      {WTEXT("{\\f99999999999 Big;}"), 2147483647, WTEXT(""), WTEXT("Big")},
      {WTEXT("{\\;\\f3\\ Lone;}"), 3, WTEXT(""), WTEXT("Lone")},
      {WTEXT("{\\f1 Open;"), 1, WTEXT(""), WTEXT("Open")},
      {WTEXT("{\\f1\\fnil;}"), 0, WTEXT(""), nullptr},
      {WTEXT("{\\f1 ;}"), 0, WTEXT(""), nullptr},
      {WTEXT("{\\fnil Arial;}"), 0, WTEXT(""), nullptr},
      {WTEXT("\\f1 Arial;"), 0, WTEXT(""), nullptr},
      {WTEXT(""), 0, WTEXT(""), nullptr},
  };
  for (const FontCase& one : cases) {
    SRtfFontEntry entry{9, WTEXT("old"), WTEXT("\\old")};
    EXPECT_EQ(entry.SetFontEntry(one.text), one.name != nullptr) << testing::PrintToString(SString(one.text));
    EXPECT_EQ(entry.m_number, one.number);
    EXPECT_EQ(entry.m_controlWords, one.words);
    EXPECT_EQ(entry.m_name, SString(one.name));
  }
}

TEST(FontEntry, WritesAndReadsBack) {
  const SRtfFontEntry arial{2, WTEXT("Arial"), WTEXT("\\fswiss\\fcharset0")};
  EXPECT_EQ(arial.GetFontEntry(), WTEXT("{\\f2\\fswiss\\fcharset0 Arial;}"));
  EXPECT_TRUE(arial == (SRtfFontEntry{7, WTEXT("aRIAL"), SString()}));
  EXPECT_FALSE(arial == (SRtfFontEntry{2, WTEXT("Arial "), SString()}));

  SRtfFontTable table;
  EXPECT_EQ(table.GetFontTable(), WTEXT("{\\fonttbl\r\n}\r\n"));
  table.AddFontTable(WTEXT("{\\fonttbl{\\f4\\fswiss Arial;}{\\f9 Courier;}}"));
  EXPECT_EQ(table.GetFontTable(), WTEXT("{\\fonttbl\r\n{\\f0\\fswiss Arial;}\r\n{\\f1 Courier;}\r\n}\r\n"));
  SRtfFontTable again;
  EXPECT_EQ(ToString(again.AddFontTable(table.GetFontTable())), "0>0 1>1 ");
  EXPECT_EQ(again.GetFontTable(), table.GetFontTable());
}

TEST(FontTable, MergesByNameWithoutCase) {
  SRtfFontTable table;
  table.AddFontTable(WTEXT("{\\fonttbl\r\n{\\f0 Times;}\r\n{\\f1 ARIAL;}\r\n}"));
  const SRtfFontTable before = table;
  const Numbers numbers = table.AddFontTable(
      WTEXT("{\\fonttbl {\\f3 arial;} {\\f8 Zapf;}{\\f5\\fnil;}{\\f9 zapf;}{\\f3 Times;}}{\\f6 Late;}"));
  EXPECT_EQ(ToString(numbers), "3>0 8>2 9>2 ");
  EXPECT_EQ(table.GetCount(), 3);
  EXPECT_EQ(table[2].m_number, 2);
  EXPECT_EQ(before.GetCount(), 2);
  EXPECT_TRUE(table.AddFontTable(WTEXT("")).empty());
  EXPECT_TRUE(table.AddFontTable(WTEXT("{\\fonttbl\\f0 Loose;}")).empty());
  table.Clear();
  EXPECT_EQ(table.GetCount(), 0);
}

TEST(ColorEntry, LosesItsSemicolonOnlyAtTheVeryEnd) {
  SRtfColorEntry entry{5, SString()};
  EXPECT_EQ(entry.SetColorEntry(WTEXT("\\red1\\green2\\blue3;")), 1);
  EXPECT_EQ(entry.m_text, WTEXT("\\red1\\green2\\blue3"));
  EXPECT_EQ(entry.m_number, 0);
  EXPECT_EQ(entry.GetColorEntry(), WTEXT("\\red1\\green2\\blue3;"));
  EXPECT_EQ(entry.SetColorEntry(WTEXT("\\red1; \r\n")), 1);
  EXPECT_EQ(entry.m_text, WTEXT("\\red1;"));
  EXPECT_TRUE(entry == (SRtfColorEntry{9, WTEXT("\\red1;")}));
  EXPECT_FALSE(entry == (SRtfColorEntry{0, WTEXT("\\Red1;")}));
  EXPECT_EQ(entry.SetColorEntry(entry.m_text), 1);
  EXPECT_EQ(entry.m_text, WTEXT("\\red1"));
}

TEST(ColorTable, MergesByExactText) {
  SRtfColorTable table;
  EXPECT_EQ(table.GetColorTable(), WTEXT("{\\colortbl\r\n}\r\n"));
  EXPECT_EQ(ToString(table.AddColorTable(WTEXT("{\\colortbl;\\red0\\green0\\blue0;\r\n\\red255\\green0\\blue0 ;}"))),
            "0>0 1>1 2>2 ");
  EXPECT_EQ(table.GetColorTable(),
            WTEXT("{\\colortbl\r\n;\r\n\\red0\\green0\\blue0;\r\n\\red255\\green0\\blue0;\r\n}\r\n"));
  EXPECT_EQ(
      ToString(table.AddColorTable(WTEXT(
          " {\\colortbl \\red255\\green0\\blue0;{\\x a;}\\red9;;{\\y}\r\n\\red255\\green0\\blue0;\\red7 } \\red8;"))),
      "0>2 1>3 2>0 3>2 4>4 ");
  EXPECT_EQ(table[4].m_number, 4);
  EXPECT_EQ(table[4].m_text, WTEXT("\\red7"));
  EXPECT_TRUE(table.AddColorTable(WTEXT("{\\colortblx;;}")).empty());
  EXPECT_TRUE(table.AddColorTable(WTEXT("{{\\colortbl;}")).empty());

  SRtfColorTable again;
  again.AddColorTable(table.GetColorTable());
  EXPECT_EQ(again.GetColorTable(), table.GetColorTable());
  WideString groups(WTEXT("{\\colortbl"));
  for (int i = 0; i < 300000; ++i) groups += WTEXT("{}a");
  EXPECT_EQ(again.AddColorTable(groups.c_str()).size(), 1u);
}

// --- failures ---

SString g_raised;
void KeepRaised(const WCHAR* text) { g_raised = text; }

template <class Table, class Add>
void CheckFailingMerge(const WCHAR* message, Add add) {
  const SErrorReporter former = g_SetErrorReporter(KeepRaised);
  for (long n = 1; n < 10000; ++n) {
    Table table;
    g_raised = SString();
    SMemFailAt(n);
    const Numbers numbers = add(table);
    const bool hasFailed = SMemHasFailed();
    SMemFailAt(0);
    for (const auto& [from, to] : numbers) EXPECT_LT(to, table.GetCount());
    // Strings try again after a failure; what was overcome is no failure of the merge.
    if (numbers.size() == 40) {
      EXPECT_EQ(g_raised, WTEXT(""));
    } else {
      EXPECT_EQ(g_raised, message);
    }
    if (!hasFailed) break;
  }
  g_SetErrorReporter(former);
}

TEST(Tables, AFailedMergeIsReportedAndKeepsWhatItHas) {
  WideString fonts(WTEXT("{\\fonttbl")), colors(WTEXT("{\\colortbl"));
  for (int i = 0; i < 40; ++i) {
    const std::string digits = std::to_string(i);
    const WideString number(digits.begin(), digits.end());
    fonts += WTEXT("{\\f") + number + WTEXT("\\fswiss Name") + number + WTEXT(";}");
    colors += WTEXT("\\red") + number + WTEXT(";");
  }
  CheckFailingMerge<SRtfFontTable>(WTEXT("RTF Font table: Add font table"),
                                   [&](SRtfFontTable& table) { return table.AddFontTable(fonts.c_str()); });
  CheckFailingMerge<SRtfColorTable>(WTEXT("RTF Color table: Add color table"),
                                    [&](SRtfColorTable& table) { return table.AddColorTable(colors.c_str()); });
}

}  // namespace
