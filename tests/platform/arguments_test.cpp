// What the calls of the portable layer answer to arguments that are missing, contradict themselves or are larger than
// anything: the published errors, and nothing done. Linux only, because the other system does not look at all of them.

#ifndef _WIN32

#include <gtest/gtest.h>
#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <cmath>
#include <cstdio>
#include <cstdlib>
#include <random>
#include <string>
#include <vector>

#include "qxcore/platform/module.h"
#include "qxcore/platform/wide.h"
#include "tests/support/registry_root.h"
#include "tests/support/temp_folder.h"

namespace {

using test::ReadAll;
using test::RegistryRoot;
using test::TempFolder;
using test::Text;
using test::WriteAll;

constexpr DWORD kBadParameter = ERROR_INVALID_PARAMETER, kBadHandle = ERROR_INVALID_HANDLE;

// Clears the last error, calls, and returns the error of a call that must fail.
template <class Call>
DWORD ErrorOf(Call call) {
  SetLastError(0xDEAD);
  EXPECT_FALSE(call());
  return GetLastError();
}

LSTATUS Code(DWORD code) { return static_cast<LSTATUS>(code); }

// --- the registry ---

TEST(RegistryArguments, AreLookedAt) {
  const RegistryRoot root;
  HKEY key = nullptr;
  EXPECT_EQ(RegOpenKeyExW(HKEY_CURRENT_USER, u"", 0, KEY_READ, nullptr), Code(kBadParameter));
  EXPECT_EQ(RegCreateKeyExW(HKEY_CURRENT_USER, u"x", 0, nullptr, 0, KEY_READ, nullptr, nullptr, nullptr),
            Code(kBadParameter));
  EXPECT_EQ(RegCreateKeyExW(HKEY_CURRENT_USER, nullptr, 0, nullptr, 0, KEY_READ, nullptr, &key, nullptr),
            Code(kBadParameter));
  EXPECT_EQ(RegDeleteKeyW(HKEY_CURRENT_USER, nullptr), Code(kBadParameter));
  EXPECT_EQ(RegDeleteKeyW(HKEY_CURRENT_USER, u""), Code(ERROR_ACCESS_DENIED)) << "a root stays";
  EXPECT_EQ(RegOpenKeyExW(HKEY_CURRENT_USER, u"\\x", 0, KEY_READ, &key), Code(ERROR_BAD_PATHNAME));
  EXPECT_EQ(RegOpenKeyExW(HKEY_CURRENT_USER, nullptr, 0, KEY_READ, &key), 0) << "the key once more";
  WCHAR name[20];
  DWORD length = 20, size = 4;
  BYTE bytes[4];
  EXPECT_EQ(RegEnumKeyExW(key, 0, nullptr, &length, nullptr, nullptr, nullptr, nullptr), Code(kBadParameter));
  EXPECT_EQ(RegEnumKeyExW(key, 0, name, nullptr, nullptr, nullptr, nullptr, nullptr), Code(kBadParameter));
  EXPECT_EQ(RegEnumValueW(key, 0, nullptr, &length, nullptr, nullptr, nullptr, nullptr), Code(kBadParameter));
  EXPECT_EQ(RegEnumValueW(key, 0, name, nullptr, nullptr, nullptr, nullptr, nullptr), Code(kBadParameter));
  EXPECT_EQ(RegEnumValueW(key, 0, name, &length, nullptr, nullptr, bytes, nullptr), Code(kBadParameter));
  EXPECT_EQ(RegQueryValueExW(key, u"x", nullptr, nullptr, bytes, nullptr), Code(kBadParameter));
  EXPECT_EQ(RegSetValueExW(key, u"x", 0, REG_BINARY, nullptr, 4), Code(ERROR_NOACCESS));
  EXPECT_EQ(RegSetValueExW(key, Text(16384, u'n').c_str(), 0, REG_BINARY, bytes, 4), Code(kBadParameter));
  EXPECT_EQ(RegQueryValueExW(key, u"absent", nullptr, nullptr, nullptr, &size), Code(ERROR_FILE_NOT_FOUND));
  EXPECT_EQ(size, 0u);
  EXPECT_EQ(RegCloseKey(key), 0);
  EXPECT_EQ(RegCloseKey(key), Code(kBadHandle)) << "it is closed";
  EXPECT_EQ(RegCloseKey(HKEY_CURRENT_USER), 0) << "a root is always open";
}

TEST(RegistryArguments, GenericRightsAndClasses) {
  const RegistryRoot root;
  HKEY key = nullptr;
  ASSERT_EQ(
      RegCreateKeyExW(HKEY_CURRENT_USER, RegistryRoot::Path(), 0, nullptr, 0, KEY_ALL_ACCESS, nullptr, &key, nullptr),
      0);
  const BYTE byte = 7;
  ASSERT_EQ(RegSetValueExW(key, u"v", 0, REG_BINARY, &byte, 1), 0);
  constexpr DWORD kMaximum = 0x02000000, kGenericAll = 0x10000000;
  const struct {
    DWORD access;
    bool reads, writes;
  } cases[] = {{GENERIC_READ, true, false},
               {GENERIC_WRITE, false, true},
               {kMaximum, true, true},
               {kGenericAll, true, true},
               {0, false, false}};
  for (const auto& each : cases) {
    HKEY again = nullptr;
    ASSERT_EQ(RegOpenKeyExW(key, u"", 0, each.access, &again), 0);
    EXPECT_EQ(RegQueryValueExW(again, u"v", nullptr, nullptr, nullptr, nullptr) == 0, each.reads) << each.access;
    EXPECT_EQ(RegSetValueExW(again, u"v", 0, REG_BINARY, &byte, 1) == 0, each.writes) << each.access;
    RegCloseKey(again);
  }
  HKEY child = nullptr;
  ASSERT_EQ(RegCreateKeyExW(key, u"child", 0, nullptr, 0, KEY_ALL_ACCESS, nullptr, &child, nullptr), 0);
  RegCloseKey(child);
  WCHAR name[20], className[20] = u"former";
  DWORD length = 20, classLength = 20;
  FILETIME time;
  EXPECT_EQ(RegEnumKeyExW(key, 0, name, &length, nullptr, className, &classLength, &time), 0);
  EXPECT_EQ(Text(name), u"child");
  EXPECT_EQ(Text(className), u"");
  EXPECT_EQ(classLength, 0u);
  RegCloseKey(key);
}

// --- handles ---

TEST(HandleArguments, AreLookedAt) {
  TempFolder folder;
  const Text path = folder.File(u"f");
  ASSERT_TRUE(WriteAll(path, "12345"));
  char bytes[4];
  DWORD done = 9;
  LARGE_INTEGER size;
  FILETIME time;
  auto* const overlapped = reinterpret_cast<OVERLAPPED*>(bytes);
  size.QuadPart = 0;
  std::vector<HANDLE> wrong = {nullptr, reinterpret_cast<HANDLE>(std::uintptr_t{5}),
                               reinterpret_cast<HANDLE>(std::uintptr_t{4000000}), INVALID_HANDLE_VALUE};
  for (const HANDLE handle : wrong) {
    EXPECT_EQ(ErrorOf([&] { return CloseHandle(handle); }), kBadHandle);
    EXPECT_EQ(ErrorOf([&] { return ReadFile(handle, bytes, 1, &done, nullptr); }), kBadHandle);
    EXPECT_EQ(ErrorOf([&] { return WriteFile(handle, bytes, 1, &done, nullptr); }), kBadHandle);
    EXPECT_EQ(ErrorOf([&] { return SetFilePointerEx(handle, size, nullptr, FILE_BEGIN); }), kBadHandle);
    EXPECT_EQ(ErrorOf([&] { return SetEndOfFile(handle); }), kBadHandle);
    EXPECT_EQ(ErrorOf([&] { return FlushFileBuffers(handle); }), kBadHandle);
    EXPECT_EQ(ErrorOf([&] { return GetFileSizeEx(handle, &size); }), kBadHandle);
    EXPECT_EQ(ErrorOf([&] { return GetFileSize(handle, nullptr) != INVALID_FILE_SIZE; }), kBadHandle);
    EXPECT_EQ(ErrorOf([&] { return GetFileTime(handle, &time, nullptr, nullptr); }), kBadHandle);
    EXPECT_EQ(ErrorOf([&] { return FindClose(handle); }), kBadHandle);
    HANDLE twin = nullptr;
    EXPECT_EQ(ErrorOf([&] {
                return DuplicateHandle(GetCurrentProcess(), handle, GetCurrentProcess(), &twin, 0, FALSE,
                                       DUPLICATE_SAME_ACCESS);
              }),
              kBadHandle);
  }
  const HANDLE file = CreateFileW(path.c_str(), GENERIC_READ | GENERIC_WRITE, 0, nullptr, OPEN_EXISTING, 0, nullptr);
  ASSERT_NE(file, INVALID_HANDLE_VALUE);
  EXPECT_EQ(ErrorOf([&] { return ReadFile(file, bytes, 1, nullptr, nullptr); }), kBadParameter);
  EXPECT_EQ(ErrorOf([&] { return ReadFile(file, bytes, 1, &done, overlapped); }), kBadParameter);
  EXPECT_EQ(ErrorOf([&] { return WriteFile(file, bytes, 1, nullptr, nullptr); }), kBadParameter);
  EXPECT_EQ(ErrorOf([&] { return WriteFile(file, bytes, 1, &done, overlapped); }), kBadParameter);
  HANDLE twin = nullptr;
  EXPECT_FALSE(DuplicateHandle(file, file, GetCurrentProcess(), &twin, 0, FALSE, 0)) << "another process";
  EXPECT_FALSE(DuplicateHandle(GetCurrentProcess(), file, file, &twin, 0, FALSE, 0));
  EXPECT_FALSE(DuplicateHandle(GetCurrentProcess(), file, GetCurrentProcess(), nullptr, 0, FALSE, 0));
  // The size that is the sign of failure in one half.
  size.QuadPart = 0x1FFFFFFFF;
  EXPECT_TRUE(SetFilePointerEx(file, size, nullptr, FILE_BEGIN) && SetEndOfFile(file));
  DWORD high = 0;
  SetLastError(0xDEAD);
  EXPECT_EQ(GetFileSize(file, &high), INVALID_FILE_SIZE);
  EXPECT_EQ(high, 1u);
  EXPECT_EQ(GetLastError(), DWORD(NO_ERROR));
  CloseHandle(file);
}

TEST(HandleArguments, DevicesAreOpenedAndEmptiedLikeFiles) {
  const HANDLE null = CreateFileW(u"C:\\dev\\null", GENERIC_WRITE, 0, nullptr, CREATE_ALWAYS, 0, nullptr);
  ASSERT_NE(null, INVALID_HANDLE_VALUE) << "what has no length needs no truncation";
  EXPECT_EQ(GetLastError(), DWORD(ERROR_ALREADY_EXISTS));
  DWORD done = 0;
  EXPECT_TRUE(WriteFile(null, "x", 1, &done, nullptr));
  EXPECT_TRUE(FlushFileBuffers(null));
  EXPECT_TRUE(CloseHandle(null));
  TempFolder folder;
  EXPECT_EQ(ErrorOf([&] {
              return CreateFileW(folder.File(u"doomed").c_str(), GENERIC_WRITE, 0, nullptr, CREATE_NEW,
                                 FILE_ATTRIBUTE_READONLY | FILE_FLAG_DELETE_ON_CLOSE, nullptr) != INVALID_HANDLE_VALUE;
            }),
            DWORD(ERROR_ACCESS_DENIED))
      << "what can never be deleted cannot be deleted at the end";
  EXPECT_EQ(GetFileAttributesW(folder.File(u"doomed").c_str()), INVALID_FILE_ATTRIBUTES);
}

// --- names and folders ---

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

// --- the program ---

// Prints what a child of this test is asked for.
TEST(DISABLED_Child, PrintsItself) {
  std::printf("<%s|%u|%u>\n", test::Narrow(GetCommandLineW()).c_str(), GetACP(), GetOEMCP());
}

// What the child printed between its brackets.
std::string AskChild(const std::string& environment, const std::string& arguments) {
  char path[4096] = {};
  EXPECT_GT(readlink("/proc/self/exe", path, sizeof path - 1), 0);
  const std::string command = environment + " '" + path +
                              "' --gtest_also_run_disabled_tests --gtest_filter=DISABLED_Child.PrintsItself " +
                              arguments;
  std::string printed;
  std::FILE* const child = popen(command.c_str(), "r");
  for (int c; (c = std::getc(child)) != EOF;) printed += static_cast<char>(c);
  pclose(child);
  const std::size_t begin = printed.find('<'), end = printed.rfind('>');
  return begin < end && end != std::string::npos ? printed.substr(begin + 1, end - begin - 1) : printed;
}

TEST(ProgramArguments, WordsAreQuotedSoThatTheyComeApartAgain) {
  const std::string line = AskChild("", R"(plain 'two words' '' 'q"x' 'back\' 'b\"' 'end \' 'two  x')");
  const std::string expected = R"( plain "two words" "" "q\"x" back\ "b\\\"" "end \\" "two  x"|)";
  EXPECT_NE(line.find(expected), std::string::npos) << line;
}

