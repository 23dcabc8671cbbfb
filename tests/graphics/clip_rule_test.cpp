// Bands outside the clip region are skipped without touching the context: the filling of bands over calls that are
// counted.
#include <gtest/gtest.h>

#include "qxcore/graphics/bitmap.h"
#include "qxcore/graphics/color.h"
#include "qxcore/graphics/dc.h"
#include "qxcore/graphics/metafile.h"

namespace {

struct Calls {
  int asked = 0, colored = 0, filled = 0;
  bool operator==(const Calls&) const = default;
} calls;

}  // namespace

static BOOL CountedRectVisible(HDC dc, const RECT* rect) {
  ++calls.asked;
  return ::RectVisible(dc, rect);
}

static COLORREF CountedSetBkColor(HDC dc, COLORREF color) {
  ++calls.colored;
  return ::SetBkColor(dc, color);
}

static BOOL CountedExtTextOutW(HDC dc, int x, int y, UINT options, const RECT* rect, LPCWSTR text, UINT count,
                               const int* advances) {
  EXPECT_EQ(count, 0u);
  EXPECT_EQ(options, static_cast<UINT>(ETO_OPAQUE));
  ++calls.filled;
  return ::ExtTextOutW(dc, x, y, options, rect, text, count, advances);
}

namespace counted {
#define RectVisible CountedRectVisible
#define SetBkColor CountedSetBkColor
#define ExtTextOutW CountedExtTextOutW
#include "qxcore/graphics/internal/gradient_ramp.h"
#undef RectVisible
#undef SetBkColor
#undef ExtTextOutW
}  // namespace counted

namespace {

void FillHundred(SDC& dc) {
  calls = Calls();
  counted::SBandPainter painter(dc);
  for (int y = 0; y < 100; ++y) painter.Fill(SRect(0, y, 50, y + 1), static_cast<unsigned long>(y));
}

TEST(ClipRule, BandsOutsideAreSkipped) {
  SBitmap bitmap;
  bitmap.CreatePixels(50, 100);
  SMemoryDC dc;
  SSelectObject select(dc, bitmap);
  FillHundred(dc);
  EXPECT_EQ(calls, (Calls{100, 101, 100})) << "and the colour is put back once";
  dc.IntersectClipRect(SRect(10, 20, 30, 45));
  FillHundred(dc);
  EXPECT_EQ(calls, (Calls{100, 26, 25}));
  dc.ExcludeClipRect(SRect(0, 30, 50, 40));
  FillHundred(dc);
  EXPECT_EQ(calls, (Calls{100, 16, 15}));
}

TEST(ClipRule, AMetafileIsNotAsked) {
  SMetafileDC recording;
  FillHundred(recording);
  EXPECT_EQ(calls, (Calls{0, 101, 100}));
  recording.Close();
}

}  // namespace
