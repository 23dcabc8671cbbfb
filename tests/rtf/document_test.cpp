// Parts of a document, and references that are renumbered.

#include "qxcore/ui/rtf/document.h"

#include <gtest/gtest.h>

#include "tests/support/text.h"

namespace {

using Numbers = SMap<int, int>;

TEST(Parts, AreHandedOutAndCut) {
  const WideString head(
      WTEXT("{\\rtf1\\ansi\\ansicpg1252\\uc2\\deff0\r\n"
            "{\\fonttbl{\\f0 Times;}}{\\colortbl;\\red9;}\n{\\stylesheet{\\s0\\f0 Normal;}}"
            "{\\*\\generator X 1.0;}{\\info{\\title }}\r\n"));
  const WideString body(WTEXT("\\viewkind4\\pard {\\fonttbl text}\\par}"));
  SString rtf((head + body).c_str()), part;
  EXPECT_EQ(SRtfDocument::ExtractHeader(rtf, part, 0), 1);
  EXPECT_EQ(part, SStringView(head));
  EXPECT_EQ(SRtfDocument::ExtractStyleTable(rtf, part, 0), 1);
  EXPECT_EQ(part, WTEXT("{\\stylesheet{\\s0\\f0 Normal;}}"));
  EXPECT_EQ(SRtfDocument::ExtractColorTable(rtf, part, 0), 1);
  EXPECT_EQ(part, WTEXT("{\\colortbl;\\red9;}"));
  EXPECT_EQ(rtf, SStringView(head + body));

  EXPECT_EQ(SRtfDocument::ExtractFontTable(rtf, part, 1), 1);
  EXPECT_EQ(part, WTEXT("{\\fonttbl{\\f0 Times;}}"));
  EXPECT_EQ(rtf.FindNoCase(WTEXT("Times")), nullptr);
  EXPECT_EQ(SRtfDocument::ExtractHeader(rtf, part, 1), 1);
  EXPECT_EQ(rtf, SStringView(WTEXT("\\uc2 ") + body));
  EXPECT_EQ(SRtfDocument::ExtractHeader(rtf, part, 1), 0);
  EXPECT_EQ(part, WTEXT(""));
  EXPECT_EQ(SRtfDocument::ExtractStyleTable(rtf, part, 1), 0);
  EXPECT_EQ(rtf, SStringView(WTEXT("\\uc2 ") + body));
}

TEST(Parts, AreFoundInOddTexts) {
  SString part;
  SString loose(WTEXT("{\\fonttbl\\f0\\fswiss\\fcharset0 Helvetica;\\f1\\fnil{\\*\\panose 02;}Monaco;\n\\f2 Open}"));
  EXPECT_EQ(SRtfDocument::ExtractFontTable(loose, part, 0), 1);
  EXPECT_EQ(part,
            WTEXT("{\\fonttbl{\\f0\\fswiss\\fcharset0 Helvetica;}{\\f1\\fnil{\\*\\panose 02;}Monaco;}{\\f2 Open;}}"));
  SString starred(WTEXT("{ \\* \\fonttbl{\\f0 A;}}"));
  EXPECT_EQ(SRtfDocument::ExtractFontTable(starred, part, 0), 1);
  EXPECT_EQ(part, WTEXT("{\\fonttbl{\\f0 A;}}")) << "as merging reads it";
  SString binary(WTEXT("{\\fonttbl\\f0 A;{\\f1 B;}\\bin3 }}}\\f2 C;}"));
  EXPECT_EQ(SRtfDocument::ExtractFontTable(binary, part, 0), 1);
  EXPECT_EQ(part, binary) << "handed out as it is";
  SString hidden(WTEXT("{\\rtf1 \\{\\fonttbl a\\\\{ {\\bin14 {\\fonttbl{\\f0}}{ \\* \\colortbl;;}"));
  EXPECT_EQ(SRtfDocument::ExtractFontTable(hidden, part, 0), 0);
  EXPECT_EQ(SRtfDocument::ExtractColorTable(hidden, part, 0), 1);
  EXPECT_EQ(part, WTEXT("{ \\* \\colortbl;;}"));
  SString blank(WTEXT(" {\\urtf1\\ansi text}"));
  EXPECT_EQ(SRtfDocument::ExtractHeader(blank, part, 0), 1);
  EXPECT_EQ(part, WTEXT(" {\\urtf1\\ansi "));
  SString plain(WTEXT("{\\pard text}"));
  EXPECT_EQ(SRtfDocument::ExtractHeader(plain, part, 0), 0);
}

TEST(References, AreRenumberedWhereTheyAreReferences) {
  const Numbers fonts{{0, 3}, {1, 10}, {12, 1}}, colors{{0, 4}, {1, 2}};
  SString result;
  const auto change = [&](const WCHAR* text) {
    EXPECT_EQ(SRtfDocument::ChangeFontAndColor(text, result, fonts, colors), 1);
    return result;
  };
  EXPECT_EQ(change(WTEXT("\\f0\\fs1\\f1 a\\f12b\\f2 c\\cf1\\cb0 d")), WTEXT("\\f3\\fs1\\f10 a\\f1b\\f2 c\\cf2\\cb4 d"));
  EXPECT_EQ(change(WTEXT("{{\\stylesheet{\\s1\\f1\\cf0 x;}}{\\*\\listtable{\\list{\\listlevel\\f12}}}")),
            WTEXT("{{\\stylesheet{\\s1\\f10\\cf4 x;}}{\\*\\listtable{\\list{\\listlevel\\f1}}}"));
  const WCHAR* const untouched[] = {WTEXT("a \\\\f0 \\{\\}f0 \\'f0 \\fi0\\f\\cf"),
                                    WTEXT("{\\fonttbl{\\f0 A;}{\\f1 B;}}"),
                                    WTEXT("{\\colortbl;\\cf0;}"),
                                    WTEXT("{\\pict\\bin6 \\f0\\f1}"),
                                    WTEXT("\\f77777777777 \\f-1 \\u0 \\uc1 \\bin"),
                                    WTEXT("\\"),
                                    WTEXT("")};
  for (const WCHAR* text : untouched) EXPECT_EQ(change(text), text);

  SString own(WTEXT("\\deff1\\highlight1 "));
  EXPECT_EQ(SRtfDocument::ChangeFontAndColor(own, own, fonts, colors), 1);
  EXPECT_EQ(own, WTEXT("\\deff10\\highlight2 "));
}

}  // namespace
