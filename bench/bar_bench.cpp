// Laying out a status bar of 20 panes in a shown window, beside Qt's with 20 widgets.

#if BENCH_PEERS
#include <QLabel>
#include <QStatusBar>
#include <memory>
#include <vector>
#endif

#include "bench/bench.h"
#if BENCH_PEERS
#include "bench/qt_application.h"
#endif
#include "qxcore/ui/bar/status_bar.h"
#include "qxcore/ui/frame/dock_site_frame.h"

namespace {

constexpr int kPanes = 20;
constexpr int kHeight = 24;

// Another width each time, so that every call lays out.
int NextWidth(int width) { return width == 1200 ? 1300 : 1200; }

}  // namespace

BENCH("lay out a status bar of 20 panes/ours") {
  auto* frame = new SDockSiteFrameWnd;
  frame->Create(nullptr, WTEXT("bench"), WS_POPUP | WS_VISIBLE, SRect(0, 0, 1400, 800));
  SStatusBar bar;
  bar.Create(frame);
  for (int i = 0; i < kPanes; ++i) bar.InsertPane(i, 40, i % 5 == 0 ? DWORD{kSPaneStretch} : 0);
  const SString text(WTEXT("text"));
  for (int i = 0; i < kPanes; ++i) bar.SetPaneText(i, &text);
  // A window that waits for its first paint message would be erased as a whole each time.
  frame->UpdateWindow();
  bar.UpdateWindow();
  int width = 1200;
  for (auto _ : state) {
    width = NextWidth(width);
    bar.MoveWindow(SRect(0, 0, width, kHeight));
  }
  frame->DestroyWindow();
}

#if BENCH_PEERS
BENCH("lay out a status bar of 20 panes/QStatusBar") {
  StartQt();
  QWidget window;
  window.resize(1400, 800);
  QStatusBar bar(&window);
  std::vector<std::unique_ptr<QLabel>> labels;
  for (int i = 0; i < kPanes; ++i) {
    labels.push_back(std::make_unique<QLabel>(QStringLiteral("text")));
    bar.addWidget(labels.back().get(), i % 5 == 0);
  }
  window.show();
  QApplication::processEvents();
  int width = 1200;
  for (auto _ : state) {
    width = NextWidth(width);
    bar.resize(width, kHeight);
  }
}
#endif
