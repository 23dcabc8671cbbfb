// The font of the interface, shared by bars, tabs and controls.
#pragma once

#include "qxcore/platform/export.h"
#include "qxcore/platform/win32.h"

// The default interface font for a number of dots an inch, 0 for the screen's: the user's choice, or else the system's
// font for messages (see SFont::LoadDefaultUIFont). The handle stays the library's and valid as long as the process.
// Null when the system has no font. For the user-interface thread.
QXCORE_API HFONT SGetDefaultUIFont(int dpi = 0);
// Reads the choice anew, after it or the settings have changed.
QXCORE_API void SUpdateDefaultUIFont();
