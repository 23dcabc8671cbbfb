// Windows: sending, posting, making and destroying, beside Qt's events and widgets.

#if BENCH_PEERS
#include <QEvent>
#include <QWidget>
#endif

#include "bench/bench.h"
#if BENCH_PEERS
#include "bench/qt_application.h"
#endif
#include "qxcore/platform/win32.h"

namespace {

constexpr UINT kMessage = WM_USER + 1;
constexpr int kBatch = 1000;

long g_count = 0;

LRESULT CALLBACK Counting(HWND window, UINT message, WPARAM wParam, LPARAM lParam) {
  if (message == kMessage) {
    g_count += static_cast<long>(wParam);
    return 1;
  }
  return DefWindowProcW(window, message, wParam, lParam);
}

HWND Make(HWND parent, DWORD style) {
  static const ATOM atom = [] {
    WNDCLASSW wanted{};
    wanted.lpfnWndProc = &Counting;
    wanted.hInstance = GetModuleHandleW(nullptr);
    wanted.lpszClassName = WTEXT("BenchWindow");
    return RegisterClassW(&wanted);
  }();
  (void)atom;
  return CreateWindowExW(0, WTEXT("BenchWindow"), WTEXT(""), style, 0, 0, 100, 100, parent, nullptr,
                         GetModuleHandleW(nullptr), nullptr);
}

BENCH("send a message to a plain procedure/ours") {
  const HWND window = Make(nullptr, WS_POPUP);
  for (auto _ : state) benchmark::DoNotOptimize(SendMessageW(window, kMessage, 1, 0));
  DestroyWindow(window);
}

BENCH("post, get and dispatch 1000 messages/ours") {
  const HWND window = Make(nullptr, WS_POPUP);
  for (auto _ : state) {
    for (int i = 0; i < kBatch; ++i) PostMessageW(window, kMessage, 1, 0);
    MSG message;
    for (int i = 0; i < kBatch; ++i) {
      GetMessageW(&message, nullptr, 0, 0);
      DispatchMessageW(&message);
    }
  }
  DestroyWindow(window);
}

BENCH("make and destroy 1000 children/ours") {
  const HWND frame = Make(nullptr, WS_OVERLAPPEDWINDOW | WS_VISIBLE);
  for (auto _ : state) {
    HWND children[kBatch];
    for (HWND& child : children) child = Make(frame, WS_CHILD | WS_VISIBLE);
    for (const HWND child : children) DestroyWindow(child);
  }
  DestroyWindow(frame);
}

#if BENCH_PEERS
class CountingWidget final : public QWidget {
 public:
  using QWidget::QWidget;
  bool event(QEvent* event) override {
    if (event->type() != QEvent::User) return QWidget::event(event);
    ++m_count;
    return true;
  }
  long m_count = 0;
};

BENCH("send a message to a plain procedure/Qt sendEvent") {
  StartQt();
  CountingWidget widget;
  QEvent event(QEvent::User);
  for (auto _ : state) benchmark::DoNotOptimize(QCoreApplication::sendEvent(&widget, &event));
}

BENCH("post, get and dispatch 1000 messages/Qt postEvent") {
  StartQt();
  CountingWidget widget;
  for (auto _ : state) {
    for (int i = 0; i < kBatch; ++i) QCoreApplication::postEvent(&widget, new QEvent(QEvent::User));
    QCoreApplication::processEvents();
  }
}

BENCH("make and destroy 1000 children/Qt widgets") {
  StartQt();
  CountingWidget frame;
  frame.show();
  for (auto _ : state) {
    QWidget* children[kBatch];
    for (QWidget*& child : children) {
      child = new CountingWidget(&frame);
      child->show();
    }
    for (QWidget* child : children) delete child;
  }
}
#endif

}  // namespace
