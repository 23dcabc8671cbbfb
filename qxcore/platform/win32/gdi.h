// The drawing calls and their types, as declared on Linux; implemented in qxcore/platform/posix/draw/. They do
// what is published for them; where a call does less, a line says so. Include qxcore/platform/win32.h, not this
// header; on Windows it is empty.
//
// Threads: a context belongs to one thread at a time, as do the objects that are selected into it. Different
// threads may draw with different contexts and objects.
#pragma once

#include "qxcore/platform/win32.h"
#include "qxcore/platform/win32/handles.h"

#ifndef _WIN32

#include "qxcore/platform/export.h"

// --- constants ---

#define CLR_INVALID 0xFFFFFFFFu
#define GDI_ERROR 0xFFFFFFFFu

#define ERROR 0
#define NULLREGION 1
#define SIMPLEREGION 2
#define COMPLEXREGION 3
#define RGN_ERROR ERROR

#define RGN_AND 1
#define RGN_OR 2
#define RGN_XOR 3
#define RGN_DIFF 4
#define RGN_COPY 5

#define OBJ_PEN 1u
#define OBJ_BRUSH 2u
#define OBJ_DC 3u
#define OBJ_METADC 4u
#define OBJ_PAL 5u
#define OBJ_FONT 6u
#define OBJ_BITMAP 7u
#define OBJ_REGION 8u
#define OBJ_METAFILE 9u
#define OBJ_MEMDC 10u
#define OBJ_EXTPEN 11u
#define OBJ_ENHMETADC 12u
#define OBJ_ENHMETAFILE 13u

#define WHITE_BRUSH 0
#define LTGRAY_BRUSH 1
#define GRAY_BRUSH 2
#define DKGRAY_BRUSH 3
#define BLACK_BRUSH 4
#define NULL_BRUSH 5
#define HOLLOW_BRUSH NULL_BRUSH
#define WHITE_PEN 6
#define BLACK_PEN 7
#define NULL_PEN 8
#define OEM_FIXED_FONT 10
#define ANSI_FIXED_FONT 11
#define ANSI_VAR_FONT 12
#define SYSTEM_FONT 13
#define DEVICE_DEFAULT_FONT 14
#define SYSTEM_FIXED_FONT 16
#define DEFAULT_GUI_FONT 17
#define DC_BRUSH 18
#define DC_PEN 19

#define PS_SOLID 0
#define PS_DASH 1
#define PS_DOT 2
#define PS_DASHDOT 3
#define PS_DASHDOTDOT 4
#define PS_NULL 5
#define PS_INSIDEFRAME 6

#define BS_SOLID 0u
#define BS_NULL 1u
#define BS_HOLLOW BS_NULL
#define BS_HATCHED 2u
#define BS_PATTERN 3u

#define HS_HORIZONTAL 0
#define HS_VERTICAL 1
#define HS_FDIAGONAL 2
#define HS_BDIAGONAL 3
#define HS_CROSS 4
#define HS_DIAGCROSS 5

#define TRANSPARENT 1
#define OPAQUE 2

#define R2_BLACK 1
#define R2_NOTMERGEPEN 2
#define R2_MASKNOTPEN 3
#define R2_NOTCOPYPEN 4
#define R2_MASKPENNOT 5
#define R2_NOT 6
#define R2_XORPEN 7
#define R2_NOTMASKPEN 8
#define R2_MASKPEN 9
#define R2_NOTXORPEN 10
#define R2_NOP 11
#define R2_MERGENOTPEN 12
#define R2_COPYPEN 13
#define R2_MERGEPENNOT 14
#define R2_MERGEPEN 15
#define R2_WHITE 16

