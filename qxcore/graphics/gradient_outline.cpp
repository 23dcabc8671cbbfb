#include "qxcore/graphics/internal/gradient_outline.h"

#include <algorithm>
#include <cmath>

#include "qxcore/graphics/color.h"
#include "qxcore/graphics/gradient.h"
#include "qxcore/graphics/internal/gradient_ramp.h"

// How far an ellipse's quarter with these radii lies inside of its rectangle, line by line from the outside.
static STableDumb<int> InsetsOf(double along, double across) {
  const int count = static_cast<int>(std::floor(along));
  STableDumb<int> insets;
  insets.GrowTo(count);
  for (int i = 0; i < count; ++i) {
    double fromMiddle = (along - (i + 0.5)) / along;
    insets.Add(static_cast<int>(std::lround(across * (1 - std::sqrt(1 - fromMiddle * fromMiddle)))));
  }
  return insets;
}

SGradientOutline::SGradientOutline(const SRect& rect, int frameType, const SSize& corner)
    : m_rect(rect),
      m_frameType(frameType),
      m_corner(std::min<int>(corner.cx, rect.Width()), std::min<int>(corner.cy, rect.Height())) {
  if (frameType != SDrawGradient::FRAME_ROUND_RECT || m_corner.cx < 2 || m_corner.cy < 2) return;
  m_rowInset = InsetsOf(m_corner.cy / 2.0, m_corner.cx / 2.0);
  m_columnInset = InsetsOf(m_corner.cx / 2.0, m_corner.cy / 2.0);
}

static int InsetAt(const STableDumb<int>& insets, int fromStart, int fromEnd) {
  int line = std::min(fromStart, fromEnd);
  return line < insets.GetCount() ? insets.GetConst(line) : 0;
}

SRect SGradientOutline::Row(int y) const {
  int inset = InsetAt(m_rowInset, y - m_rect.top, m_rect.bottom - 1 - y);
  return SRect(m_rect.left + inset, y, m_rect.right - inset, y + 1);
}

SRect SGradientOutline::Column(int x) const {
  int inset = InsetAt(m_columnInset, x - m_rect.left, m_rect.right - 1 - x);
  return SRect(x, m_rect.top + inset, x + 1, m_rect.bottom - inset);
}

static void DrawRing(SDC& dc, const SRect& rect, unsigned long topLeft, unsigned long bottomRight) {
  SBandPainter painter(dc);
  painter.FillIfAny(SRect(rect.left, rect.top, rect.right, rect.top + 1), topLeft);
  painter.FillIfAny(SRect(rect.left, rect.top + 1, rect.left + 1, rect.bottom), topLeft);
  painter.FillIfAny(SRect(rect.right - 1, rect.top + 1, rect.right, rect.bottom), bottomRight);
  painter.FillIfAny(SRect(rect.left + 1, rect.bottom - 1, rect.right - 1, rect.bottom), bottomRight);
}

static void DrawRoundLine(SDC& dc, const SRect& rect, const SSize& corner, unsigned long color) {
  HPEN pen = ::CreatePen(PS_SOLID, 1, static_cast<COLORREF>(color));
  {
    SSelectObject selectPen(dc, pen), selectBrush(dc, ::GetStockObject(NULL_BRUSH));
    dc.RoundRect(rect, corner);
  }
  ::DeleteObject(pen);
}

void SGradientOutline::DrawFrame(SDC& dc, unsigned long light, unsigned long dark) const {
  unsigned long line = SColor::GetDarkColor5(dark), shine = SColor::GetLightColor7(light),
                shade = SColor::GetDarkColor4(dark);
  SRect inner = m_rect;
  inner.Deflate(1, 1);
  switch (m_frameType) {
    case SDrawGradient::FRAME_RECT:
      return DrawRing(dc, m_rect, line, line);
    case SDrawGradient::FRAME_ROUND_RECT:
      return DrawRoundLine(dc, m_rect, m_corner, line);
    case SDrawGradient::FRAME_RAISED:
      return DrawRing(dc, m_rect, shine, shade);
    case SDrawGradient::FRAME_SUNKEN:
      return DrawRing(dc, m_rect, shade, shine);
    case SDrawGradient::FRAME_ETCHED:
      DrawRing(dc, m_rect, shine, shade);
      return inner.IsEmpty() ? void() : DrawRing(dc, inner, shade, shine);
    default:
      return;
  }
}
