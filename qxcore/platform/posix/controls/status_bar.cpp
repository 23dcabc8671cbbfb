// The class "msctls_statusbar32".

#include <utility>

#include "qxcore/platform/posix/controls/painting.h"
#include "qxcore/platform/posix/window/send.h"

namespace platform::controls {
namespace {

using model::Send;
using model::Text;

constexpr int kHorizontalBorder = 0, kVerticalBorder = 2, kGap = 2;  // pixels
constexpr int kMostParts = 256;

struct Part {
  int right = -1;  // -1: up to the end of the bar
  WORD style = 0;
  Text text;
  LPARAM ownerData = 0;  // of SBT_OWNERDRAW
};

struct StatusBar : model::OnModelHeap {
  model::List<Part> parts = model::List<Part>(1);
  Part simple;
  bool isSimple = false;
  int minHeight = 0;
  HFONT font = nullptr;
  COLORREF background = CLR_DEFAULT;
};

DWORD StyleOf(HWND window) { return static_cast<DWORD>(GetWindowLongW(window, GWL_STYLE)); }

// The grip shows where the parent can be sized.
bool HasGrip(HWND window) { return (StyleOf(window) & SBARS_SIZEGRIP) && !IsZoomed(GetParent(window)); }

int FontHeight(const StatusBar* bar) {
  const HDC dc = GetDC(nullptr);
  const HGDIOBJ old = SelectObject(dc, bar->font != nullptr ? bar->font : InterfaceFont());
  TEXTMETRICW metrics{};
  GetTextMetricsW(dc, &metrics);
  SelectObject(dc, old);
  ReleaseDC(nullptr, dc);
  return metrics.tmHeight;
}

RECT PartRect(HWND window, const StatusBar* bar, int index) {
  RECT client;
  GetClientRect(window, &client);
  RECT rect{kHorizontalBorder, client.top + kVerticalBorder, 0, client.bottom};
  if (bar->isSimple || index < 0) {
    rect.right = client.right;
    return rect;
  }
  const auto at = static_cast<std::size_t>(index);
  if (at > 0) rect.left = bar->parts[at - 1].right + kGap;
  rect.right = bar->parts[at].right == -1 ? client.right : bar->parts[at].right;
  rect.right = std::max(rect.right, rect.left);
  return rect;
}

Part* FindPart(StatusBar* bar, UINT index) {
  if (index == SB_SIMPLEID) return &bar->simple;
  return index < bar->parts.size() ? &bar->parts[index] : nullptr;
}

bool SetParts(HWND window, StatusBar* bar, int count, const int* edges) {
  if (count < 1 || count > kMostParts || edges == nullptr) return false;
  return model::OrNoMemory<bool>(false, [&] {
    bar->parts.resize(static_cast<std::size_t>(count));
    for (int i = 0; i < count; ++i) bar->parts[static_cast<std::size_t>(i)].right = edges[i];
    InvalidateRect(window, nullptr, FALSE);
    return true;
  });
}

bool SetPartText(HWND window, StatusBar* bar, WPARAM wParam, LPARAM lParam) {
  const UINT index = LOWORD(wParam) & 0xFF;
  Part* part = FindPart(bar, index);
  if (part == nullptr) return false;
  return model::OrNoMemory<bool>(false, [&] {
    const WORD style = LOWORD(wParam) & 0xFF00;
    if (style & SBT_OWNERDRAW) {
      part->text.clear();
      part->ownerData = lParam;
    } else {
      Text text = lParam != 0 ? Text(reinterpret_cast<LPCWSTR>(lParam)) : Text();
      if (text == part->text && style == part->style) return true;
      part->text = std::move(text);
    }
    part->style = style;
    const RECT rect = PartRect(window, bar, index == SB_SIMPLEID ? -1 : static_cast<int>(index));
    InvalidateRect(window, &rect, FALSE);
    return true;
  });
}

LRESULT PartText(StatusBar* bar, WPARAM wParam, LPWSTR buffer) {
  const Part* part = FindPart(bar, LOWORD(wParam) & 0xFF);
  if (part == nullptr) return 0;
  if (buffer != nullptr) {
    std::copy(part->text.begin(), part->text.end(), buffer);
    buffer[part->text.size()] = 0;
  }
  return MAKELRESULT(part->text.size(), part->style);
}

void DrawByOwner(HWND window, HDC dc, const Part& part, const RECT& rect, int index) {
  DRAWITEMSTRUCT item{};
  item.CtlID = static_cast<UINT>(GetDlgCtrlID(window));
  item.itemID = static_cast<UINT>(index);
  item.hwndItem = window;
  item.hDC = dc;
  item.rcItem = rect;
  item.itemData = static_cast<ULONG_PTR>(part.ownerData);
  Send(GetParent(window), WM_DRAWITEM, item.CtlID, reinterpret_cast<LPARAM>(&item));
}

// A tab centres what follows, a second one sets it at the right.
void PaintTexts(HDC dc, const StatusBar* bar, const Part& part, RECT rect) {
  const UINT kAligned[] = {DT_LEFT, DT_CENTER, DT_RIGHT};
  std::size_t start = 0;
  for (const UINT align : kAligned) {
    const std::size_t tab = part.text.find(u'\t', start);
    const Text piece = part.text.substr(start, tab == Text::npos ? tab : tab - start);
    PaintText(dc, rect, piece.c_str(), COLOR_BTNTEXT, bar->font, align | DT_SINGLELINE | DT_VCENTER | DT_NOPREFIX);
    if (tab == Text::npos) return;
    start = tab + 1;
  }
}

void PaintPart(HWND window, const StatusBar* bar, HDC dc, const Part& part, RECT rect, int index) {
  if (!(part.style & SBT_NOBORDERS))
    DrawEdge(dc, &rect, part.style & SBT_POPOUT ? BDR_RAISEDOUTER : BDR_SUNKENOUTER, BF_RECT);
  rect = model::Inflated(rect, -1, -1);
  if (part.style & SBT_OWNERDRAW) {
    DrawByOwner(window, dc, part, rect, index);
    return;
  }
  rect.left += 2;
  rect.right -= 2;
  PaintTexts(dc, bar, part, rect);
}

void Paint(HWND window, const StatusBar* bar, HDC dc) {
  RECT rect;
  GetClientRect(window, &rect);
  const HBRUSH brush = bar->background != CLR_DEFAULT ? CreateSolidBrush(bar->background) : nullptr;
  FillRect(dc, &rect, brush != nullptr ? brush : GetSysColorBrush(COLOR_3DFACE));
  if (brush != nullptr) DeleteObject(brush);
  if (bar->isSimple) {
    PaintPart(window, bar, dc, bar->simple, PartRect(window, bar, -1), SB_SIMPLEID);
  } else {
    for (std::size_t i = 0; i < bar->parts.size(); ++i)
      PaintPart(window, bar, dc, bar->parts[i], PartRect(window, bar, static_cast<int>(i)), static_cast<int>(i));
  }
  if (!HasGrip(window)) return;
  rect.left = rect.right - GetSystemMetrics(SM_CXVSCROLL);
  rect.top = rect.bottom - GetSystemMetrics(SM_CYHSCROLL);
  DrawFrameControl(dc, &rect, DFC_SCROLL, DFCS_SCROLLSIZEGRIP);
}

// At the parent's lower edge, unless the styles leave the place to the parent.
void Place(HWND window, const StatusBar* bar) {
  const DWORD style = StyleOf(window);
  if (style & CCS_NORESIZE) return;
  RECT parent;
  GetClientRect(GetParent(window), &parent);
  const int height = std::max(FontHeight(bar) + 4, bar->minHeight) + kVerticalBorder;
  const int top = style & CCS_NOPARENTALIGN ? 0 : parent.bottom - height;
  SetWindowPos(window, nullptr, 0, top, parent.right, height, SWP_NOZORDER | SWP_NOACTIVATE);
}

LRESULT HitTest(HWND window, WPARAM wParam, LPARAM lParam) {
  const LRESULT hit = DefWindowProcW(window, WM_NCHITTEST, wParam, lParam);
  if (hit != HTCLIENT || !HasGrip(window)) return hit;
  RECT rect;
  GetClientRect(window, &rect);
  POINT point = model::PointOf(lParam);
  ScreenToClient(window, &point);
  const bool isGrip =
      point.x >= rect.right - GetSystemMetrics(SM_CXVSCROLL) && point.y >= rect.bottom - GetSystemMetrics(SM_CYHSCROLL);
  return isGrip ? HTBOTTOMRIGHT : hit;
}

LRESULT Notify(HWND window, UINT code) {
  NMHDR header{window, static_cast<UINT_PTR>(GetDlgCtrlID(window)), code};
  return Send(GetParent(window), WM_NOTIFY, header.idFrom, reinterpret_cast<LPARAM>(&header));
}

void SetSimple(HWND window, StatusBar* bar, bool isSimple) {
  if (bar->isSimple == isSimple) return;
  bar->isSimple = isSimple;
  InvalidateRect(window, nullptr, FALSE);
  Notify(window, SBN_SIMPLEMODECHANGE);
}

void ReadEdges(const StatusBar* bar, WPARAM count, int* edges) {
  for (std::size_t i = 0; i < bar->parts.size() && i < count; ++i) edges[i] = bar->parts[i].right;
}

LRESULT SetFirstText(HWND window, StatusBar* bar, LPARAM lParam) {
  return SetPartText(window, bar, bar->parts.front().style & ~static_cast<WORD>(SBT_OWNERDRAW), lParam);
}

LRESULT FirstText(const StatusBar* bar, WPARAM capacity, LPWSTR buffer) {
  if (capacity == 0 || buffer == nullptr) return 0;
  const Text& text = bar->parts.front().text;
  const std::size_t count = std::min<std::size_t>(text.size(), capacity - 1);
  std::copy_n(text.data(), count, buffer);
  buffer[count] = 0;
  return static_cast<LRESULT>(count);
}

LRESULT OwnMessage(HWND window, StatusBar* bar, UINT message, WPARAM wParam, LPARAM lParam, bool* isOwn) {
  *isOwn = true;
  switch (message) {
    case SB_SETPARTS:
      return SetParts(window, bar, static_cast<int>(wParam), reinterpret_cast<const int*>(lParam));
    case SB_GETPARTS:
      if (lParam) ReadEdges(bar, wParam, reinterpret_cast<int*>(lParam));
      return static_cast<LRESULT>(bar->parts.size());
    case SB_SETTEXTW:
      return SetPartText(window, bar, wParam, lParam);
    case SB_GETTEXTW:
      return PartText(bar, wParam, reinterpret_cast<LPWSTR>(lParam));
    case SB_GETTEXTLENGTHW:
      return PartText(bar, wParam, nullptr);
    case SB_GETRECT:
      if (wParam >= bar->parts.size()) return FALSE;
      *reinterpret_cast<RECT*>(lParam) = PartRect(window, bar, static_cast<int>(wParam));
      return TRUE;
    case SB_GETBORDERS: {
      int* borders = reinterpret_cast<int*>(lParam);
      borders[0] = kHorizontalBorder;
      borders[1] = kVerticalBorder;
      borders[2] = kGap;
      return TRUE;
    }
    case SB_SETMINHEIGHT:
      bar->minHeight = static_cast<int>(wParam);
      return TRUE;
    case SB_SIMPLE:
      SetSimple(window, bar, wParam != 0);
      return TRUE;
    case SB_ISSIMPLE:
      return bar->isSimple;
    case SB_SETBKCOLOR:
      InvalidateRect(window, nullptr, FALSE);
      return static_cast<LRESULT>(std::exchange(bar->background, static_cast<COLORREF>(lParam)));
    case SB_SETUNICODEFORMAT:
    case SB_GETUNICODEFORMAT:
      return TRUE;
    default:
      *isOwn = false;
      return 0;
  }
}

}  // namespace

LRESULT CALLBACK StatusBarProcedure(HWND window, UINT message, WPARAM wParam, LPARAM lParam) {
  StatusBar* bar = StateOf<StatusBar>(window);
  if (bar == nullptr && message != WM_NCCREATE) return DefWindowProcW(window, message, wParam, lParam);
  bool isOwn = false;
  if (bar != nullptr) {
    const LRESULT result = OwnMessage(window, bar, message, wParam, lParam, &isOwn);
    if (isOwn) return result;
  }
  switch (message) {
    case WM_NCCREATE:
      if (!MakeState<StatusBar>(window)) return FALSE;
      break;
    case WM_NCDESTROY:
      FreeState<StatusBar>(window);
      break;
    case WM_CREATE: {
      const auto* create = reinterpret_cast<const CREATESTRUCTW*>(lParam);
      if (create->lpszName != nullptr && !IS_INTRESOURCE(create->lpszName))
        SetFirstText(window, bar, reinterpret_cast<LPARAM>(create->lpszName));
      Place(window, bar);
      return 0;
    }
    case WM_SIZE:
      Place(window, bar);
      InvalidateRect(window, nullptr, FALSE);
      return 0;
    case WM_NCHITTEST:
      return HitTest(window, wParam, lParam);
    case WM_NCLBUTTONDOWN:
      // The grip sizes the parent.
      if (wParam == HTBOTTOMRIGHT) return Send(GetParent(window), message, wParam, lParam);
      break;
    case WM_ERASEBKGND:
      return TRUE;
    case WM_PAINT: {
      PAINTSTRUCT paint;
      const HDC dc = BeginPaint(window, &paint);
      if (dc != nullptr) Paint(window, bar, dc);
      EndPaint(window, &paint);
      return 0;
    }
    case WM_PRINTCLIENT:
      Paint(window, bar, reinterpret_cast<HDC>(wParam));
      return 0;
    case WM_SETFONT:
      bar->font = reinterpret_cast<HFONT>(wParam);
      if (LOWORD(lParam)) InvalidateRect(window, nullptr, FALSE);
      return 0;
    case WM_GETFONT:
      return reinterpret_cast<LRESULT>(bar->font != nullptr ? bar->font : InterfaceFont());
    case WM_SETTEXT:
      return SetFirstText(window, bar, lParam);
    case WM_GETTEXT:
      return FirstText(bar, wParam, reinterpret_cast<LPWSTR>(lParam));
    case WM_GETTEXTLENGTH:
      return static_cast<LRESULT>(bar->parts.front().text.size());
    case WM_LBUTTONUP:
      Notify(window, NM_CLICK);
      break;
    case WM_LBUTTONDBLCLK:
      Notify(window, NM_DBLCLK);
      break;
    case WM_RBUTTONUP:
      Notify(window, NM_RCLICK);
      break;
    default:
      break;
  }
  return DefWindowProcW(window, message, wParam, lParam);
}

}  // namespace platform::controls
