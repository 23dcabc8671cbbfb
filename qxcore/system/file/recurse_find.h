// SRecurseFindFiles and SRecurseFindFolders: the files, or the folders, of a tree.
// ```cpp
// SRecurseFindFiles files;
// for (int found = files.FindFile(folder + WTEXT("\\*.txt")); found; found = files.FindNextFileW()) {
//   Show(files.GetFilePath());
// }
// if (!files.GetFailures().IsEmpty()) Show("some folders could not be read");
// ```
// Threads: an object belongs to one thread at a time.
#pragma once

#include "qxcore/system/file/file_recurse_find.h"
#include "qxcore/system/file/find_filters.h"

// Files only, never a folder or a link to one.
class QXCORE_API SRecurseFindFiles : public SAttrRejectFindFilter {
 public:
  SRecurseFindFiles() : SAttrRejectFindFilter(m_files) {}

  // The mask is SFileRecurseFind's: its last part holds in every folder. Entries with one of the attributes
  // are left out.
  int FindFile(const WCHAR* mask = nullptr, unsigned long attributes = 0) override;

  // See SFolderRecurse.
  const SFindFailures& GetFailures() const { return m_files.GetFailures(); }
  // See SFindFailures::SetSink.
  void SetFailureSink(SFindFailureSink* sink) { m_files.SetFailureSink(sink); }

 private:
  SFileRecurseFind m_files;
};

// Folders only, links to folders among them.
class QXCORE_API SRecurseFindFolders : public SAttrMatchFindFilter {
 public:
  SRecurseFindFolders() : SAttrMatchFindFilter(m_folders) { m_folders.m_foldersOnly = true; }

  // The mask is SFolderRecurse's: it holds for the first folder only. The attributes are not used.
  int FindFile(const WCHAR* mask = nullptr, unsigned long attributes = 0) override;

  // See SFolderRecurse.
  const SFindFailures& GetFailures() const { return m_folders.GetFailures(); }
  // See SFindFailures::SetSink.
  void SetFailureSink(SFindFailureSink* sink) { m_folders.SetFailureSink(sink); }

 private:
  SFolderRecurse m_folders;
};
