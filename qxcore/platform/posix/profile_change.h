// Changing initialisation files.
//
// A file is replaced by a new one that has its owner and rights, so that readers and a killed writer never see or
// leave half a file. Where that would lose something, it is written in its place: when somebody holds it open for
// writing, when it has other names, or when a file of this owner cannot be made in its folder.
#pragma once

#include <functional>
#include <string>

#include "qxcore/platform/posix/path.h"
#include "qxcore/platform/posix/profile_file.h"

namespace platform {

// Where an initialisation file of this name is or would be, in the file system. A name without a folder is in the
// folder "qxcore" of the user's configuration. Links are followed, also one whose target is missing.
struct ProfilePath {
  explicit ProfilePath(LPCWSTR name);

  std::string path;
  bool isInUserFolder = false;  // which may have to be made
  DWORD error = ERROR_SUCCESS;  // why there is no such place
};

// Reads the file, lets `change` change it (false: there is nothing to change) and writes it. Writers take turns;
// ERROR_SHARING_VIOLATION when somebody else denies reading or writing, or keeps the turn. The file is as it was
// when this fails.
DWORD ChangeProfile(LPCWSTR name, const std::function<bool(ProfileFile&)>& change);

}  // namespace platform
