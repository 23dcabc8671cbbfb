// Menus of windows: the bar, the system menu, and how much room they take.

#include <cstring>

#include "qxcore/platform/posix/window/controls.h"
#include "qxcore/platform/posix/window/default_proc.h"
#include "qxcore/platform/posix/window/frame.h"
#include "qxcore/platform/posix/window/menu.h"
#include "qxcore/platform/posix/window/tree.h"

namespace platform::model {
namespace {

// At 96 dots an inch.
constexpr int kBesideText = 6;      // at each side of a text in the bar
constexpr int kUsualCharacter = 6;  // where no text can be measured
constexpr int kCheckArea = 20, kArrowArea = 16, kPopupBorder = 3;

int TextWidth(const Text& text) {
  const auto ampersands = static_cast<int>(std::count(text.begin(), text.end(), u'&'));
  if (g_painter.textSize != nullptr) return g_painter.textSize(text.data(), static_cast<int>(text.size()), true).cx;
  return (static_cast<int>(text.size()) - ampersands) * Scaled(kUsualCharacter);
}

HMENU MenuOf(HWND handle) {
  const Guard guard;
  const Window* window = FindWindowObject(handle);
  return window != nullptr && HasMenu(window) ? reinterpret_cast<HMENU>(window->idOrMenu) : nullptr;
}

List<MenuItem> ItemsOf(HMENU handle) {
  const Guard guard;
  const Menu* menu = FindMenu(handle);
  return menu != nullptr ? menu->items : List<MenuItem>();
}

void KeepPlaces(HMENU handle, const List<MenuItem>& items) {
  const Guard guard;
  Menu* menu = FindMenu(handle);
  if (menu == nullptr || menu->items.size() != items.size()) return;
  for (std::size_t i = 0; i < items.size(); ++i) menu->items[i].place = items[i].place;
}

HMENU MakeSystemMenu(DWORD style) {
  const HMENU menu = CreatePopupMenu();
  if (menu == nullptr) return nullptr;
  const auto enabled = [&](DWORD bit) { return style & bit ? MF_ENABLED : MF_GRAYED; };
  AppendMenuW(menu, MF_STRING, SC_RESTORE, WTEXT("&Restore"));
  AppendMenuW(menu, MF_STRING, SC_MOVE, WTEXT("&Move"));
  AppendMenuW(menu, MF_STRING | enabled(WS_THICKFRAME), SC_SIZE, WTEXT("&Size"));
  AppendMenuW(menu, MF_STRING | enabled(WS_MINIMIZEBOX), SC_MINIMIZE, WTEXT("Mi&nimize"));
  AppendMenuW(menu, MF_STRING | enabled(WS_MAXIMIZEBOX), SC_MAXIMIZE, WTEXT("Ma&ximize"));
  AppendMenuW(menu, MF_SEPARATOR, 0, nullptr);
  AppendMenuW(menu, MF_STRING, SC_CLOSE, WTEXT("&Close\tAlt+F4"));
  SetMenuDefaultItem(menu, SC_CLOSE, FALSE);
  return menu;
}

}  // namespace

// Items stand side by side; one that does not fit begins a new row.
int MenuBarHeight(HWND handle, int width) {
  const int row = GetSystemMetrics(SM_CYMENU);
  const HMENU menu = MenuOf(handle);
  if (menu == nullptr) return 0;
  return OrNoMemory<int>(row, [&] {
    List<MenuItem> items = ItemsOf(menu);
    int x = 0, y = 0;
    for (MenuItem& item : items) {
      const int wide = TextWidth(item.text) + 2 * Scaled(kBesideText);
      if (x > 0 && (x + wide > width || (item.type & (MFT_MENUBREAK | MFT_MENUBARBREAK)))) {
        x = 0;
        y += row;
      }
      item.place = {x, y, x + wide, y + row - 1};
      x += wide;
    }
    KeepPlaces(menu, items);
    return y + row;
  });
}

SIZE MeasurePopup(HMENU menu) {
  return OrNoMemory<SIZE>({}, [&]() -> SIZE {
    List<MenuItem> items = ItemsOf(menu);
    const int row = GetSystemMetrics(SM_CYMENUSIZE);
    int widest = 0, y = kPopupBorder;
    for (MenuItem& item : items) {
      const int high = item.type & MFT_SEPARATOR ? row / 2 : row;
      widest = std::max(widest, Scaled(kCheckArea) + TextWidth(item.text) + Scaled(kArrowArea));
      item.place = {kPopupBorder, y, 0, y + high};
      y += high;
    }
    for (MenuItem& item : items) item.place.right = kPopupBorder + widest;
    KeepPlaces(menu, items);
    return {widest + 2 * kPopupBorder, y + kPopupBorder};
  });
}

}  // namespace platform::model

