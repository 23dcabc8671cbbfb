// Sharing modes between all who open files through this layer, with advisory locks on bytes far behind
// any file's end. The locks belong to the open file, so they hold inside one process, too.
#pragma once

#include "qxcore/platform/win32.h"

namespace platform {

// Notes what the opener does and denies, unless somebody's rights or denials stand against it; then
// false. On file systems without such locks, and for a descriptor that cannot be locked, true.
bool TakeShareMode(int descriptor, DWORD access, DWORD share);

// True when somebody has the file open without FILE_SHARE_DELETE. `path` is the file system's.
bool IsDeleteDenied(const char* path);
// True when somebody has the file open for reading, writing, or with some denial.
bool IsHeldOpen(const char* path);
// The same questions about an open file: whether somebody else denies reading, or writes.
bool IsReadDenied(int descriptor);
bool HasOtherWriter(int descriptor);

// Waits for the turn to change a file that is replaced with each change; it lasts until the descriptor, which
// must be open for writing, is closed. False when somebody else kept it for five seconds.
bool TakeTurn(int descriptor);

}  // namespace platform
