// Open files: CreateFileW and what is done with its handle.

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <climits>
#include <new>

#include "qxcore/platform/posix/file_info.h"
#include "qxcore/platform/posix/handle.h"
#include "qxcore/platform/posix/share_mode.h"

namespace {

using namespace platform;

HANDLE OpenFails(DWORD error) {
  SetLastError(error);
  return INVALID_HANDLE_VALUE;
}

bool IsFolder(const char* path) {
  struct stat info;
  return stat(path, &info) == 0 && S_ISDIR(info.st_mode);
}

// Nobody may write: the read-only attribute, which holds for the superuser, too.
bool IsReadOnly(const char* path) {
  struct stat info;
  return stat(path, &info) == 0 && S_ISREG(info.st_mode) && (info.st_mode & 0222) == 0;
}

// What is wrong with opening this entry in this way, before it is tried.
DWORD CheckOpen(const Resolved& entry, DWORD access, DWORD disposition, DWORD flags) {
  if (disposition < CREATE_NEW || disposition > TRUNCATE_EXISTING) return ERROR_INVALID_PARAMETER;
  if (disposition == TRUNCATE_EXISTING && (access & GENERIC_WRITE) == 0) return ERROR_INVALID_PARAMETER;
  if (entry.error != ERROR_SUCCESS) return entry.error;
  const bool folder = entry.exists && IsFolder(entry.path.c_str());
  if (entry.wantsFolder && !folder) return entry.exists ? ERROR_PATH_NOT_FOUND : ERROR_INVALID_NAME;
  if (!entry.exists) return disposition == OPEN_EXISTING || disposition == TRUNCATE_EXISTING ? ERROR_FILE_NOT_FOUND : 0;
  if (disposition == CREATE_NEW) return ERROR_FILE_EXISTS;
  if (folder && ((flags & FILE_FLAG_BACKUP_SEMANTICS) == 0 || (access & GENERIC_WRITE) != 0))
    return ERROR_ACCESS_DENIED;
  const bool overwrites = disposition == CREATE_ALWAYS || disposition == TRUNCATE_EXISTING;
  if (((access & GENERIC_WRITE) != 0 || overwrites) && IsReadOnly(entry.path.c_str())) return ERROR_ACCESS_DENIED;
  return ERROR_SUCCESS;
}

// Opens the descriptor; -1 with errno.
int OpenDescriptor(const Resolved& entry, DWORD access, DWORD disposition, DWORD flags, bool inherit) {
  const bool creates = disposition != OPEN_EXISTING && disposition != TRUNCATE_EXISTING;
  const bool writes = (access & GENERIC_WRITE) != 0 || disposition == CREATE_ALWAYS;
  int mode = inherit ? 0 : O_CLOEXEC;
  if (creates) mode |= O_CREAT;
  if (disposition == CREATE_NEW) mode |= O_EXCL;
  if ((flags & FILE_FLAG_WRITE_THROUGH) != 0) mode |= O_SYNC;
  if (access == 0 && !writes && entry.exists) return open(entry.path.c_str(), mode | O_PATH);
  const mode_t permissions = (flags & FILE_ATTRIBUTE_READONLY) != 0 ? 0444 : 0666;
  // A writer needs the right to read, too, for the locks of the sharing mode; without it he goes unlocked.
  int descriptor = open(entry.path.c_str(), mode | (writes ? O_RDWR : O_RDONLY), permissions);
  if (descriptor < 0 && errno == EACCES && writes && (access & GENERIC_READ) == 0)
    descriptor = open(entry.path.c_str(), mode | O_WRONLY, permissions);
  return descriptor;
}

int RetriedOpen(const Resolved& entry, DWORD access, DWORD disposition, DWORD flags, bool inherit) {
  for (;;) {
    const int descriptor = OpenDescriptor(entry, access, disposition, flags, inherit);
    if (descriptor >= 0 || errno != EINTR) return descriptor;
  }
}

DWORD PathError(const Resolved& entry) {
  const int error = errno;
  // A folder on the way that went away meanwhile, or never was.
  if (error == ENOENT && access(entry.path.substr(0, entry.path.find_last_of('/') + 1).c_str(), F_OK) != 0)
    return ERROR_PATH_NOT_FOUND;
  return ErrorFromErrno(error);
}

HANDLE OpenFileAt(const Resolved& entry, DWORD access, DWORD share, DWORD disposition, DWORD flags, bool inherit) {
  const int descriptor = RetriedOpen(entry, access, disposition, flags, inherit);
  if (descriptor < 0) return OpenFails(PathError(entry));
  auto file =
      std::make_shared<OpenFile>(descriptor, (flags & FILE_FLAG_DELETE_ON_CLOSE) != 0 ? entry.path : std::string());
  if (access != 0 && !TakeShareMode(descriptor, access, share)) return OpenFails(ERROR_SHARING_VIOLATION);
  const bool truncates = entry.exists && (disposition == CREATE_ALWAYS || disposition == TRUNCATE_EXISTING);
  // What has no length, a terminal or a pipe, needs no truncation.
  if (truncates && ftruncate(descriptor, 0) != 0 && errno != EINVAL) return OpenFails(ErrorFromErrno(errno));
  const HANDLE handle = AddHandle(std::move(file), access);
  const bool tells = disposition == CREATE_ALWAYS || disposition == OPEN_ALWAYS;
  if (handle != INVALID_HANDLE_VALUE) SetLastError(tells && entry.exists ? ERROR_ALREADY_EXISTS : ERROR_SUCCESS);
  return handle;
}

}  // namespace

