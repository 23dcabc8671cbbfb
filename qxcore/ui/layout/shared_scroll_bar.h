// The scroll bars that a splitter or a tab window shares among its windows. For the user-interface thread.
#pragma once

#include "qxcore/platform/export.h"

class SScrollBar;
class SWnd;

// The shared scroll bar that serves a window: a pane of a splitter, or the window that a tab window shows. Null for
// other windows and where there is no such bar. `bar` is SB_HORZ or SB_VERT. Views find it by themselves; other
// windows override GetScrollBarCtrl:
//
//   SScrollBar* GetScrollBarCtrl(int bar) const override { return SSharedScrollBar(this, bar); }
QXCORE_API SScrollBar* SSharedScrollBar(const SWnd* window, int bar);
