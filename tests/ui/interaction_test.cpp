// Interaction modes, modal states, wait cursors and redraw locks.

#include "qxcore/core/throw_target.h"
#include "qxcore/platform/ole.h"
#include "tests/support/failing_allocations.h"
#include "tests/ui/ui_fixture.h"

namespace {

using test::Window;

class Interaction : public test::UiTest {};

TEST_F(Interaction, Modes_AreRestoredByScope) {
  EXPECT_EQ(g_GetInteractionMode(), kInteractiveAbort);
  {
    SetInteractiveMode outer(kInteractiveAnswer);
    {
      SetInteractiveMode inner;
      inner.Set(kInteractiveDefault);
      EXPECT_EQ(SInteractionModeInForce(), kInteractiveShow);
      SetDeftInteractiveMode deft(kInteractiveAbort);
      EXPECT_EQ(g_GetDeftInteractionMode(), kInteractiveAbort);
      EXPECT_EQ(SInteractionModeInForce(), kInteractiveAbort);
      EXPECT_FALSE(SIsInteractive());
    }
    EXPECT_EQ(g_GetDeftInteractionMode(), kInteractiveShow);
    EXPECT_EQ(g_GetInteractionMode(), kInteractiveAnswer);
  }
  EXPECT_EQ(g_GetInteractionMode(), kInteractiveAbort);
}

TEST_F(Interaction, MessageBoxes_AreAnsweredWithTheirDefaultButton) {
  SetInteractiveMode answer(kInteractiveAnswer);
  struct Row {
    UINT type;
    int answers[4];
  };
  const Row rows[] = {
      {MB_OK, {IDOK, IDOK, IDOK, IDOK}},
      {MB_OKCANCEL, {IDOK, IDCANCEL, IDOK, IDOK}},
      {MB_ABORTRETRYIGNORE, {IDABORT, IDRETRY, IDIGNORE, IDABORT}},
      {MB_YESNOCANCEL, {IDYES, IDNO, IDCANCEL, IDYES}},
      {MB_YESNO, {IDYES, IDNO, IDYES, IDYES}},
      {MB_RETRYCANCEL, {IDRETRY, IDCANCEL, IDRETRY, IDRETRY}},
      {6, {IDCANCEL, IDCANCEL, IDCANCEL, IDCANCEL}},
      {9, {IDOK, IDOK, IDOK, IDOK}},
  };
  for (const Row& row : rows) {
    for (UINT button = 0; button < 4; ++button) {
      EXPECT_EQ(SMessageBox(WTEXT("?"), row.type | button << 8 | MB_ICONQUESTION), row.answers[button])
          << row.type << ' ' << button;
    }
  }
  EXPECT_EQ(SButtonSetLabel(MB_YESNOCANCEL | MB_ICONERROR), SString(WTEXT("Yes / No / Cancel")));
  EXPECT_EQ(SButtonSetLabel(6), SString());
}

SString AbortTextOf(const std::function<void()>& action) {
  try {
    action();
  } catch (const STargetedException& abort) {
    EXPECT_EQ(abort.GetTargets(), SString(WTEXT("Scripting,DlgAbort")));
    EXPECT_EQ(abort.GetValue(), 0);
    return abort.GetMessageText();
  }
  return WTEXT("nothing was thrown");
}

TEST_F(Interaction, Aborts_NameTheBoxAndQuoteIt) {
  test::Reports reports;
  const SString expected = WTEXT(
      "Aborting on \"Save 100% %s\" dialog:\n\n > Line one\n > line two\n > line three\n > Yes / No\n > \n"
      "\nEither find a way to avoid dialog or switch to another interactive mode.");
  EXPECT_EQ(
      AbortTextOf([] { SMessageBox(WTEXT("Line one\r\nline two\nline three"), MB_YESNO, WTEXT("Save 100% %s")); }),
      expected);
  EXPECT_EQ(reports.List(), std::vector<SString>{expected}) << "the text is never a format";
  const SString without = WTEXT(
      "Aborting on \"t\" dialog\n"
      "Either find a way to avoid dialog or switch to another interactive mode.");
  EXPECT_EQ(AbortTextOf([] { g_ThrowAbortOnDlg(WTEXT("t"), WTEXT("")); }), without);
  EXPECT_EQ(AbortTextOf([] { SMessageBox(WTEXT(""), MB_OK, WTEXT("t")); }), without);
  EXPECT_EQ(AbortTextOf([] { g_ThrowAbort(WTEXT("plain")); }), SString(WTEXT("plain")));
}

// --- modal states ---

class ModalStates : public test::UiTest {
 protected:
  void SetUp() override {
    test::UiTest::SetUp();
    for (Window* window : {&m_owner, &m_second, &m_disabled}) ASSERT_TRUE(window->Popup());
    m_disabled.EnableWindow(0);
    m_app.m_mainWnd = &m_owner;
  }
  void TearDown() override {
    m_app.m_mainWnd = nullptr;
    for (Window* window : {&m_owner, &m_second, &m_disabled}) window->DestroyWindow();
    test::UiTest::TearDown();
  }
  std::string Enabled() {
    std::string text;
    for (Window* window : {&m_owner, &m_second, &m_disabled}) text += window->IsWindowEnabled() ? '1' : '0';
    return text;
  }
  test::App m_app;
  Window m_owner, m_second, m_disabled;
};

TEST_F(ModalStates, Start_DisablesAndStopEnablesAgain) {
  SModalState modal(1);
  EXPECT_TRUE(modal.IsActive());
  EXPECT_EQ(SModalState::State(), 0);
  EXPECT_EQ(Enabled(), "000");
  modal.Start(1);
  modal.Stop();
  EXPECT_FALSE(modal.IsActive());
  EXPECT_EQ(SModalState::State(), 1);
  EXPECT_EQ(Enabled(), "110") << "what was disabled before stays so";
  modal.Start(0);
  EXPECT_TRUE(modal.IsActive());
  EXPECT_EQ(SModalState::State(), 1);
  EXPECT_EQ(Enabled(), "110");
  modal.Start(1);
  EXPECT_EQ(Enabled(), "000") << "another choice starts it again";
  modal.Start(0, 0, 0, 0);
  EXPECT_EQ(Enabled(), "110");
  modal.Stop();
  modal.Start(1, 0, 1);
  EXPECT_EQ(Enabled(), "010") << "the owner alone";
}

// What a program does while its windows are disabled finds the state in force already.
TEST_F(ModalStates, Handlers_OfTheDisabling_FindTheApplicationDisabled) {
  std::string states;
  m_owner.m_handler = [&](UINT message, WPARAM, LPARAM, LRESULT*) {
    if (message == WM_ENABLE) states += SModalState::State() ? '1' : '0';
    return 0;
  };
  {
    SModalState modal(1);
    EXPECT_EQ(states, "0");
  }
  EXPECT_EQ(states, "01");
  m_owner.m_handler = nullptr;
}

TEST_F(ModalStates, StopOutOfOrder_KeepsTheWindowsForTheStatesThatRemain) {
  SModalState outer(1), middle(1), inner(1);
  outer.Stop();
  EXPECT_EQ(Enabled(), "000");
  inner.Stop();
  EXPECT_EQ(Enabled(), "000");
  middle.Stop();
  EXPECT_EQ(Enabled(), "110");
}

TEST_F(ModalStates, WindowsThatEndMeanwhile_ArePassedOver) {
  SModalState modal(1);
  m_second.DestroyWindow();
  modal.Stop();
  EXPECT_TRUE(m_owner.IsWindowEnabled());
}

TEST_F(ModalStates, AnObject_MayKeepItsWindowEnabled) {
  class Keeping : public Window {
   public:
    int OnModalDisable(int disable) override {
      m_calls += disable ? 'd' : 'e';
      return m_agrees;
    }
    std::string m_calls;
    int m_agrees = 0;
  } window;
  ASSERT_TRUE(window.Popup());
  {
    SModalState modal(1);
    EXPECT_TRUE(window.IsWindowEnabled());
  }
  window.m_agrees = 1;
  { SModalState modal(1); }
  EXPECT_EQ(window.m_calls, "dde");
  window.DestroyWindow();
}

// The system's interfaces have no virtual destructor.
#pragma GCC diagnostic push
#pragma GCC diagnostic ignored "-Wnon-virtual-dtor"
struct Frame final : IOleInPlaceFrame {
  HRESULT WINAPI QueryInterface(const GUID&, void**) override { return E_NOINTERFACE; }
  ULONG WINAPI AddRef() override { return 2; }
  ULONG WINAPI Release() override { return 1; }
  HRESULT WINAPI GetWindow(HWND*) override { return E_FAIL; }
  HRESULT WINAPI ContextSensitiveHelp(BOOL) override { return S_OK; }
  HRESULT WINAPI GetBorder(RECT*) override { return E_FAIL; }
  HRESULT WINAPI RequestBorderSpace(const RECT*) override { return E_FAIL; }
  HRESULT WINAPI SetBorderSpace(const RECT*) override { return E_FAIL; }
  HRESULT WINAPI SetActiveObject(IOleInPlaceActiveObject*, LPCWSTR) override { return S_OK; }
  HRESULT WINAPI InsertMenus(HMENU, OLEMENUGROUPWIDTHS*) override { return E_FAIL; }
  HRESULT WINAPI SetMenu(HMENU, HGLOBAL, HWND) override { return E_FAIL; }
  HRESULT WINAPI RemoveMenus(HMENU) override { return E_FAIL; }
  HRESULT WINAPI SetStatusText(LPCWSTR) override { return S_OK; }
  HRESULT WINAPI EnableModeless(BOOL enable) override {
    calls += enable ? 'e' : 'd';
    return S_OK;
  }
  HRESULT WINAPI TranslateAccelerator(MSG*, WORD) override { return S_FALSE; }
  std::string calls;
};
#pragma GCC diagnostic pop

// Asked before the program has any window object: there is nothing to disable.
const int g_enabledAtStart = SModalState::Enable(0, nullptr);

TEST_F(ModalStates, InPlaceFrames_AreDisabledWithTheApplication) {
  EXPECT_EQ(g_enabledAtStart, 1);
  Frame frame, asking;
  EXPECT_TRUE(SModalState::Register(&frame));
  EXPECT_TRUE(SModalState::Register(&asking));
  { SModalState modal(1); }
  EXPECT_EQ(frame.calls, "de");
  {
    SModalState modal;
    modal.Start(1, 0, 0, 1);
  }
  EXPECT_EQ(frame.calls, "de");
  EXPECT_EQ(SModalState::Enable(0, &asking), 0);
  EXPECT_EQ(Enabled(), "000");
  EXPECT_EQ(frame.calls, "ded");
  EXPECT_EQ(asking.calls, "de") << "it was told of the first state, not of its own";
  EXPECT_EQ(SModalState::Enable(0, &asking), 0) << "no window has come: nothing is done";
  EXPECT_EQ(frame.calls, "ded");
  Window late;
  ASSERT_TRUE(late.Popup());
  EXPECT_TRUE(late.IsWindowEnabled());
  EXPECT_EQ(SModalState::Enable(0, &asking), 0);
  EXPECT_FALSE(late.IsWindowEnabled()) << "a window that was made meanwhile";
  EXPECT_EQ(SModalState::Enable(1, &asking), 1);
  EXPECT_TRUE(late.IsWindowEnabled());
  EXPECT_EQ(Enabled(), "110");
  EXPECT_TRUE(SModalState::Unregister(&frame));
  EXPECT_TRUE(SModalState::Unregister(&asking));
  EXPECT_FALSE(SModalState::Unregister(&asking));
  late.DestroyWindow();
}

TEST_F(ModalStates, FailingAllocations_LeaveNoWindowDisabled) {
  const int failures = WithEachAllocationFailing([] { SModalState modal(1); },
                                                 [this] {
                                                   EXPECT_EQ(Enabled(), "110");
                                                   EXPECT_EQ(SModalState::State(), 1);
                                                 });
  EXPECT_GT(failures, 2);
}

// --- cursors and redrawing ---

TEST_F(ModalStates, WaitCursors_Nest) {
  const HCURSOR before = ::SetCursor(::LoadCursorW(nullptr, IDC_CROSS));
  const HCURSOR wait = ::LoadCursorW(nullptr, IDC_WAIT);
  {
    SWaitCursor first;
    SWaitCursor second(1, 1, 1);
    EXPECT_EQ(m_app.GetWaitCount(), 1) << "only where there is none";
    EXPECT_EQ(SModalState::State(), 0);
    EXPECT_EQ(::GetCursor(), wait);
    ::SetCursor(before);
    first.Restore();
    EXPECT_EQ(::GetCursor(), wait);
    m_owner.BeginWaitCursor();
    EXPECT_EQ(m_app.GetWaitCount(), 2);
    ::SetCursor(before);
    m_owner.RestoreWaitCursor();
    EXPECT_EQ(::GetCursor(), wait);
    EXPECT_EQ(m_app.GetWaitCount(), 2);
    m_owner.EndWaitCursor();
  }
  EXPECT_EQ(m_app.GetWaitCount(), 0);
  EXPECT_EQ(::GetCursor(), ::LoadCursorW(nullptr, IDC_CROSS));
  {
    SWaitCursor reset;
    SWaitCursor::ForceReset();
    EXPECT_EQ(m_app.GetWaitCount(), 0);
  }
  EXPECT_EQ(m_app.GetWaitCount(), 0);
  const HCURSOR other = ::LoadCursorW(nullptr, IDC_CROSS);
  ::SetCursor(other);
  m_owner.RestoreWaitCursor();
  EXPECT_EQ(::GetCursor(), other) << "there is none to restore";
  ::SetCursor(before);
}

TEST_F(ModalStates, RedrawLocks_NestByWindow) {
  std::string sent;
  m_owner.m_handler = [&](UINT message, WPARAM wParam, LPARAM, LRESULT*) {
    if (message == WM_SETREDRAW) sent += wParam ? '1' : '0';
    return 0;
  };
  {
    SLockRedraw outer(&m_owner), inner(&m_owner), other(&m_second);
    EXPECT_EQ(SLockRedraw::LockCount(&m_owner), 2);
    EXPECT_EQ(sent, "0");
    inner.Unlock();
    EXPECT_EQ(SLockRedraw::LockCount(&m_owner), 1);
    inner.Unlock();
    EXPECT_EQ(sent, "0");
    m_second.DestroyWindow();
  }
  EXPECT_EQ(sent, "01");
  EXPECT_EQ(SLockRedraw::LockCount(&m_owner), 0);
  m_owner.m_handler = nullptr;
}

}  // namespace
