// The library's message box, which follows the interaction mode. For the user-interface thread.
#pragma once

#include "qxcore/platform/export.h"
#include "qxcore/platform/win32.h"
#include "qxcore/string/string.h"

// Shows a message box and returns the identifier of the chosen button (IDOK, ...). `type` has the system's MB_ bits;
// a null caption is the application's name; a null owner the application's owner window. Where nobody is there to
// answer, returns the default button or throws an STargetedException, as the mode says; see interaction_mode.h.
QXCORE_API int SMessageBox(LPCWSTR text, UINT type = MB_OK, LPCWSTR caption = nullptr, HWND owner = nullptr);

// The default button of a type of box, in its low 4 bits, with the system's MB_DEFBUTTON bits. Unknown types and a
// fourth button that does not exist give the first button.
QXCORE_API int SDefaultButton(UINT type);

// The names of the buttons of a type of box, e.g. "Yes / No"; empty for an unknown type.
QXCORE_API SString SButtonSetLabel(UINT type);
