// SFolderRecurse: every entry of a tree, depth first, a folder before what is in it.
//
// The mask holds for the first folder only; below it everything is visited, but "." and "..". Files are
// visited, too: SRecurseFindFolders sifts the folders out. A link to a folder is reported with its link
// attribute and never entered, so no walk comes back to where it was; where the system mounts a folder
// into itself, the length of paths ends the branch.
//
// A folder that cannot be read ends its branch, and the walk goes on; GetFailures lists it (find_failures.h).
// One open search is held for each level, never more than 128. Threads: an object belongs to one thread at a time.
#pragma once

#include "qxcore/system/file/file_find.h"
#include "qxcore/system/file/find_failures.h"

class QXCORE_API SFolderRecurse : public SBaseFind {
 public:
  // The search in one folder on the way down to the current entry.
  class QXCORE_API SFolderFinderNode : public SFileFind {
   public:
    // `parent` is the node above, null for the top; not owned by this node.
    explicit SFolderFinderNode(SFolderFinderNode* parent) : m_parent(parent) {}
    // Destroys the node, keeping the last-error value, and returns its parent.
    SFolderFinderNode* SelfDestroy();
    // Moves on to an entry that is neither "." nor ".."; stays where it is when the current one is such.
    // 0 at the end or on failure, as FindNextFileW.
    int SkipDots();

   private:
    friend class SFolderRecurse;

    SFolderFinderNode* m_parent;
  };

  SFolderRecurse() = default;
  ~SFolderRecurse() override;

  int Close() override;
  // The attributes are not used. When it returns 0, the last error is that of the search in the first folder.
  int FindFile(const WCHAR* mask = nullptr, unsigned long attributes = 0) override;
  // At the end 0, with ERROR_NO_MORE_FILES when the whole tree was read, else with the first failure.
  int FindNextFileW() override;

  SString GetFileName() const override;
  SString GetRoot() const override;  // the folder of the current entry
  std::uint64_t GetLength() const override;
  int GetCreationTime(STime* time) const override;
  int GetLastAccessTime(STime* time) const override;
  int GetLastWriteTime(STime* time) const override;
  int MatchesMask(unsigned long mask) const override;

  // What this walk could not read so far; FindFile begins anew.
  const SFindFailures& GetFailures() const { return m_failures; }
  // See SFindFailures::SetSink.
  void SetFailureSink(SFindFailureSink* sink) { m_failures.SetSink(sink); }

 private:
  friend class SFileRecurseFind;
  friend class SRecurseFindFolders;

  // Puts a node on top and searches; without an entry it is taken away again and the failure noted.
  int Enter(const SString& mask);
  int GoDown();
  int GoOn();

  SFolderFinderNode* m_current = nullptr;  // owned, with all above it
  SFindFailures m_failures;
  bool m_foldersOnly = false;  // files need not be visited
};
