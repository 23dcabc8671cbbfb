// Pixels that follow their windows later. A window that moves takes no pixels along at once: it is noted where they
// are, and they are copied, together with those of all other windows that moved meanwhile, when somebody is about to
// draw on the top-level window or to read from it. A size that is dragged thus copies once for each time that it is
// painted.
//
// Invariants, for each thread:
// 1. The windows whose pixels wait are children of one parent.
// 2. Nothing was drawn on its top-level window since the first of them moved.
// 3. The parent has not moved on the top-level window since.
#pragma once

#include "qxcore/platform/posix/window/controls.h"
#include "qxcore/platform/posix/window/placing.h"

namespace platform::model {

// Pixels of a window that are elsewhere on the screen than the window.
struct DeferredCopy {
  HWND window;
  RECT kept;  // which of them are worth copying; relative to the window
  POINT at;   // where the corner of these is, relative to the parent's client area
};

struct DeferredCopies {
  HWND parent = nullptr;
  RECT sources{};  // around all that was noted, relative to the parent's client area
  List<DeferredCopy> copies;
  List<MovedPixels> moves;  // room for as many, so that copying takes no memory of the model
};

// Under the lock: notes where the pixels are that stay valid through a change of place. Returns whether this window
// began to wait. Without memory for the note it is painted anew.
bool CopyLater(Window* window, const Placing& placing);
// The surface of a top-level window moves with it, and only the client area may lie elsewhere on it: moves its pixels.
// Without the lock.
void ShiftClient(const Placing& placing);
// Copies all that waits for the calling thread. Without the lock.
void CopyNow();
// The same if somebody is about to draw on or to read from a part of a top-level window, relative to it, that the
// pixels come from or go to.
void CopyBefore(HWND top, const RECT& used);

}  // namespace platform::model
