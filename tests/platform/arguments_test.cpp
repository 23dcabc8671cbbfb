// What the calls of the portable layer answer to arguments that are missing, contradict themselves or are larger than
// anything: the published errors, and nothing done. The registry, handles, the program and shared memory. Linux only,
// because the other system does not look at all of them.

#ifndef _WIN32

#include <gtest/gtest.h>
#include <unistd.h>

#include <cstdio>
#include <string>
#include <vector>

#include "qxcore/platform/module.h"
#include "qxcore/platform/wide.h"
#include "tests/support/last_error.h"
#include "tests/support/registry_root.h"
#include "tests/support/temp_folder.h"

namespace {

using test::RegistryRoot;
using test::TempFolder;
using test::Text;
using test::WriteAll;

constexpr DWORD kBadParameter = ERROR_INVALID_PARAMETER, kBadHandle = ERROR_INVALID_HANDLE;

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

}  // namespace

#endif
