// The edges of bars, boxes and borders, in the system's colours.
#pragma once

#include "qxcore/graphics/dc.h"

// Fills a rectangle with a colour of the system.
inline void SFillWithSystemColor(SDC& dc, const RECT& rect, int color) { dc.FillRect(rect, ::GetSysColorBrush(color)); }

// Draws a frame inside the rectangle and returns what is inside the frame. The left and top edges have one colour,
// the others another.
inline SRect SDrawEdges(SDC& dc, SRect rect, int width, int height, int topLeft, int bottomRight) {
  SFillWithSystemColor(dc, SRect(rect.left, rect.top, rect.right, rect.top + height), topLeft);
  SFillWithSystemColor(dc, SRect(rect.left, rect.top + height, rect.left + width, rect.bottom), topLeft);
  SFillWithSystemColor(dc, SRect(rect.left + width, rect.bottom - height, rect.right, rect.bottom), bottomRight);
  SFillWithSystemColor(dc, SRect(rect.right - width, rect.top + height, rect.right, rect.bottom - height), bottomRight);
  rect.Deflate(width, height);
  return rect;
}
