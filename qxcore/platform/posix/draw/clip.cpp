// Clip regions. They are kept in pixels of the device; rectangles come in logical units.
#include "qxcore/platform/posix/draw/recorder.h"

using namespace draw;

namespace {

// A rectangle in pixels of the device.
Box OnDevice(const Context& dc, const RECT& rect) {
  Box box = dc.Map(rect);
  return {box.x1 - dc.m_origin.x, box.y1 - dc.m_origin.y, box.x2 - dc.m_origin.x, box.y2 - dc.m_origin.y};
}

// Before a context has a clip region, everything belongs to it.
int CombineClip(Context& dc, const Area& area, int mode) {
  constexpr int kFar = 1 << 27;
  Area clip = dc.m_settings.clipped ? dc.m_settings.clip : Area({-kFar, -kFar, kFar, kFar});
  clip.Combine(area, mode);
  dc.m_settings.clip = std::move(clip);
  dc.m_settings.clipped = true;
  dc.UpdateClip();
  return dc.m_settings.clip.Complexity();
}

int Unclip(Context& dc) {
  dc.m_settings.clipped = false;
  dc.UpdateClip();
  return SIMPLEREGION;
}

}  // namespace

int SelectClipRgn(HDC dc, HRGN region) { return ExtSelectClipRgn(dc, region, RGN_COPY); }

int ExtSelectClipRgn(HDC handle, HRGN regionHandle, int mode) try {
  auto* dc = Find<Context>(handle);
  if (!dc) return RGN_ERROR;
  if (!regionHandle) {
    if (mode != RGN_COPY) return Fail(RGN_ERROR);
    Record(*dc, [](HDC to) { SelectClipRgn(to, nullptr); });
    return Unclip(*dc);
  }
  auto* region = Find<RegionObject>(regionHandle);
  if (!region || mode < RGN_AND || mode > RGN_COPY) return Fail(RGN_ERROR);
  Record(*dc, [area = region->m_area, mode](HDC to) {
    if (auto* target = Find<Context>(to)) CombineClip(*target, area, mode);
  });
  return CombineClip(*dc, region->m_area, mode);
} catch (const std::bad_alloc&) {
  return NoMemory(RGN_ERROR);
}

int IntersectClipRect(HDC handle, int left, int top, int right, int bottom) try {
  auto* dc = Find<Context>(handle);
  if (!dc) return RGN_ERROR;
  Record(*dc, [=](HDC to) { IntersectClipRect(to, left, top, right, bottom); });
  return CombineClip(*dc, Area(OnDevice(*dc, {left, top, right, bottom})), RGN_AND);
} catch (const std::bad_alloc&) {
  return NoMemory(RGN_ERROR);
}

int ExcludeClipRect(HDC handle, int left, int top, int right, int bottom) try {
  auto* dc = Find<Context>(handle);
  if (!dc) return RGN_ERROR;
  Record(*dc, [=](HDC to) { ExcludeClipRect(to, left, top, right, bottom); });
  return CombineClip(*dc, Area(OnDevice(*dc, {left, top, right, bottom})), RGN_DIFF);
} catch (const std::bad_alloc&) {
  return NoMemory(RGN_ERROR);
}

int OffsetClipRgn(HDC handle, int dx, int dy) {
  auto* dc = Find<Context>(handle);
  if (!dc) return RGN_ERROR;
  Record(*dc, [=](HDC to) { OffsetClipRgn(to, dx, dy); });
  if (!dc->m_settings.clipped) return SIMPLEREGION;
  dc->m_settings.clip.Offset(dc->Map().Width(dx), dc->Map().Height(dy));
  dc->UpdateClip();
  return dc->m_settings.clip.Complexity();
}

int GetClipBox(HDC handle, RECT* rect) try {
  auto* dc = Find<Context>(handle);
  if (!dc) return RGN_ERROR;
  const Area& clip = dc->Clip();
  *rect = RECT{};
  if (clip.Empty()) return NULLREGION;
  const Box& box = clip.Extents();
  POINT corners[2] = {{box.x1 - dc->m_origin.x, box.y1 - dc->m_origin.y},
                      {box.x2 - dc->m_origin.x, box.y2 - dc->m_origin.y}};
  DPtoLP(handle, corners, 2);
  *rect = {corners[0].x, corners[0].y, corners[1].x, corners[1].y};
  return clip.Complexity();
} catch (const std::bad_alloc&) {
  return NoMemory(RGN_ERROR);
}

int GetClipRgn(HDC handle, HRGN regionHandle) try {
  auto* dc = Find<Context>(handle);
  auto* region = Find<RegionObject>(regionHandle);
  if (!dc || !region) return -1;
  if (!dc->m_settings.clipped) return 0;
  region->m_area = dc->m_settings.clip;
  return 1;
} catch (const std::bad_alloc&) {
  return NoMemory(-1);
}

// An enhanced metafile has no edges, an old one nothing that could be seen.
BOOL RectVisible(HDC handle, const RECT* rect) try {
  auto* dc = Find<Context>(handle);
  if (!dc) return FALSE;
  if (dc->m_recorder) return dc->m_type == OBJ_ENHMETADC;
  Box box = dc->Map(*rect);
  if (const Box* clip = dc->SingleClip()) return !IsEmpty(Intersect(box, *clip));
  return dc->Clip().Meets(box);
} catch (const std::bad_alloc&) {
  return NoMemory(FALSE);
}

BOOL PtVisible(HDC handle, int x, int y) try {
  auto* dc = Find<Context>(handle);
  return dc && !dc->m_recorder && dc->Clip().Contains(dc->X(x), dc->Y(y));
} catch (const std::bad_alloc&) {
  return NoMemory(FALSE);
}