using namespace platform::model;

HMENU GetMenu(HWND handle) {
  const Guard guard;
  const Window* window = Expect(handle);
  return window != nullptr && !(window->style & WS_CHILD) ? reinterpret_cast<HMENU>(window->idOrMenu) : nullptr;
}

// The menu that was there stays the caller's.
BOOL SetMenu(HWND handle, HMENU menu) {
  {
    const Guard guard;
    Window* window = Expect(handle);
    if (window == nullptr) return FALSE;
    if (window->style & WS_CHILD || (menu != nullptr && FindMenu(menu) == nullptr))
      return Fail(ERROR_INVALID_MENU_HANDLE);
    window->idOrMenu = reinterpret_cast<UINT_PTR>(menu);
  }
  SetWindowPos(handle, nullptr, 0, 0, 0, 0, SWP_NOSIZE | SWP_NOMOVE | SWP_NOACTIVATE | SWP_NOZORDER | SWP_FRAMECHANGED);
  return TRUE;
}

BOOL DrawMenuBar(HWND handle) {
  if (!IsWindow(handle)) return Fail(ERROR_INVALID_WINDOW_HANDLE);
  SetWindowPos(handle, nullptr, 0, 0, 0, 0, SWP_NOSIZE | SWP_NOMOVE | SWP_NOACTIVATE | SWP_NOZORDER | SWP_FRAMECHANGED);
  return TRUE;
}

// A window's own copy, made when it is first asked for; `revert` goes back to the standard one.
HMENU GetSystemMenu(HWND handle, BOOL revert) {
  DWORD style = 0;
  HMENU old = nullptr;
  {
    const Guard guard;
    Window* window = Expect(handle);
    if (window == nullptr || !(window->style & WS_SYSMENU)) return nullptr;
    if (window->systemMenu != nullptr && !revert) return window->systemMenu;
    style = window->style;
    old = window->systemMenu;
    window->systemMenu = nullptr;
  }
  if (old != nullptr) DestroyMenu(old);
  if (revert) return nullptr;
  const HMENU menu = MakeSystemMenu(style);
  const Guard guard;
  if (Window* window = FindWindowObject(handle)) window->systemMenu = menu;
  return menu;
}

// The window that shows a menu as a popup; null while it is closed. Under the lock.
static const Window* PopupOf(HMENU menu) {
  for (const Window* window = Desktop()->firstChild; window != nullptr; window = window->next) {
    if (window->windowClass->procedure != &MenuWindowProcedure || window->extra.size() < sizeof menu) continue;
    HMENU shown;
    std::memcpy(&shown, window->extra.data(), sizeof shown);
    if (shown == menu) return window;
  }
  return nullptr;
}

// Items lie relative to the popup that shows them, or to the bar.
BOOL GetMenuItemRect(HWND handle, HMENU menuHandle, UINT position, LPRECT rect) {
  const Guard guard;
  const Menu* menu = FindMenu(menuHandle);
  if (menu == nullptr || position >= menu->items.size()) return FALSE;
  POINT origin{};
  if (const Window* popup = PopupOf(menuHandle)) {
    origin = {popup->window.left, popup->window.top};
  } else {
    const Window* window = FindWindowObject(handle);
    if (window == nullptr || window->IsChild() || reinterpret_cast<HMENU>(window->idOrMenu) != menuHandle) return FALSE;
    const RECT bar = MenuBarRect(window), whole = ScreenRect(window);
    origin = {whole.left + bar.left, whole.top + bar.top};
  }
  *rect = Moved(menu->items[position].place, origin.x, origin.y);
  return TRUE;
}
