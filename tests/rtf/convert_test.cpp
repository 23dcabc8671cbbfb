// Conversions through the control. What both targets do alike; what only the portable control promises is
// tested on Linux (see corpus_test.py as well).

#include <gtest/gtest.h>

#include "qxcore/ui/rtf/document.h"
#include "tests/rtf/rtf_file.h"
#include "tests/support/failing_allocations.h"
#include "tests/support/text.h"

namespace {

SString ToText(const SString& rtf) {
  SRtfDocument document;
  SString text;
  const int result = document.RtfToText(&text, rtf);
  EXPECT_EQ(result, !text.IsEmpty());
  return text;
}
SString ToRtf(const SString& text) {
  SRtfDocument document;
  SString rtf;
  EXPECT_EQ(document.TextToRtf(&rtf, text), 1);
  return rtf;
}
SString Body(const WCHAR* body) {
  return SString(WTEXT("{\\rtf1\\ansi\\ansicpg1252\\deff0{\\fonttbl{\\f0\\fnil\\fcharset0 Arial;}"
                       "{\\f1\\fnil\\fcharset204 Arial Cyr;}{\\f2\\fnil\\fcharset128 Gothic;}}\\pard\\f0 ")) +
         body + WTEXT("}");
}

TEST(Conversion, HandsTextAndRtfThrough) {
  EXPECT_EQ(ToText(Body(WTEXT("a\\b b\\b0  c\\par d\\tab e\\par"))), WTEXT("ab c\r\nd\te"));
  EXPECT_EQ(ToText(Body(WTEXT("\\'e9\\u8364?\\{\\}\\\\\\~{\\f1\\'e6}{\\*\\unknown x}"))),
            WTEXT("\x00E9\x20AC{}\\\x00A0\x0436"));
  const SString plain(WTEXT("one\r\n\r\n{two} \\three \x00E9\x4E2D"));
  EXPECT_EQ(ToText(plain), plain);
  const SString rtf = ToRtf(plain);
  EXPECT_TRUE(rtf.IsRtf());
  EXPECT_EQ(ToText(rtf), plain);
  EXPECT_TRUE(ToRtf(rtf).IsRtf());
  EXPECT_EQ(ToText(ToRtf(rtf)), plain);

  // Characters that are no ASCII stand for themselves, whatever the number of substitutes.
  EXPECT_EQ(ToText(Body(WTEXT("\\uc3 a\x4E2D!b"))), WTEXT("a\x4E2D!b"));
  SString own(Body(WTEXT("own")));
  SRtfDocument document, copy(document);
  EXPECT_EQ(document.RtfToText(&own, own), 1);
  EXPECT_EQ(own, WTEXT("own"));
  EXPECT_EQ(document.RtfToText(nullptr, own), 0);
  EXPECT_EQ(document.RtfToText(&own, WTEXT("")), 1);
  EXPECT_EQ(own, WTEXT(""));
  EXPECT_EQ(document.CreateEditCtrl(), 1);
  EXPECT_EQ(document.CreateEditCtrl(), 1);
  copy = document;
  document.DeleteEditCtrl();
  document.DeleteEditCtrl();
  EXPECT_EQ(copy.RtfToText(&own, WTEXT("again")), 1);
  EXPECT_EQ(own, WTEXT("again"));
}

#ifndef _WIN32

struct ReaderCase {
  const char* rtf;
  const WCHAR* text;
};

TEST(PortableReader, ReadsWhatTheFormatSays) {
  const ReaderCase cases[] = {
      // Bytes: lead and trail in every form, a code page of long sequences, control characters.
      {"{\\f2\\'82\\'a0\\'82o\\'82\r\n\\'a2}", WTEXT("\x3042\xFF30\x3044")},
      {"{\\f2\\'83\\\\\\'83\\{}", WTEXT("\x30BD\x30DC")},
      {"\\'a\\'4x\\'0d\\'09y", WTEXT("x\r\n\ty")},
      // Unicode with its substitutes.
      {"\\u1078?\\uc2\\u1078ab{\\uc0\\u1078}c\\u1078\\'41\\'42d", WTEXT("\x0436\x0436\x0436"
                                                                        "c\x0436"
                                                                        "d")},
      {"\\u-10179 ?\\u-8704 ?\\u1078{?}\\u1078\\b ?x", WTEXT("\xD83D\xDE00\x0436?\x0436?x")},
      {"{\\upr{ansi}{\\*\\ud{uni}}}", WTEXT("uni")},
      // Binary data, destinations, stars that begin nothing.
      {"a{\\pict\\bin3 }}{}b{\\bin9999 c", WTEXT("ab")},
      {"{\\header h}{\\*\\bkmkstart b}{\\info{\\title t}}{\\object{\\*\\objdata 00}{\\result r}}\\*\\cs1 s",
       WTEXT("rs")},
      {"{\\field{\\*\\fldinst HYPERLINK \"x\"}{\\fldrslt \\*\\cs2 link}}", WTEXT("link")},
      // Tables and ends.
      {"\\trowd a\\cell b\\cell\\row\\trowd\\cell\\cell\\row\\pard c\\line d\\page e\\sect\\\nf",
       WTEXT("a\tb\r\n\t\r\nc\r\nd\fe\r\n\r\nf")},
      {"a\\nestcell b\\nestcell{\\*\\nesttableprops\\nestrow}{\\nonesttables\\par}\\cell\\row", WTEXT("a\tb\r\n")},
      {"{\\pntext\\f0\\'b7\\tab}one\\par{\\listtext 2.\\tab}two", WTEXT("\x00B7\tone\r\n2.\ttwo")},
      {"\\emdash\\lquote\\bullet\\-\\_\\zwj", WTEXT("\x2014\x2018\x2022\x00AD\x2011\x200D")},
      // Behind the document there is nothing.
      {"a}}}b", WTEXT("a")},
  };
  for (const ReaderCase& one : cases) {
    const SString rtf = Body(WTEXT("")).Left(Body(WTEXT("")).Length() - 1) + Widen(one.rtf) + WTEXT("}");
    EXPECT_EQ(ToText(rtf), one.text) << one.rtf;
    EXPECT_EQ(ToText(ToRtf(rtf)), one.text) << one.rtf;
  }
}

TEST(PortableReader, KeepsFormatsWhenItWritesAnew) {
  const SString rtf =
      ToRtf(WTEXT("{\\rtf1\\deff7{\\fonttbl{\\f7\\froman\\fcharset204 Times;}{\\f9\\fswiss\\fcharset0 Arial;}}"
                  "{\\colortbl;\\red1\\green2\\blue3;}\\pard\\qc\\li360 x{\\f9\\b\\cf1\\fs30 y}\\i z\\par}"));
  EXPECT_EQ(
      rtf,
      WTEXT("{\\rtf1\\ansi\\ansicpg1252\\deff0{\\fonttbl{\\f0\\froman\\fcharset204 Times;}"
            "{\\f1\\fswiss\\fcharset0 Arial;}}\r\n{\\colortbl ;\\red1\\green2\\blue3;}\r\n\\uc1"
            "\\pard\\qc\\li360 \\plain\\f0\\fs24 x\\plain\\f1\\fs30\\cf1\\b y\\plain\\f0\\fs24\\i z\\par\r\n}\r\n"));
  EXPECT_EQ(ToRtf(rtf), rtf);
}

TEST(PortableReader, TakesAnyDepthAndAnyNumberOfFonts) {
  WideString deep(WTEXT("{\\rtf1 "));
  for (int i = 0; i < 1000000; ++i) deep += i % 2 == 0 ? WTEXT("{\\b") : WTEXT("{");
  EXPECT_EQ(ToText((deep + WTEXT("x")).c_str()), WTEXT("x"));
  WideString fonts(WTEXT("{\\rtf1{\\fonttbl"));
  for (int i = 0; i < 20000; ++i) fonts += WTEXT("{\\f1 A;}");
  fonts += WTEXT("}");
  for (int i = 0; i < 20000; ++i) fonts += WTEXT("\\f1 x");
  EXPECT_EQ(ToText(fonts.c_str()).Length(), 20000);
}

// Every cut of every real document.
TEST(PortableReader, ReadsCutDocuments) {
  const char* corpus = std::getenv("QXCORE_CORPUS");
  if (corpus == nullptr) {
    std::printf("left out: cut RTF documents, because QXCORE_CORPUS is not set\n");
    return;
  }
  SRtfDocument document;
  int cuts = 0;
  for (const auto& entry : std::filesystem::directory_iterator(std::filesystem::path(corpus) / "rtf" / "files")) {
    const SString whole = ReadRtfFile(entry.path());
    SString text;
    for (int length = 0; length < whole.Length(); length += 64, ++cuts) {
      const int result = document.RtfToText(&text, whole.Left(length));
      ASSERT_EQ(result, length == 0 || !text.IsEmpty()) << entry.path();
    }
  }
  EXPECT_GT(cuts, 10000);
}

#endif

}  // namespace
