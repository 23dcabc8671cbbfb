// Progress over the main pane, its Cancel button, and the messages that stand in the main pane for a while.

#include <limits>

#include "tests/bar/bar_fixture.h"

namespace {

using test::Frame;

class ProgressBars : public test::UiTest {
 protected:
  void SetUp() override {
    UiTest::SetUp();
    m_frame = Frame::Make();
    ASSERT_NE(m_frame, nullptr);
    m_app.m_mainWnd = m_frame;
    ASSERT_TRUE(m_bar.Create(m_frame));
    m_bar.InsertPane(0, 40, 0);
    m_bar.InsertPane(1, 0, kSPaneMain | kSPaneStretch);
    m_frame->RecalcLayout();
  }
  void TearDown() override {
    m_app.m_mainWnd = nullptr;
    m_frame->DestroyWindow();
    UiTest::TearDown();
  }
  SWnd& Progress() { return *m_bar.GetDlgItem(1); }
  SWnd& Button() { return *m_bar.GetDlgItem(2); }
  std::uint32_t Flags() {
    SProgressStatusBar::Status status;
    m_bar.GetSetProgressStatus(&status, nullptr);
    return status.m_flags;
  }
  SRect Area() {
    SRect area;
    EXPECT_TRUE(m_bar.GetPaneRect(kSMainPane, &area));
    area.Deflate(2, 0);
    return area;
  }
  bool IsShown(const SWnd& window) { return (window.GetStyle() & WS_VISIBLE) != 0; }

