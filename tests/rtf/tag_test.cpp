// The tag reader and its two helpers.

#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "qxcore/ui/rtf/document.h"
#include "tests/support/text.h"

namespace {

using Texts = std::vector<WideString>;

// All tags of a text, cut off one after the other as a caller does it.
Texts Tags(WideString text, int wholeGroup) {
  Texts tags;
  WCHAR* start;
  long length;
  while (SRtfDocument::GetNextTag(&start, &length, text.data(), wholeGroup) != 0) {
    tags.emplace_back(start, static_cast<std::size_t>(length));
    EXPECT_EQ(SRtfDocument::RemoveTag(text.data(), start - text.data() + length), 1);
  }
  EXPECT_EQ(length, 0);
  return tags;
}

TEST(Tags, EndWhereTheirKindEnds) {
  EXPECT_EQ(Tags(WTEXT("  \\b0 text"), 0), (Texts{WTEXT("\\b0 "), WTEXT("text")}));
  EXPECT_EQ(Tags(WTEXT("abc\\'e9def{"), 0), (Texts{WTEXT("abc\\'e9def"), WTEXT("{")}));
  EXPECT_EQ(Tags(WTEXT("\\b\\i\tx\\par\r\ny}\\ul{"), 0),
            (Texts{WTEXT("\\b"), WTEXT("\\i\t"), WTEXT("x"), WTEXT("\\par"), WTEXT("y"), WTEXT("}"), WTEXT("\\ul"),
                   WTEXT("{")}));
  EXPECT_EQ(Tags(WTEXT("\\'41 b c\r\n\\"), 0), (Texts{WTEXT("\\'41 b c\r\n"), WTEXT("\\")}));
}

TEST(Tags, EscapesOfTwoCharactersStandForThemselves) {
  EXPECT_EQ(Tags(WTEXT("a\\{b\\}c\\\\d"), 0),
            (Texts{WTEXT("a"), WTEXT("\\{"), WTEXT("b"), WTEXT("\\}"), WTEXT("c"), WTEXT("\\\\"), WTEXT("d")}));
  EXPECT_EQ(Tags(WTEXT("{\\}}{b}"), 1), (Texts{WTEXT("{\\}}"), WTEXT("{b}")}));
}

TEST(Tags, WholeGroupsReachTheirClosingBrace) {
  EXPECT_EQ(Tags(WTEXT("{a{b}c} {d}"), 1), (Texts{WTEXT("{a{b}c}"), WTEXT("{d}")}));
  EXPECT_EQ(Tags(WTEXT("{a}{b}"), 0), (Texts{WTEXT("{"), WTEXT("a"), WTEXT("}"), WTEXT("{"), WTEXT("b"), WTEXT("}")}));
  EXPECT_EQ(Tags(WTEXT("{a{b}"), 1), (Texts{WTEXT("{a{b}")}));
  EXPECT_EQ(Tags(WTEXT("{\\bin3 }}}x}y"), 1), (Texts{WTEXT("{\\bin3 }}}x}"), WTEXT("y")}));
  const WideString deep(1000000, '{');
  EXPECT_EQ(Tags(deep, 1), Texts{deep});
}

TEST(Tags, NothingComesOfNothing) {
  WCHAR* start = nullptr;
  long length = 7;
  WCHAR blanks[] = WTEXT(" \t\r\n");
  EXPECT_EQ(SRtfDocument::GetNextTag(&start, &length, blanks, 0), 0);
  EXPECT_EQ(length, 0);
  EXPECT_EQ(SRtfDocument::GetNextTag(nullptr, &length, blanks, 0), 0);
  EXPECT_EQ(SRtfDocument::GetNextTag(&start, nullptr, blanks, 0), 0);
  EXPECT_EQ(SRtfDocument::GetNextTag(&start, &length, nullptr, 0), 0);

  const SString constant(WTEXT(" \n\\b x"));
  const WCHAR* cursor = constant;
  EXPECT_EQ(SRtfDocument::SkipSpace(&cursor), 1);
  EXPECT_EQ(cursor, constant.GetPointerAt(2));
  EXPECT_EQ(SRtfDocument::SkipSpace(&cursor), 1);
  EXPECT_EQ(cursor, constant.GetPointerAt(2));
  EXPECT_EQ(SRtfDocument::SkipSpace(nullptr), 0);
  EXPECT_EQ(SRtfDocument::GetNextTag(&cursor, &length, constant, 0), 1);
  EXPECT_EQ(length, 3);

  EXPECT_EQ(SRtfDocument::RemoveTag(blanks, 0), 0);
  EXPECT_EQ(SRtfDocument::RemoveTag(nullptr, 1), 0);
  EXPECT_EQ(SRtfDocument::RemoveTag(blanks, 3), 1);
  EXPECT_EQ(SString(blanks), WTEXT("\n"));
  EXPECT_EQ(SRtfDocument::RemoveTag(blanks, 100), 1);
  EXPECT_EQ(blanks[0], 0);
}

}  // namespace
