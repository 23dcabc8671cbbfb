#include "qxcore/platform/posix/window/target.h"

#include "qxcore/platform/posix/window/frame.h"
#include "qxcore/platform/posix/window/paint.h"
#include "qxcore/platform/posix/window/tree.h"

namespace platform::model {

bool FindTarget(HWND handle, bool isWhole, Target* target) {
  const Guard guard;
  Window* window = Expect(handle);
  if (window == nullptr || IsRoot(window)) return false;
  Window* top = TopLevelOf(window);
  const RECT onScreen = ScreenRect(window), topPlace = ScreenRect(top), client = ClientInWindow(window);
  const POINT corner{onScreen.left - topPlace.left, onScreen.top - topPlace.top};
  VisibleRegion(window, window->style & WS_CLIPCHILDREN, &target->visible);
  if (!isWhole) target->visible.Intersect(client);
  target->visible.Move(corner.x, corner.y);
  target->origin = isWhole ? corner : POINT{corner.x + client.left, corner.y + client.top};
  target->top = top->handle;
  target->size = {Width(top->window), Height(top->window)};
  target->surface = &top->surface;
  return true;
}

}  // namespace platform::model
