// SProgressCtrl: a progress bar of the system. For the user-interface thread.
#pragma once

#include "qxcore/ui/window/window.h"

class QXCORE_API SProgressCtrl : public SWnd {
  QXCORE_DECLARE_CREATABLE_CLASS(SProgressCtrl)

 public:
  SProgressCtrl() = default;
  ~SProgressCtrl() override;

  using SWnd::Create;
  // Creates the control as a child; `style` has the system's PBS_ bits. Returns nonzero on success.
  int Create(DWORD style, const SRect& rect, SWnd* parent, UINT id);

  void SetRange(int low, int high);  // 0 to 100 at the start
  int SetPos(int position);          // returns the old position
  int GetPos() const;                // the position now
  int OffsetPos(int by);             // returns the old position
  int SetStep(int step);             // returns the old step, 10 at the start
  int StepIt();                      // returns the old position; behind the end it begins anew
};