HANDLE CreateFileW(LPCWSTR path, DWORD access, DWORD share, SECURITY_ATTRIBUTES* security, DWORD disposition,
                   DWORD flags, HANDLE) {
  try {
    const Resolved entry = ResolvePath(path);
    const DWORD error = CheckOpen(entry, access, disposition, flags);
    if (error != ERROR_SUCCESS) return OpenFails(error);
    return OpenFileAt(entry, access, share, disposition, flags, security != nullptr && security->bInheritHandle);
  } catch (const std::bad_alloc&) {
    return OpenFails(ERROR_NOT_ENOUGH_MEMORY);
  }
}

BOOL CloseHandle(HANDLE handle) {
  const std::shared_ptr<HandleObject> object = RemoveHandle(handle);
  if (object == nullptr) return FailWith(ERROR_INVALID_HANDLE);
  if (object.use_count() > 1) return TRUE;  // a duplicate goes on
  const DWORD error = object->Close();
  return error == ERROR_SUCCESS ? TRUE : FailWith(error);
}

BOOL ReadFile(HANDLE handle, LPVOID buffer, DWORD count, LPDWORD done, OVERLAPPED* overlapped) {
  if (done != nullptr) *done = 0;
  if (done == nullptr || overlapped != nullptr) return FailWith(ERROR_INVALID_PARAMETER);
  const FileUse file = UseFile(handle, GENERIC_READ);
  if (file.descriptor < 0) return FALSE;
  while (*done < count) {
    const ssize_t got = read(file.descriptor, static_cast<char*>(buffer) + *done, count - *done);
    if (got == 0) break;
    if (got < 0) {
      if (errno == EINTR) continue;
      return FailWith(ErrorFromErrno(errno));
    }
    *done += static_cast<DWORD>(got);
  }
  return TRUE;
}

BOOL WriteFile(HANDLE handle, LPCVOID buffer, DWORD count, LPDWORD done, OVERLAPPED* overlapped) {
  if (done != nullptr) *done = 0;
  if (done == nullptr || overlapped != nullptr) return FailWith(ERROR_INVALID_PARAMETER);
  const FileUse file = UseFile(handle, GENERIC_WRITE);
  if (file.descriptor < 0) return FALSE;
  while (*done < count) {
    const ssize_t put = write(file.descriptor, static_cast<const char*>(buffer) + *done, count - *done);
    if (put < 0) {
      if (errno == EINTR) continue;
      return FailWith(ErrorFromErrno(errno));
    }
    *done += static_cast<DWORD>(put);
  }
  return TRUE;
}

BOOL SetFilePointerEx(HANDLE handle, LARGE_INTEGER distance, LARGE_INTEGER* position, DWORD method) {
  const FileUse file = UseFile(handle, 0);
  if (file.descriptor < 0) return FALSE;
  if (method > FILE_END) return FailWith(ERROR_INVALID_PARAMETER);
  const int whence = method == FILE_BEGIN ? SEEK_SET : method == FILE_CURRENT ? SEEK_CUR : SEEK_END;
  const off_t at = lseek(file.descriptor, distance.QuadPart, whence);
  if (at < 0) return FailWith(errno == EINVAL ? ERROR_NEGATIVE_SEEK : ErrorFromErrno(errno));
  if (position != nullptr) position->QuadPart = at;
  return TRUE;
}

