// A parent for the controls under test, which keeps what they tell it.
#pragma once

#include <string>
#include <vector>

#include "qxcore/platform/win32.h"

class ControlHost {
 public:
  static constexpr int kId = 42;

  ControlHost() {
    WNDCLASSW host{};
    host.lpfnWndProc = &Procedure;
    host.lpszClassName = WTEXT("ControlHost");
    RegisterClassW(&host);
    m_window = CreateWindowExW(0, WTEXT("ControlHost"), nullptr, WS_POPUP | WS_VISIBLE, 0, 0, 400, 300, nullptr,
                               nullptr, nullptr, nullptr);
    SetWindowLongPtrW(m_window, GWLP_USERDATA, reinterpret_cast<LONG_PTR>(this));
  }
  ~ControlHost() { DestroyWindow(m_window); }
  ControlHost(const ControlHost&) = delete;
  ControlHost& operator=(const ControlHost&) = delete;

  HWND Make(const WCHAR* className, const WCHAR* text, DWORD style, int id = kId) {
    HWND control = CreateWindowExW(0, className, text, WS_CHILD | WS_VISIBLE | style, 10, 10 + 30 * m_made++, 120, 24,
                                   m_window, reinterpret_cast<HMENU>(static_cast<INT_PTR>(id)), nullptr, nullptr);
    told.clear();
    return control;
  }
  HWND Window() const { return m_window; }

  // "command ID CODE" and "scroll CODE POSITION", in their order, with a comma between them.
  std::vector<std::string> told;
  std::string Told() {
    std::string all;
    for (const std::string& one : told) all += (all.empty() ? "" : ", ") + one;
    told.clear();
    return all;
  }

 private:
  static LRESULT CALLBACK Procedure(HWND window, UINT message, WPARAM wParam, LPARAM lParam) {
    auto* host = reinterpret_cast<ControlHost*>(GetWindowLongPtrW(window, GWLP_USERDATA));
    const std::string low = std::to_string(LOWORD(wParam)), high = std::to_string(HIWORD(wParam));
    if (host != nullptr && message == WM_COMMAND) host->told.push_back("command " + low + " " + high);
    if (host != nullptr && (message == WM_HSCROLL || message == WM_VSCROLL)) {
      host->told.push_back("scroll " + low + " " + high);
    }
    return DefWindowProcW(window, message, wParam, lParam);
  }

  HWND m_window;
  int m_made = 0;
};

inline void Click(HWND control, int x = 5, int y = 5) {
  SendMessageW(control, WM_LBUTTONDOWN, MK_LBUTTON, MAKELPARAM(x, y));
  SendMessageW(control, WM_LBUTTONUP, 0, MAKELPARAM(x, y));
}

inline void Type(HWND control, const WCHAR* text) {
  for (; *text != 0; ++text) SendMessageW(control, WM_CHAR, static_cast<WPARAM>(*text), 0);
}

// The text of a window, as plain characters.
inline std::string TextOf(HWND control) {
  WCHAR text[256];
  const int length = GetWindowTextW(control, text, 256);
  std::string plain;
  for (int i = 0; i < length; ++i) plain += static_cast<char>(text[i]);
  return plain;
}
