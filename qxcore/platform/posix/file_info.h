// Attributes and times of an entry, in the terms of Windows.
#pragma once

#include <sys/stat.h>

#include "qxcore/platform/win32.h"

namespace platform {

struct FileTimes {
  FILETIME creation, access, write;
};

// As fstatat takes its arguments; false with errno. Where the file system keeps no time of creation, the
// earliest of the others stands for it.
bool GetTimes(int folder, const char* name, int flags, FileTimes& times);

struct EntryInfo {
  DWORD attributes;
  ULONGLONG size;  // of a file; 0 for folders and links that lead nowhere
  FileTimes times;
};

// For the entry itself; attributes and size of a link are joined with those of what it leads to. False
// with errno.
bool GetEntryInfo(int folder, const char* name, EntryInfo& info);

}  // namespace platform