TEST(ProgramArguments, PagesThatAreNoneAreTheStandardOnes) {
  const auto pages = [](const std::string& ansi, const std::string& oem) {
    const std::string printed = AskChild("QXCORE_ACP='" + ansi + "' QXCORE_OEMCP='" + oem + "'", "");
    return printed.substr(printed.find('|') + 1);
  };
  EXPECT_EQ(pages("1251", "866"), "1251|866");
  for (const char* wrong : {"", "0", "x", "1251x", "12345", "70000", "-1"})
    EXPECT_EQ(pages(wrong, wrong), "1252|437") << wrong;
}

TEST(ProgramArguments, ThePathOfTheProgramFitsOrIsCut) {
  WCHAR path[MAX_PATH], part[MAX_PATH];
  const DWORD length = GetModuleFileNameW(nullptr, path, MAX_PATH);
  ASSERT_GT(length, 10u);
  EXPECT_EQ(GetLastError(), DWORD(ERROR_SUCCESS));
  EXPECT_NE(GetFileAttributesW(path), INVALID_FILE_ATTRIBUTES);
  EXPECT_EQ(GetModuleFileNameW(nullptr, part, 8), 8u);
  EXPECT_EQ(GetLastError(), DWORD(ERROR_INSUFFICIENT_BUFFER));
  EXPECT_EQ(Text(part), Text(path).substr(0, 7));
  EXPECT_EQ(GetModuleFileNameW(nullptr, part, length + 1), length);
  EXPECT_EQ(ErrorOf([&] { return GetModuleFileNameW(nullptr, part, 0); }), DWORD(ERROR_INSUFFICIENT_BUFFER));
  EXPECT_EQ(ErrorOf([&] { return GetModuleFileNameW(platform::ModuleHandle(), part, MAX_PATH); }),
            DWORD(ERROR_MOD_NOT_FOUND));
}

