// What the X server says of the desktop and SDL does not.
#pragma once

#include <string>

#include "qxcore/platform/win32.h"

struct SDL_Window;

namespace platform::sdl {

struct Desktop {
  bool hasWindowManager = false;  // that frames windows and lets the user move them
  unsigned dpi = 0;               // the user's choice for texts (Xft.dpi); 0 for none
};
// Without an X server nothing.
Desktop AskDesktop();

// Where the pointer is now; SDL's own answer is that of the last event. False without an X server.
bool FindPointer(int* x, int* y);

// Whether Shift, Control or Alt (by the virtual number) is held down, in whatever window. False without an X server.
bool IsModifierHeld(WORD key);

// Goes on after the errors of a server that a program cannot avoid: those of windows that have gone. A window of
// another program may go while it is answered; and SDL wakes itself by an event to one of our windows, over a second
// connection, which the server may read after the window was destroyed on the first. Xlib would end the process.
void OutliveWindows();

// Names a window in UTF-8 for the window manager. SDL's own way needs a locale that has the characters.
void NameWindow(SDL_Window* window, const std::string& name);

}  // namespace platform::sdl
