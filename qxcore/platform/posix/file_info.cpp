#include "qxcore/platform/posix/file_info.h"

#include <fcntl.h>

#include <algorithm>
#include <cerrno>

#include "qxcore/platform/posix/path.h"

namespace platform {
namespace {

constexpr std::int64_t kSecondsTo1970 = 11644473600;  // from 1601

using Ticks = ULONGLONG;  // of 100 nanoseconds

Ticks ToTicks(std::int64_t seconds, std::uint32_t nanoseconds) {
  if (seconds < -kSecondsTo1970) return 0;
  return static_cast<Ticks>(seconds + kSecondsTo1970) * 10'000'000 + nanoseconds / 100;
}

Ticks ToTicks(const struct statx_timestamp& time) { return ToTicks(time.tv_sec, time.tv_nsec); }

FILETIME ToFileTime(Ticks ticks) { return {static_cast<DWORD>(ticks), static_cast<DWORD>(ticks >> 32)}; }

FileTimes TimesOf(const struct statx& data) {
  const Ticks access = ToTicks(data.stx_atime), write = ToTicks(data.stx_mtime);
  // Some images of file systems hold zeros for it.
  const bool hasCreation = (data.stx_mask & STATX_BTIME) != 0 && data.stx_btime.tv_sec != 0;
  const Ticks creation = hasCreation ? ToTicks(data.stx_btime) : std::min({access, write, ToTicks(data.stx_ctime)});
  return {ToFileTime(creation), ToFileTime(access), ToFileTime(write)};
}

DWORD AttributesOf(const struct statx& data) {
  if (S_ISDIR(data.stx_mode)) return FILE_ATTRIBUTE_DIRECTORY;
  if (!S_ISREG(data.stx_mode)) return FILE_ATTRIBUTE_DEVICE;
  return FILE_ATTRIBUTE_ARCHIVE | ((data.stx_mode & 0222) == 0 ? FILE_ATTRIBUTE_READONLY : 0);
}

constexpr unsigned kWanted = STATX_BASIC_STATS | STATX_BTIME;

}  // namespace

bool GetTimes(int folder, const char* name, int flags, FileTimes& times) {
  struct statx data;
  if (statx(folder, name, flags, kWanted, &data) != 0) return false;
  times = TimesOf(data);
  return true;
}

bool GetEntryInfo(int folder, const char* name, EntryInfo& info) {
  struct statx data;
  if (statx(folder, name, AT_SYMLINK_NOFOLLOW | AT_NO_AUTOMOUNT, kWanted, &data) != 0) return false;
  info.times = TimesOf(data);
  if (S_ISLNK(data.stx_mode)) {
    struct statx target;
    const bool leads = statx(folder, name, AT_NO_AUTOMOUNT, kWanted, &target) == 0;
    info.attributes = FILE_ATTRIBUTE_REPARSE_POINT | (leads ? AttributesOf(target) : FILE_ATTRIBUTE_ARCHIVE);
    info.size = leads && S_ISREG(target.stx_mode) ? target.stx_size : 0;
    return true;
  }
  info.attributes = AttributesOf(data);
  info.size = S_ISREG(data.stx_mode) ? data.stx_size : 0;
  return true;
}

}  // namespace platform

BOOL GetFileAttributesExW(LPCWSTR path, GET_FILEEX_INFO_LEVELS level, LPVOID data) {
  using namespace platform;
  if (level != GetFileExInfoStandard || data == nullptr) return FailWith(ERROR_INVALID_PARAMETER);
  return Succeeds([&]() -> DWORD {
    const Resolved entry = ResolvePath(path);
    if (entry.error != ERROR_SUCCESS) return entry.error;
    if (!entry.exists) return ERROR_FILE_NOT_FOUND;
    EntryInfo info;
    if (!GetEntryInfo(AT_FDCWD, entry.path.c_str(), info)) return ErrorFromErrno(errno);
    if (entry.wantsFolder && (info.attributes & FILE_ATTRIBUTE_DIRECTORY) == 0) return ERROR_INVALID_NAME;
    *static_cast<WIN32_FILE_ATTRIBUTE_DATA*>(data) = {info.attributes,
                                                      info.times.creation,
                                                      info.times.access,
                                                      info.times.write,
                                                      static_cast<DWORD>(info.size >> 32),
                                                      static_cast<DWORD>(info.size)};
    return ERROR_SUCCESS;
  });
}

DWORD GetFileAttributesW(LPCWSTR path) {
  WIN32_FILE_ATTRIBUTE_DATA data;
  return GetFileAttributesExW(path, GetFileExInfoStandard, &data) ? data.dwFileAttributes : INVALID_FILE_ATTRIBUTES;
}

// Read-only takes the right to write away from all; without it the owner gets it back. Folders stay as they
// are: there the attribute means nothing on Windows either.
BOOL SetFileAttributesW(LPCWSTR path, DWORD attributes) {
  using namespace platform;
  return Succeeds([&]() -> DWORD {
    const Resolved entry = ResolvePath(path);
    if (entry.error != ERROR_SUCCESS) return entry.error;
    struct stat info;
    if (!entry.exists || stat(entry.path.c_str(), &info) != 0) return ERROR_FILE_NOT_FOUND;
    if (entry.wantsFolder && !S_ISDIR(info.st_mode)) return ERROR_INVALID_NAME;
    if (!S_ISREG(info.st_mode)) return ERROR_SUCCESS;
    const bool readOnly = (info.st_mode & 0222) == 0, wanted = (attributes & FILE_ATTRIBUTE_READONLY) != 0;
    if (readOnly == wanted) return ERROR_SUCCESS;
    const mode_t mode = wanted ? info.st_mode & 07555 : (info.st_mode & 07777) | 0200;
    return chmod(entry.path.c_str(), mode) == 0 ? ERROR_SUCCESS : ErrorFromErrno(errno);
  });
}
