// Where the parts of a splitter lie, pixel by pixel: its fields, panes, bars and boxes, at each size and resolution.

#include <random>

#include "tests/layout/splitter_fixture.h"

namespace {

using test::PlaceIn;
using test::Splitter;
using test::Splitters;

TEST_F(Splitters, FieldsStandInTheirOrder) { Splitter().ExpectFieldOrder(); }

TEST_F(Splitters, StatedExample_KeepsTheRatio) {
  MakeStatic(1, 2);
  m_splitter.SetKeepPaneRatio(1);
  m_splitter.SetColumnInfo(0, 1, 0);
  m_splitter.SetColumnInfo(1, 3, 0);
  Size(411, 100);
  EXPECT_EQ(Widths(), (std::vector<int>{100, 300}));
  ExpectPanesInPlace();
}

TEST_F(Splitters, ChildrenHaveTheirIdentifiersAndPlaces) {
  MakeStatic(2, 3, WS_HSCROLL | WS_VSCROLL);
  const int bar = ::GetSystemMetrics(SM_CXVSCROLL);
  EXPECT_EQ(m_splitter.Inside(), SRect(2, 2, 398 - bar, 298 - bar));
  ExpectPanesInPlace();
  EXPECT_EQ(Widths(), (std::vector<int>{50, 50, 396 - bar - 114}));
  for (int column = 0; column < 3; ++column) {
    const SRect pane = m_splitter.Pane(0, column);
    EXPECT_EQ(PlaceIn(m_splitter, 0xEA00u + static_cast<UINT>(column)), SRect(pane.left, 298 - bar, pane.right, 298));
  }
  for (int row = 0; row < 2; ++row) {
    const SRect pane = m_splitter.Pane(row, 0);
    EXPECT_EQ(PlaceIn(m_splitter, 0xEA10u + static_cast<UINT>(row)), SRect(398 - bar, pane.top, 398, pane.bottom));
  }
  EXPECT_EQ(PlaceIn(m_splitter, 0xEA20u), SRect(398 - bar, 298 - bar, 398, 298));
  int row = 0, column = 0;
  EXPECT_TRUE(m_splitter.IsChildPane(m_splitter.GetDlgItem(0xE912), &row, &column));
  EXPECT_EQ(row * 10 + column, 12);
  int height = 0, minimum = 0, fixed = 0;
  m_splitter.SetRowInfo(0, 40, 10, 1);
  m_splitter.GetRowInfo(0, &height, &minimum, &fixed);
  EXPECT_EQ(height * 1000 + minimum * 10 + fixed, 40101);
  // The box is a grip only where it sizes the window around.
  const HWND box = ::GetDlgItem(m_splitter.m_hWnd, 0xEA20);
  const auto kind = [box] { return (::GetWindowLongW(box, GWL_STYLE) & 0x18) | (::IsWindowEnabled(box) ? 1 : 0); };
  EXPECT_EQ(kind(), 0x08);
  m_frame->ModifyStyle(0, WS_THICKFRAME);
  m_splitter.RecalcLayout();
  EXPECT_EQ(kind(), 0x11);
  m_frame->ModifyStyle(WS_THICKFRAME, 0);
  EXPECT_FALSE(m_splitter.IsChildPane(m_splitter.GetDlgItem(0xEA00)));
  m_splitter.SetScrollStyle(WS_VSCROLL);
  EXPECT_EQ(m_splitter.GetDlgItem(0xEA00), nullptr);
  EXPECT_EQ(m_splitter.GetDlgItem(0xEA20), nullptr);
  EXPECT_EQ(m_splitter.Inside(), SRect(2, 2, 398 - bar, 298));
}

TEST_F(Splitters, LimitsOfTheGrid) {
  SCreateContext context = test::PaneContext();
  EXPECT_FALSE(m_splitter.Create(m_frame, 17, 1, SSize(), &context));
  EXPECT_FALSE(m_splitter.Create(m_frame, 1, 0, SSize(), &context));
  EXPECT_FALSE(m_splitter.Create(m_frame, 2, 2, SSize(), nullptr));
  EXPECT_FALSE(m_splitter.CreateStatic(m_frame, 1, 17));
  MakeDynamic(1, 16, SSize(1, 1));
  Size(2000, 100);
  const SRect inside = m_splitter.Inside();
  const SPoint box(inside.left, inside.bottom);
  EXPECT_EQ(m_splitter.HitTest(box), kSHitHorzSplitBox);
  EXPECT_EQ(m_splitter.HitTest(SPoint(inside.right, inside.top)), kSHitNothing) << "no row can be added";
  for (int i = 1; i < 16; ++i) {
    EXPECT_TRUE(m_splitter.SplitColumn(i * 60 - 20));
  }
  EXPECT_EQ(m_splitter.HitTest(box), kSHitNothing);
  EXPECT_FALSE(m_splitter.SplitColumn(30));
  EXPECT_FALSE(m_splitter.SplitRow(30));
  EXPECT_EQ(test::PaneView::s_living, 16);
  ExpectPanesInPlace();
}

TEST_F(Splitters, SplitBoxesAreSixPixelsLong) {
  MakeDynamic(2, 3);
  const SRect inside = m_splitter.Inside();
  SRect rect;
  m_splitter.GetHitRect(kSHitVertSplitBox, &rect);
  EXPECT_EQ(rect, SRect(2, 0, inside.right, 4)) << "the tracker of a new bar at the edge";
  EXPECT_EQ(m_splitter.Limit(), SRect(2, 2, inside.right, inside.bottom - 4));
  EXPECT_EQ(m_splitter.HitTest(SPoint(inside.right, inside.top + 5)), 1);
  EXPECT_EQ(m_splitter.HitTest(SPoint(inside.right, inside.top + 6)), kSHitNothing);
  EXPECT_EQ(m_splitter.HitTest(SPoint(inside.left + 5, inside.bottom)), 2);
  EXPECT_EQ(m_splitter.HitTest(SPoint(inside.left + 6, inside.bottom)), 0);
  // The scroll bars begin behind them.
  EXPECT_EQ(PlaceIn(m_splitter, 0xEA00u), SRect(inside.left + 7, inside.bottom, inside.right, 298));
  EXPECT_EQ(PlaceIn(m_splitter, 0xEA10u), SRect(inside.right, inside.top + 7, 398, inside.bottom));
  ASSERT_TRUE(m_splitter.SplitColumn(100));
  const SRect second = m_splitter.Pane(0, 1);
  EXPECT_EQ(PlaceIn(m_splitter, 0xEA00u), SRect(inside.left + 7, inside.bottom, inside.left + 100, 298));
  EXPECT_EQ(PlaceIn(m_splitter, 0xEA01u), SRect(second.left, inside.bottom, second.right, 298)) << "no box lies there";
}

TEST_F(Splitters, HitRectsAndLimits) {
  MakeStatic(2, 2);
  SRect rect;
  EXPECT_EQ(m_splitter.HitTest(SPoint(10, 42)), 101);
  EXPECT_EQ(m_splitter.HitTest(SPoint(52, 10)), 201);
  m_splitter.GetHitRect(kSHitRowBar, &rect);
  EXPECT_EQ(rect, SRect(2, 40, 398, 44)) << "four pixels, two before the bar";
  EXPECT_EQ(m_splitter.Limit(), SRect(2, 2, 398, 294));
  m_splitter.GetHitRect(kSHitColumnBar, &rect);
  EXPECT_EQ(rect, SRect(50, 2, 54, 298));
  EXPECT_EQ(m_splitter.Limit(), SRect(2, 2, 394, 298));
}

// Random sizes, rules and grids; the hit test sees what lies between the panes.
TEST_F(Splitters, RandomSequences_HitTestAgreesWithThePanes) {
  std::mt19937 random(92);
  const auto below = [&random](int limit) { return static_cast<int>(random() % static_cast<unsigned>(limit)); };
  MakeStatic(3, 3, WS_VSCROLL);
  bool fixedRows[3] = {}, fixedColumns[3] = {};
  for (int step = 0; step < 400; ++step) {
    const int line = below(3);
    const bool isFixed = below(4) == 0;
    switch (below(5)) {
      case 0:
        m_splitter.SetRowInfo(line, below(120), below(30), fixedRows[line] = isFixed);
        break;
      case 1:
        m_splitter.SetColumnInfo(line, below(120), below(30), fixedColumns[line] = isFixed);
        break;
      case 2:
        m_splitter.SetKeepPaneRatio(below(2));
        break;
      default:
        Size(30 + below(500), 30 + below(400));
        break;
    }
    m_splitter.RecalcLayout();
    ASSERT_NO_FATAL_FAILURE(ExpectPanesInPlace()) << step;
    const SRect inside = m_splitter.Inside();
    for (int i = 0; i < 20; ++i) {
      const SPoint point(below(500), below(400));
      int expected = kSHitNothing;
      for (int bar = 1; bar >= 0 && inside.Contains(point); --bar) {
        const int bottom = m_splitter.Pane(bar, 0).bottom, next = m_splitter.Pane(bar + 1, 0).top;
        if (!fixedRows[bar] && point.y >= bottom && point.y < next) expected = kSHitRowBar + bar;
      }
      for (int bar = 1; bar >= 0 && inside.Contains(point); --bar) {
        const int right = m_splitter.Pane(0, bar).right, next = m_splitter.Pane(0, bar + 1).left;
        if (!fixedColumns[bar] && point.x >= right && point.x < next) expected = kSHitColumnBar + bar;
      }
      ASSERT_EQ(m_splitter.HitTest(point), expected) << step << ": " << point.x << ' ' << point.y;
    }
  }
}

TEST_F(Splitters, SizesFollowTheDpi) {
  MakeStatic(1, 2);
  m_frame->SendMessageW(WM_DPICHANGED, MAKEWPARAM(192, 192));
  EXPECT_EQ(m_splitter.Inside(), SRect(4, 4, 396, 296));
  EXPECT_EQ(m_splitter.Pane(0, 0), SRect(4, 4, 104, 296));
  EXPECT_EQ(m_splitter.Pane(0, 1).left, 104 + 14);
  m_frame->SendMessageW(WM_DPICHANGED, MAKEWPARAM(96, 96));
  EXPECT_EQ(m_splitter.Pane(0, 1).left, 59);
}

// There and back everything is as it was: places, minima, the collapsed pane, and the state that a program keeps.
TEST_F(Splitters, TheFormerDpiBringsTheFormerSizes) {
  MakeStatic(2, 3, WS_HSCROLL | WS_VSCROLL);
  m_splitter.SetColumnInfo(0, 61, 11);
  m_splitter.SetColumnInfo(1, 83, 15);
  m_splitter.SetRowInfo(0, 95, 21);
  m_splitter.RecalcLayout();
  ASSERT_TRUE(m_splitter.ToggleBar(kSHitColumnBar + 1));
  for (const int keepsRatio : {0, 1}) {
    m_splitter.SetKeepPaneRatio(keepsRatio);
    m_splitter.RecalcLayout();
    const SString state = m_splitter.GetState();
    const std::vector<int> widths = Widths(), heights = Heights();
    m_frame->SendMessageW(WM_DPICHANGED, MAKEWPARAM(192, 192));
    EXPECT_EQ(m_splitter.GetState().Left(15), SString(WTEXT("splitter 1 192 ")));
    EXPECT_EQ(m_splitter.Pane(1, 1).top - m_splitter.Pane(0, 0).bottom, 14);
    int ideal = 0, minimum = 0;
    m_splitter.GetColumnInfo(0, &ideal, &minimum);
    EXPECT_EQ(minimum, 22);
    if (!keepsRatio) {
      EXPECT_EQ(Widths()[0], 2 * widths[0]);
    }
    m_frame->SendMessageW(WM_DPICHANGED, MAKEWPARAM(96, 96));
    EXPECT_EQ(m_splitter.GetState(), state);
    EXPECT_EQ(Widths(), widths);
    EXPECT_EQ(Heights(), heights);
    ExpectPanesInPlace();
  }
}

// Below a window that is not the library's nobody passes the change on; the system tells each child.
TEST_F(Splitters, BelowAnotherWindowTheSystemTellsOfTheDpi) {
  constexpr UINT kAfterParent = 0x02E3;  // WM_DPICHANGED_AFTERPARENT
  const auto gap = [](const Splitter& splitter) { return splitter.Pane(0, 1).left - splitter.Pane(0, 0).right; };
  const HWND parent = ::CreateWindowExW(0, WTEXT("STATIC"), nullptr, WS_POPUP | WS_VISIBLE, 0, 0, 400, 300, nullptr,
                                        nullptr, nullptr, nullptr);
  Splitter splitter;
  ASSERT_TRUE(splitter.CreateStatic(SWnd::FromHandle(parent), 1, 2));
  for (int i = 0; i < 2; ++i) splitter.AddPane(0, i, &test::PaneView::classPaneView, SSize(50, 40));
  splitter.MoveWindow(SRect(0, 0, 400, 300));
  splitter.SendMessageW(WM_DPICHANGED, MAKEWPARAM(192, 192));
  EXPECT_EQ(gap(splitter), 14);
  splitter.SendMessageW(kAfterParent);
  EXPECT_EQ(gap(splitter), ::MulDiv(7, static_cast<int>(::GetDpiForWindow(splitter.m_hWnd)), 96));
  ::DestroyWindow(parent);

  MakeStatic(1, 2);
  m_frame->SendMessageW(WM_DPICHANGED, MAKEWPARAM(192, 192));
  m_splitter.SendMessageW(kAfterParent);
  EXPECT_EQ(gap(m_splitter), 14) << "the frame has passed it on";
}

// A collapsed pane opens again to the size that it had, in pixels of the new resolution.
TEST_F(Splitters, CollapsedPanesFollowTheDpi) {
  MakeStatic(1, 2);
  m_splitter.SetColumnInfo(0, 100, 10);
  m_splitter.RecalcLayout();
  ASSERT_TRUE(m_splitter.ToggleBar(kSHitColumnBar));
  m_frame->SendMessageW(WM_DPICHANGED, MAKEWPARAM(192, 192));
  ASSERT_EQ(Widths()[0], 0);
  ASSERT_TRUE(m_splitter.ToggleBar(kSHitColumnBar));
  EXPECT_EQ(Widths()[0], 200);
}

// The windows that were moved in one splitter, by their identifiers.
HWND g_watched = nullptr;
std::vector<int> g_moved;

LRESULT CALLBACK NoteMoves(int code, WPARAM wParam, LPARAM lParam) {
  const auto* sent = reinterpret_cast<const CWPSTRUCT*>(lParam);
  const bool isMoved = sent->message == WM_WINDOWPOSCHANGED && ::GetParent(sent->hwnd) == g_watched;
  if (isMoved) g_moved.push_back(::GetDlgCtrlID(sent->hwnd));
  return ::CallNextHookEx(nullptr, code, wParam, lParam);
}

// The scroll bars have their places before the panes, so that a pane finds its bars where it asks for them.
TEST_F(Splitters, BarsAreMovedBeforePanes) {
  MakeDynamic(4, 4);
  ASSERT_TRUE(m_splitter.SplitColumn(100));
  ASSERT_TRUE(m_splitter.SplitRow(100));
  g_moved.clear();
  g_watched = m_splitter.m_hWnd;
  const HHOOK hook = ::SetWindowsHookExW(WH_CALLWNDPROC, &NoteMoves, nullptr, ::GetCurrentThreadId());
  ASSERT_NE(hook, nullptr);
  Size(350, 250);
  ::UnhookWindowsHookEx(hook);
  const auto isPane = [](int id) { return id < static_cast<int>(kSHorzScrollBarId); };
  EXPECT_TRUE(std::is_partitioned(g_moved.begin(), g_moved.end(), [&](int id) { return !isPane(id); }));
  EXPECT_GE(std::count_if(g_moved.begin(), g_moved.end(), isPane), 3);
}

}  // namespace
