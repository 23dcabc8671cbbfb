// The class "Button": push buttons, check boxes, radio buttons, group boxes.

#include "qxcore/platform/posix/controls/painting.h"
#include "qxcore/platform/posix/window/send.h"

namespace platform::controls {
namespace {

using model::Send;

struct Button : model::OnModelHeap {
  UINT check = BST_UNCHECKED;
  bool isPushed = false, hasFocus = false, isPressing = false;  // pressing: the mouse or the space key is down
  HFONT font = nullptr;
};

DWORD TypeOf(HWND window) { return StyleOf(window) & BS_TYPEMASK; }
bool IsRadio(DWORD type) { return type == BS_RADIOBUTTON || type == BS_AUTORADIOBUTTON; }
bool IsPush(DWORD type) { return type == BS_PUSHBUTTON || type == BS_DEFPUSHBUTTON; }

LRESULT DialogCode(DWORD type) {
  switch (type) {
    case BS_PUSHBUTTON:
      return DLGC_BUTTON | DLGC_UNDEFPUSHBUTTON;
    case BS_DEFPUSHBUTTON:
      return DLGC_BUTTON | DLGC_DEFPUSHBUTTON;
    case BS_RADIOBUTTON:
    case BS_AUTORADIOBUTTON:
      return DLGC_BUTTON | DLGC_RADIOBUTTON;
    case BS_GROUPBOX:
      return DLGC_STATIC;
    default:
      return DLGC_BUTTON;
  }
}

void SetPushed(HWND window, Button* button, bool pushed) {
  if (button->isPushed == pushed) return;
  button->isPushed = pushed;
  InvalidateRect(window, nullptr, FALSE);
}

// Takes the check from the other radio buttons of the group.
void ClearGroup(HWND window) {
  const HWND parent = GetParent(window);
  HWND each = window;
  for (int rounds = 0; rounds < 10000; ++rounds) {
    each = GetNextDlgGroupItem(parent, each, FALSE);
    if (each == nullptr || each == window) return;
    if (Send(each, WM_GETDLGCODE) & DLGC_RADIOBUTTON) Send(each, BM_SETCHECK, BST_UNCHECKED);
  }
}

void Click(HWND window) {
  Button* button = StateOf<Button>(window);
  if (button == nullptr) return;
  switch (TypeOf(window)) {
    case BS_AUTOCHECKBOX:
      Send(window, BM_SETCHECK, button->check == BST_UNCHECKED ? BST_CHECKED : BST_UNCHECKED);
      break;
    case BS_AUTO3STATE:
      Send(window, BM_SETCHECK, button->check == BST_INDETERMINATE ? BST_UNCHECKED : button->check + 1);
      break;
    case BS_AUTORADIOBUTTON:
      ClearGroup(window);
      Send(window, BM_SETCHECK, BST_CHECKED);
      break;
    default:
      break;
  }
  NotifyCommand(window, BN_CLICKED);
}

bool IsInside(HWND window, LPARAM lParam) {
  RECT rect = ClientOf(window);
  return model::Contains(rect, model::PointOf(lParam));
}

// The end of a press: the state is given back before the click, for a click may destroy the button.
void Release(HWND window, Button* button, bool clicks) {
  if (!button->isPressing) return;
  button->isPressing = false;
  SetPushed(window, button, false);
  if (GetCapture() == window) ReleaseCapture();
  if (clicks) Click(window);
}

void DrawByOwner(HWND window, const Button* button, HDC dc, UINT action) {
  DRAWITEMSTRUCT item{};
  item.CtlType = ODT_BUTTON;
  item.CtlID = static_cast<UINT>(GetDlgCtrlID(window));
  item.itemAction = action;
  item.itemState = (button->isPushed ? ODS_SELECTED : 0u) | (button->hasFocus ? ODS_FOCUS : 0u) |
                   (IsWindowEnabled(window) ? 0u : ODS_DISABLED);
  item.hwndItem = window;
  item.hDC = dc;
  GetClientRect(window, &item.rcItem);
  Send(GetParent(window), WM_DRAWITEM, item.CtlID, reinterpret_cast<LPARAM>(&item));
}

void PaintPush(HWND window, const Button* button, HDC dc, RECT rect, LPCWSTR text) {
  const bool isDefault = TypeOf(window) == BS_DEFPUSHBUTTON;
  if (isDefault) {
    FrameRect(dc, &rect, GetSysColorBrush(COLOR_WINDOWFRAME));
    rect = model::Inflated(rect, -1, -1);
  }
  DrawFrameControl(dc, &rect, DFC_BUTTON, DFCS_BUTTONPUSH | (button->isPushed ? DFCS_PUSHED : 0u));
  if (button->isPushed) rect = model::Moved(rect, 1, 1);
  PaintText(dc, rect, text, IsWindowEnabled(window) ? COLOR_BTNTEXT : COLOR_GRAYTEXT, button->font,
            DT_SINGLELINE | DT_CENTER | DT_VCENTER);
  if (!button->hasFocus) return;
  rect = model::Inflated(rect, -3, -3);
  DrawFocusRect(dc, &rect);
}

void PaintCheck(HWND window, const Button* button, HDC dc, RECT rect, LPCWSTR text) {
  const int size = model::Scaled(13), gap = model::Scaled(4);
  const int top = (rect.top + rect.bottom - size) / 2;
  const bool isLeft = StyleOf(window) & BS_LEFTTEXT;
  RECT box{rect.left, top, rect.left + size, top + size};
  if (isLeft) box = model::Moved(box, model::Width(rect) - size, 0);
  const DWORD type = TypeOf(window);
  const UINT shape = IsRadio(type)                        ? DFCS_BUTTONRADIO
                     : button->check == BST_INDETERMINATE ? DFCS_BUTTON3STATE
                                                          : DFCS_BUTTONCHECK;
  DrawFrameControl(dc, &box, DFC_BUTTON,
                   shape | (button->check != BST_UNCHECKED ? DFCS_CHECKED : 0u) |
                       (button->isPushed ? DFCS_PUSHED : 0u) | (IsWindowEnabled(window) ? 0u : DFCS_INACTIVE));
  (isLeft ? rect.right : rect.left) += isLeft ? -size - gap : size + gap;
  PaintText(dc, rect, text, IsWindowEnabled(window) ? COLOR_WINDOWTEXT : COLOR_GRAYTEXT, button->font,
            DT_SINGLELINE | DT_VCENTER);
  if (button->hasFocus) DrawFocusRect(dc, &rect);
}

void PaintGroup(HWND window, const Button* button, HDC dc, RECT rect, LPCWSTR text) {
  RECT size{};
  const HGDIOBJ old = SelectObject(dc, button->font != nullptr ? button->font : InterfaceFont());
  DrawTextW(dc, text, -1, &size, DT_SINGLELINE | DT_CALCRECT);
  SelectObject(dc, old);
  RECT frame = rect;
  frame.top += size.bottom / 2;
  DrawEdge(dc, &frame, EDGE_ETCHED, BF_RECT);
  const int left = rect.left + model::Scaled(8);
  const RECT label{left, rect.top, left + 2 + size.right, rect.top + size.bottom};
  FillRect(dc, &label, GetSysColorBrush(COLOR_3DFACE));
  PaintText(dc, model::Inflated(label, -1, 0), text, IsWindowEnabled(window) ? COLOR_WINDOWTEXT : COLOR_GRAYTEXT,
            button->font, DT_SINGLELINE);
}

void Paint(HWND window, const Button* button, HDC dc) {
  const DWORD type = TypeOf(window);
  if (type == BS_OWNERDRAW) {
    DrawByOwner(window, button, dc, ODA_DRAWENTIRE);
    return;
  }
  RECT rect = ClientOf(window);
  const UINT message = IsPush(type) ? WM_CTLCOLORBTN : WM_CTLCOLORSTATIC;
  const auto brush = reinterpret_cast<HBRUSH>(
      Send(GetParent(window), message, reinterpret_cast<WPARAM>(dc), reinterpret_cast<LPARAM>(window)));
  if (type != BS_GROUPBOX && brush != nullptr) FillRect(dc, &rect, brush);
  WCHAR text[256];
  GetWindowTextW(window, text, static_cast<int>(std::size(text)));
  if (type == BS_GROUPBOX) {
    PaintGroup(window, button, dc, rect, text);
  } else if (IsPush(type) || StyleOf(window) & BS_PUSHLIKE) {
    PaintPush(window, button, dc, rect, text);
  } else {
    PaintCheck(window, button, dc, rect, text);
  }
}

void SetCheck(HWND window, Button* button, UINT check) {
  const DWORD type = TypeOf(window);
  const bool hasThird = type == BS_3STATE || type == BS_AUTO3STATE;
  if (check > (hasThird ? BST_INDETERMINATE : BST_CHECKED)) check = BST_CHECKED;
  if (IsRadio(type)) {
    const DWORD style = StyleOf(window);
    SetWindowLongW(window, GWL_STYLE,
                   static_cast<LONG>(check != BST_UNCHECKED ? style | WS_TABSTOP : style & ~WS_TABSTOP));
  }
  if (button->check == check || IsPush(type) || type == BS_GROUPBOX) return;
  button->check = check;
  InvalidateRect(window, nullptr, FALSE);
}

void SetFocused(HWND window, Button* button, bool focused) {
  button->hasFocus = focused;
  InvalidateRect(window, nullptr, FALSE);
  if (!focused) Release(window, button, false);
  if (StyleOf(window) & BS_NOTIFY) NotifyCommand(window, focused ? BN_SETFOCUS : BN_KILLFOCUS);
}

void Press(HWND window, Button* button) {
  button->isPressing = true;
  SetPushed(window, button, true);
}

LRESULT Handle(HWND window, Button* button, UINT message, WPARAM wParam, LPARAM lParam) {
  switch (message) {
    case WM_GETDLGCODE:
      return DialogCode(TypeOf(window));
    case WM_ENABLE:
      InvalidateRect(window, nullptr, FALSE);
      return 0;
    case WM_NCHITTEST:
      if (TypeOf(window) == BS_GROUPBOX) return HTTRANSPARENT;
      break;
    case WM_LBUTTONDOWN:
    case WM_LBUTTONDBLCLK:
      SetCapture(window);
      SetFocus(window);
      Press(window, button);
      return 0;
    case WM_MOUSEMOVE:
      if (button->isPressing && GetCapture() == window) SetPushed(window, button, IsInside(window, lParam));
      return 0;
    case WM_LBUTTONUP:
      Release(window, button, IsInside(window, lParam));
      return 0;
    case WM_CAPTURECHANGED:
      if (reinterpret_cast<HWND>(lParam) != window) {
        button->isPressing = false;
        SetPushed(window, button, false);
      }
      return 0;
    case WM_KEYDOWN:
      if (wParam == VK_SPACE) Press(window, button);
      return 0;
    case WM_KEYUP:
      if (wParam == VK_SPACE) Release(window, button, true);
      return 0;
    case WM_SETFOCUS:
    case WM_KILLFOCUS:
      SetFocused(window, button, message == WM_SETFOCUS);
      return 0;
    case WM_SETTEXT:
      return TakeText(window, wParam, lParam);
    case BM_CLICK:
      Send(window, WM_LBUTTONDOWN);
      Send(window, WM_LBUTTONUP);
      return 0;
    case BM_GETCHECK:
      return button->check;
    case BM_SETCHECK:
      SetCheck(window, button, static_cast<UINT>(wParam));
      return 0;
    case BM_GETSTATE:
      return static_cast<LRESULT>(button->check | (button->isPushed ? BST_PUSHED : 0) |
                                  (button->hasFocus ? BST_FOCUS : 0));
    case BM_SETSTATE:
      SetPushed(window, button, wParam != 0);
      return 0;
    case BM_SETSTYLE: {
      const DWORD style = (StyleOf(window) & ~static_cast<DWORD>(BS_TYPEMASK)) | (wParam & BS_TYPEMASK);
      SetWindowLongW(window, GWL_STYLE, static_cast<LONG>(style));
      if (lParam) InvalidateRect(window, nullptr, TRUE);
      return 0;
    }
    default:
      break;
  }
  return DefWindowProcW(window, message, wParam, lParam);
}

}  // namespace

LRESULT CALLBACK ButtonProcedure(HWND window, UINT message, WPARAM wParam, LPARAM lParam) {
  return ControlMessage<Button, &Paint, &Handle>(window, message, wParam, lParam);
}

}  // namespace platform::controls
