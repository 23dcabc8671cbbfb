// Activation and focus.
#pragma once

#include "qxcore/platform/posix/window/thread.h"

namespace platform::model {

enum class By { Program, Mouse };
// Makes a top-level window of the calling thread the active one; null deactivates. False when a hook or a
// procedure refuses. With `moveFocus` the focus goes there as well unless it is there already.
bool Activate(HWND window, By by, bool moveFocus);
// Gives the activation to the best other window when `window` goes.
void ActivateAnother(HWND window);
// Takes the focus from the window and what is below it when the window goes: a child gives it to its parent.
void LeaveFocus(HWND window);
// Under the lock: puts a top-level window above the others, and the windows it owns above it.
void RaiseTopLevel(Window* window);

}  // namespace platform::model
