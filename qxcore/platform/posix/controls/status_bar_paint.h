// How a status bar looks.
#pragma once

#include "qxcore/platform/posix/controls/status_bar_parts.h"

namespace platform::controls {

// Whether the bar has a grip now: by its style, and its parent is not maximised.
bool HasGrip(HWND window);
// Paints the bar's client area into a context.
void PaintStatusBar(HWND window, HDC dc, const StatusBar& bar);

}  // namespace platform::controls
