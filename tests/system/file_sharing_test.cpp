// Files that another process holds open.

#include <gtest/gtest.h>

#include <cstdio>
#include <cstdlib>
#include <string>

#include "qxcore/system/file/file.h"
#include "tests/support/temp_folder.h"
#include "tests/support/text.h"

#ifndef _WIN32
#include <sys/wait.h>
#include <unistd.h>
#endif

namespace {

using test::TempFolder;
using test::WriteAll;

SString Str(const test::Text& text) { return SString(text.c_str()); }
HRESULT Code(SFile::Status status) { return static_cast<HRESULT>(status); }

HANDLE OpenAs(const WCHAR* path, DWORD access, DWORD share) {
  return CreateFileW(path, access, share, nullptr, OPEN_EXISTING, 0, nullptr);
}

#ifdef _WIN32

constexpr const WCHAR* kReady = L"qxcore-test-ready";
constexpr const WCHAR* kDone = L"qxcore-test-done";

// Another process with the file open in this way, until the object ends: this program again, told by its
// environment to run the test below alone.
class Holder {
 public:
  Holder(const SString& path, DWORD access, DWORD share)
      : m_ready(CreateEventW(nullptr, TRUE, FALSE, kReady)), m_done(CreateEventW(nullptr, TRUE, FALSE, kDone)) {
    SetEnvironmentVariableW(L"QXCORE_TEST_HOLD", path);
    SetEnvironmentVariableA("QXCORE_TEST_ACCESS", std::to_string(access).c_str());
    SetEnvironmentVariableA("QXCORE_TEST_SHARE", std::to_string(share).c_str());
    WCHAR program[MAX_PATH],
        command[] = L"hold --gtest_also_run_disabled_tests --gtest_filter=FilesOfOthers.DISABLED_Hold";
    GetModuleFileNameW(nullptr, program, MAX_PATH);
    STARTUPINFOW startup = {};
    startup.cb = sizeof startup;
    EXPECT_TRUE(CreateProcessW(program, command, nullptr, nullptr, FALSE, 0, nullptr, nullptr, &startup, &m_process));
    EXPECT_EQ(WaitForSingleObject(m_ready, 60000), DWORD(WAIT_OBJECT_0));
  }
  ~Holder() {
    SetEvent(m_done);
    EXPECT_EQ(WaitForSingleObject(m_process.hProcess, 60000), DWORD(WAIT_OBJECT_0));
    for (const HANDLE handle : {m_process.hProcess, m_process.hThread, m_ready, m_done}) CloseHandle(handle);
  }

 private:
  PROCESS_INFORMATION m_process = {};
  HANDLE m_ready, m_done;
};

TEST(FilesOfOthers, DISABLED_Hold) {
  const WCHAR* path = _wgetenv(L"QXCORE_TEST_HOLD");
  if (path == nullptr) GTEST_SKIP() << "run by the test below";
  const auto number = [](const char* name) { return static_cast<DWORD>(std::strtoul(std::getenv(name), nullptr, 10)); };
  const HANDLE file = OpenAs(path, number("QXCORE_TEST_ACCESS"), number("QXCORE_TEST_SHARE"));
  ASSERT_NE(file, INVALID_HANDLE_VALUE);
  const HANDLE ready = CreateEventW(nullptr, TRUE, FALSE, kReady), done = CreateEventW(nullptr, TRUE, FALSE, kDone);
  SetEvent(ready);
  WaitForSingleObject(done, 60000);
}

#else

// Another process with the file open in this way, until the object ends.
class Holder {
 public:
  Holder(const SString& path, DWORD access, DWORD share) {
    int ready[2], done[2];
    if (pipe(ready) != 0 || pipe(done) != 0) return;
    m_child = fork();
    if (m_child == 0) {
      close(done[1]);
      char byte = OpenAs(path, access, share) != INVALID_HANDLE_VALUE ? 'y' : 'n';
      if (write(ready[1], &byte, 1) == 1) [[maybe_unused]]
        const ssize_t end = read(done[0], &byte, 1);
      _exit(0);
    }
    close(ready[1]);
    close(done[0]);
    char byte = 'n';
    EXPECT_EQ(read(ready[0], &byte, 1), 1);
    EXPECT_EQ(byte, 'y');
    close(ready[0]);
    m_done = done[1];
  }
  ~Holder() {
    close(m_done);
    waitpid(m_child, nullptr, 0);
  }

 private:
  pid_t m_child = -1;
  int m_done = -1;
};

#endif

TEST(FilesOfOthers, WhatAnotherProcessHolds) {
  TempFolder folder;
  const SString path = Str(folder.File(WTEXT("a")));
  WriteAll(test::Text(path), "x");
  SFile file(path);
  {
    Holder alone(path, GENERIC_READ | GENERIC_WRITE, 0);
    EXPECT_EQ(file.OpenExisting(), Code(SFile::kOpenFailed));
    EXPECT_EQ(GetLastError(), DWORD(ERROR_SHARING_VIOLATION));
    EXPECT_EQ(file.IsOpen(), 0);
    EXPECT_EQ(file.GetAccess(), 0u);
    EXPECT_EQ(file.Open(), Code(SFile::kOpenFailed));
    EXPECT_EQ(file.Delete(), Code(SFile::kDeleteFailed));
    EXPECT_EQ(file.Rename(path + WTEXT("2")), Code(SFile::kMoveFailed));
    EXPECT_EQ(file.CanBeWritten(), 0);
  }
  {
    Holder writer(path, GENERIC_WRITE, FILE_SHARE_READ);
    EXPECT_EQ(file.OpenExisting(), Code(SFile::kRestricted));
    EXPECT_EQ(file.GetAccess(), static_cast<unsigned long>(GENERIC_READ));
    file.Close();
  }
  EXPECT_EQ(file.OpenExisting(), 0);
  file.Close();
  EXPECT_EQ(file.Delete(), 0);
}

}  // namespace
