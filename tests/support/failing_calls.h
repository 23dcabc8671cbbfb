// Calls of the system that fail on order. The functions here stand in front of the C library's for the whole
// program; they are weak, so that several source files may include this, and one may have its own. Linux only.
#pragma once

#include <dlfcn.h>
#include <fcntl.h>
#include <sys/stat.h>
#include <sys/statvfs.h>
#include <unistd.h>

#include <cerrno>
#include <cstdarg>
#include <cstddef>
#include <functional>

struct Orders {
  long failAt = 0;  // the n-th call from now on; 0: none
  bool forever = false;
  int error = 0;
  long calls = 0;
  bool hasFailed = false;
};
inline Orders g_orders;

// Is told of each write before it is done.
inline void (*g_beforeWrite)(int file) = nullptr;

// A signal interrupts reads and writes only: what else is called with files on disk does not wait.
inline bool MustFail(bool mayBeInterrupted = false) {
  if (g_orders.failAt == 0 || (g_orders.error == EINTR && !mayBeInterrupted)) return false;
  ++g_orders.calls;
  const bool fails = g_orders.forever ? g_orders.calls >= g_orders.failAt : g_orders.calls == g_orders.failAt;
  if (!fails) return false;
  g_orders.hasFailed = true;
  errno = g_orders.error;
  return true;
}

template <class Function>
Function* Real(const char* name) {
  return reinterpret_cast<Function*>(dlsym(RTLD_NEXT, name));
}

// The operation with the first, second, third ... call failing with the error, until all calls succeed;
// `check` is told whether one failed.
inline void WithEachCallFailing(int error, const std::function<void()>& operation,
                                const std::function<void(bool)>& check) {
  for (const bool forever : {false, true}) {
    for (long n = 1; n < 5000; ++n) {
      g_orders = {n, forever, error, 0, false};
      operation();
      const bool failed = g_orders.hasFailed;
      g_orders = {};
      check(failed);
      if (!failed) break;
    }
  }
}

// Whether orders reach read and write: a sanitizer's own stand in front of these.
inline bool OrdersReachReads() {
  char byte;
  g_orders = {1, false, EIO, 0, false};
  const bool reached = read(-1, &byte, 0) < 0 && g_orders.hasFailed;
  g_orders = {};
  return reached;
}

// These stand in front of the C library's for the whole program.
#define FAILING_CALL(name, declared, passed, specifier)          \
  extern "C" __attribute__((weak)) int name declared specifier { \
    static auto* const real = Real<int declared>(#name);         \
    return MustFail() ? -1 : real passed;                        \
  }

FAILING_CALL(stat, (const char* path, struct stat* info), (path, info), noexcept)
FAILING_CALL(lstat, (const char* path, struct stat* info), (path, info), noexcept)
FAILING_CALL(fstat, (int file, struct stat* info), (file, info), noexcept)
FAILING_CALL(statx, (int folder, const char* path, int flags, unsigned mask, struct statx* info),
             (folder, path, flags, mask, info), noexcept)
FAILING_CALL(chdir, (const char* path), (path), noexcept)
FAILING_CALL(mkdir, (const char* path, mode_t mode), (path, mode), noexcept)
FAILING_CALL(rmdir, (const char* path), (path), noexcept)
FAILING_CALL(unlink, (const char* path), (path), noexcept)
FAILING_CALL(chmod, (const char* path, mode_t mode), (path, mode), noexcept)
FAILING_CALL(ftruncate, (int file, off_t size), (file, size), noexcept)
FAILING_CALL(fsync, (int file), (file), )
FAILING_CALL(statvfs, (const char* path, struct statvfs* info), (path, info), noexcept)
FAILING_CALL(renameat2, (int fromFolder, const char* from, int toFolder, const char* to, unsigned flags),
             (fromFolder, from, toFolder, to, flags), noexcept)

extern "C" __attribute__((weak)) int open(const char* path, int flags, ...) {
  static auto* const real = Real<int(const char*, int, ...)>("open");
  std::va_list arguments;
  va_start(arguments, flags);
  const int mode = (flags & O_CREAT) != 0 ? va_arg(arguments, int) : 0;
  va_end(arguments);
  return MustFail() ? -1 : real(path, flags, mode);
}

extern "C" __attribute__((weak)) int close(int file) {
  static auto* const real = Real<int(int)>("close");
  const int result = real(file);  // closed all the same, as the kernel does it
  return MustFail(true) ? -1 : result;
}

extern "C" __attribute__((weak)) ssize_t read(int file, void* buffer, std::size_t count) {
  static auto* const real = Real<ssize_t(int, void*, std::size_t)>("read");
  return MustFail(true) ? -1 : real(file, buffer, count);
}

extern "C" __attribute__((weak)) ssize_t write(int file, const void* buffer, std::size_t count) {
  static auto* const real = Real<ssize_t(int, const void*, std::size_t)>("write");
  if (g_beforeWrite != nullptr) g_beforeWrite(file);
  return MustFail(true) ? -1 : real(file, buffer, count);
}

extern "C" __attribute__((weak)) off_t lseek(int file, off_t offset, int whence) noexcept {
  static auto* const real = Real<off_t(int, off_t, int)>("lseek");
  return MustFail() ? -1 : real(file, offset, whence);
}

extern "C" __attribute__((weak)) ssize_t getdents64(int file, void* buffer, std::size_t count) noexcept {
  static auto* const real = Real<ssize_t(int, void*, std::size_t)>("getdents64");
  return MustFail() ? -1 : real(file, buffer, count);
}
