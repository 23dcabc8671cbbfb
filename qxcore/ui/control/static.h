// SStatic: a text, picture or frame of the system that does nothing by itself. For the user-interface thread.
#pragma once

#include "qxcore/ui/window/window.h"

class QXCORE_API SStatic : public SWnd {
  QXCORE_DECLARE_CREATABLE_CLASS(SStatic)

 public:
  SStatic() = default;
  ~SStatic() override;

  using SWnd::Create;
  // Creates the control as a child; `style` has the system's SS_ bits. Returns nonzero on success.
  int Create(LPCWSTR text, DWORD style, const SRect& rect, SWnd* parent, UINT id = 0xFFFF);
};
