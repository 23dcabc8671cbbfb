#include "qxcore/platform/posix/controls/control.h"

#include "qxcore/platform/posix/window/send.h"

namespace platform::controls {

RECT ClientOf(HWND window) {
  RECT client{};
  GetClientRect(window, &client);
  return client;
}

void NotifyCommand(HWND control, UINT code) {
  model::Send(GetParent(control), WM_COMMAND, MAKEWPARAM(GetDlgCtrlID(control), code),
              reinterpret_cast<LPARAM>(control));
}

LRESULT TakeText(HWND window, WPARAM wParam, LPARAM lParam) {
  DefWindowProcW(window, WM_SETTEXT, wParam, lParam);
  InvalidateRect(window, nullptr, TRUE);
  return TRUE;
}

Painting::Painting(HWND control, WPARAM wParam, HFONT font)
    : m_control(control),
      m_isOwn(wParam == 0),
      m_dc(m_isOwn ? BeginPaint(control, &m_paint) : reinterpret_cast<HDC>(wParam)) {
  if (font != nullptr && m_dc != nullptr) m_formerFont = SelectObject(m_dc, font);
}

Painting::~Painting() {
  if (m_formerFont != nullptr) SelectObject(m_dc, m_formerFont);
  if (m_isOwn) EndPaint(m_control, &m_paint);
}

}  // namespace platform::controls
