// Splitters and tab beams beside those of Qt, on its platform that shows nothing. Each is a child of a shown window,
// so that a change of its size is laid out inside the call.

#if BENCH_PEERS
#include <QSplitter>
#include <QTabBar>
#include <QVBoxLayout>
#endif

#include <memory>
#include <vector>

#include "bench/bench.h"
#if BENCH_PEERS
#include "bench/qt_application.h"
#endif
#include "qxcore/qxcore.h"

namespace {

constexpr int kPanes = 16;
constexpr int kTabs = 1000;

struct ShownWindow : SWnd {
  ShownWindow() { CreateEx(0, nullptr, WTEXT("bench"), WS_POPUP | WS_VISIBLE, 0, 0, 1700, 1300, nullptr, nullptr); }
};

class ShownSplitter {
 public:
  ShownSplitter() {
    m_splitter.CreateStatic(&m_frame, kPanes, kPanes);
    for (int i = 0; i < kPanes * kPanes; ++i) {
      SWnd* pane = m_panes.emplace_back(std::make_unique<SWnd>()).get();
      pane->Create(nullptr, nullptr, WS_VISIBLE, SRect(), &m_splitter, 1);
      m_splitter.AddPane(i / kPanes, i % kPanes, pane, SSize(90, 70));
    }
    m_splitter.SetKeepPaneRatio(1);
    ::RedrawWindow(m_frame.m_hWnd, nullptr, nullptr, RDW_UPDATENOW | RDW_ALLCHILDREN);
  }
  void Resize(int width, int height) {
    m_splitter.SetWindowPos(nullptr, 0, 0, width, height, SWP_NOZORDER | SWP_NOACTIVATE);
  }

 private:
  ShownWindow m_frame;
  SSplitterWnd m_splitter;
  std::vector<std::unique_ptr<SWnd>> m_panes;
};

BENCH("resize a splitter of 16 x 16 panes/ours") {
  ShownSplitter splitter;
  int less = 0;
  for (auto _ : state) {
    less = 100 - less;
    splitter.Resize(1600 - less, 1200 - less);
  }
}

class ShownBeam {
 public:
  ShownBeam() {
    m_beam.Create(&m_frame, WS_VISIBLE, 1);
    m_beam.MoveWindow(SRect(0, 0, 600, 20));
  }
  void Fill() {
    for (int i = 0; i < kTabs; ++i) m_beam.InsertTab(i, WTEXT("Sales figures"), nullptr);
  }
  void Empty() {
    while (m_beam.GetCount() > 0) m_beam.DeleteTab(m_beam.GetCount() - 1);
  }
  STabBeam& Get() { return m_beam; }

 private:
  ShownWindow m_frame;
  STabBeam m_beam;
};

BENCH("insert 1,000 tabs/ours") {
  ShownBeam beam;
  for (auto _ : state) {
    beam.Fill();
    state.PauseTiming();
    beam.Empty();
    state.ResumeTiming();
  }
}

BENCH("insert 1,000 tabs/text extents") {
  ShownBeam beam;
  SMemoryDC dc;
  const SSelectObject font(dc, beam.Get().GetTextFont());
  const SString text = WTEXT("Sales figures");
  for (auto _ : state) {
    for (int i = 0; i < kTabs; ++i) benchmark::DoNotOptimize(dc.GetTextExtent(text));
  }
}

BENCH("make the last of 1,000 tabs visible/ours") {
  ShownBeam beam;
  beam.Fill();
  for (auto _ : state) {
    beam.Get().SetCurSel(kTabs - 1);
    beam.Get().SetCurSel(0);
  }
}

#if BENCH_PEERS
BENCH("resize a splitter of 16 x 16 panes/QSplitter") {
  StartQt();
  QWidget window;
  window.resize(1700, 1300);
  auto* rows = new QSplitter(Qt::Vertical, &window);
  for (int row = 0; row < kPanes; ++row) {
    auto* line = new QSplitter(Qt::Horizontal);
    for (int column = 0; column < kPanes; ++column) line->addWidget(new QWidget);
    rows->addWidget(line);
  }
  window.show();
  QCoreApplication::processEvents();
  int less = 0;
  for (auto _ : state) {
    less = 100 - less;
    rows->resize(1600 - less, 1200 - less);
  }
}

BENCH("make the last of 1,000 tabs visible/QTabBar") {
  StartQt();
  QWidget window;
  window.resize(700, 100);
  auto* bar = new QTabBar(&window);
  bar->resize(600, 30);
  for (int i = 0; i < kTabs; ++i) bar->addTab(QStringLiteral("Sales figures"));
  window.show();
  QCoreApplication::processEvents();
  for (auto _ : state) {
    bar->setCurrentIndex(kTabs - 1);
    bar->setCurrentIndex(0);
  }
}
#endif

}  // namespace
