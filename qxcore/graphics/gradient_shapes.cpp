// The kinds of gradient that are made of nested shapes, and the buttons.
#include <algorithm>

#include "qxcore/graphics/gradient.h"
#include "qxcore/graphics/internal/gradient_bands.h"

namespace {

SRect InOrder(SRect rect) {
  rect.Normalize();
  return rect;
}

// Fills what lies between two nested rectangles.
void FillBetween(SBandPainter& painter, const SRect& outer, const SRect& inner, unsigned long color) {
  if (inner.IsEmpty()) return painter.FillIfAny(outer, color);
  painter.FillIfAny(SRect(outer.left, outer.top, outer.right, inner.top), color);
  painter.FillIfAny(SRect(outer.left, inner.top, inner.left, inner.bottom), color);
  painter.FillIfAny(SRect(inner.right, inner.top, outer.right, inner.bottom), color);
  painter.FillIfAny(SRect(outer.left, inner.bottom, outer.right, outer.bottom), color);
}

int Part(int whole, int step, int steps) { return static_cast<int>(static_cast<long long>(whole) * step / steps); }

}  // namespace

void SDrawGradient::DrawCornerGradient(SDC& dc, const SRect& rect, unsigned long from, unsigned long to, int mode,
                                       int frameType) const {
  SRect area = InOrder(rect);
  if (!(mode & CORNER) || area.IsEmpty()) return;
  int length = std::max(area.Width(), area.Height());
  SGradientRamp ramp(from, to, length, mode & 1);
  {
    SBandPainter painter(dc);
    SRect inner(area.TopLeft(), SSize());
    for (int band = 1; band <= length; ++band) {
      SRect outer(area.TopLeft(), SSize(Part(area.Width(), band, length), Part(area.Height(), band, length)));
      FillBetween(painter, outer, inner, ramp.At(band));
      inner = outer;
    }
  }
  SGradientOutline(area, frameType, m_roundRectSize).DrawFrame(dc, from, to);
}

void SDrawGradient::DrawCenterGradient(SDC& dc, const SRect& rect, unsigned long from, unsigned long to, int mode,
                                       int frameType) const {
  DrawCenterGradientEx(dc, rect, InOrder(rect).CenterPoint(), from, to, mode, frameType);
}

void SDrawGradient::DrawCenterGradientEx(SDC& dc, const SRect& rect, const SPoint& center, unsigned long from,
                                         unsigned long to, int mode, int frameType) const {
  SRect area = InOrder(rect);
  if (!(mode & CENTER) || area.IsEmpty()) return;
  int x = std::clamp(center.x, area.left, area.right), y = std::clamp(center.y, area.top, area.bottom);
  int length = std::max({x - area.left, area.right - x, y - area.top, area.bottom - y});
  SGradientRamp ramp(from, to, length, mode & 1);
  {
    SBandPainter painter(dc);
    SRect inner(x, y, x, y);
    for (int band = 1; band <= length; ++band) {
      SRect outer(x - Part(x - area.left, band, length), y - Part(y - area.top, band, length),
                  x + Part(area.right - x, band, length), y + Part(area.bottom - y, band, length));
      FillBetween(painter, outer, inner, ramp.At(band));
      inner = outer;
    }
  }
  SGradientOutline(area, frameType, m_roundRectSize).DrawFrame(dc, from, to);
}

void SDrawGradient::DrawButtonGradient(SDC& dc, const SRect& rect, unsigned long color, int mode, int frameType) const {
  SRect area = InOrder(rect);
  if (!(mode & BUTTON) || area.IsEmpty()) return;
  SGradientOutline outline(area, frameType, m_roundRectSize);
  int height = area.Height(), upper = height / 2;
  SGradientRamp gloss(SColor::GetLightColor6(color), SColor::GetLightColor2(color), upper, 0);
  SGradientRamp body(color, SColor::GetLightColor3(color), height - upper, 0);
  {
    SBandPainter painter(dc);
    for (int band = 1; band <= height; ++band)
      painter.Fill(outline.Row(area.top - 1 + band), band <= upper ? gloss.At(band) : body.At(band - upper));
  }
  outline.DrawFrame(dc, color, color);
}

void SDrawGradient::Draw3DGradient(SDC& dc, const SRect& rect, unsigned long from, unsigned long to, int mode,
                                   int frameType) const {
  SRect area = InOrder(rect);
  if (!(mode & PANEL_3D) || area.IsEmpty()) return;
  constexpr int kNarrowest = 2, kWidest = 12;
  int side = std::min(area.Width(), area.Height());
  int bevel = std::min(std::clamp(side / 8, kNarrowest, kWidest), side / 2);
  unsigned long light = SColor::GetLightColor6(from), dark = SColor::GetDarkColor5(to);
  SRect inner = area;
  for (int step = 0; step < bevel; ++step, inner.Deflate(1, 1)) {
    SBandPainter painter(dc);
    unsigned long lit = SColor::GetMediumColor(light, from, step, bevel),
                  shaded = SColor::GetMediumColor(dark, to, step, bevel);
    painter.FillIfAny(SRect(inner.left, inner.top, inner.right - 1, inner.top + 1), lit);
    painter.FillIfAny(SRect(inner.left, inner.top + 1, inner.left + 1, inner.bottom - 1), lit);
    painter.FillIfAny(SRect(inner.right - 1, inner.top, inner.right, inner.bottom), shaded);
    painter.FillIfAny(SRect(inner.left, inner.bottom - 1, inner.right - 1, inner.bottom), shaded);
  }
  if (!inner.IsEmpty()) FillRows(dc, SGradientOutline(inner, FRAME_NONE, SSize()), from, to, mode & 3);
  SGradientOutline(area, frameType, m_roundRectSize).DrawFrame(dc, from, to);
}

void SDrawGradient::DrawGradButtonGradient(SDC& dc, const SRect& rect, unsigned long from, unsigned long to, int mode,
                                           int frameType) const {
  SRect area = InOrder(rect);
  if (!(mode & GRAD_BUTTON) || area.IsEmpty()) return;
  SGradientOutline outline(area, frameType, m_roundRectSize);
  switch (mode & ~0xFFF0) {
    case GRAD_BUTTON_VERT & 0xF:
      FillColumns(dc, outline, from, to, 0);
      break;
    case GRAD_BUTTON_DIAG_UP & 0xF:
      FillDiagonals(dc, outline, from, to, 0, true);
      break;
    case GRAD_BUTTON_DIAG_DOWN & 0xF:
      FillDiagonals(dc, outline, from, to, 0, false);
      break;
    default:
      FillRows(dc, outline, from, to, 0);
  }
  outline.DrawFrame(dc, from, to);
}
