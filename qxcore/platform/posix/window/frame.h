// The parts of a window outside its client area, relative to the window's top left corner. Under the lock.
#pragma once

#include "qxcore/platform/posix/window/window.h"

namespace platform::model {

bool HasMenu(const Window* window);
// The inside of the border, with caption, menu bar and scroll bars still in it.
RECT InsideBorder(const Window* window);
RECT CaptionRect(const Window* window);
RECT MenuBarRect(const Window* window);
// The places of the scroll bars; empty for one that the window does not have.
RECT VerticalBarRect(const Window* window);
RECT HorizontalBarRect(const Window* window);
// The client area within the window.
inline RECT ClientInWindow(const Window* window) {
  return Moved(window->client, -window->window.left, -window->window.top);
}

}  // namespace platform::model
