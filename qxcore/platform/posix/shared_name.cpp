#include "qxcore/platform/posix/shared_name.h"

#include <fcntl.h>
#include <sys/mman.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>
#include <climits>
#include <cstdio>
#include <string_view>

#include "qxcore/platform/posix/path.h"

namespace platform {
namespace {

bool Lock(int descriptor, short type, bool waits) {
  struct flock lock {};
  lock.l_type = type;
  lock.l_whence = SEEK_SET;
  for (;;) {
    if (fcntl(descriptor, waits ? F_OFD_SETLKW : F_OFD_SETLK, &lock) == 0) return true;
    if (errno != EINTR) return false;
  }
}

// An object of this user's that nobody else can open. Anybody can make one of the name first.
bool IsOwn(const struct stat& info) { return info.st_uid == geteuid() && (info.st_mode & 0077) == 0; }

SharedMemory Failed(int descriptor, int error) {
  if (descriptor >= 0) close(descriptor);
  SharedMemory memory;
  memory.error = ErrorFromErrno(error);
  return memory;
}

}  // namespace

DWORD NameOfSharedMemory(LPCWSTR name, std::string& object) {
  std::u16string_view rest = name;
  for (std::u16string_view space : {u"Global\\", u"Local\\"}) {
    if (rest.starts_with(space)) {
      rest.remove_prefix(space.size());
      break;
    }
  }
  if (rest.find(u'\\') != std::u16string_view::npos) return ERROR_PATH_NOT_FOUND;
  object = "/qxcore." + std::to_string(geteuid()) + ".";
  // Letters, digits and some signs stand for themselves, the rest as hexadecimal numbers between percent signs.
  for (const char16_t c : rest) {
    const bool isPlain =
        (c >= 'a' && c <= 'z') || (c >= 'A' && c <= 'Z') || (c >= '0' && c <= '9') || c == '-' || c == '_';
    char code[8];
    std::snprintf(code, sizeof code, isPlain ? "%c" : "%%%x%%", static_cast<unsigned>(c));
    object += code;
  }
  return object.size() <= NAME_MAX ? ERROR_SUCCESS : ERROR_FILENAME_EXCED_RANGE;
}

SharedMemory OpenSharedMemory(const std::string& object, std::uint64_t size) {
  for (;;) {
    const int descriptor = shm_open(object.c_str(), O_RDWR | O_CREAT | O_CLOEXEC, 0600);
    if (descriptor < 0) return Failed(-1, errno);
    struct stat info;
    if (fstat(descriptor, &info) != 0) return Failed(descriptor, errno);
    if (!IsOwn(info)) return Failed(descriptor, EACCES);
    const bool isAlone = Lock(descriptor, F_WRLCK, false);
    if (!isAlone && !Lock(descriptor, F_RDLCK, true)) return Failed(descriptor, errno);
    if (fstat(descriptor, &info) != 0) return Failed(descriptor, errno);
    if (info.st_nlink == 0) {  // the last holder removed it between our two steps
      close(descriptor);
      continue;
    }
    if (!isAlone) return {descriptor, static_cast<std::uint64_t>(info.st_size), true, ERROR_SUCCESS};
    // New, or left behind by a process that was killed.
    if (ftruncate(descriptor, 0) != 0 || ftruncate(descriptor, static_cast<off_t>(size)) != 0) {
      const int error = errno;
      shm_unlink(object.c_str());
      return Failed(descriptor, error);
    }
    Lock(descriptor, F_RDLCK, false);  // from alone to shared is one step
    return {descriptor, size, false, ERROR_SUCCESS};
  }
}

void CloseSharedMemory(const std::string& object, int descriptor) {
  if (Lock(descriptor, F_WRLCK, false)) shm_unlink(object.c_str());
  close(descriptor);
}

}  // namespace platform
