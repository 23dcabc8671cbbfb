// Writing text in any encoding, and reading it back.

#include "qxcore/stream/output_string_stream.h"

#include "qxcore/core/io_exceptions.h"
#include "tests/stream/reader_fixture.h"

using namespace std::string_literals;

namespace {

std::string Written(const SString& text, Encoding format, WCHAR replacement = WTEXT('?'), int piece = 0) {
  CollectingOutput out;
  std::string closed;
  {
    SOutputStringStream stream(out, format);
    const WCHAR former = stream.GetReplacement();
    EXPECT_EQ(stream.SetReplacement(replacement), former);
    EXPECT_EQ(stream.GetReplacement(), replacement);
    for (int at = 0; at < text.Length(); at += piece) {
      int count = piece > 0 ? std::min(piece, text.Length() - at) : text.Length();
      stream.Write(text.GetPointerAt(at), static_cast<unsigned>(count));
      if (piece == 0) break;
    }
    stream.Close();
    closed = out.bytes;
    stream.Close();
  }
  EXPECT_EQ(out.bytes, closed) << "what was closed writes no more";
  return closed;
}

TEST(TextOutput, EveryFormat_ReadsBackWhatWasWritten) {
  const SString ascii = WTEXT("plain\r\ntext");
  const SString latin = WTEXT("na\u00EFve \u20AC ") + ascii;
  const SString any = WTEXT("\u0416 \u4E2D \u00E9 ") + latin;
  const SString kana = WTEXT("\u30A2\u30A4 ") + ascii;
  const struct {
    Encoding format;
    SString text;
  } kCases[] = {{Support::kASCII, ascii}, {Support::kANSI, latin},  {0x20000 | 932, kana}, {Support::kOEM, ascii},
                {Support::kUTF8, any},    {0x4000C, any},           {0x4001C, any},        {Support::kUTF16LE, any},
                {0x4001A, any},           {Support::kUTF16BE, any}, {0x40019, any}};
  for (const auto& one : kCases) {
    SString longText;
    for (int i = 0; i < 500; ++i) longText += one.text;
    std::string bytes = Written(longText, one.format);
    EXPECT_EQ(ReadBytes(bytes, one.format).text, longText) << std::hex << one.format;
    for (int piece : {1, 3, 1000}) EXPECT_EQ(Written(longText, one.format, WTEXT('?'), piece), bytes);
  }
}

// Either flag asks for a mark, and only 16-bit and UTF-8 forms have one.
TEST(TextOutput, MarksStandAtTheBeginningOnly) {
  const struct {
    Encoding form;
    std::string mark;
  } kForms[] = {{Support::kUTF8, "\xEF\xBB\xBF"},
                {Support::kUTF16LE, "\xFF\xFE"},
                {Support::kUTF16BE, "\xFE\xFF"},
                {Support::kANSI, ""},
                {Support::kASCII, ""}};
  for (const auto& [form, mark] : kForms) {
    for (const Encoding flags : {Encoding{0}, Encoding{Support::kOptionalBOM}, Encoding{Support::kRequiredBOM},
                                 Encoding{Support::kOptionalBOM | Support::kRequiredBOM}}) {
      if (flags != 0 && mark.empty()) continue;  // the bits mean other things there
      const std::string expected = flags != 0 ? mark : std::string();
      EXPECT_EQ(Written(SString(), form | flags), expected) << std::hex << form << " " << flags;
    }
  }
  EXPECT_EQ(Written(SString(), 0x4001C), "\xEF\xBB\xBF");
  EXPECT_EQ(Written(SString(), 0x4000A), "\xFF\xFE");
  EXPECT_EQ(Written(WTEXT("a"), Support::kUTF8), "a");
  CollectingOutput out;
  SOutputStringStream stream(out, 0x4001C);
  stream.WriteLn(WTEXT("a"), 1);
  stream.SetFormat(0x40019);
  stream.Write('b');
  stream.Close();
  EXPECT_EQ(out.bytes, std::string("\xEF\xBB\xBF"
                                   "a\r\n\0b",
                                   8));
  EXPECT_THROW(stream.SetFormat(0x20000 | 9999), SEIOInvalidEncoding);
}

TEST(TextOutput, Surrogates_PairAcrossCalls) {
  const SString face = WTEXT("\xD83D\xDE00");
  EXPECT_EQ(Written(face, Support::kUTF8, WTEXT('?'), 1), "\xF0\x9F\x98\x80");
  EXPECT_EQ(Written(WTEXT("a\xD83D"), Support::kUTF8), "a?");
  EXPECT_EQ(Written(WTEXT("\xDE00z"), Support::kUTF8, WTEXT('?'), 1), "?z");
  EXPECT_EQ(Written(face + WTEXT("!"), Support::kANSI), "?!") << "one character, one replacement";
  EXPECT_EQ(Written(face, Support::kUTF16BE, WTEXT('?'), 1), "\xD8\x3D\xDE\x00"s);
}

TEST(TextOutput, Losses_AreToldOrThrown) {
  CollectingOutput out;
  SOutputStringStream stream(out, Support::kANSI);
  stream.Write(SString(WTEXT("a\u4E2Db")));
  EXPECT_EQ(
      stream.GetEncodingWarning(),
      WTEXT(
          "Some characters were replaced by '?' during write because they could not be mapped from character set used ")
          WTEXT("by the application \"Unicode\" to write encoding format \"ANSI (Active Code Page)\"."));
  EXPECT_EQ(out.bytes, "a?b");
  EXPECT_EQ(Written(WTEXT("a\u4E2Db"), Support::kANSI, 0), "ab");
  EXPECT_EQ(Written(WTEXT("a\u4E2Db"), Support::kASCII, WTEXT('\u00E9')), "a?b")
      << "a replacement that cannot be mapped either";
  SOutputStringStream lossless(out, Support::kOEM | Support::kLossless);
  EXPECT_THROW(lossless.Write(SString(WTEXT("x\u4E2D"))), SEIOCantMap_UTF16_MBCS);
  EXPECT_EQ(out.bytes, "a?bx");
  SOutputStringStream ascii(out, Support::kASCII | Support::kLossless);
  EXPECT_THROW(ascii.Write(0xE9), SEIONonASCII);
  SOutputStringStream utf8(out, Support::kUTF8 | Support::kLossless);
  EXPECT_THROW(utf8.Write(SString(WTEXT("\xDC00"))), SEIOCantMap_UTF16_UTF8);
}

TEST(TextOutput, WithoutTarget_KeepsTheText) {
  SOutputStringStream stream;
  stream.WriteLn(WTEXT("kept"), 4);
  SString text;
  EXPECT_EQ(stream.GetString(&text), 1);
  EXPECT_EQ(text, WTEXT("kept\r\n"));
  CollectingOutput out;
  EXPECT_EQ(SOutputStringStream(out).GetString(&text), 0);
}

}  // namespace
