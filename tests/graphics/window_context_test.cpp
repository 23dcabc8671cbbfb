// Contexts of windows: where they draw, and what is kept out of them.
#include <gtest/gtest.h>

#include "qxcore/graphics/background.h"
#include "qxcore/graphics/bitmap.h"
#include "qxcore/graphics/window_dc.h"

namespace {

constexpr COLORREF kParent = RGB(10, 20, 200), kChild = RGB(200, 20, 10), kFrame = RGB(5, 120, 40);

LRESULT CALLBACK PlainProcedure(HWND window, UINT message, WPARAM wParam, LPARAM lParam) {
  if (message == WM_ERASEBKGND) return 1;
  return DefWindowProcW(window, message, wParam, lParam);
}

class WindowContexts : public testing::Test {
 protected:
  static void SetUpTestSuite() {
    WNDCLASSW description{};
    description.lpfnWndProc = PlainProcedure;
    description.lpszClassName = WTEXT("WindowContexts");
    RegisterClassW(&description);
  }
  void SetUp() override {
    top = CreateWindowExW(0, WTEXT("WindowContexts"), WTEXT(""), WS_POPUP | WS_CLIPCHILDREN | WS_VISIBLE, 20, 20, 120,
                          90, nullptr, nullptr, nullptr, nullptr);
    child = CreateWindowExW(0, WTEXT("WindowContexts"), WTEXT(""), WS_CHILD | WS_VISIBLE, 30, 20, 40, 30, top, nullptr,
                            nullptr, nullptr);
    if (!top || !child) GTEST_SKIP() << "no windows without a display";
    UpdateWindow(top);
  }
  void TearDown() override {
    if (top) DestroyWindow(top);
  }

  static void Fill(HWND window, COLORREF color) {
    SClientDC dc(window);
    dc.FillSolidRect(SRect(-50, -50, 500, 500), color);
  }

  HWND top = nullptr, child = nullptr;
};

TEST_F(WindowContexts, DrawOnTheirPartOfTheWindow) {
  Fill(top, kParent);
  Fill(child, kChild);
  Fill(top, kFrame);  // not over the child
  SClientDC dc(top), inner(child);
  EXPECT_EQ(dc.GetPixel(SPoint(5, 5)), kFrame);
  EXPECT_EQ(inner.GetPixel(SPoint(0, 0)), kChild);
  EXPECT_EQ(inner.GetPixel(SPoint(39, 29)), kChild);
  EXPECT_EQ(inner.GetClipBox(), SRect(0, 0, 40, 30));
  EXPECT_EQ(dc.GetPixel(SPoint(71, 21)), kFrame) << "beside the child";
  EXPECT_TRUE(inner.RectVisible(SRect(0, 0, 1, 1)));
  EXPECT_FALSE(inner.RectVisible(SRect(40, 0, 50, 10)));
  EXPECT_FALSE(dc.RectVisible(SRect(35, 25, 50, 40))) << "under the child";
  EXPECT_EQ(WindowFromDC(inner), child);
}

TEST_F(WindowContexts, PaintOnlyWhatIsInvalid) {
  Fill(child, kParent);
  ValidateRect(child, nullptr);
  RECT part{10, 5, 20, 15};
  InvalidateRect(child, &part, FALSE);
  {
    SPaintDC dc(child);
    EXPECT_EQ(SRect(dc.m_ps.rcPaint), SRect(part));
    dc.FillSolidRect(SRect(0, 0, 40, 30), kChild);
  }
  SClientDC dc(child);
  EXPECT_EQ(dc.GetPixel(SPoint(10, 5)), kChild);
  EXPECT_EQ(dc.GetPixel(SPoint(9, 5)), kParent);
  EXPECT_EQ(dc.GetPixel(SPoint(20, 14)), kParent);
  EXPECT_FALSE(GetUpdateRect(child, nullptr, FALSE));
}

TEST_F(WindowContexts, CopyIntoABitmap) {
  Fill(child, kChild);
  SClientDC dc(child);
  SBitmap bitmap;
  bitmap.CreatePixels(40, 30);
  SMemoryDC memory(dc);
  SSelectObject select(memory, bitmap);
  ASSERT_TRUE(memory.BitBlt(SRect(0, 0, 40, 30), dc, SPoint(0, 0)));
  GdiFlush();
  for (int i = 0; i < 40 * 30; ++i) ASSERT_EQ(bitmap.GetBits()[i] & 0xFFFFFF, 0xC8140Au) << i;
}

TEST_F(WindowContexts, ABackgroundFillsTheClientArea) {
  SDrawBackground background;
  background.GetGradient().SetGradient(SDrawGradient::HORZ, kParent, kChild, SRect());
  SClientDC dc(child);
  EXPECT_TRUE(background.Erase(dc, child));
  EXPECT_EQ(background.GetGradient().GetStartRect(), SRect(0, 0, 40, 30));
  EXPECT_EQ(dc.GetPixel(SPoint(39, 29)), kChild) << "the last band has the end colour";
  EXPECT_FALSE(background.Erase(dc, nullptr));
}

TEST_F(WindowContexts, AStaleWindowHasNone) {
  DestroyWindow(child);
  EXPECT_EQ(GetDC(child), nullptr);
  SClientDC dc(child);
  EXPECT_EQ(dc.GetSafeHdc(), nullptr);
}

}  // namespace
