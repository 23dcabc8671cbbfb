// Menus: their items, by position and by identifier.

#include "qxcore/platform/posix/window/menu.h"

#include "qxcore/platform/bmp.h"
#include "qxcore/platform/posix/window/send.h"

namespace platform::model {
namespace {

HMENU NewMenu(bool isPopup) {
  CurrentThread();
  return OrNoMemory<HMENU>(nullptr, [&]() -> HMENU {
    const Guard guard;
    Menu* menu = new Menu;
    try {
      menu->handle = static_cast<HMENU>(AddObject(Kind::Menu, menu, nullptr));
    } catch (...) {
      delete menu;
      throw;
    }
    menu->isPopup = isPopup;
    return menu->handle;
  });
}

Menu* ExpectMenu(HMENU handle) {
  Menu* menu = FindMenu(handle);
  if (menu == nullptr) SetLastError(ERROR_INVALID_MENU_HANDLE);
  return menu;
}

MenuItem* ExpectItem(HMENU handle, UINT item, UINT flags) {
  if (ExpectMenu(handle) == nullptr) return nullptr;
  MenuItem* found = FindItem(handle, item, flags).Item();
  if (found == nullptr) SetLastError(ERROR_MENU_ITEM_NOT_FOUND);
  return found;
}

void SetItemText(MenuItem& item, LPCWSTR text) {
  item.hasText = text != nullptr;
  if (text != nullptr) {
    item.text = text;
  } else {
    item.text.clear();
  }
}

constexpr UINT kTypes = MFT_BITMAP | MFT_MENUBARBREAK | MFT_MENUBREAK | MFT_OWNERDRAW | MFT_RADIOCHECK | MFT_SEPARATOR |
                        MFT_RIGHTORDER | MFT_RIGHTJUSTIFY;
constexpr UINT kStates = MFS_GRAYED | MFS_CHECKED | MFS_HILITE | MFS_DEFAULT;

// An item as AppendMenuW and the like describe it.
MenuItem ItemOf(UINT flags, UINT_PTR id, LPCWSTR text) {
  MenuItem item;
  item.type = flags & (kTypes & ~(MFT_RADIOCHECK | MFT_RIGHTORDER));
  item.state = flags & (MF_GRAYED | MF_DISABLED | MF_CHECKED | MF_HILITE);
  if (flags & MF_POPUP) item.subMenu = reinterpret_cast<HMENU>(id);
  item.id = static_cast<UINT>(id);
  if (flags & MF_SEPARATOR) return item;
  if (flags & MF_OWNERDRAW) {
    item.data = reinterpret_cast<ULONG_PTR>(text);
  } else if (flags & MF_BITMAP) {
    item.bitmap = reinterpret_cast<HBITMAP>(const_cast<WCHAR*>(text));
  } else {
    SetItemText(item, text);
  }
  return item;
}

void Fill(MenuItem& item, const MENUITEMINFOW& info) {
  if (info.fMask & MIIM_TYPE) {
    item.type = info.fType & kTypes;
    if (!(item.type & (MFT_SEPARATOR | MFT_OWNERDRAW | MFT_BITMAP))) SetItemText(item, info.dwTypeData);
  }
  if (info.fMask & MIIM_FTYPE) item.type = info.fType & kTypes;
  if (info.fMask & MIIM_STRING) SetItemText(item, info.dwTypeData);
  if (info.fMask & MIIM_STATE) item.state = info.fState & (kStates | MF_DISABLED);
  if (info.fMask & MIIM_ID) item.id = info.wID;
  if (info.fMask & MIIM_SUBMENU) item.subMenu = info.hSubMenu;
  if (info.fMask & MIIM_DATA) item.data = info.dwItemData;
  if (info.fMask & MIIM_BITMAP) item.bitmap = info.hbmpItem;
  if (info.fMask & MIIM_CHECKMARKS) {
    item.checked = info.hbmpChecked;
    item.unchecked = info.hbmpUnchecked;
  }
}

bool IsValidInfo(LPCMENUITEMINFOW info) { return info != nullptr && info->cbSize >= offsetof(MENUITEMINFOW, hbmpItem); }

BOOL Insert(HMENU handle, UINT position, UINT flags, MenuItem&& item) {
  Menu* menu = ExpectMenu(handle);
  if (menu == nullptr) return FALSE;
  std::size_t at = menu->items.size();
  const bool isLast = (flags & MF_BYPOSITION) && position >= menu->items.size();
  if (!isLast) {
    const ItemPlace place = FindItem(handle, position, flags);
    if (place.menu != nullptr) {
      menu = place.menu;
      at = place.position;
    } else if (!(flags & MF_BYPOSITION)) {
      at = menu->items.size();
    }
  }
  menu->items.insert(menu->items.begin() + static_cast<std::ptrdiff_t>(at), std::move(item));
  return TRUE;
}

HMENU Remove(HMENU handle, UINT position, UINT flags, BOOL* removed) {
  *removed = FALSE;
  if (ExpectMenu(handle) == nullptr) return nullptr;
  const ItemPlace place = FindItem(handle, position, flags);
  if (place.menu == nullptr) return Fail<HMENU>(ERROR_MENU_ITEM_NOT_FOUND);
  const HMENU subMenu = place.Item()->subMenu;
  place.menu->items.erase(place.menu->items.begin() + static_cast<std::ptrdiff_t>(place.position));
  *removed = TRUE;
  return subMenu;
}

int CopyText(const Text& text, LPWSTR buffer, int capacity) {
  if (buffer == nullptr || capacity <= 0) return static_cast<int>(text.size());
  const std::size_t count = std::min(text.size(), static_cast<std::size_t>(capacity - 1));
  std::copy_n(text.data(), count, buffer);
  buffer[count] = 0;
  return static_cast<int>(count);
}

}  // namespace

ItemPlace FindItem(HMENU handle, UINT item, UINT flags) {
  Menu* menu = FindMenu(handle);
  if (menu == nullptr) return {};
  if (flags & MF_BYPOSITION) return item < menu->items.size() ? ItemPlace{menu, item} : ItemPlace{};
  ItemPlace popup;  // a submenu whose identifier fits counts last
  for (std::size_t i = 0; i < menu->items.size(); ++i) {
    MenuItem& each = menu->items[i];
    if (each.subMenu != nullptr) {
      const ItemPlace below = FindItem(each.subMenu, item, flags);
      if (below.menu != nullptr) return below;
      if (each.id == item && popup.menu == nullptr) popup = {menu, i};
    } else if (each.id == item) {
      return {menu, i};
    }
  }
  return popup;
}

WCHAR MnemonicOf(const Text& text) {
  for (std::size_t i = 0; i + 1 < text.size(); ++i) {
    if (text[i] != '&') continue;
    if (text[i + 1] != '&') return ToUpperBmp(text[i + 1]);
    ++i;
  }
  return 0;
}

}  // namespace platform::model

