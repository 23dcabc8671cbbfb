// Draws the pictures of the guides: a status bar, a progress with Cancel, a splitter and tabs.
//
// usage: bar_pictures FOLDER SUFFIX [dark]
// QXCORE_DPI in the environment says how large.

#include <cstdio>
#include <cstring>

#include "qxcore/graphics/picture.h"
#include "qxcore/qxcore.h"

namespace {

int Scaled(int pixels) { return ::MulDiv(pixels, static_cast<int>(::GetDpiForSystem()), 96); }

class Pane : public SView {
  QXCORE_DECLARE_CREATABLE_CLASS(Pane)
 public:
  void OnDraw(SDC* dc) override {
    const SRect rect = GetClientRect();
    dc->FillSolidRect(rect, ::GetSysColor(COLOR_WINDOW));
    const SSelectObject font(*dc, SGetDefaultUIFont(static_cast<int>(::GetDpiForWindow(m_hWnd))));
    dc->SetTextColor(::GetSysColor(COLOR_WINDOWTEXT));
    dc->SetBkColor(::GetSysColor(COLOR_WINDOW));
    dc->TextOutW(Scaled(8), Scaled(8), WTEXT("notes"));
  }
};
QXCORE_IMPLEMENT_CREATABLE_CLASS(Pane, SView, 1)

void UseDarkColors() {
  const int elements[] = {COLOR_WINDOW,    COLOR_WINDOWTEXT,    COLOR_3DFACE,   COLOR_BTNTEXT,
                          COLOR_3DSHADOW,  COLOR_3DHIGHLIGHT,   COLOR_3DLIGHT,  COLOR_3DDKSHADOW,
                          COLOR_HIGHLIGHT, COLOR_HIGHLIGHTTEXT, COLOR_SCROLLBAR};
  const COLORREF colors[] = {RGB(32, 32, 32),  RGB(232, 232, 232), RGB(52, 52, 52), RGB(232, 232, 232),
                             RGB(30, 30, 30),  RGB(80, 80, 80),    RGB(64, 64, 64), RGB(12, 12, 12),
                             RGB(40, 90, 160), RGB(255, 255, 255), RGB(40, 40, 40)};
  ::SetSysColors(static_cast<int>(std::size(elements)), elements, colors);
  SUpdateUISysData();
}

bool Save(SWnd& window, const char* folder, const char* name, const char* suffix) {
  ::RedrawWindow(window.m_hWnd, nullptr, nullptr, RDW_INVALIDATE | RDW_UPDATENOW | RDW_ALLCHILDREN);
  const SString file = SFile::FromNative(std::string(folder) + "/" + name + suffix + ".png");
  return SWritePicture(file, SClientDC(window.m_hWnd), window.GetClientRect()) == S_OK;
}

void Show(SStatusBar& bar, int pane, LPCWSTR text) {
  const SString stored(text);
  bar.SetPaneText(pane, &stored);
}

bool StatusBars(const char* folder, const char* suffix) {
  auto* frame = new SDockSiteFrameWnd;  // ends with its window
  SProgressStatusBar bar;
  frame->Create(nullptr, WTEXT("frame"), WS_POPUP | WS_VISIBLE, SRect(0, 0, Scaled(480), Scaled(300)));
  bar.Create(frame);
  bar.InsertPane(0, 0, kSPaneMain | kSPaneStretch);
  bar.InsertPane(1, 0, kSPaneAutoSize);
  bar.InsertPane(2, Scaled(60), 0);
  Show(bar, kSMainPane, WTEXT("Ready"));
  Show(bar, 1, WTEXT("UTF-8"));
  Show(bar, 2, WTEXT("Line 1"));
  frame->RecalcLayout();
  bool isDone = Save(bar, folder, "status-bar", suffix);
  bar.StartProgress(1);
  bar.GetProgressCtrl().SetPos(40);
  isDone &= Save(bar, folder, "progress", suffix);
  frame->DestroyWindow();
  return isDone;
}

// The guide's program, and then its tabs as they look with scroll buttons and an empty tab.
bool SplitterAndTabs(const char* folder, const char* suffix) {
  auto* frame = new SFrameWnd;
  SSplitterWnd splitter;
  STabWnd tabs;
  frame->Create(nullptr, WTEXT("frame"), WS_POPUP | WS_VISIBLE, SRect(0, 0, Scaled(400), Scaled(200)));
  splitter.CreateStatic(frame, 1, 2);
  splitter.AddPane(0, 0, &Pane::classPane, SSize(Scaled(120), 0));
  tabs.Create(&splitter, nullptr, nullptr, WS_CHILD | WS_VISIBLE, SSplitterWnd::IdFromRowCol(0, 1));
  splitter.AddPane(0, 1, &tabs, SSize(0, 0));
  for (LPCWSTR text : {WTEXT("first"), WTEXT("second")}) tabs.AddTab(&Pane::classPane, text);
  frame->RecalcLayout();
  for (const int bar : {SB_HORZ, SB_VERT}) {
    SCROLLINFO info = {sizeof info, SIF_ALL, 0, 99, 40, 0, 0};  // as of a text that is longer than its window
    tabs.GetTabScrollBar(bar)->SetInfo(&info);
  }
  bool isDone = Save(*frame, folder, "splitter-and-tabs", suffix);
  tabs.AddTab(&Pane::classPane, WTEXT("empty"));
  tabs.GetTabBeam()->SetTabEmpty(2, 1);
  tabs.GetTabBeam()->SetScrollButtons(1, 0);
  tabs.ShowScrollBar(SB_HORZ, 0);
  tabs.ActivateTab(1);
  tabs.GetTabBeam()->SetFirstVisible(0);
  isDone &= Save(tabs, folder, "tabs", suffix);
  frame->DestroyWindow();
  return isDone;
}

}  // namespace

int main(int argc, char** argv) {
  if (argc < 3) return 2;
  SWinApp app(WTEXT("pictures"));
  if (argc > 3 && std::strcmp(argv[3], "dark") == 0) UseDarkColors();
  return StatusBars(argv[1], argv[2]) && SplitterAndTabs(argv[1], argv[2]) ? 0 : 1;
}
