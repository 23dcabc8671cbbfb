#include "qxcore/platform/posix/draw/region.h"

#include <algorithm>

namespace draw {

void Area::SetBox(const Box& box) {
  pixman_region32_fini(&m_region);
  if (IsEmpty(box))
    pixman_region32_init(&m_region);
  else
    pixman_region32_init_with_extents(&m_region, &box);
}

void Area::SetBoxes(const std::vector<Box>& boxes) {
  pixman_region32_fini(&m_region);
  Check(pixman_region32_init_rects(&m_region, boxes.data(), static_cast<int>(boxes.size())));
}

bool Area::Meets(const Box& box) const {
  return !IsEmpty(box) && pixman_region32_contains_rectangle(Data(), const_cast<Box*>(&box)) != PIXMAN_REGION_OUT;
}

void Area::Combine(const Area& other, int mode) {
  switch (mode) {
    case RGN_AND:
      And(other);
      break;
    case RGN_OR:
      Or(other);
      break;
    case RGN_DIFF:
      Less(other);
      break;
    case RGN_COPY:
      *this = other;
      break;
    case RGN_XOR: {
      Area both = *this;
      both.And(other);
      Or(other);
      Less(both);
      break;
    }
  }
}

int Area::Complexity() const {
  if (Empty()) return NULLREGION;
  int count;
  Boxes(&count);
  return count == 1 ? SIMPLEREGION : COMPLEXREGION;
}

}  // namespace draw

using namespace draw;

static HRGN EnterRegion(Area area) { return EnterAs<HRGN>(new RegionObject(std::move(area))); }

HRGN CreateRectRgn(int left, int top, int right, int bottom) try {
  return EnterRegion(Area(BoxOf(left, top, right, bottom)));
} catch (const std::bad_alloc&) {
  return NoMemory(HRGN{});
}

HRGN CreateRectRgnIndirect(const RECT* rect) { return CreateRectRgn(rect->left, rect->top, rect->right, rect->bottom); }

// A region loses the last row and column of the rectangle that it is made from.
HRGN CreateRoundRectRgn(int left, int top, int right, int bottom, int width, int height) try {
  Box box = BoxOf(left, top, right, bottom);
  --box.x2, --box.y2;
  return EnterRegion(RoundRectArea(box, std::abs(width), std::abs(height)));
} catch (const std::bad_alloc&) {
  return NoMemory(HRGN{});
}

HRGN CreateEllipticRgn(int left, int top, int right, int bottom) {
  return CreateRoundRectRgn(left, top, right, bottom, right - left, bottom - top);
}

HRGN CreatePolygonRgn(const POINT* points, int count, int mode) try {
  if (count < 2 || (mode != ALTERNATE && mode != WINDING)) return Fail<HRGN>(nullptr);
  return EnterRegion(PolygonArea(points, count, mode));
} catch (const std::bad_alloc&) {
  return NoMemory(HRGN{});
}

BOOL SetRectRgn(HRGN handle, int left, int top, int right, int bottom) {
  auto* region = Find<RegionObject>(handle);
  if (!region) return FALSE;
  region->m_area.SetBox(BoxOf(left, top, right, bottom));
  return TRUE;
}

int CombineRgn(HRGN toHandle, HRGN aHandle, HRGN bHandle, int mode) try {
  auto* to = Find<RegionObject>(toHandle);
  auto* a = Find<RegionObject>(aHandle);
  if (!to || !a) return RGN_ERROR;
  if (mode == RGN_COPY) {
    to->m_area = a->m_area;
    return to->m_area.Complexity();
  }
  auto* b = Find<RegionObject>(bHandle);
  if (!b) return RGN_ERROR;
  if (mode < RGN_AND || mode > RGN_DIFF) return Fail(RGN_ERROR);
  Area result = a->m_area;
  result.Combine(b->m_area, mode);
  to->m_area = std::move(result);
  return to->m_area.Complexity();
} catch (const std::bad_alloc&) {
  return NoMemory(RGN_ERROR);
}

int OffsetRgn(HRGN handle, int dx, int dy) {
  auto* region = Find<RegionObject>(handle);
  if (!region) return RGN_ERROR;
  region->m_area.Offset(dx, dy);
  return region->m_area.Complexity();
}

int GetRgnBox(HRGN handle, RECT* rect) {
  auto* region = Find<RegionObject>(handle);
  if (!region) return RGN_ERROR;
  const Box& box = region->m_area.Extents();
  *rect = region->m_area.Empty() ? RECT{} : RECT{box.x1, box.y1, box.x2, box.y2};
  return region->m_area.Complexity();
}

BOOL EqualRgn(HRGN aHandle, HRGN bHandle) {
  auto* a = Find<RegionObject>(aHandle);
  auto* b = Find<RegionObject>(bHandle);
  return a && b && a->m_area.Equals(b->m_area);
}

BOOL PtInRegion(HRGN handle, int x, int y) {
  auto* region = Find<RegionObject>(handle);
  return region && region->m_area.Contains(x, y);
}

BOOL RectInRegion(HRGN handle, const RECT* rect) {
  auto* region = Find<RegionObject>(handle);
  return region && region->m_area.Meets(BoxOf(rect->left, rect->top, rect->right, rect->bottom));
}
