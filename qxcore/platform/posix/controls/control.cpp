#include "qxcore/platform/posix/controls/control.h"

namespace platform::controls {

RECT ClientOf(HWND control) {
  RECT client{};
  GetClientRect(control, &client);
  return client;
}

Painting::Painting(HWND control, WPARAM wParam, HFONT font)
    : m_control(control),
      m_isOwn(wParam == 0),
      m_dc(m_isOwn ? BeginPaint(control, &m_paint) : reinterpret_cast<HDC>(wParam)) {
  if (font != nullptr) m_formerFont = SelectObject(m_dc, font);
}

Painting::~Painting() {
  if (m_formerFont != nullptr) SelectObject(m_dc, m_formerFont);
  if (m_isOwn) EndPaint(m_control, &m_paint);
}

}  // namespace platform::controls
