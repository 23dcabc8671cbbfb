// Splitters: where children lie, splitting and deleting, the mouse, the keyboard, scrolling, state.

#include <random>

#include "qxcore/core/memory.h"
#include "tests/layout/layout_fixture.h"
#include "tests/support/failing_allocations.h"

namespace {

using test::Drag;
using test::Key;
using test::Mouse;
using test::PlaceIn;

class Splitter : public SSplitterWnd {
 public:
  using SSplitterWnd::GetHitRect;
  using SSplitterWnd::GetInsideRect;
  using SSplitterWnd::HitTest;
  using SSplitterWnd::StartTracking;
  using SSplitterWnd::StopTracking;
  using SSplitterWnd::TrackColumnSize;
  using SSplitterWnd::TrackRowSize;
  SRect Limit() const { return m_limit; }
  bool IsTracking() const { return m_isTracking; }
  SRect Inside() const {
    SRect rect;
    GetInsideRect(&rect);
    return rect;
  }
  SRect Pane(int row, int column) const { return PlaceIn(*this, IdFromRowCol(row, column)); }
  SPoint MiddleOf(int code) {
    SRect rect;
    GetHitRect(code, &rect);
    return SPoint(std::max<int>(rect.CenterPoint().x, 3), std::max<int>(rect.CenterPoint().y, 3));
  }

  void OnInvertTracker(const SRect& rect) override {
    ++m_inversions;
    SSplitterWnd::OnInvertTracker(rect);
  }
  int m_inversions = 0;

  // The stated fields follow each other.
  void ExpectFieldOrder() {
    const int* fields[] = {&m_barWidth, &m_barHeight, &m_borderShareX, &m_borderShareY, &m_gapX,     &m_gapY,
                           &m_borderX,  &m_borderY,   &m_maxRows,      &m_maxColumns,   &m_rowCount, &m_columnCount};
    for (std::size_t i = 0; i < std::size(fields); ++i) EXPECT_EQ(fields[i], fields[0] + i);
    const auto* base = reinterpret_cast<const char*>(this);
    const void* rest[] = {&m_columnCount, &m_scrollStyle, &m_columns, &m_rows,  &m_paneClass, &m_context,
                          &m_isTracking,  &m_trackedCode, &m_tracker, &m_limit, &m_panes,     &m_keepRatio};
    for (std::size_t i = 1; i < std::size(rest); ++i) EXPECT_LT(rest[i - 1], rest[i]);
    if (sizeof(void*) == 4) {
      EXPECT_EQ(reinterpret_cast<const char*>(fields[0]) - base, 12);
    }
    const int values[] = {7, 7, 0, 0, 7, 7, 2, 2};
    for (std::size_t i = 0; i < std::size(values); ++i) EXPECT_EQ(*fields[i], values[i]);
  }
};

// A frame whose client is a splitter; its size is that of the splitter.
class Splitters : public test::FrameTest {
 protected:
  Splitters() : FrameTest(400) {}
  void TearDown() override {
    FrameTest::TearDown();
    test::PaneView::s_refuses = false;
    EXPECT_EQ(test::PaneView::s_living, 0);
  }

