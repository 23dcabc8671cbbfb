// The messages of the rich-edit control that the library sends. On Windows this is <richedit.h>, which brings
// names of its own and is therefore no part of win32.h.
#pragma once

#include "qxcore/platform/win32.h"

#ifdef _WIN32

#include <richedit.h>

#else

#define MSFTEDIT_CLASS WTEXT("RICHEDIT50W")
#define RICHEDIT_CLASSW WTEXT("RichEdit20W")

#define EM_EXLIMITTEXT (WM_USER + 53)
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
