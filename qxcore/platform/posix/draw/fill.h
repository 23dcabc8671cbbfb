// Painting boxes of pixels: the one road on which areas, lines and outlines reach a surface.
#pragma once

#include <algorithm>

#include "qxcore/platform/posix/draw/context.h"

namespace draw {

// A binary raster operation of source and destination as its truth table: bit 2 * source + destination.
inline int TableOfRop2(int rop2) { return (rop2 - 1) & 0xF; }

// The same for every bit of two pixels.
inline std::uint32_t Combine(int table, std::uint32_t source, std::uint32_t destination) {
  return ((table & 1 ? ~source & ~destination : 0) | (table & 2 ? ~source & destination : 0) |
          (table & 4 ? source & ~destination : 0) | (table & 8 ? source & destination : 0)) &
         0xFFFFFF;
}

// Fills a box, which must lie within the surface, with one pixel.
void FillSolid(const Surface& surface, const Box& box, std::uint32_t pixel);

// Calls draw(part) for each part of a box that can be drawn on.
template <class F>
void ForVisible(const Context& dc, const Box& box, F draw) {
  if (const Box* clip = dc.SingleClip()) {
    Box part = Intersect(box, *clip);
    if (!IsEmpty(part)) draw(part);
    return;
  }
  int count;
  const Box* boxes = dc.Clip().Boxes(&count);
  // Boxes stand in bands from the top: leave out those above, end behind the last.
  const Box* first = std::partition_point(boxes, boxes + count, [&](const Box& clip) { return clip.y2 <= box.y1; });
  for (const Box* clip = first; clip < boxes + count && clip->y1 < box.y2; ++clip) {
    Box part = Intersect(box, *clip);
    if (!IsEmpty(part)) draw(part);
  }
}

// Paints a box or an area, in pixels of the surface, within the clip region.
void PaintBox(const Context& dc, const Box& box, const Paint& paint, int rop2);
void PaintArea(const Context& dc, const Area& area, const Paint& paint, int rop2);

}  // namespace draw
