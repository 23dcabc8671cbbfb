// The class "ScrollBar": scroll bars that are windows, and size boxes.

#include "qxcore/platform/posix/controls/painting.h"
#include "qxcore/platform/posix/window/send.h"

namespace platform::controls {
namespace {

using model::Send;

struct Control : model::OnModelHeap {
  model::ScrollBar bar;
  Control() { bar.highest = 0; }
};

bool IsVertical(HWND window) { return StyleOf(window) & SBS_VERT; }
bool IsBox(HWND window) { return StyleOf(window) & (SBS_SIZEBOX | SBS_SIZEGRIP); }

void Change(HWND window, Control* control, const SCROLLINFO& info, bool redraw) {
  const bool changed = model::ChangeScrollBar(control->bar, info);
  if ((info.fMask & SIF_DISABLENOSCROLL) && (info.fMask & (SIF_RANGE | SIF_PAGE)))
    EnableScrollBar(window, SB_CTL,
                    model::LastPosition(control->bar) > control->bar.lowest ? ESB_ENABLE_BOTH : ESB_DISABLE_BOTH);
  if (changed && redraw) InvalidateRect(window, nullptr, FALSE);
}

void SetPosition(HWND window, Control* control, int position, bool redraw) {
  const SCROLLINFO info{sizeof info, SIF_POS, 0, 0, 0, position, 0};
  Change(window, control, info, redraw);
}

void SetRange(HWND window, Control* control, int lowest, int highest, bool redraw) {
  const SCROLLINFO info{sizeof info, SIF_RANGE, lowest, highest, 0, 0, 0};
  Change(window, control, info, redraw);
}

void Key(HWND window, WPARAM key) {
  struct Entry {
    BYTE key;
    UINT code;
  };
  static constexpr Entry kKeys[] = {{VK_PRIOR, SB_PAGEUP},   {VK_NEXT, SB_PAGEDOWN}, {VK_HOME, SB_TOP},
                                    {VK_END, SB_BOTTOM},     {VK_LEFT, SB_LINEUP},   {VK_UP, SB_LINEUP},
                                    {VK_RIGHT, SB_LINEDOWN}, {VK_DOWN, SB_LINEDOWN}};
  for (const Entry& entry : kKeys)
    if (entry.key == key)
      Send(GetParent(window), IsVertical(window) ? WM_VSCROLL : WM_HSCROLL, entry.code,
           reinterpret_cast<LPARAM>(window));
}

void Press(HWND window, const Control* control, LPARAM lParam) {
  if (StyleOf(window) & WS_TABSTOP) SetFocus(window);
  RECT rect;
  GetWindowRect(window, &rect);
  POINT point = model::PointOf(lParam);
  ClientToScreen(window, &point);
  model::TrackBar(window, GetParent(window), window, IsVertical(window) ? SB_VERT : SB_HORZ, rect, control->bar, point);
}

void Paint(HWND window, const Control* control, HDC dc) {
  RECT rect = ClientOf(window);
  if (!IsBox(window)) {
    PaintScrollBar(dc, rect, control->bar, IsVertical(window));
    return;
  }
  FillRect(dc, &rect, GetSysColorBrush(COLOR_3DFACE));
  if (StyleOf(window) & SBS_SIZEGRIP) DrawFrameControl(dc, &rect, DFC_SCROLL, DFCS_SCROLLSIZEGRIP);
}

LRESULT Handle(HWND window, Control* control, UINT message, WPARAM wParam, LPARAM lParam) {
  switch (message) {
    case WM_NCHITTEST:
      if (StyleOf(window) & SBS_SIZEGRIP && IsWindowEnabled(window)) return HTBOTTOMRIGHT;
      break;
    case WM_LBUTTONDOWN:
    case WM_LBUTTONDBLCLK:
      if (!IsBox(window)) Press(window, control, lParam);
      return 0;
    case WM_KEYDOWN:
      Key(window, wParam);
      return 0;
    case WM_ENABLE:
      control->bar.arrows = wParam ? ESB_ENABLE_BOTH : ESB_DISABLE_BOTH;
      InvalidateRect(window, nullptr, FALSE);
      return 0;
    case SBM_SETPOS: {
      const int old = control->bar.position;
      SetPosition(window, control, static_cast<int>(wParam), lParam != 0);
      return old;
    }
    case SBM_GETPOS:
      return control->bar.position;
    case SBM_SETRANGE:
    case SBM_SETRANGEREDRAW: {
      const int old = control->bar.position;
      SetRange(window, control, static_cast<int>(wParam), static_cast<int>(lParam), message == SBM_SETRANGEREDRAW);
      return old;
    }
    case SBM_GETRANGE:
      if (wParam) *reinterpret_cast<int*>(wParam) = control->bar.lowest;
      if (lParam) *reinterpret_cast<int*>(lParam) = control->bar.highest;
      return 0;
    case SBM_ENABLE_ARROWS: {
      const bool changed = control->bar.arrows != wParam;
      control->bar.arrows = static_cast<UINT>(wParam);
      if (changed) InvalidateRect(window, nullptr, FALSE);
      return changed;
    }
    case SBM_SETSCROLLINFO:
      Change(window, control, *reinterpret_cast<const SCROLLINFO*>(lParam), wParam != 0);
      return control->bar.position;
    case SBM_GETSCROLLINFO:
      model::ReadScrollBar(control->bar, *reinterpret_cast<SCROLLINFO*>(lParam));
      return TRUE;
    default:
      break;
  }
  return DefWindowProcW(window, message, wParam, lParam);
}

}  // namespace

LRESULT CALLBACK ScrollBarProcedure(HWND window, UINT message, WPARAM wParam, LPARAM lParam) {
  return ControlMessage<Control, &Paint, &Handle>(window, message, wParam, lParam);
}

}  // namespace platform::controls