// --- shared memory ---

TEST(MappingArguments, EveryNameIsItsOwn) {
  const Text names[] = {u"plain-Name_1",      u"plain-name_1",  u"Local\\plain-Name_1 ",
                        u"with space",        u"with%20%space", u"with%20space",
                        u"gr\u00FC\u00DFe/z", u"a.b",           u"a:b"};
  const Text own = u"qxcore " + Text(1, static_cast<WCHAR>(u'a' + getpid() % 26)) + u" ";
  std::vector<HANDLE> mappings;
  std::vector<char*> views;
  for (const Text& name : names) {
    const bool isLocal = name.starts_with(u"Local\\");
    const Text whole = isLocal ? u"Local\\" + own + name.substr(6) : own + name;
    mappings.push_back(CreateFileMappingW(INVALID_HANDLE_VALUE, nullptr, PAGE_READWRITE, 0, 100, whole.c_str()));
    ASSERT_NE(mappings.back(), nullptr);
    EXPECT_EQ(GetLastError(), DWORD(ERROR_SUCCESS)) << "it did not exist";
    views.push_back(static_cast<char*>(MapViewOfFile(mappings.back(), FILE_MAP_ALL_ACCESS, 0, 0, 0)));
    ASSERT_NE(views.back(), nullptr);
    *views.back() = static_cast<char>(views.size());
  }
  for (std::size_t i = 0; i < views.size(); ++i) EXPECT_EQ(*views[i], static_cast<char>(i + 1));
  const HANDLE again =
      CreateFileMappingW(INVALID_HANDLE_VALUE, nullptr, PAGE_READWRITE, 0, 100, (u"Global\\" + own + names[0]).c_str());
  EXPECT_EQ(GetLastError(), DWORD(ERROR_ALREADY_EXISTS)) << "the spaces of names are one";
  CloseHandle(again);
  for (std::size_t i = 0; i < views.size(); ++i) {
    UnmapViewOfFile(views[i]);
    CloseHandle(mappings[i]);
  }
  const auto make = [](const Text& name) {
    return CreateFileMappingW(INVALID_HANDLE_VALUE, nullptr, PAGE_READWRITE, 0, 100, name.c_str()) != nullptr;
  };
  EXPECT_EQ(ErrorOf([&] { return make(u"Local\\a\\b"); }), DWORD(ERROR_PATH_NOT_FOUND));
  EXPECT_EQ(ErrorOf([&] { return make(Text(300, u'n')); }), DWORD(ERROR_FILENAME_EXCED_RANGE));
  EXPECT_EQ(ErrorOf([&] {
              return CreateFileMappingW(INVALID_HANDLE_VALUE, nullptr, PAGE_READWRITE, 0xFFFFFFFF, 0, nullptr) !=
                     nullptr;
            }),
            DWORD(ERROR_NOT_ENOUGH_MEMORY));
}

