// One item of a menu, by position or by command; every change does nothing when the item is missing.
#pragma once

#include "qxcore/platform/win32.h"

class SMenuItem {
 public:
  SMenuItem(HMENU menu, UINT position) : SMenuItem(menu, position, MF_BYPOSITION) {}
  static SMenuItem OfCommand(HMENU menu, UINT id) { return SMenuItem(menu, id, MF_BYCOMMAND); }

  void Enable(bool enable) const {
    ::EnableMenuItem(m_menu, m_item, m_how | (enable ? MF_ENABLED : MF_DISABLED | MF_GRAYED));
  }
  void Check(bool check) const { ::CheckMenuItem(m_menu, m_item, m_how | (check ? MF_CHECKED : MF_UNCHECKED)); }
  void CheckRadio(bool check) const {
    if (check && m_how == MF_BYPOSITION) {
      ::CheckMenuRadioItem(m_menu, m_item, m_item, m_item, MF_BYPOSITION);
    } else {
      Check(check);
    }
  }
  void SetText(const WCHAR* text) const {
    const UINT state = ::GetMenuState(m_menu, m_item, m_how);
    if (state == static_cast<UINT>(-1)) return;
    const UINT id = m_how == MF_BYCOMMAND ? m_item : ::GetMenuItemID(m_menu, static_cast<int>(m_item));
    const UINT kept = state & (MF_DISABLED | MF_GRAYED | MF_CHECKED);
    ::ModifyMenuW(m_menu, m_item, m_how | MF_STRING | kept, id, text);
  }

 private:
  SMenuItem(HMENU menu, UINT item, UINT how) : m_menu(menu), m_item(item), m_how(how) {}
  HMENU m_menu;
  UINT m_item;
  UINT m_how;
};
