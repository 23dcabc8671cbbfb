// Frames with views, menus and accelerators; controls; what is left when memory runs out.

#include "tests/support/failing_allocations.h"
#include "tests/ui/ui_fixture.h"

namespace {

class PlainView : public SView {
  QXCORE_DECLARE_CREATABLE_CLASS(PlainView)
 public:
  void OnDraw(SDC*) override { ++m_draws; }
  void OnActivateView(int activate, SView* active, SView* former) override {
    m_calls += activate ? 'a' : 'd';
    SView::OnActivateView(activate, active, former);
  }
  int m_draws = 0;
  std::string m_calls;
};
QXCORE_IMPLEMENT_CREATABLE_CLASS(PlainView, SView, 2)

// A frame with what real ones have around their view.
class BuildingFrame : public SDockSiteFrameWnd {
 public:
  int OnCreateClient(CREATESTRUCTW* create, SCreateContext* context) override {
    return SDockSiteFrameWnd::OnCreateClient(create, context) &&
           m_button.Create(WTEXT("Go"), WS_VISIBLE, SRect(0, 0, 40, 20), this, 11) &&
           m_edit.Create(WS_VISIBLE, SRect(0, 20, 40, 40), this, 12);
  }
  SButton m_button;
  SEdit m_edit;
};

SCreateContext Context() {
  SCreateContext context;
  context.m_viewClass = &PlainView::classPlainView;
  return context;
}

class Frames : public test::UiTest {
 protected:
  test::App m_app;
};

TEST_F(Frames, TheView_FillsWhatBarsLeave) {
  // A bar that takes ten pixels at the top.
  test::Window bar([&bar = bar](UINT message, WPARAM, LPARAM lParam, LRESULT*) {
    if (message != kSMsgSizeParent) return 0;
    auto* layout = reinterpret_cast<SSizeParent*>(lParam);
    layout->m_batch = ::DeferWindowPos(layout->m_batch, bar.m_hWnd, nullptr, 0, layout->m_rect.top,
                                       layout->m_rect.Width(), 10, SWP_NOZORDER | SWP_NOACTIVATE);
    layout->m_rect.top += 10;
    return 1;
  });
  SCreateContext context = Context();
  auto* frame = new SDockSiteFrameWnd;
  ASSERT_TRUE(
      frame->Create(nullptr, WTEXT("f"), WS_OVERLAPPEDWINDOW, SRect(10, 10, 410, 310), nullptr, nullptr, 0, &context));
  SView* view = frame->GetActiveView();
  ASSERT_NE(view, nullptr);
  EXPECT_EQ(view->GetDlgCtrlID(), static_cast<int>(kSFirstPane));
  EXPECT_EQ(view->GetWindowRect().Width(), frame->GetClientRect().Width());
  EXPECT_EQ(view->GetWindowRect().Height(), frame->GetClientRect().Height());
  ASSERT_TRUE(bar.Child(frame, 77));
  frame->MoveWindow(SRect(0, 0, 300, 200));
  const SRect client = frame->GetClientRect();
  EXPECT_EQ(view->GetClientRect().Height(), client.Height() - 10);
  EXPECT_EQ(view->GetClientRect().Width(), client.Width());
  EXPECT_EQ(bar.GetClientRect().Width(), client.Width());
  EXPECT_EQ(view->GetParentFrame(), frame);
  EXPECT_EQ(view->GetTopLevelFrame(), frame);
  EXPECT_EQ(view->GetTopLevelParent(), frame);
  frame->DestroyWindow();
}

TEST_F(Frames, ActiveView_FollowsTheFocus) {
  SCreateContext context = Context();
  auto* frame = new SFrameWnd;
  ASSERT_TRUE(
      frame->Create(nullptr, nullptr, WS_OVERLAPPEDWINDOW, SRect(0, 0, 200, 200), nullptr, nullptr, 0, &context));
  auto* first = static_cast<PlainView*>(frame->GetActiveView());
  auto* second = static_cast<PlainView*>(frame->CreateView(&context, 5));
  ASSERT_NE(second, nullptr);
  EXPECT_EQ(frame->GetActiveView(), first);
  frame->ActivateFrame();
  EXPECT_EQ(SWnd::GetFocus(), first) << "a frame hands the focus to its view";
  second->SetFocus();
  EXPECT_EQ(frame->GetActiveView(), second);
  EXPECT_EQ(first->m_calls, "d");
  EXPECT_EQ(second->m_calls, "a");
  frame->DestroyWindow();
}

TEST_F(Frames, Accelerators_BecomeCommands) {
  class Counting : public SFrameWnd {
   public:
    int OnCommand(WPARAM wParam, LPARAM lParam) override {
      m_commands.push_back(static_cast<DWORD>(wParam));
      return SFrameWnd::OnCommand(wParam, lParam);
    }
    std::vector<DWORD> m_commands;
  };
  SCreateContext context = Context();
  auto* frame = new Counting;
  ASSERT_TRUE(frame->Create(nullptr, nullptr, WS_OVERLAPPEDWINDOW | WS_VISIBLE, SRect(0, 0, 200, 200), nullptr, nullptr,
                            0, &context));
  EXPECT_FALSE(frame->LoadAccelTable(WTEXT("no such table")));
  ACCEL keys[] = {{FVIRTKEY, VK_F5, 0x8005}};
  frame->SetAccelTable(::CreateAcceleratorTableW(keys, 1));
  m_app.m_mainWnd = frame;
  MSG message = {};
  message.hwnd = frame->GetActiveView()->m_hWnd;
  message.message = WM_KEYDOWN;
  message.wParam = VK_F5;
  EXPECT_TRUE(m_app.PreTranslateMessage(&message));
  message.wParam = VK_F6;
  EXPECT_FALSE(m_app.PreTranslateMessage(&message));
  EXPECT_EQ(frame->m_commands, std::vector<DWORD>{MAKELONG(0x8005, 1)});
  m_app.m_mainWnd = nullptr;
  frame->DestroyWindow();
}

TEST_F(Frames, AFrameWithAMissingMenu_EndsAtOnce) {
  bool isGone = false;
  class Ending : public SFrameWnd {
   public:
    explicit Ending(bool* isGone) : m_isGone(isGone) {}
    ~Ending() override { *m_isGone = true; }
    bool* m_isGone;
  };
  EXPECT_FALSE(
      (new Ending(&isGone))
          ->Create(nullptr, nullptr, WS_OVERLAPPEDWINDOW, SFrameWnd::m_rcDefault, nullptr, WTEXT("no such menu")));
  EXPECT_TRUE(isGone);
}

TEST_F(Frames, WheelMessagesOfTheirOwn_ReachTheFocusWindow) {
  test::Window child;
  auto* frame = new SFrameWnd;
  ASSERT_TRUE(frame->Create(nullptr, nullptr, WS_OVERLAPPEDWINDOW | WS_VISIBLE, SRect(0, 0, 200, 200)));
  ASSERT_TRUE(child.Child(frame));
  WPARAM turned = 0;
  child.m_handler = [&](UINT message, WPARAM wParam, LPARAM, LRESULT*) {
    if (message == WM_MOUSEWHEEL) turned = wParam;
    return message == WM_MOUSEWHEEL;
  };
  child.SetFocus();
  frame->SendMessageW(::RegisterWindowMessageW(WTEXT("MSWHEEL_ROLLMSG")), static_cast<WPARAM>(-120), 0);
  EXPECT_EQ(static_cast<short>(HIWORD(turned)), -120);
  frame->DestroyWindow();
}

TEST_F(Frames, ScrollLimit_AllowsForThePage) {
  test::Window window;
  ASSERT_TRUE(window.Popup(WS_VSCROLL));
  SCROLLINFO info = {};
  info.fMask = SIF_ALL;
  info.nMin = 0, info.nMax = 99, info.nPage = 20;
  window.SetScrollInfo(SB_VERT, &info);
  EXPECT_EQ(window.GetScrollLimit(SB_VERT), 80);
  SCROLLINFO asked = {};
  EXPECT_TRUE(window.GetScrollInfo(SB_VERT, &asked));
  EXPECT_EQ(asked.nPage, 20u);
  window.SetScrollPos(SB_VERT, 95);
  EXPECT_EQ(window.GetScrollPos(SB_VERT), 80);
  window.DestroyWindow();
}

TEST_F(Frames, Controls_DoWhatTheirMessagesSay) {
  test::Window parent;
  ASSERT_TRUE(parent.Popup());
  SEdit edit;
  ASSERT_TRUE(edit.Create(0, SRect(0, 0, 100, 20), &parent, 1));
  edit.SetWindowTextW(WTEXT("one two"));
  edit.SetSel(4, 7);
  edit.ReplaceSel(WTEXT("three"));
  SString text;
  edit.GetWindowTextW(&text);
  EXPECT_EQ(text, SString(WTEXT("one three")));
  int start = 0, end = 0;
  edit.SetSel(0, -1);
  edit.GetSel(&start, &end);
  EXPECT_EQ(start, 0);
  EXPECT_EQ(end, 9);
  SButton button;
  ASSERT_TRUE(button.Create(WTEXT("b"), BS_AUTOCHECKBOX, SRect(0, 0, 9, 9), &parent, 2));
  button.SetCheck(1);
  EXPECT_EQ(button.GetCheck(), 1);
  SStatic label;
  ASSERT_TRUE(label.Create(WTEXT("label"), 0, SRect(0, 0, 9, 9), &parent));
  EXPECT_EQ(label.GetWindowTextLengthW(), 5);
  SProgressCtrl progress;
  ASSERT_TRUE(progress.Create(0, SRect(0, 0, 99, 9), &parent, 3));
  progress.SetRange(0, 50);
  progress.SetPos(20);
  EXPECT_EQ(progress.OffsetPos(5), 20);
  EXPECT_EQ(progress.GetPos(), 25);
  SScrollBar bar;
  ASSERT_TRUE(bar.Create(SBS_HORZ, SRect(0, 0, 99, 16), &parent, 4));
  bar.SetRange(0, 10);
  bar.SetPos(4);
  EXPECT_EQ(bar.GetPos(), 4);
  parent.DestroyWindow();
}

TEST_F(Frames, DummyWindow_IsMadeAnewAfterItsEnd) {
  SWnd* window = SDummyWindow();
  ASSERT_NE(window, nullptr);
  EXPECT_FALSE(window->IsWindowVisible());
  EXPECT_EQ(SDummyWindow(), window);
  window->DestroyWindow();
  EXPECT_NE(SDummyWindow()->m_hWnd, nullptr);
  window->DestroyWindow();
}

TEST_F(Frames, Measures_AreReadAgainWhenSettingsChange) {
  test::Window window;
  ASSERT_TRUE(window.Popup());
  const SUISysData* measures = SGetUISysData();
  EXPECT_EQ(measures->m_edgeWidth, ::GetSystemMetrics(SM_CXEDGE));
  EXPECT_GT(measures->m_dpi, 0);
  const int color = COLOR_BTNFACE;
  const COLORREF before = ::GetSysColor(color);
  const COLORREF other = RGB(1, 2, 3);
  ASSERT_TRUE(::SetSysColors(1, &color, &other));
  window.SendMessageW(WM_SYSCOLORCHANGE);
  EXPECT_EQ(measures->m_face, other);
  ::SetSysColors(1, &color, &before);
  window.SendMessageW(WM_SYSCOLORCHANGE);
  EXPECT_EQ(measures->m_face, before);
  window.DestroyWindow();
}

BOOL CALLBACK CountOne(HWND, LPARAM count) {
  ++*reinterpret_cast<int*>(count);
  return TRUE;
}

int CountWindows() {
  int count = 0;
  ::EnumThreadWindows(::GetCurrentThreadId(), &CountOne, reinterpret_cast<LPARAM>(&count));
  return count;
}

// With each allocation failing, there is a whole frame or none.
TEST_F(Frames, FailingAllocations_LeaveNoHalfFrame) {
  SWnd::FromHandle(::GetDesktopWindow());
  const int permanent = SWnd::HandleMap().GetPermanentCount();
  const int windows = CountWindows();
  const int failures = WithEachAllocationFailing(
      [&] {
        SCreateContext context = Context();
        auto* frame = new BuildingFrame;
        const int created = frame->Create(nullptr, WTEXT("f"), WS_OVERLAPPEDWINDOW | WS_VISIBLE, SRect(0, 0, 300, 200),
                                          nullptr, nullptr, 0, &context);
        if (created) frame->DestroyWindow();
        if (!created) throw SEOutOfMemory();
      },
      [&] {
        try {
          SWndThreadState::Get().ThrowException();
        } catch (const SEOutOfMemory&) {
        }
        EXPECT_EQ(SWnd::HandleMap().GetPermanentCount(), permanent);
        EXPECT_EQ(CountWindows(), windows);
        EXPECT_EQ(SWndThreadState::Get().m_creationHook, nullptr);
      });
  EXPECT_GT(failures, 3);
}

}  // namespace
