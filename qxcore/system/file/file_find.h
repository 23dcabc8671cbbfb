// SFileFind: the search in one folder, straight from the platform.
// Threads: an object belongs to one thread at a time.
#pragma once

#include "qxcore/system/file/finder.h"

// What follows from the name, the folder and the attributes of an entry, for every finder over the platform.
class QXCORE_API SBaseFind : public SFinder {
 public:
  SString GetFilePath() const override;
  SString GetFileTitleW() const override;
  SString GetFileURL() const override;
  int IsDots() const override;
};

class QXCORE_API SFileFind : public SBaseFind {
 public:
  SFileFind() = default;
  ~SFileFind() override;

  // Keeps the last-error value when it succeeds.
  int Close() override;
  // Yields all that fits, "." and "..", too. When it returns 0, the finder is closed and the last error is
  // the platform's, or ERROR_INVALID_NAME for a mask whose full path has more than 259 characters. The
  // attributes are not used.
  int FindFile(const WCHAR* mask = nullptr, unsigned long attributes = 0) override;
  // 0 with ERROR_NO_MORE_FILES at the end; any other error when the folder cannot be read on.
  int FindNextFileW() override;

  SString GetFileName() const override;
  SString GetRoot() const override { return m_root; }
  std::uint64_t GetLength() const override;
  int GetCreationTime(STime* time) const override;
  int GetLastAccessTime(STime* time) const override;
  int GetLastWriteTime(STime* time) const override;
  int MatchesMask(unsigned long mask) const override;

  // As it was given to FindFile.
  const SString& GetMask() const { return m_mask; }

 protected:
  // FindFile for a caller that looks at folders only. The platform leaves other entries out where a listing says what
  // they are; where it does not, they are found, too.
  int FindFolders(const WCHAR* mask);

 private:
  int Search(const WCHAR* mask, bool foldersOnly);
  int GiveTime(const FILETIME& from, STime* time) const;

  WIN32_FIND_DATAW m_data = {};  // of the current entry; no name without an entry
  HANDLE m_search = nullptr;     // null when no search runs
  SString m_root;                // the folder of the search
  SString m_mask;
};

static_assert(sizeof(void*) != 4 || sizeof(SFileFind) == 608, "find data, handle, root, mask");
