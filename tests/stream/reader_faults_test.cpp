// The reader where choices, positions and sources change under way.

#include <functional>
#include <vector>

#include "qxcore/core/io_exceptions.h"
#include "qxcore/stream/encoding/multi_format_reader_unicode.h"
#include "qxcore/stream/input_buffer.h"
#include "qxcore/stream/input_file.h"
#include "tests/stream/reader_fixture.h"
#include "tests/support/steps.h"
#include "tests/support/temp_folder.h"
#include "tests/support/wine.h"

namespace {

constexpr Encoding kAnsi = Support::kANSI;
constexpr Encoding kFull = Support::kFullDetect;
constexpr Encoding kGuess = Support::kFavorGuess;

SString PlatformText(unsigned page, const std::string& bytes) {
  WideString text(bytes.size() + 1, 0);
  const int length = MultiByteToWideChar(page, 0, bytes.data(), static_cast<int>(bytes.size()), text.data(),
                                         static_cast<int>(text.size()));
  return SString(SStringView(text.data(), static_cast<std::size_t>(length)));
}

// Lets the tests see and use what derived readers may.
class OpenReader : public SMultiFormatReaderUnicode {
 public:
  using SMultiFormatReaderUnicode::SMultiFormatReaderUnicode;
  unsigned long Held() const { return m_raw.capacity; }
  unsigned long More(unsigned long count) { return GetMoreRawData(m_raw, count); }
};

// --- provisional choices ---

// A choice that becomes one of those pages that are decoded as a whole must not spin.
TEST(ProvisionalChoice, BecomesAPageThatIsDecodedAsAWhole) {
  const std::string plain(5000, 'a');
  const struct {
    unsigned page;
    const char* unit;
  } kPages[] = {{54936, "\xD6\xD0\x81\x30\x81\x30 "},
                {51932, "\xC6\xFC "},
                {50220, "\x1B$B\x46\x7C\x1B(B "},
                {52936, "~{VPND~} "},
                {57002, "\xB3\xD1 "},
                {51949, "\xC7\xD1 "}};
  int chosen = 0;
  for (const auto& one : kPages) {
    if (!IsValidCodePage(one.page)) continue;
    std::string bytes = plain;
    while (bytes.size() < 150000) bytes += one.unit;
    const SString expected = PlatformText(one.page, bytes);
    for (Encoding level : {Support::kQuickDetect, Support::kDetect, kFull}) {
      for (int way = 0; way < 3; ++way) {
        const ReadResult result = ReadBytes(bytes, kAnsi | one.page | level, 30000, way);
        if ((result.selected & Support::kValueMask) != (kAnsi | one.page)) continue;  // 7-bit, or another page fits
        ++chosen;
        ASSERT_TRUE(result.text == expected) << one.page << " way " << way;
      }
    }
    EXPECT_TRUE(ReadBytes(bytes, kAnsi | one.page).text == expected) << one.page;
  }
  if (!IsWine()) {
    EXPECT_GT(chosen, 20);
  }
}

// Going back over the place where the choice was made anew, or to what was read in another format.
TEST(ProvisionalChoice, MarksBeforeIt_GoBackToTheSameText) {
  const std::string bytes = std::string(4000, 'a') + "bcd" + std::string(200, 'e') + "\xC3\xA9\xE2\x82\xAC" + "fin";
  const SString expected = ReadBytes(bytes, Support::kUTF8).text;
  for (int markAt : {0, 10, 3999, 4096, 4200, 4203, 4204}) {
    PiecewiseInput in(bytes, 1000);
    SMultiFormatReaderUnicode reader(in, kAnsi | Support::kQuickDetect | kGuess);
    EXPECT_EQ(reader.Skip(static_cast<unsigned long>(markAt)), static_cast<unsigned long>(markAt));
    reader.Mark(100000);
    EXPECT_EQ(reader.ReadAll(), expected.Mid(markAt)) << markAt;
    EXPECT_EQ(reader.GetFormat() & Support::kValueMask, Support::kUTF8);
    reader.Reset();
    EXPECT_EQ(reader.ReadAll(), expected.Mid(markAt)) << markAt;
  }
}

TEST(Positions, ResetAfterSetFormat_ReadsInTheNewFormat) {
  const std::string bytes = "abc\xC3\xA9\xC3\xA9xyz\xE2\x82\xAC!";
  for (int markAt = 0; markAt < 8; ++markAt) {
    PiecewiseInput in(bytes);
    SMultiFormatReaderUnicode reader(in, Support::kUTF8);
    reader.Skip(static_cast<unsigned long>(markAt));
    reader.Mark(0);
    reader.Skip(3);
    reader.SetFormat(kAnsi | 1252);
    reader.Read();
    EXPECT_EQ(reader.GetFormat(), kAnsi | 1252u);
    reader.Reset();
    EXPECT_EQ(reader.GetFormat(), kAnsi | 1252u);
    const SString before = PlatformText(CP_UTF8, bytes).Left(markAt);
    char passed[64];
    const int size = WideCharToMultiByte(CP_UTF8, 0, before, before.Length(), passed, sizeof passed, nullptr, nullptr);
    EXPECT_EQ(reader.ReadAll(), PlatformText(1252, bytes.substr(static_cast<std::size_t>(size)))) << markAt;
  }
}

// Each byte position of a text in a page that is decoded as a whole.
TEST(Positions, SetFormatInAPageDecodedAsAWhole) {
  const std::string bytes = "ab\xD6\xD0\x81\x30\x81\x30z\xD6\xD0!";
  const SString whole = PlatformText(54936, bytes);
  const std::size_t starts[] = {0, 1, 2, 4, 8, 9, 11};
  for (int at = 0; at < whole.Length(); ++at) {
    PiecewiseInput in(bytes);
    SMultiFormatReaderUnicode reader(in, kAnsi | 54936);
    EXPECT_EQ(reader.Skip(static_cast<unsigned long>(at)), static_cast<unsigned long>(at));
    reader.SetFormat(kAnsi | 1252);
    EXPECT_EQ(reader.ReadAll(), PlatformText(1252, bytes.substr(starts[at]))) << at;
  }
}

// --- borrowed input ---

TEST(BorrowedInput, IsNeverWritten) {
  const std::string bytes(30000, 'x');
  std::string memory = bytes + std::string(30000, '#');
  const std::string before = memory;
  SInputBuffer source(memory.data(), static_cast<unsigned long>(bytes.size()));
  OpenReader reader(source, kAnsi | kFull);
  EXPECT_EQ(reader.ReadAll().Length(), 30000);
  reader.SetFormat(kAnsi | Support::kQuickDetect);
  EXPECT_FALSE(source.SeekPos(0));
  EXPECT_EQ(reader.ReadAll().Length(), 0) << "the input had ended";
  EXPECT_EQ(reader.More(5000), 5000u) << "but a derived class may go on";
  EXPECT_EQ(reader.ReadAll().Length(), 5000);
  EXPECT_EQ(memory, before);
}

// --- sources that throw ---

// Throws at every n-th read, and has lost nothing then.
class CancellingInput : public PiecewiseInput {
 public:
  CancellingInput(std::string bytes, unsigned long piece, int every)
      : PiecewiseInput(std::move(bytes), piece), m_every(every) {}
  int Read() override {
    Ask();
    return PiecewiseInput::Read();
  }
  unsigned long Read(void* buffer, unsigned long count) override {
    Ask();
    return PiecewiseInput::Read(buffer, count);
  }
  int Cancelled() const { return m_cancelled; }

