// SOrderedRecurseFindFiles: the files of a tree in order of their full paths.
// Threads: an object belongs to one thread at a time.
#pragma once

#include "qxcore/container/string_table.h"
#include "qxcore/system/file/find_failures.h"

class QXCORE_API SOrderedRecurseFindFiles {
 public:
  SOrderedRecurseFindFiles() = default;

  // Finds all files at once and sorts them by code unit (SStringTable::Sort); the mask is that of
  // SFileRecurseFind. 1 when there is one, and the first is the current one. 0 otherwise, with the first
  // failure as the last error, or ERROR_FILE_NOT_FOUND. Throws SEOutOfMemory; nothing is found then.
  int FindFile(const WCHAR* mask = nullptr);
  // 0 when the current file is the last one, which it stays.
  int FindNextFileW();
  // The path of the current file; empty without one.
  SString GetFilePath() const;
  // All that were found, in order.
  const SStringTable& GetPaths() const { return m_paths; }
  // Forgets the files.
  void Clear();

  // What the walk could not read; see SFolderRecurse. The files of a walk with failures are there all the same.
  const SFindFailures& GetFailures() const { return m_failures; }
  // See SFindFailures::SetSink.
  void SetFailureSink(SFindFailureSink* sink) { m_failures.SetSink(sink); }

 private:
  SStringTable m_paths;
  int m_index = 0;
  SFindFailures m_failures;
};
