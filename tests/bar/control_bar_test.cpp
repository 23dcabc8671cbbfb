// Control bars in general: their strips of a frame, what borders take from them, and the order of what is inherited.

#include <functional>

#include "tests/bar/bar_fixture.h"
#include "tests/support/slots.h"

namespace {

using test::Frame;
using test::PartsOf;

class PlainBar : public SCtrlBar {
 public:
  SSize GetBarLayout(int, int horizontal) override { return horizontal ? SSize(100, 20) : SSize(30, 50); }
  void OnBarStyleChange(DWORD oldStyle, DWORD newStyle) override { m_changes.push_back({oldStyle, newStyle}); }
  void SetBorders(int left, int top, int right, int bottom) {
    m_leftBorder = left, m_topBorder = top, m_rightBorder = right, m_bottomBorder = bottom;
  }
  std::vector<std::pair<DWORD, DWORD>> m_changes;
};

// A frame with a status bar, whose place is at the bottom.
class ControlBars : public test::UiTest {
 protected:
  void SetUp() override {
    UiTest::SetUp();
    m_frame = Frame::Make();
    ASSERT_NE(m_frame, nullptr);
    ASSERT_TRUE(m_bar.Create(m_frame));
    m_frame->RecalcLayout();
  }
  void TearDown() override {
    m_frame->DestroyWindow();
    UiTest::TearDown();
  }

