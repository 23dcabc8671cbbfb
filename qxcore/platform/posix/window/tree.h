// The tree of windows. Under the lock, all of it.
#pragma once

#include "qxcore/platform/posix/window/window.h"

namespace platform::model {

// Puts the window among the children of `parent`, below `after`; at the top for null.
void Link(Window* window, Window* parent, Window* after);
void Unlink(Window* window);
// Whether `window` is a descendant of `ancestor`, through children only.
bool IsBelow(const Window* window, const Window* ancestor);
Window* TopLevelOf(Window* window);
// The next window of the tree below `top`: depth first, in Z order; null at the end.
Window* NextInTree(const Window* window, const Window* top);
// The place of a window's parent's client area on the screen.
POINT ParentOrigin(const Window* window);
RECT ScreenRect(const Window* window);
RECT ClientScreenRect(const Window* window);
// What callers of GetParent see: the parent of a child, the owner of a popup.
Window* ParentOrOwner(const Window* window);

}  // namespace platform::model
