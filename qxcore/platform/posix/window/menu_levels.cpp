// What is open and selected while a menu is used.

#include "qxcore/platform/posix/window/controls.h"
#include "qxcore/platform/posix/window/default_proc.h"
#include "qxcore/platform/posix/window/frame.h"
#include "qxcore/platform/posix/window/menu_loop.h"
#include "qxcore/platform/posix/window/send.h"
#include "qxcore/platform/posix/window/tree.h"

namespace platform::model {

void MenuLoop::Select(int position) {
  Level& level = Deepest();
  if (level.selected == position) return;
  level.selected = position;
  {
    const Guard guard;
    if (Menu* menu = FindMenu(level.menu)) menu->highlighted = position;
  }
  Repaint(level);
  TellSelection();
}

void MenuLoop::TellSelection() {
  if (!Notifies()) return;
  const Level& level = Deepest();
  const MenuItem item = ItemAt(level, level.selected);
  UINT flags = (item.type | item.state | MF_HILITE) & 0xFF;
  if (item.subMenu != nullptr) flags |= MF_POPUP;
  if (level.isSystem) flags |= MF_SYSMENU;
  if (m_byMouse) flags |= MF_MOUSESELECT;
  const UINT what = item.subMenu != nullptr ? static_cast<UINT>(level.selected) : item.id;
  Send(m_owner, WM_MENUSELECT, MAKEWPARAM(what, flags), reinterpret_cast<LPARAM>(level.menu));
}

MenuItem MenuLoop::ItemAt(const Level& level, int position) {
  const Guard guard;
  const Menu* menu = FindMenu(level.menu);
  if (menu == nullptr || position < 0 || position >= static_cast<int>(menu->items.size())) return {};
  return menu->items[static_cast<std::size_t>(position)];
}

void MenuLoop::Repaint(const Level& level) {
  if (level.popup == nullptr) {
    PaintFrame(m_owner);
  } else if (g_painter.popupMenu != nullptr) {
    g_painter.popupMenu(level.popup, level.menu);
  }
}

HWND MenuLoop::Show(HMENU menu, POINT point) {
  const SIZE size = MeasurePopup(menu);
  const HWND popup = CreateWindowExW(WS_EX_TOOLWINDOW | WS_EX_TOPMOST, MAKEINTRESOURCEW(0x8000), nullptr, WS_POPUP, 0,
                                     0, 0, 0, m_owner, nullptr, nullptr, nullptr);
  if (popup == nullptr) return nullptr;
  SetWindowLongPtrW(popup, 0, reinterpret_cast<LONG_PTR>(menu));
  const SIZE screen{GetSystemMetrics(SM_CXSCREEN), GetSystemMetrics(SM_CYSCREEN)};
  point.x = std::max<LONG>(std::min(point.x, screen.cx - size.cx), 0);
  point.y = std::max<LONG>(std::min(point.y, screen.cy - size.cy), 0);
  SetWindowPos(popup, HWND_TOPMOST, point.x, point.y, size.cx, size.cy, SWP_SHOWWINDOW | SWP_NOACTIVATE | SWP_NOREDRAW);
  if (g_painter.popupMenu != nullptr) g_painter.popupMenu(popup, menu);
  return popup;
}

// Where the submenu of an item goes: below an item of the bar, right of an item of a popup.
POINT MenuLoop::PlaceBelow(const Level& level, const RECT& place) {
  const Guard guard;
  if (level.popup == nullptr) {
    const Window* owner = FindWindowObject(m_owner);
    if (owner == nullptr) return {};
    const RECT whole = ScreenRect(owner), bar = level.isSystem ? CaptionRect(owner) : MenuBarRect(owner);
    return {whole.left + bar.left + place.left, whole.top + bar.top + (level.isSystem ? Height(bar) : place.bottom)};
  }
  const Window* popup = FindWindowObject(level.popup);
  return popup != nullptr ? POINT{popup->window.left + place.right, popup->window.top + place.top} : POINT{};
}

void MenuLoop::Open() {
  const Level level = Deepest();
  const MenuItem item = ItemAt(level, level.selected);
  if (item.subMenu == nullptr) return;
  if (Notifies())
    Send(m_owner, WM_INITMENUPOPUP, reinterpret_cast<WPARAM>(item.subMenu),
         MAKELPARAM(level.selected, level.isSystem ? 1 : 0));
  const HWND popup = Show(item.subMenu, PlaceBelow(level, item.place));
  m_levels.push_back({item.subMenu, popup, -1, level.isSystem});
  if (!m_byMouse) Move(1);
}

void MenuLoop::Close() {
  const Level level = Deepest();
  m_levels.pop_back();
  {
    const Guard guard;
    if (Menu* menu = FindMenu(level.menu)) menu->highlighted = -1;
  }
  if (IsWindow(level.popup)) DestroyWindow(level.popup);
  if (Notifies()) Send(m_owner, WM_UNINITMENUPOPUP, reinterpret_cast<WPARAM>(level.menu));
}

void MenuLoop::CloseTop() {
  {
    const Guard guard;
    if (Menu* menu = FindMenu(Top().menu)) menu->highlighted = -1;
  }
  if (IsWindow(Top().popup)) DestroyWindow(Top().popup);
  if (Top().popup == nullptr) PaintFrame(m_owner);
}

void MenuLoop::Execute() {
  const Level level = Deepest();
  const MenuItem item = ItemAt(level, level.selected);
  if (level.selected < 0) return;
  if (item.subMenu != nullptr) {
    if (!(item.state & (MF_GRAYED | MF_DISABLED))) Open();
    return;
  }
  if (item.type & MFT_SEPARATOR || item.state & (MF_GRAYED | MF_DISABLED)) return;
  m_command = item.id;
  m_isSystemCommand = level.isSystem;
  m_isOver = true;
}

}  // namespace platform::model
