#include "qxcore/ui/window/command_ui.h"

#include "qxcore/ui/window/internal/menu_item.h"
#include "qxcore/ui/window/menu.h"
#include "qxcore/ui/window/window.h"

SCmdUI::~SCmdUI() = default;

// An item that opens a menu is not a command: its state belongs to nobody.
void SCmdUI::Enable(int enable) {
  m_enableChanged = true;
  if (m_menu != nullptr) {
    if (m_subMenu == nullptr) SMenuItem(m_menu->GetSafeHandle(), m_index).Enable(enable != 0);
  } else if (m_sender != nullptr) {
    m_sender->EnableWindow(enable);
  }
}

void SCmdUI::SetCheck(int check) {
  if (m_menu != nullptr) {
    if (m_subMenu == nullptr) SMenuItem(m_menu->GetSafeHandle(), m_index).Check(check != 0);
  } else if (m_sender != nullptr) {
    m_sender->SendMessageW(BM_SETCHECK, static_cast<WPARAM>(check), 0);
  }
}

void SCmdUI::SetRadio(int on) {
  if (m_menu == nullptr) {
    SetCheck(on != 0);
  } else if (m_subMenu == nullptr) {
    SMenuItem(m_menu->GetSafeHandle(), m_index).CheckRadio(on != 0);
  }
}

void SCmdUI::SetText(LPCWSTR text) {
  if (m_menu != nullptr) {
    SMenuItem(m_menu->GetSafeHandle(), m_index).SetText(text);
  } else if (m_sender != nullptr) {
    m_sender->SetWindowTextW(text);
  }
}

int SCmdUI::DoUpdate(SCmdTarget* target, int disableIfNoHandler) {
  if (m_id == 0 || m_id == 0xFFFF) return 1;  // a separator or an item that opens a menu
  m_enableChanged = false;
  const int handled = target->OnCmdMsg(m_id, kSMsgUpdate, this, nullptr);
  if (handled == 0 && disableIfNoHandler != 0 && !m_enableChanged) {
    S_CMDHANDLERINFO info{};
    Enable(target->OnCmdMsg(m_id, 0, this, &info));
    return 1;
  }
  return handled;
}

int SCmdUI::CallHandler(SMsgHandler handler, SCmdTarget* target, UINT id) {
  m_continueRouting = false;
  handler(target, id, reinterpret_cast<LPARAM>(this));
  return m_continueRouting ? 0 : 1;
}

HMENU SSysCmdUI::SystemMenu() const {
  return m_sender != nullptr ? ::GetSystemMenu(m_sender->GetSafeHwnd(), FALSE) : nullptr;
}

void SSysCmdUI::Enable(int enable) {
  m_enableChanged = true;
  SMenuItem::OfCommand(SystemMenu(), m_id).Enable(enable != 0);
}

void SSysCmdUI::SetCheck(int check) { SMenuItem::OfCommand(SystemMenu(), m_id).Check(check != 0); }

void SSysCmdUI::SetRadio(int on) { SMenuItem::OfCommand(SystemMenu(), m_id).Check(on != 0); }

void SSysCmdUI::SetText(LPCWSTR text) { SMenuItem::OfCommand(SystemMenu(), m_id).SetText(text); }
