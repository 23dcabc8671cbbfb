// Tells Wine from Windows, for the places where Wine falls short of the published documentation.
#pragma once

#include "platform/win32.h"

inline bool IsWine() {
#ifdef _WIN32
  return GetProcAddress(GetModuleHandleW(L"ntdll.dll"), "wine_get_version") != nullptr;
#else
  return false;
#endif
}
