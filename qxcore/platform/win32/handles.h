// The handles, geometry and message types of the window and drawing calls, as declared on Linux. Include
// qxcore/platform/win32.h, not this header; on Windows it is empty.
#pragma once

#include "qxcore/platform/win32.h"

#ifndef _WIN32

// --- handles: numbers in the clothes of pointers, never to be followed ---

struct HWND__;
using HWND = HWND__*;
struct HMENU__;
using HMENU = HMENU__*;
struct HACCEL__;
using HACCEL = HACCEL__*;
struct HICON__;
using HICON = HICON__*;
using HCURSOR = HICON;
struct HHOOK__;
using HHOOK = HHOOK__*;
struct HDWP__;
using HDWP = HDWP__*;
struct HDC__;
using HDC = HDC__*;
using HGDIOBJ = void*;  // pens, brushes, fonts, bitmaps and regions
struct HPEN__;
using HPEN = HPEN__*;
struct HBRUSH__;
using HBRUSH = HBRUSH__*;
struct HFONT__;
using HFONT = HFONT__*;
struct HBITMAP__;
using HBITMAP = HBITMAP__*;
struct HRGN__;
using HRGN = HRGN__*;
struct HPALETTE__;
using HPALETTE = HPALETTE__*;
struct HMETAFILE__;
using HMETAFILE = HMETAFILE__*;
struct HENHMETAFILE__;
using HENHMETAFILE = HENHMETAFILE__*;
struct HMONITOR__;
using HMONITOR = HMONITOR__*;
struct _IMAGELIST;
using HIMAGELIST = _IMAGELIST*;

// --- messages ---

using WPARAM = UINT_PTR;
using LONG_PTR = std::intptr_t;
using INT_PTR = std::intptr_t;
using LPARAM = LONG_PTR;
using LRESULT = LONG_PTR;
using ATOM = WORD;
using WNDPROC = LRESULT(CALLBACK*)(HWND, UINT, WPARAM, LPARAM);

// --- geometry, in pixels unless a call says otherwise; right and bottom lie outside a rectangle ---

using COLORREF = DWORD;  // 0x00BBGGRR

struct POINT {
  LONG x;
  LONG y;
};
struct SIZE {
  LONG cx;
  LONG cy;
};
struct RECT {
  LONG left;
  LONG top;
  LONG right;
  LONG bottom;
};
using LPPOINT = POINT*;
using LPSIZE = SIZE*;
using LPRECT = RECT*;
using LPCRECT = const RECT*;

#define RGB(r, g, b) ((COLORREF)(BYTE)(r) | (COLORREF)(BYTE)(g) << 8 | (COLORREF)(BYTE)(b) << 16)
#define GetRValue(color) ((BYTE)(color))
#define GetGValue(color) ((BYTE)((color) >> 8))
#define GetBValue(color) ((BYTE)((color) >> 16))

// --- words of a value; coordinates are taken with their sign ---

#define LOWORD(value) ((WORD)((DWORD_PTR)(value)&0xFFFF))
#define HIWORD(value) ((WORD)((DWORD_PTR)(value) >> 16 & 0xFFFF))
#define LOBYTE(value) ((BYTE)((DWORD_PTR)(value)&0xFF))
#define HIBYTE(value) ((BYTE)((DWORD_PTR)(value) >> 8 & 0xFF))
#define MAKELONG(low, high) ((LONG)((WORD)(low) | (DWORD)(WORD)(high) << 16))
#define MAKEWORD(low, high) ((WORD)((BYTE)(low) | (WORD)(BYTE)(high) << 8))
#define MAKEWPARAM(low, high) ((WPARAM)(DWORD)MAKELONG(low, high))
#define MAKELPARAM(low, high) ((LPARAM)(DWORD)MAKELONG(low, high))
#define MAKELRESULT(low, high) ((LRESULT)(DWORD)MAKELONG(low, high))
#define IS_INTRESOURCE(name) ((ULONG_PTR)(name) >> 16 == 0)

#endif
