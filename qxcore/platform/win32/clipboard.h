// The clipboard, as declared on Linux; on Windows windows.h has it. Included where it is used.
#pragma once

#include "qxcore/platform/win32.h"

#ifndef _WIN32

#include "qxcore/platform/export.h"

#define CF_UNICODETEXT 13
#define ERROR_CLIPBOARD_NOT_OPEN 1418

QXCORE_API BOOL OpenClipboard(HWND owner);
QXCORE_API BOOL CloseClipboard();
QXCORE_API BOOL EmptyClipboard();
QXCORE_API HANDLE SetClipboardData(UINT format, HANDLE memory);
QXCORE_API HANDLE GetClipboardData(UINT format);
QXCORE_API BOOL IsClipboardFormatAvailable(UINT format);
QXCORE_API HWND GetClipboardOwner();

#endif
