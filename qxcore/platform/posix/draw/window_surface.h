// What windows are drawn on.
#pragma once

#include "qxcore/platform/posix/draw/context.h"

namespace draw {

// A context for a window's client area or the whole window, within `clip` (in the context's coordinates; null takes
// all that is visible). Null with the last error when the window is invalid. End it with ReleaseDC.
HDC OpenWindow(HWND window, bool isWhole, const pixman_region32_t* clip);

// Ends what a top-level window's slot holds.
void FreeWindowSurface(void* surface);
// The pixels behind a top-level window's slot; null before anything was drawn.
const Surface* WindowSurface(void* surface);
// The same, at least as large as `size`.
const Surface* GrownSurface(void* surface, SIZE size);
// Whether a context draws on it.
bool IsSurfaceInUse(void* surface);

}  // namespace draw
