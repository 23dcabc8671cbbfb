// The kinds of gradient that are made of parallel bands.
#include <algorithm>

#include "qxcore/graphics/gradient.h"
#include "qxcore/graphics/internal/gradient_bands.h"

static SRect InOrder(SRect rect) {
  rect.Normalize();
  return rect;
}

void SBandPainter::Line(const SPoint& from, const SPoint& to, unsigned long color) {
  SRect bounds(from, to);
  bounds.Normalize();
  bounds.Deflate(0, 0, -1, -1);
  if (!IsVisible(bounds)) return;
  if (from == to) return Fill(bounds, color);
  HPEN pen = ::CreatePen(PS_SOLID, 1, static_cast<COLORREF>(color));
  HGDIOBJ former = ::SelectObject(m_dc, pen);
  ::MoveToEx(m_dc, from.x, from.y, nullptr);
  // The last point of a line is not drawn: go one further.
  auto further = [](int a, int b) { return b + (b > a) - (b < a); };
  ::LineTo(m_dc, further(from.x, to.x), further(from.y, to.y));
  ::SelectObject(m_dc, former);
  ::DeleteObject(pen);
}

void FillRows(SDC& dc, const SGradientOutline& outline, unsigned long from, unsigned long to, int variant) {
  const SRect& rect = outline.Rect();
  int length = rect.Height();
  SGradientRamp ramp(from, to, length, variant);
  SBandPainter painter(dc);
  for (int band = 1; band <= length; ++band) painter.Fill(outline.Row(rect.top - 1 + band), ramp.At(band));
}

void FillColumns(SDC& dc, const SGradientOutline& outline, unsigned long from, unsigned long to, int variant) {
  const SRect& rect = outline.Rect();
  int length = rect.Width();
  SGradientRamp ramp(from, to, length, variant);
  SBandPainter painter(dc);
  for (int band = 1; band <= length; ++band) painter.Fill(outline.Column(rect.left - 1 + band), ramp.At(band));
}

void FillDiagonals(SDC& dc, const SGradientOutline& outline, unsigned long from, unsigned long to, int variant,
                   bool up) {
  const SRect& rect = outline.Rect();
  if (rect.IsEmpty()) return;
  int width = rect.Width(), height = rect.Height(), length = width + height - 1;
  SGradientRamp ramp(from, to, length, variant);
  SBandPainter painter(dc);
  // A line holds the pixels whose distances from the first corner, along both sides, have the same sum.
  auto at = [&](int sum, int across) {
    int along = sum - across;
    return SPoint(rect.left + across, up ? rect.bottom - 1 - along : rect.top + along);
  };
  for (int band = 1; band <= length; ++band) {
    int sum = band - 1, first = std::max(0, sum - (height - 1)), last = std::min(sum, width - 1);
    while (first <= last && !outline.Contains(at(sum, first))) ++first;
    while (first <= last && !outline.Contains(at(sum, last))) --last;
    if (first <= last) painter.Line(at(sum, first), at(sum, last), ramp.At(band));
  }
}

void SDrawGradient::DrawHorzGradient(SDC& dc, const SRect& rect, unsigned long from, unsigned long to, int mode) const {
  if (mode & HORZ) FillRows(dc, SGradientOutline(InOrder(rect), FRAME_NONE, SSize()), from, to, mode & 0xF);
}

void SDrawGradient::DrawVertGradient(SDC& dc, const SRect& rect, unsigned long from, unsigned long to, int mode) const {
  if (mode & VERT) FillColumns(dc, SGradientOutline(InOrder(rect), FRAME_NONE, SSize()), from, to, mode & 0xF);
}

void SDrawGradient::DrawDiagUpGradient(SDC& dc, const SRect& rect, unsigned long from, unsigned long to,
                                       int mode) const {
  if (mode & DIAG_UP)
    FillDiagonals(dc, SGradientOutline(InOrder(rect), FRAME_NONE, SSize()), from, to, mode & 0xF, true);
}

void SDrawGradient::DrawDiagDownGradient(SDC& dc, const SRect& rect, unsigned long from, unsigned long to,
                                         int mode) const {
  if (mode & DIAG_DOWN)
    FillDiagonals(dc, SGradientOutline(InOrder(rect), FRAME_NONE, SSize()), from, to, mode & 0xF, false);
}
