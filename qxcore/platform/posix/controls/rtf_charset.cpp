#include "qxcore/platform/posix/controls/rtf_charset.h"

#include <map>
#include <mutex>

namespace platform::rich {
namespace {

constexpr UINT kLatin = 1252;

struct CharsetPage {
  std::int32_t charset;
  UINT page;
};

// Character sets of fonts and their code pages, as RTF 1.9.1 pairs them. Symbol fonts (2) have
// pictures of their own in place of characters; their bytes are shown as those of windows-1252.
constexpr CharsetPage kPages[] = {
    {2, kLatin}, {77, 10000}, {78, 10001}, {79, 10003}, {80, 10008}, {81, 10002}, {83, 10005}, {84, 10004},
    {85, 10006}, {86, 10081}, {87, 10021}, {88, 10029}, {89, 10007}, {128, 932},  {129, 949},  {130, 1361},
    {134, 936},  {136, 950},  {161, 1253}, {162, 1254}, {163, 1258}, {177, 1255}, {178, 1256}, {179, 1256},
    {180, 1256}, {181, 1255}, {186, 1257}, {204, 1251}, {222, 874},  {238, 1250}, {254, 437},  {255, 850},
};

}  // namespace

UINT CodePageOf(const Font& font, UINT documentPage) {
  if (font.codePage > 0) return static_cast<UINT>(font.codePage);
  for (const CharsetPage& pair : kPages) {
    if (pair.charset == font.charset) return pair.page;
  }
  return documentPage;
}

const Charset* Charset::Of(UINT page) {
  const CodePageInfo* info = page != 0 ? FindCodePage(ResolveCodePage(page)) : nullptr;
  if (info == nullptr || info->kind == CodePageKind::kSymbol || !IsInstalled(*info)) info = FindCodePage(kLatin);
  static std::mutex lock;
  static std::map<UINT, Charset> made;
  const std::lock_guard<std::mutex> guard(lock);
  Charset& charset = made[info->number];
  if (charset.m_page == 0) {
    if (info->kind == CodePageKind::kTable) charset.m_table = &GetDecodeTable(*info);
    charset.m_page = info->number;
  }
  return &charset;
}

std::u16string Charset::Decode(const std::string& bytes) const {
  std::u16string text(bytes.size() * 2 + 2, u'\0');
  const int length = MultiByteToWideChar(m_page, 0, bytes.data(), static_cast<int>(bytes.size()), text.data(),
                                         static_cast<int>(text.size()));
  text.resize(length > 0 ? static_cast<std::size_t>(length) : 0);
  return text;
}

}  // namespace platform::rich
