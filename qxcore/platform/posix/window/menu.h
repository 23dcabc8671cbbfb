// Menus as the model keeps them.
#pragma once

#include "qxcore/platform/posix/window/thread.h"

namespace platform::model {

struct MenuItem {
  UINT type = MFT_STRING;  // MFT_ flags
  UINT state = 0;          // MFS_ flags
  UINT id = 0;
  HMENU subMenu = nullptr;
  Text text;
  bool hasText = false;
  ULONG_PTR data = 0;
  HBITMAP bitmap = nullptr, checked = nullptr, unchecked = nullptr;
  RECT place{};  // within the window that shows it, as far as it is shown
};

struct Menu : OnModelHeap {
  HMENU handle = nullptr;
  List<MenuItem> items;
  bool isPopup = false;
  int highlighted = -1;
};

// Under the lock.
inline Menu* FindMenu(HMENU handle) { return FindAs<Menu, Kind::Menu>(handle); }
// The item of an identifier, in submenus as well, or of a position; and the menu in which it is. Under the lock.
struct ItemPlace {
  Menu* menu = nullptr;
  std::size_t position = 0;
  MenuItem* Item() const { return menu != nullptr ? &menu->items[position] : nullptr; }
};
ItemPlace FindItem(HMENU menu, UINT item, UINT flags);

// The height of a window's menu bar at a width, and the places of its items in that width. Without the lock.
int MenuBarHeight(HWND window, int width);
// The size of a popup menu; sets the places of its items. Without the lock.
SIZE MeasurePopup(HMENU menu);
// The character that is underlined, in upper case; 0 without.
WCHAR MnemonicOf(const Text& text);

// Lets the user choose from the menu bar of a window: by the keyboard, with the mnemonic `key` (0: the first item is
// only highlighted), or by a press at a point of the screen. Without the lock.
void UseMenuBarByKey(HWND window, WCHAR key);
void UseMenuBarByMouse(HWND window, POINT point);
// The same for the system menu.
void UseSystemMenu(HWND window);

}  // namespace platform::model
