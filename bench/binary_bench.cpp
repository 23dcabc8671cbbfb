// The binary format beside QDataStream, and escapes beside a plain copy.

#include <cstring>
#include <random>
#include <string>
#include <vector>
#if BENCH_PEERS
#include <QBuffer>
#include <QDataStream>
#include <QString>
#endif

#include "bench/bench.h"
#include "bench/inputs.h"
#include "qxcore/stream/encoding/multi_format_reader_unicode.h"
#include "qxcore/stream/input_binary_stream.h"
#include "qxcore/stream/input_buffer.h"
#include "qxcore/stream/java_unicode_escape_filter_stream.h"
#include "qxcore/stream/output_binary_stream.h"
#include "qxcore/stream/output_global.h"

namespace {

using StdText = std::basic_string<WCHAR>;
using Encodings = SAbstractIO::SMultiFormatSupport;

// A million texts of 5 to 30 letters, as names and labels are.
const std::vector<StdText>& Names() {
  static const std::vector<StdText> names = [] {
    std::mt19937 random(3);
    std::vector<StdText> made(1'000'000);
    for (StdText& name : made) {
      for (int letters = 5 + static_cast<int>(random() % 26); letters > 0; --letters)
        name += static_cast<WCHAR>('a' + random() % 26);
    }
    return made;
  }();
  return names;
}

BENCH("a million strings in binary form/ours") {
  std::vector<SString> names;
  for (const StdText& name : Names()) names.push_back(SStringView(name));
  for (auto _ : state) {
    SOutputGlobal memory;
    SOutputBinaryStream out(memory);
    for (const SString& name : names) out << name;
    SInputBuffer bytes(memory.GetData(), memory.UsedSize());
    SInputBinaryStream in(bytes);
    SString back;
    for (std::size_t i = 0; i < names.size(); ++i) in >> back;
    benchmark::DoNotOptimize(back.GetSafePointer());
  }
}

// The escaped form of UTF-16 text, read in pieces.
void Escape(benchmark::State& state, const std::string& utf16) {
  std::vector<char> piece(bench::kPieceBytes);
  for (auto _ : state) {
    SInputBuffer bytes(utf16.data(), static_cast<unsigned long>(utf16.size()));
    SMultiFormatReaderUnicode reader(bytes, Encodings::kUTF16LE);
    SJavaUnicodeEscapeFilterStream filter(reader);
    while (filter.Read(piece.data(), bench::kPieceBytes) != 0) benchmark::DoNotOptimize(piece.data());
  }
}

// Text with its escapes, taken back in pieces that end between words.
void Unescape(benchmark::State& state, const std::string& text) {
  for (auto _ : state) {
    for (std::size_t at = 0; at < text.size();) {
      std::size_t end = std::min(text.size(), at + bench::kPieceBytes);
      if (end != text.size()) end = text.rfind(' ', end) + 1;
      const SString back = SJavaUnicodeEscapeFilterStream::Unescape(text.data() + at, text.data() + end);
      benchmark::DoNotOptimize(back.GetSafePointer());
      at = end;
    }
  }
}

const std::string& PlainUtf16() {
  static const std::string text = [] {
    std::string made(bench::kInputBytes, 0);
    for (std::size_t i = 0; i < made.size() / 2; ++i) made[2 * i] = bench::Ascii()[i];
    return made;
  }();
  return text;
}

const std::string& EscapedText() {
  static const std::string text = [] {
    SInputBuffer bytes(bench::Utf16().data(), static_cast<unsigned long>(bench::Utf16().size()));
    SMultiFormatReaderUnicode reader(bytes, Encodings::kUTF16LE);
    SJavaUnicodeEscapeFilterStream filter(reader);
    std::string made(bench::kInputBytes, 0);
    made.resize(filter.Read(made.data(), bench::kInputBytes));
    return made;
  }();
  return text;
}

BENCH("escape 64 MB of plain UTF-16/ours") { Escape(state, PlainUtf16()); }
BENCH("escape 64 MB of mixed UTF-16/ours") { Escape(state, bench::Utf16()); }
BENCH("unescape 64 MB without escapes/ours") { Unescape(state, bench::Ascii()); }
BENCH("unescape 64 MB with escapes/ours") { Unescape(state, EscapedText()); }

#if BENCH_PEERS
BENCH("a million strings in binary form/QDataStream") {
  std::vector<QString> names;
  for (const StdText& name : Names()) names.push_back(QString::fromUtf16(name.data(), static_cast<int>(name.size())));
  for (auto _ : state) {
    QByteArray bytes;
    QDataStream out(&bytes, QIODevice::WriteOnly);
    for (const QString& name : names) out << name;
    QDataStream in(bytes);
    QString back;
    for (std::size_t i = 0; i < names.size(); ++i) in >> back;
    benchmark::DoNotOptimize(back.constData());
  }
}

void Copy(benchmark::State& state, const std::string& from) {
  std::string to(from.size(), 0);
  for (auto _ : state) {
    std::memcpy(to.data(), from.data(), from.size());
    benchmark::DoNotOptimize(to.data());
    benchmark::ClobberMemory();
  }
}

BENCH("escape 64 MB of plain UTF-16/memcpy") { Copy(state, PlainUtf16()); }
BENCH("escape 64 MB of mixed UTF-16/memcpy") { Copy(state, bench::Utf16()); }
BENCH("unescape 64 MB without escapes/memcpy") { Copy(state, bench::Ascii()); }
BENCH("unescape 64 MB with escapes/memcpy") { Copy(state, EscapedText()); }
#endif

}  // namespace
