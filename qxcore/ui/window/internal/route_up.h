// The way of a command from a window inside a frame up to its parent and the application.
#pragma once

#include "qxcore/platform/win32.h"

class SWnd;
struct S_CMDHANDLERINFO;

// Offers a command or its update, with an identifier from 0x8000 to 0xEFFF, to the window's parent and then to the
// application. Returns nonzero when one took it; the arguments are those of OnCmdMsg.
int SRouteUp(const SWnd& window, UINT id, int code, void* extra, S_CMDHANDLERINFO* info);
