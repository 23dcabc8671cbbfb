// Gradients: the bands against a second reading of their rules, the clip rule, metafiles.
#include "qxcore/graphics/gradient.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cstdlib>
#include <functional>
#include <vector>

#include "qxcore/graphics/background.h"
#include "qxcore/graphics/bitmap.h"
#include "qxcore/graphics/color.h"
#include "qxcore/graphics/metafile.h"

namespace {

constexpr unsigned long kFrom = 0x10C0F0, kTo = 0xE03005;

// --- a second reading: the table of the colours of all bands ---

unsigned long Mix(unsigned long from, unsigned long to, long part, long whole) {
  if (whole == 0 || part == 0) return from;
  if (part == whole) return to;
  if (from == to) return from;
  unsigned long mixed = 0;
  for (int shift = 16; shift >= 0; shift -= 8) {
    long a = static_cast<long>(from >> shift & 255), b = static_cast<long>(to >> shift & 255);
    long d = (b - a) * part / whole;
    if (d < 0) d += 1;
    mixed = mixed << 8 | static_cast<unsigned long>((a + d) & 255);
  }
  return mixed;
}

std::vector<unsigned long> BandTable(int length, int variant) {
  unsigned long from = kFrom, to = kTo;
  if (variant == 1 || variant == 3) std::swap(from, to);
  bool mirrored = variant >= 2;
  long h = mirrored ? length / 2 : length;
  unsigned long stops[5] = {from, Mix(from, to, 25, 100), Mix(from, to, 55, 100), Mix(from, to, 85, 100), to};
  long borders[5] = {0, h / 4, h / 2, h / 2 + h / 4, h};
  std::vector<unsigned long> table;
  for (long p = 1; p <= length; ++p) {
    long x = mirrored && p > h ? length - p : p;
    int piece = 0;
    while (piece < 3 && x > borders[piece + 1]) ++piece;
    table.push_back(Mix(stops[piece], stops[piece + 1], x - borders[piece], borders[piece + 1] - borders[piece]));
  }
  return table;
}

class Canvas {
 public:
  Canvas(int width, int height) : m_width(width) {
    m_bitmap.CreatePixels(width, height);
    m_select = ::SelectObject(dc, m_bitmap);
    dc.PatBlt(SRect(0, 0, width, height), WHITENESS);
  }
  ~Canvas() { ::SelectObject(dc, m_select); }
  COLORREF At(int x, int y) {
    GdiFlush();
    std::uint32_t pixel = m_bitmap.GetBits()[y * m_width + x];
    return RGB(pixel >> 16 & 255, pixel >> 8 & 255, pixel & 255);
  }
  std::vector<COLORREF> All() {
    std::vector<COLORREF> all;
    SSize size = m_bitmap.GetSize();
    for (int y = 0; y < size.cy; ++y) {
      for (int x = 0; x < size.cx; ++x) all.push_back(At(x, y));
    }
    return all;
  }

  SMemoryDC dc;

