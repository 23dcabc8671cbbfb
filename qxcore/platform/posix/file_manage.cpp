// Moving, copying and deleting files; making and removing folders.

#include <fcntl.h>
#include <stdio.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>
#include <memory>
#include <new>

#include "qxcore/platform/posix/path.h"
#include "qxcore/platform/posix/share_mode.h"

namespace {

using namespace platform;

bool IsReadOnlyFile(const Resolved& entry) { return S_ISREG(entry.info.st_mode) && (entry.info.st_mode & 0222) == 0; }

bool SameEntry(const Resolved& a, const Resolved& b) {
  return a.exists && b.exists && a.info.st_dev == b.info.st_dev && a.info.st_ino == b.info.st_ino && a.path == b.path;
}

// Runs a call that allocates.
template <class Call>
BOOL Guarded(Call call) {
  try {
    const DWORD error = call();
    return error == ERROR_SUCCESS ? TRUE : FailWith(error);
  } catch (const std::bad_alloc&) {
    return FailWith(ERROR_NOT_ENOUGH_MEMORY);
  }
}

DWORD LastErrno() { return ErrorFromErrno(errno); }

// Of an entry that must be there.
DWORD Missing(const Resolved& entry) {
  return entry.error != ERROR_SUCCESS ? entry.error : entry.exists ? ERROR_SUCCESS : ERROR_FILE_NOT_FOUND;
}

class Handle {
 public:
  explicit Handle(HANDLE handle) : m_handle(handle) {}
  Handle(const Handle&) = delete;
  Handle& operator=(const Handle&) = delete;
  ~Handle() { Close(); }
  HANDLE Get() const { return m_handle; }
  bool IsOpen() const { return m_handle != INVALID_HANDLE_VALUE; }
  bool Close() {
    if (!IsOpen()) return true;
    const bool closed = CloseHandle(m_handle);
    m_handle = INVALID_HANDLE_VALUE;
    return closed;
  }

 private:
  HANDLE m_handle;
};

DWORD CopyContent(HANDLE from, HANDLE to) {
  constexpr DWORD kBlock = 1 << 18;
  const auto buffer = std::make_unique<char[]>(kBlock);
  for (;;) {
    DWORD count = 0, written = 0;
    if (!ReadFile(from, buffer.get(), kBlock, &count, nullptr)) return GetLastError();
    if (count == 0) return ERROR_SUCCESS;
    if (!WriteFile(to, buffer.get(), count, &written, nullptr)) return GetLastError();
  }
}

// Attributes and the time of the last write go along, as on Windows.
void CopyProperties(const char* from, const char* to) {
  struct stat info;
  if (stat(from, &info) != 0) return;
  const timespec times[2] = {{0, UTIME_OMIT}, info.st_mtim};
  utimensat(AT_FDCWD, to, times, 0);
  chmod(to, info.st_mode & 0777);
}

DWORD Copy(LPCWSTR from, LPCWSTR to, bool failIfExists) {
  const Resolved source = ResolvePath(from), target = ResolvePath(to);
  if (const DWORD error = Missing(source)) return error;
  if (target.error != ERROR_SUCCESS) return target.error;
  if (target.exists && failIfExists) return ERROR_FILE_EXISTS;
  if (SameEntry(source, target)) return ERROR_SHARING_VIOLATION;
  Handle reader(CreateFileW(from, GENERIC_READ, FILE_SHARE_READ | FILE_SHARE_WRITE | FILE_SHARE_DELETE, nullptr,
                            OPEN_EXISTING, 0, nullptr));
  if (!reader.IsOpen()) return GetLastError();
  Handle writer(CreateFileW(to, GENERIC_WRITE, 0, nullptr, failIfExists ? CREATE_NEW : CREATE_ALWAYS, 0, nullptr));
  if (!writer.IsOpen()) return GetLastError();
  DWORD error = CopyContent(reader.Get(), writer.Get());
  if (!writer.Close() && error == ERROR_SUCCESS) error = GetLastError();
  if (error != ERROR_SUCCESS) {
    // Half a copy is none.
    unlink(target.path.c_str());
    return error;
  }
  CopyProperties(source.path.c_str(), target.path.c_str());
  return ERROR_SUCCESS;
}

DWORD CheckReplace(const Resolved& target) {
  if (S_ISDIR(target.info.st_mode) || IsReadOnlyFile(target)) return ERROR_ACCESS_DENIED;
  return IsDeleteDenied(target.path.c_str()) ? ERROR_SHARING_VIOLATION : ERROR_SUCCESS;
}

DWORD Move(LPCWSTR from, LPCWSTR to, DWORD flags) {
  const Resolved source = ResolvePath(from), target = ResolvePath(to);
  if (const DWORD error = Missing(source)) return error;
  if (target.error != ERROR_SUCCESS) return target.error;
  // The same entry: only its spelling changes.
  if (SameEntry(source, target)) {
    const std::string spelled = SpelledAsGiven(target, to);
    return rename(source.path.c_str(), spelled.c_str()) == 0 ? ERROR_SUCCESS : LastErrno();
  }
  const bool replaces = (flags & MOVEFILE_REPLACE_EXISTING) != 0;
  if (target.exists && !replaces) return ERROR_ALREADY_EXISTS;
  if (target.exists) {
    if (const DWORD error = CheckReplace(target)) return error;
  }
  if (IsDeleteDenied(source.path.c_str())) return ERROR_SHARING_VIOLATION;
  if (renameat2(AT_FDCWD, source.path.c_str(), AT_FDCWD, target.path.c_str(), replaces ? 0 : RENAME_NOREPLACE) == 0)
    return ERROR_SUCCESS;
  if (errno == EINVAL && !replaces && !S_ISDIR(source.info.st_mode)) {
    // A file system that knows no such promise: a link of the new name makes it.
    if (link(source.path.c_str(), target.path.c_str()) == 0)
      return unlink(source.path.c_str()) == 0 ? ERROR_SUCCESS : LastErrno();
  }
  if (errno == EEXIST) return ERROR_ALREADY_EXISTS;
  if (errno == EINVAL) return ERROR_ACCESS_DENIED;  // a folder into itself
  if (errno != EXDEV || S_ISDIR(source.info.st_mode) || (flags & MOVEFILE_COPY_ALLOWED) == 0) return LastErrno();
  if (const DWORD error = Copy(from, to, !replaces)) return error;
  return unlink(source.path.c_str()) == 0 ? ERROR_SUCCESS : LastErrno();
}

}  // namespace