 private:
  void Ask() {
    if (++m_asked % m_every != 0) return;
    ++m_cancelled;
    throw SEIOAbortedException();
  }
  int m_every;
  int m_asked = 0;
  int m_cancelled = 0;
};

TEST(CancelledReads, LoseNothing) {
  std::string bytes;
  for (int i = 0; i < 3000; ++i) bytes += "line " + std::to_string(i) + (i > 900 ? " \xC3\xA9\xE2\x82\xAC\n" : "\n");
  const std::function<void(SMultiFormatReaderUnicode&, SString&)> kWays[] = {
      [](SMultiFormatReaderUnicode& reader, SString& text) {
        for (int c; (c = reader.Read()) >= 0;) text += static_cast<WCHAR>(c);
      },
      [](SMultiFormatReaderUnicode& reader, SString& text) {
        WCHAR block[3000];
        for (test::Steps steps; const unsigned long size = reader.Read(block, sizeof block); steps.Take())
          text += SStringView(block, size / 2);
      },
      [](SMultiFormatReaderUnicode& reader, SString& text) { text += reader.ReadAll(); },
      [](SMultiFormatReaderUnicode& reader, SString& text) {
        for (test::Steps steps; !reader.IsEOF(); steps.Take()) text += reader.ReadLn();
      }};
  for (Encoding request : {Support::kUTF8, kAnsi | Support::kQuickDetect | kGuess, kAnsi | kFull | kGuess}) {
    for (std::size_t way = 0; way < std::size(kWays); ++way) {
      SString expected;
      PiecewiseInput whole(bytes);
      SMultiFormatReaderUnicode undisturbed(whole, request);
      kWays[way](undisturbed, expected);
      for (unsigned long piece : {11ul, 5000ul}) {
        CancellingInput in(bytes, piece, 3);
        SMultiFormatReaderUnicode reader(in, request);
        SString text;
        for (int quiet = 0; quiet < 2;) {
          const int length = text.Length();
          const int cancelled = in.Cancelled();
          try {
            kWays[way](reader, text);
          } catch (const SEIOAbortedException&) {
          }
          quiet = text.Length() == length && in.Cancelled() == cancelled ? quiet + 1 : 0;
        }
        EXPECT_GT(in.Cancelled(), 3);
        if (way == 3) expected.ReplaceAll(WTEXT("\n"), WTEXT(""));
        ASSERT_EQ(text, expected) << std::hex << request << " way " << way << " pieces of " << std::dec << piece;
      }
    }
  }
}

// --- long inputs ---

// So many plain bytes, then a tail; takes no memory.
class LongInput : public SInputStream {
 public:
  LongInput(std::uint64_t plain, std::string tail, bool goesBack)
      : m_plain(plain), m_tail(std::move(tail)), m_goesBack(goesBack) {}
  int Read() override {
    unsigned char byte;
    return Read(&byte, 1) == 1 ? byte : -1;
  }
  unsigned long Read(void* buffer, unsigned long count) override {
    if (m_at < m_plain) {
      const auto got = static_cast<unsigned long>(std::min<std::uint64_t>(count, m_plain - m_at));
      std::memset(buffer, 'a', got);
      m_at += got;
      return got;
    }
    const auto from = static_cast<std::size_t>(m_at - m_plain);
    const unsigned long got = std::min(count, static_cast<unsigned long>(m_tail.size() - from));
    std::memcpy(buffer, m_tail.data() + from, got);
    m_at += got;
    return got;
  }
  unsigned long Available() override { return ~0ul; }
  int IsEOF() override { return m_at == m_plain + m_tail.size(); }
  bool GetPlace(std::uint64_t* place) override {
    *place = m_at;
    return m_goesBack;
  }
  bool GoToPlace(std::uint64_t place) override {
    m_at = place;
    return m_goesBack;
  }

