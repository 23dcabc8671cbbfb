// The functions for initialisation files: reading, and writing through a new file that takes the place of
// the old one, so that readers and a killed writer never see or leave half a file.

#include <fcntl.h>
#include <sys/file.h>
#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <climits>
#include <cstdlib>

#include "qxcore/platform/posix/path.h"
#include "qxcore/platform/posix/profile_file.h"
#include "qxcore/platform/posix/user_folders.h"

namespace {

using namespace platform;

class Descriptor {
 public:
  explicit Descriptor(int descriptor) : m_descriptor(descriptor) {}
  Descriptor(const Descriptor&) = delete;
  Descriptor& operator=(const Descriptor&) = delete;
  ~Descriptor() {
    if (m_descriptor >= 0) close(m_descriptor);
  }
  operator int() const { return m_descriptor; }
  // True when closing found no error.
  bool Close() {
    const int closed = m_descriptor;
    m_descriptor = -1;
    return close(closed) == 0;
  }

 private:
  int m_descriptor;
};

// Files without a folder in their name are kept in one of their own.
bool HasFolder(LPCWSTR file) { return std::u16string_view(file).find_first_of(u"\\/:") != std::u16string_view::npos; }

// The file's path, links followed; empty, with the error set, when there is no such place.
std::string PathOf(LPCWSTR file) {
  std::string path;
  if (!HasFolder(file)) {
    path = UserConfigurationFolder() + "/qxcore/" + ToFileSystemName(file);
  } else {
    Resolved resolved = ResolvePath(file);
    if (resolved.error != ERROR_SUCCESS) {
      SetLastError(resolved.error);
      return std::string();
    }
    path = std::move(resolved.path);
  }
  char target[PATH_MAX];
  return realpath(path.c_str(), target) != nullptr ? target : path;
}

// False with errno.
bool ReadAll(const std::string& path, std::string& bytes) {
  Descriptor file(open(path.c_str(), O_RDONLY | O_CLOEXEC));
  if (file < 0) return false;
  char buffer[16384];
  for (;;) {
    const ssize_t count = read(file, buffer, sizeof buffer);
    if (count == 0) return true;
    if (count > 0) bytes.append(buffer, static_cast<std::size_t>(count));
    if (count < 0 && errno != EINTR) return false;
  }
}

bool WriteAll(int file, const std::string& bytes) {
  for (std::size_t done = 0; done < bytes.size();) {
    const ssize_t count = write(file, bytes.data() + done, bytes.size() - done);
    if (count < 0 && errno != EINTR) return false;
    if (count > 0) done += static_cast<std::size_t>(count);
  }
  return true;
}

// Puts the bytes in the place of the file, with its owner and rights. False with errno.
bool Replace(const std::string& path, const std::string& bytes, const struct stat* former) {
  std::string temporary = path + ".XXXXXX";
  Descriptor file(mkostemp(temporary.data(), O_CLOEXEC));
  if (file < 0) return false;
  mode_t mode;
  if (former != nullptr) {
    mode = former->st_mode & 07777;
    if (fchown(file, former->st_uid, former->st_gid) != 0) mode &= 0777;  // not ours to give; the rights are kept
  } else {
    const mode_t mask = umask(0);
    umask(mask);
    mode = 0666 & ~mask;
  }
  // The data must be on the device before the name is: otherwise a loss of power could leave an empty file.
  if (WriteAll(file, bytes) && fchmod(file, mode) == 0 && fdatasync(file) == 0 && file.Close() &&
      rename(temporary.c_str(), path.c_str()) == 0)
    return true;
  const int error = errno;
  unlink(temporary.c_str());
  errno = error;
  return false;
}

template <class Change>
BOOL ChangeFile(LPCWSTR file, Change change) {
  const std::string path = PathOf(file);
  if (path.empty()) return FALSE;
  const std::string folder = path.substr(0, path.rfind('/') + 1);
  if (!HasFolder(file)) {
    mkdir(folder.substr(0, folder.rfind('/', folder.size() - 2)).c_str(), 0700);
    mkdir(folder.c_str(), 0700);
  }
  // Writers of a folder's files take turns; the lock dies with its process. The file itself cannot be locked,
  // for it is replaced.
  const Descriptor lock(open(folder.c_str(), O_RDONLY | O_DIRECTORY | O_CLOEXEC));
  while (lock >= 0 && flock(lock, LOCK_EX) != 0 && errno == EINTR) {
  }
  std::string bytes;
  struct stat former;
  const bool exists = stat(path.c_str(), &former) == 0;
  if (exists && (former.st_mode & 0222) == 0) return FailWith(ERROR_ACCESS_DENIED);
  if (exists && !ReadAll(path, bytes)) return FailWith(ErrorFromErrno(errno));
  ProfileFile profile(std::move(bytes));
  if (!change(profile)) return TRUE;
  return Replace(path, profile.Bytes(), exists ? &former : nullptr) ? TRUE : FailWith(ErrorFromErrno(errno));
}

// Copies with a terminator, cut to the room. Gives the length.
DWORD CopyOut(std::u16string_view text, LPWSTR buffer, DWORD capacity) {
  const std::size_t length = std::min<std::size_t>(text.size(), capacity - 1);
  text.copy(buffer, length);
  buffer[length] = 0;
  return static_cast<DWORD>(length);
}

// Names one behind the other, each terminated, and one terminator more. Cut, it is two less than the room.
DWORD CopyOut(const std::vector<std::u16string>& names, LPWSTR buffer, DWORD capacity) {
  std::u16string all;
  for (const std::u16string& name : names) all += name + u'\0';
  if (capacity == 1) return CopyOut(u"", buffer, capacity);
  const std::size_t length = std::min<std::size_t>(all.size(), capacity - 1);
  all.copy(buffer, length);
  if (length < all.size()) {
    buffer[capacity - 2] = buffer[capacity - 1] = 0;
    return capacity - 2;
  }
  buffer[length] = 0;
  if (all.empty()) buffer[1] = 0;
  return static_cast<DWORD>(length);
}

}  // namespace