#define SRCCOPY 0x00CC0020u
#define SRCPAINT 0x00EE0086u
#define SRCAND 0x008800C6u
#define SRCINVERT 0x00660046u
#define SRCERASE 0x00440328u
#define NOTSRCCOPY 0x00330008u
#define NOTSRCERASE 0x001100A6u
#define MERGECOPY 0x00C000CAu
#define MERGEPAINT 0x00BB0226u
#define PATCOPY 0x00F00021u
#define PATPAINT 0x00FB0A09u
#define PATINVERT 0x005A0049u
#define DSTINVERT 0x00550009u
#define BLACKNESS 0x00000042u
#define WHITENESS 0x00FF0062u

#define ALTERNATE 1
#define WINDING 2

#define BLACKONWHITE 1
#define WHITEONBLACK 2
#define COLORONCOLOR 3
#define HALFTONE 4

#define MM_TEXT 1
#define MM_ISOTROPIC 7
#define MM_ANISOTROPIC 8

#define TA_NOUPDATECP 0u
#define TA_UPDATECP 1u
#define TA_LEFT 0u
#define TA_RIGHT 2u
#define TA_CENTER 6u
#define TA_TOP 0u
#define TA_BOTTOM 8u
#define TA_BASELINE 24u
#define TA_RTLREADING 256u

#define ETO_OPAQUE 0x0002u
#define ETO_CLIPPED 0x0004u
#define ETO_GLYPH_INDEX 0x0010u
#define ETO_RTLREADING 0x0080u

#define DT_TOP 0x0000u
#define DT_LEFT 0x0000u
#define DT_CENTER 0x0001u
#define DT_RIGHT 0x0002u
#define DT_VCENTER 0x0004u
#define DT_BOTTOM 0x0008u
#define DT_WORDBREAK 0x0010u
#define DT_SINGLELINE 0x0020u
#define DT_EXPANDTABS 0x0040u
#define DT_TABSTOP 0x0080u
#define DT_NOCLIP 0x0100u
#define DT_EXTERNALLEADING 0x0200u
#define DT_CALCRECT 0x0400u
#define DT_NOPREFIX 0x0800u
#define DT_INTERNAL 0x1000u
#define DT_EDITCONTROL 0x2000u
#define DT_PATH_ELLIPSIS 0x4000u
#define DT_END_ELLIPSIS 0x8000u
#define DT_MODIFYSTRING 0x10000u
#define DT_RTLREADING 0x20000u
#define DT_WORD_ELLIPSIS 0x40000u
#define DT_HIDEPREFIX 0x100000u
#define DT_PREFIXONLY 0x200000u

#define LF_FACESIZE 32
#define FW_DONTCARE 0
#define FW_THIN 100
#define FW_LIGHT 300
#define FW_NORMAL 400
#define FW_MEDIUM 500
#define FW_SEMIBOLD 600
#define FW_BOLD 700
#define FW_HEAVY 900
#define ANSI_CHARSET 0
#define DEFAULT_CHARSET 1
#define SYMBOL_CHARSET 2
#define OUT_DEFAULT_PRECIS 0
#define CLIP_DEFAULT_PRECIS 0
#define DEFAULT_QUALITY 0
#define NONANTIALIASED_QUALITY 3
#define ANTIALIASED_QUALITY 4
#define DEFAULT_PITCH 0
#define FIXED_PITCH 1
#define VARIABLE_PITCH 2
#define FF_DONTCARE 0
#define FF_ROMAN 0x10
#define FF_SWISS 0x20
#define FF_MODERN 0x30
#define TMPF_FIXED_PITCH 0x01
#define TMPF_VECTOR 0x02
#define TMPF_TRUETYPE 0x04

#define DIB_RGB_COLORS 0u
#define BI_RGB 0u

#define BITSPIXEL 12
#define PLANES 14
#define HORZSIZE 4
#define VERTSIZE 6
#define HORZRES 8
#define VERTRES 10
#define LOGPIXELSX 88
#define LOGPIXELSY 90

