// Splitters and tabs in the hands of programs that ask for the impossible: handlers that end panes, windows and objects
// in the middle of a layout, numbers at the ends of their types, calls without a window, damaged states.

#include <climits>
#include <random>

#include "tests/layout/layout_fixture.h"

namespace {

using test::Mouse;

class Splitter : public SSplitterWnd {
 public:
  using SSplitterWnd::HitTest;
  using SSplitterWnd::StartTracking;
  using SSplitterWnd::StopTracking;
  using SSplitterWnd::TrackColumnSize;
  using SSplitterWnd::TrackRowSize;
  bool IsTracking() const { return m_isTracking; }
  int WidthOf(int column) const {
    int width = 0;
    GetColumnInfo(column, &width, nullptr);
    return width;
  }
  // What holds after each layout.
  void ExpectWhole() {
    SRect inside;
    GetInsideRect(&inside);
    int sum = 0;
    for (int i = 0; i < m_columnCount; ++i) {
      ASSERT_GE(WidthOf(i), 0);
      ASSERT_GE(m_columns[i].m_ideal, 0);
      sum += WidthOf(i);
    }
    ASSERT_EQ(sum, std::max(inside.Width() - (m_columnCount - 1) * m_gapX, 0));
  }
};

class Beam : public STabBeam {
 public:
  using STabBeam::CalcTabFromOffset;
  using STabBeam::CalcTabOffset;
  using STabBeam::Scroll;
};

// A window that does something on a message, once.
class Trap : public test::Window {
 public:
  Trap(UINT message, std::function<void()> action) {
    m_handler = [this, message, action](UINT received, WPARAM, LPARAM, LRESULT*) {
      if (received != message || !m_isArmed) return 0;
      m_isArmed = false;
      action();
      return 1;
    };
  }
  bool m_isArmed = false;
};

class Hostile : public test::FrameTest {
 protected:
  Hostile() : FrameTest(400) {}
  void TearDown() override {
    FrameTest::TearDown();
    EXPECT_EQ(test::PaneView::s_living, 0);
  }
  void Size(int width) { m_frame->SetWindowPos(nullptr, 0, 0, width, 300, SWP_NOZORDER | SWP_NOACTIVATE); }
  void Scale(int dpi) { m_frame->SendMessageW(WM_DPICHANGED, MAKEWPARAM(dpi, dpi)); }
};

// --- handlers that end what is being laid out ---

TEST_F(Hostile, APaneEndsItsNeighbourWhileItIsSized) {
  Splitter splitter;
  ASSERT_TRUE(splitter.CreateStatic(m_frame, 1, 3));
  for (const bool endsAll : {false, true}) {
    test::Window neighbours[2];
    Trap pane(WM_SIZE, [&] { endsAll ? splitter.DestroyWindow() : neighbours[1].DestroyWindow(); });
    for (test::Window& window : neighbours) ASSERT_TRUE(window.Child(m_frame));
    ASSERT_TRUE(pane.Child(m_frame));
    splitter.AddPane(0, 0, &neighbours[0], SSize(50, 0));
    splitter.AddPane(0, 1, &pane, SSize(50, 0));
    splitter.AddPane(0, 2, &neighbours[1], SSize(50, 0));
    splitter.SetColumnInfo(1, 60 + endsAll, 0);
    pane.m_isArmed = true;
    splitter.RecalcLayout();
    EXPECT_FALSE(pane.m_isArmed);
    EXPECT_EQ(splitter.m_hWnd == nullptr, endsAll);
    EXPECT_EQ(neighbours[1].m_hWnd, nullptr);
    if (endsAll) return;
    splitter.ExpectWhole();
    splitter.RemovePane(0, 0);
    splitter.RemovePane(0, 1);
    neighbours[0].DestroyWindow();
    pane.DestroyWindow();
  }
}

TEST_F(Hostile, AnObjectEndsInItsOwnLayout) {
  auto* splitter = new Splitter;
  ASSERT_TRUE(splitter->CreateStatic(m_frame, 1, 2));
  Trap pane(WM_SIZE, [splitter] { delete splitter; });
  ASSERT_TRUE(pane.Child(m_frame));
  splitter->AddPane(0, 0, &pane, SSize(50, 0));
  splitter->AddPane(0, 1, &test::PaneView::classPaneView, SSize(50, 0));
  pane.m_isArmed = true;
  EXPECT_TRUE(splitter->ToggleBar(kSHitColumnBar));

  auto* grid = new Splitter;
  ASSERT_TRUE(grid->CreateStatic(m_frame, 1, 2));
  Trap ends(WM_DESTROY, [grid] { delete grid; });
  ASSERT_TRUE(ends.Child(m_frame));
  grid->AddPane(0, 0, &ends, SSize(50, 0));
  grid->AddPane(0, 1, &test::PaneView::classPaneView, SSize(50, 0));
  ends.m_isArmed = true;
  grid->DeleteColumn(0);

  for (const UINT message : {UINT{WM_SIZE}, UINT{WM_SETFOCUS}}) {
    auto* tabs = new STabWnd;
    ASSERT_TRUE(tabs->Create(m_frame, nullptr, nullptr));
    tabs->AddTab(&test::PaneView::classPaneView, WTEXT("one"));
    Trap shown(message, [tabs] { delete tabs; });
    ASSERT_TRUE(shown.Child(m_frame));
    tabs->AddTab(&shown, WTEXT("two"));
    shown.m_isArmed = true;
    tabs->ActivateTab(1);
    EXPECT_FALSE(shown.m_isArmed) << message;
    EXPECT_EQ(shown.m_hWnd, nullptr);
  }
}

TEST_F(Hostile, ATabWindowEndsWhileItsChangeIsNotified) {
  for (const int code : {kSTabChanging, kSTabChanged}) {
    for (const bool endsObject : {false, true}) {
      auto* tabs = new STabWnd;
      test::Window around;
      bool isArmed = false;
      around.m_handler = [&](UINT message, WPARAM, LPARAM lParam, LRESULT*) {
        if (message != WM_NOTIFY || !isArmed) return 0;
        if (reinterpret_cast<const NMHDR*>(lParam)->code != static_cast<UINT>(code)) return 0;
        isArmed = false;
        endsObject ? delete tabs : static_cast<void>(tabs->DestroyWindow());
        return 1;
      };
      ASSERT_TRUE(around.Popup(WS_VISIBLE));
      ASSERT_TRUE(tabs->Create(&around, nullptr, nullptr));
      for (int i = 0; i < 3; ++i) tabs->AddTab(&test::PaneView::classPaneView, WTEXT("tab"));
      isArmed = true;
      Mouse(*tabs->GetTabBeam(), WM_LBUTTONDOWN, tabs->GetTabBeam()->GetTabRect(2).CenterPoint());
      EXPECT_FALSE(isArmed);
      if (!endsObject) delete tabs;
      around.DestroyWindow();
    }
  }
}

TEST_F(Hostile, AFrameEndsWhileItsBarsTakeTheirPlaces) {
  auto* frame = new SFrameWnd;
  ASSERT_TRUE(frame->Create(nullptr, nullptr, WS_POPUP | WS_VISIBLE, SRect(0, 0, 100, 100)));
  Trap bar(kSMsgSizeParent, [frame] { frame->DestroyWindow(); });
  ASSERT_TRUE(bar.Child(frame, 7));
  bar.m_isArmed = true;
  frame->RecalcLayout();
  EXPECT_EQ(bar.m_hWnd, nullptr);
}

// A window that moves from one splitter or tab window to another stands in one of them only.
TEST_F(Hostile, AWindowChangesItsPlace) {
  Splitter splitters[2];
  STabWnd tabs[2];
  test::Window window, other;
  ASSERT_TRUE(window.Child(m_frame));
  ASSERT_TRUE(other.Child(m_frame));
  for (Splitter& splitter : splitters) ASSERT_TRUE(splitter.CreateStatic(m_frame, 1, 2));
  for (STabWnd& tab : tabs) ASSERT_TRUE(tab.Create(m_frame, nullptr, nullptr));
  splitters[0].AddPane(0, 0, &window, SSize(50, 0));
  splitters[0].AddPane(0, 1, &other, SSize(50, 0));
  EXPECT_EQ(splitters[1].AddPane(0, 0, &window, SSize(70, 0)), &window);
  EXPECT_FALSE(splitters[0].CanActivateNext());
  EXPECT_EQ(tabs[0].AddTab(&window, WTEXT("first")), 0);
  EXPECT_EQ(splitters[1].GetPane(0, 0), nullptr);
  EXPECT_EQ(tabs[1].AddTab(&window, WTEXT("second")), 0);
  EXPECT_EQ(tabs[0].GetTabCount(), 0);
  const SRect place = test::PlaceIn(tabs[1], window.m_hWnd);
  tabs[0].MoveWindow(SRect(0, 0, 77, 77));
  splitters[0].RecalcLayout();
  EXPECT_EQ(test::PlaceIn(tabs[1], window.m_hWnd), place) << "the former places move it no more";
  EXPECT_EQ(splitters[0].AddPane(0, 0, &window, SSize(50, 0)), &window);
  EXPECT_EQ(tabs[1].GetTabCount(), 0);
  EXPECT_TRUE(window.IsWindowVisible());
  EXPECT_TRUE(splitters[0].CanActivateNext());
  splitters[0].ExpectWhole();
}

// --- a drag that is overtaken ---

TEST_F(Hostile, AChangedGeometryEndsADrag) {
  SCreateContext context = test::PaneContext();
  Splitter splitter;
  ASSERT_TRUE(splitter.Create(m_frame, 1, 3, SSize(10, 10), &context));
  m_frame->RecalcLayout();
  ASSERT_TRUE(splitter.SplitColumn(100));
  ASSERT_TRUE(splitter.SplitColumn(200));
  const auto changes = {std::function<void()>([this] { Scale(192); }), std::function<void()>([this] { Size(500); }),
                        std::function<void()>([&] { splitter.DeleteColumn(1); })};
  for (const auto& change : changes) {
    splitter.StartTracking(kSHitColumnBar + 1);
    Mouse(splitter, WM_MOUSEMOVE, SPoint(30, 30));
    change();
    EXPECT_FALSE(splitter.IsTracking());
    EXPECT_EQ(SWnd::GetCapture(), nullptr);
    const SString state = splitter.GetState();
    Mouse(splitter, WM_LBUTTONUP, SPoint(30, 30));
    EXPECT_EQ(splitter.GetState(), state) << "its place was one in the former geometry";
    Scale(96);
  }
}

// --- numbers ---

TEST_F(Hostile, NumbersAtTheEndsOfTheirTypes) {
  Splitter splitter;
  ASSERT_TRUE(splitter.CreateStatic(m_frame, 2, 3));
  for (int i = 0; i < 6; ++i) splitter.AddPane(i / 3, i % 3, &test::PaneView::classPaneView, SSize(INT_MAX, INT_MAX));
  splitter.SetColumnInfo(1, INT_MAX, INT_MAX);
  splitter.SetColumnInfo(2, 5, 7);
  for (const int keepsRatio : {0, 1}) {
    splitter.SetKeepPaneRatio(keepsRatio);
    for (const int dpi : {192, 480, 96}) {
      Scale(dpi);
      ASSERT_NO_FATAL_FAILURE(splitter.ExpectWhole()) << dpi;
      const SString state = splitter.GetState();
      EXPECT_TRUE(splitter.SetState(state)) << "what was saved can be restored";
      EXPECT_EQ(splitter.GetState(), state);
    }
    for (const int place : {INT_MIN, -1, INT_MAX}) {
      splitter.TrackRowSize(place, 0);
      splitter.TrackColumnSize(place, 0);
      ASSERT_NO_FATAL_FAILURE(splitter.ExpectWhole()) << place;
    }
  }
  for (const int none : {INT_MIN, -2, -1, 16, INT_MAX}) {
    splitter.TrackRowSize(5, none);
    splitter.DeleteColumn(none);
    splitter.DeletePane(none, 0);
    splitter.SetColumnInfo(none, 1, 1);
    EXPECT_EQ(splitter.GetPane(0, none), nullptr);
    EXPECT_EQ(splitter.ToggleBar(none), 0);
  }

  SCreateContext context = test::PaneContext();
  Splitter dynamic;
  ASSERT_TRUE(dynamic.Create(m_frame, 2, 2, SSize(10, 10), &context, WS_CHILD | WS_VISIBLE, 9));
  for (const int place : {INT_MIN, -1, INT_MAX}) EXPECT_FALSE(dynamic.SplitColumn(place));

  Beam beam;
  ASSERT_TRUE(beam.Create(m_frame, WS_CHILD | WS_VISIBLE, 10));
  beam.MoveWindow(SRect(0, 0, 300, 20));
  for (int i = 0; i < 4; ++i) beam.InsertTab(i, WTEXT("wide"), nullptr, INT_MAX);
  EXPECT_EQ(beam.GetTabWidth(2), INT_MAX);
  EXPECT_EQ(beam.GetLastVisible(), 0);
  EXPECT_EQ(beam.CalcTabOffset(3), INT_MAX);
  EXPECT_EQ(beam.CalcTabFromOffset(INT_MAX - 1), 0);
  beam.EnsureVisible(3);
  EXPECT_EQ(beam.GetFirstVisible(), 3);
  EXPECT_EQ(beam.CalcTabOffset(0), INT_MIN);
  beam.UpdateWindow();
  beam.SetSpacing(INT_MAX);
  EXPECT_GT(beam.GetTabWidth(0), 0);
  beam.SendMessageW(WM_DPICHANGED, MAKEWPARAM(192, 192));
  EXPECT_GT(beam.GetSpacing(), 0);
  beam.Scroll(kSTabToLast);
  beam.UpdateWindow();
}

// Windows with less room than their parts need: every point, the mouse, the keyboard and painting.
TEST_F(Hostile, WindowsOfNoSize) {
  SCreateContext context = test::PaneContext();
  Splitter splitter;
  ASSERT_TRUE(splitter.Create(m_frame, 3, 3, SSize(10, 10), &context, WS_CHILD | WS_VISIBLE | WS_HSCROLL | WS_VSCROLL));
  ASSERT_TRUE(splitter.SplitColumn(50));
  ASSERT_TRUE(splitter.SplitRow(50));
  STabWnd tabs;
  ASSERT_TRUE(tabs.Create(m_frame, nullptr, nullptr, WS_CHILD | WS_VISIBLE, 9));
  for (int i = 0; i < 3; ++i) tabs.AddTab(&test::PaneView::classPaneView, WTEXT("tab"));
  tabs.GetTabBeam()->SetScrollButtons(1, 0);
  m_frame->ActivateFrame();
  for (const SSize size : {SSize(0, 0), SSize(1, 1), SSize(0, 300), SSize(300, 0), SSize(5, 20), SSize(20, 5)}) {
    splitter.MoveWindow(SRect(SPoint(), size));
    tabs.MoveWindow(SRect(SPoint(), size));
    ASSERT_NO_FATAL_FAILURE(splitter.ExpectWhole());
    for (SWnd* window :
         {static_cast<SWnd*>(&splitter), static_cast<SWnd*>(&tabs), static_cast<SWnd*>(tabs.GetTabBeam())}) {
      for (int y = 0; y <= size.cy; y += 4) {
        for (int x = 0; x <= size.cx; x += 4) test::Drag(*window, SPoint(x, y), SPoint(x + 3, y + 3));
      }
      window->Invalidate();
      window->UpdateWindow();
      EXPECT_EQ(SWnd::GetCapture(), nullptr);
    }
    splitter.DoKeyboardSplit();
    for (const WPARAM key : {VK_HOME, VK_END, VK_LEFT, VK_DOWN, VK_RETURN, VK_ESCAPE}) test::Key(splitter.m_hWnd, key);
    ASSERT_NO_FATAL_FAILURE(splitter.ExpectWhole());
  }
}

// --- calls without a window: before it is made, and after it went ---

TEST_F(Hostile, WithoutAWindowNothingHappens) {
  m_frame->SetFocus();
  Splitter splitter;
  STabWnd tabs;
  Beam beam;
  test::Window other;
  ASSERT_TRUE(other.Child(m_frame));
  for (const bool isAfterwards : {false, true}) {
    if (isAfterwards) {
      ASSERT_TRUE(splitter.CreateStatic(m_frame, 1, 2, WS_CHILD | WS_VISIBLE | WS_HSCROLL));
      splitter.AddPane(0, 0, &test::PaneView::classPaneView, SSize(50, 40));
      splitter.DestroyWindow();
      ASSERT_TRUE(tabs.Create(m_frame, nullptr, nullptr));
      tabs.AddTab(&test::PaneView::classPaneView, WTEXT("one"));
      tabs.DestroyWindow();
      ASSERT_TRUE(beam.Create(m_frame, WS_CHILD, 9));
      beam.DestroyWindow();
      m_frame->SetFocus();
    }
    splitter.RecalcLayout();
    splitter.StartTracking(kSHitColumnBar);
    splitter.StopTracking(1);
    splitter.TrackColumnSize(10, 0);
    splitter.ToggleBar(kSHitColumnBar);
    splitter.SetActivePane(0, 0);
    splitter.ActivateNext();
    splitter.DeletePane(0, 0);
    splitter.DeleteColumn(0);
    splitter.SetScrollStyle(WS_VSCROLL);
    EXPECT_FALSE(splitter.SplitRow(10));
    EXPECT_FALSE(splitter.DoKeyboardSplit());
    EXPECT_FALSE(splitter.DoScrollBy(nullptr, SSize(1, 1)));
    EXPECT_FALSE(splitter.IsChildPane(&other));
    EXPECT_EQ(splitter.AddPane(0, 0, &other, SSize(1, 1)), nullptr);
    EXPECT_EQ(splitter.GetActivePane(), nullptr);
    EXPECT_EQ(splitter.GetPane(0, 0), nullptr);
    EXPECT_EQ(splitter.GetPaneScrollBar(&other, SB_HORZ), nullptr);
    EXPECT_FALSE(splitter.SetState(splitter.GetState()));
    EXPECT_EQ(splitter.MakeAccessible()->GetRect(0), SRect());

    EXPECT_EQ(tabs.AddTab(&other, WTEXT("tab")), -1);
    EXPECT_EQ(tabs.AddTab(&test::PaneView::classPaneView, WTEXT("tab")), nullptr);
    tabs.RecalcLayout();
    tabs.ShowScrollBar(SB_BOTH, 1);
    tabs.SetBeamWidth(100);
    tabs.SetNoTabText(WTEXT("nothing"));
    EXPECT_FALSE(tabs.DeleteTab(0));
    EXPECT_FALSE(tabs.ActivateTab(0));
    EXPECT_EQ(tabs.GetActiveTab(), nullptr);
    EXPECT_EQ(tabs.GetTabScrollBar(SB_VERT), nullptr);
    EXPECT_FALSE(tabs.SetState(tabs.GetState()));

    beam.InsertTab(0, WTEXT("early"), nullptr);
    beam.SetScrollButtons(1, 0);
    beam.Scroll(kSTabToLast);
    EXPECT_EQ(beam.ChooseTab(5), 0);
    EXPECT_TRUE(beam.DeleteTab(0));
    EXPECT_EQ(SWnd::GetFocus(), m_frame) << "the focus stays where it is";
    EXPECT_EQ(SWnd::GetCapture(), nullptr);
    EXPECT_EQ(SWnd::FromHandlePermanent(other.m_hWnd), &other);
    EXPECT_EQ(other.GetParent(), m_frame);
  }
}

// What is shown while there is no tab may be named before there is a window.
TEST_F(Hostile, AWindowForNoTabsMayComeFirst) {
  test::Window nothing;
  ASSERT_TRUE(nothing.Child(m_frame));
  STabWnd tabs;
  tabs.SetNoTabWnd(&nothing);
  ASSERT_TRUE(tabs.Create(m_frame, nullptr, nullptr));
  tabs.RecalcLayout();
  EXPECT_EQ(nothing.GetParent(), &tabs);
  EXPECT_TRUE(nothing.IsWindowVisible());
}

// --- states ---

// A state is refused, and changes nothing, or it is taken, and then gives itself again.
template <class Bars>
void ExpectSturdy(Bars& bars, const std::vector<SString>& states, unsigned seed, const std::function<void()>& check) {
  std::mt19937 random(seed);
  const auto below = [&random](std::size_t limit) { return random() % static_cast<unsigned>(limit); };
  const LPCWSTR numbers[] = {WTEXT("0"),        WTEXT("1"),          WTEXT("16"),         WTEXT("17"),
                             WTEXT("16777216"), WTEXT("2147483647"), WTEXT("2147483648"), WTEXT("-1")};
  int taken = 0;
  for (int step = 0; step < 3000; ++step) {
    std::vector<WideString> words(1);
    for (const WCHAR character : states[below(states.size())].View()) {
      if (character == ' ') {
        words.emplace_back();
      } else {
        words.back() += character;
      }
    }
    for (std::size_t i = 0; i <= below(3); ++i) {
      const std::size_t at = below(words.size());
      if (below(8) != 0) {
        words[at] = numbers[below(std::size(numbers))];
      } else if (below(2) != 0) {
        words[at] += static_cast<WCHAR>(below(0x10000));
      } else {
        words.insert(words.begin() + static_cast<std::ptrdiff_t>(at), words[below(words.size())]);
      }
    }
    WideString text = words[0];
    for (std::size_t i = 1; i < words.size(); ++i) text += WTEXT(" ") + words[i];
    const SString damaged((SStringView(text))), before = bars.GetState();
    if (!bars.SetState(damaged)) {
      ASSERT_EQ(bars.GetState(), before) << testing::PrintToString(damaged);
      continue;
    }
    ++taken;
    ASSERT_NO_FATAL_FAILURE(check()) << testing::PrintToString(damaged);
    const SString now = bars.GetState();
    ASSERT_TRUE(bars.SetState(now)) << testing::PrintToString(now);
    ASSERT_EQ(bars.GetState(), now);
  }
  EXPECT_GT(taken, 100);
}

TEST_F(Hostile, DamagedStates) {
  SCreateContext context = test::PaneContext();
  Splitter splitter;
  ASSERT_TRUE(splitter.Create(m_frame, 2, 3, SSize(10, 10), &context));
  m_frame->RecalcLayout();
  Scale(192);
  std::vector<SString> states = {splitter.GetState(),
                                 WTEXT("splitter 1 1 0 rows 1 7 0 columns 3 16777216 0 9 16777216 0 0")};
  ASSERT_TRUE(splitter.SplitColumn(100));
  splitter.ToggleBar(kSHitColumnBar);
  states.push_back(splitter.GetState());
  splitter.SetKeepPaneRatio(1);
  states.push_back(splitter.GetState());
  ExpectSturdy(splitter, states, 1, [&] { splitter.ExpectWhole(); });
  splitter.DestroyWindow();

  STabWnd tabs;
  ASSERT_TRUE(tabs.Create(m_frame, nullptr, nullptr));
  for (int i = 0; i < 5; ++i) tabs.AddTab(&test::PaneView::classPaneView, WTEXT("Sales figures"));
  states = {tabs.GetState()};
  tabs.ActivateTab(4);
  tabs.SetBeamWidth(77);
  states.push_back(tabs.GetState());
  ExpectSturdy(tabs, states, 2, [&] {
    ASSERT_GE(tabs.GetBeamWidth(), 0);
    ASSERT_LE(tabs.GetBeamWidth(), 400);
    int shown = -1;
    ASSERT_NE(tabs.GetActiveTab(&shown), nullptr);
    tabs.GetTabBeam()->EnsureVisible(shown);  // a state makes it visible
    ASSERT_LT(tabs.GetTabBeam()->GetFirstVisible(), 5);
  });
}

// Saved in a wide window, restored in a narrow one: the chosen tab is to be seen.
TEST_F(Hostile, TheShownTabIsVisibleInANarrowerWindow) {
  STabWnd tabs;
  ASSERT_TRUE(tabs.Create(m_frame, nullptr, nullptr));
  Size(2000);
  m_frame->RecalcLayout();
  for (int i = 0; i < 8; ++i) tabs.AddTab(&test::PaneView::classPaneView, WTEXT("Sales figures"));
  tabs.ActivateTab(6);
  ASSERT_EQ(tabs.GetTabBeam()->GetFirstVisible(), 0);
  const SString state = tabs.GetState();
  tabs.ActivateTab(0);
  Size(400);
  ASSERT_TRUE(tabs.SetState(state));
  EXPECT_GE(tabs.GetTabBeam()->GetLastVisible(), 6);
}

}  // namespace
