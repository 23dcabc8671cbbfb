// Using a menu: the loop that the bar, the system menu and popups share, by keyboard and mouse.
#pragma once

#include "qxcore/platform/posix/window/menu.h"
#include "qxcore/platform/posix/window/thread.h"

namespace platform::model {

class MenuLoop {
 public:
  MenuLoop(HWND owner, HMENU menu, UINT flags, bool isBar, bool isSystem)
      : m_owner(owner), m_flags(flags), m_isBar(isBar) {
    m_levels.push_back({menu, nullptr, -1, isSystem});
  }
  MenuLoop(const MenuLoop&) = delete;
  MenuLoop& operator=(const MenuLoop&) = delete;
  // Memory may have run out in the loop: the thread must not stay in it for ever.
  ~MenuLoop();

  // False when the thread is using a menu already. Throws std::bad_alloc, as all of them do.
  bool Begin();
  // Runs until something is chosen or the menu is left. Returns the chosen command, or 0.
  UINT Run();
  // Closes what is open, and posts the command unless the flags say that it is returned.
  void End();
  // Shows the menu itself as a popup.
  void ShowTop(POINT point) { Top().popup = Show(Top().menu, point); }
  // Selects an item of the deepest menu, and says so; -1 deselects.
  void Select(int position);
  // Opens or chooses the item with the mnemonic; false when no item has it.
  bool ChooseMnemonic(WCHAR key);
  void SelectNext(int step) { Move(step); }
  bool PressAt(POINT point) { return Press(point); }

 private:
  struct Level {
    HMENU menu;
    HWND popup;  // the window that shows it; null for the bar
    int selected = -1;
    bool isSystem = false;
  };

  void Leave();
  Level& Top() { return m_levels.front(); }
  Level& Deepest() { return m_levels.back(); }
  bool Notifies() const { return !(m_flags & TPM_NONOTIFY); }
  bool Continues() const;
  void WaitForAny();
  MenuItem ItemAt(const Level& level, int position);
  int Count(const Level& level) { return std::max(GetMenuItemCount(level.menu), 0); }
  void Repaint(const Level& level);
  void TellSelection();
  HWND Show(HMENU menu, POINT point);
  // Where the submenu of an item goes: below an item of the bar, right of an item of a popup.
  POINT PlaceBelow(const Level& level, const RECT& place);
  void Open();
  void Close();
  void CloseTop();
  // To the next item that is no separator, around the ends.
  void Move(int step);
  void Execute();
  int FindMnemonic(WCHAR key);
  void TypeMnemonic(WCHAR key);
  // Left and right move along the bar, with the popup of the new item open if one was.
  void MoveAlongBar(int step);
  bool TakeKey(const MSG& message);
  // The level and item at a point of the screen; the deepest popup first.
  bool ItemUnder(POINT point, std::size_t* at, int* position);
  bool Press(POINT point);
  // Whether the message is a press outside of the menu. It ends the menu and stays in the queue, for the window that
  // lies there.
  bool IsPressBeside(const MSG& message);
  bool TakeMouse(const MSG& message);

  const HWND m_owner;
  const UINT m_flags;
  const bool m_isBar;
  bool m_hasBegun = false, m_byMouse = false, m_isOver = false, m_isSystemCommand = false;
  UINT m_command = 0;
  List<Level> m_levels;
};

}  // namespace platform::model
