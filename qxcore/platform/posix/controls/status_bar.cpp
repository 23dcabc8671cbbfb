// The class "msctls_statusbar32": parts with texts at the bottom of a window.

#include <algorithm>

#include "qxcore/platform/posix/controls/painting.h"
#include "qxcore/platform/posix/controls/status_bar_paint.h"
#include "qxcore/platform/posix/controls/status_bar_parts.h"

namespace platform::controls {

namespace {

void Repaint(HWND window) { InvalidateRect(window, nullptr, FALSE); }

// --- size and place ---

int FontHeight(HWND window, HFONT font) {
  const HDC dc = GetDC(window);
  const HGDIOBJ former = SelectObject(dc, font);
  TEXTMETRICW metrics{};
  GetTextMetricsW(dc, &metrics);
  SelectObject(dc, former);
  ReleaseDC(window, dc);
  return metrics.tmHeight;
}

// The font's height with room around it, at least the minimum of the drawing area and twice the border.
int WantedHeight(HWND window, const StatusBar& bar) {
  return std::max(FontHeight(window, bar.font) + 8, bar.minHeight + 2 * kBarTopBorder);
}

// At the bottom of the parent, as wide as it; the CCS_ styles of the common controls leave its place or its size alone.
void PlaceAtBottom(HWND window, const StatusBar& bar) {
  const DWORD style = StyleOf(window);
  if (style & CCS_NORESIZE) return;
  const int height = WantedHeight(window, bar);
  if (style & CCS_NOPARENTALIGN) {
    RECT rect;
    GetWindowRect(window, &rect);
    SetWindowPos(window, nullptr, 0, 0, rect.right - rect.left, height, SWP_NOMOVE | SWP_NOZORDER | SWP_NOACTIVATE);
    return;
  }
  const RECT area = ClientOf(GetParent(window));
  SetWindowPos(window, nullptr, 0, area.bottom - height, area.right, height, SWP_NOZORDER | SWP_NOACTIVATE);
}

// --- life ---

LRESULT OnCreate(HWND window, const CREATESTRUCTW& create) {
  StatusBar* bar = new StatusBar;
  SetWindowLongPtrW(window, 0, reinterpret_cast<LONG_PTR>(bar));
  bar->ownFont = bar->font = static_cast<HFONT>(GetStockObject(DEFAULT_GUI_FONT));
  bar->parts[0].Set(0, reinterpret_cast<LPARAM>(create.lpszName));
  PlaceAtBottom(window, *bar);
  return 0;
}

LRESULT OnSetFont(HWND window, StatusBar& bar, HFONT font, bool redraw) {
  bar.font = font != nullptr ? font : bar.ownFont;
  PlaceAtBottom(window, bar);
  if (redraw) Repaint(window);
  return 0;
}

// --- parts and texts ---

LRESULT OnSetParts(HWND window, StatusBar& bar, int count, const int* edges) {
  if (!bar.SetParts(count, edges)) return FALSE;
  Repaint(window);
  return TRUE;
}

LRESULT OnGetParts(const StatusBar& bar, int capacity, int* edges) {
  const int count = static_cast<int>(bar.PartCount());
  if (edges == nullptr) return count;
  for (int i = 0; i < std::min(capacity, count); ++i) edges[i] = bar.parts[static_cast<std::size_t>(i)].rightEdge;
  return count;
}

// The low byte names the part, the rest is the type.
LRESULT OnSetText(HWND window, StatusBar& bar, WPARAM wParam, LPARAM shown) {
  const UINT index = LOBYTE(wParam);
  BarPart* part = bar.PartToSet(index);
  if (part == nullptr) return FALSE;
  part->Set(static_cast<UINT>(wParam & 0xFF00), shown);
  if ((part == &bar.simple) != bar.isSimple) return TRUE;
  const RECT rect = bar.PartRect(index, ClientOf(window));
  InvalidateRect(window, &rect, FALSE);
  return TRUE;
}

// The length in the low word, the type in the high one.
LRESULT LengthAndType(const BarPart& part) { return MAKELONG(part.text.size(), part.type); }

LRESULT OnGetTextLength(const StatusBar& bar, UINT index) {
  const BarPart* part = bar.ShownPart(index);
  return part != nullptr ? LengthAndType(*part) : 0;
}

LRESULT OnGetText(const StatusBar& bar, UINT index, LPWSTR buffer) {
  const BarPart* part = bar.ShownPart(index);
  if (part == nullptr) return 0;
  if (part->type & SBT_OWNERDRAW) return part->ownerData;
  if (buffer != nullptr) buffer[part->text.copy(buffer, Text::npos)] = 0;
  return LengthAndType(*part);
}

// The window's text, cut to the buffer.
LRESULT OnGetWindowText(const StatusBar& bar, WPARAM capacity, LPWSTR buffer) {
  if (capacity == 0 || buffer == nullptr) return 0;
  const std::size_t count = bar.parts[0].text.copy(buffer, capacity - 1);
  buffer[count] = 0;
  return static_cast<LRESULT>(count);
}

LRESULT OnGetRect(HWND window, const StatusBar& bar, UINT index, RECT* rect) {
  if (rect == nullptr || bar.ShownPart(index) == nullptr) return FALSE;
  *rect = bar.PartRect(index, ClientOf(window));
  return TRUE;
}

LRESULT OnGetBorders(int* borders) {
  if (borders == nullptr) return FALSE;
  borders[0] = 0;
  borders[1] = kBarTopBorder;
  borders[2] = kBarGap;
  return TRUE;
}

// --- modes ---

LRESULT SendNotify(HWND window, NMHDR* header, UINT code) {
  *header = {window, static_cast<UINT_PTR>(GetWindowLongPtrW(window, GWLP_ID)), code};
  return SendMessageW(GetParent(window), WM_NOTIFY, header->idFrom, reinterpret_cast<LPARAM>(header));
}

LRESULT OnSimple(HWND window, StatusBar& bar, bool isSimple) {
  if (bar.isSimple == isSimple) return TRUE;
  bar.isSimple = isSimple;
  Repaint(window);
  NMHDR header;
  SendNotify(window, &header, SBN_SIMPLEMODECHANGE);
  return TRUE;
}

LRESULT OnSetBackground(HWND window, StatusBar& bar, COLORREF color) {
  const COLORREF former = bar.background;
  bar.background = color;
  Repaint(window);
  return static_cast<LRESULT>(former);
}

// --- mouse ---

LRESULT OnMouse(HWND window, const StatusBar& bar, UINT code, LPARAM lParam) {
  NMMOUSE mouse{};
  mouse.pt = model::PointOf(lParam);
  const int part = bar.isSimple ? SB_SIMPLEID : bar.PartAt(mouse.pt, ClientOf(window));
  mouse.dwItemSpec = static_cast<DWORD_PTR>(part);
  return SendNotify(window, &mouse.hdr, code);
}

LRESULT OnHitTest(HWND window, LPARAM lParam) {
  POINT point = model::PointOf(lParam);
  const RECT client = ClientOf(window);
  ScreenToClient(window, &point);
  const bool isOnGrip = PtInRect(&client, point) && point.x >= client.right - GetSystemMetrics(SM_CXVSCROLL);
  if (isOnGrip && HasGrip(window)) return HTBOTTOMRIGHT;
  return DefWindowProcW(window, WM_NCHITTEST, 0, lParam);
}

// --- painting ---

LRESULT OnPaint(HWND window, const StatusBar& bar, WPARAM wParam) {
  const Painting dc(window, wParam, bar.font);
  PaintStatusBar(window, dc, bar);
  return 0;
}

LRESULT Handle(HWND window, StatusBar& bar, UINT message, WPARAM wParam, LPARAM lParam) {
  switch (message) {
    case SB_SETPARTS:
      return OnSetParts(window, bar, static_cast<int>(wParam), reinterpret_cast<const int*>(lParam));
    case SB_GETPARTS:
      return OnGetParts(bar, static_cast<int>(wParam), reinterpret_cast<int*>(lParam));
    case SB_SETTEXTW:
      return OnSetText(window, bar, wParam, lParam);
    case SB_GETTEXTW:
      return OnGetText(bar, static_cast<UINT>(wParam), reinterpret_cast<LPWSTR>(lParam));
    case SB_GETTEXTLENGTHW:
      return OnGetTextLength(bar, static_cast<UINT>(wParam));
    case SB_GETRECT:
      return OnGetRect(window, bar, static_cast<UINT>(wParam), reinterpret_cast<RECT*>(lParam));
    case SB_GETBORDERS:
      return OnGetBorders(reinterpret_cast<int*>(lParam));
    case SB_SETMINHEIGHT:
      return bar.minHeight = static_cast<int>(wParam), TRUE;
    case SB_SIMPLE:
      return OnSimple(window, bar, wParam != 0);
    case SB_ISSIMPLE:
      return bar.isSimple;
    case SB_SETBKCOLOR:
      return OnSetBackground(window, bar, static_cast<COLORREF>(lParam));
    case SB_GETUNICODEFORMAT:
      return TRUE;
    case WM_SETTEXT:
      return OnSetText(window, bar, 0, lParam);
    case WM_GETTEXT:
      return OnGetWindowText(bar, wParam, reinterpret_cast<LPWSTR>(lParam));
    case WM_GETTEXTLENGTH:
      return static_cast<LRESULT>(bar.parts[0].text.size());
    case WM_SETFONT:
      return OnSetFont(window, bar, reinterpret_cast<HFONT>(wParam), LOWORD(lParam) != 0);
    case WM_GETFONT:
      return reinterpret_cast<LRESULT>(bar.font);
    case WM_SIZE:
      return PlaceAtBottom(window, bar), Repaint(window), 0;
    case WM_PAINT:
    case WM_PRINTCLIENT:
      return OnPaint(window, bar, wParam);
    case WM_ERASEBKGND:
      return TRUE;
    case WM_SYSCOLORCHANGE:
      return Repaint(window), 0;
    case WM_NCHITTEST:
      return OnHitTest(window, lParam);
    case WM_NCLBUTTONDOWN:  // on the grip, which is the parent's
    case WM_NCLBUTTONUP:
      return PostMessageW(GetParent(window), message, wParam, lParam), 0;
    case WM_LBUTTONUP:
      return OnMouse(window, bar, NM_CLICK, lParam);
    case WM_LBUTTONDBLCLK:
      return OnMouse(window, bar, NM_DBLCLK, lParam);
    case WM_RBUTTONUP:
      return OnMouse(window, bar, NM_RCLICK, lParam);
    case WM_RBUTTONDBLCLK:
      return OnMouse(window, bar, NM_RDBLCLK, lParam);
    default:
      return DefWindowProcW(window, message, wParam, lParam);
  }
}

}  // namespace

LRESULT CALLBACK StatusBarProcedure(HWND window, UINT message, WPARAM wParam, LPARAM lParam) {
  constexpr LRESULT kRefused = -1;
  if (message == WM_CREATE) {
    return model::OrNoMemory(kRefused, [=] { return OnCreate(window, *reinterpret_cast<CREATESTRUCTW*>(lParam)); });
  }
  StatusBar* bar = StateOf<StatusBar>(window);
  if (bar == nullptr) return DefWindowProcW(window, message, wParam, lParam);
  if (message == WM_NCDESTROY) {
    FreeState<StatusBar>(window);
    return DefWindowProcW(window, message, wParam, lParam);
  }
  return model::OrNoMemory(LRESULT{0}, [=] { return Handle(window, *bar, message, wParam, lParam); });
}

}  // namespace platform::controls
