#include "qxcore/ui/layout/pane_sizing.h"

#include <algorithm>

namespace {

// The ideal size as far as it counts: that of the last pane always does.
int CountedIdeal(const SPaneInfo* panes, int count, int i) {
  const SPaneInfo& pane = panes[i];
  return i < count - 1 && pane.m_ideal < pane.m_min ? 0 : pane.m_ideal;
}

int SpaceForPanes(int count, int length, int gap) {
  const std::int64_t gaps = std::int64_t{count - 1} * gap;
  return static_cast<int>(std::max<std::int64_t>(std::max(length, 0) - gaps, 0));
}

int OrNothingBelow(int minimum, int size) { return size < minimum ? 0 : size; }

// Each function sets all current sizes and returns what is left of the space.
int GiveShares(SPaneInfo* panes, int count, int space) {
  std::int64_t sum = 0;
  for (int i = 0; i < count; ++i) sum += CountedIdeal(panes, count, i);
  int left = space;
  for (int i = 0; i < count; ++i) {
    const std::int64_t share = sum <= 0 ? 0 : std::int64_t{CountedIdeal(panes, count, i)} * space / sum;
    panes[i].m_current = OrNothingBelow(panes[i].m_min, static_cast<int>(share));
    left -= panes[i].m_current;
  }
  return left;
}

int GiveIdealSizes(SPaneInfo* panes, int count, int space) {
  int left = space;
  for (int i = 0; i < count; ++i) {
    panes[i].m_current = OrNothingBelow(panes[i].m_min, std::min(CountedIdeal(panes, count, i), left));
    left -= panes[i].m_current;
  }
  return left;
}

}  // namespace

void SPaneInfo::Set(int ideal, int minimum, int fixed) {
  if (minimum >= 0) m_min = minimum;
  if (ideal >= 0) {
    m_ideal = ideal;
    m_flags = fixed != 0 ? m_flags | kFixed : m_flags & ~kFixed;
  } else {
    m_flags = minimum < 0 ? m_flags | kFiller : m_flags & ~kFiller;
  }
}

int SFillerOf(const SPaneInfo* panes, int count) {
  for (int i = 0; i < count - 1; ++i) {
    if (panes[i].m_flags & SPaneInfo::kFiller) return i;
  }
  return count - 1;
}

void SSizePanes(SPaneInfo* panes, int count, int length, int gap, int keepRatio) {
  if (count <= 0) return;
  const int space = SpaceForPanes(count, length, gap);
  const int left = keepRatio ? GiveShares(panes, count, space) : GiveIdealSizes(panes, count, space);
  panes[SFillerOf(panes, count)].m_current += left;
}

int SPaneStart(const SPaneInfo* panes, int index, int gap) {
  int start = 0;
  for (int i = 0; i < index; ++i) start += panes[i].m_current + gap;
  return start;
}

int SBarAt(const SPaneInfo* panes, int count, int gap, int distance) {
  int start = 0;
  for (int i = 0; i < count - 1; ++i) {
    start += panes[i].m_current;
    const bool isFixed = panes[i].m_flags & SPaneInfo::kFixed;
    if (!isFixed && distance >= start && distance < start + gap) return i;
    start += gap;
  }
  return -1;
}

void SMoveBar(SPaneInfo* panes, int count, int bar, int size, int keepRatio) {
  const int before = std::max(size, 0);
  const int behind = std::max(panes[bar].m_current + panes[bar + 1].m_current - before, 0);
  const int filler = SFillerOf(panes, count);
  if (keepRatio) {
    for (int i = 0; i < count; ++i) panes[i].m_ideal = panes[i].m_current;
  }
  // The filler's own ideal size is the least that it takes.
  panes[bar].m_ideal = keepRatio || bar != filler ? before : std::min<int>(panes[bar].m_ideal, before);
  if (keepRatio || bar >= filler) panes[bar + 1].m_ideal = behind;
}
