// SRgn: a set of pixels, kept as rectangles; for clipping, filling and hit tests.
// Threads: an object belongs to one thread at a time.
#pragma once

#include "qxcore/graphics/gdi_object.h"
#include "qxcore/graphics/rect.h"

class QXCORE_API SRgn : public SGdiObject {
  QXCORE_DECLARE_CREATABLE_CLASS(SRgn)

  SRgn() = default;
  // A rectangle; GetSafeHandle() is null when the system refuses.
  explicit SRgn(const RECT& rect) { CreateRectRgn(rect); }
  explicit SRgn(HRGN region) : SGdiObject(region) {}

  // A rectangle; empty for an empty one.
  int CreateRectRgn(const RECT& rect) { return Hold(::CreateRectRgnIndirect(&rect)); }
  // A rectangle whose corners are quarters of an ellipse of this width and height.
  int CreateRoundRectRgn(const RECT& rect, const SIZE& corner) {
    return Hold(::CreateRoundRectRgn(rect.left, rect.top, rect.right, rect.bottom, corner.cx, corner.cy));
  }
  // The ellipse that fits into a rectangle.
  int CreateEllipticRgn(const RECT& rect) {
    return Hold(::CreateEllipticRgn(rect.left, rect.top, rect.right, rect.bottom));
  }
  // The inside of a polygon; `mode` is ALTERNATE or WINDING.
  int CreatePolygonRgn(const POINT* points, int count, int mode) {
    return Hold(::CreatePolygonRgn(points, count, mode));
  }

  // Becomes the combination (RGN_AND, RGN_OR, RGN_XOR, RGN_DIFF, RGN_COPY) of two regions, each of which may be
  // this one. Returns NULLREGION, SIMPLEREGION, COMPLEXREGION, or ERROR.
  int CombineRgn(HRGN a, HRGN b, int mode) { return ::CombineRgn(*this, a, b, mode); }
  // Moves it. The result as above.
  int OffsetRgn(int dx, int dy) { return ::OffsetRgn(*this, dx, dy); }
  // The smallest rectangle around it.
  SRect GetRgnBox() const {
    SRect box;
    ::GetRgnBox(*this, box);
    return box;
  }
  // True when a pixel, or at least one pixel of a rectangle, belongs to it.
  bool Contains(const POINT& point) const { return ::PtInRegion(*this, point.x, point.y) != 0; }
  bool Intersects(const RECT& rect) const { return ::RectInRegion(*this, &rect) != 0; }
  // True when both hold the same pixels.
  bool Equals(HRGN other) const { return ::EqualRgn(*this, other) != 0; }

  // The handle; stays the object's.
  operator HRGN() const { return static_cast<HRGN>(m_hObject); }
};