#define BDR_RAISEDOUTER 0x0001u
#define BDR_SUNKENOUTER 0x0002u
#define BDR_RAISEDINNER 0x0004u
#define BDR_SUNKENINNER 0x0008u
#define BDR_OUTER 0x0003u
#define BDR_INNER 0x000Cu
#define BDR_RAISED 0x0005u
#define BDR_SUNKEN 0x000Au
#define EDGE_RAISED (BDR_RAISEDOUTER | BDR_RAISEDINNER)
#define EDGE_SUNKEN (BDR_SUNKENOUTER | BDR_SUNKENINNER)
#define EDGE_ETCHED (BDR_SUNKENOUTER | BDR_RAISEDINNER)
#define EDGE_BUMP (BDR_RAISEDOUTER | BDR_SUNKENINNER)

#define BF_LEFT 0x0001u
#define BF_TOP 0x0002u
#define BF_RIGHT 0x0004u
#define BF_BOTTOM 0x0008u
#define BF_TOPLEFT (BF_TOP | BF_LEFT)
#define BF_BOTTOMRIGHT (BF_BOTTOM | BF_RIGHT)
#define BF_RECT (BF_LEFT | BF_TOP | BF_RIGHT | BF_BOTTOM)
#define BF_MIDDLE 0x0800u
#define BF_SOFT 0x1000u
#define BF_ADJUST 0x2000u
#define BF_FLAT 0x4000u
#define BF_MONO 0x8000u

#define DFC_CAPTION 1u
#define DFC_MENU 2u
#define DFC_SCROLL 3u
#define DFC_BUTTON 4u
#define DFCS_SCROLLUP 0x0000u
#define DFCS_SCROLLDOWN 0x0001u
#define DFCS_SCROLLLEFT 0x0002u
#define DFCS_SCROLLRIGHT 0x0003u
#define DFCS_SCROLLCOMBOBOX 0x0005u
#define DFCS_SCROLLSIZEGRIP 0x0008u
#define DFCS_BUTTONCHECK 0x0000u
#define DFCS_BUTTONRADIO 0x0004u
#define DFCS_BUTTON3STATE 0x0008u
#define DFCS_BUTTONPUSH 0x0010u
#define DFCS_CAPTIONCLOSE 0x0000u
#define DFCS_CAPTIONMIN 0x0001u
#define DFCS_CAPTIONMAX 0x0002u
#define DFCS_CAPTIONRESTORE 0x0003u
#define DFCS_MENUARROW 0x0000u
#define DFCS_MENUCHECK 0x0001u
#define DFCS_MENUBULLET 0x0002u
#define DFCS_INACTIVE 0x0100u
#define DFCS_PUSHED 0x0200u
#define DFCS_CHECKED 0x0400u
#define DFCS_ADJUSTRECT 0x2000u
#define DFCS_FLAT 0x4000u
#define DFCS_MONO 0x8000u

#define ILC_MASK 0x0001u
#define ILC_COLOR32 0x0020u
#define ILD_NORMAL 0x0000u
#define ILD_TRANSPARENT 0x0001u
#define ILD_MASK 0x0010u
#define CLR_NONE 0xFFFFFFFFu
#define CLR_DEFAULT 0xFF000000u

// --- records ---

struct LOGPEN {
  UINT lopnStyle;
  POINT lopnWidth;
  COLORREF lopnColor;
};

struct LOGBRUSH {
  UINT lbStyle;
  COLORREF lbColor;
  ULONG_PTR lbHatch;
};

struct LOGFONTW {
  LONG lfHeight;
  LONG lfWidth;
  LONG lfEscapement;
  LONG lfOrientation;
  LONG lfWeight;
  BYTE lfItalic;
  BYTE lfUnderline;
  BYTE lfStrikeOut;
  BYTE lfCharSet;
  BYTE lfOutPrecision;
  BYTE lfClipPrecision;
  BYTE lfQuality;
  BYTE lfPitchAndFamily;
  WCHAR lfFaceName[LF_FACESIZE];
};

