// Decoding without detection: any bytes in every encoding; sequences cut anywhere; lossless or with a
// replacement; marks and resets. Valid UTF-8 beside the platform's conversion.

#include <vector>

#include "fuzz/fuzz_input.h"
#include "fuzz/pieces.h"

namespace {

using Support = SAbstractIO::SMultiFormatSupport;

// Goes back to marks while reading; the text must be the same. The pattern tells where.
void ReadWithMarks(std::string_view bytes, unsigned requested, int quick, int replacement, std::uint32_t pattern,
                   const Outcome& expected) {
  PieceInput in(bytes, 3);
  SMultiFormatReaderUnicode reader(in, requested);
  reader.SetQuickUTF8ToUTF16(quick);
  if (replacement >= 0) reader.SetReplacement(static_cast<WCHAR>(replacement));
  std::basic_string<WCHAR> text;
  try {
    bool wasMarked = false;
    std::size_t markAt = 0;
    // A reset decodes its run anew, so long inputs get fewer of them.
    const int seldom = bytes.size() > 2000 ? 0x3E0 : 0;
    for (int step = 0;; ++step) {
      if ((step & seldom) == 0 && (pattern >> (step & 31) & 1) != 0) {
        if (wasMarked && text.size() > markAt) {
          reader.Reset();
          text.resize(markAt);
          wasMarked = false;
        } else {
          reader.Mark(0);
          markAt = text.size();
          wasMarked = true;
        }
      }
      int c = reader.Read();
      if (c < 0) break;
      text += static_cast<WCHAR>(c);
      if (step > 100000) break;
    }
    FUZZ_CHECK(expected.failure == 0);
  } catch (const SException& failure) {
    FUZZ_CHECK(failure.GetCode() == expected.failure);
  }
  Outcome marked = expected;
  marked.text = text;
  CheckSame(expected, marked, "reading with marks and resets");
}

void CheckValidUtf8(std::string_view bytes, const Outcome& outcome) {
  if (bytes.empty() || bytes.size() > 100000 || bytes.starts_with("\xEF\xBB\xBF")) return;
  // The reader does not know sequences of four bytes; that is meant.
  for (char c : bytes) {
    if (static_cast<unsigned char>(c) >= 0xF0) return;
  }
  std::vector<WCHAR> wide(bytes.size());
  int length = MultiByteToWideChar(CP_UTF8, 8 /* refuse invalid */, bytes.data(), static_cast<int>(bytes.size()),
                                   wide.data(), static_cast<int>(wide.size()));
  if (length == 0) return;
  FUZZ_CHECK(outcome.failure == 0);
  FUZZ_CHECK(outcome.text == std::basic_string_view<WCHAR>(wide.data(), static_cast<std::size_t>(length)));
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  FuzzInput input(data, size);
  constexpr Support::Encoding kValues[] = {
      Support::kUTF8,         Support::kUTF16LE,      Support::kUTF16BE,      Support::kASCII,
      Support::kANSI,         Support::kOEM,          Support::kANSI | 1252,  Support::kANSI | 932,
      Support::kANSI | 936,   Support::kANSI | 949,   Support::kANSI | 950,   Support::kANSI | 54936,
      Support::kANSI | 50220, Support::kANSI | 51932, Support::kANSI | 57002, Support::kANSI | 65001};
  std::uint8_t choice = input.Byte();
  std::uint8_t way = input.Byte();
  auto pattern = input.Number<std::uint32_t>();
  unsigned requested = kValues[choice & 15] | ((way & 1) != 0 ? Support::kLossless : 0);
  int quick = (way & 2) != 0;
  int replacement = (way & 4) != 0 ? 0 : (way & 8) != 0 ? '?' : -1;
  std::string bytes = std::string((way & 0x10) != 0 ? 4090 : 0, 'a') + std::string((way & 0x20) != 0 ? 12288 : 0, 'b') +
                      std::string(input.Rest());
  Outcome whole = ReadAll(bytes, 0, requested, 4096, quick, replacement);
  CheckSame(whole, ReadAll(bytes, 1 + (choice >> 4 & 7), requested, 0, quick, replacement), "reading by character");
  CheckSame(whole, ReadAll(bytes, 4096, requested, 1 + (way >> 6), quick, replacement), "reading in small blocks");
  ReadWithMarks(bytes, requested, quick, replacement, pattern, whole);
  if (requested == Support::kUTF8) CheckValidUtf8(bytes, whole);
  return 0;
}
