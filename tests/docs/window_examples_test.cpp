// The examples of the window framework's headers, each in the setting that it speaks of.

#include "tests/layout/layout_fixture.h"
#include "tests/ui/dialog_template.h"

namespace {

class WindowExamples : public test::UiTest {
 protected:
  static SDockSiteFrameWnd* MakeFrame(SDockSiteFrameWnd* frame = new SDockSiteFrameWnd) {
    EXPECT_TRUE(frame->Create(nullptr, WTEXT("frame"), WS_OVERLAPPEDWINDOW | WS_VISIBLE, SRect(0, 0, 400, 300)));
    return frame;
  }
  test::App m_app;
};

TEST_F(WindowExamples, ModesAndStatesEndWithTheirBlock) {
  const SetInteractiveMode shown(kInteractiveShow);
  {
#include "ui_app_interaction_mode.inc"
    EXPECT_FALSE(SIsInteractive());
  }
  EXPECT_TRUE(SIsInteractive());
  {
#include "ui_app_modal_state.inc"
    EXPECT_EQ(SModalState::State(), 0);
  }
  EXPECT_EQ(SModalState::State(), 1);
}

TEST_F(WindowExamples, PanesAndMessagesOfAStatusBar) {
  class Frame : public SDockSiteFrameWnd{}* frame = new Frame;
  m_app.m_mainWnd = MakeFrame(frame);
  const SString text(WTEXT("Ready"));
  {
#include "ui_bar_status_bar.inc"
    EXPECT_EQ(bar.GetPaneText(kSMainPane), WTEXT("Ready"));
    {
#include "ui_bar_status_bar_text.inc"
    } EXPECT_EQ(bar.GetPaneText(kSMainPane), WTEXT("Ready"));
    m_app.m_mainWnd = nullptr;
    frame->DestroyWindow();
  }
}

TEST_F(WindowExamples, ProgressWithACancelButton) {
  SDockSiteFrameWnd* frame = MakeFrame();
  SProgressStatusBar bar;
  ASSERT_TRUE(bar.Create(frame));
  bar.InsertPane(0, 0, kSPaneMain | kSPaneStretch);
  {
#include "ui_bar_progress_status_bar.inc"
  } SProgressStatusBar::Status status;
  bar.GetSetProgressStatus(&status, nullptr);
  EXPECT_EQ(status.m_flags & SProgressStatusBar::kCancelRequested, 0u);
  frame->DestroyWindow();
}

constexpr WORD IDC_NAME = 101, IDC_COUNT = 102, IDC_FRAME = 103;

class SSizeDlg : public SDlg {
 public:
  void DoDataExchange(SDataExchange* exchange) override;
  // What a person would do.
  int OnInitDialog() override {
    const int result = SDlg::OnInitDialog();
    GetDlgItem(IDC_COUNT)->GetWindowTextW(&m_shown);
    GetDlgItem(IDC_COUNT)->SetWindowTextW(WTEXT("8"));
    PostMessageW(WM_COMMAND, IDOK);
    return result;
  }
  SString m_shown;
  SString m_name = WTEXT("wide");
  std::int32_t m_count = 7;
  int m_hasFrame = 1;
};
#include "ui_frame_data_exchange.inc"

TEST_F(WindowExamples, VariablesOfADialog) {
  const test::DialogTemplate shape = test::DialogTemplate(WTEXT("size"))
                                         .Edit(IDC_NAME)
                                         .Edit(IDC_COUNT, 40)
                                         .Button(WTEXT("f"), BS_AUTOCHECKBOX, IDC_FRAME);
  const SetInteractiveMode shown(kInteractiveShow);
  SSizeDlg dialog;
  dialog.SetTemplate(shape.Data());
  EXPECT_EQ(dialog.DoModal(), IDOK);
  EXPECT_EQ(dialog.m_shown, WTEXT("7"));
  EXPECT_EQ(dialog.m_count, 8);
}

constexpr UINT ID_CLEAR = 0x8001;
#include "ui_window_message_entries.inc"
int g_handled = 0;
int SNoteView::OnCreate(CREATESTRUCTW*) { return ++g_handled, 0; }
void SNoteView::OnLButtonDown(UINT, SPoint point) { g_handled += point.x; }
void SNoteView::OnClear() { g_handled += 100; }
void SNoteView::OnUpdateClear(SCmdUI* ui) { ui->Enable(0); }

class NoteView : public SNoteView {
 public:
  void OnDraw(SDC*) override {}
};

TEST_F(WindowExamples, EntriesOfAMessageMap) {
  SDockSiteFrameWnd* frame = MakeFrame();
  auto* view = new NoteView;
  ASSERT_TRUE(view->Create(nullptr, nullptr, WS_CHILD | WS_VISIBLE, SRect(0, 0, 50, 40), frame, 1));
  view->SendMessageW(WM_LBUTTONDOWN, MK_LBUTTON, MAKELPARAM(10, 0));
  view->SendMessageW(WM_COMMAND, ID_CLEAR);
  EXPECT_EQ(g_handled, 111);
  frame->DestroyWindow();
}

class STextView : public SView {
  QXCORE_DECLARE_CREATABLE_CLASS(STextView)
 public:
  void OnDraw(SDC*) override {}
};
QXCORE_IMPLEMENT_CREATABLE_CLASS(STextView, SView, 0)
class STreeView : public STextView {
  QXCORE_DECLARE_CREATABLE_CLASS(STreeView)
};
QXCORE_IMPLEMENT_CREATABLE_CLASS(STreeView, STextView, 0)

class SplitFrame : public SFrameWnd {
 public:
  int OnCreateClient(CREATESTRUCTW*, SCreateContext* context) override {
#include "ui_layout_splitter.inc"
    return 1;
  }
  SSplitterWnd m_splitter;
};

class TabFrame : public SFrameWnd {
 public:
  int OnCreateClient(CREATESTRUCTW*, SCreateContext* context) override {
#include "ui_layout_tab_window.inc"
    return 1;
  }
  STabWnd m_tabs;
};

TEST_F(WindowExamples, ClientsOfFrames) {
  auto* split = new SplitFrame;
  ASSERT_TRUE(split->Create(nullptr, WTEXT("split"), WS_POPUP | WS_VISIBLE, SRect(0, 0, 400, 300)));
  EXPECT_NE(split->m_splitter.GetPane(0, 1), nullptr);
  split->DestroyWindow();
  auto* tabs = new TabFrame;
  ASSERT_TRUE(tabs->Create(nullptr, WTEXT("tabs"), WS_POPUP | WS_VISIBLE, SRect(0, 0, 400, 300)));
  EXPECT_EQ(tabs->m_tabs.GetTabCount(), 1);
  tabs->DestroyWindow();
}

}  // namespace