struct TEXTMETRICW {
  LONG tmHeight;
  LONG tmAscent;
  LONG tmDescent;
  LONG tmInternalLeading;
  LONG tmExternalLeading;
  LONG tmAveCharWidth;
  LONG tmMaxCharWidth;
  LONG tmWeight;
  LONG tmOverhang;
  LONG tmDigitizedAspectX;
  LONG tmDigitizedAspectY;
  WCHAR tmFirstChar;
  WCHAR tmLastChar;
  WCHAR tmDefaultChar;
  WCHAR tmBreakChar;
  BYTE tmItalic;
  BYTE tmUnderlined;
  BYTE tmStruckOut;
  BYTE tmPitchAndFamily;
  BYTE tmCharSet;
};

struct BITMAP {
  LONG bmType;
  LONG bmWidth;
  LONG bmHeight;
  LONG bmWidthBytes;
  WORD bmPlanes;
  WORD bmBitsPixel;
  LPVOID bmBits;
};

struct BITMAPINFOHEADER {
  DWORD biSize;
  LONG biWidth;
  LONG biHeight;  // negative: the first row is the top one
  WORD biPlanes;
  WORD biBitCount;
  DWORD biCompression;
  DWORD biSizeImage;
  LONG biXPelsPerMeter;
  LONG biYPelsPerMeter;
  DWORD biClrUsed;
  DWORD biClrImportant;
};

struct RGBQUAD {
  BYTE rgbBlue;
  BYTE rgbGreen;
  BYTE rgbRed;
  BYTE rgbReserved;
};

struct BITMAPINFO {
  BITMAPINFOHEADER bmiHeader;
  RGBQUAD bmiColors[1];
};

struct PAINTSTRUCT {
  HDC hdc;
  BOOL fErase;
  RECT rcPaint;
  BOOL fRestore;
  BOOL fIncUpdate;
  BYTE rgbReserved[32];
};

// --- rectangles ---

QXCORE_API BOOL SetRect(RECT* rect, int left, int top, int right, int bottom);
QXCORE_API BOOL SetRectEmpty(RECT* rect);
QXCORE_API BOOL CopyRect(RECT* to, const RECT* from);
QXCORE_API BOOL InflateRect(RECT* rect, int dx, int dy);
QXCORE_API BOOL OffsetRect(RECT* rect, int dx, int dy);
QXCORE_API BOOL IntersectRect(RECT* to, const RECT* a, const RECT* b);
QXCORE_API BOOL UnionRect(RECT* to, const RECT* a, const RECT* b);
QXCORE_API BOOL SubtractRect(RECT* to, const RECT* from, const RECT* less);
QXCORE_API BOOL IsRectEmpty(const RECT* rect);
QXCORE_API BOOL EqualRect(const RECT* a, const RECT* b);
QXCORE_API BOOL PtInRect(const RECT* rect, POINT point);

// --- contexts ---

// A memory context on a bitmap of one black pixel. `compatible` may be null.
QXCORE_API HDC CreateCompatibleDC(HDC compatible);
QXCORE_API BOOL DeleteDC(HDC dc);
QXCORE_API int SaveDC(HDC dc);
QXCORE_API BOOL RestoreDC(HDC dc, int saved);
QXCORE_API int GetDeviceCaps(HDC dc, int index);
QXCORE_API HGDIOBJ GetCurrentObject(HDC dc, UINT type);
QXCORE_API BOOL GdiFlush();

QXCORE_API COLORREF SetBkColor(HDC dc, COLORREF color);
QXCORE_API COLORREF GetBkColor(HDC dc);
QXCORE_API int SetBkMode(HDC dc, int mode);
QXCORE_API int GetBkMode(HDC dc);
QXCORE_API COLORREF SetTextColor(HDC dc, COLORREF color);
QXCORE_API COLORREF GetTextColor(HDC dc);
QXCORE_API UINT SetTextAlign(HDC dc, UINT align);
QXCORE_API UINT GetTextAlign(HDC dc);
QXCORE_API int SetROP2(HDC dc, int mode);
QXCORE_API int GetROP2(HDC dc);
QXCORE_API int SetPolyFillMode(HDC dc, int mode);
QXCORE_API int GetPolyFillMode(HDC dc);
QXCORE_API int SetStretchBltMode(HDC dc, int mode);
QXCORE_API int GetStretchBltMode(HDC dc);
QXCORE_API COLORREF SetDCBrushColor(HDC dc, COLORREF color);
QXCORE_API COLORREF SetDCPenColor(HDC dc, COLORREF color);
QXCORE_API BOOL SetBrushOrgEx(HDC dc, int x, int y, POINT* old);
QXCORE_API BOOL GetBrushOrgEx(HDC dc, POINT* origin);