DWORD SetFilePointer(HANDLE handle, LONG distance, LONG* distanceHigh, DWORD method) {
  LARGE_INTEGER wanted, position;
  wanted.QuadPart = distance;
  if (distanceHigh != nullptr)
    wanted.QuadPart = static_cast<LONGLONG>(static_cast<ULONGLONG>(static_cast<DWORD>(*distanceHigh)) << 32 |
                                            static_cast<DWORD>(distance));
  if (distanceHigh == nullptr) {
    // A result that the caller cannot be told must not come about.
    LARGE_INTEGER none, current;
    none.QuadPart = 0;
    if (!SetFilePointerEx(handle, none, &current, FILE_CURRENT)) return INVALID_SET_FILE_POINTER;
    if (!SetFilePointerEx(handle, wanted, &position, method)) return INVALID_SET_FILE_POINTER;
    if (position.QuadPart > 0xFFFFFFFF) {
      SetFilePointerEx(handle, current, nullptr, FILE_BEGIN);
      SetLastError(ERROR_INVALID_PARAMETER);
      return INVALID_SET_FILE_POINTER;
    }
  } else {
    if (!SetFilePointerEx(handle, wanted, &position, method)) return INVALID_SET_FILE_POINTER;
    *distanceHigh = static_cast<LONG>(position.QuadPart >> 32);
  }
  const DWORD low = static_cast<DWORD>(position.QuadPart);
  if (low == INVALID_SET_FILE_POINTER) SetLastError(NO_ERROR);
  return low;
}

BOOL SetEndOfFile(HANDLE handle) {
  const FileUse file = UseFile(handle, GENERIC_WRITE);
  if (file.descriptor < 0) return FALSE;
  const off_t at = lseek(file.descriptor, 0, SEEK_CUR);
  if (at < 0 || ftruncate(file.descriptor, at) != 0) return FailWith(ErrorFromErrno(errno));
  return TRUE;
}

BOOL FlushFileBuffers(HANDLE handle) {
  const FileUse file = UseFile(handle, GENERIC_WRITE);
  if (file.descriptor < 0) return FALSE;
  // Devices and pipes have nothing to flush.
  return fsync(file.descriptor) == 0 || errno == EINVAL || errno == EROFS ? TRUE : FailWith(ErrorFromErrno(errno));
}

BOOL GetFileSizeEx(HANDLE handle, LARGE_INTEGER* size) {
  const FileUse file = UseFile(handle, 0);
  if (file.descriptor < 0) return FALSE;
  struct stat info;
  if (fstat(file.descriptor, &info) != 0) return FailWith(ErrorFromErrno(errno));
  size->QuadPart = info.st_size;
  return TRUE;
}

DWORD GetFileSize(HANDLE handle, LPDWORD high) {
  LARGE_INTEGER size;
  if (!GetFileSizeEx(handle, &size)) return INVALID_FILE_SIZE;
  if (high != nullptr) *high = static_cast<DWORD>(size.QuadPart >> 32);
  const DWORD low = static_cast<DWORD>(size.QuadPart);
  if (low == INVALID_FILE_SIZE) SetLastError(NO_ERROR);
  return low;
}

BOOL GetFileTime(HANDLE handle, FILETIME* creation, FILETIME* access, FILETIME* write) {
  const FileUse file = UseFile(handle, 0);
  if (file.descriptor < 0) return FALSE;
  FileTimes times;
  if (!GetTimes(file.descriptor, "", AT_EMPTY_PATH, times)) return FailWith(ErrorFromErrno(errno));
  if (creation != nullptr) *creation = times.creation;
  if (access != nullptr) *access = times.access;
  if (write != nullptr) *write = times.write;
  return TRUE;
}

HANDLE GetCurrentProcess() { return reinterpret_cast<HANDLE>(static_cast<std::intptr_t>(-1)); }

BOOL DuplicateHandle(HANDLE sourceProcess, HANDLE source, HANDLE targetProcess, HANDLE* target, DWORD access, BOOL,
                     DWORD options) {
  if (sourceProcess != GetCurrentProcess() || targetProcess != GetCurrentProcess() || target == nullptr)
    return FailWith(ERROR_INVALID_HANDLE);
  HandleUse use = UseHandle(source);
  if (use.object == nullptr) return FailWith(ERROR_INVALID_HANDLE);
  const DWORD rights = (options & DUPLICATE_SAME_ACCESS) != 0 ? use.access : access & use.access;
  *target = AddHandle(std::move(use.object), rights);
  if (*target == INVALID_HANDLE_VALUE) {
    *target = nullptr;
    return FALSE;
  }
  if ((options & DUPLICATE_CLOSE_SOURCE) != 0) RemoveHandle(source);
  return TRUE;
}
