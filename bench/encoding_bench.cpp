// Decoding and detection of 64 MB in memory, beside memcpy, ICU, iconv and uchardet.
//
// Ours and the converters work piece by piece into one buffer of 64 KB, as a program that reads a file
// does; memcpy copies the whole input at once.

#include <cstring>
#include <memory>
#include <vector>

#include "bench/bench.h"
#include "bench/inputs.h"
#include "qxcore/stream/encoding/multi_format_reader_unicode.h"
#include "qxcore/stream/input_buffer.h"
#if BENCH_PEERS
#include <iconv.h>
#include <uchardet/uchardet.h>
#include <unicode/ucnv.h>
#include <unicode/ucsdet.h>
#include <unicode/ustring.h>
#endif

namespace {

using Support = SAbstractIO::SMultiFormatSupport;
constexpr Support::Encoding kDetection = Support::kANSI | Support::kFullDetect | Support::kFavorGuess;

// The buffer that decoded text is read into.
WCHAR* Piece() {
  static std::vector<WCHAR> piece(bench::kPieceBytes / sizeof(WCHAR));
  return piece.data();
}

void ReadThrough(benchmark::State& state, const std::string& input, Support::Encoding encoding) {
  for (auto _ : state) {
    SInputBuffer in(input.data(), static_cast<unsigned long>(input.size()));
    SMultiFormatReaderUnicode reader(in, encoding);
    while (reader.Read(Piece(), bench::kPieceBytes) != 0) benchmark::DoNotOptimize(*Piece());
  }
  state.SetBytesProcessed(state.iterations() * static_cast<std::int64_t>(input.size()));
}

void Detect(benchmark::State& state, std::string_view input) {
  for (auto _ : state) {
    SInputBuffer in(input.data(), static_cast<unsigned long>(input.size()));
    SMultiFormatReaderUnicode reader(in, kDetection);
    reader.CheckFormat();
    benchmark::DoNotOptimize(reader.GetFormat());
  }
  state.SetBytesProcessed(state.iterations() * static_cast<std::int64_t>(input.size()));
}

std::string_view Sample() { return std::string_view(bench::MixedUtf8()).substr(0, 4096); }

BENCH("64 MB of ASCII through the reader/ours") { ReadThrough(state, bench::Ascii(), Support::kASCII); }
BENCH("64 MB of mixed UTF-8 through the reader/ours") { ReadThrough(state, bench::MixedUtf8(), Support::kUTF8); }
BENCH("64 MB of UTF-16 through the reader/ours") { ReadThrough(state, bench::Utf16(), Support::kUTF16LE); }
BENCH("64 MB of windows-1252 through the reader/ours") {
  ReadThrough(state, bench::Windows1252(), Support::kANSI | 1252);
}
BENCH("64 MB of Shift-JIS through the reader/ours") { ReadThrough(state, bench::ShiftJis(), Support::kANSI | 932); }
BENCH("detect 64 MB of ASCII/ours") { Detect(state, bench::Ascii()); }
BENCH("detect 64 MB of mixed UTF-8/ours") { Detect(state, bench::MixedUtf8()); }
BENCH("detect 4096 bytes/ours") { Detect(state, Sample()); }

#if BENCH_PEERS

void Copy(benchmark::State& state, const std::string& input) {
  auto copy = std::make_unique<char[]>(input.size());
  for (auto _ : state) {
    std::memcpy(copy.get(), input.data(), input.size());
    benchmark::DoNotOptimize(copy[0]);
    benchmark::ClobberMemory();
  }
  state.SetBytesProcessed(state.iterations() * static_cast<std::int64_t>(input.size()));
}

BENCH("64 MB of ASCII through the reader/memcpy") { Copy(state, bench::Ascii()); }
BENCH("64 MB of mixed UTF-8 through the reader/memcpy") { Copy(state, bench::MixedUtf8()); }
BENCH("64 MB of UTF-16 through the reader/memcpy") { Copy(state, bench::Utf16()); }
BENCH("detect 64 MB of ASCII/memcpy") { Copy(state, bench::Ascii()); }
BENCH("detect 64 MB of mixed UTF-8/memcpy") { Copy(state, bench::MixedUtf8()); }

// u_strFromUTF8 wants whole sequences, so the pieces end at sequence boundaries.
BENCH("64 MB of mixed UTF-8 through the reader/ICU") {
  const std::string& input = bench::MixedUtf8();
  constexpr std::size_t kPiece = bench::kPieceBytes / sizeof(UChar);
  for (auto _ : state) {
    for (std::size_t at = 0; at < input.size();) {
      std::size_t end = std::min(at + kPiece, input.size());
      while (end < input.size() && (static_cast<unsigned char>(input[end]) & 0xC0) == 0x80) --end;
      UErrorCode error = U_ZERO_ERROR;
      std::int32_t length;
      u_strFromUTF8(Piece(), static_cast<std::int32_t>(kPiece), &length, input.data() + at,
                    static_cast<std::int32_t>(end - at), &error);
      if (error > U_ZERO_ERROR) state.SkipWithError(u_errorName(error));
      benchmark::DoNotOptimize(*Piece());
      at = end;
    }
  }
  state.SetBytesProcessed(state.iterations() * static_cast<std::int64_t>(input.size()));
}

BENCH("64 MB of mixed UTF-8 through the reader/iconv") {
  const std::string& input = bench::MixedUtf8();
  for (auto _ : state) {
    iconv_t converter = iconv_open("UTF-16LE", "UTF-8");
    char* in = const_cast<char*>(input.data());
    std::size_t left = input.size();
    while (left > 0) {
      char* out = reinterpret_cast<char*>(Piece());
      std::size_t room = bench::kPieceBytes;
      if (iconv(converter, &in, &left, &out, &room) == static_cast<std::size_t>(-1) && errno != E2BIG) {
        state.SkipWithError("iconv refuses the input");
        break;
      }
      benchmark::DoNotOptimize(*Piece());
    }
    iconv_close(converter);
  }
  state.SetBytesProcessed(state.iterations() * static_cast<std::int64_t>(input.size()));
}

void ConvertByIcu(benchmark::State& state, const std::string& input, const char* name) {
  UErrorCode error = U_ZERO_ERROR;
  UConverter* converter = ucnv_open(name, &error);
  for (auto _ : state) {
    ucnv_reset(converter);
    const char* in = input.data();
    const char* end = in + input.size();
    do {
      error = U_ZERO_ERROR;
      UChar* out = Piece();
      ucnv_toUnicode(converter, &out, Piece() + bench::kPieceBytes / sizeof(UChar), &in, end, nullptr, true, &error);
      benchmark::DoNotOptimize(*Piece());
    } while (error == U_BUFFER_OVERFLOW_ERROR);
    if (U_FAILURE(error)) state.SkipWithError(u_errorName(error));
  }
  ucnv_close(converter);
  state.SetBytesProcessed(state.iterations() * static_cast<std::int64_t>(input.size()));
}

BENCH("64 MB of windows-1252 through the reader/ICU") { ConvertByIcu(state, bench::Windows1252(), "windows-1252"); }
BENCH("64 MB of Shift-JIS through the reader/ICU") { ConvertByIcu(state, bench::ShiftJis(), "ibm-943_P15A-2003"); }

void DetectByUchardet(benchmark::State& state, std::string_view input) {
  uchardet_t detector = uchardet_new();
  for (auto _ : state) {
    uchardet_reset(detector);
    uchardet_handle_data(detector, input.data(), input.size());
    uchardet_data_end(detector);
    benchmark::DoNotOptimize(uchardet_get_charset(detector));
  }
  uchardet_delete(detector);
  state.SetBytesProcessed(state.iterations() * static_cast<std::int64_t>(input.size()));
}

BENCH("detect 64 MB of ASCII/uchardet") { DetectByUchardet(state, bench::Ascii()); }
BENCH("detect 64 MB of mixed UTF-8/uchardet") { DetectByUchardet(state, bench::MixedUtf8()); }
BENCH("detect 4096 bytes/uchardet") { DetectByUchardet(state, Sample()); }

BENCH("detect 4096 bytes/ICU") {
  UErrorCode error = U_ZERO_ERROR;
  UCharsetDetector* detector = ucsdet_open(&error);
  for (auto _ : state) {
    ucsdet_setText(detector, Sample().data(), static_cast<std::int32_t>(Sample().size()), &error);
    benchmark::DoNotOptimize(ucsdet_detect(detector, &error));
  }
  if (U_FAILURE(error)) state.SkipWithError(u_errorName(error));
  ucsdet_close(detector);
}

#endif

}  // namespace
