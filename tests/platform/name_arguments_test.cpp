// Names of files and folders that are missing, odd or too long, and what must stay as it is. Linux only, because the
// other system does not look at all of them.

#ifndef _WIN32

#include <gtest/gtest.h>
#include <unistd.h>

#include <algorithm>
#include <cstdlib>
#include <string>

#include "qxcore/platform/wide.h"
#include "tests/support/last_error.h"
#include "tests/support/temp_folder.h"

namespace {

using test::ReadAll;
using test::TempFolder;
using test::Text;
using test::WriteAll;

constexpr DWORD kBadParameter = ERROR_INVALID_PARAMETER, kBadHandle = ERROR_INVALID_HANDLE;

TEST(NameArguments, AreLookedAt) {
  TempFolder folder;
  WCHAR text[MAX_PATH] = u"former", *part = text;
  EXPECT_EQ(ErrorOf([] { return SetCurrentDirectoryW(nullptr); }), DWORD(ERROR_INVALID_NAME));
  EXPECT_EQ(ErrorOf([] { return SetCurrentDirectoryW(u""); }), DWORD(ERROR_INVALID_NAME));
  EXPECT_EQ(ErrorOf([&] { return GetFullPathNameW(nullptr, MAX_PATH, text, &part); }), DWORD(ERROR_INVALID_NAME));
  EXPECT_EQ(part, nullptr);
  EXPECT_EQ(ErrorOf([&] { return GetFullPathNameW(u"", MAX_PATH, text, nullptr); }), DWORD(ERROR_INVALID_NAME));
  EXPECT_EQ(ErrorOf([&] { return GetTempFileNameW(nullptr, u"p", 0, text); }), kBadParameter);
  EXPECT_EQ(ErrorOf([&] { return GetTempFileNameW(folder.Path().c_str(), u"p", 0, nullptr); }), kBadParameter);
  EXPECT_EQ(ErrorOf([&] { return GetTempFileNameW(u"", u"p", 0, text); }), DWORD(ERROR_DIRECTORY));
  EXPECT_EQ(ErrorOf([&] { return GetLongPathNameW(nullptr, text, MAX_PATH); }), kBadParameter);
  EXPECT_EQ(ErrorOf([&] { return GetShortPathNameW(nullptr, text, MAX_PATH); }), kBadParameter);
  EXPECT_EQ(ErrorOf([&] { return GetShortPathNameW(u"", text, MAX_PATH); }), DWORD(ERROR_BAD_PATHNAME));
  EXPECT_EQ(ErrorOf([&] { return CopyFileW(nullptr, u"x", FALSE); }), kBadParameter);
  EXPECT_EQ(ErrorOf([&] { return CopyFileW(u"x", nullptr, FALSE); }), kBadParameter);
  EXPECT_EQ(ErrorOf([&] { return MoveFileExW(u"x", nullptr, 0); }), kBadParameter);
  EXPECT_EQ(ErrorOf([&] { return MoveFileExW(u"x", u"y", 0x80); }), kBadParameter);
  EXPECT_EQ(ErrorOf([&] { return GetFileAttributesExW(u"x", GetFileExInfoStandard, nullptr); }), kBadParameter);
  ULARGE_INTEGER room;
  EXPECT_EQ(ErrorOf([&] { return GetDiskFreeSpaceExW(u"\\\\server\\share", &room, nullptr, nullptr); }),
            DWORD(ERROR_BAD_NETPATH));
  ASSERT_TRUE(WriteAll(folder.File(u"f"), "1"));
  EXPECT_EQ(ErrorOf([&] { return GetDiskFreeSpaceExW(folder.File(u"f").c_str(), &room, nullptr, nullptr); }),
            DWORD(ERROR_DIRECTORY));
  EXPECT_EQ(ErrorOf([&] { return SetCurrentDirectoryW(folder.File(u"f").c_str()); }), DWORD(ERROR_DIRECTORY));
  EXPECT_EQ(GetSystemDirectoryW(nullptr, 0), GetSystemDirectoryW(text, MAX_PATH) + 1);
  EXPECT_EQ(GetWindowsDirectoryW(text, 2), GetWindowsDirectoryW(text, MAX_PATH) + 1);
}

TEST(NameArguments, TheTemporaryFolderIsAnAbsolutePath) {
  const char* const former = std::getenv("TMPDIR");
  const std::string kept = former != nullptr ? former : "";
  WCHAR text[MAX_PATH];
  const auto with = [&](const char* folder) {
    setenv("TMPDIR", folder, 1);
    GetTempPathW(MAX_PATH, text);
    return Text(text);
  };
  EXPECT_EQ(with("/"), u"C:\\");
  EXPECT_EQ(with("/var/tmp"), u"C:\\var\\tmp\\");
  EXPECT_EQ(with("/var//tmp/"), u"C:\\var\\tmp\\");
  EXPECT_EQ(with("relative"), u"C:\\tmp\\");
  EXPECT_EQ(with(""), u"C:\\tmp\\");
  unsetenv("TMPDIR");
  GetTempPathW(MAX_PATH, text);
  EXPECT_EQ(Text(text), u"C:\\tmp\\");
  if (former != nullptr) setenv("TMPDIR", kept.c_str(), 1);
}

TEST(NameArguments, FullPathsOfEveryForm) {
  WCHAR text[MAX_PATH], start[MAX_PATH];
  GetCurrentDirectoryW(MAX_PATH, start);
  const Text here(start);
  const struct {
    Text given, full;
  } cases[] = {{u"C:\\a/b", u"C:\\a\\b"},
               {u"C:\\a\\\\b", u"C:\\a\\b"},
               {u"C:\\a\\.\\b", u"C:\\a\\b"},
               {u"C:\\a\\..\\b", u"C:\\b"},
               {u"C:\\..\\..\\b", u"C:\\b"},
               {u"C:\\a\\./b", u"C:\\a\\b"},
               {u"C:\\.hidden\\..x", u"C:\\.hidden\\..x"},
               {u"c:x", here + u"\\x"},
               {u"C:", here},
               {u"z:x", u"z:\\x"},
               {u"\\a\\..", u"C:\\"},
               {u"\\\\?\\C:\\x", u"C:\\x"},
               {u"\\\\server", u"\\\\server"},
               {u"//server/share", u"\\\\server\\share"},
               {u"\\\\server\\share\\a\\..\\..\\b\\", u"\\\\server\\share\\b\\"},
               {u"1:\\x", here + u"\\1:\\x"}};
  for (const auto& each : cases) {
    ASSERT_NE(GetFullPathNameW(each.given.c_str(), MAX_PATH, text, nullptr), 0u);
    EXPECT_EQ(Text(text), each.full);
  }
  EXPECT_EQ(GetFileAttributesW(u"Z:\\"), INVALID_FILE_ATTRIBUTES) << "there is one drive";
  EXPECT_EQ(GetLastError(), DWORD(ERROR_PATH_NOT_FOUND));
}

TEST(NameArguments, AFolderIsMovedToANameWithABackslashBehindIt) {
  TempFolder folder;
  ASSERT_TRUE(CreateDirectoryW(folder.File(u"from").c_str(), nullptr));
  ASSERT_TRUE(WriteAll(folder.File(u"from\\f"), "1"));
  EXPECT_TRUE(MoveFileW(folder.File(u"from").c_str(), folder.File(u"To\\").c_str())) << GetLastError();
  WIN32_FIND_DATAW data;
  const HANDLE search = FindFirstFileW(folder.File(u"to").c_str(), &data);
  ASSERT_NE(search, INVALID_HANDLE_VALUE);
  EXPECT_EQ(Text(data.cFileName), u"To");
  FindClose(search);
  EXPECT_EQ(ReadAll(folder.File(u"To\\f")), "1");
}

TEST(NameArguments, TheRootHasNoFoldersAboveIt) {
  WIN32_FIND_DATAW data;
  const HANDLE search = FindFirstFileW(u"C:\\*", &data);
  ASSERT_NE(search, INVALID_HANDLE_VALUE);
  int entries = 0;
  do {
    EXPECT_NE(Text(data.cFileName), u".");
    EXPECT_NE(Text(data.cFileName), u"..");
    ++entries;
  } while (FindNextFileW(search, &data));
  EXPECT_GT(entries, 5);
  FindClose(search);
}

TEST(NameArguments, ACurrentDirectoryOfAnyLength) {
  TempFolder folder;
  WCHAR start[MAX_PATH];
  GetCurrentDirectoryW(MAX_PATH, start);
  ASSERT_TRUE(SetCurrentDirectoryW(folder.Path().c_str()));
  Text expected = folder.Path();
  const Text part(90, u'd');
  for (int depth = 0; depth < 8; ++depth) {
    ASSERT_TRUE(CreateDirectoryW(part.c_str(), nullptr) && SetCurrentDirectoryW(part.c_str()));
    expected += u'\\' + part;
    Text now(1000, u'\0');
    now.resize(GetCurrentDirectoryW(1000, now.data()));
    EXPECT_EQ(now, expected);
  }
  SetCurrentDirectoryW(start);
}

// What is at the end of a path, what must not be changed, and what leads elsewhere.
TEST(NameArguments, FilesAndFoldersThatStayAsTheyAre) {
  TempFolder folder;
  const Text file = folder.File(u"f"), other = folder.File(u"g"), sub = folder.File(u"sub");
  ASSERT_TRUE(WriteAll(file, "1") && WriteAll(other, "2") && CreateDirectoryW(sub.c_str(), nullptr));
  const auto open = [](const Text& path, DWORD access, DWORD disposition, DWORD flags = 0) {
    const HANDLE handle = CreateFileW(path.c_str(), access, 0, nullptr, disposition, flags, nullptr);
    return handle != INVALID_HANDLE_VALUE && CloseHandle(handle);
  };
  EXPECT_EQ(ErrorOf([&] { return open(file + u"\\", GENERIC_READ, OPEN_EXISTING); }), DWORD(ERROR_INVALID_NAME));
  EXPECT_EQ(ErrorOf([&] { return open(folder.File(u"new\\"), GENERIC_WRITE, CREATE_NEW); }), DWORD(ERROR_INVALID_NAME));
  EXPECT_EQ(ErrorOf([&] { return open(sub, GENERIC_WRITE, OPEN_EXISTING, FILE_FLAG_BACKUP_SEMANTICS); }),
            DWORD(ERROR_ACCESS_DENIED));
  WCHAR text[MAX_PATH];
  EXPECT_EQ(ErrorOf([&] { return GetLongPathNameW((file + u"\\").c_str(), text, MAX_PATH); }),
            DWORD(ERROR_FILE_NOT_FOUND));
  SetFileAttributesW(other.c_str(), FILE_ATTRIBUTE_READONLY);
  EXPECT_EQ(ErrorOf([&] { return open(other, GENERIC_READ, CREATE_ALWAYS); }), DWORD(ERROR_ACCESS_DENIED));
  EXPECT_EQ(ErrorOf([&] { return open(other, GENERIC_READ | GENERIC_WRITE, TRUNCATE_EXISTING); }),
            DWORD(ERROR_ACCESS_DENIED));
  EXPECT_EQ(ErrorOf([&] { return open(other, GENERIC_READ, OPEN_EXISTING, FILE_FLAG_DELETE_ON_CLOSE); }),
            DWORD(ERROR_ACCESS_DENIED));
  EXPECT_EQ(ErrorOf([&] { return MoveFileExW(file.c_str(), other.c_str(), MOVEFILE_REPLACE_EXISTING); }),
            DWORD(ERROR_ACCESS_DENIED));
  EXPECT_EQ(ErrorOf([&] { return MoveFileExW(file.c_str(), sub.c_str(), MOVEFILE_REPLACE_EXISTING); }),
            DWORD(ERROR_ACCESS_DENIED));
  EXPECT_EQ(ErrorOf([&] { return MoveFileW(sub.c_str(), folder.File(u"sub\\below").c_str()); }),
            DWORD(ERROR_ACCESS_DENIED))
      << "a folder into itself";
  EXPECT_EQ(ReadAll(file) + ReadAll(other), "12");
  std::string native = test::Narrow(folder.Path()).substr(2);
  std::replace(native.begin(), native.end(), '\\', '/');
  ASSERT_EQ(symlink("sub", (native + "/link").c_str()), 0);
  EXPECT_EQ(ErrorOf([&] { return DeleteFileW(folder.File(u"link").c_str()); }), DWORD(ERROR_ACCESS_DENIED))
      << "a link to a folder is a folder";
  EXPECT_TRUE(RemoveDirectoryW(folder.File(u"link").c_str()));
  EXPECT_NE(GetFileAttributesW(sub.c_str()), INVALID_FILE_ATTRIBUTES);
  GetCurrentDirectoryW(MAX_PATH, text);
  ASSERT_TRUE(SetCurrentDirectoryW(sub.c_str()));
  EXPECT_EQ(ErrorOf([&] { return RemoveDirectoryW(sub.c_str()); }), DWORD(ERROR_SHARING_VIOLATION));
  SetCurrentDirectoryW(text);
  EXPECT_EQ(ErrorOf([] { return RemoveDirectoryW(u"C:\\"); }), DWORD(ERROR_DIR_NOT_EMPTY));
  WIN32_FIND_DATAW data;
  EXPECT_EQ(ErrorOf([&] { return FindFirstFileW(nullptr, &data) != INVALID_HANDLE_VALUE; }),
            DWORD(ERROR_PATH_NOT_FOUND));
  EXPECT_EQ(ErrorOf([&] { return FindFirstFileW(u"", &data) != INVALID_HANDLE_VALUE; }), DWORD(ERROR_PATH_NOT_FOUND));
  EXPECT_EQ(ErrorOf([&] {
              return FindFirstFileExW(u"*", FindExInfoStandard, &data, FindExSearchNameMatch, &data, 0) !=
                     INVALID_HANDLE_VALUE;
            }),
            kBadParameter);
  const HANDLE handle = CreateFileW(file.c_str(), GENERIC_READ, 0, nullptr, OPEN_EXISTING, 0, nullptr);
  EXPECT_EQ(ErrorOf([&] { return FindNextFileW(handle, &data); }), kBadHandle) << "no search";
  CloseHandle(handle);
}

}  // namespace

#endif