using namespace platform::model;

HMENU CreateMenu() { return NewMenu(false); }
HMENU CreatePopupMenu() { return NewMenu(true); }

BOOL IsMenu(HMENU menu) {
  const Guard guard;
  return FindMenu(menu) != nullptr;
}

// Submenus go with their menu.
BOOL DestroyMenu(HMENU handle) {
  const Guard guard;
  struct Destroyer {
    static void Destroy(HMENU each) {
      auto* menu = static_cast<Menu*>(RemoveObject(Kind::Menu, each));
      if (menu == nullptr) return;
      for (const MenuItem& item : menu->items)
        if (item.subMenu != nullptr) Destroy(item.subMenu);
      delete menu;
    }
  };
  if (ExpectMenu(handle) == nullptr) return FALSE;
  Destroyer::Destroy(handle);
  return TRUE;
}

HMENU GetSubMenu(HMENU handle, int position) {
  const Guard guard;
  if (ExpectMenu(handle) == nullptr) return nullptr;
  const MenuItem* item = FindItem(handle, static_cast<UINT>(position), MF_BYPOSITION).Item();
  return item != nullptr ? item->subMenu : nullptr;
}

int GetMenuItemCount(HMENU handle) {
  const Guard guard;
  const Menu* menu = ExpectMenu(handle);
  return menu != nullptr ? static_cast<int>(menu->items.size()) : -1;
}

