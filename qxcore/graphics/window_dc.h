// The contexts of windows, each for a scope: the destructor gives it back.
// Threads: an object belongs to one thread at a time.
#pragma once

#include "qxcore/graphics/dc.h"

// A window's client area, at any time.
class QXCORE_API SClientDC : public SDC {
  QXCORE_DECLARE_CLASS(SClientDC)

  // Null is the whole screen. GetSafeHdc() is null for an invalid window.
  explicit SClientDC(HWND window);
  ~SClientDC() override;

 private:
  HWND m_window;
};

// A whole window with its caption, borders and scroll bars; (0, 0) is the window's corner.
class QXCORE_API SWindowDC : public SDC {
  QXCORE_DECLARE_CLASS(SWindowDC)

  explicit SWindowDC(HWND window);
  ~SWindowDC() override;

 private:
  HWND m_window;
};

// The invalid part of a window's client area, while it handles WM_PAINT.
class QXCORE_API SPaintDC : public SDC {
  QXCORE_DECLARE_CLASS(SPaintDC)

  explicit SPaintDC(HWND window);
  ~SPaintDC() override;

  PAINTSTRUCT m_ps;  // rcPaint is the rectangle that must be painted

 private:
  HWND m_window;
};
