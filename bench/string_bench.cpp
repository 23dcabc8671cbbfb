// Strings, string buffers and MD5, beside std::u16string, QString and OpenSSL.

#include <memory>
#include <string>
#include <vector>

#include "bench/bench.h"
#include "qxcore/string/md5.h"
#include "qxcore/string/string.h"
#include "qxcore/string/string_buffer.h"
#if BENCH_PEERS
#include <openssl/evp.h>
#include <unicode/ucnv.h>

#include <QString>
#endif

namespace {

using StdText = std::basic_string<WCHAR>;
constexpr const WCHAR* kForty = WTEXT("The quick brown fox jumps over the dogs.");
constexpr const WCHAR* kTen[] = {WTEXT("abcdefghij"), WTEXT("klmnopqrst"), WTEXT("uvwxyz0123")};
constexpr int kAppends = 1'000'000;

// 1 MB of text in which the letters of the word are frequent, the word at its end only.
StdText Haystack(const WCHAR* word) {
  StdText text;
  while (text.size() < (1 << 19) - 8) text += WTEXT("When in the course of human events it becomes necessary ");
  text.resize((1 << 19) - 8);
  return text + word;
}

StdText LatinText() {
  StdText text;
  while (text.size() < 1'600'000)
    text += WTEXT("Gr\u00F6\u00DFe und \u00C4pfel f\u00FCr jeden, plain text in between; ");
  text.resize(1'600'000);
  return text;
}

const std::vector<unsigned char>& Bytes64MB() {
  static const std::vector<unsigned char> bytes = [] {
    std::vector<unsigned char> made(64 << 20);
    unsigned state = 1;
    for (unsigned char& byte : made) byte = static_cast<unsigned char>((state = state * 1664525 + 1013904223) >> 24);
    return made;
  }();
  return bytes;
}

BENCH("copy and drop a shared string/ours") {
  SString text(kForty);
  for (auto _ : state) {
    SString copy(text);
    benchmark::DoNotOptimize(copy);
  }
}

// The peer that is there on both targets.
BENCH("copy and drop a shared string/std::shared_ptr") {
  auto text = std::make_shared<StdText>(kForty);
  for (auto _ : state) {
    auto copy = text;
    benchmark::DoNotOptimize(copy);
  }
}

BENCH("make and drop 40 characters/ours") {
  SStringView view(kForty);
  for (auto _ : state) {
    SString text(view);
    benchmark::DoNotOptimize(text);
  }
}

BENCH("a + b + c, 10 characters each/ours") {
  SString a(kTen[0]), b(kTen[1]), c(kTen[2]);
  for (auto _ : state) {
    SString sum = a + b + c;
    benchmark::DoNotOptimize(sum);
  }
}

BENCH("find a word at the end of 1 MB/ours") {
  SString text = SStringView(Haystack(WTEXT("tomorrow")));
  for (auto _ : state) benchmark::DoNotOptimize(text.Find(WTEXT("tomorrow")));
}

BENCH("find a word at the end of 1 MB, without case/ours") {
  SString text = SStringView(Haystack(WTEXT("toMorrow")));
  for (auto _ : state) benchmark::DoNotOptimize(text.FindNoCase(WTEXT("Tomorrow")));
}

// Its first and its last letter have more than two forms, or lie outside of ASCII.
BENCH("find a word with k, i and an accent, without case/ours") {
  SString text = SStringView(Haystack(WTEXT("k\u00E9pi")));
  for (auto _ : state) benchmark::DoNotOptimize(text.FindNoCase(WTEXT("K\u00C9PI")));
}

BENCH("CharToOem of 1.6 million characters/ours") {
  const SString text = SStringView(LatinText());
  for (auto _ : state) {
    SString converted = text;
    converted.CharToOemW();
    benchmark::DoNotOptimize(converted.Length());
  }
}

BENCH("a million appends of 8 characters/ours") {
  for (auto _ : state) {
    SStringBuffer buffer;
    for (int i = 0; i < kAppends; ++i) buffer += SStringView(kForty, 8);
    benchmark::DoNotOptimize(buffer.Length());
  }
}

BENCH("MD5 of 64 MB/ours") {
  const auto& bytes = Bytes64MB();
  for (auto _ : state) {
    unsigned char digest[16];
    SMd5 md5;
    md5.Add(bytes.data(), bytes.size());
    md5.Finish(digest);
    benchmark::DoNotOptimize(digest[0]);
  }
}

#if BENCH_PEERS

const QChar* AsQt(const WCHAR* text) { return reinterpret_cast<const QChar*>(text); }

BENCH("copy and drop a shared string/QString") {
  QString text(AsQt(kForty));
  for (auto _ : state) {
    QString copy(text);
    benchmark::DoNotOptimize(copy);
  }
}

BENCH("make and drop 40 characters/std::u16string") {
  SStringView view(kForty);
  for (auto _ : state) {
    StdText text(view);
    benchmark::DoNotOptimize(text);
  }
}

BENCH("make and drop 40 characters/QString") {
  for (auto _ : state) {
    QString text(AsQt(kForty), 40);
    benchmark::DoNotOptimize(text);
  }
}

BENCH("a + b + c, 10 characters each/QString") {
  QString a(AsQt(kTen[0])), b(AsQt(kTen[1])), c(AsQt(kTen[2]));
  for (auto _ : state) {
    QString sum = a + b + c;
    benchmark::DoNotOptimize(sum);
  }
}

BENCH("find a word at the end of 1 MB/std::u16string") {
  StdText text = Haystack(WTEXT("tomorrow"));
  for (auto _ : state) benchmark::DoNotOptimize(text.find(WTEXT("tomorrow")));
}

BENCH("find a word at the end of 1 MB, without case/QString") {
  QString text(AsQt(Haystack(WTEXT("toMorrow")).c_str()));
  QString word(AsQt(WTEXT("Tomorrow")));
  for (auto _ : state) benchmark::DoNotOptimize(text.indexOf(word, 0, Qt::CaseInsensitive));
}

BENCH("find a word with k, i and an accent, without case/QString") {
  QString text(AsQt(Haystack(WTEXT("k\u00E9pi")).c_str()));
  QString word(AsQt(WTEXT("K\u00C9PI")));
  for (auto _ : state) benchmark::DoNotOptimize(text.indexOf(word, 0, Qt::CaseInsensitive));
}

BENCH("CharToOem of 1.6 million characters/ICU") {
  const StdText text = LatinText();
  UErrorCode error = U_ZERO_ERROR;
  UConverter* converter = ucnv_open("ibm-437", &error);
  std::vector<char> bytes(2 * text.size());
  for (auto _ : state) {
    ucnv_fromUChars(converter, bytes.data(), static_cast<std::int32_t>(bytes.size()), text.data(),
                    static_cast<std::int32_t>(text.size()), &error);
    benchmark::DoNotOptimize(bytes[0]);
  }
  if (U_FAILURE(error)) state.SkipWithError(u_errorName(error));
  ucnv_close(converter);
}

BENCH("a million appends of 8 characters/std::u16string") {
  for (auto _ : state) {
    StdText text;
    for (int i = 0; i < kAppends; ++i) text.append(kForty, 8);
    benchmark::DoNotOptimize(text.data());
  }
}

BENCH("MD5 of 64 MB/OpenSSL") {
  const auto& bytes = Bytes64MB();
  for (auto _ : state) {
    unsigned char digest[EVP_MAX_MD_SIZE];
    unsigned length;
    EVP_Digest(bytes.data(), bytes.size(), digest, &length, EVP_md5(), nullptr);
    benchmark::DoNotOptimize(digest[0]);
  }
}

#endif

}  // namespace