// --- texts, pages and resources ---

TEST(TextArguments, AreLookedAt) {
  WCHAR text[40] = u"former";
  const WCHAR letter[] = u"\u00E9";
  EXPECT_EQ(ErrorOf([&] { return FoldStringW(MAP_COMPOSITE, nullptr, 1, text, 40); }), kBadParameter);
  EXPECT_EQ(ErrorOf([&] { return FoldStringW(MAP_COMPOSITE, letter, 0, text, 40); }), kBadParameter);
  EXPECT_EQ(ErrorOf([&] { return FoldStringW(MAP_COMPOSITE, letter, 1, text, -1); }), kBadParameter);
  EXPECT_EQ(ErrorOf([&] { return FoldStringW(MAP_COMPOSITE, letter, 1, nullptr, 40); }), kBadParameter);
  EXPECT_EQ(ErrorOf([&] { return FoldStringW(MAP_COMPOSITE, text, 1, text, 40); }), kBadParameter);
  EXPECT_EQ(ErrorOf([&] { return FoldStringW(0, letter, 1, text, 40); }), DWORD(ERROR_INVALID_FLAGS));
  EXPECT_EQ(FoldStringW(MAP_COMPOSITE, letter, -1, nullptr, 0), 3) << "the terminator counts";
  EXPECT_EQ(ErrorOf([&] { return FoldStringW(MAP_COMPOSITE, letter, 1, text, 1); }), DWORD(ERROR_INSUFFICIENT_BUFFER));

  CPINFO info;
  CPINFOEXW more;
  EXPECT_EQ(ErrorOf([] { return GetCPInfo(1252, nullptr); }), kBadParameter);
  EXPECT_EQ(ErrorOf([&] { return GetCPInfo(12345, &info); }), kBadParameter);
  EXPECT_EQ(ErrorOf([&] { return GetCPInfoExW(12345, 0, &more); }), kBadParameter);
  EXPECT_EQ(ErrorOf([&] { return GetCPInfoExW(1252, 1, &more); }), kBadParameter);
  EXPECT_EQ(ErrorOf([] { return GetCPInfoExW(1252, 0, nullptr); }), kBadParameter);
  EXPECT_FALSE(IsDBCSLeadByteEx(12345, 0x81));
  EXPECT_EQ(ErrorOf([] { return EnumSystemCodePagesW(nullptr, CP_INSTALLED); }), kBadParameter);
  static int pages = 0;
  const auto stop = [](LPWSTR) -> BOOL { return ++pages < 3; };
  EXPECT_EQ(ErrorOf([&] { return EnumSystemCodePagesW(stop, 7); }), kBadParameter);
  EXPECT_TRUE(EnumSystemCodePagesW(stop, CP_SUPPORTED));
  EXPECT_EQ(pages, 3) << "the caller had enough";

  EXPECT_EQ(ErrorOf([] { return FormatMessageW(FORMAT_MESSAGE_FROM_SYSTEM, nullptr, 2, 0, nullptr, 10, nullptr); }),
            kBadParameter);
  EXPECT_EQ(ErrorOf([] { return LoadStringW(nullptr, 1, nullptr, 10); }), kBadParameter);
  EXPECT_EQ(ErrorOf([&] { return LoadStringW(nullptr, 1, text, -1); }), kBadParameter);
  EXPECT_EQ(ErrorOf([&] { return LoadStringW(platform::ModuleHandle(), 65000, text, 0); }),
            DWORD(ERROR_RESOURCE_NAME_NOT_FOUND));
  EXPECT_EQ(Text(text), u"former") << "there was no room to say so";
  EXPECT_EQ(ErrorOf([&] { return LoadStringW(platform::ModuleHandle(), 65000, text, 40); }),
            DWORD(ERROR_RESOURCE_NAME_NOT_FOUND));
  EXPECT_EQ(Text(text), u"");
  EXPECT_EQ(ErrorOf([] { return GetModuleHandleW(u"other") != nullptr; }), DWORD(ERROR_MOD_NOT_FOUND));
  const auto number = [](std::uintptr_t n) { return reinterpret_cast<LPCWSTR>(n); };
  constexpr std::uintptr_t kTexts = 6;
  for (const std::uintptr_t block : {std::uintptr_t{0}, std::uintptr_t{4000}}) {
    EXPECT_EQ(
        ErrorOf([&] { return FindResourceW(platform::ModuleHandle(), number(block), number(kTexts)) != nullptr; }),
        DWORD(ERROR_RESOURCE_NAME_NOT_FOUND));
  }
  EXPECT_EQ(ErrorOf([&] { return FindResourceW(nullptr, number(1), number(999)) != nullptr; }),
            DWORD(ERROR_RESOURCE_TYPE_NOT_FOUND));
}

