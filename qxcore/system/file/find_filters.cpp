#include "qxcore/system/file/find_filters.h"

int SAttrFindFilter::FindFile(const WCHAR* mask, unsigned long attributes) {
  m_mask = attributes;
  return Skip(m_finder.FindFile(mask, 0));
}

int SAttrFindFilter::FindNextFileW() { return Skip(m_finder.FindNextFileW()); }

int SAttrFindFilter::Skip(int found) {
  if (m_mask == 0) return found;
  while (found && (m_finder.MatchesMask(m_mask) != 0) != m_yieldsMatches) found = m_finder.FindNextFileW();
  return found;
}
