// What the tests of splitters and tab windows share: a frame, views that note what they get, keys and the mouse.
#pragma once

#include <vector>

#include "tests/ui/ui_fixture.h"

inline void PrintTo(const SRect& rect, std::ostream* out) {
  *out << rect.left << ' ' << rect.top << " - " << rect.right << ' ' << rect.bottom;
}

namespace test {

// A view that notes its scrolling and can refuse to be created.
class PaneView : public SView {
  QXCORE_DECLARE_CREATABLE_CLASS(PaneView)
 public:
  PaneView() { ++s_living; }
  ~PaneView() override { --s_living; }
  void OnDraw(SDC* dc) override { dc->FillSolidRect(GetClientRect(), ::GetSysColor(COLOR_WINDOW)); }
  int OnWndMsg(UINT message, WPARAM wParam, LPARAM lParam, LRESULT* result) override {
    if (message == WM_CREATE && s_refuses) return *result = -1, 1;
    if (message == WM_HSCROLL || message == WM_VSCROLL) {
      const int bar = message == WM_HSCROLL ? SB_HORZ : SB_VERT;
      m_positions.push_back(GetScrollPos(bar));
      if (LOWORD(wParam) == SB_LINEDOWN) SetScrollPos(bar, GetScrollPos(bar) + 1);
      if (LOWORD(wParam) == SB_THUMBPOSITION) SetScrollPos(bar, HIWORD(wParam));
      return *result = 0, 1;
    }
    return SView::OnWndMsg(message, wParam, lParam, result);
  }
  std::vector<int> m_positions;  // of the scroll bar, when a scroll message came
  static inline int s_living = 0;
  static inline bool s_refuses = false;
};

inline SCreateContext PaneContext() {
  SCreateContext context;
  context.m_viewClass = &PaneView::classPaneView;
  return context;
}

// A place inside another window, in its client coordinates.
inline SRect PlaceIn(const SWnd& parent, HWND child) {
  SRect rect;
  ::GetWindowRect(child, rect);
  parent.ScreenToClient(rect);
  return rect;
}
inline SRect PlaceIn(const SWnd& parent, UINT id) {
  return PlaceIn(parent, ::GetDlgItem(parent.m_hWnd, static_cast<int>(id)));
}

// The mouse, by messages.
inline void Mouse(const SWnd& window, UINT message, SPoint at) {
  window.SendMessageW(message, message == WM_LBUTTONUP ? 0 : MK_LBUTTON, MAKELPARAM(at.x, at.y));
}
inline void Drag(const SWnd& window, SPoint from, SPoint to) {
  Mouse(window, WM_LBUTTONDOWN, from);
  Mouse(window, WM_MOUSEMOVE, SPoint((from.x + to.x) / 2, (from.y + to.y) / 2));
  Mouse(window, WM_MOUSEMOVE, to);
  Mouse(window, WM_LBUTTONUP, to);
}

// A key as the loop delivers it to a window: offered to the window and those around it, then dispatched.
inline void Key(HWND window, WPARAM key) {
  MSG message = {};
  message.hwnd = window;
  message.message = WM_KEYDOWN;
  message.wParam = key;
  if (!SWnd::WalkPreTranslateTree(nullptr, &message)) SSent(::SendMessageW(window, WM_KEYDOWN, key, 0));
}

// The mouse of the machine: moves to a point of a window and sends the buttons' events.
inline void RealMouse(const SWnd& window, SPoint at, DWORD events = 0) {
  window.ClientToScreen(&at);
  INPUT input = {};
  input.type = INPUT_MOUSE;
  input.mi.dx = ::MulDiv(at.x, 65536, ::GetSystemMetrics(SM_CXSCREEN)) + 32;
  input.mi.dy = ::MulDiv(at.y, 65536, ::GetSystemMetrics(SM_CYSCREEN)) + 32;
  input.mi.dwFlags = MOUSEEVENTF_MOVE | MOUSEEVENTF_ABSOLUTE | events;
  ::SendInput(1, &input, sizeof input);
}
// Handles messages until the condition holds; false after five seconds.
template <class Condition>
bool PumpUntil(Condition condition) {
  const DWORD start = ::GetTickCount();
  while (!condition()) {
    PumpAll();
    if (::GetTickCount() - start > 5000) return false;
  }
  return true;
}

// Ctrl or Shift is down for a scope.
class KeyIsDown {
 public:
  explicit KeyIsDown(int key) : m_key(key) { Set(0x80); }
  ~KeyIsDown() { Set(0); }

 private:
  void Set(BYTE state) {
    BYTE keys[256] = {};
    ::GetKeyboardState(keys);
    keys[m_key] = state;
    ::SetKeyboardState(keys);
  }
  int m_key;
};

// Tests whose bars stand in a shown frame.
class FrameTest : public UiTest {
 protected:
  explicit FrameTest(int width = 600) : m_width(width) {}
  void SetUp() override {
    UiTest::SetUp();
    m_frame = new SFrameWnd;
    ASSERT_TRUE(m_frame->Create(nullptr, WTEXT("f"), WS_POPUP | WS_VISIBLE, SRect(0, 0, m_width, 300)));
  }
  void TearDown() override {
    m_frame->DestroyWindow();
    UiTest::TearDown();
  }

  const int m_width;
  App m_app;
  SFrameWnd* m_frame = nullptr;
};

}  // namespace test
