// SScrollBar: a scroll bar or size box of the system as a window of its own.
//
// Positions are what the program makes of them. For the user-interface thread.
#pragma once

#include "qxcore/ui/window/window.h"

class QXCORE_API SScrollBar : public SWnd {
  QXCORE_DECLARE_CREATABLE_CLASS(SScrollBar)

 public:
  SScrollBar() = default;
  ~SScrollBar() override;

  using SWnd::Create;
  // Creates the control as a child; `style` has the system's SBS_ bits. Returns nonzero on success.
  int Create(DWORD style, const SRect& rect, SWnd* parent, UINT id);

  int GetPos() const;                                        // the position now
  int SetPos(int position, int redraw = 1);                  // returns the old position
  void GetRange(int* low, int* high) const;                  // both ends of the range
  void SetRange(int low, int high, int redraw = 1);          // sets them
  int GetInfo(SCROLLINFO* info, UINT mask = SIF_ALL) const;  // see SWnd::GetScrollInfo
  int SetInfo(SCROLLINFO* info, int redraw = 1);             // by the flags in info->fMask
  int EnableArrows(UINT arrows = ESB_ENABLE_BOTH);           // the system's ESB_ numbers
};
