// Files and folders through the platform's calls: results and last errors are the same on both targets.

#include <gtest/gtest.h>

#include <set>
#include <string>

#include "tests/support/temp_folder.h"
#include "tests/support/wine.h"

#ifndef _WIN32
#include <fcntl.h>
#include <sys/stat.h>
#include <sys/wait.h>
#include <unistd.h>
#endif

namespace {

using test::ReadAll;
using test::TempFolder;
using test::Text;
using test::WriteAll;

// Documented, but not done by Wine 8: the new spelling of a file renamed to its own name, an invalid search handle.
#ifdef _WIN32
constexpr bool kUnderWine = true;
#else
constexpr bool kUnderWine = false;

std::string NativePath(const Text& path) {
  std::string native = test::Narrow(path).substr(2);
  for (char& c : native)
    if (c == '\\') c = '/';
  return native;
}
#endif

constexpr DWORD kShareAll = FILE_SHARE_READ | FILE_SHARE_WRITE | FILE_SHARE_DELETE;

HANDLE Open(const Text& path, DWORD access, DWORD disposition, DWORD share = kShareAll, DWORD flags = 0) {
  SetLastError(0xDEAD);
  return CreateFileW(path.c_str(), access, share, nullptr, disposition, flags, nullptr);
}

// Opens, closes, and returns the last error of the opening (0 when it says nothing).
DWORD OpenError(const Text& path, DWORD access, DWORD disposition, DWORD share = kShareAll, DWORD flags = 0) {
  const HANDLE file = Open(path, access, disposition, share, flags);
  const DWORD error = GetLastError();
  if (file == INVALID_HANDLE_VALUE) return error;
  CloseHandle(file);
  return error == ERROR_ALREADY_EXISTS ? error : 0;
}

TEST(Files, Dispositions) {
  TempFolder folder;
  const Text path = folder.File(WTEXT("a.txt"));
  EXPECT_EQ(OpenError(path, GENERIC_READ, OPEN_EXISTING), DWORD(ERROR_FILE_NOT_FOUND));
  EXPECT_EQ(OpenError(folder.File(WTEXT("no\\a.txt")), GENERIC_READ, OPEN_EXISTING), DWORD(ERROR_PATH_NOT_FOUND));
  EXPECT_EQ(OpenError(path, GENERIC_WRITE, TRUNCATE_EXISTING), DWORD(ERROR_FILE_NOT_FOUND));
  EXPECT_EQ(OpenError(path, GENERIC_WRITE, CREATE_NEW), 0u);
  EXPECT_EQ(OpenError(path, GENERIC_WRITE, CREATE_NEW), DWORD(ERROR_FILE_EXISTS));
  EXPECT_EQ(OpenError(path, GENERIC_WRITE, OPEN_ALWAYS), DWORD(ERROR_ALREADY_EXISTS));
  EXPECT_TRUE(WriteAll(path, "12345"));
  EXPECT_EQ(OpenError(path, GENERIC_WRITE, CREATE_ALWAYS), DWORD(ERROR_ALREADY_EXISTS));
  EXPECT_EQ(ReadAll(path), "");
  EXPECT_EQ(OpenError(folder.Path(), GENERIC_READ, OPEN_EXISTING), DWORD(ERROR_ACCESS_DENIED));
  EXPECT_EQ(OpenError(folder.File(WTEXT("a?b")), GENERIC_WRITE, CREATE_NEW), DWORD(ERROR_INVALID_NAME));
}

TEST(Files, RightsOfTheHandle) {
  TempFolder folder;
  const Text path = folder.File(WTEXT("a"));
  WriteAll(path, "x");
  DWORD done;
  char byte;
  HANDLE file = Open(path, GENERIC_READ, OPEN_EXISTING);
  EXPECT_FALSE(WriteFile(file, "y", 1, &done, nullptr));
  EXPECT_EQ(GetLastError(), DWORD(ERROR_ACCESS_DENIED));
  EXPECT_FALSE(SetEndOfFile(file));
  CloseHandle(file);
  file = Open(path, GENERIC_WRITE, OPEN_EXISTING);
  EXPECT_FALSE(ReadFile(file, &byte, 1, &done, nullptr));
  EXPECT_EQ(GetLastError(), DWORD(ERROR_ACCESS_DENIED));
  HANDLE twin = nullptr;
  EXPECT_TRUE(DuplicateHandle(GetCurrentProcess(), file, GetCurrentProcess(), &twin, 0, FALSE, DUPLICATE_SAME_ACCESS));
  EXPECT_TRUE(WriteFile(file, "ab", 2, &done, nullptr));
  CloseHandle(file);
  EXPECT_TRUE(WriteFile(twin, "cd", 2, &done, nullptr));  // one position for both
  CloseHandle(twin);
  EXPECT_EQ(ReadAll(path), "abcd");
}

// A second handle can do what it was asked for. By the published text it may in some cases do more than the first one,
// and does so with Wine; here it never is a way to more rights.
TEST(Files, DuplicatesHaveNoMoreRights) {
  TempFolder folder;
  const Text path = folder.File(WTEXT("a"));
  WriteAll(path, "abcdef");
  constexpr DWORD kRights[] = {GENERIC_READ, GENERIC_WRITE, GENERIC_READ | GENERIC_WRITE};
  for (const DWORD given : kRights) {
    for (const DWORD wanted : kRights) {
      const HANDLE file = Open(path, given, OPEN_EXISTING);
      HANDLE twin = nullptr;
      const bool isMade = DuplicateHandle(GetCurrentProcess(), file, GetCurrentProcess(), &twin, wanted, FALSE, 0);
      char byte = 'x';
      DWORD done;
      const bool reads = isMade && ReadFile(twin, &byte, 1, &done, nullptr);
      const bool writes = isMade && WriteFile(twin, &byte, 1, &done, nullptr);
      const DWORD both = given & wanted;
      if (wanted == both) {
        EXPECT_TRUE(isMade);
        EXPECT_EQ(reads, (both & GENERIC_READ) != 0) << given << " " << wanted;
        EXPECT_EQ(writes, (both & GENERIC_WRITE) != 0) << given << " " << wanted;
      }
      if (!IsWindows()) {
        EXPECT_FALSE(reads && (both & GENERIC_READ) == 0) << given << " " << wanted;
        EXPECT_FALSE(writes && (both & GENERIC_WRITE) == 0) << given << " " << wanted;
      }
      if (isMade) CloseHandle(twin);
      CloseHandle(file);
    }
  }
}

TEST(Files, SharingModes) {
  TempFolder folder;
  const Text path = folder.File(WTEXT("a"));
  WriteAll(path, "x");
  const HANDLE reader = Open(path, GENERIC_READ, OPEN_EXISTING, FILE_SHARE_READ);
  EXPECT_EQ(OpenError(path, GENERIC_READ, OPEN_EXISTING, FILE_SHARE_READ), 0u);
  EXPECT_EQ(OpenError(path, GENERIC_WRITE, OPEN_EXISTING), DWORD(ERROR_SHARING_VIOLATION));
  EXPECT_EQ(OpenError(path, GENERIC_READ, OPEN_EXISTING, FILE_SHARE_WRITE), DWORD(ERROR_SHARING_VIOLATION));
  EXPECT_FALSE(DeleteFileW(path.c_str()));
  EXPECT_EQ(GetLastError(), DWORD(ERROR_SHARING_VIOLATION));
  CloseHandle(reader);
  const HANDLE writer = Open(path, GENERIC_WRITE, OPEN_EXISTING, FILE_SHARE_READ);
  EXPECT_EQ(OpenError(path, GENERIC_READ, OPEN_EXISTING, FILE_SHARE_READ), DWORD(ERROR_SHARING_VIOLATION));
  EXPECT_EQ(OpenError(path, GENERIC_READ, OPEN_EXISTING, FILE_SHARE_READ | FILE_SHARE_WRITE), 0u);
  CloseHandle(writer);
  EXPECT_TRUE(DeleteFileW(path.c_str()));
}

TEST(Files, NamesWithoutRegardToCase) {
  TempFolder folder;
  ASSERT_TRUE(CreateDirectoryW(folder.File(WTEXT("Sub")).c_str(), nullptr));
  WriteAll(folder.File(WTEXT("Sub\\\x00C4rger.TXT")), "here");
  EXPECT_EQ(ReadAll(folder.File(WTEXT("SUB\\\x00E4rger.txt"))), "here");
  EXPECT_EQ(ReadAll(folder.File(WTEXT("sub/.././SUB/\x00E4RGER.txt"))), "here");
  EXPECT_EQ(OpenError(folder.File(WTEXT("sub\\\x00E4rger.TXT")), GENERIC_WRITE, CREATE_NEW), DWORD(ERROR_FILE_EXISTS));
  EXPECT_TRUE(
      MoveFileW(folder.File(WTEXT("sub\\\x00E4rger.txt")).c_str(), folder.File(WTEXT("sub\\\x00C4RGER.txt")).c_str()));
  WIN32_FIND_DATAW data;
  const HANDLE search = FindFirstFileW(folder.File(WTEXT("sub\\*.txt")).c_str(), &data);
  ASSERT_NE(search, INVALID_HANDLE_VALUE);
  if (!kUnderWine) {
    EXPECT_EQ(Text(data.cFileName), WTEXT("\x00C4RGER.txt"));
  }
  FindClose(search);
}

std::set<Text> Find(const TempFolder& folder, const WCHAR* mask) {
  std::set<Text> names;
  WIN32_FIND_DATAW data;
  const HANDLE search = FindFirstFileW(folder.File(mask).c_str(), &data);
  if (search == INVALID_HANDLE_VALUE) return names;
  do {
    names.insert(data.cFileName);
  } while (FindNextFileW(search, &data));
  EXPECT_EQ(GetLastError(), DWORD(ERROR_NO_MORE_FILES));
  FindClose(search);
  return names;
}

TEST(Files, Searching) {
  TempFolder folder;
  for (const WCHAR* name : {WTEXT("a.txt"), WTEXT("ab.txt"), WTEXT("b.tx"), WTEXT("c"), WTEXT("x.tar.gz")})
    WriteAll(folder.File(name), "12");
  using Names = std::set<Text>;
  EXPECT_EQ(Find(folder, WTEXT("*")).size(), 7u);  // with "." and ".."
  EXPECT_EQ(Find(folder, WTEXT("*.*")).size(), 7u);
  EXPECT_EQ(Find(folder, WTEXT("*.txt")), (Names{WTEXT("a.txt"), WTEXT("ab.txt")}));
  EXPECT_EQ(Find(folder, WTEXT("?.txt")), (Names{WTEXT("a.txt")}));
  EXPECT_EQ(Find(folder, WTEXT("A*.T?T")), (Names{WTEXT("a.txt"), WTEXT("ab.txt")}));
  EXPECT_EQ(Find(folder, WTEXT("x*.gz")), (Names{WTEXT("x.tar.gz")}));
  EXPECT_EQ(Find(folder, WTEXT("c")), (Names{WTEXT("c")}));
  EXPECT_EQ(Find(folder, (Text(400, '*') + WTEXT(".gz")).c_str()), (Names{WTEXT("x.tar.gz")}));
  if (!kUnderWine) {  // names without an extension, and dots that may be missing
    EXPECT_EQ(Find(folder, WTEXT("*.")), (Names{WTEXT("."), WTEXT(".."), WTEXT("c")}));
    EXPECT_EQ(Find(folder, WTEXT("c.*")), (Names{WTEXT("c")}));
    EXPECT_EQ(Find(folder, WTEXT("???.tx?")), (Names{WTEXT("a.txt"), WTEXT("ab.txt"), WTEXT("b.tx")}));
    EXPECT_EQ(Find(folder, WTEXT("x.*.gz")), (Names{WTEXT("x.tar.gz")}));
  }
  EXPECT_EQ(Find(folder, WTEXT("zz*")), Names{});
  EXPECT_EQ(GetLastError(), DWORD(ERROR_FILE_NOT_FOUND));
  EXPECT_EQ(Find(folder, WTEXT("no\\*")), Names{});
  EXPECT_EQ(GetLastError(), DWORD(ERROR_PATH_NOT_FOUND));
  WIN32_FIND_DATAW data;
  const HANDLE search = FindFirstFileW(folder.File(WTEXT("a.*")).c_str(), &data);
  EXPECT_EQ(data.nFileSizeLow, 2u);
  FindClose(search);
  if (kUnderWine) return;
  EXPECT_FALSE(FindClose(reinterpret_cast<HANDLE>(0x12344)));
  EXPECT_EQ(GetLastError(), DWORD(ERROR_INVALID_HANDLE));
}

// What the limit leaves out is neither a folder nor a link to one; it may leave out nothing.
TEST(FindFiles, LimitedToFolders) {
  TempFolder folder;
  ASSERT_TRUE(CreateDirectoryW(folder.File(WTEXT("inner")).c_str(), nullptr));
  WriteAll(folder.File(WTEXT("file")), "x");
#ifndef _WIN32
  const std::string native = NativePath(folder.Path());
  ASSERT_EQ(symlink("inner", (native + "/linked").c_str()), 0);
  ASSERT_EQ(mkfifo((native + "/pipe").c_str(), 0600), 0);
#endif
  const auto names = [&](FINDEX_SEARCH_OPS limit) {
    std::set<Text> found;
    WIN32_FIND_DATAW data;
    const HANDLE search = FindFirstFileExW(folder.File(WTEXT("*")).c_str(), FindExInfoBasic, &data, limit, nullptr, 0);
    for (BOOL more = search != INVALID_HANDLE_VALUE; more; more = FindNextFileW(search, &data))
      if ((data.dwFileAttributes & FILE_ATTRIBUTE_DIRECTORY) != 0 || limit != FindExSearchNameMatch)
        found.insert(data.cFileName);
    EXPECT_EQ(GetLastError(), DWORD(ERROR_NO_MORE_FILES));
    FindClose(search);
    return found;
  };
  const std::set<Text> folders = names(FindExSearchNameMatch);
  std::set<Text> limited = names(FindExSearchLimitToDirectories);
  EXPECT_EQ(folders.count(WTEXT("inner")), 1u);
#ifdef _WIN32
  limited.erase(WTEXT("file"));  // the limit is a hint
#else
  EXPECT_EQ(folders.count(WTEXT("linked")), 1u);
#endif
  EXPECT_EQ(limited, folders);
}

TEST(Files, CurrentDirectoryAndFullPaths) {
  TempFolder folder;
  WCHAR before[MAX_PATH], now[MAX_PATH], full[MAX_PATH];
  ASSERT_GT(GetCurrentDirectoryW(MAX_PATH, before), 0u);
  EXPECT_FALSE(SetCurrentDirectoryW(folder.File(WTEXT("none")).c_str()));
  EXPECT_EQ(GetLastError(), DWORD(ERROR_FILE_NOT_FOUND));
  ASSERT_TRUE(SetCurrentDirectoryW(folder.Path().c_str()));
  const DWORD length = GetCurrentDirectoryW(MAX_PATH, now);
  EXPECT_EQ(GetCurrentDirectoryW(length, now), length + 1);  // one too short for the terminator
  GetCurrentDirectoryW(MAX_PATH, now);
  EXPECT_NE(platform::WideFullPath(full, WTEXT("x\\..\\y.txt"), MAX_PATH), nullptr);
  EXPECT_EQ(Text(full), Text(now) + WTEXT("\\y.txt"));
  EXPECT_NE(platform::WideFullPath(full, WTEXT("C:/a/./b//c\\..\\"), MAX_PATH), nullptr);
  EXPECT_EQ(Text(full), WTEXT("C:\\a\\b\\"));
  EXPECT_NE(platform::WideFullPath(full, WTEXT("\\\\server\\share\\..\\x"), MAX_PATH), nullptr);
  EXPECT_EQ(Text(full), WTEXT("\\\\server\\share\\x"));
  EXPECT_EQ(platform::WideFullPath(full, WTEXT("C:\\abc"), 6), nullptr);
  WriteAll(WTEXT("relative"), "r");
  EXPECT_EQ(ReadAll(folder.File(WTEXT("relative"))), "r");
  ASSERT_TRUE(SetCurrentDirectoryW(before));
}

TEST(Files, RuntimeStreams) {
  TempFolder folder;
  const Text path = folder.File(WTEXT("\x65E5.bin"));
  std::FILE* file = platform::WideFileOpen(path.c_str(), WTEXT("wb"));
  ASSERT_NE(file, nullptr);
  std::fputs("line\r\n", file);
  EXPECT_EQ(platform::FileTell(file), 6);
  const std::int64_t further = std::int64_t{5} << 30;
  EXPECT_EQ(platform::FileSeek(file, further, SEEK_CUR), 0);
  EXPECT_EQ(platform::FileTell(file), further + 6);
  EXPECT_EQ(platform::FileSeek(file, 2, SEEK_SET), 0);
  EXPECT_EQ(platform::FileTell(file), 2);
  EXPECT_NE(platform::FileSeek(file, -1, SEEK_SET), 0);
  std::fclose(file);
  EXPECT_EQ(ReadAll(path), "line\r\n");
  EXPECT_EQ(platform::WideFileOpen(folder.Path().c_str(), WTEXT("rb")), nullptr);
  EXPECT_EQ(errno, EACCES);
  EXPECT_EQ(platform::WideFileOpen(folder.File(WTEXT("none")).c_str(), WTEXT("rb")), nullptr);
  EXPECT_EQ(errno, ENOENT);
}

#ifndef _WIN32

// Names that Windows cannot hold come mapped, and every one can be opened and renamed under its mapped name.
TEST(FilesOnLinux, ForeignNamesMapBothWays) {
  TempFolder folder;
  const std::string native = NativePath(folder.Path());
  const std::string names[] = {"a:b",          "what?",  "tab\there", "latin\xE9", "back\\slash", "private\xEF\x81\x81",
                               "\xED\xA0\x80", "trail. "};
  for (const std::string& name : names) {
    const int file = open((native + "/" + name).c_str(), O_CREAT | O_WRONLY, 0666);
    ASSERT_GE(file, 0);
    ASSERT_EQ(write(file, name.data(), name.size()), ssize_t(name.size()));
    close(file);
  }
  WIN32_FIND_DATAW data;
  std::set<std::string> seen;
  const HANDLE search = FindFirstFileW(folder.File(WTEXT("*")).c_str(), &data);
  do {
    if ((data.dwFileAttributes & FILE_ATTRIBUTE_DIRECTORY) == 0) seen.insert(ReadAll(folder.File(data.cFileName)));
  } while (FindNextFileW(search, &data));
  FindClose(search);
  EXPECT_EQ(seen, std::set<std::string>(std::begin(names), std::end(names)));
  EXPECT_EQ(ReadAll(folder.File(WTEXT("a\xF03A"
                                      "b"))),
            "a:b");
  EXPECT_EQ(ReadAll(folder.File(WTEXT("latin\xF0E9"))), "latin\xE9");
  EXPECT_TRUE(MoveFileW(folder.File(WTEXT("latin\xF0E9")).c_str(), folder.File(WTEXT("q\xF03F")).c_str()));
  EXPECT_EQ(access((native + "/q?").c_str(), F_OK), 0);
}

TEST(FilesOnLinux, Links) {
  TempFolder folder;
  const std::string native = NativePath(folder.Path());
  CreateDirectoryW(folder.File(WTEXT("real")).c_str(), nullptr);
  WriteAll(folder.File(WTEXT("real\\f")), "123");
  ASSERT_EQ(symlink("real", (native + "/linked").c_str()), 0);
  ASSERT_EQ(symlink("nowhere", (native + "/dangling").c_str()), 0);
  EXPECT_EQ(GetFileAttributesW(folder.File(WTEXT("linked")).c_str()),
            DWORD(FILE_ATTRIBUTE_REPARSE_POINT | FILE_ATTRIBUTE_DIRECTORY));
  EXPECT_TRUE(GetFileAttributesW(folder.File(WTEXT("dangling")).c_str()) & FILE_ATTRIBUTE_REPARSE_POINT);
  EXPECT_EQ(ReadAll(folder.File(WTEXT("linked\\f"))), "123");
  EXPECT_EQ(OpenError(folder.File(WTEXT("dangling")), GENERIC_READ, OPEN_EXISTING), DWORD(ERROR_FILE_NOT_FOUND));
  EXPECT_TRUE(DeleteFileW(folder.File(WTEXT("dangling")).c_str()));
  EXPECT_TRUE(RemoveDirectoryW(folder.File(WTEXT("linked")).c_str()));
  EXPECT_EQ(ReadAll(folder.File(WTEXT("real\\f"))), "123");
}

// The prefix for long paths means nothing more in front of a drive; alone it is a server's name.
TEST(FilesOnLinux, ThePrefixForLongPaths) {
  WCHAR full[MAX_PATH];
  const auto fullPath = [&full](const WCHAR* path) {
    EXPECT_GT(GetFullPathNameW(path, MAX_PATH, full, nullptr), 0u);
    return Text(full);
  };
  EXPECT_EQ(fullPath(WTEXT("\\\\?\\C:\\a\\..\\b")), WTEXT("C:\\b"));
  EXPECT_EQ(fullPath(WTEXT("\\\\?\\")), WTEXT("\\\\?\\"));
  EXPECT_EQ(fullPath(WTEXT("\\\\?\\x\\y")), WTEXT("\\\\?\\x\\y"));
  EXPECT_EQ(fullPath(WTEXT("C:\\..\\.a\\b.\\..c\\")), WTEXT("C:\\.a\\b.\\..c\\"));
}

// The sharing mode holds against another process.
TEST(FilesOnLinux, SharingBetweenProcesses) {
  TempFolder folder;
  const Text path = folder.File(WTEXT("a"));
  WriteAll(path, "x");
  const HANDLE file = Open(path, GENERIC_WRITE, OPEN_EXISTING, 0);
  const pid_t child = fork();
  if (child == 0) {
    const HANDLE other = CreateFileW(path.c_str(), GENERIC_READ, kShareAll, nullptr, OPEN_EXISTING, 0, nullptr);
    _exit(other == INVALID_HANDLE_VALUE && GetLastError() == ERROR_SHARING_VIOLATION ? 7 : 1);
  }
  int status = 0;
  waitpid(child, &status, 0);
  EXPECT_EQ(WEXITSTATUS(status), 7);
  CloseHandle(file);
}

TEST(FilesOnLinux, FullDiskAndOtherDevices) {
  const HANDLE full = Open(WTEXT("C:\\dev\\full"), GENERIC_WRITE, OPEN_EXISTING);
  ASSERT_NE(full, INVALID_HANDLE_VALUE);
  DWORD done = 0;
  EXPECT_FALSE(WriteFile(full, "x", 1, &done, nullptr));
  EXPECT_EQ(GetLastError(), DWORD(ERROR_DISK_FULL));
  CloseHandle(full);
  EXPECT_EQ(OpenError(WTEXT("D:\\x"), GENERIC_READ, OPEN_EXISTING), DWORD(ERROR_PATH_NOT_FOUND));
  EXPECT_EQ(OpenError(WTEXT("\\\\server\\share\\x"), GENERIC_READ, OPEN_EXISTING), DWORD(ERROR_BAD_NETPATH));
}
#endif

#ifndef _WIN32
// Where a name cannot just change: the content moves, with its times and rights, or nothing does.
TEST(Files, MovesToAnotherFileSystem) {
  TempFolder folder;
  const Text away = WTEXT("C:\\dev\\shm\\qxcore-test") + folder.Path().substr(folder.Path().rfind('\\') + 1);
  if (!CreateDirectoryW(away.c_str(), nullptr)) GTEST_SKIP() << "no second file system";
  const Text from = folder.File(WTEXT("from.txt")), to = away + WTEXT("\\to.txt");
  const std::string content(300000, 'm');
  ASSERT_TRUE(WriteAll(from, content));
  SetLastError(0);
  if (MoveFileExW(from.c_str(), to.c_str(), 0)) {
    test::RemoveAll(away);
    GTEST_SKIP() << "one file system only";
  }
  EXPECT_EQ(GetLastError(), DWORD(ERROR_NOT_SAME_DEVICE));
  EXPECT_TRUE(MoveFileExW(from.c_str(), to.c_str(), MOVEFILE_COPY_ALLOWED));
  EXPECT_EQ(ReadAll(to), content);
  EXPECT_EQ(GetFileAttributesW(from.c_str()), INVALID_FILE_ATTRIBUTES);
  ASSERT_TRUE(WriteAll(from, "newer"));
  EXPECT_FALSE(MoveFileW(from.c_str(), to.c_str()));
  EXPECT_EQ(GetLastError(), DWORD(ERROR_ALREADY_EXISTS));
  EXPECT_EQ(ReadAll(to), content);
  EXPECT_TRUE(MoveFileExW(from.c_str(), to.c_str(), MOVEFILE_COPY_ALLOWED | MOVEFILE_REPLACE_EXISTING));
  EXPECT_EQ(ReadAll(to), "newer");
  // Folders do not move that way.
  CreateDirectoryW(folder.File(WTEXT("sub")).c_str(), nullptr);
  EXPECT_FALSE(MoveFileExW(folder.File(WTEXT("sub")).c_str(), (away + WTEXT("\\sub")).c_str(), MOVEFILE_COPY_ALLOWED));
  EXPECT_NE(GetFileAttributesW(folder.File(WTEXT("sub")).c_str()), INVALID_FILE_ATTRIBUTES);
  test::RemoveAll(away);
}
#endif

}  // namespace
