#include "qxcore/platform/posix/share_mode.h"

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>
#include <ctime>

namespace platform {
namespace {

constexpr off_t kBase = off_t{1} << 62;
enum Place { kReads, kWrites, kDeniesRead, kDeniesWrite, kDeniesDelete, kTurn };
constexpr int kModePlaces = kTurn;

// 0 when the lock was set, or errno.
int SetLock(int descriptor, Place place, short type) {
  struct flock lock {};
  lock.l_type = type;
  lock.l_whence = SEEK_SET;
  lock.l_start = kBase + place;
  lock.l_len = 1;
  return fcntl(descriptor, F_OFD_SETLK, &lock);
}

// Does another open file hold one of the places from this one on?
bool IsHeld(int descriptor, Place place, int count = 1) {
  struct flock lock {};
  lock.l_type = F_WRLCK;  // stands against every other lock
  lock.l_whence = SEEK_SET;
  lock.l_start = kBase + place;
  lock.l_len = count;
  return fcntl(descriptor, F_OFD_GETLK, &lock) == 0 && lock.l_type != F_UNLCK;
}

struct Mode {
  bool reads, writes, deniesRead, deniesWrite, deniesDelete;
};

bool HoldAll(int descriptor, const Mode& mode) {
  return (!mode.reads || SetLock(descriptor, kReads, F_RDLCK) == 0) &&
         (!mode.writes || SetLock(descriptor, kWrites, F_RDLCK) == 0) &&
         (!mode.deniesRead || SetLock(descriptor, kDeniesRead, F_RDLCK) == 0) &&
         (!mode.deniesWrite || SetLock(descriptor, kDeniesWrite, F_RDLCK) == 0) &&
         (!mode.deniesDelete || SetLock(descriptor, kDeniesDelete, F_RDLCK) == 0);
}

void DropAll(int descriptor) {
  for (Place place : {kReads, kWrites, kDeniesRead, kDeniesWrite, kDeniesDelete}) SetLock(descriptor, place, F_UNLCK);
}

bool Collides(int descriptor, const Mode& mode) {
  return (mode.reads && IsHeld(descriptor, kDeniesRead)) || (mode.writes && IsHeld(descriptor, kDeniesWrite)) ||
         (mode.deniesRead && IsHeld(descriptor, kReads)) || (mode.deniesWrite && IsHeld(descriptor, kWrites));
}

bool IsHeldAt(const char* path, Place place, int count) {
  struct stat info;
  if (lstat(path, &info) != 0 || !S_ISREG(info.st_mode)) return false;
  const int descriptor = open(path, O_RDONLY | O_NOFOLLOW | O_NONBLOCK | O_CLOEXEC);
  if (descriptor < 0) return false;
  const bool isHeld = IsHeld(descriptor, place, count);
  close(descriptor);
  return isHeld;
}

}  // namespace

// Everybody first says what he does, then looks at the others; so of two who collide at least one sees
// it. Should both, they try again after a short while.
bool TakeShareMode(int descriptor, DWORD access, DWORD share) {
  const Mode mode{(access & GENERIC_READ) != 0, (access & GENERIC_WRITE) != 0, (share & FILE_SHARE_READ) == 0,
                  (share & FILE_SHARE_WRITE) == 0, (share & FILE_SHARE_DELETE) == 0};
  for (int attempt = 0; attempt < 3; ++attempt) {
    if (!HoldAll(descriptor, mode)) {
      DropAll(descriptor);
      return true;
    }
    if (!Collides(descriptor, mode)) return true;
    DropAll(descriptor);
    const timespec nap{0, 200'000 + (getpid() % 16) * 50'000};
    nanosleep(&nap, nullptr);
  }
  return false;
}

bool IsDeleteDenied(const char* path) { return IsHeldAt(path, kDeniesDelete, 1); }

bool IsHeldOpen(const char* path) { return IsHeldAt(path, kReads, kModePlaces); }

bool IsReadDenied(int descriptor) { return IsHeld(descriptor, kDeniesRead); }

bool HasOtherWriter(int descriptor) { return IsHeld(descriptor, kWrites); }

// Asked for again and again rather than waited for: whoever may read the file could hold it for ever.
bool TakeTurn(int descriptor) {
  constexpr int kMostMilliseconds = 5000;
  timespec nap{0, 1'000'000};
  for (int waited = 0; SetLock(descriptor, kTurn, F_WRLCK) != 0; waited += static_cast<int>(nap.tv_nsec / 1'000'000)) {
    if (errno != EAGAIN && errno != EACCES && errno != EINTR) return true;  // a file system without such locks
    if (waited >= kMostMilliseconds) return false;
    if (waited > 20) nap.tv_nsec = 10'000'000;
    nanosleep(&nap, nullptr);
  }
  return true;
}

}  // namespace platform
