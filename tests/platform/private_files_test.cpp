// Who can read, hold up or empty what the portable layer keeps for its user: rights of files while they are made,
// files of other users, locks that do not end. Linux only: on Windows the system sees to all of this.

#include <gtest/gtest.h>

#ifndef _WIN32

#include <dlfcn.h>
#include <fcntl.h>
#include <malloc.h>
#include <sys/file.h>
#include <sys/mman.h>
#include <sys/mount.h>
#include <sys/resource.h>
#include <sys/stat.h>
#include <sys/wait.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <cstdarg>
#include <functional>
#include <string>
#include <vector>

#include "tests/support/failing_calls.h"
#include "tests/support/file_size_limit.h"
#include "tests/support/registry_root.h"
#include "tests/support/temp_folder.h"

namespace {

// What the hooks below see and do.
struct Hooks {
  bool hasNoLocks = false;     // as on a file system without them
  std::vector<mode_t> rights;  // of files that were written; see WatchWrite
  int umaskCalls = 0;
};
Hooks g_hooks;

void WatchWrite(int file) {
  struct stat info;
  if (fstat(file, &info) == 0 && S_ISREG(info.st_mode)) g_hooks.rights.push_back(info.st_mode & 0777);
}

}  // namespace

// These stand in front of the C library's, and of the weak ones that fail on order, for the whole program.
extern "C" int fcntl(int file, int command, ...) {
  static auto* const real = Real<int(int, int, ...)>("fcntl");
  va_list arguments;
  va_start(arguments, command);
  void* const argument = va_arg(arguments, void*);
  va_end(arguments);
  if (g_hooks.hasNoLocks && (command == F_OFD_SETLK || command == F_OFD_GETLK)) {
    errno = EINVAL;
    return -1;
  }
  return MustFail() ? -1 : real(file, command, argument);
}

extern "C" mode_t umask(mode_t mask) noexcept {
  static auto* const real = Real<mode_t(mode_t)>("umask");
  ++g_hooks.umaskCalls;
  return real(mask);
}

namespace {

using test::ReadAll;
using test::TempFolder;
using test::Text;
using test::WriteAll;

std::string Native(const Text& path) {
  std::string native = test::Narrow(path).substr(2);
  std::replace(native.begin(), native.end(), '\\', '/');
  return native;
}

mode_t RightsOf(const Text& path) {
  struct stat info;
  return stat(Native(path).c_str(), &info) == 0 ? info.st_mode & 07777 : 0;
}

// Runs in a child as a user without rights; false when it failed or died.
bool AsNobody(const std::function<bool()>& work) {
  const pid_t child = fork();
  if (child == 0) _exit(setegid(65534) == 0 && seteuid(65534) == 0 && work() ? 0 : 1);
  int status = 0;
  return waitpid(child, &status, 0) == child && WIFEXITED(status) && WEXITSTATUS(status) == 0;
}

bool IsRoot() { return geteuid() == 0; }

class PrivateFiles : public testing::Test {
 protected:
  PrivateFiles() { chmod(Native(m_folder.Path()).c_str(), 0755); }
  ~PrivateFiles() override {
    g_hooks = {};
    g_beforeWrite = nullptr;
  }

  Text Path(const WCHAR* name) const { return m_folder.File(name); }
  void Make(const WCHAR* name, const std::string& bytes, mode_t rights) const {
    WriteAll(Path(name), bytes);
    chmod(Native(Path(name)).c_str(), rights);
  }
  bool SetKey(const WCHAR* file, const WCHAR* value = u"new") const {
    return WritePrivateProfileStringW(u"s", u"k", value, Path(file).c_str()) != 0;
  }