 private:
  std::uint64_t m_plain;
  std::string m_tail;
  bool m_goesBack;
  std::uint64_t m_at = 0;
};

TEST(LongInputs, AreLookedAtWholeWithoutBeingKept) {
  constexpr std::uint64_t kGiga = 1u << 30;
  for (std::uint64_t plain : {kGiga / 8, 2 * kGiga + kGiga / 5, 4 * kGiga + 1}) {
    LongInput in(plain, "caf\xC3\xA9 caf\xC3\xA9", true);
    OpenReader reader(in, kAnsi | kFull | kGuess);
    reader.CheckFormat();
    EXPECT_EQ(reader.GetFormat() & Support::kValueMask, Support::kUTF8) << plain;
    EXPECT_LT(reader.Held(), 64ul << 20) << plain;
    EXPECT_EQ(reader.GetStatus(), SMultiFormatReaderUnicode::kSelected);
    EXPECT_EQ(reader.Read(), 'a');
    EXPECT_EQ(reader.Available(), ~0ul);
  }
  // The text is whole, and the evidence is the same as if all had been kept.
  const unsigned long length = 40ul << 20;
  for (const char* tail : {"x", "caf\xC3\xA9", "caf\xE9", "\xE2\x82"}) {
    LongInput kept(length, tail, false), looked(length, tail, true);
    OpenReader first(kept, kAnsi | kFull | kGuess), second(looked, kAnsi | kFull | kGuess);
    first.CheckFormat();
    second.CheckFormat();
    EXPECT_EQ(first.GetFormat(), second.GetFormat()) << tail;
    EXPECT_EQ(first.GetDetectionReport(), second.GetDetectionReport());
    EXPECT_EQ(second.Skip(length), length);
    EXPECT_EQ(second.ReadAll(), ReadBytes(tail, second.GetFormat() & Support::kValueMask).text);
    EXPECT_LT(second.Held(), 64ul << 20);
  }
}

std::string Repeated(const std::string& unit, std::size_t size) {
  std::string bytes;
  for (bytes.reserve(size + unit.size()); bytes.size() < size;) bytes += unit;
  return bytes;
}

// Zero bytes are judged over all of the text, wherever the pieces are cut in which it is looked at.
// Cancels one read behind what a reader keeps.
class InterruptedLongInput : public LongInput {
 public:
  using LongInput::LongInput;
  using LongInput::Read;
  unsigned long Read(void* buffer, unsigned long count) override {
    std::uint64_t place = 0;
    GetPlace(&place);
    if (place > 24u << 20 && !std::exchange(m_wasCancelled, true)) throw SEIOAbortedException();
    return LongInput::Read(buffer, count);
  }

