// The parts of a Windows path that several floors ask for.
#pragma once

#include <cstddef>

#include "qxcore/platform/win32.h"

namespace platform {

// Whether a terminated name is "." or "..", which every folder has; of any character type.
template <class Character>
constexpr bool IsDotName(const Character* name) {
  return name[0] == '.' && (name[1] == 0 || (name[1] == '.' && name[2] == 0));
}

// Characters of "C:" or of "\\server" at the start; 0 where there is neither.
constexpr std::size_t DriveLength(SStringView path) {
  if (path.size() >= 2 && path[0] == '\\' && path[1] == '\\') {
    const std::size_t end = path.find(WCHAR('\\'), 2);
    return end == SStringView::npos ? path.size() : end;
  }
  return path.size() >= 2 && path[1] == ':' ? 2 : 0;
}

// Characters in front of the last part, which may hold wildcards: "C:\data\" of "C:\data\*.txt", "C:" of "C:*.txt".
constexpr std::size_t FolderLength(SStringView path) {
  const std::size_t last = path.find_last_of(WTEXT("\\/"));
  if (last != SStringView::npos) return last + 1;
  return path.size() >= 2 && path[1] == ':' ? 2 : 0;
}

}  // namespace platform
