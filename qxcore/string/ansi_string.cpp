#include "qxcore/string/ansi_string.h"

#include <algorithm>
#include <cstring>

#include "qxcore/core/memory.h"
#include "qxcore/platform/wide.h"
#include "qxcore/string/string.h"
#include "qxcore/string/text_conversion.h"

static int CountUpTo(const WCHAR* text, int limit) {
  return static_cast<int>(platform::WideLength(text, static_cast<std::size_t>(std::max(limit, 0))));
}

SAnsiString::SAnsiString(const WCHAR* text) {
  if (text != nullptr) Convert(text, static_cast<int>(SStringView(text).size()));
}
SAnsiString::SAnsiString(const WCHAR* text, int count) {
  if (text != nullptr) Convert(text, CountUpTo(text, count));
}
SAnsiString::SAnsiString(const SString& text) { Convert(text, text.Length()); }

void SAnsiString::Convert(const WCHAR* text, int count) {
  SString terminated;  // the converter reads up to a NUL
  if (text[count] != 0) {
    terminated = SStringView(text, static_cast<std::size_t>(count));
    text = terminated;
  }
  // Two bytes a character are enough for most code pages; UTF-8 and GB 18030 may need more.
  int needed = std::max(Swcstombsz(nullptr, text, 0), 1);
  unsigned room = std::max(static_cast<unsigned>(count), static_cast<unsigned>(needed) / 2);
  m_text = static_cast<char*>(SMemAlloc(2 * room + 1));
  Swcstombsz(m_text, text, room);
  m_text[2 * room] = 0;
}

void SAnsiString::Done() { SMemFree(Detach()); }

char* SAnsiString::Detach() {
  char* text = m_text;
  m_text = nullptr;
  return text;
}

int SAnsiString::Length() const {
  if (m_text == nullptr) return 0;
  int characters = 0;
  UINT page = GetACP();
  for (const char* at = m_text; *at != 0; ++characters) {
    bool isTrail = page == CP_UTF8 && (*at & 0xC0) == 0x80;
    if (isTrail) --characters;
    at += IsDBCSLeadByteEx(page, static_cast<BYTE>(*at)) && at[1] != 0 ? 2 : 1;
  }
  return characters;
}

int SAnsiString::LengthByte() const { return m_text != nullptr ? static_cast<int>(std::strlen(m_text)) : 0; }

SUnicodeString::SUnicodeString(const char* text) {
  if (text != nullptr) Convert(text, static_cast<int>(std::strlen(text)));
}
SUnicodeString::SUnicodeString(const char* text, int count) {
  if (text != nullptr) Convert(text, count);
}

void SUnicodeString::Convert(const char* text, int count) {
  SString converted = SAnsiToString(text, count);
  std::size_t length = static_cast<std::size_t>(converted.Length());
  m_text = static_cast<WCHAR*>(SMemAlloc(std::max(length * 2, static_cast<std::size_t>(std::max(count, 0)) * 2) + 2));
  std::memcpy(m_text, converted.GetSafePointer(), (length + 1) * sizeof(WCHAR));
}

void SUnicodeString::Done() { SMemFree(Detach()); }

WCHAR* SUnicodeString::Detach() {
  WCHAR* text = m_text;
  m_text = nullptr;
  return text;
}

int SUnicodeString::Length() const { return m_text != nullptr ? static_cast<int>(SStringView(m_text).size()) : 0; }
