#include "qxcore/ui/app/ui_sys_data.h"

#include "qxcore/ui/app/ui_font.h"

static int ScreenDpi() {
  const HDC screen = ::GetDC(nullptr);
  const int dpi = screen != nullptr ? ::GetDeviceCaps(screen, LOGPIXELSY) : 0;
  if (screen != nullptr) ::ReleaseDC(nullptr, screen);
  return dpi > 0 ? dpi : 96;
}

static SUISysData ReadMeasures() {
  SUISysData data;
  data.m_dpi = ScreenDpi();
  data.m_edgeWidth = ::GetSystemMetrics(SM_CXEDGE);
  data.m_edgeHeight = ::GetSystemMetrics(SM_CYEDGE);
  data.m_borderWidth = ::GetSystemMetrics(SM_CXBORDER);
  data.m_borderHeight = ::GetSystemMetrics(SM_CYBORDER);
  data.m_frameWidth = ::GetSystemMetrics(SM_CXFRAME);
  data.m_frameHeight = ::GetSystemMetrics(SM_CYFRAME);
  data.m_scrollWidth = ::GetSystemMetrics(SM_CXVSCROLL);
  data.m_scrollHeight = ::GetSystemMetrics(SM_CYHSCROLL);
  data.m_captionHeight = ::GetSystemMetrics(SM_CYCAPTION);
  data.m_menuHeight = ::GetSystemMetrics(SM_CYMENU);
  data.m_face = ::GetSysColor(COLOR_BTNFACE);
  data.m_shadow = ::GetSysColor(COLOR_BTNSHADOW);
  data.m_highlight = ::GetSysColor(COLOR_BTNHIGHLIGHT);
  data.m_text = ::GetSysColor(COLOR_BTNTEXT);
  return data;
}

static SUISysData& Measures() {
  static SUISysData data = ReadMeasures();
  return data;
}

const SUISysData* SGetUISysData() { return &Measures(); }

void SUpdateUISysData(int dpi) {
  Measures() = ReadMeasures();
  if (dpi > 0) Measures().m_dpi = dpi;
  SUpdateDefaultUIFont();
}
