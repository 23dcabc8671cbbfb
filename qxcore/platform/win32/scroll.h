// Scroll bars and the scrolling of windows, as declared on Linux.
// Include qxcore/platform/win32.h, not this header; on Windows it is empty.
#pragma once

#include "qxcore/platform/win32.h"

#ifndef _WIN32

#include "qxcore/platform/export.h"

// --- scroll bars ---

#define SB_HORZ 0
#define SB_VERT 1
#define SB_CTL 2
#define SB_BOTH 3
#define SB_LINEUP 0
#define SB_LINELEFT 0
#define SB_LINEDOWN 1
#define SB_LINERIGHT 1
#define SB_PAGEUP 2
#define SB_PAGELEFT 2
#define SB_PAGEDOWN 3
#define SB_PAGERIGHT 3
#define SB_THUMBPOSITION 4
#define SB_THUMBTRACK 5
#define SB_TOP 6
#define SB_LEFT 6
#define SB_BOTTOM 7
#define SB_RIGHT 7
#define SB_ENDSCROLL 8
#define SIF_RANGE 0x0001
#define SIF_PAGE 0x0002
#define SIF_POS 0x0004
#define SIF_DISABLENOSCROLL 0x0008
#define SIF_TRACKPOS 0x0010
#define SIF_ALL (SIF_RANGE | SIF_PAGE | SIF_POS | SIF_TRACKPOS)
#define ESB_ENABLE_BOTH 0x0000
#define ESB_DISABLE_BOTH 0x0003
#define ESB_DISABLE_LEFT 0x0001
#define ESB_DISABLE_RIGHT 0x0002
#define ESB_DISABLE_UP 0x0001
#define ESB_DISABLE_DOWN 0x0002
#define ESB_DISABLE_LTUP ESB_DISABLE_LEFT
#define ESB_DISABLE_RTDN ESB_DISABLE_RIGHT
#define SW_SCROLLCHILDREN 0x0001
#define SW_INVALIDATE 0x0002
#define SW_ERASE 0x0004

struct SCROLLINFO {
  UINT cbSize;
  UINT fMask;
  int nMin;
  int nMax;
  UINT nPage;
  int nPos;
  int nTrackPos;
};
using LPSCROLLINFO = SCROLLINFO*;
using LPCSCROLLINFO = const SCROLLINFO*;

QXCORE_API int SetScrollPos(HWND window, int bar, int position, BOOL redraw);
QXCORE_API int GetScrollPos(HWND window, int bar);
QXCORE_API BOOL SetScrollRange(HWND window, int bar, int lowest, int highest, BOOL redraw);
QXCORE_API BOOL GetScrollRange(HWND window, int bar, LPINT lowest, LPINT highest);
QXCORE_API int SetScrollInfo(HWND window, int bar, LPCSCROLLINFO info, BOOL redraw);
QXCORE_API BOOL GetScrollInfo(HWND window, int bar, LPSCROLLINFO info);
QXCORE_API BOOL ShowScrollBar(HWND window, int bar, BOOL show);
QXCORE_API BOOL EnableScrollBar(HWND window, UINT bar, UINT arrows);

// --- scrolling what a window shows ---

QXCORE_API BOOL ScrollWindow(HWND window, int dx, int dy, const RECT* rect, const RECT* clip);
QXCORE_API int ScrollWindowEx(HWND window, int dx, int dy, const RECT* rect, const RECT* clip, HRGN update,
                              LPRECT updateRect, UINT flags);

#endif
