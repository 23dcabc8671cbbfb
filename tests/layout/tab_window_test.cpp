// Tab windows: layout, showing and hiding, focus, the border of the beam, state.

#include "tests/layout/layout_fixture.h"

namespace {

using test::Drag;
using test::Key;
using test::Mouse;
using test::PaneView;
using test::PlaceIn;

class Tabs : public STabWnd {
 public:
  // The stated fields follow each other, with their values before the window exists.
  void ExpectFields() {
    const void* fields[] = {&m_gap,   &m_vertWidth, &m_horzHeight,      &m_beamHeight, &m_nextId,  &m_firstId,
                            &m_flags, &m_beamWidth, &m_beamHundredfold, &m_noTabText,  &m_noTabWnd};
    for (std::size_t i = 1; i < std::size(fields); ++i) EXPECT_LT(fields[i - 1], fields[i]);
    EXPECT_EQ(m_gap, 6);
    EXPECT_EQ(m_vertWidth, ::GetSystemMetricsForDpi(SM_CXVSCROLL, 96));
    EXPECT_EQ(m_beamHeight, ::GetSystemMetricsForDpi(SM_CXHSCROLL, 96) + 2);
    EXPECT_EQ(m_nextId, 0xE900u);
    EXPECT_EQ(m_firstId, 0xE900u);
    EXPECT_EQ(m_flags, 6u);
    EXPECT_EQ(m_beamWidth, 0);
    EXPECT_EQ(m_beamHundredfold, 0);
  }
  bool HasScrollBars() const { return m_flags & 1; }
  bool HasNoTabWindow() const { return m_noTabWnd != nullptr; }
  // As if the system's metrics had changed.
  void ForgetMetrics() { m_vertWidth = m_horzHeight = m_beamHeight = 1; }
};

class TabWindows : public test::UiTest {
 protected:
  void SetUp() override {
    UiTest::SetUp();
    m_frame = new SFrameWnd;
    ASSERT_TRUE(m_frame->Create(nullptr, WTEXT("f"), WS_POPUP | WS_VISIBLE, SRect(0, 0, 400, 300)));
    ASSERT_TRUE(m_tabs.Create(m_frame, nullptr, nullptr));
    m_frame->RecalcLayout();
    m_bar = ::GetSystemMetrics(SM_CXHSCROLL);
  }
  void TearDown() override {
    m_frame->DestroyWindow();
    EXPECT_EQ(PaneView::s_living, 0);
    UiTest::TearDown();
  }
  SWnd* Add(LPCWSTR text) { return m_tabs.AddTab(&PaneView::classPaneView, text); }
  SRect Place(UINT id) { return PlaceIn(m_tabs, id); }
  bool IsVisible(UINT id) { return m_tabs.GetDlgItem(static_cast<int>(id))->IsWindowVisible(); }

