// What the multi-format reader makes of bytes: selection, cuts, losses, positions.

#include "qxcore/stream/encoding/multi_format_reader_unicode.h"

#include <vector>

#include "qxcore/core/internal/memory_failures.h"
#include "qxcore/core/io_exceptions.h"
#include "tests/stream/reader_fixture.h"
#include "tests/support/failing_allocations.h"
#include "tests/support/steps.h"
#include "tests/support/wine.h"

using namespace std::string_literals;

namespace {

constexpr Encoding kFull = Support::kFullDetect;
constexpr Encoding kAnsi = Support::kANSI;

std::string Repeat(const std::string& unit, std::size_t times) {
  std::string text;
  while (times-- > 0) text += unit;
  return text;
}

// --- selection ---

TEST(Selection, MarksAndDeclarations_Decide) {
  const std::string body = "plain text, long enough";
  EXPECT_EQ(ReadBytes("\xEF\xBB\xBF" + body, kAnsi | kFull).selected, 0xE4000Cu);
  EXPECT_EQ(ReadBytes("\xEF\xBB\xBF" + body, kAnsi | kFull).text, SString(body.c_str()));
  EXPECT_EQ(ReadBytes("\xFF\xFE" + Utf16Bytes(WTEXT("text")), kAnsi | kFull).selected, 0xE4000Au);
  EXPECT_EQ(ReadBytes("\xFE\xFF" + Utf16Bytes(WTEXT("text"), true), kAnsi | kFull).text, WTEXT("text"));
  EXPECT_EQ(ReadBytes("<?xml version='1.0'?>", kAnsi | kFull).selected, 0x2E10000u);
  EXPECT_EQ(ReadBytes("<?xml version='1.0'?>\xC3\xA9", kAnsi | kFull | Support::kFavorGuess).selected, 0x6E40004u)
      << "the guess keeps the XML flag";
  EXPECT_EQ(ReadBytes("\xEF\xBB\xBF<?xml version='1.0'?>", kAnsi | kFull).selected, 0x2E4000Cu);
  EXPECT_EQ(ReadBytes(Utf16Bytes(WTEXT("<?xml version='1.0'?>")), kAnsi | kFull).selected, 0x2E40002u);
  EXPECT_EQ(ReadBytes(Utf16Bytes(WTEXT("<?xml version='1.0'?>"), true), kAnsi | kFull).selected, 0x2E40001u);
  EXPECT_EQ(ReadBytes("\xEF\xBB\xBF<?xml v?", kAnsi | kFull).selected, 0x2E4000Cu) << "eleven bytes, the mark included";
  EXPECT_EQ(ReadBytes("<?xml", kAnsi | kFull).selected, 0xE10000u) << "too short for a declaration";
  const std::string wide = Utf16Bytes(WTEXT("<?xml version='1.0'?>"));
  EXPECT_EQ(ReadBytes("\xFF\xFE" + wide, kAnsi | kFull).selected, 0x2E4000Au);
  EXPECT_EQ(ReadBytes("\xFE\xFF" + wide, kAnsi | kFull).selected, 0xE40009u) << "a declaration in another form is none";
  EXPECT_EQ(ReadBytes("\xEF\xBB\xBF" + wide, kAnsi | kFull).selected, 0xE4000Cu);
}

TEST(Selection, ShortInputs_AreNotDetected) {
  EXPECT_EQ(ReadBytes("\xC3\xA9", kAnsi | kFull).selected, kAnsi | kFull);
  EXPECT_EQ(ReadBytes("", kAnsi | kFull).text, WTEXT(""));
  EXPECT_EQ(ReadBytes("\xFF\xFE", Support::kUTF16LE | kFull).text, WTEXT("\uFEFF"));
}

TEST(Selection, LevelsWithoutMeaning_DetectNothing) {
  const std::string utf8 = Repeat("\xC3\xA9t\xC3\xA9 ", 20);
  EXPECT_EQ(ReadBytes(utf8, kAnsi | 0xC00000).selected, kAnsi | 0xC00000);
  EXPECT_EQ(ReadBytes(utf8, kAnsi).selected, kAnsi);
  for (Encoding level : {0x200000u, 0x400000u, 0x600000u, 0x800000u, 0xA00000u, 0xE00000u}) {
    EXPECT_EQ(ReadBytes(utf8, Support::kOEM | level).selected, level | Support::kUTF8) << std::hex << level;
  }
}

TEST(Selection, RequiredMark_MustBeThereAndFit) {
  EXPECT_EQ(ReadBytes("abc", 0x4001C).failure, std::to_string(0x80990057u) + "SEIONoUnicodeBOM");
  EXPECT_EQ(ReadBytes("\xFE\xFF"
                      "ab",
                      0x4001A)
                .failure,
            std::to_string(0x80990058u) + "SEIOMismatchedBOM");
  EXPECT_EQ(ReadBytes("\xFF\xFE"
                      "a\0"s,
                      0x4001A)
                .text,
            WTEXT("a"));
  EXPECT_EQ(ReadBytes("\xFE\xFF\0a"s, 0x4001A | kFull).selected, 0xE40009u) << "with detection the mark wins";
  // Nothing is lost by a failed check: another request reads everything.
  PiecewiseInput in("plain");
  SMultiFormatReaderUnicode reader(in, 0x4001C);
  EXPECT_THROW(reader.Read(), SEIONoUnicodeBOM);
  EXPECT_THROW(reader.Read(), SEIONoUnicodeBOM);
  EXPECT_EQ(reader.GetFormat(), 0u);
  reader.SetFormat(kAnsi);
  EXPECT_EQ(reader.ReadAll(), WTEXT("plain"));
}

TEST(Selection, OptionalMark_IsDroppedAlsoWithoutDetection) {
  EXPECT_EQ(ReadBytes("\xEF\xBB\xBF"
                      "abc",
                      0x4000C)
                .text,
            WTEXT("abc"));
  EXPECT_EQ(ReadBytes("\xEF\xBB\xBF"
                      "abc",
                      Support::kUTF8)
                .text,
            WTEXT("\uFEFFabc"));
  EXPECT_EQ(ReadBytes("\xFE\xFF"
                      "ab",
                      0x4000A)
                .text.Length(),
            2)
      << "a mark of another form is data";
}

TEST(Selection, UnsupportedRequests_SayWhich) {
  EXPECT_EQ(ReadBytes("abc", 0).failure, std::to_string(0x80990059u) + "SEIODetectFailed");
  EXPECT_EQ(ReadBytes("abc", 0x20000 | 9999).failure, std::to_string(0x8099005Au) + "SEIOInvalidEncoding");
  EXPECT_EQ(ReadBytes("abc", 0x40003).failure, std::to_string(0x80990056u) + "SEEncodingException");
  EXPECT_EQ(ReadBytes("abc", 0).detection, WTEXT("Autodetection failed to select an encoding!"));
  EXPECT_EQ(ReadBytes("ab", kFull).detection, WTEXT("Autodetection failed to select an encoding!"));
  EXPECT_EQ(ReadBytes("abc", 0x20000 | 9999).detection, WTEXT("")) << "nothing was to be detected";
}

TEST(Selection, Evidence_DecidesBetweenCandidates) {
  const std::string utf8 = Repeat("\xC3\xA9t\xC3\xA9 \xE2\x82\xAC ", 20);
  const std::string latin = Repeat("\xE9t\xE9 ", 20);
  EXPECT_EQ(ReadBytes(utf8, kAnsi | kFull | Support::kFavorGuess).selected & 0xFFFFF, Support::kUTF8);
  EXPECT_EQ(ReadBytes(latin, Support::kUTF8 | kFull).selected & 0xFFFFF, kAnsi);
  EXPECT_EQ(ReadBytes("only ascii here", 0x204E4 | kFull).selected & 0xFFFFF, Support::kASCII);
  // Odd lengths are never UTF-16.
  std::string odd = Utf16Bytes(WTEXT("\u0416\u0438\u0442\u044C x")) + "!";
  EXPECT_NE(ReadBytes(odd, kAnsi | kFull).selected & 0xF0000, Support::kUnicode);
  // A hint that names a code page is not acceptable by rule; an equal guess is no warning.
  EXPECT_EQ(ReadBytes(latin, 0x204E4 | kFull).selected & 0xFFFFF, 0x204E4u) << "a tie gives the hint";
  EXPECT_NE(ReadBytes(latin, 0x204E4 | kFull).detection, WTEXT(""));
  // Four-byte sequences reject UTF-8.
  EXPECT_EQ(ReadBytes("grinning \xF0\x9F\x98\x80 face", Support::kUTF8 | kFull).selected & 0xFFFFF, kAnsi);
}

TEST(Selection, Utf16WithoutMark_IsFoundByThePlatformsTests) {
  const std::string greek =
      Utf16Bytes(WTEXT("\u03BA\u03B1\u03BB\u03B7\u03BC\u03AD\u03C1\u03B1 \u03BA\u03CC\u03C3\u03BC\u03B5\r\n"));
  Encoding ascii = ReadBytes(Utf16Bytes(WTEXT("Hello, world of plain letters\r\n")), kAnsi | kFull).selected & 0xFFFFF;
  if (IsWine()) {
    EXPECT_EQ(ascii, Support::kASCII) << "Wine 8 never reports the ASCII16 tests";
  } else {
    EXPECT_EQ(ascii, 0x4000Au);
  }
  EXPECT_EQ(ReadBytes(Utf16Bytes(WTEXT("Hello, world of plain letters\r\n"), true), kAnsi | kFull).selected & 0xF0000,
            IsWine() ? Support::kASCII : Support::kUnicode);
  EXPECT_EQ(ReadBytes(greek, kAnsi | kFull).selected & 0xFFFF7, Support::kUTF16LE);
  EXPECT_EQ(ReadBytes(greek, kAnsi | kFull).text.Length(), static_cast<int>(greek.size() / 2));
}

TEST(Reports, SayHowTheSelectionCameAbout) {
  const std::string latin = Repeat("\xE9t\xE9 ", 20);
  const std::string utf8 = Repeat("\xC3\xA9t\xC3\xA9 ", 20);
  EXPECT_EQ(
      ReadBytes("plain", kAnsi | kFull).report,
      WTEXT("Autodetection found that all data could be read with \"ASCII\" encoding even though \"ANSI (Active Code ")
          WTEXT("Page)\" encoding was expected"));
  EXPECT_EQ(
      ReadBytes(latin, Support::kUTF8 | kFull).report,
      WTEXT(
          "Autodetection found that most probable encoding was \"ANSI (Active Code Page)\" and selected it since the ")
          WTEXT("expected \"UTF-8\" encoding was not acceptable"));
  SString favored = ReadBytes(utf8, kAnsi | kFull).detection;
  EXPECT_EQ(favored.Left(58), WTEXT("Autodetection found that most probable encoding was \"UTF-8"));
  EXPECT_NE(favored.Find(WTEXT("the hint was favored over detection's guess")), nullptr);
  EXPECT_EQ(ReadBytes(utf8, kAnsi | kFull).selected & 0xFFFFF, kAnsi) << "an acceptable hint wins";
  EXPECT_TRUE(ReadBytes(utf8, kAnsi | kFull | Support::kFavorHint).detection.IsEmpty());
  EXPECT_TRUE(ReadBytes(utf8, kAnsi | kFull | Support::kFavorGuess).detection.IsEmpty());
}

TEST(Selection, ProvisionalASCII_IsLookedAtAgain) {
  for (std::size_t plain : {4094u, 4095u, 4096u, 4097u, 10000u, 70000u}) {
    std::string bytes = std::string(plain, 'a') + "\xC3\xA9";
    for (Encoding level : {Support::kQuickDetect, Support::kDetect}) {
      ReadResult result = ReadBytes(bytes, kAnsi | level | Support::kFavorGuess);
      EXPECT_EQ(result.selected & 0xFFFFF, Support::kUTF8) << plain << std::hex << level;
      EXPECT_EQ(result.text.Length(), static_cast<int>(plain) + 1);
      EXPECT_TRUE(result.loss.IsEmpty());
    }
  }
  ReadResult ascii = ReadBytes(std::string(50000, 'a'), kAnsi | Support::kQuickDetect);
  EXPECT_EQ(ascii.selected & 0xFFFFF, Support::kASCII);
  // A mark in the middle of the data is a character.
  ReadResult late =
      ReadBytes(std::string(4096, 'a') + "\xEF\xBB\xBFz", kAnsi | Support::kQuickDetect | Support::kFavorGuess);
  EXPECT_EQ(late.text.Right(2), WTEXT("\uFEFFz"));
}

// --- the same text, however it is handed out ---

std::vector<std::string> Samples() {
  RandomText random(11);
  std::vector<std::string> samples = {"", "a", "ab\n"};
  const std::vector<std::vector<std::string>> alphabets = {
      {"a", "b", "\r\n", " "},
      {"a", "\xC3\xA9", "\xE2\x82\xAC", "\xE4\xB8\xAD"},
      {"a", "\xC3\xA9", "\xF0\x9F\x98\x80"},
      {"a", "\xE9", "\xFC", "\x80"},
      {"a", "\xC3", "\xA9", "\xE2", "\xF5", "\x80"},
      {std::string("a\0", 2), std::string("\x16\x04", 2), "\x3D\xD8", std::string("\n\0", 2)},
      {"\x83\x41", "\x88\x9F", "a", "\xB1", "\x83"},
      {std::string("\0", 1), "a", "\xFF"}};
  for (const auto& alphabet : alphabets) {
    for (std::size_t length : {20u, 5000u, 40000u}) {
      std::string bytes;
      while (bytes.size() < length)
        bytes += alphabet[static_cast<std::size_t>(random.Number(static_cast<int>(alphabet.size())))];
      samples.push_back(bytes);
      samples.push_back(std::string(4090, 'x') + bytes);
    }
  }
  return samples;
}

constexpr Encoding kRequests[] = {kAnsi | kFull,
                                  kAnsi | Support::kQuickDetect,
                                  kAnsi | Support::kDetect | Support::kFavorGuess,
                                  Support::kUTF8,
                                  Support::kUTF8 | kFull,
                                  Support::kUTF8 | Support::kLossless,
                                  Support::kUTF16LE,
                                  Support::kUTF16BE | Support::kLossless,
                                  Support::kOEM | Support::kFavorHint | kFull,
                                  0x20000 | 932,
                                  0x20000 | 932 | Support::kLossless,
                                  Support::kASCII,
                                  Support::kASCII | Support::kLossless,
                                  0x4001C,
                                  0x20000 | 932 | kFull,
                                  0x204E4 | Support::kQuickDetect};

TEST(Reading, PiecesOfTheSource_NeverShow) {
  for (const std::string& sample : Samples()) {
    for (Encoding request : kRequests) {
      ReadResult whole = ReadBytes(sample, request);
      for (unsigned long piece : {1ul, 7ul, 4096ul}) {
        if (piece == 1 && sample.size() > 6000) continue;
        ASSERT_EQ(ReadBytes(sample, request, piece, static_cast<int>(piece % 3)), whole)
            << "request " << std::hex << request << std::dec << ", pieces of " << piece << ", " << sample.size()
            << " bytes";
      }
    }
  }
}

TEST(Reading, CutSequences_DecodeLikeUncutOnes) {
  const struct {
    Encoding encoding;
    std::string bytes;
    SString character;
  } kSequences[] = {{Support::kUTF8, "\xC3\xA9", WTEXT("\u00E9")},
                    {Support::kUTF8, "\xE4\xB8\xAD", WTEXT("\u4E2D")},
                    {Support::kUTF8, "\xED\xA0\xBD\xED\xB8\x80", WTEXT("\xD83D\xDE00")},
                    {0x20000 | 932, "\x83\x41", WTEXT("\u30A2")}};
  for (const auto& sequence : kSequences) {
    for (std::size_t edge : {4096u, 8192u, 16384u, 65536u}) {
      for (std::size_t before = edge - 4; before <= edge + 1; ++before) {
        std::string bytes = std::string(before, '.') + sequence.bytes + "end";
        ReadResult result = ReadBytes(bytes, sequence.encoding);
        SString expected = sequence.character + WTEXT("end");
        ASSERT_EQ(result.text.Right(expected.Length()), expected) << edge << ' ' << before;
        ASSERT_EQ(result.text.Length(), static_cast<int>(before) + expected.Length());
        ASSERT_TRUE(result.loss.IsEmpty());
        if (Support::IsUnicode(sequence.encoding) && sequence.bytes.size() < 4) {
          for (Encoding level : {Support::kQuickDetect, Support::kDetect}) {
            ASSERT_EQ(ReadBytes(bytes, kAnsi | level | Support::kFavorGuess).text, result.text)
                << edge << ' ' << before;
          }
        }
      }
    }
  }
}

// --- what cannot be mapped ---

TEST(Losses, AreReplacedDroppedOrThrown) {
  const struct {
    Encoding encoding;
    std::string bytes;
    const WCHAR* replaced;
    std::string thrown;
  } kCases[] = {
      {Support::kASCII, "a\xE9z", WTEXT("a?z"), std::to_string(0x8099005Bu) + "SEIONonASCII"},
      {Support::kUTF8, "a\xFFz", WTEXT("a?z"), std::to_string(0x8099005Du) + "SEIOCantMap_UTF8_UTF16"},
      {Support::kUTF8, "a\xF0\x9F\x98\x80z", WTEXT("a?z"), std::to_string(0x8099005Fu) + "SEIOCantMap_UTF8_UTF16"},
      {Support::kUTF8, "a\xE2\x82", WTEXT("a?"), std::to_string(0x8099005Du) + "SEIOCantMap_UTF8_UTF16"},
      {Support::kUTF8, "a\xC0\x80z", WTEXT("a??z"), std::to_string(0x8099005Du) + "SEIOCantMap_UTF8_UTF16"},
      {Support::kUTF8, "a\xE2(z", WTEXT("a?(z"), std::to_string(0x8099005Du) + "SEIOCantMap_UTF8_UTF16"},
      {0x20000 | 932, "a\x83", WTEXT("a?"), std::to_string(0x8099005Cu) + "SEIOCantMap_MBCS_UTF16"},
      {0x20000 | 932, "a\x83\x0Az", WTEXT("a?\nz"), std::to_string(0x8099005Cu) + "SEIOCantMap_MBCS_UTF16"},
      {Support::kUTF16LE, "a\0z"s, WTEXT("a?"), std::to_string(0x80990061u) + "SEEncodingException"}};
  for (const auto& one : kCases) {
    PiecewiseInput in(one.bytes);
    SMultiFormatReaderUnicode reader(in, one.encoding);
    EXPECT_EQ(reader.SetReplacement(WTEXT('?')), 0xFFFD);
    EXPECT_EQ(reader.ReadAll(), one.replaced);
    EXPECT_EQ(reader.GetEncodingWarning().Left(38), WTEXT("Some characters were replaced by '?' d"));
    PiecewiseInput again(one.bytes);
    SMultiFormatReaderUnicode dropping(again, one.encoding);
    dropping.SetReplacement(0);
    SString kept = one.replaced;
    kept.ReplaceAll(WTEXT("?"), WTEXT(""));
    EXPECT_EQ(dropping.ReadAll(), kept);
    EXPECT_EQ(dropping.GetEncodingWarning().Left(28), WTEXT("Some characters were removed"));
    EXPECT_EQ(ReadBytes(one.bytes, one.encoding | Support::kLossless).failure, one.thrown);
  }
}

TEST(Losses, Lossless_DeliversWhatStandsBefore) {
  PiecewiseInput in("first\xFF second");
  SMultiFormatReaderUnicode reader(in, Support::kUTF8 | Support::kLossless);
  SString before;
  EXPECT_THROW(
      {
        for (int c; (c = reader.Read()) >= 0;) before += static_cast<WCHAR>(c);
      },
      SEIOCantMap_UTF8_UTF16);
  EXPECT_EQ(before, WTEXT("first"));
  EXPECT_THROW(reader.Read(), SEIOCantMap_UTF8_UTF16);
  reader.SetFormat(Support::kUTF8);
  EXPECT_EQ(reader.ReadAll(), WTEXT("\uFFFD second"));
}

TEST(Losses, Lossless_BlocksAndLinesGiveWhatTheyHaveAndThenThrow) {
  const std::string bytes = "ab\ncd\xC3(";
  PiecewiseInput in(bytes);
  SMultiFormatReaderUnicode blocks(in, Support::kUTF8 | Support::kLossless);
  WCHAR block[4096];
  EXPECT_EQ(blocks.Read(block, sizeof block), 10u);
  EXPECT_FALSE(blocks.IsEOF());
  EXPECT_THROW(blocks.Read(block, sizeof block), SEIOCantMap_UTF8_UTF16);
  EXPECT_THROW(blocks.Read(block, sizeof block), SEIOCantMap_UTF8_UTF16);
  PiecewiseInput again(bytes);
  SMultiFormatReaderUnicode lines(again, Support::kUTF8 | Support::kLossless);
  EXPECT_EQ(lines.ReadLn(), WTEXT("ab"));
  EXPECT_EQ(lines.ReadLn(), WTEXT("cd"));
  EXPECT_THROW(lines.ReadLn(), SEIOCantMap_UTF8_UTF16);
  lines.SetFormat(Support::kUTF8);
  EXPECT_EQ(lines.ReadAll(), WTEXT("\uFFFD("));
}

TEST(Losses, QuickUtf8_TrustsItsInput) {
  PiecewiseInput in("a\xE2(b)\xC3\xA9");
  SMultiFormatReaderUnicode reader(in, Support::kUTF8);
  EXPECT_EQ(reader.SetQuickUTF8ToUTF16(1), 0);
  EXPECT_EQ(reader.ReadAll().Right(2), WTEXT(")\u00E9"));
  EXPECT_TRUE(reader.GetEncodingWarning().IsEmpty());
}

// Where sequences have all of their bytes, or end with the text, there is nothing that could be trusted wrongly.
TEST(Losses, QuickUtf8_OfWholeSequencesIsTheText) {
  const char* const kPieces[] = {"a", "\xC3\xA9", "\xE2\x82\xAC", "\xF0\x9F\x98\x80", "\x80", "\xFF"};
  RandomText random(41);
  for (int round = 0; round < 300; ++round) {
    std::string bytes;
    for (int i = random.Number(40); i >= 0; --i) bytes += kPieces[random.Number(6)];
    if (round % 3 == 0) bytes += "\xE2\x82";
    const SString expected = ReadBytes(bytes, Support::kUTF8).text;
    for (unsigned long piece : {1ul, 2ul, 3ul, 7ul, ~0ul}) {
      PiecewiseInput in(bytes, piece), again(bytes, piece);
      SMultiFormatReaderUnicode reader(in, Support::kUTF8), byOne(again, Support::kUTF8);
      reader.SetQuickUTF8ToUTF16(1);
      byOne.SetQuickUTF8ToUTF16(1);
      ASSERT_EQ(reader.ReadAll(), expected) << testing::PrintToString(bytes) << " in pieces of " << piece;
      SString text;
      for (int c; (c = byOne.Read()) >= 0;) text += static_cast<WCHAR>(c);
      ASSERT_EQ(text, expected) << testing::PrintToString(bytes) << " in pieces of " << piece;
    }
  }
}

// --- single- and double-byte pages against the platform itself ---

// Every sequence of one and two bytes of every installed page; only the conversion itself is asked what they mean.
TEST(CodePages, Tables_AgreeWithThePlatformsConversion) {
  int tested = 0, doubles = 0;
  for (unsigned page = 37; page < 65000; ++page) {
    CPINFO info;
    if (!IsValidCodePage(page) || !GetCPInfo(page, &info) || info.MaxCharSize > 2) continue;
    if (MultiByteToWideChar(page, MB_ERR_INVALID_CHARS, "A", 1, nullptr, 0) == 0) continue;
    const auto image = [page](const char* bytes, int size) {
      WCHAR wide[4];
      return MultiByteToWideChar(page, MB_ERR_INVALID_CHARS, bytes, size, wide, 4) == 1 ? int{wide[0]} : -1;
    };
    int single[256];
    std::string mappable;
    WideString expected;
    for (int byte = 1; byte < 256; ++byte) {
      const char one = static_cast<char>(byte);
      single[byte] = image(&one, 1);
      if (single[byte] < 0) continue;
      mappable += one;
      expected += static_cast<WCHAR>(single[byte]);
    }
    std::string unmappable;
    for (int lead = 0x80; lead < 256 && info.MaxCharSize == 2; ++lead) {
      if (single[lead] >= 0) continue;
      for (int trail = 0x21; trail < 256; ++trail) {
        const char two[2] = {static_cast<char>(lead), static_cast<char>(trail)};
        if (const int c = image(two, 2); c >= 0) {
          mappable.append(two, 2);
          expected += static_cast<WCHAR>(c);
          ++doubles;
        } else {
          unmappable.append(two, 2) += '\n';
        }
      }
    }
    const ReadResult result = ReadBytes(mappable, Support::kANSI | page);
    EXPECT_TRUE(result.text.View() == SStringView(expected)) << "page " << page;
    EXPECT_TRUE(result.loss.IsEmpty()) << "page " << page;
    PiecewiseInput in(unmappable);
    SMultiFormatReaderUnicode reader(in, Support::kANSI | page);
    for (test::Steps steps; !reader.IsEOF(); steps.Take())
      ASSERT_NE(reader.ReadLn().Find(WCHAR{0xFFFD}), nullptr) << "page " << page;
    ++tested;
  }
  EXPECT_GT(tested, 30);
  EXPECT_GT(doubles, 60000);
}

// --- positions ---

std::pair<unsigned long long, unsigned long long> LossesOf(const SMultiFormatReaderUnicode& reader) {
  return {reader.GetReplacedCount(), reader.GetDroppedCount()};
}

// What is read twice counts once: at the end the losses are those of a reader that never went back.
void ExpectTheSameAfterEveryReset(const std::string& bytes, Encoding request, WCHAR replacement) {
  PiecewiseInput once(bytes), in(bytes, 100);
  SMultiFormatReaderUnicode plain(once, request), reader(in, request);
  const WCHAR former = plain.GetReplacement();
  for (SMultiFormatReaderUnicode* one : {&plain, &reader}) {
    EXPECT_EQ(one->SetReplacement(replacement), former);
    EXPECT_EQ(one->GetReplacement(), replacement);
  }
  const SString whole = plain.ReadAll();
  RandomText random(8);
  for (int at = 0; at < whole.Length() - 2000;) {
    reader.Mark(100000);
    int length = random.Number(1500) + 1;
    for (int round = 0; round < 2; ++round) {
      std::vector<WCHAR> block(static_cast<std::size_t>(length));
      ASSERT_EQ(reader.Read(block.data(), static_cast<unsigned long>(length) * 2),
                static_cast<unsigned long>(length) * 2);
      ASSERT_EQ(SStringView(block.data(), block.size()),
                whole.View().substr(static_cast<std::size_t>(at), block.size()))
          << at;
      if (round == 0) reader.Reset();
    }
    at += length;
  }
  reader.ReadAll();
  EXPECT_EQ(LossesOf(reader), LossesOf(plain));
}

TEST(Positions, MarkAndReset_ReadTheSameAgain) {
  const std::string good = Repeat("line of text \xC3\xA9\xE2\x82\xAC\n", 6000);
  for (Encoding request : {Support::kUTF8, kAnsi | Support::kQuickDetect | Support::kFavorGuess}) {
    ExpectTheSameAfterEveryReset(good, request, WTEXT('?'));
  }
  const std::string bad = Repeat("lost \xC3\xA9\xFF and \x85\xE2\x82 again\n", 6000);
  for (Encoding request : {Encoding{Support::kUTF8}, Encoding{Support::kASCII}, kAnsi | 932u}) {
    for (const WCHAR replacement : {WTEXT('?'), WCHAR{0}}) ExpectTheSameAfterEveryReset(bad, request, replacement);
  }
  PiecewiseInput in(std::string(400000, 'a'));
  SMultiFormatReaderUnicode reader(in, Support::kASCII);
  EXPECT_THROW(reader.Reset(), SEIOResetInvalid);
  reader.Mark(10);
  reader.Skip(300000);
  EXPECT_THROW(reader.Reset(), SEIOResetInvalid) << "the mark was dropped";
}

TEST(Positions, SetFormat_ReadsTheRestAnew) {
  PiecewiseInput in("abc\xC3\xA9z");
  SMultiFormatReaderUnicode reader(in, kAnsi);
  for (int i = 0; i < 3; ++i) reader.Read();
  reader.SetFormat(Support::kUTF8);
  EXPECT_EQ(reader.ReadAll(), WTEXT("\u00E9z"));
  // Before anything was delivered, a mark that was passed over counts again.
  PiecewiseInput marked("\xEF\xBB\xBFx");
  SMultiFormatReaderUnicode second(marked, 0x4000C);
  second.CheckFormat();
  second.SetFormat(0x4001C);
  EXPECT_EQ(second.ReadAll(), WTEXT("x"));
}

TEST(Positions, LinesEndWithEveryEnding) {
  PiecewiseInput in("one\r\ntwo\n\nthree\r");
  SMultiFormatReaderUnicode reader(in, Support::kASCII);
  std::vector<SString> lines;
  for (test::Steps steps; !reader.IsEOF(); steps.Take()) lines.push_back(reader.ReadLn());
  EXPECT_EQ(lines, (std::vector<SString>{WTEXT("one"), WTEXT("two"), WTEXT(""), WTEXT("three\r")}));
  EXPECT_EQ(reader.Available(), 0u);
  char nothing;
  EXPECT_EQ(reader.Read(&nothing, 0), 0u);
}

TEST(Failures, EachAllocationFailing_LosesNothing) {
  const std::string bytes = Repeat("text \xC3\xA9\n", 3000);
  SString expected = ReadBytes(bytes, kAnsi | kFull | Support::kFavorGuess).text;
  int failures = WithEachAllocationFailing(
      [&] {
        PiecewiseInput in(bytes);
        SMultiFormatReaderUnicode reader(in, kAnsi | kFull | Support::kFavorGuess);
        SString text;
        for (test::Steps steps; !reader.IsEOF(); steps.Take()) text = reader.ReadLn();
      },
      [] {});
  EXPECT_GT(failures, 2);
  // After a failure the reader goes on where it stood.
  for (long n = 1; n < 6; ++n) {
    PiecewiseInput in(bytes);
    SMultiFormatReaderUnicode reader(in, kAnsi | kFull | Support::kFavorGuess);
    WideString text;
    SMemFailAt(n);
    for (int c = 0; c >= 0;) {
      try {
        c = reader.Read();
        if (c >= 0) text += static_cast<WCHAR>(c);
      } catch (const SEOutOfMemory&) {
      }
    }
    SMemFailAt(0);
    EXPECT_EQ(expected.View(), SStringView(text)) << n;
  }
}

}  // namespace
