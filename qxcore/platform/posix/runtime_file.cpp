// The C runtime's files with wide paths.

#include <sys/stat.h>

#include <cerrno>
#include <string>

#include "qxcore/platform/internal/error_number.h"
#include "qxcore/platform/posix/path.h"
#include "qxcore/platform/wide.h"

namespace platform {
namespace {

// The mode as the C library takes it: text and binary are one, inherited handles are asked for with "N" left out.
std::string ConvertMode(const WCHAR* mode) {
  std::string result;
  for (; *mode != 0 && *mode != ','; ++mode)
    if (*mode == 'r' || *mode == 'w' || *mode == 'a' || *mode == '+') result += static_cast<char>(*mode);
  return result + "e";
}

// The file, or null and why.
std::FILE* Open(const WCHAR* path, const WCHAR* mode, int& why) {
  const Resolved entry = ResolvePath(path);
  why = ErrnoOf(entry.error);
  if (entry.error != ERROR_SUCCESS) return nullptr;
  const std::string how = ConvertMode(mode);
  struct stat info;
  const bool there = stat(entry.path.c_str(), &info) == 0;
  const bool writes = how.find_first_of("wa+") != std::string::npos;
  why = EACCES;
  if (there && (S_ISDIR(info.st_mode) || (writes && S_ISREG(info.st_mode) && (info.st_mode & 0222) == 0)))
    return nullptr;
  why = ENOENT;
  if (entry.wantsFolder) return nullptr;
  std::FILE* file = std::fopen(entry.path.c_str(), how.c_str());
  why = errno;
  return file;
}

}  // namespace

std::FILE* WideFileOpen(const WCHAR* path, const WCHAR* mode) {
  int why = ENOMEM;
  std::FILE* file = Guarded<std::FILE*>(nullptr, [&] { return Open(path, mode, why); });
  if (file == nullptr) errno = why;
  return file;
}

WCHAR* WideFullPath(WCHAR* buffer, const WCHAR* path, std::size_t capacity) {
  const WCHAR* given = path != nullptr && *path != 0 ? path : u".";
  const DWORD length = GetFullPathNameW(given, static_cast<DWORD>(capacity), buffer, nullptr);
  return length > 0 && length < capacity ? buffer : nullptr;
}

int FileSeek(std::FILE* file, std::int64_t offset, int origin) { return fseeko(file, offset, origin); }

std::int64_t FileTell(std::FILE* file) { return ftello(file); }

}  // namespace platform
