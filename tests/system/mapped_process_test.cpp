// Named mappings between processes. Under Windows the system itself sees to this.

#include <gtest/gtest.h>

#ifndef _WIN32

#include <dlfcn.h>
#include <signal.h>
#include <sys/uio.h>
#include <sys/wait.h>
#include <unistd.h>

#include <cerrno>
#include <string>

#include "qxcore/system/file/mapped_file.h"
#include "tests/support/temp_folder.h"

namespace {

bool g_isCopyForbidden = false;

template <class Function>
Function* Real(const char* name) {
  return reinterpret_cast<Function*>(dlsym(RTLD_NEXT, name));
}

}  // namespace

// These stand in front of the C library's for the whole program.
#define COPYING_CALL(name)                                                                                    \
  extern "C" ssize_t name(pid_t process, const iovec* local, unsigned long locals, const iovec* remote,       \
                          unsigned long remotes, unsigned long flags) noexcept {                              \
    static auto* const real =                                                                                 \
        Real<ssize_t(pid_t, const iovec*, unsigned long, const iovec*, unsigned long, unsigned long)>(#name); \
    if (!g_isCopyForbidden) return real(process, local, locals, remote, remotes, flags);                      \
    errno = EPERM;                                                                                            \
    return -1;                                                                                                \
  }
COPYING_CALL(process_vm_readv)
COPYING_CALL(process_vm_writev)

namespace {

constexpr const WCHAR* kName = WTEXT("qxcore test between processes");

TEST(MappedMemoryBetweenProcesses, IsSharedWhileOneLivesAndNotInheritedFromTheKilled) {
  int ready[2];
  ASSERT_EQ(pipe(ready), 0);
  const pid_t child = fork();
  ASSERT_GE(child, 0);
  if (child == 0) {
    SMappedMemory memory;
    memory.CreateMapping(std::uint64_t{8192}, kName);
    SMappedView view(memory);
    view.OpenView(0);
    view.GetPointer()[8191] = 'x';
    if (write(ready[1], "r", 1) != 1) _exit(1);
    for (;;) pause();
  }
  char byte;
  ASSERT_EQ(read(ready[0], &byte, 1), 1);
  {
    SMappedMemory memory;
    ASSERT_EQ(memory.CreateMapping(std::uint64_t{1}, kName), 0);
    EXPECT_EQ(GetLastError(), ERROR_ALREADY_EXISTS);
    SMappedView view(memory);
    ASSERT_EQ(view.OpenView(8192), 0);
    EXPECT_EQ(view.GetPointer()[8191], 'x');
  }
  kill(child, SIGKILL);
  waitpid(child, nullptr, 0);
  SMappedMemory memory;
  ASSERT_EQ(memory.CreateMapping(std::uint64_t{8192}, kName), 0);
  EXPECT_EQ(GetLastError(), ERROR_SUCCESS);
  SMappedView view(memory);
  ASSERT_EQ(view.OpenView(0), 0);
  EXPECT_EQ(view.GetPointer()[8191], 0);
  close(ready[0]);
  close(ready[1]);
}

// Where a sandbox forbids the guarded copy, the plain one does as much: a file that was cut is read up to its end.
TEST(MappedMemoryBetweenProcesses, CopiesInASandbox) {
  const test::TempFolder folder;
  const test::Text path = folder.File(WTEXT("a"));
  for (const bool isForbidden : {false, true}) {
    test::WriteAll(path, std::string(100'000, 'a'));
    SMappedFile file{SString(path.c_str())};
    std::string bytes(100'000, 0);
    unsigned long count = 100'000, start = 0;
    g_isCopyForbidden = isForbidden;
    EXPECT_EQ(file.Read(bytes.data(), &count), 0);
    EXPECT_EQ(count, 100'000u);
    ASSERT_EQ(truncate(SFile::ToNative(SString(path.c_str())).c_str(), 4096), 0);
    EXPECT_EQ(file.Seek(&start, 0), 0);
    EXPECT_EQ(file.Read(bytes.data(), &count), 0);
    EXPECT_EQ(count, 4096u) << isForbidden;
    start = 0;
    EXPECT_EQ(file.Seek(&start, 0), 0);
    count = 4096;
    EXPECT_EQ(file.Write(std::string(4096, 'b').data(), &count), 0);
    g_isCopyForbidden = false;
    EXPECT_EQ(test::ReadAll(path), std::string(4096, 'b'));
  }
}

}  // namespace

#endif
