// The message loop, idle work, modal loops, and exceptions on their way through the system's functions.

#include <thread>

#include "qxcore/core/throw_target.h"
#include "tests/ui/ui_fixture.h"

namespace {

using test::Window;

// Counts notifications of idle time.
class IdleSink final : public ISNotificationSink {
 public:
  IdleSink() {
    for (int kind : {kSIdleStep, kSIdleStarted, kSIdleEnded}) SNotificationManager::Advise(this, kind);
  }
  ~IdleSink() { SNotificationManager::UnadviseAll(this); }
  HRESULT WINAPI QueryInterface(const GUID&, void** object) override {
    *object = nullptr;
    return E_NOINTERFACE;
  }
  ULONG WINAPI AddRef() override { return 2; }
  ULONG WINAPI Release() override { return 1; }
  int WINAPI OnNotification(int kind, void*, unsigned long) override {
    m_kinds += static_cast<char>('0' + kind);
    if (kind == kSIdleEnded && m_onEnd) m_onEnd();
    return 0;
  }
  std::string m_kinds;
  std::function<void()> m_onEnd;
};

class Loop : public test::UiTest {
 protected:
  void SetUp() override {
    test::UiTest::SetUp();
    test::PumpAll();
  }
  // Posts a message, runs one idle period and stops.
  void RunUntilIdle(UINT message) {
    m_sink.m_onEnd = [] { ::PostQuitMessage(5); };
    ::PostMessageW(nullptr, message, 0, 0);
    EXPECT_EQ(m_app.Run(), 5);
    m_sink.m_onEnd = nullptr;
  }
  test::App m_app;
  IdleSink m_sink;
};

TEST_F(Loop, IdlePeriod_HasTwoStepsAndThreeNotifications) {
  RunUntilIdle(WM_USER);
  EXPECT_EQ(m_app.m_idle, (std::vector<long>{0, 1}));
  EXPECT_EQ(m_sink.m_kinds, "123");
}

TEST_F(Loop, IdleMessages_AreToldApart) {
  MSG message = {};
  const auto asked = [&](UINT kind, int x = 0) {
    message.message = kind;
    message.pt.x = x;
    return m_app.IsIdleMessage(&message);
  };
  EXPECT_EQ(asked(WM_MOUSEMOVE, 3), 1);
  EXPECT_EQ(asked(WM_MOUSEMOVE, 3), 0) << "a repeated move";
  EXPECT_EQ(asked(WM_NCMOUSEMOVE, 3), 1) << "another kind at the same place";
  EXPECT_EQ(asked(WM_NCMOUSEMOVE, 4), 1);
  EXPECT_EQ(asked(WM_PAINT), 0);
  EXPECT_EQ(asked(0x0118), 0);

  const auto startsAnew = [&](UINT kind) {
    m_sink.m_kinds.clear();
    m_app.OnIdle(0);  // sets the flag
    m_sink.m_kinds.clear();
    EXPECT_EQ(asked(kind), 1);
    m_app.OnIdle(0);
    return m_sink.m_kinds == "12";
  };
  EXPECT_FALSE(startsAnew(WM_TIMER));
  EXPECT_FALSE(startsAnew(WM_MOUSEWHEEL));
  EXPECT_FALSE(startsAnew(WM_MOUSEHOVER));
  EXPECT_FALSE(startsAnew(WM_MOUSELEAVE));
  EXPECT_TRUE(startsAnew(WM_KEYDOWN));
  EXPECT_TRUE(startsAnew(WM_USER));
}

TEST_F(Loop, IdleStep_ReturnsTheCountFromBefore) {
  EXPECT_EQ(m_app.IdleStep(1), 0);
  EXPECT_EQ(m_app.IdleStep(0), 1);
  EXPECT_EQ(m_app.IdleStep(1), 1);
  EXPECT_EQ(m_app.IdleStep(0), 2);
  EXPECT_EQ(m_app.DoIdle(), 2) << "busy: nothing is done";
  EXPECT_TRUE(m_app.m_idle.empty());
}

// Idle work that posts a message each time would keep the program busy for ever.
TEST_F(Loop, IdleWorkThatPosts_StartsNoFurtherPeriod) {
  Window window;
  ASSERT_TRUE(window.Popup());
  test::PumpAll();
  int handled = 0;
  window.m_handler = [&](UINT message, WPARAM, LPARAM, LRESULT*) { return message == WM_USER + 1 ? ++handled : 0; };
  int periods = 0;
  m_app.m_onIdle = [&](long) { window.PostMessageW(WM_USER + 1); };
  m_sink.m_onEnd = [&] {
    // The first period comes from the message below, the second one from the timer.
    if (++periods == 1) window.SetTimer(1, 30);
    if (periods == 2) ::PostQuitMessage(0);
  };
  window.PostMessageW(WM_USER);
  m_app.Run();
  EXPECT_EQ(periods, 2);
  EXPECT_EQ(m_app.m_idle.size(), 4u);
  EXPECT_GE(handled, 2);
  window.DestroyWindow();
}

// A consumer that is driven from idle steps works to its end, and no longer.
TEST_F(Loop, IdleConsumers_AreDrivenByADerivedApplication) {
  class Consumer : public SIdleConsumer {
   public:
    explicit Consumer(SIdleConsumerList* list) : SIdleConsumer(list) {}
    int OnIdle(int) override { return ++m_calls < 5; }
    int m_calls = 0;
  };
  class DrivingApp : public SWinApp {
   public:
    int OnIdle(long count) override {
      const int more = SWinApp::OnIdle(count);
      return count < 1 || m_list.OnIdleNext(0) == 0 || m_consumer.m_calls < 5 || more;
    }
    SIdleConsumerList m_list;
    Consumer m_consumer{&m_list};
  };
  // The application object of the fixture stands in front; the loop is an object's own.
  DrivingApp app;
  m_sink.m_onEnd = [] { ::PostQuitMessage(0); };
  ::PostMessageW(nullptr, WM_USER, 0, 0);
  app.Run();
  EXPECT_EQ(app.m_consumer.m_calls, 5);
}

TEST_F(Loop, IdleKick_WakesTheLoopAndIsNeverDispatched) {
  Window window;
  ASSERT_TRUE(window.Popup());
  test::PumpAll();
  bool wasDispatched = false;
  window.m_handler = [&](UINT message, WPARAM, LPARAM, LRESULT*) {
    if (message == kSMsgIdleKick) wasDispatched = true;
    return 0;
  };
  window.PostMessageW(kSMsgIdleKick);
  RunUntilIdle(WM_NULL);
  EXPECT_FALSE(wasDispatched);
  EXPECT_EQ(m_sink.m_kinds, "123");
  window.DestroyWindow();
}

TEST_F(Loop, DisabledApplication_DropsInputForItsOwnerWindowAlone) {
  Window owner, other;
  ASSERT_TRUE(owner.Popup());
  ASSERT_TRUE(other.Popup());
  m_app.m_mainWnd = &owner;
  test::PumpAll();
  std::vector<UINT> got;
  static constexpr UINT posted[] = {WM_KEYDOWN,    WM_PAINT, WM_LBUTTONDOWN, WM_SIZE,      WM_MOVE,
                                    WM_SHOWWINDOW, WM_USER,  WM_TIMER,       WM_MOUSEMOVE, WM_SYSCOMMAND};
  owner.m_handler = [&](UINT message, WPARAM, LPARAM, LRESULT*) {
    got.push_back(message);
    return std::count(std::begin(posted), std::end(posted), message) != 0;
  };
  int others = 0;
  other.m_handler = [&](UINT message, WPARAM, LPARAM, LRESULT*) { return message == WM_USER ? ++others : 0; };
  SModalState modal(1);
  got.clear();
  for (UINT message : posted) owner.PostMessageW(message, 0x1234);
  other.PostMessageW(WM_USER);
  while (others == 0) m_app.PumpMessage();
  std::erase_if(got, [&](UINT message) { return std::count(std::begin(posted), std::end(posted), message) == 0; });
  EXPECT_EQ(got, (std::vector<UINT>{WM_PAINT, WM_SIZE, WM_MOVE, WM_SHOWWINDOW, WM_TIMER, WM_SYSCOMMAND}));
  EXPECT_EQ(others, 1);
  modal.Stop();
  m_app.m_mainWnd = nullptr;
  owner.DestroyWindow();
  other.DestroyWindow();
}

// --- modal loops ---

TEST_F(Loop, ModalLoop_ReturnsWhatEndModalLoopWasGiven) {
  Window outer, inner;
  ASSERT_TRUE(outer.Popup());
  ASSERT_TRUE(inner.Popup());
  inner.m_handler = [&](UINT message, WPARAM, LPARAM, LRESULT*) {
    if (message == WM_USER) {
      EXPECT_TRUE(outer.IsRunningModalLoop());
      outer.EndModalLoop(11);
      inner.EndModalLoop(22);
    }
    return 0;
  };
  outer.m_handler = [&](UINT message, WPARAM, LPARAM, LRESULT*) {
    if (message == WM_USER) {
      inner.PostMessageW(WM_USER);
      EXPECT_EQ(inner.RunModalLoop(), 22);
    }
    return 0;
  };
  outer.PostMessageW(WM_USER);
  EXPECT_EQ(outer.RunModalLoop(), 11);
  EXPECT_FALSE(outer.IsRunningModalLoop());
  outer.DestroyWindow();
  inner.DestroyWindow();
}

TEST_F(Loop, ModalLoop_EndsWithItsWindowAndWithItsObject) {
  Window window;
  ASSERT_TRUE(window.Popup());
  window.PostMessageW(WM_CLOSE);
  EXPECT_EQ(window.RunModalLoop(), -1);

  auto* deleted = new Window;
  ASSERT_TRUE(deleted->Popup());
  deleted->m_onEnd = [&] { delete deleted; };
  deleted->PostMessageW(WM_CLOSE);
  EXPECT_EQ(deleted->RunModalLoop(), -1);
}

TEST_F(Loop, ModalLoop_LeavesAQuitToTheLoopAround) {
  Window window;
  ASSERT_TRUE(window.Popup());
  ::PostQuitMessage(9);
  EXPECT_EQ(window.RunModalLoop(), -1);
  EXPECT_EQ(m_app.Run(), 9);
  window.DestroyWindow();
}

// --- exceptions ---

int ThrowingHandler(UINT message, WPARAM, LPARAM, LRESULT*) {
  if (message == WM_USER) throw STargetedException(WTEXT("Scripting"), WTEXT("first"));
  return 0;
}

TEST_F(Loop, Exception_OfAHandler_ReachesWhoSentTheMessage) {
  Window window(&ThrowingHandler);
  ASSERT_TRUE(window.Popup());
  EXPECT_THROW(window.SendMessageW(WM_USER), STargetedException);
  EXPECT_FALSE(SWndThreadState::Get().HasException());
  window.DestroyWindow();
}

TEST_F(Loop, Exception_ThroughNestedMessages_StaysTheFirst) {
  test::Reports reports;
  Window inner(&ThrowingHandler);
  Window outer([&](UINT message, WPARAM, LPARAM, LRESULT*) {
    if (message == WM_USER) {
      inner.SendMessageW(WM_USER);
      ADD_FAILURE() << "the exception is thrown on";
    }
    return 0;
  });
  ASSERT_TRUE(inner.Popup());
  ASSERT_TRUE(outer.Popup());
  EXPECT_THROW(outer.SendMessageW(WM_USER), STargetedException);

  // A plain system call keeps it until the next call of the library; a handler that runs meanwhile runs normally.
  ::SendMessageW(outer.m_hWnd, WM_USER, 0, 0);
  EXPECT_TRUE(SWndThreadState::Get().HasException());
  int seen = 0;
  outer.m_handler = [&](UINT message, WPARAM, LPARAM, LRESULT*) {
    if (message != WM_USER + 1) return 0;
    EXPECT_FALSE(SWndThreadState::Get().HasException());
    inner.SendMessageW(WM_USER + 2);
    ++seen;
    throw std::runtime_error("second");
  };
  ::SendMessageW(outer.m_hWnd, WM_USER + 1, 0, 0);
  EXPECT_EQ(seen, 1);
  EXPECT_EQ(reports.List(), std::vector<SString>{WTEXT("second")});
  EXPECT_THROW(outer.ShowWindow(SW_HIDE), STargetedException);
  outer.m_handler = nullptr;
  outer.DestroyWindow();
  inner.DestroyWindow();
}

TEST_F(Loop, Exception_DuringCreation_RefusesTheWindow) {
  for (UINT refused : {UINT{WM_NCCREATE}, UINT{WM_CREATE}}) {
    Window window([refused](UINT message, WPARAM, LPARAM, LRESULT*) -> int {
      if (message == refused) throw std::runtime_error("no");
      return 0;
    });
    EXPECT_THROW(window.Popup(), std::runtime_error);
    EXPECT_EQ(window.m_hWnd, nullptr);
    EXPECT_EQ(window.m_ends, 1);
  }
}

TEST_F(Loop, Exception_InADestructor_WaitsForTheNextCall) {
  Window other;
  ASSERT_TRUE(other.Popup());
  {
    Window window;
    ASSERT_TRUE(window.Popup());
    Window child([](UINT message, WPARAM, LPARAM, LRESULT*) -> int {
      if (message == WM_DESTROY) throw std::runtime_error("late");
      return 0;
    });
    ASSERT_TRUE(child.Child(&window));
    delete new SWnd;
    {
      SWnd owner;
      owner.Attach(window.Detach());
    }
    child.m_handler = nullptr;
  }
  EXPECT_THROW(other.UpdateWindow(), std::runtime_error);
  other.DestroyWindow();
}

TEST_F(Loop, Exception_ThatReachesRun_IsReportedAndTheLoopGoesOn) {
  test::Reports reports;
  Window window(&ThrowingHandler);
  ASSERT_TRUE(window.Popup());
  m_app.m_mainWnd = &window;
  window.PostMessageW(WM_USER);
  window.PostMessageW(WM_CLOSE);
  EXPECT_FALSE(SWinApp::IsExiting());
  EXPECT_EQ(m_app.Run(), 0);
  EXPECT_TRUE(SWinApp::IsExiting());
  EXPECT_EQ(reports.List(), std::vector<SString>{WTEXT("first")});
}

TEST_F(Loop, Exception_OfIdleWork_DoesNotSpin) {
  test::Reports reports;
  m_app.m_onIdle = [](long) { throw std::runtime_error("idle"); };
  RunUntilIdle(WM_USER);
  EXPECT_EQ(reports.List().size(), 1u);
}

TEST_F(Loop, Exception_SentFromAnotherThread_TravelsToTheSender) {
  Window window(&ThrowingHandler);
  ASSERT_TRUE(window.Popup());
  m_app.m_mainWnd = &window;
  SString caught;
  std::thread sender([&] {
    try {
      window.SendMessageW(WM_USER, 1, 2);
    } catch (const STargetedException& abort) {
      caught = abort.GetMessageText();
    }
    window.PostMessageW(WM_CLOSE);
  });
  test::Reports reports;
  m_app.Run();
  sender.join();
  EXPECT_EQ(caught, SString(WTEXT("first")));
  EXPECT_TRUE(reports.List().empty()) << "it is the sender's alone";
}

}  // namespace
