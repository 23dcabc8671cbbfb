// How many handles this process has open, to see that none is lost.
#pragma once

#include "qxcore/platform/win32.h"

#ifndef _WIN32
#include <dirent.h>
#endif

inline int CountOpenHandles() {
#ifdef _WIN32
  DWORD count = 0;
  GetProcessHandleCount(GetCurrentProcess(), &count);
  return static_cast<int>(count);
#else
  int count = 0;
  DIR* folder = opendir("/proc/self/fd");
  while (readdir(folder) != nullptr) ++count;
  closedir(folder);
  return count;
#endif
}