 private:
  int m_width;
  SBitmap m_bitmap;
  HGDIOBJ m_select;
};

TEST(Gradients, EveryBandOfHorizontalAndVerticalOnes) {
  Canvas rows(4, 304), columns(304, 4);
  for (int length = 0; length <= 300; ++length) {
    for (int variant = 0; variant < 4; ++variant) {
      std::vector<unsigned long> table = BandTable(length, variant);
      rows.dc.PatBlt(SRect(0, 0, 4, 304), WHITENESS);
      columns.dc.PatBlt(SRect(0, 0, 304, 4), WHITENESS);
      SDrawGradient gradient;
      // A rectangle whose corners are exchanged, which stays as it is.
      const SRect across(3, 1 + length, 1, 1);
      gradient.SetGradient(SDrawGradient::HORZ + variant, kFrom, kTo, across);
      gradient.DrawGradient(rows.dc);
      ASSERT_EQ(gradient.GetStartRect(), across);
      gradient.SetGradient(SDrawGradient::VERT + variant, kFrom, kTo, SRect(1, 1, 1 + length, 3));
      gradient.DrawGradient(columns.dc);
      for (int band = 0; band < length; ++band) {
        ASSERT_EQ(rows.At(1, 1 + band), table[static_cast<std::size_t>(band)])
            << length << ' ' << variant << ' ' << band;
        ASSERT_EQ(rows.At(2, 1 + band), table[static_cast<std::size_t>(band)]);
        ASSERT_EQ(columns.At(1 + band, 1), table[static_cast<std::size_t>(band)])
            << length << ' ' << variant << ' ' << band;
      }
      for (int outside : {0, length + 1}) {
        ASSERT_EQ(rows.At(1, outside), 0xFFFFFFu);
        ASSERT_EQ(columns.At(outside, 1), 0xFFFFFFu);
      }
      ASSERT_EQ(rows.At(0, 1), 0xFFFFFFu);
      ASSERT_EQ(rows.At(3, 1), 0xFFFFFFu);
    }
  }
}

TEST(Gradients, AModeWithoutTheBitOrAnUnknownKindDrawsNothing) {
  Canvas canvas(20, 20);
  const std::vector<COLORREF> white = canvas.All();
  const SRect rect(2, 2, 18, 18);
  SDrawGradient gradient;
  for (int mode : {0, 0x03, 0x2000, 0x30, 0x8000, 0x110}) {
    gradient.SetGradient(mode, kFrom, kTo, rect);
    gradient.DrawGradient(canvas.dc);
  }
  gradient.DrawHorzGradient(canvas.dc, rect, kFrom, kTo, 0x20);
  gradient.DrawVertGradient(canvas.dc, rect, kFrom, kTo, 0x10);
  for (int mode : {0x10, 0x20, 0x40, 0x80, 0x100, 0x200, 0x400, 0x800, 0x1005, 0x1007}) {
    gradient.SetGradient(mode, kFrom, kTo, SRect(5, 5, 5, 5));
    gradient.DrawGradient(canvas.dc);
  }
  EXPECT_EQ(canvas.All(), white);
}

TEST(Gradients, TheContextIsAsBefore) {
  Canvas canvas(40, 40);
  canvas.dc.SetBkColor(0x123456);
  HGDIOBJ pen = canvas.dc.GetCurrentObject(OBJ_PEN), brush = canvas.dc.GetCurrentObject(OBJ_BRUSH);
  for (int mode : {0x10, 0x20, 0x40, 0x80, 0x100, 0x200, 0x400, 0x800, 0x1005, 0x1006, 0x1007, 0x1008}) {
    SDrawGradient gradient;
    gradient.SetGradient(mode, kFrom, kTo, SRect(0, 0, 40, 40));
    gradient.SetFrameType(SDrawGradient::FRAME_ROUND_RECT);
    gradient.DrawGradient(canvas.dc);
    EXPECT_EQ(canvas.dc.GetBkColor(), 0x123456u) << mode;
    EXPECT_EQ(canvas.dc.GetCurrentObject(OBJ_PEN), pen) << mode;
    EXPECT_EQ(canvas.dc.GetCurrentObject(OBJ_BRUSH), brush) << mode;
  }
}

// Every kind fills its rectangle and nothing else; diagonals are constant along their lines and turn with a variant.
TEST(Gradients, KindsFillTheirRectangle) {
  for (int mode :
       {0x10, 0x20, 0x40, 0x43, 0x80, 0x82, 0x100, 0x200, 0x201, 0x400, 0x800, 0x1005, 0x1006, 0x1007, 0x1008}) {
    for (int frame = SDrawGradient::FRAME_NONE; frame <= SDrawGradient::FRAME_ETCHED; ++frame) {
      if (frame == SDrawGradient::FRAME_ROUND_RECT) continue;
      Canvas canvas(40, 30);
      SDrawGradient gradient;
      gradient.SetGradient(mode, 0x400000, 0x000040, SRect(5, 4, 34, 25));
      gradient.SetFrameType(frame);
      gradient.DrawGradient(canvas.dc);
      for (int y = 0; y < 30; ++y) {
        for (int x = 0; x < 40; ++x)
          ASSERT_EQ(canvas.At(x, y) != 0xFFFFFF, SRect(5, 4, 34, 25).Contains(SPoint(x, y)))
              << std::hex << mode << std::dec << ' ' << x << ' ' << y;
      }
    }
  }
  Canvas up(30, 30), down(30, 30), reversed(30, 30);
  SDrawGradient gradient;
  gradient.DrawDiagUpGradient(up.dc, SRect(0, 0, 30, 30), kFrom, kTo, SDrawGradient::DIAG_UP);
  gradient.DrawDiagDownGradient(down.dc, SRect(0, 0, 30, 30), kFrom, kTo, SDrawGradient::DIAG_DOWN);
  gradient.DrawDiagUpGradient(reversed.dc, SRect(0, 0, 30, 30), kTo, kFrom, SDrawGradient::DIAG_UP_REVERSED);
  EXPECT_EQ(up.All(), reversed.All());
  for (int y = 0; y < 29; ++y) {
    for (int x = 0; x < 29; ++x) {
      ASSERT_EQ(up.At(x, y), up.At(x + 1, y + 1));
      ASSERT_EQ(down.At(x, y + 1), down.At(x + 1, y));
      ASSERT_EQ(up.At(x, y), down.At(x, 29 - y));
    }
  }
}

// The members of the kinds do what the mode orders, and nothing for a mode without their bit; they use the rectangle
// and the colours that they are given, not those of the object.
TEST(Gradients, EachKindAloneIsTheKindOfTheMode) {
  using Gradient = SDrawGradient;
  const SRect rect(5, 4, 34, 25);
  constexpr int kFrame = Gradient::FRAME_RAISED;
  const struct {
    int mode;
    std::function<void(const Gradient&, SDC&, int)> draw;
  } kKinds[] = {
      {Gradient::CORNER, [&](const Gradient& gradient, SDC& dc,
                             int mode) { gradient.DrawCornerGradient(dc, rect, kFrom, kTo, mode, kFrame); }},
      {Gradient::CENTER_REVERSED, [&](const Gradient& gradient, SDC& dc,
                                      int mode) { gradient.DrawCenterGradient(dc, rect, kFrom, kTo, mode, kFrame); }},
      {Gradient::BUTTON, [&](const Gradient& gradient, SDC& dc,
                             int mode) { gradient.DrawButtonGradient(dc, rect, kFrom, mode, kFrame); }},
      {Gradient::PANEL_3D, [&](const Gradient& gradient, SDC& dc,
                               int mode) { gradient.Draw3DGradient(dc, rect, kFrom, kTo, mode, kFrame); }},
      {Gradient::GRAD_BUTTON_DIAG_UP, [&](const Gradient& gradient, SDC& dc, int mode) {
         gradient.DrawGradButtonGradient(dc, rect, kFrom, kTo, mode, kFrame);
       }}};
  for (const auto& kind : kKinds) {
    Canvas byMode(40, 30), alone(40, 30), blank(40, 30);
    Gradient gradient, other;
    gradient.SetGradient(kind.mode, kFrom, kTo, rect);
    gradient.SetFrameType(kFrame);
    gradient.DrawGradient(byMode.dc);
    kind.draw(other, alone.dc, kind.mode);
    EXPECT_EQ(alone.All(), byMode.All()) << std::hex << kind.mode;
    EXPECT_NE(alone.All(), blank.All()) << std::hex << kind.mode;
    Canvas nothing(40, 30);
    kind.draw(other, nothing.dc, Gradient::HORZ);
    EXPECT_EQ(nothing.All(), blank.All()) << std::hex << kind.mode;
  }
}

// The point has the start colour; one outside counts as the nearest place of the rectangle.
TEST(Gradients, CentresMayLieAnywhere) {
  const SRect rect(5, 4, 34, 25);
  const SDrawGradient gradient;
  const auto draw = [&](const SPoint& center) {
    Canvas canvas(40, 30);
    gradient.DrawCenterGradientEx(canvas.dc, rect, center, 0xFF0000, 0x0000FF, SDrawGradient::CENTER,
                                  SDrawGradient::FRAME_NONE);
    return canvas.All();
  };
  const auto blueAt = [](const std::vector<COLORREF>& pixels, int x, int y) {
    return static_cast<int>(pixels[static_cast<std::size_t>(y * 40 + x)] >> 16 & 255);
  };
  const std::vector<COLORREF> pixels = draw(SPoint(10, 20));
  SPoint bluest(5, 4);
  for (int y = 4; y < 25; ++y)
    for (int x = 5; x < 34; ++x)
      if (blueAt(pixels, x, y) > blueAt(pixels, bluest.x, bluest.y)) bluest = SPoint(x, y);
  EXPECT_LE(std::max(std::abs(bluest.x - 10), std::abs(bluest.y - 20)), 2) << "the middle lies between pixels";
  EXPECT_GT(blueAt(pixels, 10, 20), blueAt(pixels, 33, 4));
  EXPECT_EQ(draw(SPoint(-100, 12)), draw(SPoint(5, 12)));
  EXPECT_EQ(draw(SPoint(20, 500)), draw(SPoint(20, 25)));
}

// An enhanced metafile of the screen's size plays pixel by pixel into a rectangle of that size.
struct ScreenFrame {
  ScreenFrame() {
    SDC screen(::GetDC(nullptr));
    pixels = SRect(0, 0, screen.GetDeviceCaps(HORZRES), screen.GetDeviceCaps(VERTRES));
    frame = SRect(0, 0, screen.GetDeviceCaps(HORZSIZE) * 100, screen.GetDeviceCaps(VERTSIZE) * 100);
    ::ReleaseDC(nullptr, screen.Detach());
  }
  SRect pixels, frame;
};

// In an old metafile no rectangle is visible, and everything must be drawn; in an enhanced one all is.
TEST(Gradients, MetafilesPlayAsDirectDrawing) {
  const ScreenFrame screen;
  for (int mode : {0x10, 0x13, 0x20, 0x21, 0x40, 0x80, 0x100, 0x200, 0x400, 0x800, 0x1005, 0x1006, 0x1007, 0x1008}) {
    for (int frame : {SDrawGradient::FRAME_NONE, SDrawGradient::FRAME_ROUND_RECT, SDrawGradient::FRAME_ETCHED}) {
      SDrawGradient gradient;
      gradient.SetGradient(mode, kFrom, kTo, SRect(3, 5, 45, 37));
      gradient.SetFrameType(frame);
      gradient.SetRoundRectSize(SSize(14, 10));
      Canvas direct(50, 40), played(50, 40);
      gradient.DrawGradient(direct.dc);
      SMetafileDC recording;
      ASSERT_TRUE(recording.IsMetafile());
      ASSERT_FALSE(recording.RectVisible(SRect(0, 0, 10, 10)));
      gradient.DrawGradient(recording);
      SMetafile metafile = recording.Close();
      ASSERT_TRUE(metafile.Play(played.dc));
      ASSERT_EQ(direct.All(), played.All()) << std::hex << mode << ' ' << frame;

#ifdef _WIN32
      // An enhanced metafile keeps a round rectangle in a form of its own, which the system's player rounds otherwise.
      if (frame == SDrawGradient::FRAME_ROUND_RECT) continue;
#endif
      Canvas enhanced(50, 40);
      SEnhMetafileDC enhancedRecording(screen.frame);
      ASSERT_TRUE(enhancedRecording.IsMetafile());
      ASSERT_TRUE(enhancedRecording.RectVisible(SRect(-5, -5, -1, -1)));
      gradient.DrawGradient(enhancedRecording);
      SMetafile enhancedMetafile = enhancedRecording.Close();
      ASSERT_TRUE(enhancedMetafile.Play(enhanced.dc, screen.pixels));
      ASSERT_EQ(direct.All(), enhanced.All()) << std::hex << mode << ' ' << frame;
    }
  }
}

}  // namespace
