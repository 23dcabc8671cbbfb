// Commands: routing, reflection, notifications, and the state of menu items.

#include "tests/ui/ui_fixture.h"

namespace {

using test::Window;

constexpr UINT kOpen = 0x8001, kPaste = 0x8002, kZoom1 = 0x8010, kZoom9 = 0x8018, kControl = 7;

// Notes what reached it.
struct Notes {
  std::string text;
  void operator()(const std::string& what) { text += (text.empty() ? "" : " ") + what; }
  std::string Take() { return std::exchange(text, {}); }
};
Notes g_notes;

class View : public SView {
  QXCORE_DECLARE_CREATABLE_CLASS(View)
 public:
  void OnDraw(SDC*) override {}
  void OnPaste() { g_notes("view:paste"); }
  void OnUpdatePaste(SCmdUI* ui) {
    g_notes("view:update");
    if (m_passesOn) {
      ui->ContinueRouting();
    } else {
      ui->Enable(1);
    }
  }
  static bool m_passesOn;
  QXCORE_DECLARE_MESSAGE_MAP()
};
bool View::m_passesOn = false;
QXCORE_IMPLEMENT_CREATABLE_CLASS(View, SView, 2)
QXCORE_IMPLEMENT_MESSAGE_MAP(View, SView, command<kPaste, &View::OnPaste>(), update<kPaste, &View::OnUpdatePaste>())

class Frame : public SDockSiteFrameWnd {
 public:
  void OnOpen() { g_notes("frame:open"); }
  void OnZoom(UINT id) { g_notes("frame:zoom" + std::to_string(id - kZoom1 + 1)); }
  void OnUpdatePaste(SCmdUI* ui) {
    g_notes("frame:update");
    ui->Enable(0);
    ui->SetCheck(1);
    ui->SetText(WTEXT("Paste twice"));
  }
  void OnUpdateZoom(SCmdUI* ui) { ui->SetRadio(ui->GetID() == kZoom1 + 2); }
  void OnNotified(NMHDR* header, LRESULT* result) {
    g_notes("frame:notify" + std::to_string(static_cast<int>(header->code)));
    *result = 77;
  }
  QXCORE_DECLARE_MESSAGE_MAP()
};
QXCORE_IMPLEMENT_MESSAGE_MAP(Frame, SDockSiteFrameWnd, command<kOpen, &Frame::OnOpen>(),
                             command_range<kZoom1, kZoom9, &Frame::OnZoom>(), update<kPaste, &Frame::OnUpdatePaste>(),
                             update_range<kZoom1, kZoom9, &Frame::OnUpdateZoom>(),
                             notify<kControl, -5, &Frame::OnNotified>())

class App : public test::App {
 public:
  void OnOpen() { g_notes("app:open"); }
  void OnHelp() { g_notes("app:help"); }
  QXCORE_DECLARE_MESSAGE_MAP()
};
QXCORE_IMPLEMENT_MESSAGE_MAP(App, SWinApp, command<kOpen, &App::OnOpen>(), command<0x8030, &App::OnHelp>())

class Control : public SWnd {
 public:
  void OnClicked() { g_notes("control:clicked"); }
  void OnOwnNotify(NMHDR*, LRESULT* result) {
    g_notes("control:notify");
    *result = 55;
  }
  void OnScroll(UINT code, UINT) { g_notes("control:scroll" + std::to_string(code)); }
  void DrawItem(DRAWITEMSTRUCT* item) { g_notes("control:draw" + std::to_string(item->itemID)); }
  void OnMeasure(MEASUREITEMSTRUCT* item) {
    g_notes("control:measure");
    item->itemHeight = 33;
  }
  QXCORE_DECLARE_MESSAGE_MAP()
};
QXCORE_IMPLEMENT_MESSAGE_MAP(Control, SWnd, reflected_command<0, &Control::OnClicked>(),
                             reflected_notify<-6, &Control::OnOwnNotify>(), reflected<WM_HSCROLL, &Control::OnScroll>(),
                             reflected<WM_DRAWITEM, &Control::DrawItem>(),
                             reflected<WM_MEASUREITEM, &Control::OnMeasure>())

class Document : public SCmdTarget {
 public:
  void OnOpen() { g_notes("document:open"); }
  void OnPaste() { g_notes("document:paste"); }
  QXCORE_DECLARE_MESSAGE_MAP()
};
QXCORE_IMPLEMENT_MESSAGE_MAP(Document, SCmdTarget, command<kOpen, &Document::OnOpen>(),
                             command<kPaste, &Document::OnPaste>())

class Commands : public test::UiTest {
 protected:
  void SetUp() override {
    test::UiTest::SetUp();
    View::m_passesOn = false;
    SCreateContext context;
    context.m_viewClass = &View::classView;
    m_frame = new Frame;
    ASSERT_TRUE(m_frame->Create(nullptr, WTEXT("frame"), WS_OVERLAPPEDWINDOW, SRect(0, 0, 400, 300), nullptr, nullptr,
                                0, &context));
    m_app.m_mainWnd = m_frame;
    g_notes.Take();
  }
  void TearDown() override {
    m_app.m_mainWnd = nullptr;
    if (m_frame != nullptr) m_frame->DestroyWindow();
    test::UiTest::TearDown();
  }
  App m_app;
  Frame* m_frame = nullptr;
};

TEST_F(Commands, Routing_GoesFromViewToFrameToApplication) {
  EXPECT_EQ(m_frame->SendMessageW(WM_COMMAND, kPaste), 1);
  EXPECT_EQ(m_frame->SendMessageW(WM_COMMAND, kOpen), 1);
  EXPECT_EQ(m_frame->SendMessageW(WM_COMMAND, 0x8030), 1);
  EXPECT_EQ(m_frame->SendMessageW(WM_COMMAND, kZoom1 + 4), 1);
  EXPECT_EQ(g_notes.Take(), "view:paste frame:open app:help frame:zoom5");
  EXPECT_EQ(m_frame->SendMessageW(WM_COMMAND, 0x8031), 0);
  EXPECT_EQ(m_frame->SendMessageW(WM_COMMAND, 0), 0);
  EXPECT_EQ(m_frame->SendMessageW(WM_COMMAND, MAKEWPARAM(kPaste, 1)), 1) << "an accelerator routes as its menu item";
  EXPECT_EQ(g_notes.Take(), "view:paste");
  m_frame->SetActiveView(nullptr);
  EXPECT_EQ(m_frame->SendMessageW(WM_COMMAND, kPaste), 0);
  EXPECT_EQ(g_notes.Take(), "");
}

TEST_F(Commands, AskingForAHandler_CallsNothing) {
  S_CMDHANDLERINFO info = {};
  EXPECT_EQ(m_frame->OnCmdMsg(kPaste, 0, nullptr, &info), 1);
  EXPECT_EQ(info.m_target, m_frame->GetActiveView());
  EXPECT_NE(info.m_handler, nullptr);
  EXPECT_EQ(m_frame->OnCmdMsg(0x8031, 0, nullptr, &info), 0);
  EXPECT_EQ(g_notes.Take(), "");
}

// What a view shows handles commands behind the view and before the frame.
TEST_F(Commands, Routing_GoesFromTheViewToItsDocument) {
  Document document;
  m_frame->GetActiveView()->DestroyWindow();
  SCreateContext context;
  context.m_viewClass = &View::classView;
  context.m_document = &document;
  SView* view = SObjectCast<SView>(m_frame->CreateView(&context), &SView::classSView);
  EXPECT_EQ(m_frame->GetActiveView(), view);
  EXPECT_EQ(view->GetDocument(), &document);
  m_frame->SendMessageW(WM_COMMAND, kPaste);
  m_frame->SendMessageW(WM_COMMAND, kOpen);
  view->SetDocument(nullptr);
  m_frame->SendMessageW(WM_COMMAND, kOpen);
  EXPECT_EQ(g_notes.Take(), "view:paste document:open frame:open");
}

TEST_F(Commands, ADestroyedActiveView_IsForgotten) {
  m_frame->GetActiveView()->DestroyWindow();
  EXPECT_EQ(m_frame->GetActiveView(), nullptr);
  EXPECT_EQ(m_frame->SendMessageW(WM_COMMAND, kPaste), 0);
}

TEST_F(Commands, Controls_AreOfferedTheirOwnNotificationsFirst) {
  Control control;
  ASSERT_TRUE(control.Create(nullptr, nullptr, 0, SRect(0, 0, 5, 5), m_frame, kControl));
  const LPARAM handle = reinterpret_cast<LPARAM>(control.m_hWnd);
  EXPECT_EQ(m_frame->SendMessageW(WM_COMMAND, MAKEWPARAM(kOpen, 0), handle), 1);
  EXPECT_EQ(g_notes.Take(), "control:clicked");
  EXPECT_EQ(m_frame->SendMessageW(WM_COMMAND, MAKEWPARAM(kPaste, 9), handle), 0) << "a code that nobody handles";

  NMHDR header = {control.m_hWnd, kControl, static_cast<UINT>(-6)};
  EXPECT_EQ(m_frame->SendMessageW(WM_NOTIFY, kControl, reinterpret_cast<LPARAM>(&header)), 55);
  header.code = static_cast<UINT>(-5);
  EXPECT_EQ(m_frame->SendMessageW(WM_NOTIFY, kControl, reinterpret_cast<LPARAM>(&header)), 77);
  EXPECT_EQ(g_notes.Take(), "control:notify frame:notify-5");

  Window parent;
  ASSERT_TRUE(parent.Popup());
  Control child;
  ASSERT_TRUE(child.Create(nullptr, nullptr, 0, SRect(0, 0, 5, 5), &parent, kControl));
  parent.SendMessageW(WM_HSCROLL, SB_PAGEDOWN, reinterpret_cast<LPARAM>(child.m_hWnd));
  DRAWITEMSTRUCT draw = {};
  draw.CtlType = ODT_BUTTON;
  draw.hwndItem = child.m_hWnd;
  draw.itemID = 4;
  EXPECT_EQ(parent.SendMessageW(WM_DRAWITEM, kControl, reinterpret_cast<LPARAM>(&draw)), 1);
  draw.CtlType = ODT_MENU;
  parent.SendMessageW(WM_DRAWITEM, 0, reinterpret_cast<LPARAM>(&draw));
  MEASUREITEMSTRUCT measure = {};
  measure.CtlType = ODT_BUTTON;
  measure.CtlID = kControl;
  parent.SendMessageW(WM_MEASUREITEM, kControl, reinterpret_cast<LPARAM>(&measure));
  EXPECT_EQ(measure.itemHeight, 33u);
  EXPECT_EQ(g_notes.Take(), "control:scroll3 control:draw4 control:measure");
  LRESULT result = 0;
  EXPECT_EQ(child.ReflectChildNotify(WM_CTLCOLORBTN, 0, 0, &result), 0);
  parent.DestroyWindow();
  control.DestroyWindow();
}

TEST_F(Commands, MenuItems_TakeTheirStateFromTheRouting) {
  SMenu menu;
  ASSERT_TRUE(menu.CreatePopupMenu());
  menu.AppendMenuW(MF_STRING, kPaste, WTEXT("Paste"));
  menu.AppendMenuW(MF_SEPARATOR);
  menu.AppendMenuW(MF_STRING, kOpen, WTEXT("Open"));
  menu.AppendMenuW(MF_STRING, 0x8031, WTEXT("Nobody's"));
  menu.AppendMenuW(MF_STRING, kZoom1 + 1, WTEXT("2"));
  menu.AppendMenuW(MF_STRING, kZoom1 + 2, WTEXT("3"));
  const auto show = [&] { m_frame->SendMessageW(WM_INITMENUPOPUP, reinterpret_cast<WPARAM>(menu.m_hMenu), 0); };
  const auto stateOf = [&](UINT item) {
    return menu.GetMenuState(item, MF_BYPOSITION) & (MF_GRAYED | MF_DISABLED | MF_CHECKED);
  };
  menu.EnableMenuItem(2, MF_BYPOSITION | MF_GRAYED);
  show();
  EXPECT_EQ(g_notes.Take(), "view:update");
  EXPECT_EQ(stateOf(0), 0u);
  EXPECT_EQ(stateOf(2), 0u) << "a command with a handler is enabled";
  EXPECT_EQ(stateOf(3), UINT{MF_GRAYED | MF_DISABLED}) << "one without is not";
  EXPECT_EQ(stateOf(4), 0u);
  EXPECT_EQ(stateOf(5), UINT{MF_CHECKED});
  EXPECT_EQ(menu.GetMenuStringW(0, MF_BYPOSITION), SString(WTEXT("Paste")));

  View::m_passesOn = true;
  show();
  EXPECT_EQ(g_notes.Take(), "view:update frame:update");
  EXPECT_EQ(stateOf(0), UINT{MF_GRAYED | MF_DISABLED | MF_CHECKED});
  EXPECT_EQ(menu.GetMenuStringW(0, MF_BYPOSITION), SString(WTEXT("Paste twice")));
}

TEST_F(Commands, SystemMenuItems_AreFoundByTheirCommand) {
  SSysCmdUI ui;
  ui.m_id = SC_MAXIMIZE;
  ui.m_sender = m_frame;
  const HMENU menu = ::GetSystemMenu(m_frame->m_hWnd, FALSE);
  const auto state = [&] { return ::GetMenuState(menu, SC_MAXIMIZE, MF_BYCOMMAND); };
  ui.Enable(0);
  EXPECT_NE(state() & MF_GRAYED, 0u);
  ui.Enable(1);
  EXPECT_EQ(state() & MF_GRAYED, 0u);
  ui.SetCheck(1);
  EXPECT_NE(state() & MF_CHECKED, 0u);
  ui.SetCheck(0);
  EXPECT_EQ(state() & MF_CHECKED, 0u);
}

TEST_F(Commands, CommandUiOfAWindow_SetsTheWindow) {
  SButton button;
  ASSERT_TRUE(button.Create(WTEXT("a"), WS_CHILD | BS_CHECKBOX, SRect(0, 0, 50, 20), m_frame, kPaste));
  SCmdUI ui;
  ui.m_id = kPaste;
  ui.m_sender = &button;
  View::m_passesOn = true;
  EXPECT_TRUE(ui.DoUpdate(m_frame, 1));
  EXPECT_FALSE(button.IsWindowEnabled());
  EXPECT_EQ(button.GetCheck(), 1);
  SString text;
  button.GetWindowTextW(&text);
  EXPECT_EQ(text, SString(WTEXT("Paste twice")));
  button.DestroyWindow();
}

TEST_F(Commands, AClosedFrame_EndsTheProgramAndDeletesItself) {
  m_frame->PostMessageW(WM_CLOSE);
  EXPECT_EQ(m_app.Run(), 0);
  m_frame = nullptr;
  EXPECT_EQ(m_app.m_mainWnd, nullptr);
}

}  // namespace
