// SEdit: an edit control of the system.
//
// Positions and lengths count characters. Members that only send a message return its result. For the user-interface
// thread.
#pragma once

#include "qxcore/ui/window/window.h"

class QXCORE_API SEdit : public SWnd {
  QXCORE_DECLARE_CREATABLE_CLASS(SEdit)

 public:
  SEdit() = default;
  ~SEdit() override;

  using SWnd::Create;
  // Creates the control as a child; `style` has the system's ES_ bits. Returns nonzero on success.
  int Create(DWORD style, const SRect& rect, SWnd* parent, UINT id);

  void GetSel(int* start, int* end) const;         // the selection; `end` lies behind it
  void SetSel(int start, int end);                 // (0, -1) selects all
  void ReplaceSel(LPCWSTR text, int canUndo = 0);  // types over the selection
  void SetLimitText(int count);                    // how much a user may type
  int GetLimitText() const;                        // what SetLimitText set
  int GetModify() const;                           // nonzero when the user changed the text
  void SetModify(int modified);                    // sets or clears that
  int CanUndo() const;                             // nonzero when Undo has something to do
  int Undo();                                      // takes the last change back
  void EmptyUndoBuffer();                          // Undo then has nothing to do
  void Cut();                                      // moves the selection to the clipboard
  void Copy();                                     // copies it
  void Paste();                                    // replaces it by the clipboard's text
  void Clear();                                    // deletes the selection
  int GetLineCount() const;                        // at least 1
  WCHAR GetPasswordChar() const;                   // 0 while the text is shown as it is
  void SetPasswordChar(WCHAR character);           // shows it in place of every character
};
