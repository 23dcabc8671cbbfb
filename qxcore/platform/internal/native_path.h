// The system's own paths, as program arguments and the interfaces of the system have them, and those that the
// library speaks.
#pragma once

#include <string>
#include <string_view>

#include "qxcore/platform/win32.h"

namespace platform {

// On Linux "/usr/a:b" and "C:\usr\a", U+F03A, "b"; relative paths stay relative. On Windows the same text, native
// paths in UTF-8.
std::basic_string<WCHAR> FromNativePath(std::string_view path);
// Empty for a path that no path of the system stands for: other drives and servers, on Linux.
std::string ToNativePath(SStringView path);

}  // namespace platform
