// Messages and commands, beside virtual calls, events of Qt and of wxWidgets.

#include <ctime>

#if BENCH_PEERS
#include <QEvent>
#include <QWidget>
#endif
#if defined(BENCH_WX)
#include <wx/app.h>
#include <wx/event.h>
#endif

#include "bench/bench.h"
#if BENCH_PEERS
#include "bench/qt_application.h"
#endif
#include "qxcore/ui/app/application.h"
#include "qxcore/ui/frame/frame.h"
#include "qxcore/ui/frame/view.h"
#include "qxcore/ui/window/message_entries.h"
#include "qxcore/ui/window/window.h"

namespace {

constexpr UINT kHandled = WM_USER + 1;
constexpr UINT kUnhandled = WM_USER + 2;
constexpr UINT kCommand = 0x8001;

// The handler stands in the map of the outermost class, three bases below the object's own.
class Handling : public SWnd {
 public:
  LRESULT OnHandled(WPARAM wParam, LPARAM) { return static_cast<LRESULT>(m_sum += wParam); }
  WPARAM m_sum = 0;
  QXCORE_DECLARE_MESSAGE_MAP()
};
QXCORE_IMPLEMENT_MESSAGE_MAP(Handling, SWnd, on<kHandled, &Handling::OnHandled>())
#define LEVEL(Class, Base)       \
  class Class : public Base {    \
    QXCORE_DECLARE_MESSAGE_MAP() \
  };                             \
  QXCORE_IMPLEMENT_MESSAGE_MAP(Class, Base)
LEVEL(One, Handling)
LEVEL(Two, One)
LEVEL(Three, Two)

struct Virtual {
  virtual ~Virtual() = default;
  virtual LRESULT Call(UINT message, WPARAM wParam, LPARAM lParam) = 0;
};
// Two, so that no compiler calls the only one directly.
template <int>
struct Called final : Virtual {
  [[gnu::noinline]] LRESULT Call(UINT, WPARAM wParam, LPARAM) override { return static_cast<LRESULT>(m_sum += wParam); }
  WPARAM m_sum = 0;
};
volatile int g_choice = 0;

BENCH("a handled message, three bases down/ours") {
  Three window;
  SWnd* object = &window;
  benchmark::DoNotOptimize(object);
  for (auto _ : state) {
    LRESULT result = 0;
    benchmark::DoNotOptimize(object->OnWndMsg(kHandled, 1, 0, &result));
    benchmark::DoNotOptimize(result);
  }
}

BENCH("an unhandled message/ours") {
  Three window;
  SWnd* object = &window;
  benchmark::DoNotOptimize(object);
  for (auto _ : state) {
    LRESULT result = 0;
    benchmark::DoNotOptimize(object->OnWndMsg(kUnhandled, 1, 0, &result));
  }
}

void VirtualCalls(benchmark::State& state) {
  Called<0> one;
  Called<1> two;
  Virtual* object = g_choice == 0 ? static_cast<Virtual*>(&one) : &two;
  for (auto _ : state) benchmark::DoNotOptimize(object->Call(kHandled, 1, 0));
}
BENCH("a handled message, three bases down/virtual call") { VirtualCalls(state); }
BENCH("an unhandled message/virtual call") { VirtualCalls(state); }

BENCH("SendMessage to a handler/ours") {
  Three window;
  window.CreateEx(0, nullptr, nullptr, WS_POPUP, 0, 0, 9, 9, nullptr, nullptr);
  for (auto _ : state) benchmark::DoNotOptimize(window.SendMessageW(kHandled, 1, 0));
  window.DestroyWindow();
}

LRESULT CALLBACK PlainProcedure(HWND window, UINT message, WPARAM wParam, LPARAM lParam) {
  return message == kHandled ? static_cast<LRESULT>(wParam) : ::DefWindowProcW(window, message, wParam, lParam);
}

BENCH("SendMessage to a handler/plain procedure") {
  WNDCLASSEXW registered = {};
  registered.cbSize = sizeof(registered);
  registered.lpfnWndProc = &PlainProcedure;
  registered.hInstance = SGetInstance();
  registered.lpszClassName = WTEXT("bench plain");
  ::RegisterClassExW(&registered);
  const HWND window = ::CreateWindowExW(0, WTEXT("bench plain"), nullptr, WS_POPUP, 0, 0, 9, 9, nullptr, nullptr,
                                        SGetInstance(), nullptr);
  for (auto _ : state) benchmark::DoNotOptimize(::SendMessageW(window, kHandled, 1, 0));
  ::DestroyWindow(window);
}

// A command that only the application handles: past the maps of view and frame.
class BenchView : public SView {
  QXCORE_DECLARE_CREATABLE_CLASS(BenchView)
 public:
  void OnDraw(SDC*) override {}
  void OnOther() {}
  QXCORE_DECLARE_MESSAGE_MAP()
};
QXCORE_IMPLEMENT_CREATABLE_CLASS(BenchView, SView, 2)
QXCORE_IMPLEMENT_MESSAGE_MAP(BenchView, SView, command<1, &BenchView::OnOther>(), command<2, &BenchView::OnOther>(),
                             command<3, &BenchView::OnOther>(), command<4, &BenchView::OnOther>())
class BenchApp : public SWinApp {
 public:
  void OnCommand() { ++m_count; }
  void OnOther() {}
  long m_count = 0;
  QXCORE_DECLARE_MESSAGE_MAP()
};
QXCORE_IMPLEMENT_MESSAGE_MAP(BenchApp, SWinApp, command<1, &BenchApp::OnOther>(), command<2, &BenchApp::OnOther>(),
                             command<3, &BenchApp::OnOther>(), command<kCommand, &BenchApp::OnCommand>())

BENCH("a command through view, frame and application/ours") {
  BenchApp app;
  SCreateContext context;
  context.m_viewClass = &BenchView::classBenchView;
  auto* frame = new SFrameWnd;
  frame->Create(nullptr, nullptr, WS_OVERLAPPEDWINDOW, SRect(0, 0, 99, 99), nullptr, nullptr, 0, &context);
  for (auto _ : state) benchmark::DoNotOptimize(frame->OnCmdMsg(kCommand, 0, nullptr, nullptr));
  frame->DestroyWindow();
}

#if BENCH_PEERS
// The loop of a program whose windows wait; the processor time of the whole process.
class IdleApp : public SWinApp {
 public:
  void Idle() {
    SWnd window;
    window.CreateEx(0, nullptr, WTEXT("idle"), WS_OVERLAPPEDWINDOW | WS_VISIBLE, 0, 0, 200, 100, nullptr, nullptr);
    m_mainWnd = &window;
    window.SetTimer(1, 10000);
    window.PostMessageW(WM_USER);
    MSG waiting;
    while (PumpMessage() && m_message.message != WM_TIMER) {
      if (!::PeekMessageW(&waiting, nullptr, 0, 0, PM_NOREMOVE)) DoIdle();
    }
    m_mainWnd = nullptr;
    window.DestroyWindow();
  }
};

void IdleForTenSeconds(benchmark::State& state) {
  const std::clock_t before = std::clock();
  for (auto _ : state) IdleApp().Idle();
  state.counters["processor_ns"] = static_cast<double>(std::clock() - before) * 1e9 / CLOCKS_PER_SEC;
}
const auto g_idle = benchmark::RegisterBenchmark("an idle program, ten seconds/ours", IdleForTenSeconds)
                        -> Iterations(1) -> Repetitions(1);

template <class Base>
class QtReceiver : public Base {
 public:
  bool event(QEvent* event) override {
    if (event->type() == QEvent::User) return ++m_count, true;
    return Base::event(event);
  }
  long m_count = 0;
};

template <class Base>
void QtSends(benchmark::State& state) {
  StartQt();
  QtReceiver<Base> receiver;
  QEvent event(QEvent::User);
  for (auto _ : state) benchmark::DoNotOptimize(QCoreApplication::sendEvent(&receiver, &event));
}
BENCH("a handled message, three bases down/Qt sendEvent") { QtSends<QObject>(state); }
BENCH("SendMessage to a handler/Qt sendEvent") { QtSends<QWidget>(state); }
#endif

#if defined(BENCH_WX)
// clang-format off
wxDEFINE_EVENT(kWxHandled, wxCommandEvent);
class WxHandling : public wxEvtHandler {
 public:
  void OnHandled(wxCommandEvent&) { ++m_count; }
  long m_count = 0;
  wxDECLARE_EVENT_TABLE();
};
wxBEGIN_EVENT_TABLE(WxHandling, wxEvtHandler)
  EVT_COMMAND(wxID_ANY, kWxHandled, WxHandling::OnHandled)
wxEND_EVENT_TABLE()

class WxOne : public WxHandling { wxDECLARE_EVENT_TABLE(); };
wxBEGIN_EVENT_TABLE(WxOne, WxHandling)
wxEND_EVENT_TABLE()

class WxTwo : public WxOne { wxDECLARE_EVENT_TABLE(); };
wxBEGIN_EVENT_TABLE(WxTwo, WxOne)
wxEND_EVENT_TABLE()

// A table as long as a view's with those of its bases, without the command that is sent.
#define WX_ENTRY(number) EVT_COMMAND(number, kWxHandled, WxOther::OnOther)
#define WX_TEN(first) \
  WX_ENTRY(first) WX_ENTRY(first + 1) WX_ENTRY(first + 2) WX_ENTRY(first + 3) WX_ENTRY(first + 4) \
  WX_ENTRY(first + 5) WX_ENTRY(first + 6) WX_ENTRY(first + 7) WX_ENTRY(first + 8) WX_ENTRY(first + 9)
class WxOther : public wxEvtHandler {
 public:
  void OnOther(wxCommandEvent&) {}
  wxDECLARE_EVENT_TABLE();
};
wxBEGIN_EVENT_TABLE(WxOther, wxEvtHandler)
  WX_TEN(100) WX_TEN(110) WX_TEN(120) WX_TEN(130) WX_TEN(140) WX_ENTRY(1) WX_ENTRY(2) WX_ENTRY(3) WX_ENTRY(4)
wxEND_EVENT_TABLE()
    // clang-format on

    BENCH("a handled message, three bases down/wxWidgets") {
  WxTwo handler;
  wxCommandEvent event(kWxHandled, 7);
  for (auto _ : state) benchmark::DoNotOptimize(handler.ProcessEvent(event));
}

BENCH("a command through view, frame and application/wxWidgets") {
  WxOther view, frame;
  WxTwo app;
  view.SetNextHandler(&frame);
  frame.SetPreviousHandler(&view);
  frame.SetNextHandler(&app);
  app.SetPreviousHandler(&frame);
  wxCommandEvent event(kWxHandled, 7);
  for (auto _ : state) benchmark::DoNotOptimize(view.ProcessEvent(event));
  view.Unlink();
  frame.Unlink();
  app.Unlink();
}
#endif

}  // namespace