  void MakeStatic(int rows, int columns, DWORD scroll = 0) {
    ASSERT_TRUE(m_splitter.CreateStatic(m_frame, rows, columns, WS_CHILD | WS_VISIBLE | scroll));
    for (int i = 0; i < rows * columns; ++i) {
      ASSERT_NE(m_splitter.AddPane(i / columns, i % columns, &test::PaneView::classPaneView, SSize(50, 40)), nullptr);
    }
    Size(400, 300);
  }
  void MakeDynamic(int rows, int columns, SSize minimum = SSize(20, 20)) {
    SCreateContext context = test::PaneContext();
    ASSERT_TRUE(m_splitter.Create(m_frame, rows, columns, minimum, &context));
    Size(400, 300);
  }
  void Size(int width, int height) {
    m_frame->SetWindowPos(nullptr, 0, 0, width, height, SWP_NOZORDER | SWP_NOACTIVATE);
    m_splitter.RecalcLayout();
  }
  std::vector<int> Widths() {
    std::vector<int> widths(static_cast<std::size_t>(m_splitter.GetColumnCount()));
    for (std::size_t i = 0; i < widths.size(); ++i) {
      m_splitter.GetColumnInfo(static_cast<int>(i), &widths[i], nullptr);
    }
    return widths;
  }
  std::vector<int> Heights() {
    std::vector<int> heights(static_cast<std::size_t>(m_splitter.GetRowCount()));
    for (std::size_t i = 0; i < heights.size(); ++i) m_splitter.GetRowInfo(static_cast<int>(i), &heights[i], nullptr);
    return heights;
  }
  // Every pane lies at its place, with a gap to the next one.
  void ExpectPanesInPlace() {
    const SRect inside = m_splitter.Inside();
    int top = inside.top;
    for (int row = 0; row < m_splitter.GetRowCount(); ++row) {
      const int height = Heights()[static_cast<std::size_t>(row)];
      int left = inside.left;
      for (int column = 0; column < m_splitter.GetColumnCount(); ++column) {
        const int width = Widths()[static_cast<std::size_t>(column)];
        ASSERT_EQ(m_splitter.Pane(row, column), SRect(left, top, left + width, top + height)) << row << ' ' << column;
        left += width + 7;
      }
      top += height + 7;
    }
  }

