// Moving, copying and deleting files; making and removing folders.

#include <fcntl.h>
#include <stdio.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>

#include "qxcore/platform/posix/file_copy.h"
#include "qxcore/platform/posix/share_mode.h"

namespace {

using namespace platform;

bool IsReadOnlyFile(const Resolved& entry) { return S_ISREG(entry.info.st_mode) && (entry.info.st_mode & 0222) == 0; }

bool SameEntry(const Resolved& a, const Resolved& b) {
  return a.exists && b.exists && a.info.st_dev == b.info.st_dev && a.info.st_ino == b.info.st_ino && a.path == b.path;
}

DWORD LastErrno() { return ErrorFromErrno(errno); }

// The error for an entry that must be there; a file has no backslash at the end of its name.
DWORD Missing(const Resolved& entry) {
  if (entry.error != ERROR_SUCCESS) return entry.error;
  if (!entry.exists) return ERROR_FILE_NOT_FOUND;
  struct stat info;
  const bool isFile = entry.wantsFolder && stat(entry.path.c_str(), &info) == 0 && !S_ISDIR(info.st_mode);
  return isFile ? ERROR_INVALID_NAME : ERROR_SUCCESS;
}

// What stands in the way of another file's taking the place of this one.
DWORD CheckReplace(const Resolved& target) {
  if (S_ISDIR(target.info.st_mode) || IsReadOnlyFile(target)) return ERROR_ACCESS_DENIED;
  return IsHeldOpen(target.path.c_str()) ? ERROR_ACCESS_DENIED : ERROR_SUCCESS;
}

// Sets the entry's new name in one step, without replacing another one unless it may. ERROR_NOT_SAME_DEVICE when
// the two are on different file systems.
DWORD Rename(const Resolved& source, const std::string& target, bool replaces) {
  if (renameat2(AT_FDCWD, source.path.c_str(), AT_FDCWD, target.c_str(), replaces ? 0 : RENAME_NOREPLACE) == 0)
    return ERROR_SUCCESS;
  if (errno == EINVAL && !replaces && !S_ISDIR(source.info.st_mode)) {
    // A file system that knows no such promise: a link of the new name makes it.
    if (link(source.path.c_str(), target.c_str()) == 0)
      return unlink(source.path.c_str()) == 0 ? ERROR_SUCCESS : LastErrno();
  }
  if (errno == EEXIST) return ERROR_ALREADY_EXISTS;
  if (errno == EINVAL) return ERROR_ACCESS_DENIED;  // a folder into itself
  return LastErrno();
}

DWORD Respell(const Resolved& entry, LPCWSTR to) {
  const std::string spelled = SpelledAsGiven(entry, to);
  return rename(entry.path.c_str(), spelled.c_str()) == 0 ? ERROR_SUCCESS : LastErrno();
}

DWORD Move(LPCWSTR from, LPCWSTR to, DWORD flags) {
  const Resolved source = ResolvePath(from), target = ResolvePath(to);
  if (const DWORD error = Missing(source)) return error;
  if (target.error != ERROR_SUCCESS) return target.error;
  // The same entry: only its spelling changes.
  if (SameEntry(source, target)) return Respell(target, to);
  const bool replaces = (flags & MOVEFILE_REPLACE_EXISTING) != 0;
  if (target.exists && !replaces) return ERROR_ALREADY_EXISTS;
  if (target.exists) {
    if (const DWORD error = CheckReplace(target)) return error;
  }
  if (IsDeleteDenied(source.path.c_str())) return ERROR_SHARING_VIOLATION;
  DWORD error = Rename(source, target.path, replaces);
  if (error == ERROR_NOT_SAME_DEVICE && (flags & MOVEFILE_COPY_ALLOWED) != 0)
    error = MoveByCopy(source, target.path, replaces);
  // A replaced name is found whatever its case; the new file has the spelling that was asked for.
  return error == ERROR_SUCCESS && target.exists ? Respell(target, to) : error;
}

DWORD Copy(LPCWSTR from, LPCWSTR to, bool failIfExists) {
  const Resolved source = ResolvePath(from);
  if (const DWORD error = Missing(source)) return error;
  return CopyFileTo(source, to, failIfExists);
}

}  // namespace

BOOL CopyFileW(LPCWSTR from, LPCWSTR to, BOOL failIfExists) {
  if (from == nullptr || to == nullptr) return FailWith(ERROR_INVALID_PARAMETER);
  return Succeeds([&] { return Copy(from, to, failIfExists != FALSE); });
}

BOOL MoveFileExW(LPCWSTR from, LPCWSTR to, DWORD flags) {
  if (to == nullptr || (flags & ~(MOVEFILE_REPLACE_EXISTING | MOVEFILE_COPY_ALLOWED | MOVEFILE_WRITE_THROUGH)) != 0)
    return FailWith(ERROR_INVALID_PARAMETER);
  return Succeeds([&] { return Move(from, to, flags); });
}

BOOL MoveFileW(LPCWSTR from, LPCWSTR to) { return MoveFileExW(from, to, MOVEFILE_COPY_ALLOWED); }

BOOL DeleteFileW(LPCWSTR path) {
  return Succeeds([&]() -> DWORD {
    const Resolved entry = ResolvePath(path);
    if (const DWORD error = Missing(entry)) return error;
    if (S_ISDIR(entry.info.st_mode) || IsReadOnlyFile(entry)) return ERROR_ACCESS_DENIED;
    struct stat target;
    // A link to a folder is a folder.
    if (S_ISLNK(entry.info.st_mode) && stat(entry.path.c_str(), &target) == 0 && S_ISDIR(target.st_mode))
      return ERROR_ACCESS_DENIED;
    if (IsDeleteDenied(entry.path.c_str())) return ERROR_SHARING_VIOLATION;
    return unlink(entry.path.c_str()) == 0 ? ERROR_SUCCESS : LastErrno();
  });
}

BOOL CreateDirectoryW(LPCWSTR path, SECURITY_ATTRIBUTES*) {
  return Succeeds([&]() -> DWORD {
    const Resolved entry = ResolvePath(path);
    if (entry.error != ERROR_SUCCESS) return entry.error;
    if (entry.exists) return ERROR_ALREADY_EXISTS;
    if (mkdir(entry.path.c_str(), 0777) == 0) return ERROR_SUCCESS;
    return errno == EEXIST ? ERROR_ALREADY_EXISTS : errno == ENOENT ? ERROR_PATH_NOT_FOUND : LastErrno();
  });
}

BOOL RemoveDirectoryW(LPCWSTR path) {
  return Succeeds([&]() -> DWORD {
    const Resolved entry = ResolvePath(path);
    if (const DWORD error = Missing(entry)) return error;
    struct stat info;
    if (stat(entry.path.c_str(), &info) != 0 || !S_ISDIR(info.st_mode)) return ERROR_DIRECTORY;
    if (S_ISLNK(entry.info.st_mode)) return unlink(entry.path.c_str()) == 0 ? ERROR_SUCCESS : LastErrno();
    struct stat current;
    if (stat(".", &current) == 0 && current.st_dev == info.st_dev && current.st_ino == info.st_ino)
      return ERROR_SHARING_VIOLATION;
    if (entry.path == "/") return ERROR_DIR_NOT_EMPTY;
    return rmdir(entry.path.c_str()) == 0 ? ERROR_SUCCESS : LastErrno();
  });
}
