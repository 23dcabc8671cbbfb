// The messages of the rich-edit control that the library sends. On Windows this is <richedit.h>, which brings
// names of its own and is therefore no part of win32.h.
#pragma once

#include "qxcore/platform/win32.h"

#ifdef _WIN32

#include <richedit.h>

#else

#define MSFTEDIT_CLASS WTEXT("RICHEDIT50W")
#define RICHEDIT_CLASSW WTEXT("RichEdit20W")

#define EM_EXGETSEL (WM_USER + 52)
#define EM_EXLIMITTEXT (WM_USER + 53)
#define EM_EXSETSEL (WM_USER + 55)
#define EM_GETCHARFORMAT (WM_USER + 58)
#define EM_GETSELTEXT (WM_USER + 62)
#define EM_SETCHARFORMAT (WM_USER + 68)
#define EM_STREAMIN (WM_USER + 73)
#define EM_STREAMOUT (WM_USER + 74)
#define EM_SETTEXTMODE (WM_USER + 89)
#define EM_GETTEXTMODE (WM_USER + 90)
#define EM_GETTEXTEX (WM_USER + 94)
#define EM_GETTEXTLENGTHEX (WM_USER + 95)

#define TM_PLAINTEXT 1
#define TM_RICHTEXT 2

#define SF_TEXT 0x0001
#define SF_RTF 0x0002
#define SF_UNICODE 0x0010
#define SFF_SELECTION 0x8000

struct CHARRANGE {
  LONG cpMin;
  LONG cpMax;
};

#define SCF_DEFAULT 0x0000
#define SCF_SELECTION 0x0001
#define SCF_ALL 0x0004

#define CFM_BOLD 0x00000001u
#define CFM_ITALIC 0x00000002u
#define CFM_UNDERLINE 0x00000004u
#define CFM_STRIKEOUT 0x00000008u
#define CFM_SMALLCAPS 0x00000040u
#define CFM_ALLCAPS 0x00000080u
#define CFM_HIDDEN 0x00000100u
#define CFM_BACKCOLOR 0x04000000u
#define CFM_CHARSET 0x08000000u
#define CFM_FACE 0x20000000u
#define CFM_COLOR 0x40000000u
#define CFM_SIZE 0x80000000u
#define CFE_BOLD CFM_BOLD
#define CFE_ITALIC CFM_ITALIC
#define CFE_UNDERLINE CFM_UNDERLINE
#define CFE_STRIKEOUT CFM_STRIKEOUT
#define CFE_SMALLCAPS CFM_SMALLCAPS
#define CFE_ALLCAPS CFM_ALLCAPS
#define CFE_HIDDEN CFM_HIDDEN
#define CFE_SUBSCRIPT 0x00010000u
#define CFE_SUPERSCRIPT 0x00020000u
#define CFE_AUTOCOLOR CFM_COLOR
#define CFE_AUTOBACKCOLOR CFM_BACKCOLOR
#define CFM_SUBSCRIPT (CFE_SUBSCRIPT | CFE_SUPERSCRIPT)
#define CFM_SUPERSCRIPT CFM_SUBSCRIPT

struct CHARFORMATW {
  UINT cbSize;      // bytes of the structure
  DWORD dwMask;     // CFM_: which of the others count
  DWORD dwEffects;  // CFE_
  LONG yHeight;     // in twentieths of a point
  LONG yOffset;
  COLORREF crTextColor;
  BYTE bCharSet;
  BYTE bPitchAndFamily;
  WCHAR szFaceName[LF_FACESIZE];
};
struct CHARFORMAT2W : CHARFORMATW {
  WORD wWeight;
  short sSpacing;
  COLORREF crBackColor;
  LCID lcid;
  DWORD dwReserved;
  short sStyle;
  WORD wKerning;
  BYTE bUnderlineType;
  BYTE bAnimation;
  BYTE bRevAuthor;
};

// Moves up to `size` bytes and stores how many; not 0 ends the stream with an error.
using EDITSTREAMCALLBACK = DWORD(CALLBACK*)(DWORD_PTR cookie, BYTE* buffer, LONG size, LONG* moved);
struct EDITSTREAM {
  DWORD_PTR dwCookie;
  DWORD dwError;
  EDITSTREAMCALLBACK pfnCallback;
};

#define GT_DEFAULT 0
#define GT_USECRLF 1
struct GETTEXTEX {
  DWORD cb;  // bytes of the buffer
  DWORD flags;
  UINT codepage;  // 1200: UTF-16
  LPCSTR lpDefaultChar;
  LPBOOL lpUsedDefChar;
};

#define GTL_DEFAULT 0
#define GTL_USECRLF 1
#define GTL_PRECISE 2
#define GTL_CLOSE 4
#define GTL_NUMCHARS 8
#define GTL_NUMBYTES 16
struct GETTEXTLENGTHEX {
  DWORD flags;
  UINT codepage;
};

#endif
