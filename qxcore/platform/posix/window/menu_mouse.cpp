// A menu by the mouse.

#include "qxcore/platform/posix/window/frame.h"
#include "qxcore/platform/posix/window/menu_loop.h"
#include "qxcore/platform/posix/window/tree.h"

namespace platform::model {

static bool IsPress(UINT message) {
  return message == WM_LBUTTONDOWN || message == WM_LBUTTONDBLCLK || message == WM_RBUTTONDOWN;
}

// The level and item at a point of the screen; the deepest popup first.
bool MenuLoop::ItemUnder(POINT point, std::size_t* at, int* position) {
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

bool MenuLoop::Press(POINT point) {
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

bool MenuLoop::IsPressBeside(const MSG& message) {
  std::size_t at;
  int position;
  return IsPress(message.message) && !ItemUnder(message.pt, &at, &position);
}

bool MenuLoop::TakeMouse(const MSG& message) {
  const bool isMouse = message.message >= WM_MOUSEFIRST && message.message <= WM_MOUSELAST;
  if (!isMouse) return message.message >= WM_NCMOUSEMOVE && message.message <= WM_NCMBUTTONDBLCLK;
  m_byMouse = true;
  std::size_t at;
  int position;
  if (IsPress(message.message)) {
    Press(message.pt);
    return true;
  }
  switch (message.message) {
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
      // An item is chosen only when the mouse has selected it before.
      if (ItemUnder(message.pt, &at, &position) && at + 1 == m_levels.size() && position >= 0 &&
          position == m_levels[at].selected && (at > 0 || m_levels[at].popup != nullptr))
        Execute();
      return true;
    default:
      return true;
  }
}

}  // namespace platform::model
