#include "qxcore/ui/layout/tab_strip.h"

#include <limits>

static int Saturated(std::int64_t place) {
  using Limits = std::numeric_limits<int>;
  return static_cast<int>(std::clamp<std::int64_t>(place, Limits::min(), Limits::max()));
}

int STabStrip::Offset(int tab) const { return Saturated(Start(tab)); }
int STabStrip::RightEdge(int tab) const { return Saturated(Start(tab) + Step(tab) + m_spacing); }

int STabStrip::TabAt(int x) const {
  std::int64_t left = m_origin;
  if (x < left) return -1;
  for (int i = m_first; i < m_count; ++i) {
    left += Step(i);
    if (x < left) return i;
  }
  return -1;
}

int STabStrip::LastVisible() const {
  if (m_first >= m_count) return m_first;
  std::int64_t right = m_origin + Step(m_first) + m_spacing;
  int last = m_first;
  while (last + 1 < m_count && right + Step(last + 1) <= m_width) right += Step(++last);
  return last;
}

int STabStrip::SmallestFirstThatShows(int tab) const {
  std::int64_t right = m_origin + Step(tab) + m_spacing;
  int first = tab;
  while (first > 0 && right + Step(first - 1) <= m_width) right += Step(--first);
  return first;
}

int STabStrip::FirstThatShows(int tab) const {
  return tab <= m_first ? tab : std::max(m_first, SmallestFirstThatShows(tab));
}

void STabButtons::Show(int show, int twoOnly) {
  m_shown = show != 0;
  m_count = !show ? 0 : twoOnly ? 2 : 4;
  m_areaWidth = m_count * m_width;
}

void STabButtons::SetSize(int size) {
  m_width = m_height = size;
  m_areaWidth = m_count * m_width;
}

int STabButtons::At(const POINT& point) const {
  if (point.x < 0 || point.x >= m_areaWidth || point.y < 0 || point.y >= m_height) return kSTabNoButton;
  return point.x / m_width + (m_count == 2 ? kSTabToPrevious : kSTabToFirst);
}

SRect STabButtons::RectOf(int button) const {
  const int place = button - (m_count == 2 ? kSTabToPrevious : kSTabToFirst);
  if (place < 0 || place >= m_count) return SRect();
  return SRect(place * m_width, 0, (place + 1) * m_width, m_height);
}

bool STabCanScroll(const STabStrip& strip, int button) {
  switch (button) {
    case kSTabToFirst:
    case kSTabToPrevious:
      return strip.m_first > 0;
    case kSTabToNext:
    case kSTabToLast:
      return strip.LastVisible() < strip.m_count - 1;
    default:
      return false;
  }
}

int STabScrollTarget(const STabStrip& strip, int button) {
  if (strip.m_count == 0) return strip.m_first;
  switch (button) {
    case kSTabToFirst:
      return 0;
    case kSTabToPrevious:
      return std::max(strip.m_first - 1, 0);
    case kSTabToNext:
      return std::min(strip.m_first + 1, strip.m_count - 1);
    case kSTabToLast:
      return strip.SmallestFirstThatShows(strip.m_count - 1);
    default:
      return strip.m_first;
  }
}
