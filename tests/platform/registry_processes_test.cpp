// Several processes write to one registry and to one initialisation file, and one of them is killed: what
// was acknowledged is there. Each case must be the first in its process to use the registry, which a
// fork does not carry over; so they are started one by one (tests.cmake) and have names that an ordinary
// run passes over.

#include <gtest/gtest.h>

#ifndef _WIN32

#include <signal.h>
#include <sys/stat.h>
#include <sys/wait.h>
#include <unistd.h>

#include <array>
#include <cstdio>
#include <functional>
#include <random>
#include <string>

#include "qxcore/platform/wide.h"
#include "qxcore/platform/win32.h"
#include "tests/support/registry_root.h"

namespace {

constexpr int kWriters = 10;

// Runs in a child; false when it failed or died.
bool InChild(const std::function<bool()>& work) {
  const pid_t child = fork();
  if (child == 0) _exit(work() ? 0 : 1);
  int status = 0;
  return waitpid(child, &status, 0) == child && WIFEXITED(status) && WEXITSTATUS(status) == 0;
}

volatile sig_atomic_t g_mustStop = 0;

// One child that makes its n-th write, n = 1, 2, ..., and tells each that was acknowledged.
class Writer {
 public:
  explicit Writer(const std::function<bool(int)>& write) {
    // Before the fork, so that a child that has not run yet knows it, too.
    signal(SIGTERM, [](int) { g_mustStop = 1; });
    int ends[2];
    if (pipe(ends) != 0) return;
    m_process = fork();
    if (m_process == 0) {
      close(ends[0]);
      for (int n = 1; g_mustStop == 0; ++n) {
        if (!write(n)) _exit(1);
        if (::write(ends[1], &n, sizeof n) != sizeof n) _exit(2);
      }
      _exit(0);
    }
    close(ends[1]);
    m_acknowledged = ends[0];
  }
  void Send(int signalNumber) const { kill(m_process, signalNumber); }
  void WaitFor(int wanted) const {
    for (int n = 0; n < wanted && read(m_acknowledged, &n, sizeof n) == sizeof n;) {
    }
  }
  // How many writes were acknowledged, at the end.
  int Count() {
    int last = 0;
    for (int n; read(m_acknowledged, &n, sizeof n) == sizeof n;) last = n;
    close(m_acknowledged);
    waitpid(m_process, &m_status, 0);
    return last;
  }
  // It ended in good order.
  bool IsWell() const { return WIFEXITED(m_status) && WEXITSTATUS(m_status) == 0; }
  int Status() const { return m_status; }

