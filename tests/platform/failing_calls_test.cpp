// The portable layer when the system fails: every call of every operation in turn, once and for ever after. What says
// that it is done is done, what fails leaves what was there, and no descriptor stays open. Linux only.

#ifndef _WIN32

#include <gtest/gtest.h>
#include <sys/mman.h>

#include <cstdlib>
#include <functional>
#include <string>
#include <utility>

#include "qxcore/platform/win32.h"
#include "tests/support/failing_calls.h"
#include "tests/support/file_size_limit.h"
#include "tests/support/open_handles.h"
#include "tests/support/temp_folder.h"

FAILING_CALL(fchmod, (int file, mode_t mode), (file, mode), noexcept)
FAILING_CALL(fchown, (int file, uid_t user, gid_t group), (file, user, group), noexcept)
FAILING_CALL(fdatasync, (int file), (file), )
FAILING_CALL(futimens, (int file, const struct timespec* times), (file, times), noexcept)
FAILING_CALL(mkostemp, (char* path, int flags), (path, flags), )
FAILING_CALL(rename, (const char* from, const char* to), (from, to), noexcept)
FAILING_CALL(link, (const char* from, const char* to), (from, to), noexcept)
FAILING_CALL(symlink, (const char* to, const char* path), (to, path), noexcept)
FAILING_CALL(shm_open, (const char* name, int flags, mode_t mode), (name, flags, mode), )
FAILING_CALL(memfd_create, (const char* name, unsigned flags), (name, flags), noexcept)
FAILING_CALL(msync, (void* at, std::size_t size, int flags), (at, size, flags), )

extern "C" __attribute__((weak)) ssize_t readlink(const char* path, char* to, std::size_t size) noexcept {
  static auto* const real = Real<ssize_t(const char*, char*, std::size_t)>("readlink");
  return MustFail() ? -1 : real(path, to, size);
}

namespace {

using test::ReadAll;
using test::TempFolder;
using test::Text;
using test::WriteAll;

const std::string kOld(70000, 'o'), kNew(90000, 'n');

class FailingCalls : public testing::Test {
 protected:
  // `run` returns whether the operation said that it was done; `check` is given that.
  void WithEachFailure(const std::function<void()>& prepare, const std::function<bool()>& run,
                       const std::function<void(bool)>& check) {
    for (const int error : {EIO, EACCES, ENOSPC, EMFILE, EINVAL}) {
      SCOPED_TRACE(error);
      bool isDone = false;
      int before = 0, failures = 0;
      WithEachCallFailing(
          error,
          [&] {
            const Orders orders = std::exchange(g_orders, {});
            prepare();
            before = CountOpenHandles();
            g_orders = orders;
            isDone = run();
          },
          [&](bool failed) {
            failures += failed;
            check(isDone);
            if (!failed) {
              EXPECT_TRUE(isDone);
            }
            EXPECT_EQ(CountOpenHandles(), before);
          });
      EXPECT_GT(failures, 1);
    }
  }
  void Put(const Text& path, const std::string& content) {
    SetFileAttributesW(path.c_str(), FILE_ATTRIBUTE_NORMAL);
    ASSERT_TRUE(WriteAll(path, content));
  }

