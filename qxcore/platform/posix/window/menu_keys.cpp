// A menu by the keyboard: arrows, mnemonics, Enter and Escape.

#include "qxcore/platform/bmp.h"
#include "qxcore/platform/posix/window/menu_loop.h"
#include "qxcore/platform/posix/window/send.h"

namespace platform::model {

// To the next item that is no separator, around the ends.
void MenuLoop::Move(int step) {
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

int MenuLoop::FindMnemonic(WCHAR key) {
  const Level level = Deepest();
  for (int i = 0; i < Count(level); ++i)
    if (MnemonicOf(ItemAt(level, i).text) == ToUpperBmp(key)) return i;
  return -1;
}

// Opens or chooses the item with the mnemonic; false when no item has it.
bool MenuLoop::ChooseMnemonic(WCHAR key) {
  const int position = FindMnemonic(key);
  if (position < 0) return false;
  Select(position);
  Execute();
  return true;
}

void MenuLoop::TypeMnemonic(WCHAR key) {
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
void MenuLoop::MoveAlongBar(int step) {
  if (!m_isBar) return;
  const bool wasOpen = m_levels.size() > 1;
  while (m_levels.size() > 1) Close();
  Move(step);
  if (wasOpen) Open();
}

bool MenuLoop::TakeKey(const MSG& message) {
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

}  // namespace platform::model
