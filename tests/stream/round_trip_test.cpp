// Text out and in again in every encoding, with its longest characters at every place around the internal buffers.

#include <algorithm>
#include <set>
#include <vector>

#include "qxcore/core/io_exceptions.h"
#include "qxcore/stream/input_buffer.h"
#include "qxcore/stream/output_string_stream.h"
#include "tests/stream/reader_fixture.h"
#include "tests/support/steps.h"
#include "tests/support/wine.h"

namespace {

std::string Written(const SString& text, Encoding format, unsigned piece) {
  CollectingOutput out;
  SOutputStringStream stream(out, format);
  for (unsigned at = 0, length = static_cast<unsigned>(text.Length()); at < length; at += piece)
    stream.Write(text.GetPointerAt(static_cast<int>(at)), std::min(piece, length - at));
  stream.Close();
  EXPECT_EQ(stream.GetEncodingWarning(), WTEXT("")) << std::hex << format;
  return out.bytes;
}

// The platform's bytes of a text in a code page.
std::string Converted(unsigned page, const SString& text) {
  std::string bytes(static_cast<std::size_t>(text.Length()) * 8 + 8, 0);
  const int size =
      WideCharToMultiByte(page, 0, text, text.Length(), bytes.data(), static_cast<int>(bytes.size()), nullptr, nullptr);
  return bytes.substr(0, static_cast<std::size_t>(std::max(size, 0)));
}

SString ConvertedBack(unsigned page, const std::string& bytes) {
  WideString text(bytes.size() + 1, 0);
  const int length = MultiByteToWideChar(page, 0, bytes.data(), static_cast<int>(bytes.size()), text.data(),
                                         static_cast<int>(text.size()));
  return SString(SStringView(text.data(), static_cast<std::size_t>(std::max(length, 0))));
}

// Characters of a page that have the most bytes and survive the way there and back; at most three.
std::vector<SString> LongestOf(unsigned page) {
  std::vector<SString> longest;
  std::size_t most = 1;
  for (unsigned c : {0xE9u, 0x20ACu, 0x410u, 0x5D0u, 0x627u, 0xE01u, 0x30A2u, 0x4E2Du, 0x65E5u, 0x1F00u, 0xAC00u,
                     0x915u, 0x3B1u, 0x2592u, 0x1F600u, 0x20000u}) {
    WideString units(1, static_cast<WCHAR>(c));
    if (c >= 0x10000) units = {static_cast<WCHAR>(0xD7C0 + (c >> 10)), static_cast<WCHAR>(0xDC00 + (c & 0x3FF))};
    const SString text{SStringView(units)};
    const std::string bytes = Converted(page, text);
    if (bytes.empty() || ConvertedBack(page, bytes) != text) continue;
    if (bytes.size() > most) longest.clear();
    most = std::max(most, bytes.size());
    if (bytes.size() == most && longest.size() < 3) longest.push_back(text);
  }
  return longest;
}

// The pages whose bytes depend on what was before: each piece that is written begins and ends in the plain state.
bool KeepsState(unsigned page) {
  return (page >= 50220 && page <= 50229) || page == 52936 || (page >= 57002 && page <= 57011);
}

struct Form {
  Encoding encoding;
  unsigned page;  // of the platform's conversion that gives the same bytes; 0 for UTF-16
};

std::vector<Form> g_forms;

BOOL CALLBACK AddPage(LPWSTR digits) {
  const unsigned page = static_cast<unsigned>(SString(digits).ToULONG());
  CPINFOEXW info;
  const bool isText = page != CP_UTF7 && page != CP_UTF8 && GetCPInfoExW(page, 0, &info);
  if (isText && Support::MachineSupports(Support::kANSI | page)) g_forms.push_back({Support::kANSI | page, page});
  return TRUE;
}

std::vector<Form> AllForms() {
  g_forms = {{Support::kUTF8 | Support::kFullUnicode, CP_UTF8}, {Support::kUTF16LE, 0}, {Support::kUTF16BE, 0}};
  EnumSystemCodePagesW(AddPage, CP_INSTALLED);
  return g_forms;
}

TEST(RoundTrips, LongestCharactersAtEveryPlaceAroundTheBuffers) {
  int forms = 0;
  for (const Form& form : AllForms()) {
    std::vector<SString> characters =
        form.page == 0 ? std::vector<SString>{SString(WTEXT("\xD83D\xDE00")), SString(WTEXT("\u00E9"))}
                       : LongestOf(form.page);
    if (characters.empty()) continue;
    ++forms;
    std::set<int> places;
    for (int edge : {1024, 2048, 4096, 8192}) {
      for (int place = edge - 5; place <= edge + 2; ++place) places.insert(place);
    }
    for (int before : places) {
      SString text = SString(SStringView(WideString(static_cast<std::size_t>(before), WTEXT('.'))));
      for (const SString& character : characters) text += character;
      text += characters.front() + WTEXT("end");
      const std::string bytes = Written(text, form.encoding, 0xFFFFFF);
      if (form.page != 0 && !KeepsState(form.page)) {
        ASSERT_EQ(bytes, Converted(form.page, text)) << form.page << ", behind " << before;
      }
      // Cut anywhere, also between the halves of a pair.
      for (unsigned piece : {static_cast<unsigned>(before) + 1, 1023u}) {
        const std::string cut = Written(text, form.encoding, piece);
        ASSERT_EQ(ReadBytes(cut, form.encoding).text, text) << std::hex << form.encoding << std::dec << ' ' << before;
      }
      for (unsigned long inPiece : {~0ul, 511ul}) {
        const ReadResult read = ReadBytes(bytes, form.encoding, inPiece, static_cast<int>(inPiece % 3));
        ASSERT_EQ(read.text, text) << std::hex << form.encoding << std::dec << ", behind " << before;
        ASSERT_EQ(read.loss, WTEXT(""));
      }
    }
  }
  EXPECT_GT(forms, 30);
}

// A page that is decoded as a whole delivers what stands before a loss, too, and says the loss when it is reached.
TEST(RoundTrips, LosslessPagesDecodedAsAWhole_DeliverWhatStandsBeforeTheLoss) {
  const struct {
    unsigned page;
    std::string good, bad;
  } kCases[] = {{54936, "ab\xD6\xD0\x81\x30\x81\x30z", "\xFF\x20"},
                {50220, "ab\x1B$B\x46\x7C", "\x7E\x7E\x1B(B"},
                {52936, "ab~{VPND~}", "~{\x7E\x7E~}"}};
  int tested = 0;
  for (const auto& one : kCases) {
    if (!IsValidCodePage(one.page)) continue;
    const SString expected = ConvertedBack(one.page, one.good);
    if (ConvertedBack(one.page, one.good + one.bad).Find(WCHAR{0xFFFD}) == nullptr) continue;  // it is no loss there
    ++tested;
    for (int way = 0; way < 2; ++way) {
      PiecewiseInput in(one.good + one.bad + "behind", 3);
      SMultiFormatReaderUnicode reader(in, Support::kANSI | one.page | Support::kLossless);
      SString text;
      const auto read = [&] {
        WCHAR block[2000];
        for (int c; way == 0 && (c = reader.Read()) >= 0;) text += static_cast<WCHAR>(c);
        for (test::Steps steps; const unsigned long size = way == 0 ? 0 : reader.Read(block, sizeof block);
             steps.Take())
          text += SStringView(block, size / 2);
      };
      EXPECT_THROW(read(), SEIOCantMap_MBCS_UTF16) << one.page;
      EXPECT_EQ(text.Left(expected.Length()), expected) << one.page << " way " << way;
      EXPECT_LE(text.Length(), expected.Length() + 1);
      EXPECT_THROW(reader.Read(), SEIOCantMap_MBCS_UTF16) << "and again";
      const SString before = text;
      reader.SetFormat(Support::kANSI | one.page);
      EXPECT_EQ(reader.ReadAll().Right(6), WTEXT("behind"));
      if (one.page == 54936) {  // the others keep a state, and begin anew in the plain one
        EXPECT_EQ(reader.GetReplacedCount(), 1u);
      }
    }
  }
  if (!IsWine()) {
    EXPECT_GT(tested, 0);
  }
}

}  // namespace