TEST(TextArguments, NothingIsWrittenBehindTheRoom) {
  const std::string bytes("ab\0cd\0", 6);
  const Text wide(bytes.begin(), bytes.end());
  for (const UINT page : {1252u, 932u, 50220u, 54936u, 57002u, 65000u, 65001u}) {
    if (!IsValidCodePage(page)) continue;
    for (int room = 1; room <= 7; ++room) {
      WCHAR text[8];
      char back[8];
      std::fill_n(text, 8, u'#');
      std::fill_n(back, 8, '#');
      const int length = MultiByteToWideChar(page, 0, bytes.data(), 6, text, room);
      EXPECT_EQ(length, room >= 6 ? 6 : 0) << page;
      EXPECT_EQ(Text(text + room, text + 8), Text(static_cast<std::size_t>(8 - room), u'#')) << page << ' ' << room;
      const int size = WideCharToMultiByte(page, 0, wide.data(), 6, back, room, nullptr, nullptr);
      EXPECT_EQ(size, room >= 6 ? 6 : 0) << page;
      EXPECT_EQ(std::string(back + room, back + 8), std::string(static_cast<std::size_t>(8 - room), '#')) << page;
    }
  }
}

TEST(TextArguments, DefaultsOfTwoBytesAndLonelyHalves) {
  const WCHAR missing[] = {u'a', 0x0E01, u'b'}, half[] = {0xD800, u'x'};
  char bytes[20] = {};
  BOOL used = FALSE;
  EXPECT_EQ(WideCharToMultiByte(932, 0, missing, 3, bytes, 20, "\x81\x48", &used), 4);
  EXPECT_EQ(std::string(bytes, 4),
            "a\x81\x48"
            "b");
  EXPECT_TRUE(used);
  EXPECT_EQ(WideCharToMultiByte(932, 0, missing, 3, bytes, 20, "\x81", &used), 3) << "a lead byte alone stays one byte";
  EXPECT_EQ(WideCharToMultiByte(932, 0, missing, 3, bytes, 20, "#", nullptr), 3);
  EXPECT_EQ(std::string(bytes, 3), "a#b");
  EXPECT_EQ(WideCharToMultiByte(932, 0, missing, 3, bytes, 20, "", nullptr), 3);
  EXPECT_EQ(bytes[1], '?');
  EXPECT_EQ(
      ErrorOf([&] { return WideCharToMultiByte(54936, WC_ERR_INVALID_CHARS, half, 2, bytes, 20, nullptr, nullptr); }),
      DWORD(ERROR_NO_UNICODE_TRANSLATION));
  EXPECT_GT(WideCharToMultiByte(54936, 0, half, 2, bytes, 20, nullptr, &used), 0);
  EXPECT_TRUE(used);
}

