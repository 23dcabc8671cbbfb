// The colours of a gradient's bands, and the filling of one band.
#pragma once

#include "qxcore/graphics/color.h"
#include "qxcore/graphics/dc.h"

// The colours over an extent of `length` bands, for a mode's variant: bit 0 exchanges the colours, bit 1 runs them
// over half of the extent and back.
class SGradientRamp {
 public:
  SGradientRamp(unsigned long from, unsigned long to, int length, int variant)
      : m_from(variant & 1 ? to : from),
        m_to(variant & 1 ? from : to),
        m_length(length),
        m_half(variant & 2 ? length / 2 : length),
        m_mirrored((variant & 2) != 0),
        m_at25(SColor::GetMediumColor(m_from, m_to, 25, 100)),
        m_at55(SColor::GetMediumColor(m_from, m_to, 55, 100)),
        m_at85(SColor::GetMediumColor(m_from, m_to, 85, 100)) {}

  // The colour of band 1 to `length`.
  unsigned long At(int band) const {
    int x = m_mirrored && band > m_half ? m_length - band : band;
    int quarter = m_half / 4, half = m_half / 2;
    if (x <= quarter) return SColor::GetMediumColor(m_from, m_at25, x, quarter);
    if (x <= half) return SColor::GetMediumColor(m_at25, m_at55, x - quarter, half - quarter);
    if (x <= half + quarter) return SColor::GetMediumColor(m_at55, m_at85, x - half, quarter);
    return SColor::GetMediumColor(m_at85, m_to, x - (half + quarter), m_half - (half + quarter));
  }

 private:
  unsigned long m_from, m_to;
  int m_length, m_half;
  bool m_mirrored;
  unsigned long m_at25, m_at55, m_at85;
};

// Fills bands by an empty text on an opaque background, which is the cheapest solid fill; afterwards the background
// colour is as it was.
class SBandPainter {
 public:
  explicit SBandPainter(SDC& dc) : m_dc(dc.m_hDC), m_drawsAll(dc.IsMetafile()), m_background(::GetBkColor(m_dc)) {}
  ~SBandPainter() { ::SetBkColor(m_dc, m_background); }
  SBandPainter(const SBandPainter&) = delete;
  SBandPainter& operator=(const SBandPainter&) = delete;

  // A metafile has no clip region to ask.
  bool IsVisible(const RECT& rect) const { return m_drawsAll || ::RectVisible(m_dc, &rect); }

  void Fill(const RECT& band, unsigned long color) {
    if (!IsVisible(band)) return;
    ::SetBkColor(m_dc, static_cast<COLORREF>(color));
    ::ExtTextOutW(m_dc, 0, 0, ETO_OPAQUE, &band, WTEXT(""), 0, nullptr);
  }
  // The same; an empty rectangle is left out.
  void FillIfAny(const SRect& rect, unsigned long color) {
    if (!rect.IsEmpty()) Fill(rect, color);
  }
  // A line of one pixel from one point to another, both drawn; along an axis or at 45 degrees.
  void Line(const SPoint& from, const SPoint& to, unsigned long color);

 private:
  HDC m_dc;
  bool m_drawsAll;
  COLORREF m_background;
};