 private:
  bool m_wasCancelled = false;
};

TEST(LongInputs, ACancelledLookAtTheRestLosesNothing) {
  constexpr unsigned long kLength = 40ul << 20;
  InterruptedLongInput in(kLength, "caf\xC3\xA9 caf\xC3\xA9", true);
  OpenReader reader(in, kAnsi | kFull | kGuess);
  EXPECT_THROW(reader.CheckFormat(), SEIOAbortedException);
  reader.CheckFormat();
  EXPECT_EQ(reader.GetFormat() & Support::kValueMask, Support::kUTF8);
  EXPECT_EQ(reader.Skip(kLength), kLength);
  EXPECT_EQ(reader.ReadAll(), WTEXT("caf\u00E9 caf\u00E9"));
}

TEST(LongInputs, ZeroBytesBehindTheBeginning_MakeNo16BitText) {
  constexpr std::size_t kMega = 1u << 20;
  const struct {
    const char* line;
    Encoding expected;
  } kTexts[] = {{"plain text, and more of it\n", Support::kASCII},
                {"caf\xC3\xA9 au lait, \xE2\x82\xAC 4\n", Support::kUTF8},
                {"caf\xE9 au lait, \xA3 4 all in one byte each\n", kAnsi}};
  const test::TempFolder folder;
  const test::Text path = folder.File(WTEXT("zeros.txt"));
  for (const auto& one : kTexts) {
    std::string run = Repeated(one.line, 24 * kMega), few = run;
    if (run.size() % 2 != 0) run += '\n', few += '\n';
    // The beginnings of pieces lie in the run; the few are at even or at odd offsets by the piece, of 4 MB behind 16
    // MB.
    const std::size_t from = run.find('\n', 15 * kMega);
    std::fill_n(run.begin() + static_cast<std::ptrdiff_t>(from), run.find('\n', 21 * kMega) - from, '\0');
    for (std::size_t place = 0; place < 24 * kMega; place += 1024) {
      const std::size_t parity = place / (place < 16 * kMega ? 1024 : 4 * kMega) % 2;
      std::size_t at = few.find('\n', place);
      while (at % 2 != parity) at = few.find('\n', at + 1);
      few[at] = '\0';
    }
    for (const std::string* bytes : {&run, &few}) {
      test::WriteAll(path, *bytes);
      for (Encoding policy : {kGuess, kGuess | Support::kFullUnicode}) {
        SInputFile file(SString(path.c_str()));
        OpenReader fromFile(file, kAnsi | kFull | policy);
        fromFile.CheckFormat();
        EXPECT_EQ(fromFile.GetFormat() & Support::kValueMask, one.expected) << one.line << (bytes == &few);
        EXPECT_LT(fromFile.Held(), 20 * kMega) << "it was kept";
        PiecewiseInput stream(*bytes);
        OpenReader fromStream(stream, kAnsi | kFull | policy);
        fromStream.CheckFormat();
        EXPECT_EQ(fromStream.GetFormat() & Support::kValueMask, one.expected) << one.line << (bytes == &few);
      }
    }
  }
}

// Nothing is kept of what was read and gave no character.
TEST(LongInputs, DroppedCharactersTakeNoMemory) {
  PiecewiseInput in(std::string(20u << 20, '\xFF') + "end");
  OpenReader reader(in, Support::kASCII);
  reader.SetReplacement(0);
  EXPECT_EQ(reader.ReadAll(), WTEXT("end"));
  EXPECT_LT(reader.Held(), 1ul << 20);
  EXPECT_EQ(reader.GetDroppedCount(), 20ull << 20);
}

// --- overriding ---

class OpinionatedReader : public SMultiFormatReaderUnicode {
 public:
  using SMultiFormatReaderUnicode::SMultiFormatReaderUnicode;
  int samples = 0, guesses = 0;