QXCORE_API int SetMapMode(HDC dc, int mode);  // MM_TEXT, MM_ISOTROPIC and MM_ANISOTROPIC
QXCORE_API int GetMapMode(HDC dc);
QXCORE_API BOOL SetWindowOrgEx(HDC dc, int x, int y, POINT* old);
QXCORE_API BOOL GetWindowOrgEx(HDC dc, POINT* origin);
QXCORE_API BOOL SetViewportOrgEx(HDC dc, int x, int y, POINT* old);
QXCORE_API BOOL GetViewportOrgEx(HDC dc, POINT* origin);
QXCORE_API BOOL OffsetViewportOrgEx(HDC dc, int dx, int dy, POINT* old);
QXCORE_API BOOL SetWindowExtEx(HDC dc, int cx, int cy, SIZE* old);
QXCORE_API BOOL SetViewportExtEx(HDC dc, int cx, int cy, SIZE* old);
QXCORE_API BOOL LPtoDP(HDC dc, POINT* points, int count);
QXCORE_API BOOL DPtoLP(HDC dc, POINT* points, int count);

// --- contexts of windows ---

QXCORE_API HDC GetDC(HWND window);
QXCORE_API HDC GetWindowDC(HWND window);
QXCORE_API int ReleaseDC(HWND window, HDC dc);
QXCORE_API HDC BeginPaint(HWND window, PAINTSTRUCT* paint);
QXCORE_API BOOL EndPaint(HWND window, const PAINTSTRUCT* paint);
QXCORE_API HWND WindowFromDC(HDC dc);

// --- objects ---

QXCORE_API HGDIOBJ SelectObject(HDC dc, HGDIOBJ object);
// A selected object is gone for its handle at once, and for the context when another one is selected.
QXCORE_API BOOL DeleteObject(HGDIOBJ object);
QXCORE_API HGDIOBJ GetStockObject(int index);
QXCORE_API DWORD GetObjectType(HGDIOBJ object);
QXCORE_API int GetObjectW(HANDLE object, int size, LPVOID buffer);

QXCORE_API HPEN CreatePen(int style, int width, COLORREF color);
QXCORE_API HPEN CreatePenIndirect(const LOGPEN* pen);
QXCORE_API HBRUSH CreateSolidBrush(COLORREF color);
QXCORE_API HBRUSH CreateHatchBrush(int hatch, COLORREF color);
QXCORE_API HBRUSH CreatePatternBrush(HBITMAP bitmap);
QXCORE_API HBRUSH CreateBrushIndirect(const LOGBRUSH* brush);

// --- bitmaps ---

QXCORE_API HBITMAP CreateCompatibleBitmap(HDC dc, int width, int height);
// 1, 4, 8, 24 and 32 bits a pixel; kept with 32, of which a bitmap of 1 uses black and white.
QXCORE_API HBITMAP CreateBitmap(int width, int height, UINT planes, UINT bitCount, const void* bits);
// 32 bits a pixel without compression; no file mapping.
QXCORE_API HBITMAP CreateDIBSection(HDC dc, const BITMAPINFO* info, UINT usage, void** bits, HANDLE section,
                                    DWORD offset);
// 24 and 32 bits a pixel.
QXCORE_API int GetDIBits(HDC dc, HBITMAP bitmap, UINT start, UINT lines, LPVOID bits, BITMAPINFO* info, UINT usage);
QXCORE_API int SetDIBits(HDC dc, HBITMAP bitmap, UINT start, UINT lines, const void* bits, const BITMAPINFO* info,
                         UINT usage);
