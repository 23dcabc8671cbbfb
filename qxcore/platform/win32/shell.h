// Files that are dropped on a window, as declared on Linux.
// Include qxcore/platform/win32.h, not this header; on Windows it is empty.
#pragma once

#include "qxcore/platform/win32.h"

#ifndef _WIN32

#include "qxcore/platform/export.h"

// What WM_DROPFILES carries: a block of global memory of the published layout (DROPFILES, then the paths, each with
// its NUL, and one more NUL).
using HDROP = struct PlatformDrop*;

// With the index 0xFFFFFFFF the number of files; else the length of a path without its NUL, and the path as far as
// `capacity` characters hold it, NUL included. 0 for an invalid index or handle.
QXCORE_API UINT DragQueryFileW(HDROP drop, UINT index, LPWSTR buffer, UINT capacity);
// Where it was dropped, in the window's client area. Nonzero unless it was outside of that.
QXCORE_API BOOL DragQueryPoint(HDROP drop, POINT* point);
// Frees the block.
QXCORE_API void DragFinish(HDROP drop);
// Whether the window takes files.
QXCORE_API void DragAcceptFiles(HWND window, BOOL accept);

#endif
