#include "qxcore/graphics/window_dc.h"

QXCORE_IMPLEMENT_CLASS(SClientDC, SDC, 1)
QXCORE_IMPLEMENT_CLASS(SWindowDC, SDC, 1)
QXCORE_IMPLEMENT_CLASS(SPaintDC, SDC, 1)

SClientDC::SClientDC(HWND window) : m_window(window) { Attach(::GetDC(window)); }

SClientDC::~SClientDC() {
  if (HDC dc = Detach()) ::ReleaseDC(m_window, dc);
}

SWindowDC::SWindowDC(HWND window) : m_window(window) { Attach(::GetWindowDC(window)); }

SWindowDC::~SWindowDC() {
  if (HDC dc = Detach()) ::ReleaseDC(m_window, dc);
}

SPaintDC::SPaintDC(HWND window) : m_ps{}, m_window(window) { Attach(::BeginPaint(window, &m_ps)); }

SPaintDC::~SPaintDC() {
  if (Detach()) ::EndPaint(m_window, &m_ps);
}