TEST(TextArguments, NumbersThatAreNoneAndLongPrecisions) {
  const auto format = [](const WCHAR* pattern, auto value) {
    WCHAR text[300];
    const int length = platform::WideFormat(text, 300, pattern, value);
    return length < 0 ? Text(u"refused") : Text(text, static_cast<std::size_t>(length));
  };
  const double infinite = HUGE_VAL, none = std::nan("");
  EXPECT_EQ(format(u"%E", -infinite), u"-1.#INF00E+000");
  EXPECT_EQ(format(u"%+g", infinite), u"+1.#INF");
  EXPECT_EQ(format(u"% G", none), u" 1.#QNAN");
  EXPECT_EQ(format(u"%.10f", none), u"1.#QNAN00000");
  EXPECT_EQ(format(u"%g", -none), u"-1.#IND");
  EXPECT_EQ(format(u"%.0g", 2.5), u"3");
  EXPECT_EQ(format(u"%+.1f", 2.0), u"+2.0");
  EXPECT_EQ(format(u"% .1f", 2.0), u" 2.0");
  EXPECT_EQ(format(u"%Lf", 1.0), u"1.000000");
  EXPECT_EQ(format(u"%#X", 255), u"0XFF");
  EXPECT_EQ(format(u"%#o", 8), u"010");
  EXPECT_EQ(format(u"%.0S", "narrow"), u"");
  EXPECT_EQ(format(u"%9999999999d", 1), u"refused");
  char narrow[200];
  const int length = std::snprintf(narrow, sizeof narrow, "%.70f", 0.1);
  EXPECT_EQ(format(u"%.70f", 0.1), Text(narrow, narrow + length));
}

