// What the codes of SSplitterWnd::HitTest say.
#pragma once

#include "qxcore/ui/layout/splitter.h"

// Boxes and bars that divide rows; the others divide columns.
constexpr bool SIsOfRows(int code) {
  return code == kSHitVertSplitBox || (code >= kSHitRowBar && code < kSHitColumnBar);
}
constexpr bool SIsSplitBox(int code) { return code == kSHitVertSplitBox || code == kSHitHorzSplitBox; }
// The row or column before a bar.
constexpr int SBarNumber(int code) { return code >= kSHitColumnBar ? code - kSHitColumnBar : code - kSHitRowBar; }
