// The choice of an encoding by a second reading of its rules, hints of every code page, texts in double-byte active
// pages, and the base streams.

#include <algorithm>
#include <random>
#include <vector>

#include "qxcore/core/io_exceptions.h"
#include "qxcore/stream/input_buffer.h"
#include "qxcore/stream/input_file.h"
#include "qxcore/stream/output_file.h"
#include "qxcore/stream/output_file_on_change.h"
#include "qxcore/stream/output_global.h"
#include "qxcore/stream/output_string_stream.h"
#include "qxcore/stream/seekable_input_ansi_file.h"
#include "qxcore/stream/seekable_string_input_stream.h"
#include "qxcore/stream/zip/inflater.h"
#include "tests/stream/reader_fixture.h"
#include "tests/support/temp_folder.h"
#include "tests/support/wine.h"

namespace {

// --- the choice among the candidates ---

// Finds the evidence that it is told to find.
class EvidenceReader : public SMultiFormatReaderUnicode {
 public:
  using SMultiFormatReaderUnicode::SMultiFormatReaderUnicode;
  SDetectionCounters evidence;

 protected:
  Encoding DataAffinity(const unsigned char*, const unsigned char*, std::int32_t& ascii, std::int32_t& utf8,
                        std::int32_t& active, std::int32_t& utf16, std::int32_t& littleZeros, std::int32_t& bigZeros,
                        std::int32_t& specified, unsigned short) override {
    ascii = evidence.ascii, utf8 = evidence.utf8, active = evidence.active, utf16 = evidence.utf16;
    littleZeros = evidence.littleZeros, bigZeros = evidence.bigZeros, specified = evidence.specified;
    return 0;
  }
};

struct Expected {
  Encoding selected;
  bool warns;
  bool operator==(const Expected& other) const = default;
};

// The rules one after the other, as the guide to text encodings has them.
Expected SecondReading(Encoding requested, const SDetectionCounters& c, bool isComplete) {
  const Encoding policy = requested & Support::kFlagsMask, value = requested & Support::kValueMask;
  if (c.ascii >= 0) return {policy | Support::kASCII, false};
  const bool favours = (policy & (Support::kFavorHint | Support::kFavorGuess)) != 0;
  if (c.utf8 < 0 && c.active < 0 && c.utf16 < 0 && c.specified < 0) {
    if (value == Support::kOEM || favours) return {requested, false};
    return {policy | Support::kOEM, true};
  }
  const Encoding order = c.littleZeros > c.bigZeros ? Support::kUTF16LE : Support::kUTF16BE;
  Encoding best = 0;
  if (c.utf8 > c.active && c.utf8 > c.utf16 && c.utf8 > c.specified) best = Support::kUTF8;
  if (c.active > c.utf8 && c.active > c.utf16 && c.active > c.specified) best = Support::kANSI;
  if (c.specified > c.utf8 && c.specified > c.utf16 && c.specified > c.active) best = value;
  if (c.utf16 > c.utf8 && c.utf16 > c.active && c.utf16 > c.specified) best = order;
  const int acceptable = (c.utf8 >= 0) + (c.active >= 0) + (c.utf16 >= 0) + (c.specified >= 0);
  const bool isSure = isComplete && best != 0 && acceptable == 1;
  if (best != 0 && (policy & Support::kFavorGuess) != 0) return {policy | best, false};
  const bool fitsHint = ((requested & 0xFFFE7) == Support::kUTF8 && c.utf8 > 0) ||
                        (value == Support::kANSI && c.active > 0) || ((requested & 0xFFFE7) == order && c.utf16 > 0);
  if (fitsHint) return {requested, !isSure && (policy & Support::kFavorHint) == 0 && best != value};
  if (best != 0) return {policy | best, !isSure};
  if (c.active == c.utf8 && c.active > c.specified) return {policy | Support::kANSI, true};
  if (c.utf8 > c.active && c.utf8 > c.specified && c.utf8 == c.utf16) return {policy | Support::kUTF8, true};
  if (c.active > c.utf8 && c.active > c.specified && c.active == c.utf16) return {policy | Support::kANSI, true};
  return {requested, true};
}

TEST(Choices, AreThoseOfASecondReading) {
  std::mt19937 random(29);
  const Encoding kHints[] = {Support::kANSI,
                             Support::kANSI | 1251,
                             Support::kUTF8,
                             Support::kUTF16LE,
                             Support::kUTF16BE | Support::kOptionalBOM,
                             Support::kOEM,
                             Support::kASCII,
                             Support::kUTF8 | Support::kOptionalBOM};
  const Encoding kFavours[] = {0, Support::kFavorHint, Support::kFavorGuess};
  const std::string whole = "abcdef", part(6000, 'a');
  int warned = 0;
  for (int round = 0; round < 60000; ++round) {
    const bool isComplete = random() % 2 != 0;
    const Encoding requested = kHints[random() % std::size(kHints)] | kFavours[random() % 3] |
                               (isComplete ? Support::kFullDetect : Support::kQuickDetect);
    PiecewiseInput in(isComplete ? whole : part);
    EvidenceReader reader(in, requested);
    const auto few = [&] { return static_cast<std::int32_t>(random() % 4) - 1; };
    reader.evidence = {random() % 5 == 0 ? 0 : -3, few(), few(), few(), few(), few(), few()};
    reader.CheckFormat();
    const Expected expected = SecondReading(requested, reader.evidence, isComplete);
    const bool warns = (reader.GetStatus() & SMultiFormatReaderUnicode::kWarning) != 0;
    ASSERT_EQ((Expected{reader.GetFormat(), warns}), expected)
        << std::hex << requested << std::dec << ' ' << reader.evidence.utf8 << ' ' << reader.evidence.active << ' '
        << reader.evidence.utf16 << ' ' << reader.evidence.specified << ' ' << reader.evidence.littleZeros << ' '
        << reader.evidence.bigZeros << ' ' << isComplete;
    ASSERT_EQ(!reader.GetDetectionWarning().IsEmpty(), warns);
    ASSERT_FALSE(reader.GetDetectionReport().IsEmpty());
    const bool isProvisional = reader.evidence.ascii >= 0 && !isComplete;
    ASSERT_EQ((reader.GetStatus() & SMultiFormatReaderUnicode::kProvisional) != 0, isProvisional);
    ASSERT_EQ((reader.GetStatus() & SMultiFormatReaderUnicode::kSelected) != 0, !isProvisional);
    warned += warns;
  }
  EXPECT_GT(warned, 1000);
}

// Scans without reading.
class Scanner : public SMultiFormatReaderUnicode {
 public:
  using SMultiFormatReaderUnicode::SMultiFormatReaderUnicode;
  SDetectionCounters Scan(const std::string& bytes) {
    SDetectionCounters c;
    const auto* begin = reinterpret_cast<const unsigned char*>(bytes.data());
    DataAffinity(begin, begin + bytes.size(), c.ascii, c.utf8, c.active, c.utf16, c.littleZeros, c.bigZeros,
                 c.specified, 0);
    return c;
  }
};

// Pieces are too short for the walk over blocks, of which processors have several; the whole text is long enough.
TEST(Evidence, OfATextIsThatOfItsPieces) {
  constexpr const char* kGood[] = {"x", "-", "\xC3\xA9", "\xD1\x8F", "\xE0\xA0\x80", "\xED\x9F\xBF", "\xEF\xBF\xBD"};
  constexpr const char* kHigh[] = {"\xF0\x9F\x98\x80", "\xF4\x8F\xBF\xBF"};
  constexpr const char* kBad[] = {"\x80", "\xC3", "\xE2\x82", "\xC0\x80", "\xED\xA0\x80", "\xF4\x90\x80\x80", "\xFF"};
  std::mt19937 random(64);
  const auto any = [&](const auto& list) { return list[random() % std::size(list)]; };
  PiecewiseInput in("");
  Scanner basic(in, Support::kANSI), full(in, Support::kANSI | Support::kFullUnicode);
  int rejected = 0;
  for (int round = 0; round < 4000; ++round) {
    Scanner& scanner = round % 2 == 0 ? basic : full;
    const bool isFaulty = random() % 2 == 0;
    std::string text;
    std::int64_t ascii = 0, utf8 = 0;
    bool isRejected = false;
    for (auto count = random() % 50 + 1; count > 0; --count) {
      std::string piece = "a";
      for (auto length = random() % 18; length > 0; --length)
        piece += isFaulty && random() % 256 == 0 ? any(kBad) : random() % 16 == 0 ? any(kHigh) : any(kGood);
      piece += "z";
      if (piece.size() > 64) continue;
      const SDetectionCounters found = scanner.Scan(piece);
      ascii += found.ascii, utf8 += found.utf8;
      isRejected |= found.utf8 < 0;
      text += piece;
    }
    const SDetectionCounters whole = scanner.Scan(text);
    ASSERT_EQ(whole.ascii, ascii) << testing::PrintToString(text);
    ASSERT_EQ(whole.utf8, isRejected ? SDetectionCounters::kRejected : utf8) << testing::PrintToString(text);
    rejected += isRejected;
  }
  EXPECT_GT(rejected, 500);
  EXPECT_LT(rejected, 3500);
}

// Whether the platform converts the bytes as a page, by its published flags; a lead byte at the end may be cut.
bool Converts(unsigned page, std::string bytes) {
  const bool forbidsFlags = page == 42 || (page >= 50220 && page <= 50222) || page == 50225 || page == 50227 ||
                            page == 50229 || page == 52936 || page == 54936 || (page >= 57002 && page <= 57011);
  const DWORD flags = forbidsFlags ? 0 : MB_PRECOMPOSED | MB_ERR_INVALID_CHARS;
  for (int attempt = 0; attempt < 2; ++attempt) {
    const int size = static_cast<int>(bytes.size());
    if (size == 0 || MultiByteToWideChar(page, flags, bytes.data(), size, nullptr, 0) > 0) return true;
    if (!IsDBCSLeadByteEx(page, static_cast<BYTE>(bytes.back()))) return false;
    bytes.pop_back();
  }
  return false;
}

// The installed pages, and the numbers that stand for others.
std::vector<unsigned> g_pages;

BOOL CALLBACK AddPage(LPWSTR digits) {
  g_pages.push_back(static_cast<unsigned>(SString(digits).ToULONG()));
  return TRUE;
}

const std::vector<unsigned>& Pages() {
  g_pages = {1, 2, 3, 42};
  EnumSystemCodePagesW(AddPage, CP_INSTALLED);
  return g_pages;
}

TEST(Hints, OfEveryPageAreTestedByThePlatform) {
  int accepted = 0, rejected = 0;
  for (const unsigned page : Pages()) {
    if (page == 65000 || page == 65001) continue;
    unsigned resolved = page;
    CPINFOEXW info;
    if (page == CP_OEMCP) resolved = GetOEMCP();
    if ((page == CP_MACCP || page == CP_THREAD_ACP) && GetCPInfoExW(page, 0, &info)) resolved = info.CodePage;
    for (const std::string bytes : {"caf\xE9 \xE9t\xE9s", "\x83\x65\x83\x58\x83\x67z", "a\xB4\xEB\xC7\xD1z",
                                    "lead \x83\x65\x83", "\x81 \x8D \x8F \x90", "plain\xFF", "\xA1\xFE\xA1\xFE\xA1"}) {
      // A long text of a page of single bytes is judged by the page.
      const std::string sample = (bytes.size() + page) % 2 == 0 ? bytes : bytes + std::string(5000, 'p') + bytes;
      PiecewiseInput in(sample);
      SMultiFormatReaderUnicode reader(in, Support::kANSI | page | Support::kFullDetect | Support::kFavorGuess);
      try {
        reader.CheckFormat();
      } catch (const SException&) {
        continue;  // the page is selected and not installed
      }
      const bool converts = Converts(resolved, sample);
      ASSERT_EQ(reader.GetCounters().specified >= 0, converts) << page << ' ' << testing::PrintToString(sample);
      if (converts && sample.size() < 4096) {
        ASSERT_EQ(reader.GetCounters().specified, -reader.GetCounters().ascii) << page;
      }
      accepted += converts, rejected += !converts;
    }
  }
  EXPECT_GT(accepted, 100);
  EXPECT_GT(rejected, 10);
}

// --- active pages of two bytes; the environment chooses the page, on Linux ---

TEST(DoubleByteFiles, AreReadCharacterByCharacter) {
  if (GetACP() != 932) GTEST_SKIP() << "the active page is " << GetACP();
  const test::TempFolder folder;
  const test::Text path = folder.File(WTEXT("text"));
  ASSERT_TRUE(test::WriteAll(path, "a\x83\x65\x83\x58\xB1\r\nz\x83"));  // the last character is cut
  SSeekableInputANSIFile file(SString(path.c_str()));
  SString text;
  for (int c; (c = file.ReadChar()) >= 0;) text += static_cast<WCHAR>(c);
  EXPECT_EQ(text.Left(6), WTEXT("a\u30C6\u30B9\uFF71\r\n"));
  EXPECT_EQ(text.Length(), 8);
  EXPECT_FALSE(file.SeekPos(0));
  EXPECT_EQ(file.ReadLn(), WTEXT("a\u30C6\u30B9\uFF71"));
  EXPECT_EQ(file.ReadLn().Left(1), WTEXT("z"));
}

// --- the base streams ---

class OneByOne : public SInputStream {
 public:
  explicit OneByOne(std::string bytes) : m_bytes(std::move(bytes)) {}
  using SInputStream::Read;
  int Read() override { return m_at < m_bytes.size() ? static_cast<unsigned char>(m_bytes[m_at++]) : -1; }
  int IsEOF() override { return m_at == m_bytes.size(); }

