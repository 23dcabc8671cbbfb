// Every way in which the library waits for an answer, in every interaction mode. Each test ends within the fixture's
// time limit, which fails it: a program that nobody watches never waits for a person.

#include "qxcore/core/throw_target.h"
#include "tests/ui/dialog_template.h"
#include "tests/ui/ui_fixture.h"

namespace {

// Answers the first box that becomes active, as a user would: posts a command to it.
class Answer {
 public:
  explicit Answer(int button) {
    g_button = button;
    m_hook = ::SetWindowsHookExW(WH_CBT, &Hook, nullptr, ::GetCurrentThreadId());
  }
  Answer(const Answer&) = delete;
  Answer& operator=(const Answer&) = delete;
  ~Answer() { ::UnhookWindowsHookEx(m_hook); }
  bool WasAsked() const { return g_button == 0; }

 private:
  static LRESULT CALLBACK Hook(int code, WPARAM wParam, LPARAM lParam) {
    WCHAR name[16] = {};
    const HWND window = reinterpret_cast<HWND>(wParam);
    if (code == HCBT_ACTIVATE && ::GetClassNameW(window, name, 16) && SStringView(name) == WTEXT("#32770") &&
        g_button) {
      ::PostMessageW(window, WM_COMMAND, static_cast<WPARAM>(std::exchange(g_button, 0)), 0);
    }
    return ::CallNextHookEx(nullptr, code, wParam, lParam);
  }
  static inline int g_button = 0;
  HHOOK m_hook;
};

class Unattended : public test::OwnerTest {
 protected:
  // What the call does in a mode: its result as a text, or "abort".
  template <class Call>
  std::string In(InteractiveMode mode, Call call) {
    SetInteractiveMode scope(mode);
    try {
      return std::to_string(call());
    } catch (const STargetedException& abort) {
      EXPECT_EQ(abort.GetTargets(), SString(WTEXT("Scripting,DlgAbort")));
      return "abort";
    }
  }
  test::Reports m_reports;
};

TEST_F(Unattended, MessageBoxes) {
  const auto library = [] { return SMessageBox(WTEXT("?"), MB_YESNOCANCEL | MB_DEFBUTTON2, WTEXT("box")); };
  const auto window = [this] { return m_owner.MessageBoxW(WTEXT("?"), WTEXT("box"), MB_YESNO); };
  EXPECT_EQ(In(kInteractiveAnswer, library), std::to_string(IDNO));
  EXPECT_EQ(In(kInteractiveAnswer, window), std::to_string(IDYES));
  EXPECT_EQ(In(kInteractiveAbort, library), "abort");
  EXPECT_EQ(In(kInteractiveAbort, window), "abort");
  for (int button : {IDYES, IDNO, IDCANCEL}) {
    Answer answer(button);
    EXPECT_EQ(In(kInteractiveShow, library), std::to_string(button));
    EXPECT_TRUE(answer.WasAsked());
  }
  Answer answer(IDNO);
  EXPECT_EQ(In(kInteractiveShow, window), std::to_string(IDNO));
  EXPECT_TRUE(m_owner.IsWindowEnabled());
}

// One line or many, short ones or such that must be broken: all of the text is to be seen.
TEST_F(Unattended, ABoxHasRoomForItsText) {
  const SetInteractiveMode mode(kInteractiveShow);
  SString wide, high, both;
  for (int i = 0; i < 120; ++i) wide += WTEXT("many words that follow ");
  for (int i = 0; i < 20; ++i) high += WTEXT("a line\n");
  for (int i = 0; i < 12; ++i) both += wide.Left(400) + WTEXT("\n");
  for (const SString& text : {SString(WTEXT("?")), wide, high, both}) {
    SRect place, needed;
    m_owner.m_handler = [&](UINT message, WPARAM, LPARAM, LRESULT*) {
      const HWND box = ::GetLastActivePopup(m_owner.m_hWnd);
      if (message != WM_TIMER || box == m_owner.m_hWnd) return 0;
      const SWnd* shown = SWnd::FromHandle(::GetDlgItem(box, 0xFFFF));
      place = shown->GetClientRect();
      needed = SRect(0, 0, place.right, 0);
      SClientDC dc(shown->m_hWnd);
      const SSelectObject font(dc, shown->GetFont() != nullptr ? shown->GetFont() : SGetDefaultUIFont());
      dc.DrawTextW(text, needed, DT_CALCRECT | DT_WORDBREAK | DT_NOPREFIX);
      ::PostMessageW(box, WM_COMMAND, IDOK, 0);
      return 1;
    };
    m_owner.SetTimer(1, 10);
    EXPECT_EQ(m_owner.MessageBoxW(text, WTEXT("box"), MB_OK), IDOK);
    m_owner.KillTimer(1);
    EXPECT_GT(place.right, 0);
    EXPECT_GE(place.right, needed.right) << testing::PrintToString(text);
    EXPECT_GE(place.bottom, needed.bottom) << testing::PrintToString(text);
  }
}

TEST_F(Unattended, ErrorReports) {
  const auto report = [] { return SShowError(WTEXT("broken: %s %n")), 0; };
  EXPECT_EQ(In(kInteractiveAnswer, report), "0");
  EXPECT_EQ(In(kInteractiveAbort, report), "0");
  Answer answer(IDOK);
  EXPECT_EQ(In(kInteractiveShow, report), "0");
  EXPECT_TRUE(answer.WasAsked());
}

TEST_F(Unattended, Dialogs) {
  const test::DialogTemplate made =
      test::DialogTemplate(WTEXT("question")).Edit(101).Button(WTEXT("OK"), BS_DEFPUSHBUTTON, IDOK);
  class Checking : public SDlg {
   public:
    void DoDataExchange(SDataExchange* exchange) override {
      exchange->Number(101, &m_number);
      exchange->Range(m_number, 5, 9);
    }
    int m_number = 1;
  };
  const auto modal = [&] {
    SDlg dialog;
    dialog.SetTemplate(made.Data());
    return dialog.DoModal();
  };
  EXPECT_EQ(In(kInteractiveAnswer, modal), "abort");
  EXPECT_EQ(In(kInteractiveAbort, modal), "abort");
  EXPECT_TRUE(m_owner.IsWindowEnabled());
  {
    Answer answer(IDOK);
    EXPECT_EQ(In(kInteractiveShow, modal), std::to_string(IDOK));
  }
  // What the exchange of data has to say comes in a box.
  Checking dialog;
  ASSERT_TRUE(dialog.CreateDlgIndirect(made.Data(), &m_owner));
  const auto exchange = [&] { return dialog.UpdateData(1); };
  EXPECT_EQ(In(kInteractiveAnswer, exchange), "0");
  EXPECT_EQ(In(kInteractiveAbort, exchange), "abort");
  Answer answer(IDOK);
  EXPECT_EQ(In(kInteractiveShow, exchange), "0");
  EXPECT_TRUE(answer.WasAsked());
  dialog.DestroyWindow();
}

TEST_F(Unattended, PopupMenus) {
  SMenu menu;
  menu.CreatePopupMenu();
  menu.AppendMenuW(MF_STRING, 0x8001, WTEXT("&First"));
  menu.AppendMenuW(MF_STRING, 0x8002, WTEXT("&Second"));
  int asked = 0;
  m_owner.m_handler = [&](UINT message, WPARAM, LPARAM, LRESULT*) {
    if (message != WM_INITMENUPOPUP) return 0;
    ++asked;
    for (const WPARAM key : {VK_DOWN, VK_DOWN, VK_RETURN}) m_owner.PostMessageW(WM_KEYDOWN, key, 1);
    return 1;  // the items stay as they are: nobody handles their commands here
  };
  const auto track = [&] { return menu.TrackPopupMenu(TPM_RETURNCMD, 50, 60, &m_owner); };
  EXPECT_EQ(In(kInteractiveAnswer, track), "0");
  EXPECT_EQ(In(kInteractiveAbort, track), "0");
  EXPECT_EQ(asked, 0);
  EXPECT_EQ(In(kInteractiveShow, track), std::to_string(0x8002));
  EXPECT_EQ(asked, 1);
}

// A modal loop waits for what its program has arranged, not for a person: it runs in each mode.
TEST_F(Unattended, ModalLoops) {
  m_owner.m_handler = [&](UINT message, WPARAM, LPARAM, LRESULT*) {
    if (message == WM_TIMER) m_owner.EndModalLoop(7);
    return message == WM_TIMER;
  };
  const auto run = [&] {
    m_owner.SetTimer(1, 10);
    const int result = m_owner.RunModalLoop();
    m_owner.KillTimer(1);
    return result;
  };
  for (InteractiveMode mode : {kInteractiveDefault, kInteractiveShow, kInteractiveAnswer, kInteractiveAbort}) {
    EXPECT_EQ(In(mode, run), "7");
  }
}

TEST_F(Unattended, Printing) {
  for (InteractiveMode mode : {kInteractiveShow, kInteractiveAnswer, kInteractiveAbort}) {
    EXPECT_EQ(In(mode, [&] { return m_app.DoPrintDialog(nullptr); }), std::to_string(IDCANCEL));
  }
}

}  // namespace