UINT GetMenuItemID(HMENU handle, int position) {
  const Guard guard;
  const MenuItem* item = FindItem(handle, static_cast<UINT>(position), MF_BYPOSITION).Item();
  return item != nullptr && item->subMenu == nullptr ? item->id : static_cast<UINT>(-1);
}

UINT GetMenuState(HMENU handle, UINT position, UINT flags) {
  const Guard guard;
  const MenuItem* item = ExpectItem(handle, position, flags);
  if (item == nullptr) return static_cast<UINT>(-1);
  const UINT state = (item->state | item->type) & 0xFF;
  if (item->subMenu == nullptr) return item->state | item->type;
  const Menu* below = FindMenu(item->subMenu);
  return state | MF_POPUP | static_cast<UINT>((below != nullptr ? below->items.size() : 0) << 8);
}

int GetMenuStringW(HMENU handle, UINT position, LPWSTR text, int capacity, UINT flags) {
  const Guard guard;
  if (text != nullptr && capacity > 0) text[0] = 0;
  const MenuItem* item = ExpectItem(handle, position, flags);
  return item != nullptr ? CopyText(item->text, text, capacity) : 0;
}

BOOL GetMenuItemInfoW(HMENU handle, UINT position, BOOL byPosition, LPMENUITEMINFOW info) {
  if (!IsValidInfo(info)) return Fail(ERROR_INVALID_PARAMETER);
  const Guard guard;
  const MenuItem* item = ExpectItem(handle, position, byPosition ? MF_BYPOSITION : MF_BYCOMMAND);
  if (item == nullptr) return FALSE;
  if (info->fMask & (MIIM_TYPE | MIIM_FTYPE)) info->fType = item->type;
  const bool wantsText = (info->fMask & MIIM_STRING) ||
                         ((info->fMask & MIIM_TYPE) && !(item->type & (MFT_SEPARATOR | MFT_OWNERDRAW | MFT_BITMAP)));
  if (wantsText) info->cch = static_cast<UINT>(CopyText(item->text, info->dwTypeData, static_cast<int>(info->cch)));
  if (info->fMask & MIIM_STATE) info->fState = item->state;
  if (info->fMask & MIIM_ID) info->wID = item->id;
  info->hSubMenu = info->fMask & MIIM_SUBMENU ? item->subMenu : nullptr;
  if (info->fMask & MIIM_DATA) info->dwItemData = item->data;
  if (info->fMask & MIIM_BITMAP) info->hbmpItem = item->bitmap;
  if (info->fMask & MIIM_CHECKMARKS) {
    info->hbmpChecked = item->checked;
    info->hbmpUnchecked = item->unchecked;
  }
  return TRUE;
}

BOOL SetMenuItemInfoW(HMENU handle, UINT position, BOOL byPosition, LPCMENUITEMINFOW info) {
  if (!IsValidInfo(info)) return Fail(ERROR_INVALID_PARAMETER);
  return OrNoMemory<BOOL>(FALSE, [&]() -> BOOL {
    const Guard guard;
    MenuItem* item = ExpectItem(handle, position, byPosition ? MF_BYPOSITION : MF_BYCOMMAND);
    if (item == nullptr) return FALSE;
    Fill(*item, *info);
    return TRUE;
  });
}

BOOL InsertMenuItemW(HMENU handle, UINT position, BOOL byPosition, LPCMENUITEMINFOW info) {
  if (!IsValidInfo(info)) return Fail(ERROR_INVALID_PARAMETER);
  return OrNoMemory<BOOL>(FALSE, [&] {
    const Guard guard;
    MenuItem item;
    Fill(item, *info);
    return Insert(handle, position, byPosition ? MF_BYPOSITION : MF_BYCOMMAND, std::move(item));
  });
}

BOOL InsertMenuW(HMENU handle, UINT position, UINT flags, UINT_PTR id, LPCWSTR text) {
  return OrNoMemory<BOOL>(FALSE, [&] {
    const Guard guard;
    return Insert(handle, position, flags, ItemOf(flags, id, text));
  });
}

BOOL AppendMenuW(HMENU handle, UINT flags, UINT_PTR id, LPCWSTR text) {
  return InsertMenuW(handle, static_cast<UINT>(-1), flags | MF_BYPOSITION, id, text);
}

