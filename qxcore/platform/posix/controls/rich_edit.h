// The window class of rich-edit controls: it holds a document, takes and gives it as text and as RTF, and changes what
// is selected of it.
//
// There is no typing and no painting. What it answers: WM_SETTEXT (a text that begins as RTF is read as such),
// WM_GETTEXT, WM_GETTEXTLENGTH, EM_STREAMIN and EM_STREAMOUT with SF_RTF, SF_TEXT, SF_UNICODE and SFF_SELECTION,
// EM_GETTEXTEX and EM_GETTEXTLENGTHEX for UTF-16, EM_SETTEXTMODE and EM_GETTEXTMODE, EM_EXLIMITTEXT, which limits plain
// text that is streamed in, EM_GETMODIFY and EM_SETMODIFY, EM_EXGETSEL, EM_EXSETSEL, EM_GETSELTEXT, EM_REPLACESEL,
// EM_GETCHARFORMAT and EM_SETCHARFORMAT for the selection or all.
#pragma once

#include "qxcore/platform/win32.h"

namespace platform::rich {

LRESULT CALLBACK RichEditProcedure(HWND window, UINT message, WPARAM wParam, LPARAM lParam);

}  // namespace platform::rich
