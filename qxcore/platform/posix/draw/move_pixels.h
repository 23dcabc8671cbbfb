#pragma once

#include "qxcore/platform/posix/window/controls.h"

namespace draw {

// Moves pixels on the surface in a top-level window's slot, which is made as large as the window first. False without
// memory; then some may be lost.
bool MovePixels(HWND top, void* slot, SIZE size, const platform::MovedPixels* moves, std::size_t count);

}  // namespace draw
