// A picture of a window as it is on the screen.
#pragma once

#include "qxcore/ui/window/window.h"

// Paints what is invalid and writes the whole window, with its caption and borders, as a PNG file. Throws Failure.
void SavePicture(SWnd& window, const SString& file);