BOOL CopyFileW(LPCWSTR from, LPCWSTR to, BOOL failIfExists) {
  return Guarded([&] { return Copy(from, to, failIfExists != FALSE); });
}

BOOL MoveFileExW(LPCWSTR from, LPCWSTR to, DWORD flags) {
  if (to == nullptr || (flags & ~(MOVEFILE_REPLACE_EXISTING | MOVEFILE_COPY_ALLOWED | MOVEFILE_WRITE_THROUGH)) != 0)
    return FailWith(ERROR_INVALID_PARAMETER);
  return Guarded([&] { return Move(from, to, flags); });
}

BOOL MoveFileW(LPCWSTR from, LPCWSTR to) { return MoveFileExW(from, to, MOVEFILE_COPY_ALLOWED); }

BOOL DeleteFileW(LPCWSTR path) {
  return Guarded([&]() -> DWORD {
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
  return Guarded([&]() -> DWORD {
    const Resolved entry = ResolvePath(path);
    if (entry.error != ERROR_SUCCESS) return entry.error;
    if (entry.exists) return ERROR_ALREADY_EXISTS;
    if (mkdir(entry.path.c_str(), 0777) == 0) return ERROR_SUCCESS;
    return errno == EEXIST ? ERROR_ALREADY_EXISTS : errno == ENOENT ? ERROR_PATH_NOT_FOUND : LastErrno();
  });
}

BOOL RemoveDirectoryW(LPCWSTR path) {
  return Guarded([&]() -> DWORD {
    const Resolved entry = ResolvePath(path);
    if (const DWORD error = Missing(entry)) return error;
    struct stat info;
    if (stat(entry.path.c_str(), &info) != 0 || !S_ISDIR(info.st_mode)) return ERROR_DIRECTORY;
    if (S_ISLNK(entry.info.st_mode)) return unlink(entry.path.c_str()) == 0 ? ERROR_SUCCESS : LastErrno();
    struct stat current;
    if (stat(".", &current) == 0 && current.st_dev == info.st_dev && current.st_ino == info.st_ino)
      return ERROR_SHARING_VIOLATION;
    return rmdir(entry.path.c_str()) == 0 ? ERROR_SUCCESS : LastErrno();
  });
}