  test::App m_app;
  SProgressStatusBar m_bar;
  Frame* m_frame = nullptr;
};

TEST_F(ProgressBars, WithoutCancel_TheProgressFillsTheMainPane) {
  EXPECT_FALSE(IsShown(Progress()));
  EXPECT_FALSE(IsShown(Button()));
  m_bar.EndProgress();
  m_bar.StartProgress(0);
  EXPECT_TRUE(m_bar.InProgress());
  EXPECT_EQ(test::PlaceOf(Progress()), Area());
  EXPECT_TRUE(IsShown(Progress()));
  EXPECT_FALSE(IsShown(Button()));
  Button().SendMessageW(BM_CLICK);
  EXPECT_EQ(Flags(), SProgressStatusBar::kInProgress) << "it cannot be cancelled";
  m_bar.EndProgress();
  EXPECT_FALSE(m_bar.InProgress());
  EXPECT_FALSE(IsShown(Progress()));
}

TEST_F(ProgressBars, WithCancel_TheButtonStandsInTheCorner) {
  m_bar.StartProgress(1);
  SString label;
  Button().GetWindowTextW(&label);
  EXPECT_EQ(label, WTEXT("Cancel"));
  const SRect button = test::PlaceOf(Button());
  SRect text;
  SClientDC dc(m_bar.m_hWnd);
  const SSelectObject font(dc, m_bar.GetFont());
  dc.DrawTextW(WTEXT("Cancel"), text, DT_CALCRECT | DT_SINGLELINE);
  EXPECT_EQ(button.Size(), text.Size() + SSize(20, 0));
  EXPECT_EQ(Button().GetStyle() & 0xF00, 0x300u);
  EXPECT_EQ(button.BottomRight(), Area().BottomRight());
  EXPECT_EQ(test::PlaceOf(Progress()), SRect(Area().left, Area().top, button.left, Area().bottom));
  EXPECT_TRUE(IsShown(Button()));

  m_frame->SetClientSize(600, 200);
  EXPECT_EQ(test::PlaceOf(Button()).BottomRight(), Area().BottomRight()) << "it follows the pane";
  EXPECT_EQ(test::PlaceOf(Button()).Size(), button.Size());
  m_bar.StartProgress(0);
  EXPECT_FALSE(IsShown(Button()));
  EXPECT_EQ(test::PlaceOf(Progress()), Area());
  m_bar.StartProgress(1);

  // A layout in front of the main pane moves it.
  m_bar.SetPaneStyle(0, kSPaneSplice);
  SStatusBarLayout layout;
  layout.InsertPane(0, 70, 0);
  layout.Attach(&m_bar);
  layout.Activate(1);
  m_bar.SendMessageW(WM_SIZE);
  EXPECT_EQ(test::PlaceOf(Progress()).left, Area().left);
  EXPECT_EQ(Area().left, test::PartRect(m_bar, 2).left + 2) << "by the control's index";
}

TEST_F(ProgressBars, WithoutAMainPane_TheClientAreaIsTaken) {
  m_bar.DeletePane(kSMainPane);
  m_bar.StartProgress(0);
  SRect client = m_bar.GetClientRect();
  client.Deflate(2, 0);
  EXPECT_EQ(test::PlaceOf(Progress()), client);
}

TEST_F(ProgressBars, Cancel_IsRequestedByMouseAndKeys) {
  m_frame->SetFocus();
  for (WPARAM key : {WPARAM{0}, WPARAM{VK_ESCAPE}, WPARAM{VK_RETURN}}) {
    Button().EnableWindow(0);
    Progress().EnableWindow(0);
    m_bar.StartProgress(1);
    EXPECT_TRUE(Button().IsWindowEnabled() && Progress().IsWindowEnabled());
    EXPECT_EQ(::GetFocus(), Button().m_hWnd);
    EXPECT_EQ(Flags() & SProgressStatusBar::kCancelRequested, 0u);
    if (key == 0) {
      Button().SendMessageW(BM_CLICK);
    } else {
      Button().SendMessageW(WM_KEYDOWN, key);
    }
    EXPECT_EQ(Flags(), 7u);
    m_bar.StartProgress(1);
    EXPECT_EQ(Flags(), 7u) << "a request stays until the end";
    m_bar.EndProgress();
    EXPECT_EQ(Flags(), 0u);
    EXPECT_EQ(::GetFocus(), m_frame->m_hWnd) << "the focus goes back";
  }
}

// The time limit of the test ends the wait when the click does not arrive.
TEST_F(ProgressBars, Cancel_IsRequestedByARealClick) {
  m_frame->ActivateFrame();
  m_bar.StartProgress(1);
  test::PumpAll();
  const SPoint at = Button().GetWindowRect().CenterPoint();
  ASSERT_TRUE(::SetCursorPos(at.x, at.y));
  INPUT click[2] = {};
  click[0].type = click[1].type = INPUT_MOUSE;
  click[0].mi.dwFlags = MOUSEEVENTF_LEFTDOWN;
  click[1].mi.dwFlags = MOUSEEVENTF_LEFTUP;
  ASSERT_EQ(::SendInput(2, click, sizeof(INPUT)), 2u);
  MSG message;
  while ((Flags() & SProgressStatusBar::kCancelRequested) == 0 && ::GetMessageW(&message, nullptr, 0, 0)) {
    ::DispatchMessageW(&message);
  }
  EXPECT_EQ(Flags(), 7u);
}

TEST_F(ProgressBars, Status_IsKeptAndBroughtBack) {
  m_bar.StartProgress(1);
  m_bar.GetProgressCtrl().SetRange(0, 10'000'000'000);
  m_bar.GetProgressCtrl().SetPos(5'000'000'000);
  SProgressStatusBar::Status outer, inner;
  inner.m_flags = SProgressStatusBar::kInProgress;
  m_bar.GetSetProgressStatus(&outer, &inner);
  EXPECT_EQ(m_bar.GetProgressCtrl().GetPercent(), 0);
  EXPECT_FALSE(IsShown(Button()));
  m_bar.GetSetProgressStatus(nullptr, &outer);
  EXPECT_EQ(m_bar.GetProgressCtrl().GetPercent(), 50);
  EXPECT_TRUE(IsShown(Button()));
}

TEST_F(ProgressBars, Cursor_IsAnArrowOverTheButtonOnly) {
  const HCURSOR wait = ::LoadCursorW(nullptr, IDC_WAIT);
  m_bar.StartProgress(1);
  ::SetCursor(wait);
  EXPECT_EQ(Button().SendMessageW(WM_SETCURSOR, reinterpret_cast<WPARAM>(Button().m_hWnd), HTCLIENT), 1);
  EXPECT_EQ(::GetCursor(), ::LoadCursorW(nullptr, IDC_ARROW));
  m_bar.EndProgress();
  EXPECT_EQ(::GetCursor(), wait);
  // What was shown before the progress began is not its affair.
  m_bar.StartProgress(0);
  ::SetCursor(::LoadCursorW(nullptr, IDC_CROSS));
  m_bar.EndProgress();
  EXPECT_EQ(::GetCursor(), ::LoadCursorW(nullptr, IDC_CROSS));
}

// Before the window is made, and after it went: what is kept is kept, and nobody loses the focus.
TEST_F(ProgressBars, WithoutAWindow_NothingIsShown) {
  m_frame->SetFocus();
  const SString text(WTEXT("early"));
  SProgressStatusBar bar;
  SStatusBarLayout layout;
  for (const bool isAfterwards : {false, true}) {
    if (isAfterwards) {
      ASSERT_TRUE(bar.Create(m_frame, 0, WS_CHILD, 9));
      bar.UpdatePaneStrings();
      EXPECT_EQ(test::PartText(bar, 0), WTEXT("early")) << "the panes came before the control";
      bar.DestroyWindow();
    }
    EXPECT_EQ(bar.InsertPane(0, 20, kSPaneMain | kSPaneAutoSize), 1);
    EXPECT_EQ(bar.SetMainPaneText(&text), 1);
    EXPECT_EQ(bar.GetPaneWidth(0), test::WidthOf(m_bar, text.View()));
    layout.InsertPane(0, 20, 0);
    layout.Attach(&bar);
    EXPECT_EQ(layout.Activate(1), 1);
    EXPECT_EQ(layout.SetPaneText(0, &text), 1);
    SRect rect;
    EXPECT_EQ(bar.GetPaneRect(0, &rect), 0);
    bar.StartProgress(1);
    EXPECT_TRUE(bar.InProgress());
    EXPECT_EQ(::GetFocus(), m_frame->m_hWnd);
    bar.EndProgress();
    EXPECT_FALSE(bar.InProgress());
    bar.UpdatePaneStrings();
    EXPECT_GT(bar.GetBarLayout(1, 1).cy, 0);
    layout.Detach();
  }
}

TEST(CustomProgress, Positions_OfTheWholeRangeOf64Bits) {
  using Limits = std::numeric_limits<std::int64_t>;
  SCustomProgressCtrl progress;
  EXPECT_EQ(progress.SetPos(40), 0);
  EXPECT_EQ(progress.SetPos(400), 40);
  EXPECT_EQ(progress.GetPos(), 100);
  EXPECT_EQ(progress.GetPercent(), 100);
  progress.SetRange(Limits::min(), Limits::max());
  EXPECT_EQ(progress.GetPercent(), 50);
  progress.SetPos(Limits::max() - 1);
  EXPECT_EQ(progress.GetPercent(), 99) << "100 means all";
  progress.SetPos(Limits::max());
  EXPECT_EQ(progress.GetPercent(), 100);
  progress.SetRange(5, 5);
  EXPECT_EQ(progress.GetPercent(), 0);
}

TEST_F(ProgressBars, Painting_FillsThePartThatIsDone) {
  m_bar.StartProgress(0);
  m_bar.GetProgressCtrl().SetPos(50);
  Progress().UpdateWindow();
  const SRect client = Progress().GetClientRect();
  SClientDC dc(Progress().m_hWnd);
  EXPECT_EQ(dc.GetPixel(SPoint(1, 1)), ::GetSysColor(COLOR_HIGHLIGHT));
  EXPECT_EQ(dc.GetPixel(SPoint(client.Width() / 2 - 1, client.Height() - 1)), ::GetSysColor(COLOR_HIGHLIGHT));
  EXPECT_EQ(dc.GetPixel(SPoint(client.Width() / 2 + 1, 0)), ::GetSysColor(COLOR_WINDOW));
}

// --- messages ---

class StatusTexts : public ProgressBars {
 protected:
  void SetUp() override {
    ProgressBars::SetUp();
    Ready(WTEXT("Ready"));
  }
  void Ready(LPCWSTR text) {
    const SString stored(text);
    m_bar.SetMainPaneText(&stored);
  }
  SString Shown() { return m_bar.GetPaneText(kSMainPane); }
};

TEST_F(StatusTexts, Message_StandsUntilTheEndOfItsBlock) {
  {
    SSetStatusBarText message(WTEXT("Reading"));
    EXPECT_EQ(Shown(), WTEXT("Reading"));
    EXPECT_EQ(m_app.GetWaitCount(), 1);
    SSetStatusBarText::Set(WTEXT("Reading, 2 of 3"));
    EXPECT_EQ(Shown(), WTEXT("Reading, 2 of 3"));
    {
      SSetStatusBarText inner(WTEXT("Sorting"));
      SSetStatusBarText::Set(WTEXT("Sorting, 1 of 9"));
      EXPECT_EQ(m_app.GetWaitCount(), 2);
    }
    EXPECT_EQ(Shown(), WTEXT("Reading, 2 of 3"));
    message.Reset();
    EXPECT_EQ(Shown(), WTEXT("Ready"));
    EXPECT_EQ(m_app.GetWaitCount(), 0);
    Ready(WTEXT("Done"));
  }
  EXPECT_EQ(Shown(), WTEXT("Done")) << "what was reset is not reset again";
}

TEST_F(StatusTexts, Messages_MayEndInAnyOrder) {
  auto first = std::make_unique<SSetStatusBarText>(WTEXT("first"));
  auto second = std::make_unique<SSetStatusBarText>(260, nullptr);
  EXPECT_EQ(Shown(), WTEXT("Cancel")) << "from the library's string table";
  first.reset();
  EXPECT_EQ(Shown(), WTEXT("Cancel"));
  second.reset();
  EXPECT_EQ(Shown(), WTEXT("Ready"));

  SSetStatusBarText quiet;
  EXPECT_EQ(Shown(), WTEXT("Ready"));
  quiet.Set(WTEXT("later"));
  EXPECT_EQ(Shown(), WTEXT("later"));
  quiet.Reset();
  EXPECT_EQ(Shown(), WTEXT("Ready"));
  m_frame->SendMessageW(kSMsgStatusText, reinterpret_cast<WPARAM>(WTEXT("plain")), 0);
  EXPECT_EQ(Shown(), WTEXT("plain"));
  m_frame->SendMessageW(kSMsgStatusText);
  EXPECT_EQ(Shown(), WTEXT("Ready"));
  m_frame->SendMessageW(kSMsgStatusText);
  EXPECT_EQ(Shown(), WTEXT("Ready")) << "there is nothing to take back";
}

TEST_F(StatusTexts, Windows_AreDisabledAsLongAsTheMessage) {
  {
    SSetStatusBarText message(WTEXT("busy"));
    message.DisableOwner();
    EXPECT_FALSE(m_frame->IsWindowEnabled());
    EXPECT_EQ(SModalState::State(), 1);
  }
  EXPECT_TRUE(m_frame->IsWindowEnabled());
  {
    SSetStatusBarText message(WTEXT("busy"));
    message.StartModal();
    EXPECT_EQ(SModalState::State(), 0);
  }
  EXPECT_EQ(SModalState::State(), 1);
  EXPECT_TRUE(m_frame->IsWindowEnabled());
  EXPECT_EQ(m_app.GetWaitCount(), 0);
}

// What the owner window gets: each text once, and the end once.
TEST_F(StatusTexts, Messages_AreSentToTheOwner) {
  std::vector<WideString> sent;
  test::Window owner([&sent](UINT message, WPARAM wParam, LPARAM, LRESULT*) {
    if (message != 0x047B) return 0;
    sent.push_back(wParam != 0 ? reinterpret_cast<LPCWSTR>(wParam) : WTEXT("-"));
    return 1;
  });
  ASSERT_TRUE(owner.Popup());
  m_app.m_mainWnd = &owner;
  {
    SSetStatusBarText message(WTEXT("one"));
    message.Reset();
  }
  EXPECT_EQ(sent, (std::vector<WideString>{WTEXT("one"), WTEXT("-")}));
  sent.clear();
  {
    const SSetStatusBarText quiet;
    EXPECT_TRUE(sent.empty());
    EXPECT_EQ(m_app.GetWaitCount(), 1);
  }
  EXPECT_EQ(sent, std::vector<WideString>{WTEXT("-")});
  m_app.m_mainWnd = m_frame;
  owner.DestroyWindow();
}

TEST(StatusTextsAlone, WithoutAnApplication_NothingHappens) {
  SSetStatusBarText message(WTEXT("nobody reads it"));
  message.DisableOwner();
  SSetStatusBarText::Set(nullptr);
}

}  // namespace