QXCORE_API BOOL BitBlt(HDC to, int x, int y, int width, int height, HDC from, int fromX, int fromY, DWORD rop);
QXCORE_API BOOL StretchBlt(HDC to, int x, int y, int width, int height, HDC from, int fromX, int fromY, int fromWidth,
                           int fromHeight, DWORD rop);
QXCORE_API BOOL PatBlt(HDC dc, int x, int y, int width, int height, DWORD rop);
QXCORE_API COLORREF GetPixel(HDC dc, int x, int y);
QXCORE_API COLORREF SetPixel(HDC dc, int x, int y, COLORREF color);
QXCORE_API BOOL SetPixelV(HDC dc, int x, int y, COLORREF color);

// --- regions and clipping ---

QXCORE_API HRGN CreateRectRgn(int left, int top, int right, int bottom);
QXCORE_API HRGN CreateRectRgnIndirect(const RECT* rect);
QXCORE_API HRGN CreateRoundRectRgn(int left, int top, int right, int bottom, int width, int height);
QXCORE_API HRGN CreateEllipticRgn(int left, int top, int right, int bottom);
QXCORE_API HRGN CreatePolygonRgn(const POINT* points, int count, int mode);
QXCORE_API BOOL SetRectRgn(HRGN region, int left, int top, int right, int bottom);
QXCORE_API int CombineRgn(HRGN to, HRGN a, HRGN b, int mode);
QXCORE_API int OffsetRgn(HRGN region, int dx, int dy);
QXCORE_API int GetRgnBox(HRGN region, RECT* box);
QXCORE_API BOOL EqualRgn(HRGN a, HRGN b);
QXCORE_API BOOL PtInRegion(HRGN region, int x, int y);
QXCORE_API BOOL RectInRegion(HRGN region, const RECT* rect);
QXCORE_API BOOL FillRgn(HDC dc, HRGN region, HBRUSH brush);
QXCORE_API BOOL FrameRgn(HDC dc, HRGN region, HBRUSH brush, int width, int height);
QXCORE_API BOOL InvertRgn(HDC dc, HRGN region);
QXCORE_API BOOL PaintRgn(HDC dc, HRGN region);

QXCORE_API int SelectClipRgn(HDC dc, HRGN region);
QXCORE_API int ExtSelectClipRgn(HDC dc, HRGN region, int mode);
QXCORE_API int IntersectClipRect(HDC dc, int left, int top, int right, int bottom);
QXCORE_API int ExcludeClipRect(HDC dc, int left, int top, int right, int bottom);
QXCORE_API int OffsetClipRgn(HDC dc, int dx, int dy);
QXCORE_API int GetClipBox(HDC dc, RECT* box);
QXCORE_API int GetClipRgn(HDC dc, HRGN region);
QXCORE_API BOOL RectVisible(HDC dc, const RECT* rect);
QXCORE_API BOOL PtVisible(HDC dc, int x, int y);

// --- lines and shapes ---

QXCORE_API BOOL MoveToEx(HDC dc, int x, int y, POINT* old);
QXCORE_API BOOL GetCurrentPositionEx(HDC dc, POINT* position);
QXCORE_API BOOL LineTo(HDC dc, int x, int y);
QXCORE_API BOOL Polyline(HDC dc, const POINT* points, int count);
QXCORE_API BOOL Polygon(HDC dc, const POINT* points, int count);
QXCORE_API BOOL Rectangle(HDC dc, int left, int top, int right, int bottom);
QXCORE_API BOOL RoundRect(HDC dc, int left, int top, int right, int bottom, int width, int height);
QXCORE_API BOOL Ellipse(HDC dc, int left, int top, int right, int bottom);
QXCORE_API int FillRect(HDC dc, const RECT* rect, HBRUSH brush);
QXCORE_API int FrameRect(HDC dc, const RECT* rect, HBRUSH brush);
QXCORE_API BOOL InvertRect(HDC dc, const RECT* rect);
QXCORE_API BOOL DrawFocusRect(HDC dc, const RECT* rect);
QXCORE_API BOOL DrawEdge(HDC dc, RECT* rect, UINT edge, UINT flags);
// Scroll arrows, the size grip, push, check and radio buttons, caption buttons, menu marks.
QXCORE_API BOOL DrawFrameControl(HDC dc, RECT* rect, UINT type, UINT state);

