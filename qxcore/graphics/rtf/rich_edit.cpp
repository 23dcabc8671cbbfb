#include "qxcore/graphics/rtf/internal/rich_edit.h"

#include <cstdio>
#include <cstring>

#include "qxcore/core/exception.h"
#include "qxcore/platform/internal/rich_edit_class.h"
#include "qxcore/platform/win32/rich_edit.h"
#include "qxcore/string/string_buffer.h"

namespace {

constexpr UINT kUtf16 = 1200;
constexpr long kNoLimit = 0x7FFFFFFE;
constexpr LONG kLongest = 20;  // bytes of one character as RTF

// A character beyond ASCII, in a group of its own, so that it has no substitute.
LONG WriteCharacter(WCHAR c, BYTE* buffer) {
  char text[kLongest];
  const int length = std::snprintf(text, sizeof text, "{\\uc0\\u%d }", static_cast<int>(static_cast<std::int16_t>(c)));
  std::memcpy(buffer, text, static_cast<std::size_t>(length));
  return length;
}

// Gives the characters of an RTF text as ASCII.
DWORD CALLBACK GiveRtf(DWORD_PTR cookie, BYTE* buffer, LONG size, LONG* moved) {
  auto& rest = *reinterpret_cast<SStringView*>(cookie);
  LONG written = 0;
  std::size_t read = 0;
  for (; read < rest.size() && size - written >= kLongest; ++read) {
    const WCHAR c = rest[read];
    if (c < 0x80) {
      buffer[written++] = static_cast<BYTE>(c);
    } else {
      written += WriteCharacter(c, buffer + written);
    }
  }
  rest.remove_prefix(read);
  *moved = written;
  return 0;
}

DWORD CALLBACK TakeRtf(DWORD_PTR cookie, BYTE* buffer, LONG size, LONG* moved) {
  constexpr LONG kPiece = 1024;
  auto& text = *reinterpret_cast<SStringBuffer*>(cookie);
  try {
    for (LONG at = 0; at < size; at += kPiece) {
      WCHAR wide[kPiece];
      const LONG count = size - at < kPiece ? size - at : kPiece;
      for (LONG i = 0; i < count; ++i) wide[i] = buffer[at + i];
      text.Concat(wide, wide + count);
    }
  } catch (...) {
    return ERROR_NOT_ENOUGH_MEMORY;
  }
  *moved = size;
  return 0;
}

}  // namespace

SRichEditCtrl::~SRichEditCtrl() {
  if (m_hWnd != nullptr) DestroyWindow(m_hWnd);
}

int SRichEditCtrl::Create() {
  const WCHAR* name = platform::LoadRichEditClass();
  if (name == nullptr) return 0;
  m_hWnd =
      CreateWindowExW(0, name, WTEXT(""), WS_CHILD | ES_MULTILINE, 0, 0, 0, 0, HWND_MESSAGE, nullptr, nullptr, nullptr);
  if (m_hWnd == nullptr) return 0;
  SendMessageW(m_hWnd, EM_SETTEXTMODE, TM_RICHTEXT, 0);
  SendMessageW(m_hWnd, EM_EXLIMITTEXT, 0, kNoLimit);
  return 1;
}

int SRichEditCtrl::SetPlainText(const SString& text) {
  return SendMessageW(m_hWnd, WM_SETTEXT, 0, reinterpret_cast<LPARAM>(text.GetSafePointer())) != 0;
}

int SRichEditCtrl::SetRtf(const SString& rtf) {
  SStringView rest(rtf.GetSafePointer());
  EDITSTREAM stream = {};
  stream.dwCookie = reinterpret_cast<DWORD_PTR>(&rest);
  stream.pfnCallback = GiveRtf;
  SendMessageW(m_hWnd, EM_STREAMIN, SF_RTF, reinterpret_cast<LPARAM>(&stream));
  return stream.dwError == 0;
}

SString SRichEditCtrl::GetPlainText() const {
  SString text;
  GETTEXTLENGTHEX measure = {GTL_USECRLF | GTL_PRECISE | GTL_NUMCHARS, kUtf16};
  const LRESULT length = SendMessageW(m_hWnd, EM_GETTEXTLENGTHEX, reinterpret_cast<WPARAM>(&measure), 0);
  if (length <= 0) return text;
  if (length >= 0x3FFFFFFF) throw SEOutOfMemory();  // the message counts its bytes in 32 bits
  GETTEXTEX how = {static_cast<DWORD>((length + 1) * static_cast<LRESULT>(sizeof(WCHAR))), GT_USECRLF, kUtf16, nullptr,
                   nullptr};
  WCHAR* buffer = text.GetBufferSetLength(static_cast<int>(length));
  SendMessageW(m_hWnd, EM_GETTEXTEX, reinterpret_cast<WPARAM>(&how), reinterpret_cast<LPARAM>(buffer));
  return text;
}

SString SRichEditCtrl::GetRtf() const {
  SStringBuffer text;
  EDITSTREAM stream = {};
  stream.dwCookie = reinterpret_cast<DWORD_PTR>(&text);
  stream.pfnCallback = TakeRtf;
  SendMessageW(m_hWnd, EM_STREAMOUT, SF_RTF, reinterpret_cast<LPARAM>(&stream));
  if (stream.dwError != 0) throw SEOutOfMemory();
  return text.Detach();
}
