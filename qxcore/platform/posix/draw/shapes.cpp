// Rectangles, round rectangles and ellipses: the inside with the brush, the outline with the pen.
#include <cstdlib>

#include "qxcore/platform/posix/draw/line.h"
#include "qxcore/platform/posix/draw/recorder.h"
#include "qxcore/platform/posix/draw/stock.h"

using namespace draw;

namespace {

// Paints the four sides of a frame that lies inside a box.
void PaintFrame(const Context& dc, const Box& box, int width, int height, const Paint& paint, int rop2) {
  Area frame(box);
  frame.Less(Area({box.x1 + width, box.y1 + height, box.x2 - width, box.y2 - height}));
  PaintArea(dc, frame, paint, rop2);
}

// The pixels of an area from which one can leave it by going up or down `height` pixels, or `width` to a side.
Area OutlineOf(const Area& area, int width, int height) {
  Area inner = area;
  for (POINT step : {POINT{-width, 0}, POINT{width, 0}, POINT{0, -height}, POINT{0, height}}) {
    Area moved = area;
    moved.Offset(step.x, step.y);
    inner.And(moved);
  }
  Area outline = area;
  outline.Less(inner);
  return outline;
}

// Paints a round rectangle: the inside, and an outline that lies on the middle of a wide pen.
void PaintRound(const Context& dc, const Box& box, int cornerWidth, int cornerHeight) {
  const Settings& set = dc.m_settings;
  Area area = RoundRectArea(box, cornerWidth, cornerHeight);
  int width = PenWidth(dc), out = set.pen->m_style == PS_INSIDEFRAME ? 0 : width / 2;
  if (set.pen->m_style == PS_NULL) {
    PaintArea(dc, area, PaintOf(dc, *set.brush), set.rop2);
    return;
  }
  Area outline;
  if (width == 1) {
    outline = OutlineOf(area, 1, 1);
  } else {
    int in = width - out, wider = 2 * out, narrower = 2 * in;
    outline = RoundRectArea({box.x1 - out, box.y1 - out, box.x2 + out, box.y2 + out}, cornerWidth + wider,
                            cornerHeight + wider);
    area = RoundRectArea({box.x1 + in, box.y1 + in, box.x2 - in, box.y2 - in}, std::max(0, cornerWidth - narrower),
                         std::max(0, cornerHeight - narrower));
    outline.Less(area);
  }
  area.Less(outline);
  PaintArea(dc, area, PaintOf(dc, *set.brush), set.rop2);
  PaintArea(dc, outline, PaintOf(dc, *set.pen), set.rop2);
}

}  // namespace

BOOL Rectangle(HDC handle, int left, int top, int right, int bottom) try {
  auto* dc = Find<Context>(handle);
  if (!dc) return FALSE;
  if (Record(*dc, [=](HDC to) { Rectangle(to, left, top, right, bottom); })) return TRUE;
  Box box = dc->Map(left, top, right, bottom);
  if (IsEmpty(box)) return TRUE;
  const Settings& set = dc->m_settings;
  Paint fill = PaintOf(*dc, *set.brush);
  if (set.pen->m_style == PS_NULL) {
    PaintBox(*dc, {box.x1, box.y1, box.x2 - 1, box.y2 - 1}, fill, set.rop2);
    return TRUE;
  }
  // The outline lies on the edges, with round corners when the pen is wide; for a pen within the frame the edges are
  // moved inward so far that it covers no pixel outside.
  int width = PenWidth(*dc), out = width / 2, in = width - out;
  if (set.pen->m_style == PS_INSIDEFRAME) box = {box.x1 + out, box.y1 + out, box.x2 - in + 1, box.y2 - in + 1};
  PaintBox(*dc, {box.x1 + in, box.y1 + in, box.x2 - 1 - out, box.y2 - 1 - out}, fill, set.rop2);
  POINT corners[4] = {{box.x1, box.y1}, {box.x2 - 1, box.y1}, {box.x2 - 1, box.y2 - 1}, {box.x1, box.y2 - 1}};
  DrawLines(*dc, corners, 4, true);
  return TRUE;
} catch (const std::bad_alloc&) {
  return NoMemory(FALSE);
}

BOOL RoundRect(HDC handle, int left, int top, int right, int bottom, int width, int height) try {
  auto* dc = Find<Context>(handle);
  if (!dc) return FALSE;
  if (Record(*dc, [=](HDC to) { RoundRect(to, left, top, right, bottom, width, height); })) return TRUE;
  Box box = dc->Map(left, top, right, bottom);
  PaintRound(*dc, box, std::abs(dc->Map().Width(width)), std::abs(dc->Map().Height(height)));
  return TRUE;
} catch (const std::bad_alloc&) {
  return NoMemory(FALSE);
}