 private:
  pid_t m_process = -1;
  int m_acknowledged = -1;
  int m_status = 0;
};

// `write` is the n-th write of a writer in a round; `check` looks, in a process of its own, whether the
// first `count` writes of each writer are there.
void RunRounds(int rounds, const std::function<bool(int round, int writer, int n)>& write,
               const std::function<bool(int round, const std::array<int, kWriters>& counts)>& check) {
  std::mt19937 random(11);
  int total = 0;
  for (int round = 0; round < rounds; ++round) {
    std::vector<Writer> writers;
    for (int i = 0; i < kWriters; ++i) writers.emplace_back([&](int n) { return write(round, i, n); });
    const std::size_t victim = random() % kWriters;
    usleep(10000 + random() % 40000);
    writers[victim].Send(SIGKILL);
    usleep(random() % 10000);
    for (const Writer& writer : writers) writer.Send(SIGTERM);
    std::array<int, kWriters> counts;
    for (std::size_t i = 0; i < kWriters; ++i) {
      counts[i] = writers[i].Count();
      total += counts[i];
      ASSERT_TRUE(i == victim || writers[i].IsWell()) << "round " << round << ", status " << writers[i].Status();
    }
    ASSERT_TRUE(InChild([&] { return check(round, counts); })) << "round " << round;
  }
  std::printf("%d writes acknowledged in %d rounds\n", total, rounds);
  EXPECT_GT(total, 0);  // how many is the disk's matter
}

std::basic_string<WCHAR> Name(const WCHAR* format, int a, int b = 0) {
  WCHAR name[64];
  platform::WideFormat(name, 64, format, a, b);
  return name;
}

TEST(DISABLED_RegistryProcesses, EveryAcknowledgedWriteIsThere) {
  const test::TempFolder folder;
  const std::string file = test::Narrow(folder.Path()).substr(2) + "/registry.db";
  std::string path = file;
  for (char& c : path)
    if (c == '\\') c = '/';
  test::SetVariable("QXCORE_REGISTRY", path);
  const auto open = [](int round, int writer, HKEY* key) {
    return RegCreateKeyExW(HKEY_CURRENT_USER, Name(u"Software\\round %d\\writer %d", round, writer).c_str(), 0, nullptr,
                           0, KEY_ALL_ACCESS, nullptr, key, nullptr) == 0;
  };
  RunRounds(
      100,
      [&](int round, int writer, int n) {
        static HKEY key = nullptr;
        if (key == nullptr && !open(round, writer, &key)) {
          std::fprintf(stderr, "the key cannot be made\n");
          return false;
        }
        const LSTATUS result = RegSetValueExW(key, Name(u"value %d", n).c_str(), 0, REG_DWORD,
                                              reinterpret_cast<const BYTE*>(&n), sizeof n);
        if (result != 0) std::fprintf(stderr, "writing gives %d\n", static_cast<int>(result));
        return result == 0;
      },
      [&](int round, const std::array<int, kWriters>& counts) {
        for (int writer = 0; writer < kWriters; ++writer) {
          HKEY key = nullptr;
          if (!open(round, writer, &key)) return false;
          for (int n = 1; n <= counts[static_cast<std::size_t>(writer)]; ++n) {
            int value = 0;
            DWORD size = sizeof value;
            if (RegQueryValueExW(key, Name(u"value %d", n).c_str(), nullptr, nullptr, reinterpret_cast<BYTE*>(&value),
                                 &size) != 0 ||
                value != n) {
              std::printf("writer %d has lost write %d of %d\n", writer, n, counts[static_cast<std::size_t>(writer)]);
              std::fflush(stdout);
              return false;
            }
          }
        }
        return true;
      });
}

// What one process writes another reads at once, however often it has read the old value.
TEST(DISABLED_RegistryProcesses, ReadersSeeWritesAtOnce) {
  const test::TempFolder folder;
  std::string path = test::Narrow(folder.Path()).substr(2) + "/registry.db";
  for (char& c : path)
    if (c == '\\') c = '/';
  test::SetVariable("QXCORE_REGISTRY", path);
  int toWriter[2], toReader[2];
  ASSERT_EQ(pipe(toWriter) | pipe(toReader), 0);
  const pid_t writer = fork();
  if (writer == 0) {
    close(toWriter[1]);
    for (int n; read(toWriter[0], &n, sizeof n) == sizeof n;) {
      RegSetValueExW(HKEY_CURRENT_USER, u"n", 0, REG_DWORD, reinterpret_cast<const BYTE*>(&n), sizeof n);
      if (write(toReader[1], &n, sizeof n) < 0) break;
    }
    _exit(0);
  }
  for (int n = 1; n <= 2000; ++n) {
    int value = 0, answer = 0;
    DWORD size = sizeof value;
    ASSERT_EQ(write(toWriter[1], &n, sizeof n), static_cast<ssize_t>(sizeof n));
    ASSERT_EQ(read(toReader[0], &answer, sizeof answer), static_cast<ssize_t>(sizeof answer));
    for (int i = 0; i < 3; ++i) {
      ASSERT_EQ(RegQueryValueExW(HKEY_CURRENT_USER, u"n", nullptr, nullptr, reinterpret_cast<BYTE*>(&value), &size), 0);
      ASSERT_EQ(value, n);
    }
  }
  close(toWriter[1]);
  waitpid(writer, nullptr, 0);
}

TEST(DISABLED_ProfileProcesses, EveryAcknowledgedWriteIsThere) {
  const test::TempFolder folder;
  const test::Text file = folder.File(u"shared.ini");
  RunRounds(
      20,
      [&](int round, int writer, int n) {
        return WritePrivateProfileStringW(Name(u"round %d", round).c_str(), Name(u"%d-%d", writer, n).c_str(), u"kept",
                                          file.c_str()) != 0;
      },
      [&](int round, const std::array<int, kWriters>& counts) {
        for (int writer = 0; writer < kWriters; ++writer) {
          for (int n = 1; n <= counts[static_cast<std::size_t>(writer)]; ++n) {
            WCHAR text[8];
            GetPrivateProfileStringW(Name(u"round %d", round).c_str(), Name(u"%d-%d", writer, n).c_str(), u"", text, 8,
                                     file.c_str());
            if (std::u16string_view(text) != u"kept") return false;
          }
        }
        return true;
      });
}

// A user that may read the database and not write it, beside nobody and beside a process that has it open.
TEST(DISABLED_RegistryProcesses, ReadersOfAForeignDatabase) {
  if (geteuid() != 0) GTEST_SKIP() << "only root can become another user";
  const test::TempFolder folder;
  std::string path = test::Narrow(folder.Path()).substr(2) + "/registry.db";
  for (char& c : path)
    if (c == '\\') c = '/';
  test::SetVariable("QXCORE_REGISTRY", path);
  const auto writeOne = [](const WCHAR* name) {
    HKEY key;
    return RegCreateKeyExW(HKEY_CURRENT_USER, u"Software\\a", 0, nullptr, 0, KEY_ALL_ACCESS, nullptr, &key, nullptr) ==
               0 &&
           RegSetValueExW(key, name, 0, REG_SZ, reinterpret_cast<const BYTE*>(u"v"), 4) == 0 && RegCloseKey(key) == 0;
  };
  // 0, or the line that went wrong.
  const auto reads = [](const WCHAR* name) {
    HKEY key, other;
    DWORD size = 0;
    if (RegOpenKeyExW(HKEY_CURRENT_USER, u"Software\\a", 0, KEY_ALL_ACCESS, &key) != LSTATUS(ERROR_ACCESS_DENIED))
      return __LINE__;
    if (RegOpenKeyExW(HKEY_CURRENT_USER, u"Software\\a", 0, KEY_READ, &key) != 0) return __LINE__;
    if (RegQueryValueExW(key, name, nullptr, nullptr, nullptr, &size) != 0 || size != 4) return __LINE__;
    if (RegSetValueExW(HKEY_CURRENT_USER, u"x", 0, REG_SZ, nullptr, 0) != LSTATUS(ERROR_ACCESS_DENIED)) return __LINE__;
    if (RegDeleteKeyW(HKEY_CURRENT_USER, u"Software\\a") != LSTATUS(ERROR_ACCESS_DENIED)) return __LINE__;
    if (RegCreateKeyExW(HKEY_CURRENT_USER, u"b", 0, nullptr, 0, KEY_READ, nullptr, &other, nullptr) !=
        LSTATUS(ERROR_ACCESS_DENIED))
      return __LINE__;
    RegCloseKey(key);
    return 0;
  };
  const auto asNobody = [](const std::function<int()>& work) {
    return InChild([&] {
      if (setegid(65534) != 0 || seteuid(65534) != 0) return false;
      const int line = work();
      if (line != 0) std::printf("line %d\n", line), std::fflush(stdout);
      return line == 0;
    });
  };
  // No database, and no way to make one: an empty registry that cannot be written.
  chmod(path.substr(0, path.rfind('/')).c_str(), 0755);
  EXPECT_TRUE(asNobody([] {
    HKEY key;
    if (RegOpenKeyExW(HKEY_CURRENT_USER, u"Software", 0, KEY_READ, &key) != LSTATUS(ERROR_FILE_NOT_FOUND))
      return __LINE__;
    if (RegOpenKeyExW(HKEY_CURRENT_USER, u"", 0, KEY_READ, &key) != 0) return __LINE__;
    return RegOpenKeyExW(HKEY_CURRENT_USER, u"", 0, KEY_WRITE, &key) == LSTATUS(ERROR_ACCESS_DENIED) ? 0 : __LINE__;
  }));
  ASSERT_TRUE(InChild([&] {
    const bool isWritten = writeOne(u"first");
    std::exit(isWritten ? 0 : 1);  // closes the database
    return isWritten;
  }));
  chmod(path.c_str(), 0644);  // its user lets others read it
  EXPECT_TRUE(asNobody([&] { return reads(u"first"); }));
  // One that has read already sees what is written later.
  int ready[2], written[2];
  ASSERT_EQ(pipe(ready) | pipe(written), 0);
  const pid_t reader = fork();
  if (reader == 0) {
    char byte = 'r';
    const bool isNobody = setegid(65534) == 0 && seteuid(65534) == 0;
    const int before = reads(u"first");
    if (write(ready[1], &byte, 1) != 1 || read(written[0], &byte, 1) != 1) _exit(2);
    _exit(isNobody && before == 0 && reads(u"later") == 0 ? 0 : 1);
  }
  char byte = 'w';
  EXPECT_EQ(read(ready[0], &byte, 1), 1);
  ASSERT_TRUE(InChild([&] {
    const bool isWritten = writeOne(u"later");
    std::exit(isWritten ? 0 : 1);
    return isWritten;
  }));
  EXPECT_EQ(write(written[1], &byte, 1), 1);
  int status = 0;
  waitpid(reader, &status, 0);
  EXPECT_EQ(WEXITSTATUS(status), 0);
  // Now another process has it open, with what it wrote in the log.
  Writer holder([&](int n) {
    if (n == 1) return writeOne(u"second");
    for (const char* suffix : {"", "-wal", "-shm"}) chmod((path + suffix).c_str(), 0644);
    while (n == 3 && g_mustStop == 0) usleep(1000);
    return true;
  });
  holder.WaitFor(2);
  EXPECT_TRUE(asNobody([&] { return reads(u"second"); }));
  holder.Send(SIGTERM);
  holder.Count();
  EXPECT_TRUE(holder.IsWell());
}

}  // namespace

#endif
