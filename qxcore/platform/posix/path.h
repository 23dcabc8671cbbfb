// From Windows paths to those of the file system, and back.
//
// "C:\" stands for "/"; both slashes separate; "." and ".." are taken out by the text alone, before
// links are followed, as on Windows. Where the exact spelling does not exist, each part is looked up
// without regard to case (bmp.h), the first entry that fits being taken.
#pragma once

#include <sys/stat.h>

#include <string>
#include <string_view>

#include "qxcore/platform/posix/failure.h"
#include "qxcore/platform/posix/file_name.h"

namespace platform {

constexpr bool IsSeparator(char16_t c) { return c == '\\' || c == '/'; }

// A whole absolute path of the file system as a Windows path, without a trailing backslash but for the root.
std::u16string ToWindowsPath(std::string_view path);

// The absolute form of a path: drive or server, no "." and "..", backslashes. Empty for an empty path,
// and for one that leans on a current directory that is gone.
std::u16string MakeFullPath(std::u16string_view path);

// That form, without a copy when the path has it already.
class FullPath {
 public:
  explicit FullPath(std::u16string_view path);
  FullPath(const FullPath&) = delete;
  FullPath& operator=(const FullPath&) = delete;
  std::u16string_view View() const { return m_view; }

 private:
  std::u16string m_made;
  std::u16string_view m_view;
};

// The path of the file system for a full path in its exact spelling, without a trailing slash but for the
// root. ERROR_SUCCESS, or why there can be none; ERROR_PATH_NOT_FOUND for an empty one.
DWORD SpellExactly(std::u16string_view full, std::string& exact);

struct Resolved {
  std::string path;             // of the file system; the last part need not exist
  DWORD error = ERROR_SUCCESS;  // why there is none
  bool exists = false;
  bool wantsFolder = false;  // the given path ended in a separator
  struct stat info {};       // of the entry itself (links are not followed), when it exists
};
Resolved ResolvePath(LPCWSTR path);

// The same folder as `resolved`, but the last name exactly as the caller spelled it.
std::string SpelledAsGiven(const Resolved& resolved, LPCWSTR path);

// Whether the path, links followed, leads to this open file, and not to nothing or to another one.
bool IsNameOf(const char* path, int descriptor);

// The Win32 error for an errno value.
DWORD ErrorFromErrno(int error);

}  // namespace platform
