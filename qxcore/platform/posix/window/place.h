// Where windows are: placing, limits, showing. Called without the lock.
#pragma once

#include "qxcore/platform/posix/window/window.h"

namespace platform::model {

// The limits of a window's size, as it answers WM_GETMINMAXINFO.
MINMAXINFO AskLimits(HWND window);
// Sends WM_SIZE and WM_MOVE as a new window gets them.
void SendSizeAndMove(HWND window);
// Whether those two come with the first showing: for overlapped windows.
bool WaitsForShow(HWND window);
// How CreateWindowExW shows a window of the style.
int FirstShow(DWORD style);

// Private flags in WINDOWPOS::flags, as the system has them: what became of the client area, and that the
// window was minimised, maximised or restored.
inline constexpr UINT kNoClientSize = 0x0800, kNoClientMove = 0x1000, kStateChanged = 0x8000;

// frame.cpp: how much the frame takes on each side (positive), without menu and scroll bars.
RECT FrameWidths(DWORD style, DWORD exStyle);

}  // namespace platform::model
