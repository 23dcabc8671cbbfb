// The pictures that both targets draw with the same calls.
#pragma once

#include <array>
#include <functional>
#include <vector>

#include "qxcore/graphics/bitmap.h"
#include "qxcore/graphics/brush.h"
#include "qxcore/graphics/dc.h"
#include "qxcore/graphics/font.h"
#include "qxcore/graphics/pen.h"
#include "qxcore/graphics/region.h"

namespace drawing {

constexpr int kWidth = 320, kHeight = 240;

// A number generator that is the same everywhere.
class Random {
 public:
  explicit Random(std::uint32_t seed) : m_state(seed) {}
  int Below(int bound) {
    m_state = m_state * 1664525u + 1013904223u;
    return static_cast<int>((m_state >> 8) % static_cast<std::uint32_t>(bound));
  }
  // One number a statement: compilers differ in the order of arguments.
  COLORREF Color() { return static_cast<COLORREF>(Below(0x1000000)); }
  SPoint Point() {
    int x = Below(kWidth + 80) - 40, y = Below(kHeight + 80) - 40;
    return SPoint(x, y);
  }
  SSize Size(int least, int range) {
    int width = least + Below(range), height = least + Below(range);
    return SSize(width, height);
  }
  SRect Rect() {
    SPoint first = Point(), second = Point();
    SRect rect(first, second);
    rect.Normalize();
    return rect;
  }

