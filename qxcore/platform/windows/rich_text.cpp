#include "qxcore/platform/internal/rich_text.h"

#include <richedit.h>

#include <algorithm>
#include <cstring>

namespace platform {
namespace {

// The bytes of an RTF text; what is not ASCII is written as \u, in a group of its own, so that it has no
// substitute.
std::string ToBytes(SStringView text) {
  std::string bytes;
  bytes.reserve(text.size());
  for (const WCHAR c : text) {
    if (c < 0x80) {
      bytes += static_cast<char>(c);
    } else {
      bytes += "{\\uc0\\u" + std::to_string(static_cast<short>(c)) + " }";
    }
  }
  return bytes;
}

DWORD CALLBACK GiveBytes(DWORD_PTR cookie, BYTE* buffer, LONG size, LONG* given) {
  std::string_view& rest = *reinterpret_cast<std::string_view*>(cookie);
  const std::size_t count = std::min(rest.size(), static_cast<std::size_t>(size));
  std::memcpy(buffer, rest.data(), count);
  rest.remove_prefix(count);
  *given = static_cast<LONG>(count);
  return 0;
}

DWORD CALLBACK TakeBytes(DWORD_PTR cookie, BYTE* buffer, LONG size, LONG* taken) try {
  reinterpret_cast<std::string*>(cookie)->append(reinterpret_cast<const char*>(buffer), static_cast<std::size_t>(size));
  *taken = size;
  return 0;
} catch (...) {
  return ERROR_NOT_ENOUGH_MEMORY;
}

class SystemRichText : public RichText {
 public:
  SystemRichText()
      : m_window(LoadLibraryW(L"msftedit.dll") != nullptr
                     ? CreateWindowExW(0, L"RICHEDIT50W", L"", ES_MULTILINE | WS_POPUP, 0, 0, 0, 0, nullptr, nullptr,
                                       GetModuleHandleW(nullptr), nullptr)
                     : nullptr) {
    SendMessageW(m_window, EM_SETTEXTMODE, TM_RICHTEXT, 0);
    SendMessageW(m_window, EM_EXLIMITTEXT, 0, 0x7FFFFFFE);
  }
  ~SystemRichText() override {
    if (m_window != nullptr) DestroyWindow(m_window);
  }
  bool IsMade() const { return m_window != nullptr; }

  bool Load(SStringView text, bool isRtf) override {
    if (!isRtf) return SendMessageW(m_window, WM_SETTEXT, 0, reinterpret_cast<LPARAM>(std::wstring(text).c_str())) != 0;
    const std::string bytes = ToBytes(text);
    std::string_view rest(bytes);
    EDITSTREAM stream = {reinterpret_cast<DWORD_PTR>(&rest), 0, GiveBytes};
    SendMessageW(m_window, EM_STREAMIN, SF_RTF, reinterpret_cast<LPARAM>(&stream));
    return stream.dwError == 0;
  }
  std::size_t TextLength() override {
    GETTEXTLENGTHEX how = {GTL_USECRLF | GTL_PRECISE | GTL_NUMCHARS, 1200};
    const LRESULT length = SendMessageW(m_window, EM_GETTEXTLENGTHEX, reinterpret_cast<WPARAM>(&how), 0);
    return length > 0 ? static_cast<std::size_t>(length) : 0;
  }
  void GetText(WCHAR* text) override {
    GETTEXTEX how = {static_cast<DWORD>((TextLength() + 1) * sizeof(WCHAR)), GT_USECRLF, 1200, nullptr, nullptr};
    SendMessageW(m_window, EM_GETTEXTEX, reinterpret_cast<WPARAM>(&how), reinterpret_cast<LPARAM>(text));
  }
  std::string GetRtf() override {
    std::string rtf;
    EDITSTREAM stream = {reinterpret_cast<DWORD_PTR>(&rtf), 0, TakeBytes};
    SendMessageW(m_window, EM_STREAMOUT, SF_RTF, reinterpret_cast<LPARAM>(&stream));
    return rtf;
  }

 private:
  HWND m_window;
};

}  // namespace

std::unique_ptr<RichText> RichText::Make() {
  auto made = std::make_unique<SystemRichText>();
  return made->IsMade() ? std::move(made) : nullptr;
}

}  // namespace platform