// Numbers of every form, as another reader of numbers has them.
TEST(TextArguments, NumbersAreThoseOfTheRuntime) {
  std::mt19937 random(77);
  const auto digits = [&](int most) {
    std::string made;
    for (int i = static_cast<int>(random() % static_cast<unsigned>(most)); i > 0; --i)
      made += random() % 3 == 0 ? '0' : static_cast<char>('0' + random() % 10);
    return made;
  };
  for (int round = 0; round < 20000; ++round) {
    std::string text(random() % 3, ' ');
    text += std::string("+-").substr(random() % 3, 1);
    text += digits(12);
    if (random() % 2 == 0) text += "." + digits(random() % 9 == 0 ? 400 : 12);
    if (random() % 3 == 0)
      text += std::string("eE").substr(random() % 2, 1) + std::string("+-").substr(random() % 3, 1) + digits(4);
    text += std::string("x e").substr(random() % 3, 1);
    char* stop = nullptr;
    errno = 0;
    const double expected = std::strtod(text.c_str(), &stop);
    const bool isOut = errno == ERANGE && (expected == 0 || expected == HUGE_VAL || expected == -HUGE_VAL);
    const Text wide(text.begin(), text.end());
    const WCHAR* end = nullptr;
    errno = 0;
    ASSERT_EQ(platform::WideToDouble(wide.c_str(), &end), expected) << text;
    ASSERT_EQ(end - wide.c_str(), stop - text.c_str()) << text;
    if (isOut) {
      ASSERT_EQ(errno, ERANGE) << text;
    }
    const int base = static_cast<int>(random() % 36) + 1;
    std::string letters;
    for (int i = static_cast<int>(random() % 6); i > 0; --i) letters += static_cast<char>('/' + random() % 80);
    const std::string whole = std::string(random() % 2, ' ') + std::string("+-").substr(random() % 3, 1) +
                              (random() % 4 == 0 ? "0x" : "") + letters;
    const int asked = base == 1 ? 0 : base;
    const long long value = std::strtoll(whole.c_str(), &stop, asked);
    const Text wideWhole(whole.begin(), whole.end());
    if (value >= -0x80000000LL && value <= 0x7FFFFFFF) {
      ASSERT_EQ(platform::WideToLong(wideWhole.c_str(), &end, asked), value) << whole << " to base " << asked;
      ASSERT_EQ(end - wideWhole.c_str(), stop - whole.c_str()) << whole << " to base " << asked;
    }
  }
}

}  // namespace

#endif