DWORD GetPrivateProfileStringW(LPCWSTR section, LPCWSTR key, LPCWSTR standard, LPWSTR text, DWORD capacity,
                               LPCWSTR file) {
  if (text == nullptr || capacity == 0) return 0;
  std::u16string_view fallback = standard == nullptr ? u"" : standard;
  while (!fallback.empty() && fallback.back() == ' ') fallback.remove_suffix(1);
  try {
    std::string bytes;
    const std::string path = file == nullptr ? std::string() : PathOf(file);
    if (path.empty() || !ReadAll(path, bytes)) {
      const DWORD length = section != nullptr && key != nullptr
                               ? CopyOut(fallback, text, capacity)
                               : CopyOut(std::vector<std::u16string>(), text, capacity);
      SetLastError(ERROR_FILE_NOT_FOUND);
      return length;
    }
    const ProfileFile profile(std::move(bytes));
    if (section == nullptr) return CopyOut(profile.Sections(), text, capacity);
    if (key == nullptr) return CopyOut(profile.Keys(section), text, capacity);
    std::u16string value;
    return CopyOut(profile.Find(section, key, value) ? std::u16string_view(value) : fallback, text, capacity);
  } catch (const std::bad_alloc&) {
    SetLastError(ERROR_NOT_ENOUGH_MEMORY);
    return CopyOut(fallback, text, capacity);
  }
}

BOOL WritePrivateProfileStringW(LPCWSTR section, LPCWSTR key, LPCWSTR text, LPCWSTR file) {
  if (file == nullptr || *file == 0) return FailWith(ERROR_ACCESS_DENIED);
  if (section == nullptr) return FailWith(ERROR_SUCCESS);  // nothing is held back that could be written now
  try {
    return ChangeFile(file, [&](ProfileFile& profile) {
      if (key == nullptr) return profile.DeleteSection(section);
      return text == nullptr ? profile.DeleteKey(section, key) : profile.Set(section, key, text);
    });
  } catch (const std::bad_alloc&) {
    return FailWith(ERROR_NOT_ENOUGH_MEMORY);
  }
}
