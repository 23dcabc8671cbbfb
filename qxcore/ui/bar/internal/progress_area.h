// Where the progress control and the Cancel button of a status bar stand.
#pragma once

#include <algorithm>

#include "qxcore/graphics/rect.h"

struct SProgressPlaces {
  SRect m_progress;
  SRect m_button;  // empty without a button
};

// Divides a pane's rectangle, narrowed by `margin` pixels left and right. The button keeps its size and stands in the
// bottom right corner; the progress control takes the width left of it. A null size is no button.
inline SProgressPlaces SPlaceProgress(SRect pane, int margin, const SSize* button) {
  pane.Deflate(margin, 0);
  pane.right = std::max(pane.right, pane.left);
  if (button == nullptr) return {pane, SRect()};
  const SRect place(SPoint(pane.right - button->cx, pane.bottom - button->cy), *button);
  pane.right = std::max(place.left, pane.left);
  return {pane, place};
}