BOOL ModifyMenuW(HMENU handle, UINT position, UINT flags, UINT_PTR id, LPCWSTR text) {
  return OrNoMemory<BOOL>(FALSE, [&]() -> BOOL {
    HMENU gone = nullptr;
    {
      const Guard guard;
      MenuItem* item = ExpectItem(handle, position, flags);
      if (item == nullptr) return FALSE;
      MenuItem changed = ItemOf(flags, id, text);
      if (item->subMenu != changed.subMenu) gone = item->subMenu;
      *item = std::move(changed);
    }
    if (gone != nullptr) DestroyMenu(gone);
    return TRUE;
  });
}

BOOL RemoveMenu(HMENU handle, UINT position, UINT flags) {
  const Guard guard;
  BOOL removed;
  Remove(handle, position, flags, &removed);
  return removed;
}

BOOL DeleteMenu(HMENU handle, UINT position, UINT flags) {
  BOOL removed;
  HMENU subMenu = nullptr;
  {
    const Guard guard;
    subMenu = Remove(handle, position, flags, &removed);
  }
  if (subMenu != nullptr) DestroyMenu(subMenu);
  return removed;
}

BOOL EnableMenuItem(HMENU handle, UINT position, UINT flags) {
  const Guard guard;
  MenuItem* item = FindItem(handle, position, flags).Item();
  if (item == nullptr) return -1;
  constexpr UINT kOff = MF_GRAYED | MF_DISABLED;
  const UINT old = item->state & kOff;
  item->state = (item->state & ~kOff) | (flags & kOff);
  return static_cast<BOOL>(old);
}

DWORD CheckMenuItem(HMENU handle, UINT position, UINT flags) {
  const Guard guard;
  MenuItem* item = FindItem(handle, position, flags).Item();
  if (item == nullptr) return static_cast<DWORD>(-1);
  const DWORD old = item->state & MF_CHECKED;
  item->state = (item->state & ~MF_CHECKED) | (flags & MF_CHECKED);
  return old;
}

BOOL CheckMenuRadioItem(HMENU handle, UINT first, UINT last, UINT chosen, UINT flags) {
  const Guard guard;
  BOOL done = FALSE;
  for (UINT each = first; each <= last; ++each) {
    MenuItem* item = FindItem(handle, each, flags).Item();
    if (item == nullptr) continue;
    if (each == chosen) {
      item->type |= MFT_RADIOCHECK;
      item->state |= MFS_CHECKED;
      done = TRUE;
    } else {
      item->state &= ~MFS_CHECKED;
    }
  }
  return done;
}

BOOL HiliteMenuItem(HWND window, HMENU handle, UINT position, UINT flags) {
  if (!IsWindow(window)) return Fail(ERROR_INVALID_WINDOW_HANDLE);
  const Guard guard;
  const ItemPlace place = FindItem(handle, position, flags);
  if (place.menu == nullptr) return FALSE;
  place.menu->highlighted = flags & MF_HILITE ? static_cast<int>(place.position) : -1;
  return TRUE;
}

BOOL SetMenuDefaultItem(HMENU handle, UINT position, UINT byPosition) {
  const Guard guard;
  Menu* menu = ExpectMenu(handle);
  if (menu == nullptr) return FALSE;
  MenuItem* wanted =
      position != static_cast<UINT>(-1) ? FindItem(handle, position, byPosition ? MF_BYPOSITION : 0).Item() : nullptr;
  if (wanted == nullptr && position != static_cast<UINT>(-1)) return FALSE;
  for (MenuItem& item : menu->items) item.state &= ~MFS_DEFAULT;
  if (wanted != nullptr) wanted->state |= MFS_DEFAULT;
  return TRUE;
}

UINT GetMenuDefaultItem(HMENU handle, UINT byPosition, UINT) {
  const Guard guard;
  const Menu* menu = ExpectMenu(handle);
  if (menu == nullptr) return static_cast<UINT>(-1);
  for (std::size_t i = 0; i < menu->items.size(); ++i)
    if (menu->items[i].state & MFS_DEFAULT) return byPosition ? static_cast<UINT>(i) : menu->items[i].id;
  return static_cast<UINT>(-1);
}
