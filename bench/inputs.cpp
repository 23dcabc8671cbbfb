#include "bench/inputs.h"

#include <vector>

#include "qxcore/platform/win32.h"

namespace bench {
namespace {

constexpr const char* kEnglish =
    "The library of the old town was open until late in the evening, and nobody ever asked who had the key. ";
constexpr const char* kGerman =
    "Während der großen Überschwemmung wären natürlich schönere Tage möglich gewesen, sagte der müde Bürgermeister. ";
constexpr const char* kFrench =
    "L'élève a déjà reçu la leçon, même si le garçon préférait être près de la forêt où naît la rivière. ";
constexpr const char* kPolish = "Zażółć gęślą jaźń, powiedział król, a potem pojechał łódką przez błękitną rzekę. ";
constexpr const char* kRussian =
    "Однажды весною, в час небывало жаркого заката, на бульваре появились два гражданина. ";
constexpr const char* kGreek = "Η βιβλιοθήκη της παλιάς πόλης ήταν ανοιχτή μέχρι αργά το βράδυ, κάθε μέρα. ";
constexpr const char* kChinese = "老城的图书馆一直开到深夜，没有人问过谁有钥匙。";
constexpr const char* kJapanese = "古い町の図書館は夜遅くまで開いていて、誰も鍵を持っている人を尋ねなかった。";

std::string Repeat(const std::vector<std::string>& sentences) {
  std::string text;
  text.reserve(kInputBytes);
  for (std::size_t i = 0;; ++i) {
    const std::string& sentence = sentences[i % sentences.size()];
    if (text.size() + sentence.size() > kInputBytes) return text;
    text += sentence;
  }
}

std::basic_string<WCHAR> Widen(const std::string& utf8) {
  std::basic_string<WCHAR> wide(utf8.size(), 0);
  int length = MultiByteToWideChar(CP_UTF8, 0, utf8.data(), static_cast<int>(utf8.size()), wide.data(),
                                   static_cast<int>(wide.size()));
  wide.resize(static_cast<std::size_t>(length));
  return wide;
}

std::string InCodePage(unsigned codePage, const char* utf8) {
  std::basic_string<WCHAR> wide = Widen(utf8);
  std::string bytes(wide.size() * 2, 0);
  int length = WideCharToMultiByte(codePage, 0, wide.data(), static_cast<int>(wide.size()), bytes.data(),
                                   static_cast<int>(bytes.size()), nullptr, nullptr);
  bytes.resize(static_cast<std::size_t>(length));
  return bytes;
}

std::string InUtf16(const char* utf8) {
  std::basic_string<WCHAR> wide = Widen(utf8);
  return std::string(reinterpret_cast<const char*>(wide.data()), wide.size() * sizeof(WCHAR));
}

}  // namespace

const std::string& Ascii() {
  static const std::string text = Repeat({kEnglish});
  return text;
}

const std::string& MixedUtf8() {
  static const std::string text =
      Repeat({kEnglish, kGerman, kFrench, kPolish, kRussian, kGreek, kChinese, kJapanese, kEnglish, "\r\n"});
  return text;
}

const std::string& Utf16() {
  static const std::string text =
      Repeat({InUtf16(kEnglish), InUtf16(kGerman), InUtf16(kFrench), InUtf16(kPolish), InUtf16(kRussian),
              InUtf16(kGreek), InUtf16(kChinese), InUtf16(kJapanese), InUtf16(kEnglish), InUtf16("\r\n")});
  return text;
}

const std::string& Windows1252() {
  static const std::string text =
      Repeat({InCodePage(1252, kEnglish), InCodePage(1252, kGerman), InCodePage(1252, kFrench), "\r\n"});
  return text;
}

const std::string& ShiftJis() {
  static const std::string text =
      Repeat({InCodePage(932, kJapanese), InCodePage(932, kEnglish), InCodePage(932, kJapanese), "\r\n"});
  return text;
}

}  // namespace bench
