// The end of windows, and what creation shares with it. Called without the lock.
#pragma once

#include "qxcore/platform/posix/window/thread.h"

namespace platform::model {

// Sends WM_NCDESTROY to the children and the window, and frees them.
void EndWindow(HWND window);
// Frees a window that has heard nothing yet.
void FreeWindow(HWND window);
// Frees the windows of a thread that ends; their procedures hear nothing of it.
void FreeWindowsOf(Thread* thread);
// WM_PARENTNOTIFY to all parents.
void NotifyParent(HWND window, UINT message);

}  // namespace platform::model
