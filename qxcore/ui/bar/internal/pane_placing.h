// How the panes of a status bar, and of the layout that is spliced into it, share the bar's width.
#pragma once

#include <algorithm>
#include <cstdint>
#include <limits>

#include "qxcore/ui/bar/status_bar_panes.h"

// What the panes are laid out in; pixels.
struct SPaneSpace {
  int m_width;    // from the bar's left edge to where panes end
  int m_border;   // left of the first pane
  int m_gap;      // between two panes
  int m_padding;  // added to each pane's width
};

// Calls `visit` with each pane in the order of display: own panes before the splice, all extra ones (null for none),
// the remaining own ones.
template <class Panes, class Visit>
void SVisitPanes(Panes& own, int splice, Panes* extra, Visit visit) {
  for (int i = 0; i < splice; ++i) visit(own[i]);
  for (int i = 0, count = extra != nullptr ? extra->GetCount() : 0; i < count; ++i) visit((*extra)[i]);
  for (int i = splice; i < own.GetCount(); ++i) visit(own[i]);
}

// The index by which the control knows an own pane.
inline int SControlIndex(int position, int splice, int extraCount) {
  return position < splice ? position : position + extraCount;
}

// Stores the right edge of each pane, in the order of display, up to `capacity` of them, and returns how many there
// are. The stretch panes share what is left over; a remainder of the division goes to the later ones. With less room
// than the panes need, none grows, and edges lie outside the bar. Sums are 64 bits wide; edges stop at the ends of int.
inline int SPlacePanes(const SStatusBarPanes& own, int splice, const SStatusBarPanes* extra, const SPaneSpace& space,
                       int* edges, int capacity) {
  std::int64_t spare = std::int64_t{space.m_width} + space.m_gap;
  std::int64_t stretching = 0;
  SVisitPanes(own, splice, extra, [&](const SStatusBarPane& pane) {
    spare -= std::int64_t{pane.m_width} + space.m_padding + space.m_gap;
    if (pane.m_style & kSPaneStretch) ++stretching;
  });

  int placed = 0;
  std::int64_t x = space.m_border;
  SVisitPanes(own, splice, extra, [&](const SStatusBarPane& pane) {
    x += std::int64_t{pane.m_width} + space.m_padding;
    if ((pane.m_style & kSPaneStretch) && spare > 0) {
      const std::int64_t share = spare / stretching--;
      x += share;
      spare -= share;
    }
    using Limits = std::numeric_limits<int>;
    if (placed < capacity)
      edges[placed++] = static_cast<int>(std::clamp<std::int64_t>(x, Limits::min(), Limits::max()));
    x += space.m_gap;
  });
  return placed;
}
