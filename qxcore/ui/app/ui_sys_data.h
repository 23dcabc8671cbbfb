// SUISysData: the measures of the interface, kept so that painting need not ask the system each time.
#pragma once

#include "qxcore/platform/export.h"
#include "qxcore/platform/win32.h"

// Pixels unless a line says otherwise. Read again when settings, colours, fonts or the DPI change.
struct SUISysData {
  int m_dpi;             // dots an inch of the main screen
  int m_edgeWidth;       // of a three-dimensional edge
  int m_edgeHeight;      // the same
  int m_borderWidth;     // of a flat border
  int m_borderHeight;    // the same
  int m_frameWidth;      // of the border by which a window is sized
  int m_frameHeight;     // the same
  int m_scrollWidth;     // of a vertical scroll bar
  int m_scrollHeight;    // of a horizontal scroll bar
  int m_captionHeight;   // of a window's title
  int m_menuHeight;      // of one line of a menu bar
  COLORREF m_face;       // of buttons and bars
  COLORREF m_shadow;     // of their dark edges
  COLORREF m_highlight;  // of their bright edges
  COLORREF m_text;       // of what stands on them
};

// The measures as they are now; the record changes in place. For the user-interface thread.
QXCORE_API const SUISysData* SGetUISysData();
// Reads them anew, and the default interface font with them. `dpi`: the dots an inch if they are known better than the
// screen says, else 0.
QXCORE_API void SUpdateUISysData(int dpi = 0);
