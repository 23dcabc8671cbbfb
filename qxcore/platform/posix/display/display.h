// What the window model asks of a display, and what a display reports to it. Headless is the default: nothing
// is shown, and all logic runs. A display serves the thread that opened it.
#pragma once

#include "qxcore/platform/win32.h"

namespace platform {

class Display {
 public:
  virtual ~Display() = default;

  // In pixels, and dots per inch.
  virtual SIZE ScreenSize() = 0;
  virtual RECT WorkArea() = 0;
  virtual UINT Dpi() = 0;

  // Top-level windows. The rectangle is on the screen, frame included; the title ends with a NUL.
  virtual void Show(HWND window, bool visible, const RECT& rect) = 0;
  virtual void Move(HWND window, const RECT& rect) = 0;
  virtual void SetTitle(HWND window, LPCWSTR title) = 0;
  // The pixels of `rect` (of the window) have changed.
  virtual void Present(HWND window, const RECT& rect) = 0;
  virtual void Close(HWND window) = 0;

  // One of the IDC_ numbers; 0 hides the cursor.
  virtual void SetCursor(int shape) = 0;

  // Waits for events, for a Wake() from any thread or at most `milliseconds`, and reports what came to the
  // model (platform/posix/window/input.h). Only called on the thread that the display serves.
  virtual void Wait(DWORD milliseconds) = 0;
  virtual void Wake() = 0;
  // Whether it has events of its own and so must do the waiting of this thread.
  virtual bool Serves(DWORD thread) = 0;
};

// The display of the process; never null. Opened with the first window.
Display& TheDisplay();

}  // namespace platform
