// Using menus: one loop for the bar, the system menu and popups, by keyboard and mouse.

#include "qxcore/platform/bmp.h"
#include "qxcore/platform/posix/window/controls.h"
#include "qxcore/platform/posix/window/default_proc.h"
#include "qxcore/platform/posix/window/frame.h"
#include "qxcore/platform/posix/window/menu.h"
#include "qxcore/platform/posix/window/queue.h"
#include "qxcore/platform/posix/window/send.h"
#include "qxcore/platform/posix/window/tree.h"

namespace platform::model {
namespace {

constexpr UINT kNothing = 0xFFFF;

struct Level {
  HMENU menu;
  HWND popup;  // the window that shows it; null for the bar
  int selected = -1;
  bool isSystem = false;
};

class MenuLoop {
 public:
  MenuLoop(HWND owner, HMENU menu, UINT flags, bool isBar, bool isSystem)
      : m_owner(owner), m_flags(flags), m_isBar(isBar) {
    m_levels.push_back({menu, nullptr, -1, isSystem});
  }

  bool Begin() {
    Thread* thread = CurrentThread();
    {
      const Guard guard;
      if (thread->inMenuLoop) return false;
      thread->inMenuLoop = true;
      thread->menuOwner = m_owner;
    }
    SetCapture(m_owner);
    Send(m_owner, WM_ENTERMENULOOP, m_isBar ? FALSE : TRUE);
    Send(m_owner, WM_SETCURSOR, reinterpret_cast<WPARAM>(m_owner), MAKELPARAM(HTCAPTION, 0));
    if (Notifies()) Send(m_owner, WM_INITMENU, reinterpret_cast<WPARAM>(Top().menu));
    return true;
  }

  // Returns the chosen command, or 0.
  UINT Run() {
    MSG message;
    while (!m_isOver && Continues()) {
      if (!PeekMessageW(&message, nullptr, 0, 0, PM_REMOVE)) {
        Send(m_owner, WM_ENTERIDLE, MSGF_MENU, reinterpret_cast<LPARAM>(Deepest().popup));
        if (!m_isOver && Continues()) WaitForAny();
        continue;
      }
      if (message.message == WM_QUIT) {
        PostQuitMessage(static_cast<int>(message.wParam));
        break;
      }
      if (!TakeMouse(message) && !TakeKey(message)) {
        TranslateMessage(&message);
        DispatchMessageW(&message);
      }
    }
    return m_command;
  }

  void End() {
    Thread* thread = CurrentThread();
    {
      const Guard guard;
      thread->inMenuLoop = false;
      thread->menuOwner = nullptr;
    }
    if (GetCapture() == m_owner) ReleaseCapture();
    while (m_levels.size() > 1) Close();
    CloseTop();
    if (Notifies()) Send(m_owner, WM_MENUSELECT, MAKEWPARAM(0, kNothing), 0);
    Send(m_owner, WM_EXITMENULOOP, m_isBar ? FALSE : TRUE);
    if (m_command == 0 || m_flags & TPM_RETURNCMD) return;
    PostMessageW(m_owner, m_isSystemCommand ? WM_SYSCOMMAND : WM_COMMAND, m_command, 0);
  }

  void ShowTop(POINT point) { Top().popup = Show(Top().menu, point); }

