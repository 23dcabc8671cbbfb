// Dialogs: windows that were made from a template.
#pragma once

#include "qxcore/platform/posix/window/window.h"

namespace platform::model {

struct Dialog : OnModelHeap {
  bool isEnded = false;
  INT_PTR result = 0;
  HWND savedFocus = nullptr;  // while the dialog is not active
  UINT defaultId = IDOK;
  int baseX = 7, baseY = 16;  // a dialog unit is a quarter and an eighth of these, in pixels
  HFONT font = nullptr;
};

// Under the lock.
Dialog* FindDialog(HWND window);
HWND FindItemById(HWND dialog, UINT id);  // the first child with the number; null without
void FreeDialog(Window* window);

// Makes a window a dialog, if it is not one yet. Without the lock; false when memory is out.
bool MakeDialog(HWND window);

// Gives the focus to a control of the dialog as a user's tab does: the text of an edit control is selected.
void FocusControl(HWND control);
// Moves the frame of the default button to `control` if it is a push button, else back to the dialog's own.
void ShowDefaultButton(HWND dialog, HWND control);

// Runs messages until the dialog is ended; its result. `owner` gets WM_ENTERIDLE. Without the lock.
INT_PTR RunDialog(HWND dialog, HWND owner);

}  // namespace platform::model
