// SFindFailures: what a walk through a tree could not read.
//
// A walk passes over a folder that it cannot enter and goes on with the next. So that nothing is missed
// silently, each such folder is counted here and reported to the sink, and a walk that missed something ends
// with the first failure as the last-error value instead of ERROR_NO_MORE_FILES.
// Threads: an object belongs to one thread at a time.
#pragma once

#include "qxcore/platform/export.h"
#include "qxcore/string/string.h"

// Is called for every folder that a walk could not read, at the moment when the walk meets it.
class QXCORE_API SFindFailureSink {
 public:
  virtual ~SFindFailureSink() = default;

  // `error` is the platform's: ERROR_ACCESS_DENIED, ERROR_PATH_NOT_FOUND for a folder that was removed
  // meanwhile, ERROR_INVALID_NAME for one whose path is too long (more than 255 characters), ... Must not
  // throw, and must leave the finder alone.
  virtual void OnFolderNotRead(const SString& folder, unsigned long error) = 0;
};

class QXCORE_API SFindFailures {
 public:
  int GetCount() const { return m_count; }
  bool IsEmpty() const { return m_count == 0; }
  // The first of them; 0 and an empty text without one.
  unsigned long GetFirstError() const { return m_firstError; }
  const SString& GetFirstFolder() const { return m_firstFolder; }

  // Null for none; must live as long as it is set. Not owned.
  void SetSink(SFindFailureSink* sink) { m_sink = sink; }

  // For walks: notes that the folder could not be read. The same folder twice in a row counts once.
  void Add(const SString& folder, unsigned long error);
  // The same for the folder of a mask, unless the error only says that nothing (more) was found there.
  void AddSearch(const SString& mask, unsigned long error);
  // Forgets what was counted; the sink stays.
  void Clear();

 private:
  int m_count = 0;
  unsigned long m_firstError = 0;
  SString m_firstFolder;
  SString m_lastFolder;
  SFindFailureSink* m_sink = nullptr;
};
