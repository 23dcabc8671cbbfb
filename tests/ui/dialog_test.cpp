// Dialog boxes: made from a template, modal and modeless, with exchange of data, in every mode.

#include "qxcore/core/throw_target.h"
#include "tests/ui/dialog_template.h"
#include "tests/ui/ui_fixture.h"

namespace {

constexpr WORD kName = 101, kCount = 102, kFlag = 103, kFirst = 104, kSecond = 105;

const test::DialogTemplate& Template() {
  static const test::DialogTemplate made = test::DialogTemplate(WTEXT("Size of the model"))
                                               .Edit(kName)
                                               .Edit(kCount)
                                               .Button(WTEXT("Flag"), BS_AUTOCHECKBOX, kFlag)
                                               .Button(WTEXT("First"), BS_AUTORADIOBUTTON | WS_GROUP, kFirst)
                                               .Button(WTEXT("Second"), BS_AUTORADIOBUTTON, kSecond)
                                               .Button(WTEXT("OK"), BS_DEFPUSHBUTTON | WS_GROUP, IDOK)
                                               .Button(WTEXT("Cancel"), BS_PUSHBUTTON, IDCANCEL);
  return made;
}

class Dialog : public SDlg {
 public:
  explicit Dialog(SWnd* parent = nullptr) : SDlg(nullptr, parent) { SetTemplate(Template().Data()); }
  void PreInitDialog() override { m_calls += "pre "; }
  int OnInitDialog() override {
    m_calls += "init ";
    const int result = SDlg::OnInitDialog();
    if (m_onInit) m_onInit();
    return result;
  }
  void OnOK() override {
    m_calls += "ok ";
    SDlg::OnOK();
  }
  void OnCancel() override {
    m_calls += "cancel ";
    SDlg::OnCancel();
  }
  void PostNcDestroy() override { ++m_ends; }
  int OnWndMsg(UINT message, WPARAM wParam, LPARAM lParam, LRESULT* result) override {
    if (m_onMessage) m_onMessage(message);
    return SDlg::OnWndMsg(message, wParam, lParam, result);
  }
  void DoDataExchange(SDataExchange* exchange) override {
    exchange->Text(kName, &m_name);
    exchange->MaxLength(m_name, 8);
    exchange->Number(kCount, &m_count);
    exchange->Range(m_count, 1, 99);
    exchange->Check(kFlag, &m_flag);
    exchange->Radio(kFirst, &m_choice);
  }
  SString TextOf(int id) {
    SString text;
    GetDlgItem(id)->GetWindowTextW(&text);
    return text;
  }
  std::function<void()> m_onInit;
  std::function<void(UINT)> m_onMessage;
  std::string m_calls;
  SString m_name = WTEXT("model");
  std::int32_t m_count = 7;
  int m_flag = 1;
  int m_choice = 1;
  int m_ends = 0;
};

class Dialogs : public test::OwnerTest {
 protected:
  // The dialogs are shown; what answers them stands in the queue.
  SetInteractiveMode m_shown{kInteractiveShow};
};

TEST_F(Dialogs, Modal_IsAnsweredByItsButtons) {
  Dialog dialog;
  dialog.m_onInit = [&] {
    EXPECT_FALSE(m_owner.IsWindowEnabled());
    EXPECT_EQ(dialog.TextOf(kName), SString(WTEXT("model")));
    EXPECT_EQ(dialog.TextOf(kCount), SString(WTEXT("7")));
    EXPECT_EQ(::SendMessageW(::GetDlgItem(dialog.m_hWnd, kFlag), BM_GETCHECK, 0, 0), BST_CHECKED);
    EXPECT_EQ(::SendMessageW(::GetDlgItem(dialog.m_hWnd, kSecond), BM_GETCHECK, 0, 0), BST_CHECKED);
    dialog.GetDlgItem(kName)->SetWindowTextW(WTEXT("other"));
    dialog.GetDlgItem(kCount)->SetWindowTextW(WTEXT(" 42 "));
    dialog.PostMessageW(WM_COMMAND, IDOK);
  };
  EXPECT_EQ(dialog.DoModal(), IDOK);
  EXPECT_EQ(dialog.m_calls, "pre init ok ");
  EXPECT_EQ(dialog.m_name, SString(WTEXT("other")));
  EXPECT_EQ(dialog.m_count, 42);
  EXPECT_EQ(dialog.m_ends, 1);
  EXPECT_TRUE(m_owner.IsWindowEnabled());
  EXPECT_EQ(::GetActiveWindow(), m_owner.m_hWnd) << "the owner is enabled before the box goes";
}

TEST_F(Dialogs, Modal_TakesTheKeyboard) {
  for (const auto& [key, result] : {std::pair{VK_RETURN, IDOK}, std::pair{VK_ESCAPE, IDCANCEL}}) {
    Dialog dialog;
    dialog.m_onInit = [&dialog, key = key] {
      ::PostMessageW(::GetDlgItem(dialog.m_hWnd, kName), WM_KEYDOWN, static_cast<WPARAM>(key), 1);
    };
    EXPECT_EQ(dialog.DoModal(), result);
  }
}

TEST_F(Dialogs, Modal_EndsWithItsWindowOrAQuit) {
  Dialog closed;
  closed.m_onInit = [&] { closed.PostMessageW(WM_CLOSE); };
  EXPECT_EQ(closed.DoModal(), IDCANCEL);

  Dialog destroyed;
  // The box ends while its loop waits.
  m_owner.m_handler = [&](UINT message, WPARAM, LPARAM, LRESULT*) -> int {
    if (message == WM_TIMER) ::DestroyWindow(destroyed.m_hWnd);
    return 0;
  };
  destroyed.m_onInit = [&] { ::PostMessageW(m_owner.m_hWnd, WM_TIMER, 1, 0); };
  EXPECT_EQ(destroyed.DoModal(), -1);
  EXPECT_EQ(destroyed.m_ends, 1);
  m_owner.m_handler = nullptr;

  Dialog quit;
  quit.m_onInit = [] { ::PostQuitMessage(4); };
  EXPECT_EQ(quit.DoModal(), -1);
  EXPECT_EQ(m_app.Run(), 4);
}

// A box whose answer is known before anybody sees it.
TEST_F(Dialogs, Modal_EndedByOnInitDialog_ReturnsTheResultUnshown) {
  Dialog dialog;
  dialog.m_onInit = [&] {
    dialog.EndDialog(37);
    EXPECT_NE(dialog.m_hWnd, nullptr) << "the box lives until its loop would have ended";
    dialog.EndDialog(38);
  };
  bool wasShown = false;
  dialog.m_onMessage = [&](UINT message) { wasShown = wasShown || message == WM_SHOWWINDOW; };
  EXPECT_EQ(dialog.DoModal(), 37);
  EXPECT_FALSE(wasShown);
  EXPECT_EQ(dialog.m_calls, "pre init ");
  EXPECT_EQ(dialog.m_ends, 1);
  EXPECT_TRUE(m_owner.IsWindowEnabled());

  dialog.m_onInit = [&] { dialog.DestroyWindow(); };
  EXPECT_EQ(dialog.DoModal(), -1);
  EXPECT_EQ(dialog.m_ends, 2);
}

TEST_F(Dialogs, Modeless_LivesUntilItIsAnswered) {
  Dialog dialog;
  ASSERT_TRUE(dialog.CreateDlgIndirect(Template().Data(), &m_owner));
  EXPECT_TRUE(m_owner.IsWindowEnabled());
  dialog.SendMessageW(WM_COMMAND, IDOK);
  EXPECT_EQ(dialog.m_hWnd, nullptr);
  EXPECT_EQ(dialog.m_ends, 1);
  EXPECT_FALSE(dialog.CreateDlgIndirect(nullptr));
  Dialog unknown;
  unknown.SetTemplate(nullptr);
  EXPECT_EQ(unknown.DoModal(), -1);
}

TEST_F(Dialogs, InvalidData_IsNamedAndKeepsTheBox) {
  SetInteractiveMode answer(kInteractiveAnswer);
  Dialog dialog;
  ASSERT_TRUE(dialog.CreateDlgIndirect(Template().Data(), &m_owner));
  struct Row {
    const WCHAR* name;
    const WCHAR* count;
    int valid;
  };
  const Row rows[] = {{WTEXT("good"), WTEXT("1"), 1},          {WTEXT("good"), WTEXT("0"), 0},
                      {WTEXT("good"), WTEXT("100"), 0},        {WTEXT("good"), WTEXT("ten"), 0},
                      {WTEXT("good"), WTEXT("1.5"), 0},        {WTEXT("good"), WTEXT(""), 0},
                      {WTEXT("good"), WTEXT("9999999999"), 0}, {WTEXT("much too long"), WTEXT("5"), 0},
                      {WTEXT("12345678"), WTEXT("99"), 1}};
  for (const Row& row : rows) {
    ::SendMessageW(::GetDlgItem(dialog.m_hWnd, kName), EM_LIMITTEXT, 100, 0);
    dialog.GetDlgItem(kName)->SetWindowTextW(row.name);
    dialog.GetDlgItem(kCount)->SetWindowTextW(row.count);
    EXPECT_EQ(dialog.UpdateData(1), row.valid) << SString(row.name).ToUtf8() << ' ' << SString(row.count).ToUtf8();
  }
  SetInteractiveMode abort(kInteractiveAbort);
  test::Reports reports;
  dialog.GetDlgItem(kCount)->SetWindowTextW(WTEXT("0"));
  EXPECT_THROW(dialog.UpdateData(1), STargetedException);
  ASSERT_EQ(reports.List().size(), 1u);
  EXPECT_NE(reports.List()[0].Find(WTEXT("between 1 and 99")), nullptr);
  dialog.DestroyWindow();
}

// A script's command opens a box in a handler, deep in nested messages: the abort reaches the script.
TEST_F(Dialogs, Unattended_AbortsAndReachesTheScript) {
  test::Reports reports;
  for (InteractiveMode mode : {kInteractiveAnswer, kInteractiveAbort}) {
    SetInteractiveMode unattended(mode);
    m_owner.m_handler = [](UINT message, WPARAM, LPARAM, LRESULT*) -> int {
      if (message == WM_COMMAND) {
        Dialog dialog;
        dialog.DoModal();
        ADD_FAILURE() << "the box was shown";
      }
      return 0;
    };
    test::Window script([this](UINT message, WPARAM, LPARAM, LRESULT*) -> int {
      if (message == WM_USER) m_owner.SendMessageW(WM_COMMAND, 0x8001);
      return 0;
    });
    ASSERT_TRUE(script.Popup());
    try {
      script.SendMessageW(WM_USER);
      ADD_FAILURE();
    } catch (const STargetedException& abort) {
      EXPECT_NE(abort.GetMessageText().Find(WTEXT("Aborting on \"Size of the model\" dialog")), nullptr);
    }
    script.DestroyWindow();
  }
  m_owner.m_handler = nullptr;
}

TEST_F(Dialogs, Exception_OfOnInitDialog_EndsTheBoxAndReachesTheCaller) {
  Dialog modal;
  modal.m_onInit = [] { throw STargetedException(WTEXT("Scripting"), WTEXT("refused")); };
  EXPECT_THROW(modal.DoModal(), STargetedException);
  EXPECT_EQ(modal.m_ends, 1);
  EXPECT_EQ(modal.m_hWnd, nullptr);
  EXPECT_TRUE(m_owner.IsWindowEnabled());
  EXPECT_THROW(modal.CreateDlgIndirect(Template().Data()), STargetedException);
  EXPECT_EQ(modal.m_hWnd, nullptr);
}

TEST_F(Dialogs, Exception_OfAButton_ReachesTheCaller) {
  class Throwing : public Dialog {
   public:
    void OnOK() override { throw std::runtime_error("button"); }
  } dialog;
  dialog.m_onInit = [&] { dialog.PostMessageW(WM_COMMAND, IDOK); };
  EXPECT_THROW(dialog.DoModal(), std::runtime_error);
  EXPECT_EQ(dialog.m_hWnd, nullptr);
  EXPECT_EQ(dialog.m_ends, 1);
  EXPECT_TRUE(m_owner.IsWindowEnabled());
}

TEST_F(Dialogs, Boxes_Nest) {
  Dialog outer, inner;
  outer.m_onInit = [&] {
    inner.m_onInit = [&] { inner.PostMessageW(WM_COMMAND, IDCANCEL); };
    EXPECT_EQ(inner.DoModal(), IDCANCEL);
    EXPECT_FALSE(m_owner.IsWindowEnabled());
    outer.PostMessageW(WM_COMMAND, IDOK);
  };
  EXPECT_EQ(outer.DoModal(), IDOK);
  EXPECT_TRUE(m_owner.IsWindowEnabled());
}

TEST_F(Dialogs, Hook_IsCalledBehindOnInitDialog) {
  static Dialog* g_dialog;
  Dialog dialog;
  g_dialog = &dialog;
  struct Hook {
    static INT_PTR CALLBACK Called(HWND window, UINT message, WPARAM, LPARAM) {
      EXPECT_EQ(window, g_dialog->m_hWnd);
      EXPECT_EQ(message, UINT{WM_INITDIALOG});
      g_dialog->m_calls += "hook ";
      return 0;
    }
  };
  SWndThreadState::Get().m_dialogHook = &Hook::Called;
  EXPECT_TRUE(dialog.CreateDlgIndirect(Template().Data(), &m_owner));
  SWndThreadState::Get().m_dialogHook = nullptr;
  EXPECT_EQ(dialog.m_calls, "pre init hook ");
  dialog.DestroyWindow();
}

}  // namespace
