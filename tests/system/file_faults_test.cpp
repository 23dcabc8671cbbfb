// Files and finders when the system, the disk or the memory fails: every call of the system in turn, every
// allocation in turn; nothing is lost silently and no handle stays open.

#include <gtest/gtest.h>

#include <set>
#include <string>

#include "qxcore/system/file/current_directory.h"
#include "qxcore/system/file/file.h"
#include "qxcore/system/file/ordered_recurse_find_files.h"
#include "qxcore/system/file/recurse_find.h"
#include "tests/support/failing_allocations.h"
#include "tests/support/open_handles.h"
#include "tests/support/temp_folder.h"
#include "tests/support/text.h"

#ifndef _WIN32
#include <sys/mount.h>
#include <sys/resource.h>
#include <unistd.h>

#include <cerrno>
#include <csignal>

#include "tests/support/failing_calls.h"
#endif

namespace {

using test::TempFolder;
using test::WriteAll;
using Names = std::multiset<SString>;

SString Str(const test::Text& text) { return SString(text.c_str()); }
[[maybe_unused]] HRESULT Code(SFile::Status status) { return static_cast<HRESULT>(status); }

// Three folders with files in them.
class SmallTree {
 public:
  SmallTree() {
    for (const WCHAR* file : {WTEXT("a"), WTEXT("one\\b"), WTEXT("one\\two\\c"), WTEXT("three\\d")}) {
      const SString path = Str(m_folder.File(file));
      SFile::CreateFilePath(path, nullptr);
      WriteAll(test::Text(path), "x");
    }
  }
  SString Path(const WCHAR* name) const { return Str(m_folder.File(name)); }