// --- text ---

// Escapement and orientation are stored, but text is drawn level.
QXCORE_API HFONT CreateFontIndirectW(const LOGFONTW* font);
QXCORE_API HFONT CreateFontW(int height, int width, int escapement, int orientation, int weight, DWORD italic,
                             DWORD underline, DWORD strikeOut, DWORD charSet, DWORD outPrecision, DWORD clipPrecision,
                             DWORD quality, DWORD pitchAndFamily, LPCWSTR face);
QXCORE_API BOOL GetTextMetricsW(HDC dc, TEXTMETRICW* metrics);
QXCORE_API int GetTextFaceW(HDC dc, int count, LPWSTR face);
QXCORE_API BOOL GetTextExtentPoint32W(HDC dc, LPCWSTR text, int count, SIZE* size);
QXCORE_API BOOL GetTextExtentExPointW(HDC dc, LPCWSTR text, int count, int maxExtent, int* fit, int* extents,
                                      SIZE* size);
QXCORE_API BOOL GetCharWidth32W(HDC dc, UINT first, UINT last, int* widths);
QXCORE_API BOOL TextOutW(HDC dc, int x, int y, LPCWSTR text, int count);
QXCORE_API BOOL ExtTextOutW(HDC dc, int x, int y, UINT options, const RECT* rect, LPCWSTR text, UINT count,
                            const int* advances);
QXCORE_API int DrawTextW(HDC dc, LPCWSTR text, int count, RECT* rect, UINT format);

// --- metafiles: in memory only, `file` must be null ---

QXCORE_API HDC CreateMetaFileW(LPCWSTR file);
QXCORE_API HMETAFILE CloseMetaFile(HDC dc);
QXCORE_API BOOL PlayMetaFile(HDC dc, HMETAFILE metafile);
QXCORE_API BOOL DeleteMetaFile(HMETAFILE metafile);
// `frame` in 0.01 mm; without one the picture plays unscaled, from the corner of the rectangle.
QXCORE_API HDC CreateEnhMetaFileW(HDC reference, LPCWSTR file, const RECT* frame, LPCWSTR description);
QXCORE_API HENHMETAFILE CloseEnhMetaFile(HDC dc);
QXCORE_API BOOL PlayEnhMetaFile(HDC dc, HENHMETAFILE metafile, const RECT* rect);
QXCORE_API BOOL DeleteEnhMetaFile(HENHMETAFILE metafile);

// --- image lists: 32 bits a pixel ---

QXCORE_API HIMAGELIST ImageList_Create(int width, int height, UINT flags, int initial, int grow);
QXCORE_API BOOL ImageList_Destroy(HIMAGELIST list);
QXCORE_API int ImageList_GetImageCount(HIMAGELIST list);
QXCORE_API BOOL ImageList_GetIconSize(HIMAGELIST list, int* width, int* height);
QXCORE_API int ImageList_Add(HIMAGELIST list, HBITMAP image, HBITMAP mask);
QXCORE_API int ImageList_AddMasked(HIMAGELIST list, HBITMAP image, COLORREF mask);
QXCORE_API BOOL ImageList_Remove(HIMAGELIST list, int index);
QXCORE_API BOOL ImageList_Draw(HIMAGELIST list, int index, HDC dc, int x, int y, UINT style);
QXCORE_API COLORREF ImageList_SetBkColor(HIMAGELIST list, COLORREF color);
QXCORE_API COLORREF ImageList_GetBkColor(HIMAGELIST list);

#endif
