// Commands and notifications: to the control that sent them, then along the routing.

#include "qxcore/ui/window/message_shapes.h"
#include "qxcore/ui/window/thread_state.h"
#include "qxcore/ui/window/window.h"

int SWnd::OnCommand(WPARAM wParam, LPARAM lParam) {
  const UINT id = LOWORD(wParam);
  int code = HIWORD(wParam);
  if (const HWND control = reinterpret_cast<HWND>(lParam)) {
    LRESULT result = 0;
    if (ReflectLastMsg(control, &result)) return 1;
  } else {
    code = 0;  // menus and accelerators route alike
  }
  return id != 0 ? OnCmdMsg(id, code, nullptr, nullptr) : 0;
}

int SWnd::OnNotify(WPARAM, LPARAM lParam, LRESULT* result) {
  auto* header = reinterpret_cast<NMHDR*>(lParam);
  if (header == nullptr) return 0;
  LRESULT ignored = 0;
  if (result == nullptr) result = &ignored;
  if (ReflectLastMsg(header->hwndFrom, result)) return 1;
  SMsgNotify notify{header, result};
  const int code = static_cast<int>(UINT{WM_NOTIFY} << 16 | (header->code & 0xFFFF));
  return OnCmdMsg(static_cast<UINT>(header->idFrom), code, &notify, nullptr);
}

int SWnd::ReflectLastMsg(HWND control, LRESULT* result) {
  SWnd* object = FromHandlePermanent(control);
  if (object == nullptr) return 0;
  const SCurrentMessage current = SWndThreadState::Get().m_current;
  return object->OnChildNotify(current.m_message, current.m_wParam, current.m_lParam, result);
}

int SWnd::OnChildNotify(UINT message, WPARAM wParam, LPARAM lParam, LRESULT* result) {
  return ReflectChildNotify(message, wParam, lParam, result);
}

int SWnd::ReflectChildNotify(UINT message, WPARAM wParam, LPARAM lParam, LRESULT* result) {
  const UINT reflected = message + kSMsgReflected;
  switch (message) {
    case WM_COMMAND:
      if (!OnCmdMsg(0, static_cast<int>(reflected << 16 | HIWORD(wParam)), nullptr, nullptr)) return 0;
      if (result != nullptr) *result = 1;
      return 1;
    case WM_NOTIFY: {
      LRESULT ignored = 0;
      SMsgNotify notify{reinterpret_cast<NMHDR*>(lParam), result != nullptr ? result : &ignored};
      return OnCmdMsg(0, static_cast<int>(reflected << 16 | (notify.m_header->code & 0xFFFF)), &notify, nullptr);
    }
    case WM_DRAWITEM:
    case WM_MEASUREITEM:
    case WM_DELETEITEM:
    case WM_VKEYTOITEM:
    case WM_CHARTOITEM:
    case WM_COMPAREITEM:
    case WM_HSCROLL:
    case WM_VSCROLL:
    case WM_PARENTNOTIFY:
      return OnWndMsg(reflected, wParam, lParam, result);
    default:
      return 0;
  }
}