 protected:
  Encoding DataAffinity(const unsigned char* begin, const unsigned char* end, std::int32_t& ascii, std::int32_t& utf8,
                        std::int32_t& active, std::int32_t& utf16, std::int32_t& littleZeros, std::int32_t& bigZeros,
                        std::int32_t& specified, unsigned short codePage) override {
    ++samples;
    const Encoding settled = SMultiFormatReaderUnicode::DataAffinity(begin, end, ascii, utf8, active, utf16,
                                                                     littleZeros, bigZeros, specified, codePage);
    if (codePage == 1251) specified += 1000;
    return settled;
  }
  Encoding GuessEncoding(Encoding requested, std::int32_t ascii, std::int32_t utf8, std::int32_t active,
                         std::int32_t utf16, std::int32_t littleZeros, std::int32_t bigZeros,
                         std::int32_t specified) override {
    ++guesses;
    if (active == -1 && ascii < 0) return Support::kOEM;
    return SMultiFormatReaderUnicode::GuessEncoding(requested, ascii, utf8, active, utf16, littleZeros, bigZeros,
                                                    specified);
  }
};

// Memory of the buffers from a derived class, which may give more than is asked for, or refuse.
class ThriftyReader : public SMultiFormatReaderUnicode {
 public:
  using SMultiFormatReaderUnicode::SMultiFormatReaderUnicode;
  unsigned long most = ~0ul;
  int raws = 0, texts = 0;