  TempFolder m_folder;
  const Text m_from = m_folder.File(WTEXT("from")), m_to = m_folder.File(WTEXT("to"));
};

TEST_F(FailingCalls, Writing) {
  WithEachFailure([&] { Put(m_to, kOld); },
                  [&] {
                    const HANDLE file = CreateFileW(m_to.c_str(), GENERIC_READ | GENERIC_WRITE, FILE_SHARE_READ,
                                                    nullptr, OPEN_ALWAYS, 0, nullptr);
                    if (file == INVALID_HANDLE_VALUE) return false;
                    DWORD done = 0;
                    bool isDone = WriteFile(file, kNew.data(), static_cast<DWORD>(kNew.size()), &done, nullptr) &&
                                  done == kNew.size();
                    LARGE_INTEGER end;
                    end.QuadPart = 80000;
                    isDone = isDone && SetFilePointerEx(file, end, nullptr, FILE_BEGIN) && SetEndOfFile(file) &&
                             FlushFileBuffers(file);
                    return CloseHandle(file) && isDone;
                  },
                  [&](bool isDone) {
                    if (isDone) {
                      EXPECT_EQ(ReadAll(m_to), kNew.substr(0, 80000));
                    }
                  });
}

TEST_F(FailingCalls, CopyingAndMoving) {
  const auto prepare = [&] {
    Put(m_from, kNew);
    Put(m_to, kOld);
  };
  WithEachFailure(
      prepare, [&] { return CopyFileW(m_from.c_str(), m_to.c_str(), FALSE) != FALSE; },
      [&](bool isDone) {
        EXPECT_EQ(ReadAll(m_from), kNew);
        if (isDone) {
          EXPECT_EQ(ReadAll(m_to), kNew);
        }
      });
  WithEachFailure(
      prepare, [&] { return MoveFileExW(m_from.c_str(), m_to.c_str(), MOVEFILE_REPLACE_EXISTING) != FALSE; },
      [&](bool isDone) {
        EXPECT_EQ(ReadAll(m_to), isDone ? kNew : ReadAll(m_from) == kNew ? kOld : kNew) << "neither is lost";
      });
  // To another file system, where there is one, by a copy.
  const Text away = WTEXT("C:\\dev\\shm\\qxcore-fails") + m_folder.Path().substr(m_folder.Path().rfind('\\') + 1);
  WithEachFailure(
      [&] {
        test::RemoveAll(away);
        Put(m_from, kNew);
      },
      [&] { return MoveFileExW(m_from.c_str(), away.c_str(), MOVEFILE_COPY_ALLOWED) != FALSE; },
      [&](bool isDone) { EXPECT_EQ(ReadAll(isDone ? away : m_from), kNew); });
  test::RemoveAll(away);
}

// A signal that comes while the system reads or writes is no failure.
TEST_F(FailingCalls, InterruptedOnesAreTakenUpAgain) {
  if (!OrdersReachReads()) GTEST_SKIP() << "the sanitizer has its own read and write";
  const Text away = WTEXT("C:\\dev\\shm\\qxcore-signals") + m_folder.Path().substr(m_folder.Path().rfind('\\') + 1);
  const Text settings = m_folder.File(WTEXT("settings"));
  WithEachCallFailing(
      EINTR,
      [&] {
        const Orders orders = std::exchange(g_orders, {});
        test::RemoveAll(away);
        Put(m_from, kNew);
        Put(m_to, kOld);
        Put(settings, "[section]\r\nfirst=1\r\n");
        g_orders = orders;
        g_orders.forever = false;
        EXPECT_TRUE(CopyFileW(m_from.c_str(), m_to.c_str(), FALSE)) << GetLastError();
        EXPECT_TRUE(MoveFileExW(m_from.c_str(), away.c_str(), MOVEFILE_COPY_ALLOWED)) << GetLastError();
        EXPECT_TRUE(WritePrivateProfileStringW(WTEXT("section"), WTEXT("first"), WTEXT("2"), settings.c_str()));
      },
      [&](bool) {
        EXPECT_EQ(ReadAll(m_to), kNew);
        EXPECT_EQ(ReadAll(away), kNew);
        EXPECT_EQ(ReadAll(settings), "[section]\r\nfirst=2\r\n");
      });
  test::RemoveAll(away);
}

TEST_F(FailingCalls, AMoveWithoutRoomLeavesNothingElsewhere) {
  const Text away = WTEXT("C:\\dev\\shm\\qxcore-full") + m_folder.Path().substr(m_folder.Path().rfind('\\') + 1);
  if (!CreateDirectoryW(away.c_str(), nullptr)) GTEST_SKIP() << "no second file system";
  Put(m_from, kNew);
  {
    const test::FileSizeLimit full(1000);
    EXPECT_FALSE(MoveFileExW(m_from.c_str(), (away + WTEXT("\\to")).c_str(), MOVEFILE_COPY_ALLOWED));
  }
  EXPECT_EQ(ReadAll(m_from), kNew);
  EXPECT_TRUE(RemoveDirectoryW(away.c_str())) << "there is something in it";
  test::RemoveAll(away);
}

TEST_F(FailingCalls, InitialisationFiles) {
  const auto value = [&](const WCHAR* key) {
    WCHAR text[20];
    GetPrivateProfileStringW(WTEXT("section"), key, WTEXT("missing"), text, 20, m_to.c_str());
    return Text(text);
  };
  WithEachFailure(
      [&] { Put(m_to, "[section]\r\nfirst=1\r\nsecond=2\r\n"); },
      [&] { return WritePrivateProfileStringW(WTEXT("section"), WTEXT("first"), WTEXT("one"), m_to.c_str()) != FALSE; },
      [&](bool isDone) {
        EXPECT_EQ(value(WTEXT("second")), WTEXT("2"));
        if (isDone) {
          EXPECT_EQ(value(WTEXT("first")), WTEXT("one"));
        } else {
          EXPECT_NE(value(WTEXT("first")), WTEXT("missing"));
        }
      });
}

TEST_F(FailingCalls, Mappings) {
  for (const WCHAR* name : {static_cast<const WCHAR*>(nullptr), WTEXT(""), WTEXT("Local\\qxcore failing calls")}) {
    const bool isOfAFile = name == nullptr;
    WithEachFailure([&] { Put(m_to, kOld); },
                    [&] {
                      const HANDLE file = isOfAFile ? CreateFileW(m_to.c_str(), GENERIC_READ | GENERIC_WRITE, 0,
                                                                  nullptr, OPEN_EXISTING, 0, nullptr)
                                                    : INVALID_HANDLE_VALUE;
                      if (isOfAFile && file == INVALID_HANDLE_VALUE) return false;
                      const HANDLE mapping = CreateFileMappingW(file, nullptr, PAGE_READWRITE, 0, 80000, name);
                      bool isDone = mapping != nullptr;
                      char* const view =
                          isDone ? static_cast<char*>(MapViewOfFile(mapping, FILE_MAP_ALL_ACCESS, 0, 0, 0)) : nullptr;
                      isDone = view != nullptr;
                      if (isDone) {
                        view[79999] = 'm';
                        isDone = FlushViewOfFile(view, 0) != FALSE;
                        isDone = UnmapViewOfFile(view) && isDone;
                      }
                      if (mapping != nullptr) isDone = CloseHandle(mapping) && isDone;
                      if (isOfAFile) isDone = CloseHandle(file) && isDone;
                      return isDone;
                    },
                    [&](bool isDone) {
                      if (isDone && isOfAFile) {
                        EXPECT_EQ(ReadAll(m_to), kOld + std::string(9999, '\0') + "m");
                      }
                    });
  }
}

TEST_F(FailingCalls, FoldersAttributesAndNames) {
  const Text folder = m_folder.File(WTEXT("Sub Folder")), inner = folder + WTEXT("\\inner");
  WCHAR start[MAX_PATH];
  GetCurrentDirectoryW(MAX_PATH, start);
  WithEachFailure(
      [&] {
        SetCurrentDirectoryW(start);
        test::RemoveAll(folder);
        Put(m_to, kOld);
      },
      [&] {
        WCHAR text[MAX_PATH];
        WIN32_FILE_ATTRIBUTE_DATA data;
        WIN32_FIND_DATAW found;
        bool isDone = CreateDirectoryW(folder.c_str(), nullptr) && SetCurrentDirectoryW(folder.c_str()) &&
                      GetCurrentDirectoryW(MAX_PATH, text) != 0 && CreateDirectoryW(WTEXT("inner"), nullptr) &&
                      GetLongPathNameW((m_folder.Path() + WTEXT("\\sub folder\\INNER")).c_str(), text, MAX_PATH) != 0 &&
                      GetTempFileNameW(folder.c_str(), WTEXT("tmp"), 0, text) != 0 &&
                      SetFileAttributesW(m_to.c_str(), FILE_ATTRIBUTE_READONLY) &&
                      GetFileAttributesExW(m_to.c_str(), GetFileExInfoStandard, &data) &&
                      data.nFileSizeLow == kOld.size();
        const HANDLE search = isDone ? FindFirstFileW((folder + WTEXT("\\*")).c_str(), &found) : INVALID_HANDLE_VALUE;
        isDone = search != INVALID_HANDLE_VALUE;
        int entries = 1;
        while (isDone && FindNextFileW(search, &found)) ++entries;
        isDone = isDone && GetLastError() == ERROR_NO_MORE_FILES && entries == 4;
        if (search != INVALID_HANDLE_VALUE) isDone = FindClose(search) && isDone;
        return isDone && RemoveDirectoryW(inner.c_str());
      },
      [&](bool isDone) {
        EXPECT_EQ(ReadAll(m_to), kOld);
        if (isDone) {
          EXPECT_EQ(GetFileAttributesW(inner.c_str()), INVALID_FILE_ATTRIBUTES);
          EXPECT_EQ(GetFileAttributesW(m_to.c_str()) & FILE_ATTRIBUTE_READONLY, DWORD(FILE_ATTRIBUTE_READONLY));
        }
      });
  SetCurrentDirectoryW(start);
}

}  // namespace

#endif