 private:
  TempFolder m_folder;
};

Names NamesOf(SFinder& finder, const SString& mask) {
  Names names;
  for (int found = finder.FindFile(mask); found; found = finder.FindNextFileW()) names.insert(finder.GetFileName());
  return names;
}

const Names kFiles = {SString(WTEXT("a")), SString(WTEXT("b")), SString(WTEXT("c")), SString(WTEXT("d"))};
const Names kFolders = {SString(WTEXT("one")), SString(WTEXT("two")), SString(WTEXT("three"))};

TEST(FindersWithoutMemory, CloseTheirSearch) {
  SmallTree tree;
  const SString all = tree.Path(WTEXT("*")), root = SFile::NormalizeDirectoryName(tree.Path(WTEXT(".")));
  const int before = CountOpenHandles();
  const auto check = [before] { EXPECT_EQ(CountOpenHandles(), before); };
  const int failures = WithEachAllocationFailing(
      [&] {
        SRecurseFindFiles files;
        EXPECT_EQ(NamesOf(files, all), kFiles);
        SRecurseFindFolders folders;
        EXPECT_EQ(NamesOf(folders, all), kFolders);
        SOrderedRecurseFindFiles ordered;
        EXPECT_EQ(ordered.FindFile(root), 1);
        EXPECT_EQ(ordered.GetPaths().GetCount(), 4);
      },
      check);
  EXPECT_GT(failures, 10);
  // One finder through all failures, which may leave it in the middle of its walk; it can begin anew.
  SRecurseFindFiles files;
  WithEachAllocationFailing([&] { EXPECT_EQ(NamesOf(files, all), kFiles); },
                            [&] {
                              files.Close();
                              EXPECT_EQ(CountOpenHandles(), before);
                            });
}

TEST(FilesWithoutMemory, KeepNoHandle) {
  SmallTree tree;
  const SString path = tree.Path(WTEXT("a")), start = SCurrentDirectory::Get();
  const int before = CountOpenHandles();
  WithEachAllocationFailing(
      [&] {
        SFile file(path);
        file.OpenExisting(0);
        SFile second(path + WTEXT("2"));
        second.Init(file);
        file.FindFirst(tree.Path(WTEXT("*")));
        file.FindNext();
        SCurrentDirectory guard(tree.Path(WTEXT("one")));
      },
      [&] {
        EXPECT_EQ(CountOpenHandles(), before);
        SCurrentDirectory::Set(start);
      });
  EXPECT_EQ(SCurrentDirectory::Get(), start);
}

// A folder that goes while the walk stands on it, or is in it.
TEST(FindersAndRemovedFolders, TheWalkGoesOnAndTellsIt) {
  SmallTree tree;
  SFolderRecurse walk;
  Names seen;
  for (int found = walk.FindFile(tree.Path(WTEXT("*"))); found; found = walk.FindNextFileW()) {
    seen.insert(walk.GetFileName());
    if (walk.GetFileName() == SString(WTEXT("one"))) test::RemoveAll(test::Text(walk.GetFilePath()));
  }
  EXPECT_EQ(GetLastError(), DWORD(ERROR_PATH_NOT_FOUND));
  EXPECT_EQ(walk.GetFailures().GetCount(), 1);
  EXPECT_EQ(walk.GetFailures().GetFirstFolder().Right(4), SString(WTEXT("\\one")));
  EXPECT_EQ(seen, (Names{SString(WTEXT("a")), SString(WTEXT("d")), SString(WTEXT("one")), SString(WTEXT("three"))}));
  // From within: what is gone is not there any more, which is no failure; whether its last entries are still
  // told depends on what the system had read already.
  SmallTree other;
  SRecurseFindFiles files;
  seen.clear();
  for (int found = files.FindFile(other.Path(WTEXT("*"))); found; found = files.FindNextFileW()) {
    seen.insert(files.GetFileName());
    if (files.GetFileName() == SString(WTEXT("b"))) test::RemoveAll(test::Text(files.GetRoot()));
  }
  EXPECT_EQ(seen.count(SString(WTEXT("a"))) + seen.count(SString(WTEXT("b"))) + seen.count(SString(WTEXT("d"))), 3u);
}

#ifndef _WIN32

// --- calls of the system that fail on order ---

// Whatever fails: a walk that did not see all says so, and ends.
TEST(FindersWhenCallsFail, NothingIsMissedSilently) {
  SmallTree tree;
  const SString all = tree.Path(WTEXT("*"));
  const int before = CountOpenHandles();
  for (const int error : {EIO, EACCES, EMFILE, ENOENT}) {
    Names seen;
    int failures = 0;
    DWORD last = 0;
    const auto walk = [&](auto&& finder, const Names& expected) {
      WithEachCallFailing(
          error,
          [&] {
            seen = NamesOf(finder, all);
            last = GetLastError();
            failures = finder.GetFailures().GetCount();
            finder.Close();
          },
          [&](bool failed) {
            EXPECT_EQ(CountOpenHandles(), before);
            EXPECT_TRUE(failed || failures == 0);
            // An entry that is gone between two looks (ENOENT) is no failure.
            if (seen != expected && error != ENOENT) {
              EXPECT_GT(failures, 0) << error;
              EXPECT_NE(last, DWORD(ERROR_NO_MORE_FILES)) << error;
            }
            for (const SString& name : seen) EXPECT_EQ(expected.count(name), 1u);
          });
    };
    walk(SRecurseFindFiles(), kFiles);
    walk(SRecurseFindFolders(), kFolders);
  }
}

TEST(FilesWhenCallsFail, AGoodStatusMeansThatItWasDone) {
  TempFolder folder;
  const SString path = Str(folder.File(WTEXT("a"))), copy = Str(folder.File(WTEXT("b"))),
                moved = Str(folder.File(WTEXT("c")));
  const int before = CountOpenHandles();
  HRESULT worst = 0;
  const auto note = [&worst](HRESULT status) {
    if (status != 0) worst = status;
  };
  WithEachCallFailing(
      EIO,
      [&] {
        worst = 0;
        SFile file(path);
        note(file.Create(FILE_ATTRIBUTE_NORMAL));
        unsigned long count = 6;
        if (file.IsOpen()) note(file.Write("123456", count));
        std::int64_t position = 3;
        note(file.Seek(position, FILE_BEGIN));
        note(file.SetEndOfFile());
        note(file.Flush());
        note(file.Close());
        note(file.Copy(copy, 1));
        note(file.SetAttributes(FILE_ATTRIBUTE_READONLY));
        note(file.Rename(moved));
      },
      [&](bool failed) {
        EXPECT_EQ(CountOpenHandles(), before);
        EXPECT_TRUE(failed || worst == 0);
        if (worst == 0) {
          EXPECT_EQ(test::ReadAll(test::Text(copy)), "123");
          EXPECT_EQ(test::ReadAll(test::Text(moved)), "123");
          EXPECT_EQ(SFile(moved).IsReadOnly(), 1);
          EXPECT_EQ(SFile::Exists(path), 0);
        }
        for (const SString& name : {path, copy, moved}) test::RemoveAll(test::Text(name));
      });
}

// A call that a signal interrupts is made again.
TEST(FilesWhenCallsFail, InterruptedReadsAndWritesGoOn) {
  if (!OrdersReachReads()) GTEST_SKIP() << "the sanitizer has its own read and write";
  TempFolder folder;
  SFile file(Str(folder.File(WTEXT("a"))));
  ASSERT_EQ(file.Create(FILE_ATTRIBUTE_NORMAL), 0);
  char bytes[6];
  unsigned long count = 6;
  const auto interrupted = [](auto operation) {
    g_orders = {1, false, EINTR, 0, false};
    const HRESULT status = operation();
    EXPECT_TRUE(g_orders.hasFailed);
    g_orders = {};
    return status;
  };
  EXPECT_EQ(interrupted([&] { return file.Write("123456", count); }), 0);
  EXPECT_EQ(count, 6u);
  ASSERT_EQ(file.RestorePosition(0), 0);
  EXPECT_EQ(interrupted([&] { return file.Read(bytes, count); }), 0);
  EXPECT_EQ(std::string(bytes, count), "123456");
}

TEST(FilesWhenCallsFail, EachFailureHasItsCode) {
  if (!OrdersReachReads()) GTEST_SKIP() << "the sanitizer has its own read and write";
  TempFolder folder;
  const SString path = Str(folder.File(WTEXT("a")));
  SFile file(path);
  ASSERT_EQ(file.Create(FILE_ATTRIBUTE_NORMAL), 0);
  const auto failing = [](auto operation) {
    g_orders = {1, true, EIO, 0, false};
    const HRESULT status = operation();
    g_orders = {};
    return status;
  };
  unsigned long count = 1, low, high;
  std::int64_t position = 0;
  char byte;
  FILETIME time;
  EXPECT_EQ(failing([&] { return file.Write("x", count); }), Code(SFile::kWriteFailed));
  EXPECT_EQ(GetLastError(), DWORD(ERROR_IO_DEVICE));
  EXPECT_EQ(failing([&] { return file.Read(&byte, count = 1); }), Code(SFile::kReadFailed));
  EXPECT_EQ(failing([&] { return file.Flush(); }), Code(SFile::kFlushFailed));
  EXPECT_EQ(failing([&] { return file.Seek(position, FILE_BEGIN); }), Code(SFile::kSeekFailed));
  EXPECT_EQ(failing([&] { return file.GetSize(low, high); }), Code(SFile::kGetSizeFailed));
  EXPECT_EQ(failing([&] { return file.GetDateTime(&time); }), Code(SFile::kGetTimeFailed));
  EXPECT_EQ(failing([&] { return file.Close(); }), Code(SFile::kCloseFailed));
  EXPECT_EQ(file.IsOpen(), 0);
  EXPECT_EQ(failing([&] { return file.OpenExisting(); }), Code(SFile::kNotFound));
  EXPECT_EQ(failing([&] { return SFile::CreateDirectoryW(path); }), Code(SFile::kCreateDirectoryFailed));
  EXPECT_EQ(failing([&] { return SFile::Delete(path); }), Code(SFile::kDeleteFailed));
  EXPECT_EQ(file.FindFirst(Str(folder.File(WTEXT("*")))), 0);
  EXPECT_EQ(file.FindClose(), 0);
}

// A search whose handle somebody else closed behind the object's back.
TEST(FilesWhenCallsFail, ClosingALostSearch) {
  TempFolder folder;
  const SString all = Str(folder.File(WTEXT("*")));
  WriteAll(folder.File(WTEXT("a")), "");
  const auto lose = [&all](SFile& file) {
    // The number of a handle that was closed is the next one to be used.
    WIN32_FIND_DATAW data;
    const HANDLE next = ::FindFirstFileW(all, &data);
    ::FindClose(next);
    ASSERT_EQ(file.FindFirst(all), 0);
    ASSERT_TRUE(::FindClose(next));
  };
  SFile file;
  lose(file);
  EXPECT_EQ(file.FindClose(), Code(SFile::kFindCloseFailed));
  EXPECT_EQ(file.FindClose(), 0);
  lose(file);
  EXPECT_EQ(file.FindFirst(all), Code(SFile::kFindCloseFailed));
  lose(file);
  EXPECT_EQ(file.Done(), Code(SFile::kFindCloseFailed));
  lose(file);
  EXPECT_EQ(file.Init(all), Code(SFile::kInvalidFilename));  // which it is, too
  SFileFind find;
  ASSERT_EQ(find.FindFile(all), 1);
  EXPECT_EQ(find.Close(), 1);
}

// --- disks that fill ---

TEST(FilesOnFullDisks, TheLimitOfFileSizes) {
  TempFolder folder;
  SFile file(Str(folder.File(WTEXT("a"))));
  ASSERT_EQ(file.Create(FILE_ATTRIBUTE_NORMAL), 0);
  rlimit before;
  getrlimit(RLIMIT_FSIZE, &before);
  const auto handler = std::signal(SIGXFSZ, SIG_IGN);
  const rlimit small = {1000, before.rlim_max};
  setrlimit(RLIMIT_FSIZE, &small);
  const std::string bytes(1500, 'x');
  unsigned long count = 1500;
  const HRESULT status = file.Write(bytes.data(), count);
  const DWORD error = GetLastError();
  setrlimit(RLIMIT_FSIZE, &before);
  std::signal(SIGXFSZ, handler);
  EXPECT_EQ(status, Code(SFile::kWriteFailed));
  EXPECT_EQ(error, DWORD(ERROR_FILE_TOO_LARGE));
  EXPECT_EQ(count, 1000u);  // what was written is told
}

TEST(FilesOnFullDisks, ASmallDisk) {
  TempFolder folder;
  const SString disk = Str(folder.File(WTEXT("disk")));
  SFile::CreateDirectoryW(disk);
  std::string native = test::Narrow(test::Text(disk)).substr(2);
  std::replace(native.begin(), native.end(), '\\', '/');
  if (mount("none", native.c_str(), "tmpfs", 0, "size=64k") != 0) GTEST_SKIP() << "no right to mount a small disk";
  {
    SFile file(disk + WTEXT("\\a"));
    EXPECT_EQ(file.Create(FILE_ATTRIBUTE_NORMAL), 0);
    const std::string bytes(100'000, 'x');
    unsigned long count = 100'000;
    EXPECT_EQ(file.Write(bytes.data(), count), Code(SFile::kWriteFailed));
    EXPECT_EQ(GetLastError(), DWORD(ERROR_DISK_FULL));
    EXPECT_GT(count, 0u);
    EXPECT_LT(count, 100'000u);
    EXPECT_EQ(SFile::GetFreeDiskSpace(disk), 0u);
    EXPECT_EQ(file.Close(), 0);
    const SString source = Str(folder.File(WTEXT("source")));
    WriteAll(test::Text(source), bytes);
    EXPECT_EQ(SFile(source).Copy(disk + WTEXT("\\b"), 0), Code(SFile::kCopyFailed));
    EXPECT_EQ(SFile::Exists(disk + WTEXT("\\b")), 0);  // half a copy is none
  }
  umount(native.c_str());
}

#endif

}  // namespace
