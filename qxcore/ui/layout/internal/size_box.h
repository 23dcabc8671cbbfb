// The box in the corner between two scroll bars: a grip where it sizes the outer window, else a plain box.
#pragma once

#include "qxcore/platform/win32.h"

// True when the window's bottom right corner is that of the client area of a top-level window which the user can
// size and which is not maximised.
bool SIsInSizingCorner(HWND window);

// Makes the box a grip or a plain one, as its container's place asks for, and repaints it when that changed. The
// container must have its new place already.
void SUpdateSizeBox(HWND box, HWND container);

// Passes a sizing command of a grip in `container` on to the top-level window; true when it was one.
bool SPassOnSizing(HWND container, UINT id, LPARAM lParam);
