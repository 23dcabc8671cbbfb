// Named mappings between processes. Under Windows the system itself sees to this.

#include <gtest/gtest.h>

#ifndef _WIN32

#include <signal.h>
#include <sys/wait.h>
#include <unistd.h>

#include "qxcore/system/file/mapped_view.h"

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

}  // namespace

#endif