 private:
  std::uint32_t m_state;
};

inline void Fills(SDC& dc) {
  Random random(1);
  for (int i = 0; i < 30; ++i) {
    SRect rect = random.Rect();
    dc.FillSolidRect(rect, random.Color());
  }
  for (int i = 0; i < 20; ++i) {
    SBrush brush(random.Color());
    dc.FillRect(random.Rect(), brush);
  }
  for (int i = 0; i < 20; ++i) {
    SBrush brush(random.Color());
    dc.FrameRect(random.Rect(), brush);
  }
  for (int i = 0; i < 10; ++i) dc.InvertRect(random.Rect());
  for (int i = 0; i < 10; ++i) {
    SRect rect = random.Rect();
    COLORREF light = random.Color(), dark = random.Color();
    dc.Draw3dRect(rect, light, dark);
  }
}

inline void Brushes(SDC& dc) {
  for (int hatch = HS_HORIZONTAL; hatch <= HS_DIAGCROSS; ++hatch) {
    SBrush brush;
    brush.CreateHatchBrush(hatch, RGB(200, 0, 40 * hatch));
    dc.SetBkColor(RGB(255, 255, 200));
    dc.SetBkMode(hatch % 2 ? TRANSPARENT : OPAQUE);
    dc.SetBrushOrg(SPoint(hatch, 2 * hatch));
    dc.FillRect(SRect(10 + 50 * hatch, 10, 50 + 50 * hatch, 60), brush);
  }
  SBitmap pattern;
  pattern.CreatePixels(5, 3);
  for (int i = 0; i < 15; ++i) pattern.GetBits()[i] = static_cast<std::uint32_t>(0x103050 * i) & 0xFFFFFF;
  SBrush brush;
  brush.CreatePatternBrush(pattern);
  dc.FillRect(SRect(10, 80, 150, 130), brush);
  SSelectObject select(dc, brush);
  dc.PatBlt(SRect(160, 80, 310, 130), PATINVERT);
  for (int mode = R2_BLACK; mode <= R2_WHITE; ++mode) {
    SSaveDC save(dc);
    SPen pen(PS_SOLID, 1, RGB(200, 100, 50));
    SBrush fill(RGB(15, 60, 240));
    SSelectObject selectPen(dc, pen), selectBrush(dc, fill);
    dc.SetROP2(mode);
    dc.Rectangle(SRect(mode * 18, 70 + mode * 2, mode * 18 + 16, 200 + mode));
  }
}

inline void Lines(SDC& dc) {
  Random random(2);
  for (int i = 0; i < 40; ++i) {
    SPen pen(PS_SOLID, 1, random.Color());
    SSelectObject select(dc, pen);
    dc.MoveTo(random.Point());
    dc.LineTo(random.Point());
  }
  SPoint center(160, 120);
  SPen black(PS_SOLID, 0, 0);
  SSelectObject select(dc, black);
  for (int i = 0; i < 40; ++i) {
    dc.MoveTo(center);
    dc.LineTo(SPoint(120 + 2 * i, 80));
    dc.MoveTo(center);
    dc.LineTo(SPoint(120 + 2 * i, 160));
    dc.MoveTo(center);
    dc.LineTo(SPoint(120, 80 + 2 * i));
    dc.MoveTo(center);
    dc.LineTo(SPoint(200, 80 + 2 * i));
  }
}

inline void BrokenLines(SDC& dc) {
  for (int style = PS_DASH; style <= PS_DASHDOTDOT; ++style) {
    SPen pen(style, 1, RGB(200, 0, 0));
    SSelectObject select(dc, pen);
    dc.SetBkMode(style % 2 ? OPAQUE : TRANSPARENT);
    dc.SetBkColor(RGB(220, 255, 220));
    dc.MoveTo(5, 20 * style);
    dc.LineTo(300, 20 * style);
    dc.MoveTo(5, 100 + 20 * style);
    dc.LineTo(300, 110 + 22 * style);
  }
}

inline void Polygons(SDC& dc) {
  Random random(3);
  for (int i = 0; i < 24; ++i) {
    std::array<POINT, 6> points;
    int count = 3 + random.Below(4);
    int left = random.Below(kWidth - 60), top = random.Below(kHeight - 60);
    for (int k = 0; k < count; ++k) {
      SSize offset = random.Size(0, 70);
      points[static_cast<std::size_t>(k)] = SPoint(left + offset.cx, top + offset.cy);
    }
    SBrush brush(random.Color());
    SPen pen(PS_SOLID, 1, random.Color());
    SSelectObject selectBrush(dc, brush), selectPen(dc, i % 3 ? static_cast<HGDIOBJ>(pen) : GetStockObject(NULL_PEN));
    dc.SetPolyFillMode(i % 2 ? WINDING : ALTERNATE);
    dc.Polygon(points.data(), count);
  }
}

inline void Ellipses(SDC& dc) {
  Random random(4);
  int x = 2, y = 2;
  for (int i = 0; i < 60; ++i) {
    int width = 8 + i % 20, height = 8 + i * 7 % 18;
    SBrush brush(random.Color());
    SPen pen(PS_SOLID, 1, random.Color());
    SSelectObject selectBrush(dc, brush),
        selectPen(dc, i % 4 == 3 ? GetStockObject(NULL_PEN) : static_cast<HGDIOBJ>(pen));
    dc.Ellipse(SRect(x, y, x + width, y + height));
    if ((x += 33) > kWidth - 33) x = 2, y += 32;
  }
  SBrush large(RGB(250, 240, 200));
  SSelectObject select(dc, large);
  dc.Ellipse(SRect(180, 140, 310, 230));
}

inline void RoundRects(SDC& dc) {
  Random random(5);
  for (int i = 0; i < 30; ++i) {
    SBrush brush(random.Color());
    SPen pen(PS_SOLID, 1, random.Color());
    SSelectObject selectBrush(dc, brush), selectPen(dc, pen);
    int x = 5 + i % 6 * 52, y = 5 + i / 6 * 46;
    SSize size = random.Size(20, 24);
    int corner = 4 + random.Below(16);
    dc.RoundRect(SRect(SPoint(x, y), size), SSize(corner + i % 3, corner));
  }
}

inline void Regions(SDC& dc) {
  SRgn ellipse, round, polygon;
  ellipse.CreateEllipticRgn(SRect(10, 10, 120, 90));
  round.CreateRoundRectRgn(SRect(60, 40, 200, 140), SSize(40, 26));
  POINT star[5] = {{150, 10}, {190, 130}, {90, 50}, {210, 50}, {110, 130}};
  polygon.CreatePolygonRgn(star, 5, WINDING);
  int x = 0;
  for (int mode : {RGN_AND, RGN_OR, RGN_XOR, RGN_DIFF}) {
    SRgn result(SRect(0, 0, 1, 1));
    result.CombineRgn(ellipse, round, mode);
    result.CombineRgn(result, polygon, RGN_XOR);
    result.OffsetRgn(x / 2, x / 3);
    dc.FillRgn(result, SBrush(RGB(60 * mode, 250 - 60 * mode, 128)));
    x += 100;
  }
  SSaveDC save(dc);
  polygon.OffsetRgn(100, 90);
  dc.SelectClipRgn(polygon);
  dc.ExcludeClipRect(SRect(230, 130, 250, 190));
  dc.FillSolidRect(SRect(0, 0, kWidth, kHeight), RGB(0, 0, 0));
  for (int i = 0; i < kWidth; i += 6) {
    SPen pen(PS_SOLID, 1, RGB(255, i % 256, 0));
    SSelectObject select(dc, pen);
    dc.MoveTo(i, 0);
    dc.LineTo(kWidth - i, kHeight);
  }
}

inline void Blits(SDC& dc) {
  SMemoryDC memory(dc);
  SBitmap bitmap;
  bitmap.CreateCompatibleBitmap(dc, 60, 40);
  SSelectObject select(memory, bitmap);
  Random random(6);
  for (int i = 0; i < 30; ++i) {
    SSize first = random.Size(0, 50), second = random.Size(0, 50);
    SRect rect(SPoint(first.cx, first.cy), SPoint(second.cx, second.cy));
    rect.Normalize();
    memory.FillSolidRect(rect, random.Color());
  }
  SBrush brush(RGB(90, 200, 30));
  SSelectObject selectBrush(dc, brush);
  DWORD operations[] = {SRCCOPY,    SRCPAINT, SRCAND,   SRCINVERT, SRCERASE,  NOTSRCCOPY, NOTSRCERASE, MERGECOPY,
                        MERGEPAINT, PATCOPY,  PATPAINT, PATINVERT, DSTINVERT, BLACKNESS,  WHITENESS,   0x00B8074A};
  dc.FillSolidRect(SRect(0, 0, kWidth, kHeight / 2), RGB(200, 180, 220));
  for (int i = 0; i < 16; ++i)
    dc.BitBlt(SRect(SPoint(5 + i % 8 * 39, 5 + i / 8 * 50), SSize(36, 44)), memory, SPoint(3, 2), operations[i]);
  // Onto itself, overlapping.
  dc.BitBlt(SRect(20, 120, 160, 170), dc, SPoint(5, 100));
  dc.BitBlt(SRect(5, 150, 100, 220), dc, SPoint(20, 160));
  // Stretched and mirrored.
  dc.SetStretchBltMode(COLORONCOLOR);
  dc.StretchBlt(SRect(170, 110, 310, 170), memory, SRect(0, 0, 60, 40));
  dc.StretchBlt(SRect(170, 175, 200, 195), memory, SRect(0, 0, 60, 40));
  dc.StretchBlt(SRect(280, 175, 220, 215), memory, SRect(0, 0, 60, 40));
  // Beyond the source.
  dc.BitBlt(SRect(110, 180, 160, 235), memory, SPoint(30, 20));
}

inline void OneBit(SDC& dc) {
  static const BYTE kBits[] = {0xF0, 0, 0xC3, 0, 0x99, 0, 0x3C, 0, 0x3C, 0, 0x99, 0, 0xC3, 0, 0xF0, 0};
  SBitmap mask(::CreateBitmap(8, 8, 1, 1, kBits));
  SMemoryDC memory(dc);
  SSelectObject select(memory, mask);
  dc.SetTextColor(RGB(255, 0, 0));
  dc.SetBkColor(RGB(0, 0, 255));
  dc.BitBlt(SRect(10, 10, 18, 18), memory, SPoint(0, 0));
  dc.SetStretchBltMode(COLORONCOLOR);
  dc.StretchBlt(SRect(30, 10, 94, 74), memory, SRect(0, 0, 8, 8));
  dc.BitBlt(SRect(100, 10, 108, 18), memory, SPoint(0, 0), SRCAND);
  // Back: what has the source's background colour becomes white.
  dc.FillSolidRect(SRect(120, 10, 160, 50), RGB(1, 2, 3));
  dc.FillSolidRect(SRect(130, 20, 150, 40), RGB(200, 100, 0));
  dc.SetBkColor(RGB(1, 2, 3));
  SMemoryDC second(dc);
  SBitmap made(::CreateBitmap(40, 40, 1, 1, nullptr));
  SSelectObject selectMade(second, made);
  second.BitBlt(SRect(0, 0, 40, 40), dc, SPoint(120, 10));
  dc.SetBkColor(RGB(255, 255, 255));
  dc.SetTextColor(0);
  dc.BitBlt(SRect(170, 10, 210, 50), second, SPoint(0, 0));
}

inline void Edges(SDC& dc) {
  dc.FillSolidRect(SRect(0, 0, kWidth, kHeight), GetSysColor(COLOR_3DFACE));
  unsigned int edges[] = {BDR_RAISEDOUTER, BDR_SUNKENOUTER, BDR_RAISEDINNER, BDR_SUNKENINNER,
                          EDGE_RAISED,     EDGE_SUNKEN,     EDGE_ETCHED,     EDGE_BUMP};
  unsigned int flags[] = {BF_RECT,    BF_RECT | BF_SOFT, BF_RECT | BF_FLAT,   BF_RECT | BF_MONO,
                          BF_TOPLEFT, BF_BOTTOMRIGHT,    BF_RECT | BF_MIDDLE, BF_LEFT | BF_BOTTOM};
  for (int i = 0; i < 8; ++i) {
    for (int k = 0; k < 8; ++k) {
      SRect rect(SPoint(5 + i * 38, 5 + k * 28), SSize(32, 22));
      dc.DrawEdge(rect, edges[i], flags[k] | BF_ADJUST);
      dc.FillSolidRect(SRect(rect.TopLeft(), SSize(3, 3)), RGB(255, 0, 0));
    }
  }
}

inline void WideLines(SDC& dc) {
  for (int width = 2; width <= 9; ++width) {
    SPen pen(PS_SOLID, width, RGB(20 * width, 0, 255 - 20 * width));
    SSelectObject select(dc, pen);
    dc.MoveTo(10, 24 * (width - 1));
    dc.LineTo(120, 24 * (width - 1));
    dc.MoveTo(130 + 8 * width, 60);
    dc.LineTo(130 + 8 * width, 120 + width);
    SPen inside(PS_INSIDEFRAME, width, RGB(0, 20 * width, 0));
    SBrush brush(RGB(255, 240, 200));
    SSelectObject selectBrush(dc, brush);
    const SRect rect(SPoint(222 + width % 2 * 48, 10 + width / 2 * 46), SSize(20 + width, 34));
    dc.Rectangle(rect);
    SSelectObject selectInside(dc, inside);
    dc.Rectangle(SRect(SPoint(140 + width * 9, 140 + width % 2 * 40), SSize(20, 30)));
  }
}

inline SFontOld& UseFont(SFontOld& font, const WCHAR* face, int height, int weight = FW_NORMAL, bool italic = false) {
  LOGFONTW description{};
  description.lfHeight = height;
  description.lfWeight = weight;
  description.lfItalic = italic;
  description.lfCharSet = DEFAULT_CHARSET;
  for (int i = 0; face[i]; ++i) description.lfFaceName[i] = face[i];
  font.CreateFontIndirectW(&description);
  return font;
}

inline void Texts(SDC& dc) {
  int y = 2;
  for (int height : {-8, -9, -10, -11, -12, -13, -15, -18, 16, 24}) {
    SFontOld font;
    SSelectObject select(dc, UseFont(font, WTEXT("Liberation Sans"), height));
    dc.SetBkMode(height % 2 ? TRANSPARENT : OPAQUE);
    dc.SetBkColor(RGB(255, 255, 180));
    dc.SetTextColor(RGB(0, 0, 10 * -height));
    dc.TextOutW(4, y, WTEXT("Sphinx of black quartz, judge my vow. 0123456789"));
    TEXTMETRICW metrics;
    dc.GetTextMetricsW(&metrics);
    y += metrics.tmHeight + 4;
  }
}

// The boxes of texts: where the font's metrics and the formats put them, with the glyphs painted over.
inline void TextBoxes(SDC& dc) {
  const SStringView text = WTEXT("Several words that need\tmore than one line.\nAnd &another paragraph");
  unsigned int formats[] = {DT_LEFT,
                            DT_CENTER | DT_WORDBREAK,
                            DT_RIGHT | DT_WORDBREAK,
                            DT_SINGLELINE | DT_VCENTER,
                            DT_SINGLELINE | DT_BOTTOM | DT_RIGHT,
                            DT_EXPANDTABS,
                            DT_WORDBREAK | DT_NOPREFIX | DT_EXTERNALLEADING,
                            DT_SINGLELINE | DT_END_ELLIPSIS};
  int i = 0;
  for (const WCHAR* face : {WTEXT("Liberation Sans"), WTEXT("DejaVu Sans")}) {
    for (unsigned int format : formats) {
      SFontOld font;
      SSelectObject select(dc, UseFont(font, face, i % 2 ? -11 : i < 8 ? 15 : 12));
      SRect rect(SPoint(4 + i % 4 * 78, 4 + i / 4 * 58), SSize(70, 50));
      SRect measured = rect;
      int height = dc.DrawTextW(text, measured, format | DT_CALCRECT);
      dc.FrameRect(measured, SBrush(RGB(0, 160, 0)));
      dc.FillSolidRect(SRect(rect.left, rect.top, rect.left + 2, rect.top + height), RGB(200, 0, 0));
      ++i;
    }
  }
}

struct Picture {
  const char* name;
  void (*draw)(SDC&);
  bool hasText;  // glyphs may differ a little
};

inline const std::vector<Picture>& Pictures() {
  static const std::vector<Picture> pictures = {
      {"fills", Fills, false},
      {"brushes", Brushes, false},
      {"lines", Lines, false},
      {"broken-lines", BrokenLines, false},
      {"polygons", Polygons, false},
      {"ellipses", Ellipses, false},
      {"round-rects", RoundRects, false},
      {"regions", Regions, false},
      {"blits", Blits, false},
      {"one-bit", OneBit, false},
      {"edges", Edges, false},
      {"wide-lines", WideLines, false},
      {"text-boxes", TextBoxes, false},
      {"texts", Texts, true},
  };
  return pictures;
}

// A picture on a white bitmap.
inline void Draw(const Picture& picture, SBitmap& bitmap) {
  bitmap.CreatePixels(kWidth, kHeight);
  SMemoryDC dc;
  SSelectObject select(dc, bitmap);
  dc.PatBlt(SRect(0, 0, kWidth, kHeight), WHITENESS);
  SSaveDC save(dc);
  picture.draw(dc);
  GdiFlush();
}

}  // namespace drawing
