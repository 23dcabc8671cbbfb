// When temporary objects go: those that FromHandle of SWnd, SImageList, SMenu, SDC, SGdiObject and SFontOld makes.
//
// The application empties their maps at idle time. While anybody holds the lock, nothing is freed; the framework
// holds it while a message is being handled, so an object that a handler was given is valid until it returns.
// For the user-interface thread.
#pragma once

#include "qxcore/platform/export.h"

// Raises the lock count; returns the new one.
QXCORE_API long SLockTempMaps() noexcept;
// Lowers it; returns the new one. When it falls to 0 and `deleteTemps` is nonzero, the six maps are emptied, in the
// order above.
QXCORE_API long SUnlockTempMaps(int deleteTemps = 1);