 private:
  std::string m_bytes;
  std::size_t m_at = 0;
};

class OneByOneOutput : public SOutputStream {
 public:
  using SOutputStream::Write;
  void Write(int byte) override { bytes += static_cast<char>(byte); }
  std::string bytes;
};

// A stream that has nothing but its single byte has all the rest by that.
TEST(BaseStreams, ComeFromTheSingleByte) {
  OneByOne in("0123456789");
  char bytes[20] = {};
  EXPECT_EQ(in.Read(bytes, 4), 4u);
  EXPECT_EQ(in.Skip(3), 3u);
  EXPECT_EQ(in.Read(bytes + 4, 10), 3u);
  EXPECT_STREQ(bytes, "0123789");
  EXPECT_EQ(in.Skip(3), 0u);
  EXPECT_EQ(in.Read(bytes, 1), 0u);
  in.Mark(9);
  EXPECT_THROW(in.Reset(), SEIOResetInvalid);
  EXPECT_EQ(in.Available(), 0u);
  EXPECT_EQ(in.TakeRest(nullptr), nullptr);
  std::uint64_t place = 0;
  EXPECT_FALSE(in.GetPlace(&place));
  EXPECT_FALSE(in.GoToPlace(0));
  OneByOne wide("ab");
  WCHAR characters[4];
  EXPECT_EQ(wide.ReadCharacters(characters, 4), 1u);
  EXPECT_EQ(characters[0], WTEXT('a'));
  EXPECT_EQ(wide.ReadCharacters(characters, 4), 1u);
  EXPECT_EQ(wide.ReadCharacters(characters, 4), 0u);
  OneByOneOutput out;
  EXPECT_EQ(out.Write(bytes, 7), 7u);
  EXPECT_EQ(out.bytes, "0123789");
  out.Flush();
  out.Close();
}

TEST(BaseStreams, HaveNothingMoreOnceTheyAreClosed) {
  const test::TempFolder folder;
  const test::Text path = folder.File(WTEXT("file"));
  ASSERT_TRUE(test::WriteAll(path, "0123456789"));
  char bytes[4] = {};
  std::uint64_t place = 0;
  SInputFile in(SString(path.c_str()));
  EXPECT_EQ(in.Read(), '0');
  EXPECT_TRUE(in.GetPlace(&place));
  EXPECT_EQ(place, 1u);
  in.Close();
  EXPECT_EQ(in.Read(), -1);
  EXPECT_EQ(in.Read(bytes, 4), 0u);
  EXPECT_EQ(in.Skip(4), 0u);
  EXPECT_EQ(in.Available(), 0u);
  EXPECT_TRUE(in.IsEOF());
  EXPECT_TRUE(in.SeekPos(0)) << "it says that it failed";
  EXPECT_FALSE(in.GetPlace(&place));
  EXPECT_FALSE(in.GoToPlace(0));

  SOutputFile out(SString(folder.File(WTEXT("out")).c_str()));
  EXPECT_EQ(out.Write("abc", 3), 3u);
  out.Close();
  EXPECT_THROW(out.Write('x'), SEIOWriteFailed);
  EXPECT_THROW(out.Write("xy", 2), SEIOWriteFailed);
  EXPECT_EQ(out.Write("", 0), 0u);
  out.Flush();
  out.Close();
  EXPECT_EQ(out.GetPosition(), -1);
  EXPECT_EQ(test::ReadAll(folder.File(WTEXT("out"))), "abc");

  SOutputFileOnChange changed(SString(path.c_str()));
  changed.Close();
  changed.Flush();
  EXPECT_THROW(changed.Write("x", 1), SEIOWriteFailed);
  EXPECT_EQ(test::ReadAll(path), "") << "the content was empty";

  SInputBuffer none(nullptr, 0);
  unsigned long size = 7;
  EXPECT_EQ(none.TakeRest(&size), nullptr);
  SInflater unmade;
  EXPECT_EQ(unmade.Inflate(bytes, 4), 0);
  EXPECT_THROW(unmade.SetDictionary("x", 1), SEZipException);
}

TEST(BaseStreams, MemoryThatNothingCanHoldIsRefused) {
  SOutputGlobal out;
  EXPECT_EQ(out.Write("kept", 4), 4u);
  EXPECT_EQ(out.Write(nullptr, 0), 0u);
  EXPECT_THROW(out.Write("x", ~0ul), SEOutOfMemory);
  EXPECT_THROW(out.Write("x", ~0ul - 70000), SEOutOfMemory);
  EXPECT_EQ(out.UsedSize(), 4u);
  EXPECT_EQ(std::string(static_cast<const char*>(out.GetData()), 4), "kept");
}

TEST(BaseStreams, CharactersOfAFileGoBackToTheirMark) {
  const test::TempFolder folder;
  const test::Text path = folder.File(WTEXT("file"));
  ASSERT_TRUE(test::WriteAll(path, "one two"));
  SSeekableInputANSIFile file(SString(path.c_str()));
  SSeekableStringInputStream in(file);
  EXPECT_THROW(in.Reset(), SEIOResetInvalid);
  WCHAR text[20] = {};
  in.Mark(0);
  for (unsigned long size = 0; size < 2 * 7 * sizeof(WCHAR); ++size) {
    const unsigned long whole = std::min<unsigned long>(size / sizeof(WCHAR), 7);
    EXPECT_EQ(in.Read(text, size), whole * sizeof(WCHAR)) << size << " bytes; half a character is none";
    EXPECT_EQ(SString(SStringView(text, whole)), SString(WTEXT("one two")).Left(static_cast<int>(whole)));
    in.Reset();
  }
  EXPECT_EQ(in.Skip(4), 4u);
  in.Mark(0);
  EXPECT_EQ(in.Read(text, sizeof text), 3 * sizeof(WCHAR)) << "what is there";
  in.Reset();
  EXPECT_EQ(in.Read(), 't');
  file.Close();
  EXPECT_THROW(in.Reset(), SEIOResetInvalid);
}

// Into a text without a stream below, and with characters that the encoding lacks.
TEST(TextOutputForms, WithoutATargetAndWithoutARepresentation) {
  SOutputStringStream text;
  text.Flush();
  EXPECT_EQ(text.Write(WTEXT("one"), 3u), 3u);
  EXPECT_EQ(text.Write(static_cast<const WCHAR*>(nullptr), 3u), 0u);
  EXPECT_EQ(text.Write(WTEXT("none"), 0u), 0u);
  text.WriteLn(WTEXT("two"), 3u);
  text.Close();
  SString content;
  EXPECT_EQ(text.GetString(nullptr), 0);
  EXPECT_EQ(text.GetString(&content), 1);
  EXPECT_EQ(content, WTEXT("onetwo\r\n"));

  for (const WCHAR replacement : {WTEXT('?'), WCHAR{0}}) {
    CollectingOutput target;
    SOutputStringStream out(target, Support::kANSI | 1252);
    out.SetReplacement(replacement);
    EXPECT_TRUE(out.GetEncodingWarning().IsEmpty());
    out.Write(WTEXT("a\u0416b"), 3u);
    out.Close();
    EXPECT_EQ(target.bytes, replacement != 0 ? "a?b" : "ab");
    EXPECT_EQ(out.GetDroppedCount(), replacement != 0 ? 0u : 1u);
    EXPECT_FALSE(out.GetEncodingWarning().IsEmpty());
    EXPECT_EQ(out.GetString(&content), 0) << "it went elsewhere";
    EXPECT_TRUE(content.IsEmpty());
  }
  // Halves of pairs in writes of their own.
  CollectingOutput target;
  SOutputStringStream out(target, Support::kUTF8 | Support::kFullUnicode);
  out.Write(0xD83D);
  out.Write(0xDE00);
  out.Write(0xD83D);
  out.Write(WTEXT('x'));
  out.Write(0xD83D);
  out.Close();
  EXPECT_EQ(target.bytes.substr(0, 4), "\xF0\x9F\x98\x80");
  EXPECT_EQ(out.GetReplacedCount(), 2u) << "two halves stayed alone";
}

}  // namespace
