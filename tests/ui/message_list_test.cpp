// The messages that windows get, in their order, beside expected files that were made under Wine (./dev expected).
//
// Left out: messages about icons, input methods, palettes, themes and the desktop's own business, which differ from
// system to system, and those that only ask (text, hit tests, cursors).

#include <cstdlib>
#include <fstream>
#include <map>
#include <sstream>

#include "tests/support/display.h"
#include "tests/support/wine.h"
#include "tests/ui/dialog_template.h"
#include "tests/ui/ui_fixture.h"

namespace {

const std::map<UINT, const char*> kNames = {
#define NAME(message) \
  { message, #message }
    NAME(WM_ACTIVATE),     NAME(WM_ACTIVATEAPP),   NAME(WM_CANCELMODE),       NAME(WM_CAPTURECHANGED),
    NAME(WM_CLOSE),        NAME(WM_COMMAND),       NAME(WM_CREATE),           NAME(WM_DESTROY),
    NAME(WM_ENABLE),       NAME(WM_ENTERMENULOOP), NAME(WM_MENUSELECT),       NAME(WM_UNINITMENUPOPUP),
    NAME(WM_EXITMENULOOP), NAME(WM_ERASEBKGND),    NAME(WM_GETMINMAXINFO),    NAME(WM_INITDIALOG),
    NAME(WM_INITMENU),     NAME(WM_INITMENUPOPUP), NAME(WM_KILLFOCUS),        NAME(WM_MOVE),
    NAME(WM_NCACTIVATE),   NAME(WM_NCCALCSIZE),    NAME(WM_NCCREATE),         NAME(WM_NCDESTROY),
    NAME(WM_NCPAINT),      NAME(WM_PAINT),         NAME(WM_PARENTNOTIFY),     NAME(WM_SETFOCUS),
    NAME(WM_SHOWWINDOW),   NAME(WM_SIZE),          NAME(WM_STYLECHANGED),     NAME(WM_STYLECHANGING),
    NAME(WM_SYSCOMMAND),   NAME(WM_TIMER),         NAME(WM_WINDOWPOSCHANGED), NAME(WM_WINDOWPOSCHANGING),
    NAME(WM_SETREDRAW),    NAME(WM_HSCROLL),
#undef NAME
};

// Windows write into one list.
class MessageLists : public test::UiTest {
 protected:
  test::Window::Handler Recorder(const char* name, test::Window::Handler then = nullptr) {
    return [this, name, then](UINT message, WPARAM wParam, LPARAM lParam, LRESULT* result) {
      const auto found = kNames.find(message);
      if (m_isOn && found != kNames.end()) m_list += std::string(name) + " " + found->second + "\n";
      return then ? then(message, wParam, lParam, result) : 0;
    };
  }
  void Start() {
    test::PumpAll();
    m_list.clear();
    m_isOn = true;
  }
  void Step(const char* what) { m_list += std::string("-- ") + what + "\n"; }

  // Compares with the expected file, or writes it when the variable QXCORE_EXPECTED says so.
  void Check(const char* name) {
    m_isOn = false;
    const std::string path = std::string(QXCORE_SOURCE_DIR) + "/tests/ui/expected/" + name + ".txt";
    if (std::getenv("QXCORE_EXPECTED") != nullptr) {
      std::ofstream(path, std::ios::binary) << m_list;
      return;
    }
    std::ifstream file(path, std::ios::binary);
    std::stringstream expected;
    expected << file.rdbuf();
    EXPECT_EQ(m_list, expected.str()) << name;
  }

  test::App m_app;
  std::string m_list;
  bool m_isOn = false;
};

TEST_F(MessageLists, CreateAndDestroy_ATopLevelWindow) {
  test::Window window(Recorder("window"));
  Start();
  ASSERT_TRUE(window.CreateEx(0, nullptr, WTEXT("w"), WS_OVERLAPPEDWINDOW, 10, 10, 300, 200, nullptr, nullptr));
  Step("destroy");
  window.DestroyWindow();
  Check("top_level");
}

TEST_F(MessageLists, CreateShowAndDestroy_AVisibleChild) {
  test::Window parent(Recorder("parent"));
  test::Window child(Recorder("child"));
  ASSERT_TRUE(parent.Popup());
  Start();
  ASSERT_TRUE(child.Child(&parent));
  Step("hide");
  child.ShowWindow(SW_HIDE);
  Step("show");
  child.ShowWindow(SW_SHOW);
  Step("move");
  child.SetWindowPos(nullptr, 5, 6, 70, 30, SWP_NOZORDER | SWP_NOACTIVATE);
  Step("the same place");
  child.SetWindowPos(nullptr, 5, 6, 70, 30, SWP_NOZORDER | SWP_NOACTIVATE);
  Step("disable");
  child.EnableWindow(0);
  child.EnableWindow(1);
  Step("destroy the parent");
  parent.DestroyWindow();
  Check("child");
}

TEST_F(MessageLists, Destroy_InTheWindowsOwnHandler) {
  test::Window window;
  window.m_handler = Recorder("window", [&](UINT message, WPARAM, LPARAM, LRESULT*) {
    if (message != WM_TIMER) return 0;
    window.DestroyWindow();
    return 1;
  });
  ASSERT_TRUE(window.Popup());
  Start();
  window.SendMessageW(WM_TIMER);
  Check("destroyed_in_handler");
}

TEST_F(MessageLists, Focus_GoesFromOneChildToAnother) {
  test::Window parent(Recorder("parent"));
  test::Window first(Recorder("first")), second(Recorder("second"));
  ASSERT_TRUE(parent.Popup(WS_VISIBLE));
  ASSERT_TRUE(first.Child(&parent, 1));
  ASSERT_TRUE(second.Child(&parent, 2));
  first.SetFocus();
  Start();
  second.SetFocus();
  Step("destroy the focus window");
  second.DestroyWindow();
  parent.m_handler = first.m_handler = nullptr;
  Check("focus");
  parent.DestroyWindow();
}

TEST_F(MessageLists, Command_ComesFromAnAccelerator) {
  test::Window window(Recorder("window"));
  ASSERT_TRUE(
      window.CreateEx(0, nullptr, WTEXT("w"), WS_OVERLAPPEDWINDOW | WS_VISIBLE, 10, 10, 300, 200, nullptr, nullptr));
  ACCEL keys[] = {{FVIRTKEY, VK_F5, 0x8005}};
  const HACCEL table = ::CreateAcceleratorTableW(keys, 1);
  MSG message = {};
  message.hwnd = window.m_hWnd;
  message.message = WM_KEYDOWN;
  message.wParam = VK_F5;
  Start();
  EXPECT_TRUE(::TranslateAcceleratorW(window.m_hWnd, table, &message));
  Check("accelerator");
  ::DestroyAcceleratorTable(table);
  window.DestroyWindow();
}

// A class of the framework whose messages go into the list.
template <class Base>
class Listed : public Base {
 public:
  explicit Listed(test::Window::Handler handler) : m_handler(std::move(handler)) {}
  int OnWndMsg(UINT message, WPARAM wParam, LPARAM lParam, LRESULT* result) override {
    m_handler(message, wParam, lParam, result);
    return Base::OnWndMsg(message, wParam, lParam, result);
  }

 private:
  test::Window::Handler m_handler;
};

class PlainView : public SView {
  void OnDraw(SDC*) override {}
};

TEST_F(MessageLists, Command_ComesFromAMenu) {
  class View : public Listed<PlainView> {
   public:
    View(test::Window::Handler handler, std::string* list) : Listed(std::move(handler)), m_list(list) {}
    int OnCmdMsg(UINT id, int code, void*, S_CMDHANDLERINFO* info) override {
      if (info == nullptr) *m_list += code == kSMsgUpdate ? "view is asked for the state\n" : "view gets the command\n";
      return id == 0x8002 && (code != kSMsgUpdate);
    }
    std::string* m_list;
  };
  HWND window = nullptr;
  bool isOpening = false;
  // The keys come when the open menu waits for them.
  auto* frame = new Listed<SFrameWnd>(Recorder("frame", [&](UINT message, WPARAM, LPARAM, LRESULT*) {
    if (message == WM_INITMENUPOPUP) isOpening = true;
    if (message == WM_ENTERIDLE && std::exchange(isOpening, false)) {
      for (const WPARAM key : {VK_DOWN, VK_RETURN}) ::PostMessageW(window, WM_KEYDOWN, key, 1);
    }
    return 0;
  }));
  ASSERT_TRUE(frame->Create(nullptr, WTEXT("f"), WS_OVERLAPPEDWINDOW | WS_VISIBLE, SRect(10, 20, 310, 220)));
  auto* view = new View(Recorder("view"), &m_list);
  ASSERT_TRUE(view->Create(nullptr, nullptr, WS_VISIBLE, SRect(0, 0, 50, 50), frame, kSFirstPane));
  frame->SetActiveView(view);
  SMenu file, bar;
  file.CreatePopupMenu();
  file.AppendMenuW(MF_STRING, 0x8001, WTEXT("&Nothing"));
  file.AppendMenuW(MF_STRING, 0x8002, WTEXT("&Go"));
  bar.CreateMenu();
  bar.AppendMenuW(MF_POPUP, reinterpret_cast<UINT_PTR>(file.Detach()), WTEXT("&File"));
  frame->SetMenu(bar.Detach());
  test::HearTheDisplay();
  test::PumpAll();
  Start();
  window = frame->m_hWnd;
  frame->SendMessageW(WM_SYSCOMMAND, SC_KEYMENU, 'f');
  Step("the loop goes on");
  test::PumpAll();
  Check("menu_command");
  m_isOn = false;
  frame->DestroyWindow();
}

TEST_F(MessageLists, ModalDialog_OpensIsAnsweredAndCloses) {
  class Box : public Listed<SDlg> {
   public:
    Box(test::Window::Handler handler, std::string* list) : Listed(std::move(handler)), m_list(list) {}
    void PreInitDialog() override { *m_list += "PreInitDialog\n"; }
    int OnInitDialog() override {
      *m_list += "OnInitDialog\n";
      PostMessageW(WM_COMMAND, IDOK);
      return SDlg::OnInitDialog();
    }
    void OnOK() override {
      *m_list += "OnOK\n";
      SDlg::OnOK();
    }
    void PostNcDestroy() override { *m_list += "PostNcDestroy\n"; }
    std::string* m_list;
  };
  SetInteractiveMode shown(kInteractiveShow);
  test::Window owner(Recorder("owner"));
  ASSERT_TRUE(owner.Popup(WS_VISIBLE));
  m_app.m_mainWnd = &owner;
  const test::DialogTemplate made =
      test::DialogTemplate(WTEXT("box")).Button(WTEXT("OK"), BS_DEFPUSHBUTTON, IDOK).Edit(101);
  Box box(Recorder("box"), &m_list);
  box.SetTemplate(made.Data());
  Start();
  EXPECT_EQ(box.DoModal(), IDOK);
  Check("modal_dialog");
  m_isOn = false;
  m_app.m_mainWnd = nullptr;
  owner.m_handler = nullptr;
  owner.DestroyWindow();
}

TEST_F(MessageLists, Timer_IsDispatched) {
  test::Window window;
  int timers = 0;
  window.m_handler = Recorder("window", [&](UINT message, WPARAM id, LPARAM, LRESULT*) {
    if (message == WM_TIMER) timers += window.KillTimer(id);
    return message == WM_TIMER;
  });
  ASSERT_TRUE(window.Popup());
  Start();
  window.SetTimer(4, 10);
  while (timers == 0) m_app.PumpMessage();
  Check("timer");
  window.DestroyWindow();
}

}  // namespace
