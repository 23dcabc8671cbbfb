// What the display shows of the model's windows. None of these functions is called with the lock held.
#pragma once

#include "qxcore/platform/posix/display/display.h"
#include "qxcore/platform/posix/window/window.h"

namespace platform::model {

// Shows a top-level window as the model has it now; nothing for other windows.
void ShowOnDisplay(HWND window);
// Something was drawn within `changed` on the surface of a top-level window.
void PresentOnDisplay(HWND top, const ShownPixels& pixels, const RECT& changed);

}  // namespace platform::model
