// How a length is divided among the rows, or among the columns, of a splitter. Rows and columns follow the same
// rules, so these functions know one direction only: panes in order, with a gap between each two of them.
//
// After SSizePanes no pane is below 0, and the sizes sum to max(0, length - gaps). A pane that collapses to 0 keeps
// its gap, so that its bar can be dragged open again. Where the window is too small even for the gaps, all sizes are
// 0 and the window shows as many bars as fit.
//
// Plain arithmetic without a window; products are 64 bits wide.
// Threads: a value belongs to one thread at a time; the functions serve any thread.
#pragma once

#include <cstdint>

#include "qxcore/platform/export.h"

// One row or column.
struct SPaneInfo {
  // Flags.
  enum : std::uint32_t {
    kFixed = 1,   // the bar behind this pane cannot be dragged
    kFiller = 2,  // this pane takes the space that is left over
  };

  std::int32_t m_min = 0;      // pixels; below it the pane is not shown
  std::int32_t m_ideal = 0;    // the size that the user or the program asked for: pixels, or a share (see SSizePanes)
  std::int32_t m_current = 0;  // the size laid out last, pixels
  std::uint32_t m_flags = 0;   // kFixed, kFiller

  // Stores an ideal size and a minimum; a negative number leaves the field as it is. With an ideal size, kFixed
  // becomes `fixed`; without one, kFiller is set when the minimum is negative too, and cleared otherwise, and no
  // other flag changes.
  QXCORE_API void Set(int ideal, int minimum, int fixed);
};

static_assert(sizeof(SPaneInfo) == 16, "the layout is public");

// Sets the current sizes. `length` is the space for all panes and gaps; a negative one counts as 0. The ideal sizes
// stay as they are. The filler is the first pane with kFiller, or else the last pane; it takes what is left over,
// even if that is below its minimum. An ideal size below the pane's minimum counts as 0, but for the last pane.
//
// With `keepRatio` 0, the panes get their ideal sizes in order. Where the space runs short, a pane gets what is left
// if that is not below its minimum, and else 0. Otherwise each pane gets the share of the space that its ideal size
// has in their sum, rounded down, or 0 if that is below its minimum.
QXCORE_API void SSizePanes(SPaneInfo* panes, int count, int length, int gap, int keepRatio);

// The pane that takes the space left over. `count` is at least 1.
QXCORE_API int SFillerOf(const SPaneInfo* panes, int count);

// The distance from the start of the first pane to the start of pane `index`, which may be the count.
QXCORE_API int SPaneStart(const SPaneInfo* panes, int index, int gap);

// The bar at a distance from the start of the first pane: the number of the pane before it, or -1 for no bar. The
// bars of fixed panes are passed over.
QXCORE_API int SBarAt(const SPaneInfo* panes, int count, int gap, int distance);

// Changes ideal sizes so that the next layout gives the pane before the bar `size` pixels, as far as minima and the
// space allow. `bar` is the number of the pane before the bar, below count - 1. Before the filler, the panes behind
// the bar keep their sizes and move; behind it, and where the ratio is kept, the bar moves between its two neighbours.
QXCORE_API void SMoveBar(SPaneInfo* panes, int count, int bar, int size, int keepRatio);
