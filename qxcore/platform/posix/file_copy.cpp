#include "qxcore/platform/posix/file_copy.h"

#include <fcntl.h>
#include <stdio.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>
#include <climits>

#include "qxcore/platform/posix/descriptor.h"
#include "qxcore/platform/posix/handle.h"
#include "qxcore/platform/posix/open_file.h"

namespace platform {
namespace {

constexpr mode_t kRights = 0777;

// A handle of the portable layer and the descriptor behind it.
class OpenedFile {
 public:
  OpenedFile() = default;
  OpenedFile(const OpenedFile&) = delete;
  OpenedFile& operator=(const OpenedFile&) = delete;
  ~OpenedFile() {
    if (m_handle != INVALID_HANDLE_VALUE) CloseHandle(m_handle);
  }
  // ERROR_SUCCESS, or the error.
  DWORD Open(const Resolved& entry, const OpenRequest& request) {
    m_handle = OpenFileAt(entry, request);
    if (m_handle == INVALID_HANDLE_VALUE) return GetLastError();
    const int descriptor = Descriptor();
    return fstat(descriptor, &m_info) == 0 ? ERROR_SUCCESS : ErrorFromErrno(errno);
  }
  // False when the system reports only now that something was not written.
  bool Close() {
    return m_handle == INVALID_HANDLE_VALUE || CloseHandle(std::exchange(m_handle, INVALID_HANDLE_VALUE));
  }
  int Descriptor() const { return UseFile(m_handle, 0).descriptor; }
  const struct stat& Info() const { return m_info; }
  bool IsSameAs(const OpenedFile& other) const {
    return m_info.st_dev == other.m_info.st_dev && m_info.st_ino == other.m_info.st_ino;
  }

 private:
  HANDLE m_handle = INVALID_HANDLE_VALUE;
  struct stat m_info {};
};

// Alone if possible; where others hold the target and share writing, among them.
DWORD OpenTarget(const Resolved& entry, OpenRequest request, OpenedFile& target) {
  const DWORD error = target.Open(entry, request);
  if (error != ERROR_SHARING_VIOLATION) return error;
  request.share = FILE_SHARE_READ | FILE_SHARE_WRITE;
  return target.Open(entry, request);
}

// The target, empty and with its rights. A name that was free must still be so: what somebody else puts there
// meanwhile is looked at like any other file.
DWORD PrepareTarget(LPCWSTR path, const OpenedFile& source, bool failIfExists, OpenedFile& target) {
  Resolved entry = ResolvePath(path);
  if (entry.error != ERROR_SUCCESS) return entry.error;
  if (!entry.exists) {
    const mode_t rights = source.Info().st_mode & kRights;
    const DWORD error = OpenTarget(entry, {GENERIC_WRITE, 0, CREATE_NEW, 0, false, rights}, target);
    if (error != ERROR_FILE_EXISTS || failIfExists) return error;
    entry = ResolvePath(path);
  }
  if (failIfExists) return ERROR_FILE_EXISTS;
  if (const DWORD error = OpenTarget(entry, {GENERIC_WRITE, 0, OPEN_ALWAYS, 0, false, 0600}, target)) return error;
  // The same file under two names would be emptied before it is read.
  if (target.IsSameAs(source)) return ERROR_SHARING_VIOLATION;
  const int file = target.Descriptor();
  const mode_t former = target.Info().st_mode, rights = former & (source.Info().st_mode | ~kRights);
  // Somebody else's file keeps its rights: they are not ours to take.
  if (S_ISREG(former) && rights != former && fchmod(file, rights & 07777) != 0 && errno != EPERM)
    return ErrorFromErrno(errno);
  return ftruncate(file, 0) == 0 || errno == EINVAL ? ERROR_SUCCESS : ErrorFromErrno(errno);
}

DWORD CopyInto(const OpenedFile& source, OpenedFile& target) {
  const int file = target.Descriptor();
  if (!CopyToEnd(source.Descriptor(), file)) return ErrorFromErrno(errno);
  const timespec times[2] = {{0, UTIME_OMIT}, source.Info().st_mtim};
  if (S_ISREG(target.Info().st_mode)) futimens(file, times);
  return target.Close() ? ERROR_SUCCESS : GetLastError();
}

DWORD MoveLink(const Resolved& source, const std::string& temporary) {
  char leadsTo[PATH_MAX];
  const ssize_t length = readlink(source.path.c_str(), leadsTo, sizeof leadsTo - 1);
  if (length < 0) return ErrorFromErrno(errno);
  leadsTo[length] = 0;
  return symlink(leadsTo, temporary.c_str()) == 0 ? ERROR_SUCCESS : ErrorFromErrno(errno);
}

// With all that a move keeps; what the file system or the caller's rights do not allow is left out.
bool CopyWhole(int from, int to) {
  struct stat info;
  if (fstat(from, &info) != 0 || !CopyToEnd(from, to)) return false;
  const bool isOwned = fchown(to, info.st_uid, info.st_gid) == 0;
  const timespec times[2] = {info.st_atim, info.st_mtim};
  return fchmod(to, info.st_mode & (isOwned ? 07777 : kRights)) == 0 && (futimens(to, times) == 0 || errno == EPERM) &&
         fdatasync(to) == 0;
}

DWORD MoveContent(const Resolved& source, std::string& temporary) {
  const Descriptor from(open(source.path.c_str(), O_RDONLY | O_NOFOLLOW | O_CLOEXEC));
  if (from < 0) return ErrorFromErrno(errno);
  Descriptor to(mkostemp(temporary.data(), O_CLOEXEC));
  if (to < 0) return ErrorFromErrno(errno);
  return CopyWhole(from, to) && to.Close() ? ERROR_SUCCESS : ErrorFromErrno(errno);
}

}  // namespace

DWORD CopyFileTo(const Resolved& source, LPCWSTR to, bool failIfExists) {
  OpenedFile reader, writer;
  constexpr DWORD kShareAll = FILE_SHARE_READ | FILE_SHARE_WRITE | FILE_SHARE_DELETE;
  if (const DWORD error = reader.Open(source, {GENERIC_READ, kShareAll, OPEN_EXISTING})) return error;
  if (const DWORD error = PrepareTarget(to, reader, failIfExists, writer)) return error;
  const DWORD error = CopyInto(reader, writer);
  if (error == ERROR_SUCCESS) return error;
  // Half a copy is no copy.
  writer.Close();
  DeleteFileW(to);
  return error;
}

DWORD MoveByCopy(const Resolved& source, const std::string& target, bool replaces) {
  const bool isLink = S_ISLNK(source.info.st_mode);
  if (!isLink && !S_ISREG(source.info.st_mode)) return ERROR_NOT_SAME_DEVICE;
  std::string temporary = target + ".XXXXXX";
  DWORD error;
  if (isLink) {
    temporary = target + ".qx" + std::to_string(getpid());
    error = MoveLink(source, temporary);
  } else {
    error = MoveContent(source, temporary);
  }
  if (error == ERROR_SUCCESS &&
      renameat2(AT_FDCWD, temporary.c_str(), AT_FDCWD, target.c_str(), replaces ? 0 : RENAME_NOREPLACE) != 0)
    error = errno == EEXIST ? ERROR_ALREADY_EXISTS : ErrorFromErrno(errno);
  if (error != ERROR_SUCCESS) {
    unlink(temporary.c_str());
    return error;
  }
  return unlink(source.path.c_str()) == 0 ? ERROR_SUCCESS : ErrorFromErrno(errno);
}

}  // namespace platform
