// Copying files, for CopyFileW and for moves from one file system to another.
#pragma once

#include "qxcore/platform/posix/path.h"

namespace platform {

// CopyFileW: content, access rights and the time of the last write. A new file gets the rights of the source,
// less those of the process's umask; one that is there keeps no right that the source lacks. Rights are set before
// the content is there. A copy that failed is removed.
DWORD CopyFileTo(const Resolved& source, LPCWSTR to, bool failIfExists);

// Moves a file or a link by a copy that takes the target's name once it is whole, with owner, rights and times.
DWORD MoveByCopy(const Resolved& source, const std::string& target, bool replaces);

}  // namespace platform
