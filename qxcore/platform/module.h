// Which module the running code belongs to, and on Linux what a module handle stands for.
// Threads: the functions may be called in any thread.
#pragma once

#include <cstddef>

#include "qxcore/platform/export.h"
#include "qxcore/platform/win32.h"

#ifndef _WIN32
// One text of a module's string table.
struct StringResource {
  unsigned int id;     // as LoadStringW takes it
  const WCHAR* text;   // terminated; may hold NULs
  std::size_t length;  // in characters
};

// What an HINSTANCE points to on targets without resource modules: a string table. A module that has
// texts of its own defines one statically and hands out its address.
struct HINSTANCE__ {
  const StringResource* strings;  // ascending by id
  std::size_t count;              // of strings
};
#endif

namespace platform {

// The handle of the library itself (not of the program), for its resources.
QXCORE_API HINSTANCE ModuleHandle() noexcept;

}  // namespace platform
