// The runtime's error number for one of the system's.
#pragma once

#include <cerrno>

#include "qxcore/platform/win32.h"

namespace platform {

// As the published runtime maps them; EINVAL for what it does not know.
inline int ErrnoOf(DWORD error) {
  switch (error) {
    case ERROR_FILE_NOT_FOUND:
    case ERROR_PATH_NOT_FOUND:
    case ERROR_INVALID_NAME:
    case ERROR_BAD_NETPATH:
      return ENOENT;
    case ERROR_ACCESS_DENIED:
    case ERROR_SHARING_VIOLATION:
      return EACCES;
    case ERROR_TOO_MANY_OPEN_FILES:
      return EMFILE;
    case ERROR_NOT_ENOUGH_MEMORY:
      return ENOMEM;
    case ERROR_DISK_FULL:
      return ENOSPC;
    case ERROR_WRITE_FAULT:
    case ERROR_READ_FAULT:
      return EIO;
    default:
      return EINVAL;
  }
}

}  // namespace platform
