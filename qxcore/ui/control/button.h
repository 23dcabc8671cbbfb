// SButton: a push button, check box, radio button or group box of the system.
//
// Members that only send a message return its result. For the user-interface thread.
#pragma once

#include "qxcore/ui/window/window.h"

class QXCORE_API SButton : public SWnd {
  QXCORE_DECLARE_CREATABLE_CLASS(SButton)

 public:
  SButton() = default;
  ~SButton() override;

  using SWnd::Create;
  // Creates the control as a child; `style` has the system's BS_ bits. Returns nonzero on success.
  int Create(LPCWSTR text, DWORD style, const SRect& rect, SWnd* parent, UINT id);

  int GetCheck() const;                             // 0, 1, or 2 for undecided
  void SetCheck(int check);                         // sets it
  UINT GetState() const;                            // the system's BST_ bits
  void SetState(int pressed);                       // draws it pressed or not
  UINT GetButtonStyle() const;                      // the BS_ bits
  void SetButtonStyle(UINT style, int redraw = 1);  // sets them
};
