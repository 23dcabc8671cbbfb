// SAttrMatchFindFilter and SAttrRejectFindFilter: finders that sift the entries of another by attributes.
//
// A filter passes everything on to the finder that it wraps, which must live as long as the filter, and
// leaves out the entries that do not pass. A mask of 0 filters nothing. Filters can be put around filters.
// Threads: an object belongs to one thread at a time.
#pragma once

#include "qxcore/system/file/finder.h"

// What both have in common.
class QXCORE_API SAttrFindFilter : public SFinder {
 public:
  int Close() override { return m_finder.Close(); }
  // `attributes` is the mask of the filter; the inner finder gets 0.
  int FindFile(const WCHAR* mask = nullptr, unsigned long attributes = 0) override;
  int FindNextFileW() override;

  SString GetFileName() const override { return m_finder.GetFileName(); }
  SString GetFilePath() const override { return m_finder.GetFilePath(); }
  SString GetFileTitleW() const override { return m_finder.GetFileTitleW(); }
  SString GetFileURL() const override { return m_finder.GetFileURL(); }
  SString GetRoot() const override { return m_finder.GetRoot(); }
  std::uint64_t GetLength() const override { return m_finder.GetLength(); }
  int GetCreationTime(STime* time) const override { return m_finder.GetCreationTime(time); }
  int GetLastAccessTime(STime* time) const override { return m_finder.GetLastAccessTime(time); }
  int GetLastWriteTime(STime* time) const override { return m_finder.GetLastWriteTime(time); }
  int MatchesMask(unsigned long mask) const override { return m_finder.MatchesMask(mask); }
  int IsDots() const override { return m_finder.IsDots(); }

 protected:
  // `yieldsMatches`: entries that share a bit with the mask pass; otherwise the others.
  SAttrFindFilter(SFinder& finder, bool yieldsMatches) : m_finder(finder), m_yieldsMatches(yieldsMatches) {}

 private:
  int Skip(int found);

  SFinder& m_finder;
  unsigned long m_mask = 0;
  bool m_yieldsMatches;
};

// Yields the entries that share a bit with the mask: FindFile(L"C:\\*.*", FILE_ATTRIBUTE_READONLY).
class QXCORE_API SAttrMatchFindFilter : public SAttrFindFilter {
 public:
  // The finder is not owned.
  explicit SAttrMatchFindFilter(SFinder& finder) : SAttrFindFilter(finder, true) {}
};

// Yields the entries that share no bit with the mask.
class QXCORE_API SAttrRejectFindFilter : public SAttrFindFilter {
 public:
  // The finder is not owned.
  explicit SAttrRejectFindFilter(SFinder& finder) : SAttrFindFilter(finder, false) {}
};
