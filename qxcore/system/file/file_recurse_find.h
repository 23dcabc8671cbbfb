// SFileRecurseFind: the search in one folder, then in every folder below it.
// Threads: an object belongs to one thread at a time.
#pragma once

#include "qxcore/system/file/folder_recurse.h"

class QXCORE_API SFileRecurseFind : public SFileFind {
 public:
  SFileRecurseFind() { m_folders.m_foldersOnly = true; }

  int Close() override;
  // Takes the mask apart into folder and file mask: a mask without "*" that names a folder stands for all in
  // that folder; else the folder ends at the last backslash or, without one, at the colon of a drive ("C:*.c"
  // looks from the drive's root on); without either it is the current directory. The file mask holds in
  // every folder. Yields what SFileFind yields in each, folders, "." and "..", too; SRecurseFindFiles sifts
  // the files out. The attributes are not used.
  // When it returns 0, the last error is the first failure, or ERROR_FILE_NOT_FOUND when all was read.
  int FindFile(const WCHAR* mask = nullptr, unsigned long attributes = 0) override;
  // At the end 0, with ERROR_NO_MORE_FILES when the whole tree was read, else with the first failure.
  int FindNextFileW() override;

  // The failures of both searches together; FindFile begins anew. See SFolderRecurse.
  const SFindFailures& GetFailures() const { return m_folders.GetFailures(); }
  // See SFindFailures::SetSink.
  void SetFailureSink(SFindFailureSink* sink) { m_folders.SetFailureSink(sink); }

 private:
  void TakeApart(const SString& mask);
  int FindIn(const SString& folder);
  int FindInNextFolder();
  int EndWith(DWORD error);

  SString m_base;            // with a backslash at its end
  SString m_fileMask;        // the mask's last part
  SFolderRecurse m_folders;  // walks the folders below the base
  int m_walks = 0;           // that walk has been started
};