  TempFolder m_folder;
};

// --- copies and moves ---

TEST_F(PrivateFiles, ACopyHasNoMoreRightsThanItsSourceAtAnyTime) {
  const mode_t before = umask(022);
  const struct {
    mode_t source, target, result;  // 0: there is no target
  } cases[] = {{0600, 0, 0600},    {0666, 0, 0644},    {0755, 0, 0755},   {0444, 0, 0444},
               {0600, 0644, 0600}, {0644, 0600, 0600}, {0444, 0644, 0444}};
  for (const auto& each : cases) {
    test::RemoveAll(Path(u"to"));
    Make(u"from", "secret", each.source);
    if (each.target != 0) Make(u"to", "old and longer", each.target);
    g_beforeWrite = WatchWrite;
    g_hooks.rights.clear();
    g_hooks.umaskCalls = 0;
    EXPECT_TRUE(CopyFileW(Path(u"from").c_str(), Path(u"to").c_str(), FALSE)) << GetLastError();
    g_beforeWrite = nullptr;
    EXPECT_EQ(g_hooks.umaskCalls, 0);
    EXPECT_EQ(RightsOf(Path(u"to")), each.result) << std::oct << each.source << ' ' << each.target;
    ASSERT_EQ(g_hooks.rights.empty(), !OrdersReachReads()) << "a sanitizer has its own write";
    for (const mode_t rights : g_hooks.rights) EXPECT_EQ(rights & ~each.source, 0u) << std::oct << each.source;
    EXPECT_EQ(ReadAll(Path(u"to")), "secret");
    chmod(Native(Path(u"from")).c_str(), 0600);
    chmod(Native(Path(u"to")).c_str(), 0600);
  }
  umask(before);
}

TEST_F(PrivateFiles, ACopyOntoItselfUnderAnotherNameIsRefused) {
  Make(u"a", "content", 0644);
  ASSERT_EQ(link(Native(Path(u"a")).c_str(), Native(Path(u"hard")).c_str()), 0);
  ASSERT_EQ(symlink("a", Native(Path(u"soft")).c_str()), 0);
  for (const bool hasNoLocks : {false, true}) {
    g_hooks.hasNoLocks = hasNoLocks;
    for (const WCHAR* other : {u"hard", u"soft", u"A", u"a"}) {
      EXPECT_FALSE(CopyFileW(Path(u"a").c_str(), Path(other).c_str(), FALSE));
      EXPECT_EQ(GetLastError(), DWORD(ERROR_SHARING_VIOLATION));
      EXPECT_FALSE(CopyFileW(Path(other).c_str(), Path(u"a").c_str(), FALSE));
      EXPECT_EQ(ReadAll(Path(u"a")), "content");
    }
  }
}

TEST_F(PrivateFiles, AMoveToAnotherFileSystemKeepsEverything) {
  const std::string disk = Native(Path(u"disk"));
  CreateDirectoryW(Path(u"disk").c_str(), nullptr);
  if (!IsRoot() || mount("none", disk.c_str(), "tmpfs", 0, "size=64k") != 0)
    GTEST_SKIP() << "no right to mount another file system";
  const std::string content(5000, 'x');
  Make(u"from", content, 0640);
  const timespec times[2] = {{1000, 0}, {2000, 5}};
  utimensat(AT_FDCWD, Native(Path(u"from")).c_str(), times, 0);
  EXPECT_EQ(chown(Native(Path(u"from")).c_str(), 1234, 5678), 0);
  WriteAll(Path(u"disk\\to"), "old");
  g_beforeWrite = WatchWrite;
  EXPECT_FALSE(MoveFileExW(Path(u"from").c_str(), Path(u"disk\\to").c_str(), MOVEFILE_REPLACE_EXISTING));
  EXPECT_EQ(GetLastError(), DWORD(ERROR_NOT_SAME_DEVICE));
  EXPECT_FALSE(MoveFileW(Path(u"from").c_str(), Path(u"disk\\to").c_str()));
  EXPECT_EQ(GetLastError(), DWORD(ERROR_ALREADY_EXISTS));
  EXPECT_TRUE(
      MoveFileExW(Path(u"from").c_str(), Path(u"disk\\to").c_str(), MOVEFILE_REPLACE_EXISTING | MOVEFILE_COPY_ALLOWED));
  for (const mode_t rights : g_hooks.rights) EXPECT_EQ(rights, 0600u);
  struct stat info;
  ASSERT_EQ(stat((disk + "/to").c_str(), &info), 0);
  EXPECT_EQ(info.st_mode & 07777, 0640u);
  EXPECT_EQ(info.st_uid, 1234u);
  EXPECT_EQ(info.st_gid, 5678u);
  EXPECT_EQ(info.st_atim.tv_sec, 1000);
  EXPECT_EQ(info.st_mtim.tv_nsec, 5);
  EXPECT_EQ(ReadAll(Path(u"disk\\to")), content);
  EXPECT_EQ(GetFileAttributesW(Path(u"from").c_str()), DWORD(INVALID_FILE_ATTRIBUTES));
  // A link stays one.
  ASSERT_EQ(symlink("to", Native(Path(u"link")).c_str()), 0);
  EXPECT_TRUE(MoveFileW(Path(u"link").c_str(), Path(u"disk\\link").c_str()));
  EXPECT_TRUE(lstat((disk + "/link").c_str(), &info) == 0 && S_ISLNK(info.st_mode));
  // A full disk: source and target are as they were, and nothing else is there.
  Make(u"big", std::string(200'000, 'y'), 0644);
  EXPECT_FALSE(
      MoveFileExW(Path(u"big").c_str(), Path(u"disk\\to").c_str(), MOVEFILE_REPLACE_EXISTING | MOVEFILE_COPY_ALLOWED));
  EXPECT_EQ(GetLastError(), DWORD(ERROR_DISK_FULL));
  EXPECT_EQ(ReadAll(Path(u"disk\\to")), content);
  EXPECT_EQ(ReadAll(Path(u"big")).size(), 200'000u);
  WIN32_FIND_DATAW data;
  const HANDLE search = FindFirstFileW(Path(u"disk\\to?*").c_str(), &data);
  EXPECT_FALSE(FindNextFileW(search, &data));
  FindClose(search);
  umount(disk.c_str());
}

TEST_F(PrivateFiles, TemporaryFilesAreForTheirUserAlone) {
  WCHAR name[MAX_PATH];
  ASSERT_NE(GetTempFileNameW(m_folder.Path().c_str(), u"t", 0, name), 0u);
  EXPECT_EQ(RightsOf(name), 0600u);
}

// --- initialisation files ---

TEST_F(PrivateFiles, AnIniFileKeepsItsRightsOwnerAndOtherNames) {
  const mode_t before = umask(027);
  g_hooks.umaskCalls = 0;
  EXPECT_TRUE(SetKey(u"new.ini"));
  EXPECT_EQ(RightsOf(Path(u"new.ini")), 0640u);
  Make(u"a.ini", "[s]\nk=old\n", 0604);
  if (IsRoot()) {
    EXPECT_EQ(chown(Native(Path(u"a.ini")).c_str(), 1234, 5678), 0);
  }
  g_beforeWrite = WatchWrite;
  EXPECT_TRUE(SetKey(u"a.ini"));
  EXPECT_EQ(g_hooks.umaskCalls, 0);
  for (const mode_t rights : g_hooks.rights) EXPECT_EQ(rights & ~0604, 0u);
  struct stat info;
  ASSERT_EQ(stat(Native(Path(u"a.ini")).c_str(), &info), 0);
  EXPECT_EQ(info.st_mode & 07777, 0604u);
  EXPECT_EQ(info.st_uid, IsRoot() ? 1234u : geteuid());
  ASSERT_EQ(link(Native(Path(u"a.ini")).c_str(), Native(Path(u"hard.ini")).c_str()), 0);
  EXPECT_TRUE(SetKey(u"a.ini", u"a longer value than before"));
  EXPECT_EQ(ReadAll(Path(u"hard.ini")), "[s]\nk=a longer value than before\n");
  EXPECT_TRUE(SetKey(u"hard.ini", u"short"));
  EXPECT_EQ(ReadAll(Path(u"a.ini")), "[s]\nk=short\n");
  umask(before);
}

TEST_F(PrivateFiles, AnIniFileBehindALinkIsWrittenWhereTheLinkLeads) {
  ASSERT_EQ(symlink("sub/target.ini", Native(Path(u"link.ini")).c_str()), 0);
  EXPECT_FALSE(SetKey(u"link.ini"));
  EXPECT_EQ(GetLastError(), DWORD(ERROR_PATH_NOT_FOUND));
  CreateDirectoryW(Path(u"sub").c_str(), nullptr);
  EXPECT_TRUE(SetKey(u"link.ini"));
  EXPECT_EQ(ReadAll(Path(u"sub\\target.ini")), "[s]\r\nk=new\r\n");
  struct stat info;
  EXPECT_TRUE(lstat(Native(Path(u"link.ini")).c_str(), &info) == 0 && S_ISLNK(info.st_mode));
  ASSERT_EQ(symlink("round.ini", Native(Path(u"round.ini")).c_str()), 0);
  EXPECT_FALSE(SetKey(u"round.ini"));
}

TEST_F(PrivateFiles, FoldersForSettingsAreMadeWithAllThatIsMissing) {
  const char* const former = getenv("XDG_CONFIG_HOME");
  const std::string kept = former == nullptr ? "" : former;
  test::SetVariable("XDG_CONFIG_HOME", Native(Path(u"a")) + "/b/c");
  EXPECT_TRUE(WritePrivateProfileStringW(u"s", u"k", u"v", u"plain.ini"));
  test::SetVariable("XDG_CONFIG_HOME", kept);
  EXPECT_EQ(ReadAll(Path(u"a\\b\\c\\qxcore\\plain.ini")), "[s]\r\nk=v\r\n");
  EXPECT_EQ(RightsOf(Path(u"a\\b")), 0700u);
}

TEST_F(PrivateFiles, AnIniFileThatTheUserMayNotWriteIsRefused) {
  if (!IsRoot()) GTEST_SKIP() << "only root can become another user";
  chmod(Native(m_folder.Path()).c_str(), 0777);
  Make(u"a.ini", "[s]\nk=old\n", 0644);
  EXPECT_TRUE(AsNobody([&] { return !SetKey(u"a.ini") && GetLastError() == ERROR_ACCESS_DENIED; }));
  EXPECT_EQ(ReadAll(Path(u"a.ini")), "[s]\nk=old\n");
  // One that he may write is, and stays its owner's, also where he may not make files.
  for (const mode_t folder : {0777, 0755}) {
    Make(u"a.ini", "[s]\nk=old\n", 0666);
    chmod(Native(m_folder.Path()).c_str(), folder);
    EXPECT_TRUE(AsNobody([&] { return SetKey(u"a.ini"); }));
    EXPECT_EQ(ReadAll(Path(u"a.ini")), "[s]\nk=new\n");
    struct stat info;
    EXPECT_TRUE(stat(Native(Path(u"a.ini")).c_str(), &info) == 0 && info.st_uid == 0);
  }
}

// Only a file that is not there is empty; one that cannot be read keeps what it has.
TEST_F(PrivateFiles, AnIniFileThatCannotBeReadIsNotWritten) {
  Make(u"a.ini", "[s]\nk=old\nother=1\n", 0644);
  rlimit former;
  getrlimit(RLIMIT_NOFILE, &former);
  const rlimit none = {0, former.rlim_max};
  setrlimit(RLIMIT_NOFILE, &none);
  EXPECT_FALSE(SetKey(u"a.ini"));
  const DWORD error = GetLastError();
  setrlimit(RLIMIT_NOFILE, &former);
  EXPECT_EQ(error, DWORD(ERROR_TOO_MANY_OPEN_FILES));
  EXPECT_EQ(ReadAll(Path(u"a.ini")), "[s]\nk=old\nother=1\n");
  if (IsRoot()) {
    chmod(Native(m_folder.Path()).c_str(), 0777);
    Make(u"a.ini", "[s]\nk=old\nother=1\n", 0622);
    EXPECT_TRUE(AsNobody([&] { return !SetKey(u"a.ini") && GetLastError() == ERROR_ACCESS_DENIED; }));
    EXPECT_EQ(ReadAll(Path(u"a.ini")), "[s]\nk=old\nother=1\n");
  }
  CreateDirectoryW(Path(u"folder.ini").c_str(), nullptr);
  EXPECT_FALSE(SetKey(u"folder.ini"));
  EXPECT_FALSE(SetKey(u"a.ini\\below.ini"));
}

// Locks that somebody else holds do not keep a writer for ever: those on the folder not at all.
TEST_F(PrivateFiles, LocksOfOthersHoldNobodyUp) {
  Make(u"a.ini", "[s]\nk=old\n", 0644);
  const int folder = open(Native(m_folder.Path()).c_str(), O_RDONLY | O_DIRECTORY | O_CLOEXEC);
  ASSERT_EQ(flock(folder, LOCK_EX), 0);
  EXPECT_TRUE(SetKey(u"a.ini", u"first"));
  close(folder);
  const int file = open(Native(Path(u"a.ini")).c_str(), O_RDONLY | O_CLOEXEC);
  struct flock all {};
  all.l_type = F_RDLCK;
  ASSERT_EQ(fcntl(file, F_OFD_SETLK, &all), 0);
  EXPECT_FALSE(SetKey(u"a.ini", u"second"));
  EXPECT_EQ(GetLastError(), DWORD(ERROR_SHARING_VIOLATION));
  close(file);
  EXPECT_EQ(ReadAll(Path(u"a.ini")), "[s]\nk=first\n");
  g_hooks.hasNoLocks = true;
  EXPECT_TRUE(SetKey(u"a.ini", u"third"));
  EXPECT_EQ(ReadAll(Path(u"a.ini")), "[s]\nk=third\n");
}

// --- the registry and shared memory ---

TEST_F(PrivateFiles, TheRegistryIsForItsUserAlone) {
  const test::RegistryRoot root;
  const BYTE byte = 1;
  ASSERT_EQ(RegSetValueExW(HKEY_CURRENT_USER, u"private", 0, REG_BINARY, &byte, 1), 0);
  struct stat info;
  for (const char* suffix : {"", "-wal", "-shm"}) {
    ASSERT_EQ(stat((root.File() + suffix).c_str(), &info), 0);
    EXPECT_EQ(info.st_mode & 0777, 0600u) << suffix;
  }
}

TEST_F(PrivateFiles, TheRegistryIsKeptInTheUsersDataFolder) {
  const test::RegistryRoot root;
  const char* const former = getenv("XDG_DATA_HOME");
  const std::string kept = former == nullptr ? "" : former, folder = Native(Path(u"data"));
  test::SetVariable("XDG_DATA_HOME", folder + "/x");
  test::SetVariable("QXCORE_REGISTRY", "");
  const BYTE byte = 1;
  EXPECT_EQ(RegSetValueExW(HKEY_CURRENT_USER, u"v", 0, REG_BINARY, &byte, 1), 0);
  test::SetVariable("QXCORE_REGISTRY", root.File());
  test::SetVariable("XDG_DATA_HOME", kept);
  EXPECT_EQ(RightsOf(Path(u"data\\x\\qxcore\\registry.db")), 0600u);
  EXPECT_EQ(RightsOf(Path(u"data\\x\\qxcore")), 0700u);
  EXPECT_NE(RegQueryValueExW(HKEY_CURRENT_USER, u"v", nullptr, nullptr, nullptr, nullptr), 0);
}

TEST_F(PrivateFiles, SettingsLieInTheUsersFolderWhateverNamesIt) {
  const char* const variables[] = {"HOME", "XDG_CONFIG_HOME"};
  std::string kept[2];
  for (int i = 0; i < 2; ++i) kept[i] = getenv(variables[i]) != nullptr ? getenv(variables[i]) : "";
  const std::string home = Native(m_folder.Path());
  WCHAR text[20];
  const auto read = [&] {
    GetPrivateProfileStringW(u"s", u"k", u"missing", text, 20, u"qxcore-test.ini");
    return Text(text);
  };
  test::SetVariable("HOME", home);
  for (const char* folder : {"", "relative", "/"}) {
    test::SetVariable("XDG_CONFIG_HOME", folder[0] == '/' ? home + "/own" : folder);
    EXPECT_TRUE(WritePrivateProfileStringW(u"s", u"k", folder[0] == '/' ? u"own" : u"home", u"qxcore-test.ini"));
    EXPECT_EQ(read(), folder[0] == '/' ? u"own" : u"home") << folder;
  }
  EXPECT_EQ(ReadAll(Path(u".config\\qxcore\\qxcore-test.ini")), "[s]\r\nk=home\r\n");
  EXPECT_EQ(ReadAll(Path(u"own\\qxcore\\qxcore-test.ini")), "[s]\r\nk=own\r\n");
  // Without the variables it is the folder that the system knows.
  test::SetVariable("XDG_CONFIG_HOME", "");
  test::SetVariable("HOME", "");
  EXPECT_EQ(read(), u"missing");
  for (int i = 0; i < 2; ++i) test::SetVariable(variables[i], kept[i]);
}

TEST_F(PrivateFiles, AnIniFileWithOtherNamesStaysWholeWithoutRoom) {
  Make(u"a.ini", "[s]\r\nk=old\r\n", 0644);
  ASSERT_EQ(link(Native(Path(u"a.ini")).c_str(), Native(Path(u"b.ini")).c_str()), 0);
  {
    const test::FileSizeLimit full(16);
    EXPECT_FALSE(SetKey(u"a.ini", Text(200, u'n').c_str()));
  }
  EXPECT_EQ(ReadAll(Path(u"b.ini")), "[s]\r\nk=old\r\n");
  EXPECT_TRUE(SetKey(u"a.ini", u"n"));
  EXPECT_EQ(ReadAll(Path(u"b.ini")), "[s]\r\nk=n\r\n");
}

TEST_F(PrivateFiles, ARegistryThatCannotBeOpenedNowIsThereLater) {
  const test::RegistryRoot root;
  const BYTE byte = 1;
  {
    ASSERT_EQ(RegSetValueExW(HKEY_CURRENT_USER, u"kept", 0, REG_BINARY, &byte, 1), 0);
    const std::string file = root.File();
    test::SetVariable("QXCORE_REGISTRY", Native(Path(u"other.db")));
    ASSERT_EQ(RegSetValueExW(HKEY_CURRENT_USER, u"other", 0, REG_BINARY, &byte, 1), 0);
    test::SetVariable("QXCORE_REGISTRY", file);
  }
  rlimit former;
  getrlimit(RLIMIT_NOFILE, &former);
  // With no descriptor beside the standard ones, then with each number that is not enough.
  for (rlim_t spare = 0; spare < 3; ++spare) {
    const rlimit few = {3 + spare, former.rlim_max};
    setrlimit(RLIMIT_NOFILE, &few);
    const LSTATUS result = RegQueryValueExW(HKEY_CURRENT_USER, u"kept", nullptr, nullptr, nullptr, nullptr);
    setrlimit(RLIMIT_NOFILE, &former);
    EXPECT_NE(result, LSTATUS(ERROR_FILE_NOT_FOUND)) << spare;
    if (spare == 0) {
      EXPECT_EQ(result, LSTATUS(ERROR_TOO_MANY_OPEN_FILES));
    }
  }
  EXPECT_EQ(RegQueryValueExW(HKEY_CURRENT_USER, u"kept", nullptr, nullptr, nullptr, nullptr), 0);
  EXPECT_EQ(RegSetValueExW(HKEY_CURRENT_USER, u"more", 0, REG_BINARY, &byte, 1), 0);
}

// What was read is kept for a while, but never more than a few megabytes of it.
TEST_F(PrivateFiles, TheRegistryKeepsLittleInMemory) {
  const test::RegistryRoot root;
  const std::string large(1 << 20, 'x');
  std::string read(large.size(), 0);
  HKEY key = nullptr;
  ASSERT_EQ(RegCreateKeyExW(HKEY_CURRENT_USER, root.Path(), 0, nullptr, 0, KEY_ALL_ACCESS, nullptr, &key, nullptr), 0);
  const std::size_t before = mallinfo2().uordblks + mallinfo2().hblkhd;
  for (int i = 0; i < 48; ++i) {
    const Text name(1, static_cast<WCHAR>(u'0' + i));
    ASSERT_EQ(RegSetValueExW(key, name.c_str(), 0, REG_BINARY, reinterpret_cast<const BYTE*>(large.data()), 1 << 20),
              0);
  }
  for (int i = 0; i < 48; ++i) {
    const Text name(1, static_cast<WCHAR>(u'0' + i));
    DWORD size = 1 << 20;
    ASSERT_EQ(RegQueryValueExW(key, name.c_str(), nullptr, nullptr, reinterpret_cast<BYTE*>(read.data()), &size), 0);
    ASSERT_EQ(read, large);
    WCHAR other[8];
    DWORD length = 8;
    EXPECT_EQ(RegEnumValueW(key, static_cast<DWORD>(i), other, &length, nullptr, nullptr, nullptr, nullptr), 0);
  }
  EXPECT_LT(mallinfo2().uordblks + mallinfo2().hblkhd, before + (32u << 20));
  RegCloseKey(key);
}

TEST_F(PrivateFiles, SharedMemoryThatSomebodyElseMadeIsNotJoined) {
  const std::string name = "/qxcore." + std::to_string(geteuid()) + ".squatted";
  const auto create = [] {
    const HANDLE mapping = CreateFileMappingW(INVALID_HANDLE_VALUE, nullptr, PAGE_READWRITE, 0, 4096, u"squatted");
    if (mapping != nullptr) CloseHandle(mapping);
    return mapping != nullptr;
  };
  for (const bool isForeign : {false, true}) {
    if (isForeign && !IsRoot()) continue;
    const int file = shm_open(name.c_str(), O_RDWR | O_CREAT | O_EXCL, 0600);
    ASSERT_GE(file, 0);
    if (isForeign) {
      EXPECT_EQ(fchown(file, 65534, 65534), 0);
    } else {
      fchmod(file, 0666);
    }
    EXPECT_EQ(ftruncate(file, 4096), 0);
    EXPECT_FALSE(create());
    EXPECT_EQ(GetLastError(), DWORD(ERROR_ACCESS_DENIED));
    close(file);
    shm_unlink(name.c_str());
  }
  EXPECT_TRUE(create());
}

}  // namespace

#endif
