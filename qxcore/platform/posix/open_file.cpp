// Opening files: CreateFileW.

#include "qxcore/platform/posix/open_file.h"

#include <fcntl.h>
#include <unistd.h>

#include <cerrno>

#include "qxcore/platform/posix/handle.h"
#include "qxcore/platform/posix/share_mode.h"

namespace platform {
namespace {

bool IsFolder(const char* path) {
  struct stat info;
  return stat(path, &info) == 0 && S_ISDIR(info.st_mode);
}

// Nobody may write: the read-only attribute, which holds for the superuser, too.
bool IsReadOnly(const char* path) {
  struct stat info;
  return stat(path, &info) == 0 && S_ISREG(info.st_mode) && (info.st_mode & 0222) == 0;
}

bool Creates(DWORD disposition) { return disposition != OPEN_EXISTING && disposition != TRUNCATE_EXISTING; }

// What is wrong with opening an entry that is there.
DWORD CheckExisting(const Resolved& entry, const OpenRequest& request) {
  const bool isFolder = IsFolder(entry.path.c_str());
  if (entry.wantsFolder && !isFolder) return ERROR_INVALID_NAME;
  if (request.disposition == CREATE_NEW) return ERROR_FILE_EXISTS;
  const bool writes = (request.access & GENERIC_WRITE) != 0;
  if (isFolder && ((request.flags & FILE_FLAG_BACKUP_SEMANTICS) == 0 || writes)) return ERROR_ACCESS_DENIED;
  const bool changes = writes || request.disposition == CREATE_ALWAYS || request.disposition == TRUNCATE_EXISTING ||
                       (request.flags & FILE_FLAG_DELETE_ON_CLOSE) != 0;
  return changes && IsReadOnly(entry.path.c_str()) ? ERROR_ACCESS_DENIED : ERROR_SUCCESS;
}

// What is wrong with opening this entry in this way, before it is tried.
DWORD CheckOpen(const Resolved& entry, const OpenRequest& request) {
  if (request.disposition < CREATE_NEW || request.disposition > TRUNCATE_EXISTING) return ERROR_INVALID_PARAMETER;
  if (request.disposition == TRUNCATE_EXISTING && (request.access & GENERIC_WRITE) == 0) return ERROR_INVALID_PARAMETER;
  if (entry.error != ERROR_SUCCESS) return entry.error;
  if (entry.exists) return CheckExisting(entry, request);
  if (!Creates(request.disposition)) return ERROR_FILE_NOT_FOUND;
  if (entry.wantsFolder) return ERROR_INVALID_NAME;
  // What can never be deleted cannot be deleted at the end, either.
  const bool isDoomed = (request.flags & FILE_FLAG_DELETE_ON_CLOSE) != 0;
  return isDoomed && (request.flags & FILE_ATTRIBUTE_READONLY) != 0 ? ERROR_ACCESS_DENIED : ERROR_SUCCESS;
}

// Opens the descriptor; -1 with errno.
int OpenOnce(const Resolved& entry, const OpenRequest& request) {
  const bool writes = (request.access & GENERIC_WRITE) != 0 || request.disposition == CREATE_ALWAYS;
  int mode = request.isInherited ? 0 : O_CLOEXEC;
  if (Creates(request.disposition)) mode |= O_CREAT;
  if (request.disposition == CREATE_NEW) mode |= O_EXCL;
  if ((request.flags & FILE_FLAG_WRITE_THROUGH) != 0) mode |= O_SYNC;
  if (request.access == 0 && !writes && entry.exists) return open(entry.path.c_str(), mode | O_PATH);
  const mode_t rights = (request.flags & FILE_ATTRIBUTE_READONLY) != 0 ? request.rights & 0555 : request.rights;
  // A writer needs the right to read, too, for the locks of the sharing mode; without it he goes unlocked.
  int descriptor = open(entry.path.c_str(), mode | (writes ? O_RDWR : O_RDONLY), rights);
  if (descriptor < 0 && errno == EACCES && writes && (request.access & GENERIC_READ) == 0)
    descriptor = open(entry.path.c_str(), mode | O_WRONLY, rights);
  return descriptor;
}

int OpenDescriptor(const Resolved& entry, const OpenRequest& request) {
  for (;;) {
    const int descriptor = OpenOnce(entry, request);
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

}  // namespace

HANDLE OpenFileAt(const Resolved& entry, const OpenRequest& request) {
  const auto fails = [](DWORD error) { return FailWith(error, INVALID_HANDLE_VALUE); };
  if (const DWORD error = CheckOpen(entry, request)) return fails(error);
  const int descriptor = OpenDescriptor(entry, request);
  if (descriptor < 0) return fails(PathError(entry));
  const bool isDoomed = (request.flags & FILE_FLAG_DELETE_ON_CLOSE) != 0;
  auto file = std::make_shared<OpenFile>(descriptor, isDoomed ? entry.path : std::string());
  if (request.access != 0 && !TakeShareMode(descriptor, request.access, request.share))
    return fails(ERROR_SHARING_VIOLATION);
  const bool truncates =
      entry.exists && (request.disposition == CREATE_ALWAYS || request.disposition == TRUNCATE_EXISTING);
  // What has no length, a terminal or a pipe, needs no truncation.
  if (truncates && ftruncate(descriptor, 0) != 0 && errno != EINVAL) return fails(ErrorFromErrno(errno));
  const HANDLE handle = AddHandle(std::move(file), request.access);
  const bool saysExists = request.disposition == CREATE_ALWAYS || request.disposition == OPEN_ALWAYS;
  if (handle != INVALID_HANDLE_VALUE) SetLastError(saysExists && entry.exists ? ERROR_ALREADY_EXISTS : ERROR_SUCCESS);
  return handle;
}

}  // namespace platform

HANDLE CreateFileW(LPCWSTR path, DWORD access, DWORD share, SECURITY_ATTRIBUTES* security, DWORD disposition,
                   DWORD flags, HANDLE) {
  using namespace platform;
  return Guarded(INVALID_HANDLE_VALUE, [&] {
    const bool isInherited = security != nullptr && security->bInheritHandle;
    return OpenFileAt(ResolvePath(path), {access, share, disposition, flags, isInherited});
  });
}
