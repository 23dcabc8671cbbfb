#include "qxcore/platform/posix/draw/context.h"

#include <algorithm>
#include <cmath>

#include "qxcore/platform/posix/draw/font_object.h"
#include "qxcore/platform/posix/draw/recorder.h"
#include "qxcore/platform/posix/draw/stock.h"
#include "qxcore/platform/posix/window/deferred_copies.h"

namespace draw {

int Mapping::Round(double value) {
  return static_cast<int>(std::floor(std::clamp(value, -1073741824.0, 1073741824.0) + 0.5));
}

Context::Context(DWORD type) : Object(type) {
  m_settings.pen = StockAs<Pen>(BLACK_PEN);
  m_settings.brush = StockAs<Brush>(WHITE_BRUSH);
  m_settings.font = StockAs<FontObject>(SYSTEM_FONT);
}

Context::~Context() {
  if (m_type == OBJ_MEMDC && m_target && m_target->m_user == this) m_target->m_user = nullptr;
}

void Context::SetTarget(const Ref<Bitmap>& bitmap) {
  SetTarget(bitmap, POINT{}, Area(Box{0, 0, bitmap->m_surface.width, bitmap->m_surface.height}));
}

void Context::SetTarget(const Ref<Bitmap>& surface, POINT origin, const Area& visible) {
  m_target = surface;
  m_surface = surface->m_surface;
  m_origin = origin;
  m_visible = visible;
  m_visible.And(Box{0, 0, m_surface.width, m_surface.height});
  UpdateMapping();
  UpdateClip();
}

void Context::UpdateMapping() {
  const Settings& set = m_settings;
  double scaleX = set.mapMode == MM_TEXT ? 1 : double(set.viewportExtent.cx) / set.windowExtent.cx;
  double scaleY = set.mapMode == MM_TEXT ? 1 : double(set.viewportExtent.cy) / set.windowExtent.cy;
  double addX = set.viewportOrigin.x - set.windowOrigin.x * scaleX;
  double addY = set.viewportOrigin.y - set.windowOrigin.y * scaleY;
  m_map.scaleX = scaleX * m_playScaleX;
  m_map.scaleY = scaleY * m_playScaleY;
  m_map.addX = addX * m_playScaleX + m_playAddX + m_origin.x;
  m_map.addY = addY * m_playScaleY + m_playAddY + m_origin.y;
  m_map.shiftOnly = m_map.scaleX == 1 && m_map.scaleY == 1;
  m_map.dx = Mapping::Round(m_map.addX);
  m_map.dy = Mapping::Round(m_map.addY);
}

void Context::SetPlayback(double scaleX, double scaleY, double addX, double addY) {
  m_playScaleX = scaleX, m_playScaleY = scaleY, m_playAddX = addX, m_playAddY = addY;
  UpdateMapping();
}

void Context::EndPlayback() { SetPlayback(1, 1, 0, 0); }

void Context::ComputeClip() const {
  if (m_top && !m_wasDrawnOn) {
    const Box& used = VisibleExtents();
    platform::model::CopyBefore(m_top, {used.x1, used.y1, used.x2, used.y2});
  }
  m_wasDrawnOn = true;
  m_clip = m_visible;
  if (m_settings.clipped) {
    Area own = m_settings.clip;
    own.Offset(m_origin.x, m_origin.y);
    m_clip.And(own);
  }
  m_single = m_clip.Complexity() == SIMPLEREGION;
  m_clipValid = true;
}

}  // namespace draw
