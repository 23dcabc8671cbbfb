// The saved states of splitters and tab windows: any text is refused without a change, or taken; then no size is below
// 0, and the state gives itself again.

#include "fuzz/fuzz_input.h"
#include "qxcore/qxcore.h"

namespace {

class Pane : public SView {
  QXCORE_DECLARE_CREATABLE_CLASS(Pane)
 public:
  void OnDraw(SDC*) override {}
};
QXCORE_IMPLEMENT_CREATABLE_CLASS(Pane, SView, 1)

struct Bars {
  Bars() {
    SCreateContext context;
    context.m_viewClass = &Pane::classPane;
    m_frame->Create(nullptr, nullptr, WS_POPUP, SRect(0, 0, 400, 300));
    m_dynamic.Create(m_frame, 3, 3, SSize(10, 10), &context);
    m_static.CreateStatic(m_frame, 2, 2);
    m_tabs.Create(m_frame, nullptr, &context);
    FUZZ_CHECK(m_dynamic.GetRowCount() == 1 && m_static.GetRowCount() == 2);
    for (int i = 0; i < 3; ++i) m_tabs.AddTab(&Pane::classPane, WTEXT("tab"));
  }
  ~Bars() { m_frame->DestroyWindow(); }
  SFrameWnd* m_frame = new SFrameWnd;
  SSplitterWnd m_dynamic, m_static;
  STabWnd m_tabs;
};

template <class Window>
void Check(Window& window, const SString& state) {
  const SString before = window.GetState();
  if (!window.SetState(state)) {
    FUZZ_CHECK(window.GetState() == before);
    return;
  }
  window.SetState(window.GetState());  // a tab window makes its shown tab visible
  const SString taken = window.GetState();
  FUZZ_CHECK(window.SetState(taken));
  FUZZ_CHECK(window.GetState() == taken);
}

void CheckSizes(const SSplitterWnd& splitter) {
  for (int i = 0; i < splitter.GetColumnCount(); ++i) {
    int size = 0;
    splitter.GetColumnInfo(i, &size, nullptr);
    FUZZ_CHECK(size >= 0 && size <= 400);
  }
  for (int i = 0; i < splitter.GetRowCount(); ++i) {
    int size = 0;
    splitter.GetRowInfo(i, &size, nullptr);
    FUZZ_CHECK(size >= 0 && size <= 300);
  }
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  static SWinApp app(WTEXT("fuzz"));
  Bars bars;
  FuzzInput input(data, size);
  const SString state(ToText(input.Rest()).c_str());
  Check(bars.m_dynamic, state);
  CheckSizes(bars.m_dynamic);
  Check(bars.m_static, state);
  CheckSizes(bars.m_static);
  Check(bars.m_tabs, state);
  FUZZ_CHECK(bars.m_tabs.GetBeamWidth() >= 0 && bars.m_tabs.GetBeamWidth() <= 400);
  FUZZ_CHECK(bars.m_tabs.GetTabBeam()->GetFirstVisible() < 3);
  return 0;
}
