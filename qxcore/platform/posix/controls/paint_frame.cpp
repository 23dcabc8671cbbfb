// The parts of windows that are not their own: frame, caption, menu bar, scroll bars, popup menus.

#include "qxcore/platform/posix/controls/painting.h"
#include "qxcore/platform/posix/window/controls.h"
#include "qxcore/platform/posix/window/frame.h"
#include "qxcore/platform/posix/window/menu.h"
#include "qxcore/platform/posix/window/scroll.h"

namespace platform::controls {
namespace {

using namespace platform::model;

// A window's frame, copied so that painting needs no lock.
struct Frame {
  DWORD style = 0, exStyle = 0;
  bool isActive = false;
  RECT whole{}, inside{}, caption{}, menuBar{}, horizontal{}, vertical{}, client{};
  ScrollBar horizontalBar, verticalBar;
  HMENU menu = nullptr;
  Text title;
};

Frame FrameOf(HWND handle) {
  Frame frame;
  const Guard guard;
  const Window* window = FindWindowObject(handle);
  if (window == nullptr) return frame;
  frame.style = window->style;
  frame.exStyle = window->exStyle;
  frame.isActive = window->isActiveFrame;
  frame.whole = AtOrigin(window->window);
  frame.inside = InsideBorder(window);
  frame.caption = CaptionRect(window);
  frame.menuBar = MenuBarRect(window);
  frame.horizontal = HorizontalBarRect(window);
  frame.vertical = VerticalBarRect(window);
  frame.client = ClientInWindow(window);
  if (window->scrollBars != nullptr) {
    frame.horizontalBar = window->scrollBars->horizontal;
    frame.verticalBar = window->scrollBars->vertical;
  }
  if (HasMenu(window)) frame.menu = reinterpret_cast<HMENU>(window->idOrMenu);
  frame.title = window->text;
  return frame;
}

void PaintBorder(HDC dc, const Frame& frame) {
  RECT rect = frame.whole;
  for (int i = 0; rect.left + i < frame.inside.left; ++i) {
    RECT line = Inflated(rect, -i, -i);
    FrameRect(dc, &line, GetSysColorBrush(i == 0 ? COLOR_WINDOWFRAME : COLOR_3DFACE));
  }
  if (frame.exStyle & WS_EX_CLIENTEDGE) {
    RECT edge = frame.client;
    if (frame.style & WS_VSCROLL) edge.right = std::max(edge.right, frame.vertical.right);
    if (frame.style & WS_HSCROLL) edge.bottom = std::max(edge.bottom, frame.horizontal.bottom);
    edge = Inflated(edge, GetSystemMetrics(SM_CXEDGE), GetSystemMetrics(SM_CYEDGE));
    DrawEdge(dc, &edge, EDGE_SUNKEN, BF_RECT);
  }
}

void PaintCaption(HDC dc, const Frame& frame) {
  if (Height(frame.caption) <= 0) return;
  FillRect(dc, &frame.caption, GetSysColorBrush(frame.isActive ? COLOR_ACTIVECAPTION : COLOR_INACTIVECAPTION));
  RECT text = frame.caption;
  if (frame.style & WS_SYSMENU) text.right -= Height(frame.caption);
  text.left += GetSystemMetrics(SM_CXEDGE);
  PaintText(dc, text, frame.title.c_str(), frame.isActive ? COLOR_CAPTIONTEXT : COLOR_INACTIVECAPTIONTEXT, nullptr,
            DT_SINGLELINE | DT_VCENTER | DT_NOPREFIX | DT_END_ELLIPSIS);
  if (!(frame.style & WS_SYSMENU)) return;
  const int size = Height(frame.caption) - 1;
  RECT button{frame.caption.right - size, frame.caption.top + 1, frame.caption.right - 1, frame.caption.top + size - 1};
  DrawFrameControl(dc, &button, DFC_CAPTION, DFCS_CAPTIONCLOSE);
  if (frame.exStyle & WS_EX_TOOLWINDOW || !(frame.style & (WS_MINIMIZEBOX | WS_MAXIMIZEBOX))) return;
  button = Moved(button, -size, 0);
  const UINT middle = frame.style & WS_MAXIMIZE ? DFCS_CAPTIONRESTORE : DFCS_CAPTIONMAX;
  DrawFrameControl(dc, &button, DFC_CAPTION, middle | (frame.style & WS_MAXIMIZEBOX ? 0u : DFCS_INACTIVE));
  button = Moved(button, -size, 0);
  DrawFrameControl(dc, &button, DFC_CAPTION, DFCS_CAPTIONMIN | (frame.style & WS_MINIMIZEBOX ? 0u : DFCS_INACTIVE));
}

struct Items {
  List<MenuItem> items;
  int highlighted = -1;
};

Items ItemsOf(HMENU handle) {
  const Guard guard;
  const Menu* menu = FindMenu(handle);
  return menu != nullptr ? Items{menu->items, menu->highlighted} : Items{};
}

void PaintItem(HDC dc, const MenuItem& item, RECT rect, bool isHighlighted, int indent) {
  if (item.type & MFT_SEPARATOR) {
    const int middle = (rect.top + rect.bottom) / 2;
    RECT line{rect.left, middle, rect.right, middle + 2};
    DrawEdge(dc, &line, EDGE_ETCHED, BF_TOP);
    return;
  }
  if (isHighlighted) FillRect(dc, &rect, GetSysColorBrush(COLOR_HIGHLIGHT));
  const bool isOff = item.state & (MF_GRAYED | MF_DISABLED);
  const int color = isOff ? COLOR_GRAYTEXT : isHighlighted ? COLOR_HIGHLIGHTTEXT : COLOR_MENUTEXT;
  if (item.state & MFS_CHECKED) {
    RECT check{rect.left, rect.top, rect.left + indent, rect.bottom};
    DrawFrameControl(dc, &check, DFC_MENU, item.type & MFT_RADIOCHECK ? DFCS_MENUBULLET : DFCS_MENUCHECK);
  }
  rect.left += indent;
  const std::size_t tab = item.text.find(u'\t');
  const Text label = item.text.substr(0, tab);
  PaintText(dc, rect, label.c_str(), color, nullptr, DT_SINGLELINE | DT_VCENTER);
  if (tab == Text::npos) return;
  rect.right -= GetSystemMetrics(SM_CXMENUCHECK);
  PaintText(dc, rect, item.text.c_str() + tab + 1, color, nullptr, DT_SINGLELINE | DT_VCENTER | DT_RIGHT);
}

constexpr int kBarIndent = 6, kPopupIndent = 20;  // at 96 dots an inch

void PaintMenuBar(HDC dc, const Frame& frame) {
  if (frame.menu == nullptr) return;
  FillRect(dc, &frame.menuBar, GetSysColorBrush(COLOR_MENUBAR));
  const Items all = ItemsOf(frame.menu);
  for (std::size_t i = 0; i < all.items.size(); ++i)
    PaintItem(dc, all.items[i], Moved(all.items[i].place, frame.menuBar.left, frame.menuBar.top),
              static_cast<int>(i) == all.highlighted, Scaled(kBarIndent));
}

void PaintNonClient(HWND window) {
  const HDC dc = GetWindowDC(window);
  if (dc == nullptr) return;
  const Frame frame = FrameOf(window);
  PaintBorder(dc, frame);
  PaintCaption(dc, frame);
  PaintMenuBar(dc, frame);
  if (frame.style & WS_VSCROLL) PaintScrollBar(dc, frame.vertical, frame.verticalBar, true);
  if (frame.style & WS_HSCROLL) PaintScrollBar(dc, frame.horizontal, frame.horizontalBar, false);
  if ((frame.style & (WS_VSCROLL | WS_HSCROLL)) == (WS_VSCROLL | WS_HSCROLL)) {
    const RECT corner{frame.vertical.left, frame.horizontal.top, frame.vertical.right, frame.horizontal.bottom};
    FillRect(dc, &corner, GetSysColorBrush(COLOR_3DFACE));
  }
  ReleaseDC(window, dc);
}

void PaintPopup(HWND window, HMENU menu) {
  const HDC dc = GetWindowDC(window);
  if (dc == nullptr) return;
  RECT rect = FrameOf(window).whole;
  FillRect(dc, &rect, GetSysColorBrush(COLOR_MENU));
  DrawEdge(dc, &rect, EDGE_RAISED, BF_RECT);
  const Items all = ItemsOf(menu);
  for (std::size_t i = 0; i < all.items.size(); ++i) {
    PaintItem(dc, all.items[i], all.items[i].place, static_cast<int>(i) == all.highlighted, Scaled(kPopupIndent));
    if (all.items[i].subMenu == nullptr) continue;
    RECT arrow = all.items[i].place;
    arrow.left = arrow.right - GetSystemMetrics(SM_CXMENUCHECK);
    DrawFrameControl(dc, &arrow, DFC_MENU, DFCS_MENUARROW);
  }
  ReleaseDC(window, dc);
}

// Without memory for a copy of the texts nothing is painted; the frame is painted anew with the next change.
void NonClient(HWND window) {
  OrNoMemory<int>(0, [&] { return PaintNonClient(window), 0; });
}

void PopupMenu(HWND window, HMENU menu) {
  OrNoMemory<int>(0, [&] { return PaintPopup(window, menu), 0; });
}

}  // namespace

HFONT InterfaceFont() {
  static const HFONT font = [] {
    NONCLIENTMETRICSW metrics{};
    metrics.cbSize = sizeof metrics;
    SystemParametersInfoW(SPI_GETNONCLIENTMETRICS, sizeof metrics, &metrics, 0);
    return CreateFontIndirectW(&metrics.lfMessageFont);
  }();
  return font;
}

void PaintText(HDC dc, RECT rect, LPCWSTR text, int color, HFONT font, UINT format) {
  const HGDIOBJ old = SelectObject(dc, font != nullptr ? font : InterfaceFont());
  const int oldMode = SetBkMode(dc, TRANSPARENT);
  const COLORREF oldColor = SetTextColor(dc, GetSysColor(color));
  DrawTextW(dc, text, -1, &rect, format);
  SetTextColor(dc, oldColor);
  SetBkMode(dc, oldMode);
  SelectObject(dc, old);
}

void PaintScrollBar(HDC dc, const RECT& rect, const ScrollBar& bar, bool isVertical) {
  const int length = isVertical ? Height(rect) : Width(rect);
  const ScrollParts parts = PartsOf(bar, length);
  const auto piece = [&](int from, int to) {
    return isVertical ? RECT{rect.left, rect.top + from, rect.right, rect.top + to}
                      : RECT{rect.left + from, rect.top, rect.left + to, rect.bottom};
  };
  const UINT off = bar.arrows == ESB_DISABLE_BOTH ? DFCS_INACTIVE : 0u;
  RECT part = piece(0, parts.arrow);
  DrawFrameControl(dc, &part, DFC_SCROLL, (isVertical ? DFCS_SCROLLUP : DFCS_SCROLLLEFT) | off);
  part = piece(length - parts.arrow, length);
  DrawFrameControl(dc, &part, DFC_SCROLL, (isVertical ? DFCS_SCROLLDOWN : DFCS_SCROLLRIGHT) | off);
  part = piece(parts.arrow, length - parts.arrow);
  FillRect(dc, &part, GetSysColorBrush(COLOR_SCROLLBAR));
  if (parts.thumbSize == 0) return;
  part = piece(parts.thumb, parts.thumb + parts.thumbSize);
  FillRect(dc, &part, GetSysColorBrush(COLOR_3DFACE));
  DrawEdge(dc, &part, EDGE_RAISED, BF_RECT);
}

void InstallPainter() {
  g_painter.nonClient = &NonClient;
  g_painter.popupMenu = &PopupMenu;
}

}  // namespace platform::controls