  void Select(int position) {
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

  void OpenSelected() { Open(); }
  // Opens or chooses the item with the mnemonic; false without one.
  bool ChooseMnemonic(WCHAR key) {
    const int position = FindMnemonic(key);
    if (position < 0) return false;
    Select(position);
    Execute();
    return true;
  }
  void SelectNext(int step) { Move(step); }
  bool PressAt(POINT point) { return Press(point); }

 private:
  Level& Top() { return m_levels.front(); }
  Level& Deepest() { return m_levels.back(); }
  bool Notifies() const { return !(m_flags & TPM_NONOTIFY); }
  bool Continues() const {
    Thread* thread = CurrentThread();
    const Guard guard;
    return thread->menuOwner == m_owner && FindWindowObject(m_owner) != nullptr;
  }

  void WaitForAny() {
    Thread* thread = CurrentThread();
    MSG message;
    const Guard guard;
    while (!TakeMessage(thread, &message, {nullptr, 0, 0}, false)) WaitForMessage(thread);
  }

  MenuItem ItemAt(const Level& level, int position) {
    const Guard guard;
    const Menu* menu = FindMenu(level.menu);
    if (menu == nullptr || position < 0 || position >= static_cast<int>(menu->items.size())) return {};
    return menu->items[static_cast<std::size_t>(position)];
  }

  int Count(const Level& level) { return std::max(GetMenuItemCount(level.menu), 0); }

  void Repaint(const Level& level) {
    if (level.popup == nullptr) {
      PaintFrame(m_owner);
    } else if (g_painter.popupMenu != nullptr) {
      g_painter.popupMenu(level.popup, level.menu);
    }
  }

  void TellSelection() {
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

  HWND Show(HMENU menu, POINT point) {
    const SIZE size = MeasurePopup(menu);
    const HWND popup = CreateWindowExW(WS_EX_TOOLWINDOW | WS_EX_TOPMOST, MAKEINTRESOURCEW(0x8000), nullptr, WS_POPUP, 0,
                                       0, 0, 0, m_owner, nullptr, nullptr, nullptr);
    if (popup == nullptr) return nullptr;
    SetWindowLongPtrW(popup, 0, reinterpret_cast<LONG_PTR>(menu));
    const SIZE screen{GetSystemMetrics(SM_CXSCREEN), GetSystemMetrics(SM_CYSCREEN)};
    point.x = std::max<LONG>(std::min(point.x, screen.cx - size.cx), 0);
    point.y = std::max<LONG>(std::min(point.y, screen.cy - size.cy), 0);
    SetWindowPos(popup, HWND_TOPMOST, point.x, point.y, size.cx, size.cy,
                 SWP_SHOWWINDOW | SWP_NOACTIVATE | SWP_NOREDRAW);
    if (g_painter.popupMenu != nullptr) g_painter.popupMenu(popup, menu);
    return popup;
  }

  // Where the submenu of an item goes: below an item of the bar, right of an item of a popup.
  POINT PlaceBelow(const Level& level, const RECT& place) {
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

  void Open() {
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

  void Close() {
    const Level level = Deepest();
    m_levels.pop_back();
    {
      const Guard guard;
      if (Menu* menu = FindMenu(level.menu)) menu->highlighted = -1;
    }
    if (IsWindow(level.popup)) DestroyWindow(level.popup);
    if (Notifies()) Send(m_owner, WM_UNINITMENUPOPUP, reinterpret_cast<WPARAM>(level.menu));
  }

  void CloseTop() {
    {
      const Guard guard;
      if (Menu* menu = FindMenu(Top().menu)) menu->highlighted = -1;
    }
    if (IsWindow(Top().popup)) DestroyWindow(Top().popup);
    if (Top().popup == nullptr) PaintFrame(m_owner);
  }

  // To the next item that is no separator, around the ends.
  void Move(int step) {
    const Level level = Deepest();
    const int count = Count(level);
    int position = level.selected < 0 ? (step > 0 ? count - 1 : 0) : level.selected;
    for (int i = 0; i < count; ++i) {
      position = (position + step + count) % count;
      if (!(ItemAt(level, position).type & MFT_SEPARATOR)) {
        Select(position);
        return;
      }
    }
  }

  void Execute() {
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

  int FindMnemonic(WCHAR key) {
    const Level level = Deepest();
    for (int i = 0; i < Count(level); ++i)
      if (MnemonicOf(ItemAt(level, i).text) == ToUpperBmp(key)) return i;
    return -1;
  }

  void TypeMnemonic(WCHAR key) {
    const int position = FindMnemonic(key);
    if (position >= 0) {
      Select(position);
      Execute();
      return;
    }
    const LRESULT answer = Send(m_owner, WM_MENUCHAR, MAKEWPARAM(key, m_levels.size() > 1 ? MF_POPUP : 0),
                                reinterpret_cast<LPARAM>(Deepest().menu));
    if (HIWORD(answer) == MNC_CLOSE) m_isOver = true;
    if (HIWORD(answer) == MNC_SELECT || HIWORD(answer) == MNC_EXECUTE) Select(LOWORD(answer));
    if (HIWORD(answer) == MNC_EXECUTE) Execute();
  }

  // Left and right move along the bar, with the popup of the new item open if one was.
  void MoveAlongBar(int step) {
    if (!m_isBar) return;
    const bool wasOpen = m_levels.size() > 1;
    while (m_levels.size() > 1) Close();
    Move(step);
    if (wasOpen) Open();
  }

  bool TakeKey(const MSG& message) {
    m_byMouse = false;
    if (message.message == WM_CHAR || message.message == WM_SYSCHAR) {
      if (message.wParam >= ' ') TypeMnemonic(static_cast<WCHAR>(message.wParam));
      return true;
    }
    if (message.message != WM_KEYDOWN && message.message != WM_SYSKEYDOWN)
      return message.message == WM_KEYUP || message.message == WM_SYSKEYUP;
    const bool inBar = m_levels.size() == 1 && Top().popup == nullptr;
    switch (message.wParam) {
      case VK_MENU:
      case VK_F10:
        m_isOver = true;
        return true;
      case VK_ESCAPE:
        if (m_levels.size() > 1) {
          Close();
        } else {
          m_isOver = true;
        }
        return true;
      case VK_RETURN:
        Execute();
        return true;
      case VK_DOWN:
      case VK_UP:
        if (inBar) {
          Open();
        } else {
          Move(message.wParam == VK_DOWN ? 1 : -1);
        }
        return true;
      case VK_RIGHT:
        if (!inBar && ItemAt(Deepest(), Deepest().selected).subMenu != nullptr) {
          Open();
        } else {
          MoveAlongBar(1);
        }
        return true;
      case VK_LEFT:
        if (m_levels.size() > 2) {
          Close();
        } else {
          MoveAlongBar(-1);
        }
        return true;
      default:
        TranslateMessage(&message);
        return true;
    }
  }

  // The level and item at a point of the screen; the deepest popup first.
  bool ItemUnder(POINT point, std::size_t* at, int* position) {
    for (std::size_t i = m_levels.size(); i-- > 0;) {
      const Level level = m_levels[i];
      RECT area{};
      POINT origin{};
      {
        const Guard guard;
        if (level.popup != nullptr) {
          const Window* popup = FindWindowObject(level.popup);
          if (popup == nullptr) continue;
          area = popup->window;
          origin = {area.left, area.top};
        } else {
          const Window* owner = FindWindowObject(m_owner);
          if (owner == nullptr || level.isSystem) continue;
          const RECT whole = ScreenRect(owner), bar = MenuBarRect(owner);
          area = Moved(bar, whole.left, whole.top);
          origin = {area.left, area.top};
        }
      }
      if (!Contains(area, point)) continue;
      *at = i;
      *position = -1;
      for (int each = 0; each < Count(level); ++each)
        if (Contains(ItemAt(level, each).place, {point.x - origin.x, point.y - origin.y})) *position = each;
      return true;
    }
    return false;
  }

  bool Press(POINT point) {
    m_byMouse = true;
    std::size_t at;
    int position;
    if (!ItemUnder(point, &at, &position)) return false;
    const bool wasOpen = m_levels.size() > at + 1 && m_levels[at].selected == position;
    if (wasOpen) return true;
    while (m_levels.size() > at + 1) Close();
    Select(position);
    Open();
    return true;
  }

  bool TakeMouse(const MSG& message) {
    const bool isMouse = message.message >= WM_MOUSEFIRST && message.message <= WM_MOUSELAST;
    if (!isMouse) return message.message >= WM_NCMOUSEMOVE && message.message <= WM_NCMBUTTONDBLCLK;
    m_byMouse = true;
    std::size_t at;
    int position;
    switch (message.message) {
      case WM_LBUTTONDOWN:
      case WM_LBUTTONDBLCLK:
      case WM_RBUTTONDOWN:
        if (!Press(message.pt)) m_isOver = true;
        return true;
      case WM_MOUSEMOVE:
        if (ItemUnder(message.pt, &at, &position) && position >= 0 && position != m_levels[at].selected) {
          const bool opens = at == 0 && m_isBar && m_levels.size() > 1;
          while (m_levels.size() > at + 1) Close();
          Select(position);
          if (opens) Open();
        }
        return true;
      case WM_LBUTTONUP:
      case WM_RBUTTONUP:
        if (ItemUnder(message.pt, &at, &position) && at + 1 == m_levels.size() && position >= 0 &&
            (at > 0 || m_levels[at].popup != nullptr)) {
          Select(position);
          Execute();
        }
        return true;
      default:
        return true;
    }
  }

  const HWND m_owner;
  const UINT m_flags;
  const bool m_isBar;
  bool m_byMouse = false, m_isOver = false, m_isSystemCommand = false;
  UINT m_command = 0;
  List<Level> m_levels;
};

}  // namespace

void UseMenuBarByKey(HWND window, WCHAR key) {
  const HMENU menu = GetMenu(window);
  if (!IsMenu(menu) || GetMenuItemCount(menu) == 0) return;
  OrNoMemory<int>(0, [&] {
    MenuLoop loop(window, menu, 0, true, false);
    if (!loop.Begin()) return 0;
    if (key == 0) {
      loop.SelectNext(1);
      loop.Run();
    } else if (loop.ChooseMnemonic(key)) {
      loop.Run();
    } else {
      MessageBeep(0);
    }
    loop.End();
    return 0;
  });
}

void UseMenuBarByMouse(HWND window, POINT point) {
  const HMENU menu = GetMenu(window);
  if (!IsMenu(menu)) return;
  OrNoMemory<int>(0, [&] {
    MenuLoop loop(window, menu, 0, true, false);
    if (!loop.Begin()) return 0;
    if (loop.PressAt(point)) loop.Run();
    loop.End();
    return 0;
  });
}

void UseSystemMenu(HWND window) {
  const HMENU menu = GetSystemMenu(window, FALSE);
  if (menu == nullptr) return;
  OrNoMemory<int>(0, [&] {
    MenuLoop loop(window, menu, 0, false, true);
    if (!loop.Begin()) return 0;
    RECT rect;
    GetWindowRect(window, &rect);
    Send(window, WM_INITMENUPOPUP, reinterpret_cast<WPARAM>(menu), MAKELPARAM(0, 1));
    loop.ShowTop({rect.left, rect.top + GetSystemMetrics(SM_CYCAPTION)});
    loop.SelectNext(1);
    loop.Run();
    loop.End();
    return 0;
  });
}

// The window that shows a popup; the loop does everything else.
LRESULT CALLBACK MenuWindowProcedure(HWND window, UINT message, WPARAM wParam, LPARAM lParam) {
  switch (message) {
    case WM_MOUSEACTIVATE:
      return MA_NOACTIVATE;
    case WM_ERASEBKGND:
      return TRUE;
    case WM_PAINT:
      if (g_painter.popupMenu != nullptr)
        g_painter.popupMenu(window, reinterpret_cast<HMENU>(GetWindowLongPtrW(window, 0)));
      ValidateRect(window, nullptr);
      return 0;
    default:
      return DefWindowProcW(window, message, wParam, lParam);
  }
}

}  // namespace platform::model

using namespace platform::model;

BOOL TrackPopupMenu(HMENU menu, UINT flags, int x, int y, int, HWND owner, const RECT*) {
  if (!IsMenu(menu)) return Fail(ERROR_INVALID_MENU_HANDLE);
  if (!IsWindow(owner)) return Fail(ERROR_INVALID_WINDOW_HANDLE);
  return OrNoMemory<BOOL>(FALSE, [&]() -> BOOL {
    MenuLoop loop(owner, menu, flags, false, false);
    if (!loop.Begin()) return FALSE;
    if (!(flags & TPM_NONOTIFY)) Send(owner, WM_INITMENUPOPUP, reinterpret_cast<WPARAM>(menu), 0);
    const SIZE size = MeasurePopup(menu);
    if (flags & TPM_RIGHTALIGN) x -= size.cx;
    if (flags & TPM_CENTERALIGN) x -= size.cx / 2;
    if (flags & TPM_BOTTOMALIGN) y -= size.cy;
    if (flags & TPM_VCENTERALIGN) y -= size.cy / 2;
    loop.ShowTop({x, y});
    const UINT command = loop.Run();
    loop.End();
    return flags & TPM_RETURNCMD ? static_cast<BOOL>(command) : TRUE;
  });
}

BOOL TrackPopupMenuEx(HMENU menu, UINT flags, int x, int y, HWND owner, TPMPARAMS*) {
  return TrackPopupMenu(menu, flags, x, y, 0, owner, nullptr);
}

// The loop sees that its window is no longer the owner of a menu.
BOOL EndMenu() {
  Thread* thread = CurrentThread();
  const Guard guard;
  thread->menuOwner = nullptr;
  Wake(thread);
  return TRUE;
}
