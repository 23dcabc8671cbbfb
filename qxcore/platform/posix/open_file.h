// Opening files as CreateFileW does, with what only the portable layer itself can ask for.
#pragma once

#include <sys/stat.h>

#include "qxcore/platform/posix/path.h"

namespace platform {

struct OpenRequest {
  DWORD access, share, disposition;
  DWORD flags = 0;
  bool isInherited = false;
  mode_t rights = 0666;  // of a file that is made, less those of the process's umask
};

// A handle, with the last error as CreateFileW leaves it; or INVALID_HANDLE_VALUE.
HANDLE OpenFileAt(const Resolved& entry, const OpenRequest& request);

}  // namespace platform
