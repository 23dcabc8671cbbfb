#include "qxcore/graphics/background.h"

void SDrawBackground::Draw(SDC& dc, const SRect& rect) {
  m_gradient.SetStartRect(rect);
  m_gradient.DrawGradient(dc);
}

int SDrawBackground::Erase(SDC& dc, HWND window) {
  SRect client;
  if (!::GetClientRect(window, client)) return 0;
  Draw(dc, client);
  return 1;
}
