#include "qxcore/platform/posix/controls/status_bar_paint.h"

#include <algorithm>

#include "qxcore/platform/posix/controls/control.h"

namespace platform::controls {

namespace {

constexpr int kTextIndent = 3;  // at 96 dots an inch

COLORREF BackgroundOf(const StatusBar& bar) {
  return bar.background == CLR_DEFAULT ? GetSysColor(COLOR_3DFACE) : bar.background;
}

void Fill(HDC dc, const RECT& rect, COLORREF color) {
  SetBkColor(dc, color);
  ExtTextOutW(dc, 0, 0, ETO_OPAQUE, &rect, nullptr, 0, nullptr);
}

// A text is indented at the side where it begins, and may fill the part to its other edge.
RECT Indented(RECT rect, UINT side) {
  const int indent = model::Scaled(kTextIndent);
  if (side != DT_RIGHT) rect.left += indent;
  if (side != DT_LEFT) rect.right -= indent;
  return rect;
}

// A text has up to three sections, which tabs part: left, centred, right.
void DrawSections(HDC dc, const RECT& rect, const BarPart& part) {
  const UINT reading = part.type & SBT_RTLREADING ? DT_RTLREADING : 0;
  const UINT sides[] = {reading ? DT_RIGHT : DT_LEFT, DT_CENTER, reading ? DT_LEFT : DT_RIGHT};
  std::size_t start = 0;
  for (UINT side : sides) {
    const bool isLast = side == sides[2] || (part.type & SBT_NOTABPARSING);
    const std::size_t tab = isLast ? Text::npos : part.text.find(u'\t', start);
    const std::size_t end = std::min(tab, part.text.size());
    RECT place = Indented(rect, side);
    DrawTextW(dc, part.text.data() + start, static_cast<int>(end - start), &place,
              side | reading | DT_SINGLELINE | DT_VCENTER | DT_NOPREFIX);
    if (tab >= part.text.size()) return;
    start = tab + 1;
  }
}

void AskOwner(HWND window, HDC dc, UINT index, const BarPart& part, const RECT& rect) {
  DRAWITEMSTRUCT item{};
  item.CtlID = static_cast<UINT>(GetWindowLongPtrW(window, GWLP_ID));
  item.itemID = index;
  item.itemAction = ODA_DRAWENTIRE;
  item.hwndItem = window;
  item.hDC = dc;
  item.rcItem = rect;
  item.itemData = static_cast<ULONG_PTR>(part.ownerData);
  SendMessageW(GetParent(window), WM_DRAWITEM, item.CtlID, reinterpret_cast<LPARAM>(&item));
}

void PaintPart(HWND window, HDC dc, UINT index, const BarPart& part, RECT rect) {
  if ((part.type & SBT_NOBORDERS) == 0) {
    DrawEdge(dc, &rect, part.type & SBT_POPOUT ? BDR_RAISEDOUTER : BDR_SUNKENOUTER, BF_RECT | BF_ADJUST);
  }
  const int saved = SaveDC(dc);
  IntersectClipRect(dc, rect.left, rect.top, rect.right, rect.bottom);
  if (part.type & SBT_OWNERDRAW) {
    AskOwner(window, dc, index, part, rect);
  } else {
    SetBkMode(dc, TRANSPARENT);
    SetTextColor(dc, GetSysColor(COLOR_BTNTEXT));
    DrawSections(dc, rect, part);
  }
  RestoreDC(dc, saved);
}

// Three diagonal ridges in the bottom right corner.
void PaintGrip(HWND window, HDC dc) {
  if (!HasGrip(window)) return;
  RECT rect = ClientOf(window);
  rect.left = rect.right - GetSystemMetrics(SM_CXVSCROLL);
  rect.top = rect.bottom - std::min<LONG>(GetSystemMetrics(SM_CYHSCROLL), rect.bottom - rect.top);
  DrawFrameControl(dc, &rect, DFC_SCROLL, DFCS_SCROLLSIZEGRIP);
}

}  // namespace

bool HasGrip(HWND window) { return (StyleOf(window) & SBARS_SIZEGRIP) != 0 && !IsZoomed(GetParent(window)); }

void PaintStatusBar(HWND window, HDC dc, const StatusBar& bar) {
  const RECT client = ClientOf(window);
  const int saved = SaveDC(dc);
  Fill(dc, client, BackgroundOf(bar));
  PaintGrip(window, dc);
  // An owner may change the parts while it paints one, and even destroy the bar.
  for (UINT i = 0; IsWindow(window) && i < (bar.isSimple ? 1 : bar.PartCount()); ++i) {
    const BarPart part = *bar.ShownPart(i);
    PaintPart(window, dc, i, part, bar.PartRect(i, client));
  }
  RestoreDC(dc, saved);
}

}  // namespace platform::controls
