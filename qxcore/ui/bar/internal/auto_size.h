// Panes that are as wide as their text.
#pragma once

#include "qxcore/graphics/window_dc.h"
#include "qxcore/ui/bar/status_bar_panes.h"

// Gives an auto-size pane the width of its text in `font`, measured on the window's context, or the screen's for null.
// Returns true when the width has changed.
inline bool SFitToText(SStatusBarPane& pane, HWND window, HFONT font) {
  if ((pane.m_style & kSPaneAutoSize) == 0) return false;
  SClientDC dc(window);
  const SSelectObject selected(dc, font);
  const int width = dc.GetTextExtent(pane.m_text.View()).cx;
  const bool hasChanged = width != pane.m_width;
  pane.m_width = width;
  return hasChanged;
}
