// Painting of windows, while there is no window model: every window's handle is invalid.
#include "qxcore/platform/posix/draw/object.h"

HDC BeginPaint(HWND, PAINTSTRUCT*) { return draw::Fail<HDC>(nullptr, ERROR_INVALID_HANDLE); }

BOOL EndPaint(HWND, const PAINTSTRUCT*) { return draw::Fail(FALSE, ERROR_INVALID_HANDLE); }
