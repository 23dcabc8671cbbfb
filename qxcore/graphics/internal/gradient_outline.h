// The area that a gradient fills, and the frame around it.
#pragma once

#include "qxcore/container/table_dumb.h"
#include "qxcore/graphics/dc.h"

// A rectangle, or one with round corners.
class SGradientOutline {
 public:
  // Round when the frame type says so and the corners have a size. Throws SEOutOfMemory.
  SGradientOutline(const SRect& rect, int frameType, const SSize& corner);

  const SRect& Rect() const { return m_rect; }
  // What belongs to it of a row (y) or a column (x) of the rectangle.
  SRect Row(int y) const;
  SRect Column(int x) const;
  bool Contains(const SPoint& point) const { return Row(point.y).Contains(point); }

  // Draws the frame in shades of a light and a dark colour.
  void DrawFrame(SDC& dc, unsigned long light, unsigned long dark) const;

 private:
  SRect m_rect;
  int m_frameType;
  SSize m_corner;
  STableDumb<int> m_rowInset;     // of the rows from the top, as far as the corner goes
  STableDumb<int> m_columnInset;  // of the columns from the left
};
