// SDockSiteFrameWnd: a frame at whose edges control bars stand; the usual main window of a program.
#pragma once

#include "qxcore/ui/frame/frame.h"

class QXCORE_API SDockSiteFrameWnd : public SFrameWnd {
  QXCORE_DECLARE_CREATABLE_CLASS(SDockSiteFrameWnd)

 public:
  SDockSiteFrameWnd() = default;
  ~SDockSiteFrameWnd() override;

 protected:
  QXCORE_DECLARE_MESSAGE_MAP()
};
