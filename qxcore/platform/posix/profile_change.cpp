#include "qxcore/platform/posix/profile_change.h"

#include <fcntl.h>
#include <stdio.h>
#include <stdlib.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>
#include <climits>

#include "qxcore/platform/posix/descriptor.h"
#include "qxcore/platform/posix/share_mode.h"
#include "qxcore/platform/posix/user_folders.h"

namespace platform {
namespace {

DWORD LastErrno() { return ErrorFromErrno(errno); }

// To what a link leads, there or not.
DWORD FollowLinks(std::string& path) {
  constexpr int kMostLinks = 40;
  for (int links = 0; links < kMostLinks; ++links) {
    char target[PATH_MAX];
    const ssize_t length = readlink(path.c_str(), target, sizeof target);
    if (length < 0) return errno == EINVAL || errno == ENOENT ? ERROR_SUCCESS : LastErrno();
    const std::string_view next(target, static_cast<std::size_t>(length));
    path = (next[0] == '/' ? std::string() : path.substr(0, path.rfind('/') + 1)).append(next);
  }
  return ERROR_CANT_RESOLVE_FILENAME;
}

// The file that is changed, in this writer's turn. Made when it is missing, and removed again unless it is kept.
class FileInTurn {
 public:
  FileInTurn() = default;
  FileInTurn(const FileInTurn&) = delete;
  FileInTurn& operator=(const FileInTurn&) = delete;
  ~FileInTurn() {
    if (m_isNew && IsNameOf(m_path.c_str(), m_file)) unlink(m_path.c_str());
  }

  DWORD Open(const std::string& path) {
    m_path = path;
    for (;;) {
      if (const DWORD error = OpenOrMake()) return error;
      if (!TakeTurn(m_file)) return ERROR_SHARING_VIOLATION;
      // The writer before may have replaced or removed it.
      if (IsNameOf(m_path.c_str(), m_file)) break;
      m_isNew = false;
    }
    return Check();
  }
  DWORD Write(const std::string& bytes) {
    // The first can find out that only the second is possible.
    const bool isWritten = (!m_isInPlace && Replace(bytes)) || (m_isInPlace && WriteInPlace(bytes));
    if (!isWritten) return LastErrno();
    m_isNew = false;
    return ERROR_SUCCESS;
  }
  bool Read(std::string& bytes) { return ReadToEnd(m_file, bytes); }

 private:
  DWORD OpenOrMake() {
    for (;;) {
      m_file = Descriptor(open(m_path.c_str(), O_RDWR | O_NONBLOCK | O_CLOEXEC));
      if (m_file >= 0) return ERROR_SUCCESS;
      if (errno != ENOENT) return LastErrno();
      m_file = Descriptor(open(m_path.c_str(), O_RDWR | O_CREAT | O_EXCL | O_CLOEXEC, 0666));
      m_isNew = m_file >= 0;
      if (m_isNew) return ERROR_SUCCESS;
      if (errno != EEXIST) return errno == ENOENT ? ERROR_PATH_NOT_FOUND : LastErrno();
    }
  }

  DWORD Check() {
    if (fstat(m_file, &m_info) != 0) return LastErrno();
    // Nobody may write: the read-only attribute, which holds for the superuser, too.
    if (!S_ISREG(m_info.st_mode) || (!m_isNew && (m_info.st_mode & 0222) == 0)) return ERROR_ACCESS_DENIED;
    if (!TakeShareMode(m_file, GENERIC_READ | GENERIC_WRITE, FILE_SHARE_READ | FILE_SHARE_WRITE | FILE_SHARE_DELETE))
      return ERROR_SHARING_VIOLATION;
    m_isInPlace = HasOtherWriter(m_file) || m_info.st_nlink > 1;
    return ERROR_SUCCESS;
  }

  // Puts a new file in the place of the old one. False with errno; m_isInPlace is set when the file can only be
  // written where it is.
  bool Replace(const std::string& bytes) {
    std::string temporary = m_path + ".XXXXXX";
    Descriptor file(mkostemp(temporary.data(), O_CLOEXEC));
    if (file < 0) {
      m_isInPlace = errno == EACCES || errno == EPERM || errno == EROFS;
      return false;
    }
    m_isInPlace = fchown(file, m_info.st_uid, m_info.st_gid) != 0;
    // The data must be on the device before the name is: otherwise a loss of power could leave an empty file.
    if (!m_isInPlace && WriteWhole(file, bytes.data(), bytes.size()) && fchmod(file, m_info.st_mode & 07777) == 0 &&
        fdatasync(file) == 0 && file.Close() && rename(temporary.c_str(), m_path.c_str()) == 0)
      return true;
    const int error = errno;
    unlink(temporary.c_str());
    errno = error;
    return false;
  }

  // Takes the room first, so that a full disk leaves the file as it was.
  bool WriteInPlace(const std::string& bytes) {
    const auto size = static_cast<off_t>(bytes.size());
    if (size > m_info.st_size) {
      if (const int error = posix_fallocate(m_file, m_info.st_size, size - m_info.st_size)) {
        if (ftruncate(m_file, m_info.st_size) == 0) errno = error;
        return false;
      }
    }
    return lseek(m_file, 0, SEEK_SET) == 0 && WriteWhole(m_file, bytes.data(), bytes.size()) &&
           ftruncate(m_file, size) == 0 && fdatasync(m_file) == 0;
  }

  std::string m_path;
  Descriptor m_file;
  struct stat m_info {};
  bool m_isNew = false;
  bool m_isInPlace = false;
};

}  // namespace

ProfilePath::ProfilePath(LPCWSTR name)
    : isInUserFolder(std::u16string_view(name).find_first_of(u"\\/:") == std::u16string_view::npos) {
  if (isInUserFolder) {
    path = UserConfigurationFolder() + "/qxcore/" + ToFileSystemName(name);
  } else {
    Resolved resolved = ResolvePath(name);
    error = resolved.error;
    path = std::move(resolved.path);
  }
  if (error == ERROR_SUCCESS) error = FollowLinks(path);
}

DWORD ChangeProfile(LPCWSTR name, const std::function<bool(ProfileFile&)>& change) {
  const ProfilePath path(name);
  if (path.error != ERROR_SUCCESS) return path.error;
  if (path.isInUserFolder) MakeFoldersOf(path.path);
  FileInTurn file;
  if (const DWORD error = file.Open(path.path)) return error;
  std::string bytes;
  if (!file.Read(bytes)) return LastErrno();
  ProfileFile profile(std::move(bytes));
  return change(profile) ? file.Write(profile.Bytes()) : ERROR_SUCCESS;
}

}  // namespace platform