  Splitter m_splitter;
};

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
  EXPECT_TRUE(m_splitter.IsChildPane(m_splitter.GetPane(1, 2), &row, &column));
  EXPECT_EQ(row * 10 + column, 12);
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
  EXPECT_EQ(m_splitter.HitTest(SPoint(inside.right, inside.top + 5)), kSHitVertSplitBox);
  EXPECT_EQ(m_splitter.HitTest(SPoint(inside.right, inside.top + 6)), kSHitNothing);
  EXPECT_EQ(m_splitter.HitTest(SPoint(inside.left + 5, inside.bottom)), kSHitHorzSplitBox);
  EXPECT_EQ(m_splitter.HitTest(SPoint(inside.left + 6, inside.bottom)), kSHitNothing);
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

TEST_F(Splitters, ADraggedBarLiesUnderTheMouse) {
  MakeStatic(2, 2);
  Drag(m_splitter, SPoint(55, 100), SPoint(155, 120));
  EXPECT_EQ(Widths(), (std::vector<int>{150, 396 - 157}));
  EXPECT_EQ(m_splitter.m_inversions % 2, 0) << "the tracker is gone";
  EXPECT_EQ(SWnd::GetCapture(), nullptr);
  Drag(m_splitter, SPoint(55 + 100, 100), SPoint(2000, 100));
  EXPECT_EQ(Widths(), (std::vector<int>{389, 0})) << "as far as there is room";
  ExpectPanesInPlace();
  // Without a move, and when the drag is given up, nothing changes.
  const std::vector<int> before = Heights();
  Drag(m_splitter, SPoint(100, 43), SPoint(100, 43));
  Mouse(m_splitter, WM_LBUTTONDOWN, SPoint(100, 43));
  Mouse(m_splitter, WM_MOUSEMOVE, SPoint(100, 143));
  Key(m_splitter.GetPane(0, 0)->m_hWnd, VK_ESCAPE);
  EXPECT_FALSE(m_splitter.IsTracking());
  Mouse(m_splitter, WM_LBUTTONUP, SPoint(100, 143));
  Mouse(m_splitter, WM_LBUTTONDOWN, SPoint(100, 43));
  Mouse(m_splitter, WM_MOUSEMOVE, SPoint(100, 143));
  m_splitter.SendMessageW(WM_CANCELMODE);
  EXPECT_FALSE(m_splitter.IsTracking());
  Mouse(m_splitter, WM_LBUTTONDOWN, SPoint(100, 43));
  ::ReleaseCapture();
  EXPECT_FALSE(m_splitter.IsTracking());
  EXPECT_EQ(Heights(), before);
}

TEST_F(Splitters, RealInput_DragsABar) {
  MakeStatic(1, 2);
  m_frame->ActivateFrame();
  test::PumpAll();
  test::RealMouse(m_splitter, SPoint(55, 100));
  test::RealMouse(m_splitter, SPoint(55, 100), MOUSEEVENTF_LEFTDOWN);
  ASSERT_TRUE(test::PumpUntil([this] { return m_splitter.IsTracking(); }));
  const int inversions = m_splitter.m_inversions;
  test::RealMouse(m_splitter, SPoint(155, 100));
  EXPECT_TRUE(test::PumpUntil([&] { return m_splitter.m_inversions > inversions; }));
  test::RealMouse(m_splitter, SPoint(155, 100), MOUSEEVENTF_LEFTUP);
  ASSERT_TRUE(test::PumpUntil([this] { return !m_splitter.IsTracking(); }));
  EXPECT_EQ(Widths()[0], 150);
}

TEST_F(Splitters, PanesComeOutOfTheSplitBoxesAndGoAtTheEdges) {
  MakeDynamic(3, 2);
  const SRect inside = m_splitter.Inside();
  Drag(m_splitter, SPoint(inside.right + 3, inside.top + 2), SPoint(inside.right + 3, inside.top + 102));
  ASSERT_EQ(m_splitter.GetRowCount(), 2);
  EXPECT_EQ(Heights()[0], 100);
  Drag(m_splitter, SPoint(inside.right + 3, inside.top + 2), SPoint(inside.right + 3, inside.top + 52));
  ASSERT_EQ(m_splitter.GetRowCount(), 3);
  EXPECT_EQ(Heights(), (std::vector<int>{50, 43, inside.Height() - 107})) << "the row under the bar is divided";
  ExpectPanesInPlace();
  Drag(m_splitter, SPoint(inside.left + 2, inside.bottom + 3), SPoint(inside.left + 122, inside.bottom + 3));
  EXPECT_EQ(test::PaneView::s_living, 6);
  EXPECT_NE(m_splitter.GetDlgItem(0xEA01), nullptr);
  EXPECT_NE(m_splitter.GetDlgItem(0xEA12), nullptr);
  SWnd* survivor = m_splitter.GetPane(1, 1);
  // The first row's bar goes up to the edge: the row goes.
  Drag(m_splitter, SPoint(200, inside.top + 53), SPoint(200, inside.top));
  EXPECT_EQ(m_splitter.GetRowCount(), 2);
  EXPECT_EQ(m_splitter.GetPane(0, 1), survivor);
  // The last row's bar goes down to the edge: the row goes.
  Mouse(m_splitter, WM_LBUTTONDOWN, m_splitter.MiddleOf(kSHitRowBar));
  Mouse(m_splitter, WM_MOUSEMOVE, SPoint(200, 2000));
  Mouse(m_splitter, WM_LBUTTONUP, SPoint(200, 2000));
  EXPECT_EQ(m_splitter.GetRowCount(), 1);
  // A double click on the bar removes the pane before it.
  survivor = m_splitter.GetPane(0, 1);
  Mouse(m_splitter, WM_LBUTTONDBLCLK, m_splitter.MiddleOf(kSHitColumnBar));
  EXPECT_EQ(m_splitter.GetColumnCount(), 1);
  EXPECT_EQ(m_splitter.GetPane(0, 0), survivor);
  EXPECT_EQ(test::PaneView::s_living, 1);
  EXPECT_EQ(m_splitter.GetDlgItem(0xEA11), nullptr);
  m_splitter.DeleteRow(0);
  EXPECT_EQ(m_splitter.GetRowCount(), 1) << "the only row stays";
}

TEST_F(Splitters, APaneThatCannotBeMadeChangesNothing) {
  MakeDynamic(2, 2);
  ASSERT_TRUE(m_splitter.SplitColumn(100));
  const SString state = m_splitter.GetState();
  test::PaneView::s_refuses = true;
  EXPECT_FALSE(m_splitter.SplitRow(100));
  test::PaneView::s_refuses = false;
  EXPECT_EQ(m_splitter.GetState(), state);
  EXPECT_EQ(test::PaneView::s_living, 2);
  EXPECT_FALSE(m_splitter.SplitRow(10)) << "the upper part would be below its minimum";
  EXPECT_FALSE(m_splitter.SplitRow(290)) << "the lower part would be";
  EXPECT_TRUE(m_splitter.SplitRow(100));
}

TEST_F(Splitters, PanesComeAndGo) {
  ASSERT_TRUE(m_splitter.CreateStatic(m_frame, 1, 2));
  EXPECT_EQ(m_splitter.AddPane(0, 2, &test::PaneView::classPaneView, SSize()), nullptr);
  EXPECT_EQ(m_splitter.AddPane(0, 0, &SObject::classSObject, SSize()), nullptr);
  test::Window adopted;
  ASSERT_TRUE(adopted.Child(m_frame));
  EXPECT_EQ(m_splitter.AddPane(0, 0, &adopted, SSize(80, -1)), &adopted);
  EXPECT_EQ(m_splitter.AddPane(0, 0, &test::PaneView::classPaneView, SSize()), nullptr) << "the place is taken";
  ASSERT_NE(m_splitter.AddPane(0, 1, &test::PaneView::classPaneView, SSize()), nullptr);
  EXPECT_TRUE(m_splitter.CanActivateNext());
  m_splitter.RemovePane(0, 0);
  EXPECT_TRUE(::IsWindow(adopted.m_hWnd));
  EXPECT_FALSE(adopted.IsWindowVisible());
  EXPECT_EQ(m_splitter.GetPane(0, 0), nullptr);
  m_splitter.RecalcLayout();
  // A pane that ends itself leaves its place.
  m_splitter.GetPane(0, 1)->DestroyWindow();
  EXPECT_FALSE(m_splitter.CanActivateNext());
  EXPECT_NE(m_splitter.AddPane(0, 1, &test::PaneView::classPaneView, SSize()), nullptr);
  m_splitter.DeletePane(0, 1);
  EXPECT_EQ(test::PaneView::s_living, 0);
}

TEST_F(Splitters, F6GoesFromPaneToPane) {
  MakeStatic(2, 2);
  m_frame->ActivateFrame();
  m_splitter.SetActivePane(0, 0);
  std::vector<int> visited;
  for (int i = 0; i < 5; ++i) {
    int row = 0, column = 0;
    m_splitter.GetActivePane(&row, &column);
    visited.push_back(row * 10 + column);
    Key(::GetFocus(), VK_F6);
  }
  EXPECT_EQ(visited, (std::vector<int>{0, 1, 10, 11, 0}));
  const test::KeyIsDown shift(VK_SHIFT);
  Key(::GetFocus(), VK_F6);
  EXPECT_EQ(SWnd::GetFocus(), m_splitter.GetPane(0, 0));
}

TEST_F(Splitters, TheKeyboardMovesBars) {
  MakeStatic(1, 2);
  m_frame->ActivateFrame();
  m_splitter.SetColumnInfo(0, 100, 30);
  m_splitter.SetColumnInfo(1, 0, 40);
  m_splitter.RecalcLayout();
  m_splitter.SetActivePane(0, 1);
  const HWND pane = ::GetFocus();
  Key(pane, VK_F8);
  ASSERT_EQ(SWnd::GetFocus(), &m_splitter);
  Key(m_splitter.m_hWnd, VK_RIGHT);
  EXPECT_EQ(Widths()[0], 108);
  {
    const test::KeyIsDown control(VK_CONTROL);
    Key(m_splitter.m_hWnd, VK_LEFT);
  }
  EXPECT_EQ(Widths()[0], 107);
  Key(m_splitter.m_hWnd, VK_UP);
  Key(m_splitter.m_hWnd, VK_HOME);
  EXPECT_EQ(Widths()[0], 30);
  Key(m_splitter.m_hWnd, VK_END);
  EXPECT_EQ(Widths(), (std::vector<int>{389 - 40, 40}));
  Key(m_splitter.m_hWnd, VK_RETURN);
  EXPECT_EQ(Widths(), (std::vector<int>{0, 389}));
  Key(m_splitter.m_hWnd, VK_RETURN);
  EXPECT_EQ(Widths()[0], 349);
  Key(m_splitter.m_hWnd, VK_ESCAPE);
  EXPECT_EQ(Widths()[0], 100);
  EXPECT_EQ(::GetFocus(), pane);
}

TEST_F(Splitters, TheKeyboardSplits) {
  MakeDynamic(2, 1);
  m_frame->ActivateFrame();
  m_splitter.SetActivePane(0, 0);
  Key(::GetFocus(), VK_F8);
  Key(m_splitter.m_hWnd, VK_RETURN);
  EXPECT_EQ(m_splitter.GetRowCount(), 2);
  const int before = Heights()[0];
  Key(m_splitter.m_hWnd, VK_DOWN);
  EXPECT_EQ(Heights()[0], before + 8);
  Key(m_splitter.m_hWnd, VK_TAB);
  EXPECT_EQ(SWnd::GetFocus(), m_splitter.GetPane(0, 0));
}

TEST_F(Splitters, PanesOfALineScrollTogether) {
  MakeStatic(2, 2, WS_HSCROLL | WS_VSCROLL);
  SScrollBar* bar = m_splitter.GetPaneScrollBar(m_splitter.GetPane(1, 0), SB_VERT);
  ASSERT_NE(bar, nullptr);
  EXPECT_EQ(bar->GetDlgCtrlID(), 0xEA11);
  const HWND handle = bar->m_hWnd;
  bar->SetRange(0, 100);
  bar->SetPos(40);
  const auto positions = [this](int row, int column) {
    return static_cast<test::PaneView*>(m_splitter.GetPane(row, column))->m_positions;
  };
  m_splitter.SendMessageW(WM_VSCROLL, SB_LINEDOWN, reinterpret_cast<LPARAM>(handle));
  EXPECT_EQ(positions(1, 0), std::vector<int>{40});
  EXPECT_EQ(positions(1, 1), std::vector<int>{40}) << "a line further for all of them";
  EXPECT_TRUE(positions(0, 0).empty());
  EXPECT_EQ(::GetScrollPos(handle, SB_CTL), 41);

  auto* view = static_cast<SView*>(m_splitter.GetPane(1, 1));
  EXPECT_TRUE(m_splitter.DoScrollBy(view, SSize(0, 5), 0));
  EXPECT_EQ(::GetScrollPos(handle, SB_CTL), 41);
  EXPECT_TRUE(m_splitter.DoScrollBy(view, SSize(0, 5)));
  EXPECT_EQ(::GetScrollPos(handle, SB_CTL), 46);
  EXPECT_TRUE(m_splitter.DoScrollBy(view, SSize(0, 1000)));
  EXPECT_EQ(::GetScrollPos(handle, SB_CTL), 100);
  EXPECT_FALSE(m_splitter.DoScrollBy(view, SSize(0, 1000)));
  EXPECT_TRUE(m_splitter.DoScroll(view, SB_LINEDOWN << 8 | 0xFF));
  EXPECT_EQ(positions(1, 0).back(), 100);
  EXPECT_FALSE(m_splitter.DoScroll(view, 0xFFFF));
}

TEST_F(Splitters, CommandsOfPanesReachTheFrame) {
  class Control : public SFrameWnd {
   public:
    int OnCmdMsg(UINT id, int, void*, S_CMDHANDLERINFO*) override { return m_ids.push_back(id), 1; }
    std::vector<UINT> m_ids;
  };
  auto* frame = new Control;
  ASSERT_TRUE(frame->Create(nullptr, nullptr, WS_POPUP, SRect(0, 0, 100, 100)));
  Splitter splitter;
  ASSERT_TRUE(splitter.CreateStatic(frame, 1, 1));
  SButton button;
  ASSERT_TRUE(button.Create(WTEXT("b"), 0, SRect(), &splitter, 0x9000));
  frame->m_ids.clear();
  EXPECT_TRUE(splitter.SendMessageW(WM_COMMAND, 0x9000, reinterpret_cast<LPARAM>(button.m_hWnd)));
  EXPECT_EQ(frame->m_ids, std::vector<UINT>{0x9000});
  frame->m_ids.clear();
  EXPECT_FALSE(splitter.OnCmdMsg(0x7FFF, 0, nullptr, nullptr)) << "not one of the commands that go up";
  EXPECT_TRUE(splitter.OnCmdMsg(0xEFFF, kSMsgUpdate, nullptr, nullptr));
  EXPECT_EQ(frame->m_ids, std::vector<UINT>{0xEFFF});
  frame->DestroyWindow();
}

TEST_F(Splitters, StateComesBackAtAnotherSize) {
  MakeDynamic(2, 3);
  ASSERT_TRUE(m_splitter.SplitRow(100));
  ASSERT_TRUE(m_splitter.SplitColumn(80));
  m_splitter.ToggleBar(kSHitRowBar);
  const SString state = m_splitter.GetState();
  m_splitter.DeleteColumn(0);
  Size(800, 600);
  ASSERT_TRUE(m_splitter.SetState(state));
  EXPECT_EQ(m_splitter.GetState(), state);
  EXPECT_EQ(Widths()[0], 80);
  EXPECT_EQ(Heights()[0], 0);
  m_splitter.ToggleBar(kSHitRowBar);
  EXPECT_EQ(Heights()[0], 100) << "the size of a collapsed pane is part of the state";
  const SString now = m_splitter.GetState();
  for (const WCHAR* bad :
       {WTEXT(""), WTEXT("splitter"), WTEXT("splitter 2 96 0 rows 1 0 0 columns 1 0 0"),
        WTEXT("splitter 1 96 0 rows 3 1 1 1 1 1 1 columns 1 0 0"), WTEXT("splitter 1 96 0 rows 1 -5 0 columns 1 0 0"),
        WTEXT("splitter 1 96 0 rows 1 0 0 columns 1 0 0 "),
        WTEXT("splitter 1 96 0 rows 1 99999999999999999999 0 columns 1 0 0"),
        WTEXT("splitter 1 96 0 rows 0 columns 1 0 0"), WTEXT("splitter 1 96 0 rows 17 1")}) {
    EXPECT_FALSE(m_splitter.SetState(bad)) << testing::PrintToString(SString(bad));
    EXPECT_EQ(m_splitter.GetState(), now);
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

TEST_F(Splitters, CollapsedPanesKeepTheirSizeWhenOthersGo) {
  MakeDynamic(1, 4);
  for (const int place : {230, 130, 60}) ASSERT_TRUE(m_splitter.SplitColumn(place));
  const int size = Widths()[1];
  ASSERT_TRUE(m_splitter.ToggleBar(kSHitColumnBar + 1));
  m_splitter.DeleteColumn(0);
  ASSERT_EQ(Widths()[0], 0);
  ASSERT_TRUE(m_splitter.ToggleBar(kSHitColumnBar));
  EXPECT_EQ(Widths()[0], size);
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

// Memory that runs out at any point of making and splitting leaves a grid that is whole.
TEST_F(Splitters, FailingAllocations) {
  const auto operation = [this] {
    Splitter splitter;
    SCreateContext context = test::PaneContext();
    if (!splitter.Create(m_frame, 2, 2, SSize(10, 10), &context)) throw SEOutOfMemory();
    struct Check {
      Splitter& splitter;
      ~Check() {
        for (int i = 0; splitter.m_hWnd != nullptr && i < splitter.GetRowCount() * splitter.GetColumnCount(); ++i) {
          EXPECT_NE(splitter.GetPane(i / splitter.GetColumnCount(), i % splitter.GetColumnCount()), nullptr);
        }
      }
    } check{splitter};
    splitter.SplitRow(100);
    splitter.SplitColumn(100);
    SMemFree(SMemAlloc(1));  // panes that are not made, and moves without a batch, say nothing
  };
  EXPECT_GT(WithEachAllocationFailing(operation, [] { EXPECT_EQ(test::PaneView::s_living, 0); }), 0);
}

}  // namespace
