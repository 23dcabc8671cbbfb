// The non-client area: how much it takes, and which part of it lies under a point.

#include "qxcore/platform/posix/window/frame.h"

#include "qxcore/platform/posix/window/controls.h"
#include "qxcore/platform/posix/window/default_proc.h"
#include "qxcore/platform/posix/window/menu.h"
#include "qxcore/platform/posix/window/paint.h"
#include "qxcore/platform/posix/window/place.h"
#include "qxcore/platform/posix/window/send.h"
#include "qxcore/platform/posix/window/tree.h"

namespace platform {
Painter g_painter;
}

namespace platform::model {
namespace {

bool HasCaption(DWORD style) { return (style & WS_CAPTION) == WS_CAPTION; }

int CaptionHeight(DWORD exStyle) {
  return GetSystemMetrics(exStyle & WS_EX_TOOLWINDOW ? SM_CYSMCAPTION : SM_CYCAPTION);
}

int BorderWidth(DWORD style, DWORD exStyle) {
  int width = 0;
  if ((exStyle & (WS_EX_STATICEDGE | WS_EX_DLGMODALFRAME)) == WS_EX_STATICEDGE) {
    width = 1;
  } else if ((exStyle & WS_EX_DLGMODALFRAME) || (style & (WS_THICKFRAME | WS_DLGFRAME))) {
    width = 2;
  }
  if (style & WS_THICKFRAME) width += GetSystemMetrics(SM_CXSIZEFRAME) - GetSystemMetrics(SM_CXDLGFRAME);
  if ((style & (WS_BORDER | WS_DLGFRAME)) || (exStyle & WS_EX_DLGMODALFRAME)) ++width;
  return width;
}

int EdgeWidth(DWORD exStyle) { return exStyle & WS_EX_CLIENTEDGE ? GetSystemMetrics(SM_CXEDGE) : 0; }

// Where the size border is hit: the corners reach along the edges as far as the caption is high.
int BorderHit(const Window* window, POINT point) {
  const RECT whole = AtOrigin(window->window);
  const int border = BorderWidth(window->style, window->exStyle);
  const RECT inside = Inflated(whole, -border, -border);
  if (Contains(inside, point)) return HTNOWHERE;
  if (!(window->style & WS_THICKFRAME) || (window->style & (WS_MINIMIZE | WS_MAXIMIZE))) return HTBORDER;
  const int corner = border + GetSystemMetrics(SM_CYCAPTION) - 1;
  const int column = point.x < whole.left + corner ? 0 : point.x >= whole.right - corner ? 2 : 1;
  const int row = point.y < whole.top + corner ? 0 : point.y >= whole.bottom - corner ? 2 : 1;
  static constexpr int kParts[3][3] = {
      {HTTOPLEFT, HTTOP, HTTOPRIGHT}, {HTLEFT, HTBORDER, HTRIGHT}, {HTBOTTOMLEFT, HTBOTTOM, HTBOTTOMRIGHT}};
  return kParts[row][column];
}

// The buttons stand at the right, each as wide as the caption is high: close, then maximise, then minimise.
int CaptionHit(const Window* window, POINT point) {
  const RECT caption = CaptionRect(window);
  if (!(window->style & WS_SYSMENU)) return HTCAPTION;
  const int width = Height(caption) - 1;
  const int fromRight = (caption.right - 1 - point.x) / std::max(width, 1);
  if (fromRight == 0) return HTCLOSE;
  const bool hasBoxes = window->style & (WS_MINIMIZEBOX | WS_MAXIMIZEBOX);
  if (hasBoxes && !(window->exStyle & WS_EX_TOOLWINDOW)) {
    if (fromRight == 1) return HTMAXBUTTON;
    if (fromRight == 2) return HTMINBUTTON;
  }
  const bool hasIcon = !(window->exStyle & (WS_EX_TOOLWINDOW | WS_EX_DLGMODALFRAME));
  return hasIcon && point.x < caption.left + width ? HTSYSMENU : HTCAPTION;
}

int HitInWindow(const Window* window, POINT point) {
  if (!Contains(AtOrigin(window->window), point)) return HTNOWHERE;
  if (window->style & WS_MINIMIZE) return HTCAPTION;
  if (Contains(ClientInWindow(window), point)) return HTCLIENT;
  if (const int border = BorderHit(window, point); border != HTNOWHERE) return border;
  if (Contains(CaptionRect(window), point)) return CaptionHit(window, point);
  if (Contains(MenuBarRect(window), point)) return HTMENU;
  if (Contains(VerticalBarRect(window), point)) return HTVSCROLL;
  if (Contains(HorizontalBarRect(window), point)) return HTHSCROLL;
  // The corner between two scroll bars.
  const bool hasBoth = (window->style & (WS_VSCROLL | WS_HSCROLL)) == (WS_VSCROLL | WS_HSCROLL);
  return hasBoth ? HTSIZE : HTNOWHERE;
}

// Takes the frame, the menu bar and the scroll bars off a rectangle.
RECT ClientOf(HWND handle, RECT rect) {
  DWORD style, exStyle;
  bool hasMenu = false;
  {
    const Guard guard;
    const Window* window = FindWindowObject(handle);
    if (window == nullptr) return rect;
    style = window->style;
    exStyle = window->exStyle;
    hasMenu = HasMenu(window);
  }
  if (style & WS_MINIMIZE) return {rect.left, rect.top, rect.left, rect.top};
  const RECT frame = FrameWidths(style, exStyle & ~WS_EX_CLIENTEDGE);
  rect = {rect.left + frame.left, rect.top + frame.top, rect.right - frame.right, rect.bottom - frame.bottom};
  if (hasMenu) rect.top += MenuBarHeight(handle, Width(rect));
  const int edge = EdgeWidth(exStyle);
  if (Width(rect) > 2 * edge && Height(rect) > 2 * edge) rect = Inflated(rect, -edge, -edge);
  if (style & WS_VSCROLL && Width(rect) >= GetSystemMetrics(SM_CXVSCROLL)) {
    (exStyle & WS_EX_LEFTSCROLLBAR ? rect.left : rect.right) +=
        exStyle & WS_EX_LEFTSCROLLBAR ? GetSystemMetrics(SM_CXVSCROLL) : -GetSystemMetrics(SM_CXVSCROLL);
  }
  if (style & WS_HSCROLL && Height(rect) > GetSystemMetrics(SM_CYHSCROLL))
    rect.bottom -= GetSystemMetrics(SM_CYHSCROLL);
  rect.right = std::max(rect.right, rect.left);
  rect.bottom = std::max(rect.bottom, rect.top);
  return rect;
}

}  // namespace

RECT FrameWidths(DWORD style, DWORD exStyle) {
  const int width = BorderWidth(style, exStyle) + EdgeWidth(exStyle);
  return {width, width + (HasCaption(style) ? CaptionHeight(exStyle) : 0), width, width};
}

bool HasMenu(const Window* window) {
  return !(window->style & WS_CHILD) && FindObject(Kind::Menu, reinterpret_cast<void*>(window->idOrMenu)) != nullptr;
}

RECT InsideBorder(const Window* window) {
  const int border = BorderWidth(window->style, window->exStyle);
  return Inflated(AtOrigin(window->window), -border, -border);
}

RECT CaptionRect(const Window* window) {
  if (!HasCaption(window->style)) return {};
  RECT rect = InsideBorder(window);
  rect.bottom = rect.top + CaptionHeight(window->exStyle);
  return rect;
}

RECT MenuBarRect(const Window* window) {
  if (!HasMenu(window)) return {};
  RECT rect = InsideBorder(window);
  if (HasCaption(window->style)) rect.top += CaptionHeight(window->exStyle);
  rect.bottom = ClientInWindow(window).top - EdgeWidth(window->exStyle);
  return rect;
}

RECT VerticalBarRect(const Window* window) {
  if (!(window->style & WS_VSCROLL)) return {};
  const RECT client = ClientInWindow(window);
  const int width = GetSystemMetrics(SM_CXVSCROLL);
  if (window->exStyle & WS_EX_LEFTSCROLLBAR) return {client.left - width, client.top, client.left, client.bottom};
  return {client.right, client.top, client.right + width, client.bottom};
}

RECT HorizontalBarRect(const Window* window) {
  if (!(window->style & WS_HSCROLL)) return {};
  const RECT client = ClientInWindow(window);
  return {client.left, client.bottom, client.right, client.bottom + GetSystemMetrics(SM_CYHSCROLL)};
}

bool IsTopLevel(HWND handle) {
  const Guard guard;
  const Window* window = FindWindowObject(handle);
  return window != nullptr && window->parent == Desktop();
}

void PaintFrame(HWND handle) {
  if (g_painter.nonClient != nullptr && IsWindowVisible(handle)) g_painter.nonClient(handle);
}

LRESULT DefaultCalcSize(HWND handle, BOOL, LPARAM lParam) {
  // Both forms begin with the rectangle.
  RECT* rect = reinterpret_cast<RECT*>(lParam);
  *rect = ClientOf(handle, *rect);
  return 0;
}

LRESULT DefaultHitTest(HWND handle, POINT point) {
  const Guard guard;
  const Window* window = FindWindowObject(handle);
  if (window == nullptr) return HTNOWHERE;
  const RECT rect = ScreenRect(window);
  return HitInWindow(window, {point.x - rect.left, point.y - rect.top});
}

LRESULT DefaultNcActivate(HWND handle, BOOL active) {
  {
    const Guard guard;
    Window* window = FindWindowObject(handle);
    if (window == nullptr) return FALSE;
    window->isActiveFrame = active;
  }
  PaintFrame(handle);
  return TRUE;
}

}  // namespace platform::model
