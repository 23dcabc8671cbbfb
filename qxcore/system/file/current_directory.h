// SCurrentDirectory: changes the process's current directory and brings it back.
// ```cpp
// SCurrentDirectory guard;
// guard.Assign(folder, 0);
// SFile settings(WTEXT("settings.ini"));  // is looked up there; the end of the guard restores
// ```
// The current directory belongs to the process: other threads see the change. Names are compared without
// regard to case on both targets. Results of the platform's calls: 1, or 0 with the last error.
#pragma once

#include "qxcore/platform/export.h"
#include "qxcore/platform/win32.h"
#include "qxcore/string/string.h"

class QXCORE_API SCurrentDirectory {
 public:
  SCurrentDirectory() = default;
  // As Assign.
  explicit SCurrentDirectory(const SString& path, int unconditional = 0) { Assign(path, unconditional); }
  SCurrentDirectory(const SCurrentDirectory&) = delete;
  SCurrentDirectory& operator=(const SCurrentDirectory&) = delete;
  // Calls Restore where it is due; failures are ignored.
  ~SCurrentDirectory();

  // The current directory, without a backslash at its end but for a root. Empty on failure.
  static SString Get();
  static int Set(const SString& path);
  // The folder for temporary files, without a backslash at its end.
  static SString GetDefaultTemporaryDirectory();

  // Remembers where to return to and goes to `path`; an empty one is the default temporary directory. The
  // platform's result when the directory was to be changed; 0 also when it is the current one already. An
  // earlier assignment is forgotten, not restored. With `unconditional` not 0 Restore returns even when
  // somebody else has gone elsewhere meanwhile.
  int Assign(const SString& path, int unconditional = 0);
  // Goes back. 0 when nothing was assigned, when we are there already, and when the current directory is
  // no longer the assigned one: somebody else has moved on, and that choice stands. Else the platform's
  // result. Unless `keep` is not 0 the assignment is forgotten, whatever came of it.
  int Restore(int keep = 0);
  // Forgets the assignment; the current directory stays.
  void CancelRestore();

 private:
  SString m_returnTo;
  SString m_assigned;  // as the system names it, which may spell it otherwise than the caller
  int m_unconditional = 0;
};

static_assert(sizeof(void*) != 4 || sizeof(SCurrentDirectory) == 12, "two directories and the flag");
