// What users and programs do with a splitter: dragging, splitting and deleting, the keyboard, scrolling, its state.

#include "qxcore/core/memory.h"
#include "tests/layout/splitter_fixture.h"
#include "tests/support/failing_allocations.h"
#include "tests/support/wine.h"

namespace {

using test::Drag;
using test::Key;
using test::Mouse;
using test::Splitter;
using test::Splitters;

TEST_F(Splitters, ADraggedBarLiesUnderTheMouse) {
  MakeStatic(2, 2);
  Drag(m_splitter, SPoint(55, 100), SPoint(155, 120));
  EXPECT_EQ(Widths(), (std::vector<int>{150, 396 - 157}));
  EXPECT_EQ(m_splitter.m_inversions % 2, 0) << "the tracker is gone";
  EXPECT_EQ(SWnd::GetCapture(), nullptr);
  Drag(m_splitter, SPoint(55 + 100, 100), SPoint(2000, 100));
  EXPECT_EQ(Widths(), (std::vector<int>{389, 0})) << "as far as there is room";
  ExpectPanesInPlace();
  Drag(m_splitter, SPoint(395, 100), SPoint(150 + 5, 100));
  Drag(m_splitter, SPoint(155, 100), SPoint(-50, 100));
  EXPECT_EQ(Widths(), (std::vector<int>{0, 389}));
  m_splitter.ToggleBar(kSHitColumnBar);
  EXPECT_EQ(Widths()[0], 149) << "it opens as wide as it was before the drag";
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
  MakeStatic(2, 2);
  m_frame->ActivateFrame();
  test::PumpAll();
  const auto cursorAt = [this](SPoint at) {
    m_splitter.ClientToScreen(&at);
    ::SetCursorPos(at.x, at.y);
    m_splitter.SendMessageW(WM_SETCURSOR, reinterpret_cast<WPARAM>(m_splitter.m_hWnd), HTCLIENT);
    return ::GetCursor();
  };
  EXPECT_EQ(cursorAt(SPoint(55, 100)), ::LoadCursorW(nullptr, IDC_SIZEWE));
  EXPECT_EQ(cursorAt(SPoint(100, 45)), ::LoadCursorW(nullptr, IDC_SIZENS));
  EXPECT_EQ(cursorAt(SPoint(0, 0)), ::LoadCursorW(nullptr, IDC_ARROW));
  test::RealMouse(m_splitter, SPoint(55, 100));
  test::RealMouse(m_splitter, SPoint(55, 100), MOUSEEVENTF_LEFTDOWN);
  ASSERT_TRUE(test::PumpUntil([this] { return m_splitter.IsTracking(); }));
  const int inversions = m_splitter.m_inversions;
  test::RealMouse(m_splitter, SPoint(155, 100));
  EXPECT_TRUE(test::PumpUntil([&] { return m_splitter.m_inversions > inversions; }));
  test::RealMouse(m_splitter, SPoint(155, 100), MOUSEEVENTF_LEFTUP);
  ASSERT_TRUE(test::PumpUntil([this] { return !m_splitter.IsTracking(); }));
  EXPECT_EQ(Widths()[0], 150);
  if (IsWine()) return;  // which loses what happens outside of its windows until the mouse is captured
  // A busy program finds all of it at once: the press, the way out of the window, and the release there.
  test::RealMouse(m_splitter, SPoint(155, 100), MOUSEEVENTF_LEFTDOWN);
  test::RealMouse(m_splitter, SPoint(600, 100));
  test::RealMouse(m_splitter, SPoint(600, 100), MOUSEEVENTF_LEFTUP);
  EXPECT_TRUE(test::PumpUntil([this] { return Widths()[0] == 389; }));
  EXPECT_EQ(SWnd::GetCapture(), nullptr);
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
  const HWND bar = ::GetDlgItem(m_splitter.m_hWnd, 0xEA11);
  // The first row's bar goes up to the edge: the row goes.
  Drag(m_splitter, SPoint(200, inside.top + 53), SPoint(200, inside.top));
  EXPECT_EQ(m_splitter.GetRowCount(), 2);
  EXPECT_EQ(m_splitter.GetPane(0, 1), survivor);
  EXPECT_EQ(::GetDlgItem(m_splitter.m_hWnd, 0xEA10), bar) << "a scroll bar stays with its row";
  EXPECT_EQ(m_splitter.GetDlgItem(0xEA12), nullptr);
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