 protected:
  void AllocRawData(BufferStatus& buffer, unsigned long size) override {
    ++raws;
    if (size > most) throw SEOutOfMemory();
    SMultiFormatReaderUnicode::AllocRawData(buffer, size + 100);
  }
  void AllocStrData(BufferStatus& buffer, unsigned long size) override {
    ++texts;
    SMultiFormatReaderUnicode::AllocStrData(buffer, size + 100);
  }
};

TEST(Overriding, BuffersOfADerivedReader) {
  const std::string bytes = std::string(200000, 'a') + "caf\xC3\xA9";
  PiecewiseInput in(bytes, 900);
  ThriftyReader reader(in, kAnsi | kFull | kGuess);
  reader.most = 100000;
  EXPECT_THROW(reader.Read(), SEOutOfMemory) << "all of the input was wanted";
  reader.most = ~0ul;
  EXPECT_EQ(reader.ReadAll(), ReadBytes(bytes, Support::kUTF8).text) << "nothing was lost";
  EXPECT_GT(reader.raws, 1);
  EXPECT_GT(reader.texts, 0);
  EXPECT_EQ(reader.GetCounters().ascii, -1) << "one lead byte";
  EXPECT_GT(reader.GetCounters().utf8, 0);
}

TEST(Overriding, DerivedReadersScoreAndChoose) {
  PiecewiseInput in("\xE9t\xE9 \xE9t\xE9");
  OpinionatedReader reader(in, kAnsi | 1251 | kFull);
  reader.CheckFormat();
  EXPECT_EQ(reader.GetFormat() & Support::kValueMask, kAnsi | 1251u) << "strictly above";
  EXPECT_EQ(reader.GetDetectionReport().Left(61),
            WTEXT("Autodetection found that most probable encoding was \"ANSI - C"));
  EXPECT_EQ(reader.samples, 1);
  EXPECT_EQ(reader.guesses, 1);
}

// --- Unicode by the standards ---

constexpr Encoding kStandard = Support::kFullUnicode;

std::string Utf8Of(SStringView text) { return SString(text).ToUtf8(); }

TEST(FullUnicode, EveryCharacterComesBack) {
  // With a shift of one byte each, pairs lie at every offset around all block sizes.
  WideString text;
  for (char32_t c = 1; c < 0x110000; c += c < 0x10000 ? 1 : 67) {
    if (c >= 0xD800 && c < 0xE000) continue;
    if (c >= 0x10000) {
      text += static_cast<WCHAR>(0xD7C0 + (c >> 10));
      text += static_cast<WCHAR>(0xDC00 + (c & 0x3FF));
    } else {
      text += static_cast<WCHAR>(c);
    }
  }
  for (int shift = 0; shift < 5; ++shift) {
    const std::string bytes = std::string(static_cast<std::size_t>(shift), 'x') + Utf8Of(text);
    const SString expected = SString::FromUtf8(bytes);
    for (int way = 0; way < 3; ++way) {
      const ReadResult result = ReadBytes(bytes, kAnsi | kFull | kGuess | kStandard, 60000, way);
      ASSERT_EQ(result.selected & Support::kValueMask, Support::kUTF8);
      ASSERT_EQ(result.text, expected) << shift << " way " << way;
      ASSERT_EQ(result.loss, WTEXT(""));
    }
  }
}

TEST(FullUnicode, JudgesByTheStandard) {
  const auto select = [](const std::string& bytes) {
    return ReadBytes(
               "plain text before \xC3\xA9 " + bytes + " and behind, long enough for a block: " + std::string(70, '.'),
               kAnsi | kFull | kGuess | kStandard)
               .selected &
           Support::kValueMask;
  };
  for (const char* good : {"\xF0\x9F\x98\x80", "\xF4\x8F\xBF\xBF", "\xED\x9F\xBF", "\xEE\x80\x80", "\xE0\xA0\x80"}) {
    EXPECT_EQ(select(good), Support::kUTF8);
  }
  for (const char* bad : {"\xC0\x80", "\xC1\xBF", "\xE0\x9F\xBF", "\xED\xA0\x80", "\xF0\x8F\xBF\xBF",
                          "\xF4\x90\x80\x80", "\xF5\x80\x80\x80", "\xF0\x9F\x98", "\x80"}) {
    EXPECT_EQ(select(bad), kAnsi);
  }
  EXPECT_EQ(ReadBytes("a\xED\xA0\x80z", Support::kUTF8 | kStandard).text, WTEXT("a\uFFFD\uFFFD\uFFFDz"));
  EXPECT_EQ(ReadBytes("a\xF0\x9F\x98", Support::kUTF8 | kStandard).text, WTEXT("a\uFFFD"));
  // Every short sequence of bytes: the reader and the string's own conversion are of one opinion.
  RandomText random(5);
  for (int round = 0; round < 20000; ++round) {
    constexpr unsigned char kBytes[] = {'a',  0x80, 0x8F, 0x90, 0x9F, 0xA0, 0xBF, 0xC1, 0xC2, 0xDF,
                                        0xE0, 0xE1, 0xED, 0xEF, 0xF0, 0xF1, 0xF4, 0xF5, 0xFF};
    std::string bytes(static_cast<std::size_t>(random.Number(90)), 'p');
    for (int i = 0; i < 7; ++i) bytes += static_cast<char>(kBytes[random.Number(static_cast<int>(std::size(kBytes)))]);
    bytes += std::string(static_cast<std::size_t>(random.Number(90)), 'q');
    const ReadResult result = ReadBytes(bytes, Support::kUTF8 | kStandard, 1 + static_cast<unsigned>(round % 97));
    ASSERT_EQ(result.text, SString::FromUtf8(bytes)) << round;
    const bool isValid = result.loss.IsEmpty() && !result.text.IsEmpty();
    const bool hasHigh =
        std::any_of(bytes.begin(), bytes.end(), [](char c) { return static_cast<unsigned char>(c) >= 0x80; });
    if (bytes.size() < 3 || !hasHigh) continue;
    const Encoding selected = ReadBytes(bytes, kAnsi | kFull | kGuess | kStandard).selected & Support::kFormatMask;
    if (isValid) {
      ASSERT_EQ(selected, Support::kUTF8) << round;
    }
  }
}

TEST(FullUnicode, Utf16OfPlainBytesIsRecognised) {
  const SString russian =
      WTEXT("\u041F\u0440\u0438\u0432\u0435\u0442, \u043C\u0438\u0440! \u0413\u043E\u0434 2024\r\n");
  const SString thai = WTEXT("\u0E2A\u0E27\u0E31\u0E2A\u0E14\u0E35 \u0E0A\u0E32\u0E27\u0E42\u0E25\u0E01\r\n");
  const SString latin = WTEXT("Only letters of ASCII, in sixteen bits each.\r\n");
  const Encoding request = kAnsi | kFull | kGuess | kStandard;
  for (const SString& text : {russian, thai, latin}) {
    EXPECT_EQ(ReadBytes(Utf16Bytes(text), request).selected & Support::kFormatMask, Support::kUTF16LE);
    EXPECT_EQ(ReadBytes(Utf16Bytes(text, true), request).selected & Support::kFormatMask, Support::kUTF16BE);
    EXPECT_EQ(ReadBytes(Utf16Bytes(text, true), request).text, text);
  }
  for (const char* plain :
       {"just text\twith tabs\r\nand lines\n", "\x01\x02\x03\x04 controls \x1B[0m of a terminal\x07"}) {
    EXPECT_EQ(ReadBytes(plain, request).selected & Support::kValueMask, Support::kASCII);
  }
  EXPECT_EQ(ReadBytes(std::string("a record\0of fields\0\0", 20), request).selected & Support::kValueMask,
            Support::kASCII);
}

// A position between the halves of a pair is no place in the bytes: the pair counts as read.
TEST(FullUnicode, PositionsAroundPairs) {
  const std::string bytes = "a\xF0\x9F\x98\x80z\xF0\x9F\x98\x81";
  const SString whole = SString::FromUtf8(bytes);
  for (int at = 0; at <= whole.Length(); ++at) {
    PiecewiseInput in(bytes);
    SMultiFormatReaderUnicode reader(in, Support::kUTF8 | kStandard);
    reader.Skip(static_cast<unsigned long>(at));
    reader.Mark(0);
    EXPECT_EQ(reader.ReadAll(), whole.Mid(at));
    reader.Reset();
    EXPECT_EQ(reader.ReadAll(), whole.Mid(at));
    reader.Reset();
    reader.SetFormat(Support::kUTF8 | kStandard);
    const int next = at == 2 || at == 5 ? at + 1 : at;
    EXPECT_EQ(reader.ReadAll(), whole.Mid(next)) << at;
  }
  WCHAR two[2];
  PiecewiseInput in(bytes);
  SMultiFormatReaderUnicode reader(in, Support::kUTF8 | kStandard);
  SString text;
  for (test::Steps steps; const unsigned long size = reader.Read(two, sizeof(WCHAR)); steps.Take())
    text += SStringView(two, size / 2);
  EXPECT_EQ(text, whole);
}

}  // namespace
