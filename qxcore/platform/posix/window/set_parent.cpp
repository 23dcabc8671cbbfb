// Moving a window to another parent: it is hidden, moved in the tree, and shown again.

#include "qxcore/platform/posix/window/children_area.h"
#include "qxcore/platform/posix/window/paint.h"
#include "qxcore/platform/posix/window/send.h"
#include "qxcore/platform/posix/window/tree.h"

using namespace platform::model;

HWND SetParent(HWND handle, HWND newParent) {
  {
    const Guard guard;
    Window* window = Expect(handle);
    if (window == nullptr) return nullptr;
    const Window* parent = newParent == nullptr        ? Desktop()
                           : newParent == HWND_MESSAGE ? MessageRoot()
                                                       : Expect(newParent);
    if (parent == nullptr) return nullptr;
    if (IsRoot(window) || parent == window || IsBelow(parent, window)) return Fail<HWND>(ERROR_INVALID_PARAMETER);
  }
  const bool wasVisible = ShowWindow(handle, SW_HIDE);
  HWND oldParent = nullptr;
  POINT place{};
  {
    const Guard guard;
    Window* window = Expect(handle);
    Window* parent = newParent == nullptr ? Desktop() : newParent == HWND_MESSAGE ? MessageRoot() : Expect(newParent);
    if (window == nullptr || parent == nullptr) return nullptr;
    oldParent = HandleOf(window->parent);
    place = {window->window.left, window->window.top};
    // It stays where it is on the screen, until it is moved to the same place in the new parent.
    const POINT before = ParentOrigin(window);
    Unlink(window);
    Link(window, parent, nullptr);
    const POINT after = ParentOrigin(window);
    window->window = Moved(window->window, before.x - after.x, before.y - after.y);
    window->client = Moved(window->client, before.x - after.x, before.y - after.y);
    SceneChanged(window);
  }
  SetWindowPos(handle, HWND_TOP, place.x, place.y, 0, 0, SWP_NOSIZE | (wasVisible ? 0u : SWP_NOACTIVATE));
  if (wasVisible) ShowWindow(handle, SW_SHOW);
  return oldParent;
}
