// The private messages between a frame and its bars. For the user-interface thread.
#pragma once

#include "qxcore/graphics/rect.h"

// Sent by a frame to its children when it lays them out; lParam is the address of an SSizeParent. A bar takes its
// strip off m_rect, and moves itself in the batch, if there is one.
inline constexpr UINT kSMsgSizeParent = 0x0361;

struct SSizeParent {
  HDWP m_batch;   // the moves so far, to be replaced by DeferWindowPos; null when only the space is asked for
  SRect m_rect;   // what is left of the client area
  SSize m_used;   // what bars have taken so far
  int m_stretch;  // nonzero: bars are as long as the area
};

// Sent to the owner window: wParam is a text to show in the status bar's main pane, and 0 to show what stood there
// before. lParam says for whom the text is shown: messages of different users nest. It is never followed as an
// address, and may be 0.
inline constexpr UINT kSMsgStatusText = 0x047B;
