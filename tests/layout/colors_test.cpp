// Splitters, tabs and status bars in the system's colours, as they are and as they become, and without a flicker.

#include "tests/layout/layout_fixture.h"
#include "tests/support/wine.h"

namespace {

// Another colour of the system for a scope.
class SystemColor {
 public:
  SystemColor(int index, COLORREF color) : m_index(index), m_former(::GetSysColor(index)) { Set(color); }
  SystemColor(const SystemColor&) = delete;
  SystemColor& operator=(const SystemColor&) = delete;
  ~SystemColor() { Set(m_former); }

 private:
  void Set(COLORREF color) {
    ::SetSysColors(1, &m_index, &color);
    test::PumpAll();
  }
  int m_index;
  COLORREF m_former;
};

class Colors : public test::FrameTest {
 protected:
  Colors() : FrameTest(400) {}
  void SetUp() override {
    FrameTest::SetUp();
    ASSERT_TRUE(m_bar.Create(m_frame));
    m_bar.InsertPane(0, 50, 0);
    ASSERT_TRUE(m_splitter.CreateStatic(m_frame, 1, 2));
    ASSERT_TRUE(m_tabs.Create(&m_splitter, nullptr, nullptr, WS_CHILD, SSplitterWnd::IdFromRowCol(0, 1)));
    m_splitter.AddPane(0, 0, &test::PaneView::classPaneView, SSize(100, 0));
    m_splitter.AddPane(0, 1, &m_tabs, SSize());
    m_frame->RecalcLayout();
    m_frame->UpdateWindow();
    test::PumpAll();
  }
  static COLORREF ColorAt(SWnd& window, SPoint place) {
    window.UpdateWindow();
    SClientDC dc(window.m_hWnd);
    return dc.GetPixel(place);
  }
  // A place of each where nothing but its face is to be seen.
  void ExpectFaces(COLORREF color) {
    STabBeam& beam = *m_tabs.GetTabBeam();
    EXPECT_EQ(ColorAt(m_splitter, SPoint(105, 50)), color);
    EXPECT_EQ(ColorAt(beam, SPoint(beam.GetClientRect().right - 2, 8)), color);
    EXPECT_EQ(ColorAt(m_tabs, SPoint(m_tabs.GetClientRect().right / 2, 20)), color);
    if (!IsWine()) {  // whose control takes the colour from a theme
      EXPECT_EQ(ColorAt(m_bar, SPoint(70, 10)), color);
    }
  }

  SStatusBar m_bar;
  SSplitterWnd m_splitter;
  STabWnd m_tabs;
};

TEST_F(Colors, ChangeAtOnceWithTheSystems) {
  const COLORREF usual = ::GetSysColor(COLOR_3DFACE);
  ExpectFaces(usual);
  {
    const SystemColor green(COLOR_3DFACE, RGB(16, 160, 32));
    ExpectFaces(RGB(16, 160, 32));
  }
  ExpectFaces(usual);
}

// What is painted over is not erased before.
TEST_F(Colors, NothingIsErased) {
  SMemoryDC dc;
  SBitmap bitmap;
  bitmap.CreatePixels(8, 8);
  const SSelectObject selected(dc, bitmap);
  for (const SWnd* window : {static_cast<const SWnd*>(&m_splitter), static_cast<const SWnd*>(&m_tabs),
                             static_cast<const SWnd*>(m_tabs.GetTabBeam())}) {
    dc.FillSolidRect(SRect(0, 0, 8, 8), RGB(1, 2, 3));
    EXPECT_NE(window->SendMessageW(WM_ERASEBKGND, reinterpret_cast<WPARAM>(dc.GetSafeHdc())), 0);
    EXPECT_EQ(dc.GetPixel(SPoint(4, 4)), RGB(1, 2, 3));
  }
}

}  // namespace
