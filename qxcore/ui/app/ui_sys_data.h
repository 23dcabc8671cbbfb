// SUISysData: the measures of the interface, kept so that painting need not ask the system each time.
#pragma once

#include "qxcore/platform/export.h"
#include "qxcore/platform/win32.h"

// Pixels unless a line says otherwise. Read again when settings, colours, fonts or the DPI change.
struct SUISysData {
  int m_dpi;                                       // dots an inch of the main screen
  int m_edgeWidth, m_edgeHeight;                   // of a three-dimensional edge
  int m_borderWidth, m_borderHeight;               // of a flat border
  int m_frameWidth, m_frameHeight;                 // of the border by which a window is sized
  int m_scrollWidth, m_scrollHeight;               // of a vertical and of a horizontal scroll bar
  int m_captionHeight;                             // of a window's title
  int m_menuHeight;                                // of one line of a menu bar
  COLORREF m_face, m_shadow, m_highlight, m_text;  // of buttons and bars
};

// The measures as they are now; the record changes in place. For the user-interface thread.
QXCORE_API const SUISysData* SGetUISysData();
// Reads them anew.
QXCORE_API void SUpdateUISysData();
