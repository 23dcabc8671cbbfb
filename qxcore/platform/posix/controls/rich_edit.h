// The window class of rich-edit controls: it holds a document, and takes and gives it as text and as RTF.
//
// There is no editing and no painting. What it answers: WM_SETTEXT (a text that begins as RTF is read as such),
// WM_GETTEXT, WM_GETTEXTLENGTH, EM_STREAMIN and EM_STREAMOUT with SF_RTF, SF_TEXT and SF_UNICODE, EM_GETTEXTEX and
// EM_GETTEXTLENGTHEX for UTF-16, EM_SETTEXTMODE and EM_GETTEXTMODE, EM_EXLIMITTEXT, which limits plain text that
// is streamed in.
#pragma once

#include "qxcore/platform/win32.h"

namespace platform::rich {

LRESULT CALLBACK RichEditProcedure(HWND window, UINT message, WPARAM wParam, LPARAM lParam);

}  // namespace platform::rich
