// Narrow text, code pages, classification and numbers of SString.

#include <algorithm>
#include <climits>
#include <cstdlib>

#include "qxcore/core/internal/working_buffer.h"
#include "qxcore/platform/wide.h"
#include "qxcore/string/string.h"
#include "qxcore/string/text_conversion.h"

// --- narrow text, converted with the ANSI code page ---

// What no int can hold is more than any string takes.
static SString Widened(const char* text) {
  const std::size_t length = text != nullptr ? std::strlen(text) : 0;
  return SAnsiToString(text, static_cast<int>(std::min(length, static_cast<std::size_t>(INT_MAX))));
}
static SString Widened(char character) { return SAnsiToString(&character, character != 0 ? 1 : 0); }

SString::SString(const char* text) : SString(Widened(text)) {}
SString::SString(const char* text, int count) : SString(SAnsiToString(text, count)) {}
SString& SString::operator=(const char* text) { return *this = Widened(text); }
SString& SString::operator=(char character) { return *this = Widened(character); }
SString& SString::operator+=(const char* text) { return *this += Widened(text); }
SString& SString::operator+=(char character) { return *this += Widened(character); }
SString operator+(const SString& a, const char* b) { return a + Widened(b); }
SString operator+(const char* a, const SString& b) { return Widened(a) + b; }
SString operator+(const SString& a, char b) { return a + Widened(b); }
SString operator+(char a, const SString& b) { return Widened(a) + b; }

// --- code pages ---

// Bytes that a text takes at most in the OEM page. Only pages that keep a state are asked: the question is a whole
// conversion.
static int RoomInOem(const WCHAR* text, int length) {
  CPINFO info;
  const bool isPlain = GetCPInfo(CP_OEMCP, &info) && info.MaxCharSize <= 2 && length <= INT_MAX / 2;
  return isPlain ? static_cast<int>(info.MaxCharSize) * length
                 : WideCharToMultiByte(CP_OEMCP, 0, text, length, nullptr, 0, nullptr, nullptr);
}

// Each byte of the OEM page is kept as a character of that value; a character that takes two bytes there becomes two.
void SString::CharToOemW() {
  if (IsEmpty()) return;
  const int room = RoomInOem(m_text, Length());
  SWorkingBuffer<char> bytes(static_cast<std::size_t>(room));
  const int size = WideCharToMultiByte(CP_OEMCP, 0, m_text, Length(), bytes.Get(), room, nullptr, nullptr);
  SString converted;
  WCHAR* out = converted.GetBufferSetLength(size);
  for (int i = 0; i < size; ++i) out[i] = static_cast<unsigned char>(bytes.Get()[i]);
  *this = converted;
}

void SString::OemToCharW() {
  if (IsEmpty()) return;
  const int size = Length();
  SWorkingBuffer<char> bytes(static_cast<std::size_t>(size));
  for (int i = 0; i < size; ++i) bytes.Get()[i] = static_cast<char>(m_text[i]);
  const int length = MultiByteToWideChar(CP_OEMCP, 0, bytes.Get(), size, nullptr, 0);
  SString converted;
  MultiByteToWideChar(CP_OEMCP, 0, bytes.Get(), size, converted.GetBufferSetLength(length), length);
  *this = converted;
}

char* SString::ToAnsi(char* dst) const {
  Swcstombsz(dst, m_text, static_cast<unsigned>(Length()));
  return dst;
}

WCHAR* SString::ToUnicode(WCHAR* dst) const {
  std::memcpy(dst, m_text, (static_cast<std::size_t>(Length()) + 1) * sizeof(WCHAR));
  return dst;
}

int SString::CanConvertToMBCS() const {
  UINT page = GetACP();
  if (IsEmpty()) return 1;
  BOOL usedDefault = FALSE;
  bool isUtf8 = page == CP_UTF8;
  DWORD flags = isUtf8 ? WC_ERR_INVALID_CHARS : WC_NO_BEST_FIT_CHARS;
  int bytes = WideCharToMultiByte(page, flags, m_text, Length(), nullptr, 0, nullptr, isUtf8 ? nullptr : &usedDefault);
  return bytes > 0 && !usedDefault;
}

// --- classification ---

#define QXCORE_CLASSIFY(Member, condition)        \
  int SString::Member(int index) const {          \
    if (index < 0 || index >= Length()) return 0; \
    WCHAR c = m_text[index];                      \
    return (condition) ? 1 : 0;                   \
  }

QXCORE_CLASSIFY(IsASCII, c < 0x80)
QXCORE_CLASSIFY(IsAlpha, platform::IsAlpha(c))
QXCORE_CLASSIFY(IsAlphaNum, platform::IsAlpha(c) || platform::IsDigit(c))
QXCORE_CLASSIFY(IsDigit, platform::IsDigit(c))
QXCORE_CLASSIFY(IsLower, platform::IsLower(c))
QXCORE_CLASSIFY(IsUpper, platform::IsUpper(c))
QXCORE_CLASSIFY(IsWhitespace, platform::IsSpace(c))
QXCORE_CLASSIFY(IsXDigit, platform::IsXDigit(c))

static bool IsSign(WCHAR c) { return c == WTEXT('+') || c == WTEXT('-'); }
static bool IsDecimal(WCHAR c) { return c >= WTEXT('0') && c <= WTEXT('9'); }

int SString::IsInteger() const {
  const WCHAR* at = m_text + (IsSign(m_text[0]) ? 1 : 0);
  if (at == end()) return 0;
  for (; at != end(); ++at) {
    if (!IsDecimal(*at)) return 0;
  }
  return 1;
}

static const WCHAR* SkipDecimals(const WCHAR* at) {
  while (IsDecimal(*at)) ++at;
  return at;
}

int SString::IsNumber() const {
  const WCHAR* at = m_text + (IsSign(m_text[0]) ? 1 : 0);
  const WCHAR* whole = SkipDecimals(at);
  bool hasDigits = whole != at;
  at = whole;
  if (*at == WTEXT('.')) {
    const WCHAR* fraction = SkipDecimals(at + 1);
    hasDigits = hasDigits || fraction != at + 1;
    at = fraction;
  }
  if (!hasDigits) return 0;
  if (*at == WTEXT('e') || *at == WTEXT('E')) {
    const WCHAR* exponent = at + 1 + (IsSign(at[1]) ? 1 : 0);
    at = SkipDecimals(exponent);
    if (at == exponent) return 0;
  }
  return at == end();
}

int SString::IsRtf() const { return IsRtfText(m_text); }

int SString::IsRtfText(const WCHAR* text) {
  if (text == nullptr) return 0;
  // The text may be long: only its beginning is looked at.
  const auto begins = [text](SStringView start) {
    std::size_t at = 0;
    while (at < start.size() && text[at] == start[at]) ++at;
    return at == start.size();
  };
  return begins(WTEXT("{\\rtf")) || begins(WTEXT("{\\urtf"));
}

// --- numbers ---

long SString::ToLONG() const { return platform::WideToLong(m_text); }
unsigned long SString::ToULONG() const { return platform::WideToULong(m_text); }
double SString::ToDouble() const { return platform::WideToDouble(m_text); }
int SString::ToBOOL() const { return CompareNoCase(Yes) == 0 || ToLONG() != 0; }
