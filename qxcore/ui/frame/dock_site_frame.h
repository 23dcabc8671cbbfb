// SDockSiteFrameWnd: a frame at whose edges control bars stand; the usual main window of a program.
//
// It shows the messages of SSetStatusBarText in the main pane of its status bar, the first child that is one, and
// afterwards what stood there before. For the user-interface thread.
#pragma once

#include "qxcore/ui/bar/status_texts.h"
#include "qxcore/ui/frame/frame.h"

class QXCORE_API SDockSiteFrameWnd : public SFrameWnd {
  QXCORE_DECLARE_CREATABLE_CLASS(SDockSiteFrameWnd)

 public:
  SDockSiteFrameWnd() = default;
  ~SDockSiteFrameWnd() override;

 protected:
  // Takes wParam and lParam of kSMsgStatusText. Returns 1, or 0 when the frame has no status bar.
  LRESULT OnStatusText(WPARAM text, LPARAM user);

  QXCORE_DECLARE_MESSAGE_MAP()

 private:
  SStatusTexts m_texts;
};