  test::App m_app;
  SFrameWnd* m_frame = nullptr;
  Tabs m_tabs;
  int m_bar = 0;
};

TEST_F(TabWindows, FieldsStandInTheirOrder) { Tabs().ExpectFields(); }

TEST_F(TabWindows, ChildrenHaveTheirIdentifiersAndPlaces) {
  SWnd* first = Add(WTEXT("one"));
  SWnd* second = Add(WTEXT("two"));
  EXPECT_EQ(first->GetDlgCtrlID(), 0xE900);
  EXPECT_EQ(second->GetDlgCtrlID(), 0xE901);
  EXPECT_TRUE(m_tabs.HasScrollBars());
  const int strip = 300 - m_bar - 2;
  EXPECT_EQ(Place(0xEA01), SRect(0, strip, 200, 300));
  EXPECT_EQ(Place(0xEA00), SRect(206, 300 - m_bar, 400 - m_bar, 300));
  EXPECT_EQ(Place(0xEA10), SRect(400 - m_bar, 0, 400, strip));
  EXPECT_EQ(Place(0xEA20), SRect(400 - m_bar, 300 - m_bar, 400, 300));
  EXPECT_EQ(Place(0xE900), SRect(0, 0, 400 - m_bar, strip));
  EXPECT_TRUE(IsVisible(0xE900));
  EXPECT_FALSE(IsVisible(0xE901));

  m_tabs.ShowScrollBar(SB_HORZ, 0);
  EXPECT_EQ(Place(0xEA01), SRect(0, strip, 400, 300)) << "the beam spans the width";
  EXPECT_FALSE(IsVisible(0xEA00));
  EXPECT_FALSE(IsVisible(0xEA20));
  EXPECT_EQ(m_tabs.GetTabScrollBar(SB_HORZ), nullptr);
  m_tabs.ShowScrollBar(SB_BOTH, 0);
  EXPECT_EQ(Place(0xE900), SRect(0, 0, 400, strip));
  m_tabs.ShowScrollBar(SB_BOTH, 1);
  EXPECT_TRUE(IsVisible(0xEA20));
}

// The box is a grip only where it sizes the window around.
TEST_F(TabWindows, TheSizeBoxIsAGripInASizableCorner) {
  const HWND box = ::GetDlgItem(m_tabs.m_hWnd, 0xEA20);
  EXPECT_EQ(::GetWindowLongW(box, GWL_STYLE) & 0x18, 0x08);
  EXPECT_FALSE(::IsWindowEnabled(box));
  m_frame->ModifyStyle(0, WS_THICKFRAME, SWP_FRAMECHANGED);
  m_frame->RecalcLayout();
  m_tabs.RecalcLayout();
  EXPECT_EQ(::GetWindowLongW(box, GWL_STYLE) & 0x18, 0x10);
  EXPECT_TRUE(::IsWindowEnabled(box));
}

TEST_F(TabWindows, TheBeamKeepsItsShare) {
  Drag(m_tabs, SPoint(203, 290), SPoint(103, 290));
  EXPECT_EQ(m_tabs.GetBeamWidth(), 100);
  EXPECT_EQ(SWnd::GetCapture(), nullptr);
  for (const int width : {801, 3, 0, 17, 1200}) m_frame->SetWindowPos(nullptr, 0, 0, width, 300, SWP_NOZORDER);
  EXPECT_EQ(m_tabs.GetBeamWidth(), 300);
  m_frame->SetWindowPos(nullptr, 0, 0, 400, 300, SWP_NOZORDER);
  EXPECT_EQ(m_tabs.GetBeamWidth(), 100);
  Drag(m_tabs, SPoint(103, 290), SPoint(2000, 290));
  EXPECT_EQ(m_tabs.GetBeamWidth(), 400 - m_bar - 6);
  Mouse(m_tabs, WM_LBUTTONDBLCLK, SPoint(400 - m_bar - 3, 290));
  EXPECT_EQ(m_tabs.GetBeamWidth(), 200);
  Drag(m_tabs, SPoint(100, 100), SPoint(150, 100));
  EXPECT_EQ(m_tabs.GetBeamWidth(), 200) << "elsewhere nothing is dragged";
  for (const bool isCancelled : {true, false}) {
    Mouse(m_tabs, WM_LBUTTONDOWN, SPoint(203, 290));
    isCancelled ? static_cast<void>(m_tabs.SendMessageW(WM_CANCELMODE)) : static_cast<void>(::ReleaseCapture());
    EXPECT_EQ(SWnd::GetCapture(), nullptr);
    Mouse(m_tabs, WM_MOUSEMOVE, SPoint(150, 290));
    EXPECT_EQ(m_tabs.GetBeamWidth(), 200) << "the drag was taken away";
  }
}

TEST_F(TabWindows, AChosenTabIsShownAndHasTheFocus) {
  SWnd* first = Add(WTEXT("one"));
  SWnd* second = Add(WTEXT("two"));
  m_frame->ActivateFrame();
  m_tabs.SetFocus();
  EXPECT_EQ(SWnd::GetFocus(), first);
  Mouse(*m_tabs.GetTabBeam(), WM_LBUTTONDOWN, m_tabs.GetTabBeam()->GetTabRect(1).CenterPoint());
  int index = -1;
  EXPECT_EQ(m_tabs.GetActiveTab(&index), second);
  EXPECT_EQ(index, 1);
  EXPECT_TRUE(second->IsWindowVisible());
  EXPECT_FALSE(first->IsWindowVisible());
  EXPECT_EQ(SWnd::GetFocus(), second);
  EXPECT_EQ(m_frame->GetActiveView(), second);

  EXPECT_TRUE(m_tabs.ActivateTab(0, 0));
  EXPECT_EQ(SWnd::GetFocus(), first) << "the former window had the focus";
  m_frame->EnableWindow(0);
  EXPECT_TRUE(m_tabs.ActivateTab(1));
  EXPECT_EQ(m_frame->GetActiveView(), second) << "commands go to what is seen, though nothing can have the focus";
  m_frame->EnableWindow(1);
  EXPECT_TRUE(m_tabs.ActivateTab(0));
  EXPECT_FALSE(m_tabs.ActivateTab(2));
  EXPECT_EQ(m_tabs.SendMessageW(kSMsgTabSetCurrent, 1), 1);
  EXPECT_EQ(m_tabs.GetActiveTab(), second);
  EXPECT_EQ(m_tabs.SendMessageW(kSMsgTabSetCurrent, 0, reinterpret_cast<LPARAM>(first->m_hWnd)), 1);
  EXPECT_EQ(m_tabs.SendMessageW(kSMsgTabSetCurrent, 7), 0);
  EXPECT_EQ(m_tabs.GetActiveTab(), first);
}

TEST_F(TabWindows, RealInput_ChoosesATabAndScrolls) {
  for (int i = 0; i < 12; ++i) Add(WTEXT("Sales figures"));
  STabBeam& beam = *m_tabs.GetTabBeam();
  beam.SetScrollButtons(1, 1);
  m_frame->ActivateFrame();
  test::PumpAll();
  const SPoint tab = SRect(beam.GetTabRect(1)).CenterPoint();
  test::RealMouse(beam, tab, MOUSEEVENTF_LEFTDOWN);
  test::RealMouse(beam, tab, MOUSEEVENTF_LEFTUP);
  EXPECT_TRUE(test::PumpUntil([this] { return m_tabs.GetActiveTab() == m_tabs.GetTabWindow(1); }));
  // Held down, the button scrolls more than once.
  const SPoint next = beam.GetButtonRect(kSTabToNext).CenterPoint();
  test::RealMouse(beam, next, MOUSEEVENTF_LEFTDOWN);
  EXPECT_TRUE(test::PumpUntil([&beam] { return beam.GetFirstVisible() >= 3; }));
  test::RealMouse(beam, next, MOUSEEVENTF_LEFTUP);
  EXPECT_TRUE(test::PumpUntil([] { return SWnd::GetCapture() == nullptr; }));
}

TEST_F(TabWindows, TheWindowAroundMayRefuse) {
  test::Window around([](UINT message, WPARAM, LPARAM lParam, LRESULT* result) {
    if (message != WM_NOTIFY) return 0;
    *result = reinterpret_cast<const NMHDR*>(lParam)->code == static_cast<UINT>(kSTabChanging);
    return 1;
  });
  ASSERT_TRUE(around.Popup());
  Tabs tabs;
  ASSERT_TRUE(tabs.Create(&around, nullptr, nullptr));
  tabs.AddTab(&PaneView::classPaneView, WTEXT("one"));
  tabs.AddTab(&PaneView::classPaneView, WTEXT("two"));
  EXPECT_EQ(tabs.SendMessageW(kSMsgTabSetCurrent, 1), 0);
  EXPECT_EQ(tabs.GetActiveTab(), tabs.GetTabWindow(0));
  around.DestroyWindow();
}

TEST_F(TabWindows, TabsComeAndGo) {
  SWnd* first = Add(WTEXT("one"));
  SWnd* second = Add(WTEXT("two"));
  test::Window adopted;
  ASSERT_TRUE(adopted.Child(m_frame));
  EXPECT_EQ(m_tabs.InsertTab(0, &adopted, WTEXT("zero")), 0);
  EXPECT_EQ(m_tabs.InsertTab(0, &adopted, WTEXT("again")), -1);
  EXPECT_EQ(m_tabs.InsertTab(9, &PaneView::classPaneView, WTEXT("far")), nullptr);
  EXPECT_EQ(m_tabs.AddTab(&SObject::classSObject, WTEXT("no window")), nullptr);
  EXPECT_EQ(m_tabs.GetActiveTab(), first) << "the same tab stays current";
  EXPECT_EQ(m_tabs.GetTabIndex(second), 2);
  EXPECT_EQ(m_tabs.GetTabText(0), WTEXT("zero"));
  WCHAR cut[3];
  EXPECT_EQ(m_tabs.GetTabText(0, cut, 3), 2);
  EXPECT_EQ(SStringView(cut), WTEXT("ze"));
  EXPECT_EQ(m_tabs.GetTabTextLength(2), 3);
  EXPECT_EQ(m_tabs.GetTabTextLength(3), 0);

  EXPECT_TRUE(m_tabs.DeleteTab(1));
  EXPECT_EQ(m_tabs.GetActiveTab(), second);
  EXPECT_TRUE(second->IsWindowVisible());
  second->DestroyWindow();
  EXPECT_EQ(m_tabs.GetTabCount(), 1) << "a window that ends takes its tab along";
  EXPECT_EQ(m_tabs.GetActiveTab(), &adopted);
  EXPECT_TRUE(adopted.IsWindowVisible());
  EXPECT_TRUE(m_tabs.DetachTab(&adopted));
  EXPECT_FALSE(m_tabs.DetachTab(&adopted));
  EXPECT_TRUE(::IsWindow(adopted.m_hWnd));
  EXPECT_FALSE(adopted.IsWindowVisible());
  EXPECT_EQ(m_tabs.GetActiveTab(), nullptr);
}

TEST_F(TabWindows, AnObjectThatEndsTakesItsWindowAlong) {
  Tabs tabs;
  ASSERT_TRUE(tabs.Create(m_frame, nullptr, nullptr, WS_CHILD, 7));
  tabs.AddTab(&PaneView::classPaneView, WTEXT("one"));
  SSplitterWnd splitter;
  ASSERT_TRUE(splitter.CreateStatic(m_frame, 1, 1, WS_CHILD, 8));
  splitter.AddPane(0, 0, &PaneView::classPaneView, SSize());
}

TEST_F(TabWindows, WithoutATabAWindowIsShown) {
  test::Window nothing;
  ASSERT_TRUE(nothing.Child(m_frame));
  m_tabs.SetNoTabText(WTEXT("nothing is open"));
  m_tabs.SetNoTabWnd(&nothing);
  EXPECT_TRUE(nothing.IsWindowVisible());
  EXPECT_EQ(nothing.GetParent(), &m_tabs);
  Add(WTEXT("one"));
  EXPECT_FALSE(nothing.IsWindowVisible());
  m_tabs.DeleteTab(0);
  EXPECT_TRUE(nothing.IsWindowVisible());
  nothing.DestroyWindow();
  EXPECT_FALSE(m_tabs.HasNoTabWindow()) << "its object may have gone along";
}

// More tabs than there are identifiers below those of the scroll bars.
TEST_F(TabWindows, IdentifiersSkipTheScrollBars) {
  UINT last = 0;
  for (int i = 0; i < 300; ++i) {
    last = m_tabs.GetNextID();
    ASSERT_TRUE(last != 0xEA00 && last != 0xEA01 && last != 0xEA10 && last != 0xEA20);
  }
  EXPECT_EQ(last, 0xE900u + 299 + 4);
  for (int i = 300; i < 0x10000 - 0xE900 - 4; ++i) last = m_tabs.GetNextID();
  EXPECT_EQ(last, 0xFFFFu);
  EXPECT_EQ(m_tabs.GetNextID(), 0xE900u);
}

TEST_F(TabWindows, ScrollMessagesGoToTheShownWindow) {
  Add(WTEXT("one"));
  Add(WTEXT("two"));
  m_tabs.ActivateTab(1, 0);
  SScrollBar* bar = m_tabs.GetTabScrollBar(SB_VERT);
  ASSERT_NE(bar, nullptr);
  const HWND handle = bar->m_hWnd;
  bar->SetRange(0, 10);
  m_tabs.SendMessageW(WM_VSCROLL, SB_LINEDOWN, reinterpret_cast<LPARAM>(handle));
  EXPECT_EQ(::GetScrollPos(handle, SB_CTL), 1);
  EXPECT_TRUE(static_cast<PaneView*>(m_tabs.GetTabWindow(0))->m_positions.empty());
}

TEST_F(TabWindows, KeysGoFromTabToTabAndToTheBeam) {
  SWnd* first = Add(WTEXT("one"));
  SWnd* second = Add(WTEXT("two"));
  m_frame->ActivateFrame();
  m_tabs.SetFocus();
  {
    const test::KeyIsDown control(VK_CONTROL);
    Key(::GetFocus(), VK_TAB);
    EXPECT_EQ(SWnd::GetFocus(), second);
    Key(::GetFocus(), VK_NEXT);
    EXPECT_EQ(SWnd::GetFocus(), first) << "after the last comes the first";
    Key(::GetFocus(), VK_PRIOR);
    EXPECT_EQ(SWnd::GetFocus(), second);
  }
  Key(::GetFocus(), VK_F6);
  EXPECT_EQ(SWnd::GetFocus(), m_tabs.GetTabBeam());
  Key(::GetFocus(), VK_LEFT);
  EXPECT_EQ(m_tabs.GetActiveTab(), first);
  EXPECT_EQ(SWnd::GetFocus(), m_tabs.GetTabBeam()) << "the arrows go on choosing";
  Key(::GetFocus(), VK_RETURN);
  EXPECT_EQ(SWnd::GetFocus(), first);
}

// Tabs in a splitter in a splitter: F6 visits them all, and Shift+F6 the same way back.
TEST_F(TabWindows, F6GoesThroughNestedWindows) {
  auto* frame = new SFrameWnd;
  ASSERT_TRUE(frame->Create(nullptr, nullptr, WS_POPUP | WS_VISIBLE, SRect(0, 0, 400, 300)));
  SSplitterWnd outer, inner;
  Tabs tabs;
  ASSERT_TRUE(outer.CreateStatic(frame, 1, 2));
  ASSERT_TRUE(inner.CreateStatic(&outer, 1, 2, WS_CHILD, SSplitterWnd::IdFromRowCol(0, 1)));
  ASSERT_TRUE(tabs.Create(&inner, nullptr, nullptr, WS_CHILD, SSplitterWnd::IdFromRowCol(0, 1)));
  SWnd* first = outer.AddPane(0, 0, &PaneView::classPaneView, SSize(100, 0));
  SWnd* second = inner.AddPane(0, 0, &PaneView::classPaneView, SSize(100, 0));
  inner.AddPane(0, 1, &tabs, SSize());
  outer.AddPane(0, 1, &inner, SSize());
  SWnd* tab = tabs.AddTab(&PaneView::classPaneView, WTEXT("one"));
  frame->ActivateFrame();
  const auto visited = [&] {
    std::vector<SWnd*> windows;
    outer.SetActivePane(0, 0);
    for (int i = 0; i < 5; ++i) {
      windows.push_back(SWnd::GetFocus());
      Key(::GetFocus(), VK_F6);
    }
    return windows;
  };
  EXPECT_EQ(visited(), (std::vector<SWnd*>{first, second, tab, tabs.GetTabBeam(), first}));
  const test::KeyIsDown shift(VK_SHIFT);
  EXPECT_EQ(visited(), (std::vector<SWnd*>{first, tabs.GetTabBeam(), tab, second, first}));
  frame->DestroyWindow();
}

TEST_F(TabWindows, StateComesBackAtAnotherSize) {
  for (int i = 0; i < 3; ++i) Add(WTEXT("tab"));
  m_tabs.ActivateTab(2);
  m_tabs.SetBeamWidth(100);
  const SString state = m_tabs.GetState();
  m_tabs.ActivateTab(0);
  m_tabs.SetBeamWidth(300);
  m_frame->SetWindowPos(nullptr, 0, 0, 800, 300, SWP_NOZORDER);
  ASSERT_TRUE(m_tabs.SetState(state));
  EXPECT_EQ(m_tabs.GetActiveTab(), m_tabs.GetTabWindow(2));
  EXPECT_EQ(m_tabs.GetBeamWidth(), 200);
  EXPECT_FALSE(m_tabs.SetState(WTEXT("tabs 1 1 0 100")));
  EXPECT_FALSE(m_tabs.SetState(WTEXT("splitter 1 96 0 rows 1 0 0 columns 1 0 0")));
  EXPECT_TRUE(m_tabs.SetState(WTEXT("tabs 1 9 9 0 0"))) << "tabs that do not exist are left alone";
  EXPECT_EQ(m_tabs.GetActiveTab(), m_tabs.GetTabWindow(2));
}

TEST_F(TabWindows, SizesFollowTheDpi) {
  Add(WTEXT("one"));
  m_frame->SendMessageW(WM_DPICHANGED, MAKEWPARAM(192, 192));
  const int bar = ::GetSystemMetricsForDpi(SM_CXHSCROLL, 192);
  EXPECT_EQ(Place(0xEA01), SRect(0, 300 - bar - 4, 200, 300));
  EXPECT_EQ(Place(0xEA00).left, 212);
}

// There and back everything is as it was, and so is the state that a program keeps.
TEST_F(TabWindows, TheFormerDpiBringsTheFormerPlaces) {
  Add(WTEXT("one"));
  Add(WTEXT("two"));
  m_tabs.ActivateTab(1);
  m_tabs.SetBeamWidth(137);
  const SString state = m_tabs.GetState();
  std::vector<SRect> places;
  for (const UINT id : {0xE900, 0xE901, 0xEA00, 0xEA01, 0xEA10, 0xEA20}) places.push_back(Place(id));
  const int width = m_tabs.GetTabBeam()->GetTabWidth(1);
  m_frame->SendMessageW(WM_DPICHANGED, MAKEWPARAM(192, 192));
  EXPECT_EQ(m_tabs.GetState(), state) << "a share of the strip is no number of pixels";
  EXPECT_GT(m_tabs.GetTabBeam()->GetTabWidth(1), width);
  m_frame->SendMessageW(WM_DPICHANGED, MAKEWPARAM(96, 96));
  EXPECT_EQ(m_tabs.GetState(), state);
  EXPECT_EQ(m_tabs.GetTabBeam()->GetTabWidth(1), width);
  std::size_t next = 0;
  for (const UINT id : {0xE900, 0xE901, 0xEA00, 0xEA01, 0xEA10, 0xEA20}) EXPECT_EQ(Place(id), places[next++]) << id;
  m_tabs.ForgetMetrics();
  m_tabs.SendMessageW(WM_SETTINGCHANGE);
  EXPECT_EQ(Place(0xEA10), places[4]);
}

}  // namespace
