// What is done with the handle of an open file.

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>

#include "qxcore/platform/posix/file_info.h"
#include "qxcore/platform/posix/handle.h"

using namespace platform;

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
      return FailWith(errno == EFAULT ? ERROR_INVALID_USER_BUFFER : ErrorFromErrno(errno));
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
