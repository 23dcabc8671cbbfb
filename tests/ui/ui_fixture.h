// What the tests of windows share: an application object, unattended by default, and windows that keep a list of the
// messages they get.
#pragma once

#include <gtest/gtest.h>

#include <functional>
#include <string>
#include <vector>

#include "qxcore/core/handle_map.h"
#include "qxcore/core/raise_error.h"
#include "qxcore/qxcore.h"
#include "tests/support/text.h"

namespace test {

// Collects what goes to the error reporter.
class Reports {
 public:
  Reports() {
    List().clear();
    m_former = g_SetErrorReporter([](const WCHAR* text) { List().push_back(SString(text)); });
  }
  Reports(const Reports&) = delete;
  Reports& operator=(const Reports&) = delete;
  ~Reports() { g_SetErrorReporter(m_former); }
  static std::vector<SString>& List() {
    static std::vector<SString> list;
    return list;
  }

 private:
  SErrorReporter m_former;
};

// A window whose messages a test handles with a function; it counts its ends.
class Window : public SWnd {
 public:
  using Handler = std::function<int(UINT message, WPARAM wParam, LPARAM lParam, LRESULT* result)>;

  explicit Window(Handler handler = nullptr) : m_handler(std::move(handler)) {}
  int OnWndMsg(UINT message, WPARAM wParam, LPARAM lParam, LRESULT* result) override {
    if (m_handler) {
      // The handler may replace or end itself.
      Handler handler = m_handler;
      if (handler(message, wParam, lParam, result)) return 1;
    }
    return SWnd::OnWndMsg(message, wParam, lParam, result);
  }
  void PostNcDestroy() override {
    ++m_ends;
    if (m_onEnd) m_onEnd();
  }

  int Popup(DWORD style = 0) {
    return CreateEx(0, nullptr, WTEXT("popup"), WS_POPUP | style, 10, 20, 300, 200, nullptr, nullptr);
  }
  int Child(SWnd* parent, UINT id = 1) { return Create(nullptr, nullptr, WS_VISIBLE, SRect(0, 0, 50, 40), parent, id); }

  Handler m_handler;
  std::function<void()> m_onEnd;
  int m_ends = 0;
};

// The application of a test; a test that pumps gives it a limit, after which it fails.
class App : public SWinApp {
 public:
  App() : SWinApp(WTEXT("test application")) {}
  int OnIdle(long count) override {
    m_idle.push_back(count);
    if (m_onIdle) m_onIdle(count);
    return SWinApp::OnIdle(count);
  }
  std::vector<long> m_idle;
  std::function<void(long)> m_onIdle;
};

// Handles what is in the queue without waiting.
inline void PumpAll() {
  MSG message;
  while (::PeekMessageW(&message, nullptr, 0, 0, PM_REMOVE)) {
    ::TranslateMessage(&message);
    ::DispatchMessageW(&message);
  }
}

// Ends the process when a test waits for longer: a modal path must never wait for a person.
class TimeLimit {
 public:
  explicit TimeLimit(int seconds);
  TimeLimit(const TimeLimit&) = delete;
  TimeLimit& operator=(const TimeLimit&) = delete;
  ~TimeLimit();

 private:
  struct State;
  State* m_state;
};

// No test leaves a window, a permanent object or a pending exception behind.
class UiTest : public testing::Test {
 protected:
  // Seconds that one test may take, on the busiest machine.
  explicit UiTest(int limit = 120) : m_limit(limit) {}
  void SetUp() override { m_permanent = SWnd::HandleMap().GetPermanentCount(); }
  void TearDown() override {
    PumpAll();
    EXPECT_EQ(SWnd::HandleMap().GetPermanentCount(), m_permanent) << "an object is still in the handle map";
    EXPECT_FALSE(SWndThreadState::Get().HasException());
    EXPECT_EQ(SModalState::State(), 1);
    SWnd::DeleteTempMap();
    SMenu::DeleteTempMap();
  }
  SetInteractiveMode m_unattended{kInteractiveAbort};
  TimeLimit m_limit;

 private:
  int m_permanent = 0;
};

// With an application whose main window owns the boxes and dialogs.
class OwnerTest : public UiTest {
 protected:
  void SetUp() override {
    UiTest::SetUp();
    ASSERT_TRUE(m_owner.Popup(WS_VISIBLE));
    m_app.m_mainWnd = &m_owner;
  }
  void TearDown() override {
    m_app.m_mainWnd = nullptr;
    m_owner.m_handler = nullptr;
    m_owner.DestroyWindow();
    UiTest::TearDown();
  }
  App m_app;
  Window m_owner;
};

}  // namespace test
