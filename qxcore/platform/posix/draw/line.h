// Lines of one pixel, and the outlines that are made of them.
#pragma once

#include "qxcore/platform/posix/draw/fill.h"

namespace draw {

// A line in pixels of the surface; its last point is left out. `phase` runs through the pattern of a broken pen from
// one line to the next.
void DrawLine(const Context& dc, POINT from, POINT to, int* phase);
// Lines from point to point with the selected pen, of any width; `closed` adds the one back to the first.
void DrawLines(const Context& dc, const POINT* points, int count, bool closed);
// The width of a pen in pixels, at least 1.
int PenWidth(const Context& dc);

}  // namespace draw
