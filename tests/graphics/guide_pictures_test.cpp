// The pictures of the guide, drawn anew and compared with those that stand in docs/pictures.
#include <gtest/gtest.h>

#include <cstdlib>

#include "qxcore/graphics/bitmap.h"
#include "qxcore/graphics/gradient.h"
#include "qxcore/graphics/picture.h"

namespace {

constexpr int kWidth = 96, kHeight = 64, kGap = 12;
constexpr unsigned long kFrom = RGB(30, 70, 150), kTo = RGB(235, 240, 200);

SRect Cell(int column, int row) {
  return SRect(SPoint(kGap + column * (kWidth + kGap), kGap + row * (kHeight + kGap)), SSize(kWidth, kHeight));
}

void Kind(SDC& dc, int column, int row, int mode, int frame = SDrawGradient::FRAME_NONE) {
  SDrawGradient gradient;
  gradient.SetGradient(mode, kFrom, kTo, Cell(column, row));
  gradient.SetFrameType(frame);
  gradient.SetRoundRectSize(SSize(24, 24));
  gradient.DrawGradient(dc);
}

void Gradients(SDC& dc) {
  const int kinds[15] = {SDrawGradient::HORZ,
                         SDrawGradient::HORZ_MIRRORED,
                         SDrawGradient::VERT,
                         SDrawGradient::DIAG_UP,
                         SDrawGradient::DIAG_DOWN,
                         SDrawGradient::CORNER,
                         SDrawGradient::CENTER,
                         SDrawGradient::CENTER_REVERSED,
                         SDrawGradient::BUTTON,
                         SDrawGradient::PANEL_3D,
                         SDrawGradient::GRAD_BUTTON_HORZ,
                         SDrawGradient::GRAD_BUTTON_VERT,
                         SDrawGradient::GRAD_BUTTON_DIAG_UP,
                         SDrawGradient::GRAD_BUTTON_DIAG_DOWN,
                         SDrawGradient::BUTTON};
  for (int i = 0; i < 15; ++i) {
    int frame = i == 14           ? SDrawGradient::FRAME_ROUND_RECT
                : i == 8 || i > 9 ? SDrawGradient::FRAME_RECT
                                  : SDrawGradient::FRAME_NONE;
    Kind(dc, i % 5, i / 5, kinds[i], frame);
  }
}

void Frames(SDC& dc) {
  for (int frame = SDrawGradient::FRAME_NONE; frame <= SDrawGradient::FRAME_ETCHED; ++frame)
    Kind(dc, frame, 0, SDrawGradient::GRAD_BUTTON_HORZ, frame);
}

void Check(const char* name, int columns, int rows, void (*draw)(SDC&)) {
  SSize size(kGap + columns * (kWidth + kGap), kGap + rows * (kHeight + kGap));
  SString file = SString(QXCORE_SOURCE_DIR "/docs/pictures/") + SString(name);
  SBitmap drawn, kept;
  drawn.CreatePixels(size.cx, size.cy);
  {
    SMemoryDC dc;
    SSelectObject select(dc, drawn);
    dc.FillSolidRect(SRect(SPoint(), size), RGB(255, 255, 255));
    draw(dc);
    GdiFlush();
  }
  if (std::getenv("QXCORE_WRITE_EXPECTED")) {
    ASSERT_EQ(SWritePicture(file, drawn), S_OK);
  }
  ASSERT_EQ(SReadPicture(file, &kept), S_OK);
  ASSERT_EQ(kept.GetSize(), size);
  int different = 0;
  for (int i = 0; i < size.cx * size.cy; ++i) different += (drawn.GetBits()[i] & 0xFFFFFF) != kept.GetBits()[i];
  EXPECT_EQ(different, 0);
}

TEST(GuidePictures, Gradients) { Check("gradients.png", 5, 3, Gradients); }
TEST(GuidePictures, Frames) { Check("frames.png", 6, 1, Frames); }

}  // namespace
