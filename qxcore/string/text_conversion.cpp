#include "qxcore/string/text_conversion.h"

#include <algorithm>
#include <cstring>

#include "qxcore/platform/internal/utf.h"
#include "qxcore/platform/internal/widen.h"
#include "qxcore/platform/wide.h"
#include "qxcore/string/string.h"

char* ST2UTF8Helper(char* dst, const WCHAR* src, int max) {
  SEncodeUTF8(dst, SStringView(src, platform::WideLength(src, static_cast<std::size_t>(std::max(max, 0)))));
  return dst;
}

char* SEncodeUTF8(char* dst, SStringView src) {
  char* out = dst;
  const WCHAR* at = src.data();
  const WCHAR* end = at + src.size();
  for (;;) {
    const std::size_t plain = SNarrowASCII<0>(at, static_cast<std::size_t>(end - at), out);
    out += plain;
    at += plain;
    if (at == end || *at == 0) break;
    out = platform::PutUtf8(static_cast<std::uint16_t>(*at++), out);
  }
  *out = 0;
  return out;
}

// Decodes one sequence, which begins before its text's NUL or `end` (null: only a NUL ends it); false when that
// cuts the sequence.
static bool DecodeSequence(const char*& at, const char* end, WCHAR*& out) {
  const unsigned lead = static_cast<unsigned char>(*at++);
  if (lead < 0x80) {
    *out++ = static_cast<WCHAR>(lead);
  } else if (lead >= 0xC0 && lead < 0xF0) {
    unsigned value = lead < 0xE0 ? lead & 0x1F : lead & 0x0F;
    for (int more = lead < 0xE0 ? 1 : 2; more > 0; --more) {
      if (at == end || *at == 0) return false;
      value = value << 6 | (static_cast<unsigned char>(*at++) & 0x3F);
    }
    *out++ = static_cast<WCHAR>(value);
  }
  return true;
}

WCHAR* SUTF82THelper(WCHAR* dst, const char* src, int max) {
  WCHAR* out = dst;
  for (int i = 0; i < max && *src != 0; ++i) {
    if (!DecodeSequence(src, nullptr, out)) break;
  }
  *out = 0;
  return dst;
}

WCHAR* SDecodeUTF8(WCHAR* dst, std::string_view src) {
  WCHAR* out = dst;
  const char* at = src.data();
  const char* end = at + src.size();
  for (;;) {
    const std::size_t plain = SWidenUntil<SStopAtHighAndNUL>(reinterpret_cast<const unsigned char*>(at),
                                                             static_cast<std::size_t>(end - at), out);
    out += plain;
    at += plain;
    if (at == end || *at == 0 || !DecodeSequence(at, end, out)) break;
  }
  *out = 0;
  return out;
}

int g_bSwcstombszHadLoss = 0;

int Swcstombsz(char* dst, const WCHAR* src, unsigned int n) {
  if (dst != nullptr) *dst = 0;
  if (src == nullptr || (dst == nullptr && n != 0)) return 0;
  g_bSwcstombszHadLoss = 0;
  int size = dst != nullptr ? static_cast<int>(2 * n + 1) : 0;
  int written;
  if (GetACP() == CP_UTF8) {  // takes neither these flags nor a default character
    written = WideCharToMultiByte(CP_UTF8, 0, src, -1, dst, size, nullptr, nullptr);
  } else {
    BOOL usedDefault = FALSE;
    written =
        WideCharToMultiByte(CP_ACP, WC_COMPOSITECHECK | WC_DEFAULTCHAR, src, -1, dst, size, nullptr, &usedDefault);
    g_bSwcstombszHadLoss = usedDefault;
  }
  if (written == 0 && dst != nullptr) *dst = 0;
  return written;
}

int Smbstowcsz(WCHAR* dst, const char* src, unsigned int n) {
  if (dst != nullptr) *dst = 0;
  if (src == nullptr || (dst == nullptr && n != 0)) return 0;
  int written = MultiByteToWideChar(CP_ACP, 0, src, -1, dst, dst != nullptr ? static_cast<int>(n + 1) : 0);
  if (written == 0 && dst != nullptr) *dst = 0;
  return written;
}

SString SAnsiToString(const char* text, int count) {
  SString converted;
  if (text == nullptr || count <= 0) return converted;
  if (const void* end = std::memchr(text, 0, static_cast<std::size_t>(count))) {
    count = static_cast<int>(static_cast<const char*>(end) - text);
  }
  if (count == 0) return converted;
  const std::size_t size = static_cast<std::size_t>(count);
  const auto* bytes = reinterpret_cast<const unsigned char*>(text);
  if (SWidenASCII(bytes, size, converted.GetBufferSetLength(count)) < size) {
    int length = MultiByteToWideChar(CP_ACP, 0, text, count, nullptr, 0);
    WCHAR* buffer = converted.Lock(length);
    converted.Unlock(MultiByteToWideChar(CP_ACP, 0, text, count, buffer, length));
  }
  return converted;
}
