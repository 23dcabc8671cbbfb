// Which system a test runs on: for what only one of them has, and for the places where Wine falls short
// of the published documentation.
#pragma once

#include "qxcore/platform/win32.h"

inline bool IsWine() {
#ifdef _WIN32
  return GetProcAddress(GetModuleHandleW(L"ntdll.dll"), "wine_get_version") != nullptr;
#else
  return false;
#endif
}

inline bool IsWindows() {
#ifdef _WIN32
  return true;
#else
  return false;
#endif
}