BOOL Ellipse(HDC handle, int left, int top, int right, int bottom) try {
  auto* dc = Find<Context>(handle);
  if (!dc) return FALSE;
  if (Record(*dc, [=](HDC to) { Ellipse(to, left, top, right, bottom); })) return TRUE;
  Box box = dc->Map(left, top, right, bottom);
  PaintRound(*dc, box, box.x2 - box.x1, box.y2 - box.y1);
  return TRUE;
} catch (const std::bad_alloc&) {
  return NoMemory(FALSE);
}

// --- with a brush of their own ---

static Ref<Brush> FindBrush(HBRUSH handle) {
  // A number up to 31 is a system colour plus one.
  auto number = reinterpret_cast<std::uintptr_t>(handle);
  if (number >= 1 && number <= 31) handle = GetSysColorBrush(static_cast<int>(number) - 1);
  return Find<Brush>(handle);
}

namespace {

int FillWith(Context& dc, const RECT& rect, const Ref<Brush>& brush) {
  if (Record(dc, [=](HDC to) { FillWith(*Find<Context>(to), rect, brush); })) return 1;
  PaintBox(dc, dc.Map(rect), PaintOf(dc, *brush), R2_COPYPEN);
  return 1;
}

int FrameWith(Context& dc, const RECT& rect, const Ref<Brush>& brush) {
  if (Record(dc, [=](HDC to) { FrameWith(*Find<Context>(to), rect, brush); })) return 1;
  PaintFrame(dc, dc.Map(rect), 1, 1, PaintOf(dc, *brush), R2_COPYPEN);
  return 1;
}

// An area in pixels of the device.
BOOL FillAreaWith(Context& dc, const Area& area, const Ref<Brush>& brush, int rop2) {
  if (Record(dc, [=](HDC to) { FillAreaWith(*Find<Context>(to), area, brush, rop2); })) return TRUE;
  Area moved = area;
  moved.Offset(dc.X(0), dc.Y(0));
  PaintArea(dc, moved, PaintOf(dc, *brush), rop2);
  return TRUE;
}

BOOL FillRegion(HDC handle, HRGN regionHandle, const Ref<Brush>& brush, int rop2) {
  auto* dc = Find<Context>(handle);
  auto* region = Find<RegionObject>(regionHandle);
  return dc && region && brush && FillAreaWith(*dc, region->m_area, brush, rop2);
}

}  // namespace

int FillRect(HDC handle, const RECT* rect, HBRUSH brushHandle) try {
  auto* dc = Find<Context>(handle);
  Ref<Brush> brush = FindBrush(brushHandle);
  return dc && brush ? FillWith(*dc, *rect, brush) : 0;
} catch (const std::bad_alloc&) {
  return NoMemory(0);
}

int FrameRect(HDC handle, const RECT* rect, HBRUSH brushHandle) try {
  auto* dc = Find<Context>(handle);
  Ref<Brush> brush = FindBrush(brushHandle);
  if (!dc || !brush || rect->right <= rect->left || rect->bottom <= rect->top) return 0;
  return FrameWith(*dc, *rect, brush);
} catch (const std::bad_alloc&) {
  return NoMemory(0);
}

BOOL FillRgn(HDC dc, HRGN region, HBRUSH brush) try {
  return FillRegion(dc, region, FindBrush(brush), R2_COPYPEN);
} catch (const std::bad_alloc&) {
  return NoMemory(FALSE);
}

BOOL FrameRgn(HDC handle, HRGN regionHandle, HBRUSH brushHandle, int width, int height) try {
  auto* dc = Find<Context>(handle);
  auto* region = Find<RegionObject>(regionHandle);
  Ref<Brush> brush = FindBrush(brushHandle);
  return dc && region && brush && FillAreaWith(*dc, OutlineOf(region->m_area, width, height), brush, R2_COPYPEN);
} catch (const std::bad_alloc&) {
  return NoMemory(FALSE);
}

BOOL PaintRgn(HDC handle, HRGN region) try {
  auto* dc = Find<Context>(handle);
  return dc && FillRegion(handle, region, dc->m_settings.brush, dc->m_settings.rop2);
} catch (const std::bad_alloc&) {
  return NoMemory(FALSE);
}

BOOL InvertRgn(HDC handle, HRGN region) try {
  return FillRegion(handle, region, StockAs<Brush>(BLACK_BRUSH), R2_NOT);
} catch (const std::bad_alloc&) {
  return NoMemory(FALSE);
}

BOOL InvertRect(HDC handle, const RECT* rect) try {
  auto* dc = Find<Context>(handle);
  if (!dc) return FALSE;
  if (Record(*dc, [rect = *rect](HDC to) { InvertRect(to, &rect); })) return TRUE;
  PaintBox(*dc, dc->Map(*rect), SolidPaint(*dc, 0), R2_NOT);
  return TRUE;
} catch (const std::bad_alloc&) {
  return NoMemory(FALSE);
}
