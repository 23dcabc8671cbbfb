#include "qxcore/platform/posix/draw/pen_brush.h"

#include <cstdlib>
#include <cstring>

#include "qxcore/platform/posix/draw/context.h"

using namespace draw;

HPEN CreatePen(int style, int width, COLORREF color) {
  if (style < PS_SOLID || style > PS_INSIDEFRAME) style = PS_SOLID;
  return EnterAs<HPEN>(new Pen(style, std::abs(width), {ColorSource::kFixed, color, 0}));
}

HPEN CreatePenIndirect(const LOGPEN* pen) {
  return CreatePen(static_cast<int>(pen->lopnStyle), pen->lopnWidth.x, pen->lopnColor);
}

HBRUSH CreateSolidBrush(COLORREF color) {
  return EnterAs<HBRUSH>(new Brush(BS_SOLID, {ColorSource::kFixed, color, 0}));
}

HBRUSH CreateHatchBrush(int hatch, COLORREF color) {
  if (hatch < HS_HORIZONTAL || hatch > HS_DIAGCROSS) return Fail<HBRUSH>(nullptr);
  return EnterAs<HBRUSH>(new Brush(BS_HATCHED, {ColorSource::kFixed, color, 0}, hatch));
}

HBRUSH CreatePatternBrush(HBITMAP handle) {
  auto* source = Find<Bitmap>(handle);
  if (!source) return nullptr;
  const Surface& from = source->m_surface;
  Ref<Bitmap> copy(Bitmap::Make(from.width, from.height, source->m_bitCount));
  auto* brush = copy ? new Brush(BS_PATTERN, {}) : nullptr;
  if (!brush) return Fail<HBRUSH>(nullptr, ERROR_NOT_ENOUGH_MEMORY);
  for (int y = 0; y < from.height; ++y)
    std::memcpy(copy->m_surface.Row(y), from.Row(y), static_cast<std::size_t>(from.width) * 4);
  brush->m_pattern = copy;
  return EnterAs<HBRUSH>(brush);
}

HBRUSH CreateBrushIndirect(const LOGBRUSH* brush) {
  switch (brush->lbStyle) {
    case BS_SOLID:
      return CreateSolidBrush(brush->lbColor);
    case BS_HATCHED:
      return CreateHatchBrush(static_cast<int>(brush->lbHatch), brush->lbColor);
    case BS_PATTERN:
      return CreatePatternBrush(reinterpret_cast<HBITMAP>(brush->lbHatch));
    case BS_NULL:
      return EnterAs<HBRUSH>(new Brush(BS_NULL, {}));
    default:
      return Fail<HBRUSH>(nullptr);
  }
}
