// The class "Static": texts, frames and rectangles.

#include "qxcore/platform/posix/controls/painting.h"
#include "qxcore/platform/posix/window/send.h"

namespace platform::controls {
namespace {

struct Static : model::OnModelHeap {
  HFONT font = nullptr;
};

UINT TextFormat(DWORD style) {
  UINT format = style & SS_NOPREFIX ? DT_NOPREFIX : 0u;
  switch (style & SS_TYPEMASK) {
    case SS_CENTER:
      format |= DT_CENTER | DT_WORDBREAK;
      break;
    case SS_RIGHT:
      format |= DT_RIGHT | DT_WORDBREAK;
      break;
    case SS_SIMPLE:
      return format | DT_SINGLELINE;
    case SS_LEFTNOWORDWRAP:
      break;
    default:
      format |= DT_WORDBREAK;
  }
  if (style & SS_CENTERIMAGE) format = (format & ~static_cast<UINT>(DT_WORDBREAK)) | DT_SINGLELINE | DT_VCENTER;
  return format | DT_EXPANDTABS;
}

void PaintText(HWND window, const Static* control, HDC dc, const RECT& rect) {
  const auto brush = reinterpret_cast<HBRUSH>(model::Send(
      GetParent(window), WM_CTLCOLORSTATIC, reinterpret_cast<WPARAM>(dc), reinterpret_cast<LPARAM>(window)));
  if (brush != nullptr) FillRect(dc, &rect, brush);
  model::OrNoMemory<int>(0, [&] {
    model::Text text(static_cast<std::size_t>(GetWindowTextLengthW(window)) + 1, 0);
    GetWindowTextW(window, text.data(), static_cast<int>(text.size()));
    controls::PaintText(dc, rect, text.data(), IsWindowEnabled(window) ? COLOR_WINDOWTEXT : COLOR_GRAYTEXT,
                        control->font, TextFormat(StyleOf(window)));
    return 0;
  });
}

void DrawByOwner(HWND window, HDC dc, const RECT& rect) {
  DRAWITEMSTRUCT item{};
  item.CtlType = ODT_STATIC;
  item.CtlID = static_cast<UINT>(GetDlgCtrlID(window));
  item.itemAction = ODA_DRAWENTIRE;
  item.itemState = IsWindowEnabled(window) ? 0u : ODS_DISABLED;
  item.hwndItem = window;
  item.hDC = dc;
  item.rcItem = rect;
  model::Send(GetParent(window), WM_DRAWITEM, item.CtlID, reinterpret_cast<LPARAM>(&item));
}

void Paint(HWND window, const Static* control, HDC dc) {
  RECT rect = ClientOf(window);
  switch (StyleOf(window) & SS_TYPEMASK) {
    case SS_BLACKRECT:
      FillRect(dc, &rect, GetSysColorBrush(COLOR_3DDKSHADOW));
      break;
    case SS_GRAYRECT:
      FillRect(dc, &rect, GetSysColorBrush(COLOR_3DSHADOW));
      break;
    case SS_WHITERECT:
      FillRect(dc, &rect, GetSysColorBrush(COLOR_3DHIGHLIGHT));
      break;
    case SS_BLACKFRAME:
      FrameRect(dc, &rect, GetSysColorBrush(COLOR_3DDKSHADOW));
      break;
    case SS_GRAYFRAME:
      FrameRect(dc, &rect, GetSysColorBrush(COLOR_3DSHADOW));
      break;
    case SS_WHITEFRAME:
      FrameRect(dc, &rect, GetSysColorBrush(COLOR_3DHIGHLIGHT));
      break;
    case SS_ETCHEDHORZ:
      DrawEdge(dc, &rect, EDGE_ETCHED, BF_TOP | BF_BOTTOM);
      break;
    case SS_ETCHEDVERT:
      DrawEdge(dc, &rect, EDGE_ETCHED, BF_LEFT | BF_RIGHT);
      break;
    case SS_ETCHEDFRAME:
      DrawEdge(dc, &rect, EDGE_ETCHED, BF_RECT);
      break;
    case SS_OWNERDRAW:
      DrawByOwner(window, dc, rect);
      break;
    case SS_ICON:
    case SS_BITMAP:
      break;
    default:
      PaintText(window, control, dc, rect);
  }
}

LRESULT Handle(HWND window, Static*, UINT message, WPARAM wParam, LPARAM lParam) {
  switch (message) {
    case WM_GETDLGCODE:
      return DLGC_STATIC;
    case WM_NCHITTEST:
      return StyleOf(window) & SS_NOTIFY ? HTCLIENT : HTTRANSPARENT;
    case WM_LBUTTONDOWN:
      if (StyleOf(window) & SS_NOTIFY) NotifyCommand(window, STN_CLICKED);
      return 0;
    case WM_LBUTTONDBLCLK:
      if (StyleOf(window) & SS_NOTIFY) NotifyCommand(window, STN_DBLCLK);
      return 0;
    case WM_ENABLE:
      InvalidateRect(window, nullptr, FALSE);
      if (StyleOf(window) & SS_NOTIFY) NotifyCommand(window, wParam ? STN_ENABLE : STN_DISABLE);
      return 0;
    case WM_SETTEXT:
      return TakeText(window, wParam, lParam);
    default:
      break;
  }
  return DefWindowProcW(window, message, wParam, lParam);
}

}  // namespace

LRESULT CALLBACK StaticProcedure(HWND window, UINT message, WPARAM wParam, LPARAM lParam) {
  return ControlMessage<Static, &Paint, &Handle>(window, message, wParam, lParam);
}

}  // namespace platform::controls
