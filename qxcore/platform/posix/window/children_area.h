// What of a client area the visible children cover. Relative to the client area; under the lock, all of it.
#pragma once

#include "qxcore/platform/posix/window/window.h"

namespace platform::model {

// The number of the scene: it changes whenever a window comes to light, goes, moves or gets another size. While it is
// the same, a window remembers that all its children are invalid as a whole (paint.h).
extern std::uint64_t g_scene;
// To be called for each such change, with the window that changed.
void SceneChanged(Window* window);

// Remembered until one of the children changes. Throws std::bad_alloc.
const ChildrenArea& AreaOfChildren(Window* parent);
// Whether no visible child lies over another. Throws std::bad_alloc.
bool AreChildrenApart(Window* parent);

// Takes the children's places from a region that is relative to the window.
void SubtractChildren(const Window* window, Region* region);

}  // namespace platform::model