  SStatusBar m_bar;
  Frame* m_frame = nullptr;
};

TEST_F(ControlBars, TakeTheirStripsInTurn) {
  PlainBar bars[3];
  const DWORD sides[] = {kSBarAtTop, kSBarAtLeft, kSBarAtRight};
  for (int i = 0; i < 3; ++i) {
    bars[i].SetBarStyle(sides[i]);
    ASSERT_TRUE(bars[i].Create(nullptr, nullptr, WS_VISIBLE, SRect(), m_frame, 100u + static_cast<UINT>(i)));
    bars[i].SetWindowPos(HWND_BOTTOM, 0, 0, 0, 0, SWP_NOMOVE | SWP_NOSIZE);
  }
  test::Window client;
  ASSERT_TRUE(client.Create(nullptr, nullptr, WS_VISIBLE, SRect(), m_frame, kSFirstPane));
  m_frame->RecalcLayout();
  const int below = test::PlaceOf(m_bar).top;
  EXPECT_EQ(test::PlaceOf(bars[0]), SRect(0, 0, 400, 20));
  EXPECT_EQ(test::PlaceOf(bars[1]), SRect(0, 20, 30, below));
  EXPECT_EQ(test::PlaceOf(bars[2]), SRect(370, 20, 400, below));
  EXPECT_EQ(test::PlaceOf(client), SRect(30, 20, 370, below));
  bars[0].ShowWindow(SW_HIDE);
  m_frame->SetClientSize(401, 10);
  EXPECT_EQ(test::PlaceOf(m_bar).bottom, 10) << "a bar keeps its height";
  EXPECT_EQ(test::PlaceOf(client).Height(), 0);
  client.DestroyWindow();

  // Asked for their space alone, bars take no more of an area than there is, and say how much they want.
  bars[0].ShowWindow(SW_SHOWNA);
  SSizeParent asked{nullptr, SRect(0, 0, 50, 90), SSize(), 0};
  for (PlainBar& bar : bars) bar.SendMessageW(kSMsgSizeParent, 0, reinterpret_cast<LPARAM>(&asked));
  EXPECT_EQ(asked.m_rect, SRect(30, 20, 30, 90));
  EXPECT_EQ(asked.m_used, SSize(50 + 30 + 30, 50)) << "an upper bar adds to the height, the others to the width";
}

// What a bar does while it is asked for its place: it may take away its layout, another bar, or itself.
TEST_F(ControlBars, ThatGoWhileTheyAreLaidOut) {
  class Going : public PlainBar {
   public:
    SSize GetBarLayout(int stretch, int horizontal) override {
      if (m_onLayout) m_onLayout();
      return PlainBar::GetBarLayout(stretch, horizontal);
    }
    std::function<void()> m_onLayout;
  };
  m_bar.InsertPane(0, 50, 0);
  SStatusBarLayout layout;
  layout.InsertPane(0, 30, 0);
  layout.Attach(&m_bar);
  layout.Activate(1);
  test::Window client;
  ASSERT_TRUE(client.Create(nullptr, nullptr, WS_VISIBLE, SRect(), m_frame, kSFirstPane));
  PlainBar other;
  Going bar;
  other.SetBarStyle(kSBarAtTop);
  ASSERT_TRUE(other.Create(nullptr, nullptr, WS_VISIBLE, SRect(), m_frame, 100u));
  ASSERT_TRUE(bar.Create(nullptr, nullptr, WS_VISIBLE, SRect(), m_frame, 101u));
  bar.SetWindowPos(HWND_TOP, 0, 0, 0, 0, SWP_NOMOVE | SWP_NOSIZE);
  bar.m_onLayout = [&] { layout.Detach(); };
  m_frame->RecalcLayout();
  EXPECT_EQ(PartsOf(m_bar).size(), 1u);
  const int height = m_bar.GetBarLayout(1, 1).cy;
  EXPECT_EQ(test::PlaceOf(client), SRect(0, 20, 400, 300 - 20 - height));
  bar.m_onLayout = [&] { other.DestroyWindow(); };
  m_frame->RecalcLayout();
  EXPECT_EQ(test::PlaceOf(client), SRect(0, 0, 400, 300 - 20 - height));
  bar.m_onLayout = [&] { bar.DestroyWindow(); };
  m_frame->RecalcLayout();
  m_frame->RecalcLayout();
  EXPECT_EQ(test::PlaceOf(client), SRect(0, 0, 400, 300 - height));
}

TEST(ControlBar, Offsets_AreThoseOfTheStyleAndTheFields) {
  PlainBar bar;
  const SUISysData& measures = *SGetUISysData();
  EXPECT_EQ(bar.SetBarStyle(kSBarBorderLeft | kSBarBorderBottom), 0u);
  EXPECT_EQ(bar.SetBarStyle(kSBarBorderLeft | kSBarBorderBottom | kSBarBorder3d), kSBarBorderLeft | kSBarBorderBottom);
  const DWORD first = kSBarBorderLeft | kSBarBorderBottom;
  EXPECT_EQ(bar.m_changes, (std::vector<std::pair<DWORD, DWORD>>{{0, first}, {first, first | kSBarBorder3d}}));
  bar.SetBorders(1, 2, 3, 4);
  SRect rect(0, 0, 100, 100);
  bar.CalcNCOffsets(&rect, 1);
  EXPECT_EQ(rect, SRect(measures.m_edgeWidth + 1, 2, 97, 96 - measures.m_edgeHeight));
  rect = SRect(0, 0, 100, 100);
  bar.SetBarStyle(kSBarBorderTop | kSBarBorderRight);
  bar.CalcNCOffsets(&rect, 0);
  EXPECT_EQ(rect, SRect(2, measures.m_borderHeight + 1, 96 - measures.m_borderWidth, 97)) << "vertical: in pairs";
}

// The order of fields and virtual functions is part of the binary interface.
struct Order : SStatusBar {
  void Check() {
    const std::ptrdiff_t last = SlotOf(&Order::SafeOnKillFocus);
    EXPECT_EQ(SlotOf(&Order::OnBarStyleChange), last + 1);
    EXPECT_EQ(SlotOf(&Order::GetBarLayout), last + 2);
    EXPECT_EQ(SlotOf(&Order::GetCustomLayout), last + 3);
    EXPECT_EQ(kSMsgSizeParent, 0x0361u);
    EXPECT_EQ(kSMsgStatusText, 0x047Bu);
    if (sizeof(void*) != 4) return;  // elsewhere a class may begin in the padding of its base
    const auto offset = [this](const auto& field) {
      return static_cast<int>(reinterpret_cast<const char*>(&field) - reinterpret_cast<const char*>(this));
    };
    const int borders = static_cast<int>(sizeof(SWnd));
    EXPECT_EQ(offset(m_leftBorder), borders);
    EXPECT_EQ(offset(m_topBorder), borders + 4);
    EXPECT_EQ(offset(m_rightBorder), borders + 8);
    EXPECT_EQ(offset(m_bottomBorder), borders + 12);
    EXPECT_EQ(offset(m_minHeight), static_cast<int>(sizeof(SCtrlBar)));
    EXPECT_EQ(offset(m_splice), offset(m_minHeight) + 4);
    EXPECT_EQ(offset(m_panes), offset(m_minHeight) + 8);
    EXPECT_EQ(offset(m_layout), offset(m_panes) + static_cast<int>(sizeof m_panes));
  }
};

TEST(ControlBar, Order_OfFieldsAndSlots) { Order().Check(); }

}  // namespace
