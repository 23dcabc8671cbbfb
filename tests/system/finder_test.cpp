// Finders on real trees: what they yield, in which order, and what they tell of what they cannot read.

#include <gtest/gtest.h>

#include <algorithm>
#include <filesystem>
#include <map>
#include <set>
#include <string>
#include <vector>

#include "qxcore/system/file/file.h"
#include "qxcore/system/file/internal/links.h"
#include "qxcore/system/file/ordered_recurse_find_files.h"
#include "qxcore/system/file/recurse_find.h"
#include "qxcore/system/time/time.h"
#include "tests/support/failing_allocations.h"
#include "tests/support/temp_folder.h"
#include "tests/support/text.h"
#include "tests/support/wine.h"

namespace {

using test::TempFolder;
using test::WriteAll;
using Paths = std::vector<SString>;

SString Str(const test::Text& text) { return SString(text.c_str()); }

void MakeFolder(const SString& path) { ASSERT_EQ(SFile::CreateFilePath(path, nullptr, 0), 0); }

// A folder with a tree in it, and paths relative to it.
class Tree {
 public:
  Tree() : m_root(SFile::ToLongNames(Str(m_folder.Path()))) {}

  SString Path(const WCHAR* relative) const { return m_root + WTEXT("\\") + relative; }
  const SString& Root() const { return m_root; }
  void Folder(const WCHAR* relative) const { MakeFolder(Path(relative)); }
  void File(const WCHAR* relative, const char* content = "") const {
    ASSERT_EQ(SFile::CreateFilePath(Path(relative), nullptr), 0);
    ASSERT_TRUE(WriteAll(test::Text(Path(relative)), content));
  }
  SString Relative(const SString& path) const {
    EXPECT_EQ(path.CompareNoCase(m_root + WTEXT("\\"), m_root.Length() + 1), 0) << test::Narrow(test::Text(path));
    return path.Mid(m_root.Length() + 1);
  }

 private:
  TempFolder m_folder;
  SString m_root;
};

// All that a finder yields, as relative paths, in the order in which they come.
Paths All(const Tree& tree, SFinder& finder, const WCHAR* mask, unsigned long attributes = 0) {
  Paths paths;
  for (int found = finder.FindFile(tree.Path(mask), attributes); found; found = finder.FindNextFileW())
    paths.push_back(tree.Relative(finder.GetFilePath()));
  return paths;
}

Paths Sorted(Paths paths) {
  std::sort(paths.begin(), paths.end());
  return paths;
}

struct Failure {
  SString folder;
  unsigned long error;
};

class FailureList final : public SFindFailureSink {
 public:
  void OnFolderNotRead(const SString& folder, unsigned long error) override { m_list.push_back({folder, error}); }
  const std::vector<Failure>& List() const { return m_list; }

 private:
  std::vector<Failure> m_list;
};

TEST(FileFind, OneFolder) {
  Tree tree;
  tree.File(WTEXT("a.txt"), "12345");
  tree.File(WTEXT("b.tar.gz"));
  tree.File(WTEXT(".profile"));
  tree.File(WTEXT("sub\\deep.txt"));
  SFileFind find;
  EXPECT_EQ(Sorted(All(tree, find, WTEXT("*.*"))),
            Sorted({WTEXT("."), WTEXT(".."), WTEXT(".profile"), WTEXT("a.txt"), WTEXT("b.tar.gz"), WTEXT("sub")}));
  EXPECT_EQ(GetLastError(), DWORD(ERROR_NO_MORE_FILES));
  EXPECT_EQ(find.GetFileName(), SString());
  EXPECT_EQ(find.GetFilePath(), SString());
  EXPECT_EQ(find.GetLength(), 0u);
  EXPECT_EQ(find.FindNextFileW(), 0);

  ASSERT_EQ(find.FindFile(tree.Path(WTEXT("a.*"))), 1);
  EXPECT_EQ(find.GetFileName(), SString(WTEXT("a.txt")));
  EXPECT_EQ(find.GetFileTitleW(), SString(WTEXT("a")));
  EXPECT_EQ(find.GetRoot(), tree.Root());
  EXPECT_EQ(find.GetFilePath(), tree.Path(WTEXT("a.txt")));
  EXPECT_EQ(find.GetMask(), tree.Path(WTEXT("a.*")));
  EXPECT_EQ(find.GetFileURL(), SFile::PathToURL(tree.Path(WTEXT("a.txt"))));
  EXPECT_EQ(find.GetLength(), 5u);
  EXPECT_EQ(find.IsDirectory(), 0);
  EXPECT_EQ(find.IsDots(), 0);
  STime created, read, written;
  EXPECT_EQ(find.GetCreationTime(&created) & find.GetLastAccessTime(&read) & find.GetLastWriteTime(&written), 1);
  FILETIME time;
  SFile(tree.Path(WTEXT("a.txt"))).GetDateTime(&time);
  EXPECT_EQ(written, STime(time));
  EXPECT_LT(std::abs(STime::GetTickCount().GetTime() - created.GetTime()), 100);
  EXPECT_EQ(find.FindFile(find.GetMask()), 1);  // its own mask
  EXPECT_EQ(find.Close(), 1);
  EXPECT_EQ(find.Close(), 1);
  EXPECT_EQ(find.GetCreationTime(&created), 0);
  EXPECT_EQ(find.GetRoot(), SString());

  find.FindFile(tree.Path(WTEXT("*.gz")));
  EXPECT_EQ(find.GetFileTitle(), SString(WTEXT("b.tar")));  // either form of the name
  find.FindFile(tree.Path(WTEXT(".p*")));
  EXPECT_EQ(find.GetFileTitleW(), SString(WTEXT(".profile")));
  find.FindFile(tree.Path(WTEXT("sub")));
  EXPECT_EQ(find.MatchesMask(FILE_ATTRIBUTE_DIRECTORY | FILE_ATTRIBUTE_READONLY), 1);
  EXPECT_EQ(find.MatchesMask(FILE_ATTRIBUTE_DEVICE), 0);
  EXPECT_EQ(find.MatchesMask(0), 0);
  for (int found = find.FindFile(tree.Path(WTEXT("sub\\.*"))), dots = 0; found; found = find.FindNextFileW()) {
    EXPECT_EQ(find.IsDots(), 1);
    EXPECT_LE(++dots, 2);
  }
}

TEST(FileFind, RootsAndCurrentDirectory) {
  SFileFind find;
  ASSERT_EQ(find.FindFile(WTEXT("C:\\*")), 1);
  EXPECT_EQ(find.GetRoot(), SString(WTEXT("C:")));
  EXPECT_EQ(find.GetFilePath(), SString(WTEXT("C:\\")) + find.GetFileName());
  ASSERT_EQ(find.FindFile(nullptr), 1);
  EXPECT_EQ(find.GetRoot(), SFile::NormalizeDirectoryName(WTEXT(".")));
  EXPECT_EQ(find.GetMask(), SString(WTEXT("*.*")));
  ASSERT_EQ(find.FindFile(WTEXT("C:/*.*")), 1);
  EXPECT_EQ(find.GetRoot(), SString(WTEXT("C:")));
}

// The last error survives the closing within.
TEST(FileFind, FailuresTellTheirReason) {
  Tree tree;
  tree.Folder(WTEXT("sub"));
  SFileFind find;
  EXPECT_EQ(find.FindFile(tree.Path(WTEXT("none*"))), 0);
  EXPECT_EQ(GetLastError(), DWORD(ERROR_FILE_NOT_FOUND));
  EXPECT_EQ(find.FindFile(tree.Path(WTEXT("no\\such\\*"))), 0);
  EXPECT_EQ(GetLastError(), DWORD(ERROR_PATH_NOT_FOUND));
  EXPECT_EQ(find.FindNextFileW(), 0);
  EXPECT_EQ(find.GetFileName(), SString());
  const SString dots(test::Text(300, 'x').c_str());
  EXPECT_EQ(find.FindFile(tree.Path(dots)), 0);
}

TEST(FolderRecurse, VisitsFoldersBeforeTheirContent) {
  Tree tree;
  for (const WCHAR* file : {WTEXT("a\\1"), WTEXT("a\\b\\2"), WTEXT("a\\b\\c\\3"), WTEXT("d\\4"), WTEXT("5")})
    tree.File(file);
  tree.Folder(WTEXT("empty\\emptier"));
  SFolderRecurse walk;
  const Paths paths = All(tree, walk, WTEXT("*.*"));
  EXPECT_EQ(GetLastError(), DWORD(ERROR_NO_MORE_FILES));
  EXPECT_TRUE(walk.GetFailures().IsEmpty());
  EXPECT_EQ(Sorted(paths),
            Sorted({WTEXT("a"), WTEXT("a\\1"), WTEXT("a\\b"), WTEXT("a\\b\\2"), WTEXT("a\\b\\c"), WTEXT("a\\b\\c\\3"),
                    WTEXT("d"), WTEXT("d\\4"), WTEXT("5"), WTEXT("empty"), WTEXT("empty\\emptier")}));
  // What is in a folder follows it at once, with nothing else between.
  for (std::size_t i = 0; i < paths.size(); ++i) {
    const SString inside = paths[i] + WTEXT("\\");
    std::size_t end = i + 1;
    while (end < paths.size() && paths[end].Compare(inside, inside.Length()) == 0) ++end;
    for (std::size_t k = 0; k < paths.size(); ++k)
      EXPECT_EQ(paths[k].Compare(inside, inside.Length()) == 0, k > i && k < end);
  }
  EXPECT_EQ(walk.FindNextFileW(), 0);
  EXPECT_EQ(walk.GetFilePath(), SString());
  EXPECT_EQ(walk.MatchesMask(~0ul), 0);
  // The mask holds for the first folder only.
  EXPECT_EQ(Sorted(All(tree, walk, WTEXT("d*"))), Sorted({WTEXT("d"), WTEXT("d\\4")}));
  EXPECT_EQ(walk.FindFile(tree.Path(WTEXT("zz*"))), 0);
  EXPECT_EQ(GetLastError(), DWORD(ERROR_FILE_NOT_FOUND));
  EXPECT_EQ(walk.FindFile(tree.Path(WTEXT("empty\\emptier\\*"))), 0);  // "." and ".." do not count
}

TEST(FileRecurseFind, MasksAreTakenApart) {
  Tree tree;
  for (const WCHAR* file : {WTEXT("a.c"), WTEXT("a.h"), WTEXT("s\\b.c"), WTEXT("s\\t\\c.c"), WTEXT("s\\t\\a.c")})
    tree.File(file);
  SRecurseFindFiles files;
  const Paths all = {WTEXT("a.c"), WTEXT("a.h"), WTEXT("s\\b.c"), WTEXT("s\\t\\a.c"), WTEXT("s\\t\\c.c")};
  EXPECT_EQ(Sorted(All(tree, files, WTEXT("*.c"))),
            Paths({WTEXT("a.c"), WTEXT("s\\b.c"), WTEXT("s\\t\\a.c"), WTEXT("s\\t\\c.c")}));
  EXPECT_EQ(Sorted(All(tree, files, WTEXT(""))), all);  // a folder stands for all that is in it
  EXPECT_EQ(Sorted(All(tree, files, WTEXT("*"))), all);
  EXPECT_EQ(Sorted(All(tree, files, WTEXT("s"))), Paths({WTEXT("s\\b.c"), WTEXT("s\\t\\a.c"), WTEXT("s\\t\\c.c")}));
  EXPECT_EQ(Sorted(All(tree, files, WTEXT("a.c"))), Paths({WTEXT("a.c"), WTEXT("s\\t\\a.c")}));
  EXPECT_EQ(All(tree, files, WTEXT("s\\?.h")), Paths());
  EXPECT_EQ(GetLastError(), DWORD(ERROR_FILE_NOT_FOUND));
  // Without a folder: the current one.
  const SString before = SFile::NormalizeDirectoryName(WTEXT("."));
  ASSERT_EQ(SFile::SetCurrentDirectoryW(tree.Path(WTEXT("s\\t"))), 0);
  int count = 0;
  for (int found = files.FindFile(WTEXT("*.c")); found; found = files.FindNextFileW()) ++count;
  EXPECT_EQ(count, 2);
  for (int found = files.FindFile(); found; found = files.FindNextFileW()) ++count;
  EXPECT_EQ(count, 4);
  SFile::SetCurrentDirectoryW(before);
  EXPECT_EQ(files.FindFile(tree.Path(WTEXT("none\\*"))), 0);
  EXPECT_EQ(GetLastError(), DWORD(ERROR_PATH_NOT_FOUND));
  EXPECT_EQ(files.GetFailures().GetCount(), 1);
}

TEST(Filters, MatchAndReject) {
  Tree tree;
  tree.File(WTEXT("plain"));
  tree.File(WTEXT("locked"));
  tree.Folder(WTEXT("sub"));
  tree.File(WTEXT("sub\\locked"));
  for (const WCHAR* name : {WTEXT("locked"), WTEXT("sub\\locked")})
    SFile(tree.Path(name)).SetAttributes(FILE_ATTRIBUTE_READONLY);
  SFolderRecurse walk;
  SAttrMatchFindFilter match(walk);
  SAttrRejectFindFilter reject(walk);
  EXPECT_EQ(Sorted(All(tree, match, WTEXT("*"), FILE_ATTRIBUTE_READONLY)),
            Paths({WTEXT("locked"), WTEXT("sub\\locked")}));
  EXPECT_EQ(All(tree, match, WTEXT("*"), FILE_ATTRIBUTE_DEVICE), Paths());
  EXPECT_EQ(Sorted(All(tree, reject, WTEXT("*"), FILE_ATTRIBUTE_READONLY | FILE_ATTRIBUTE_DIRECTORY)),
            Paths({WTEXT("plain")}));
  EXPECT_EQ(All(tree, reject, WTEXT("*"), 0).size(), 4u);
  EXPECT_EQ(All(tree, match, WTEXT("*"), 0).size(), 4u);
  // Around another, and describing what the inner one stands on.
  SAttrRejectFindFilter both(match);
  ASSERT_EQ(match.FindFile(tree.Path(WTEXT("sub\\l*")), FILE_ATTRIBUTE_READONLY), 1);
  EXPECT_EQ(both.GetFileName(), SString(WTEXT("locked")));
  EXPECT_EQ(both.GetRoot(), tree.Path(WTEXT("sub")));
  EXPECT_EQ(both.GetFileURL(), walk.GetFileURL());
  EXPECT_EQ(both.Close(), 1);
  EXPECT_EQ(walk.GetFileName(), SString());
  // Files only, folders only, whatever is asked for.
  SRecurseFindFiles files;
  SRecurseFindFolders folders;
  EXPECT_EQ(Sorted(All(tree, files, WTEXT("*"))), Paths({WTEXT("locked"), WTEXT("plain"), WTEXT("sub\\locked")}));
  EXPECT_EQ(All(tree, files, WTEXT("*"), FILE_ATTRIBUTE_READONLY), Paths({WTEXT("plain")}));
  EXPECT_EQ(All(tree, folders, WTEXT("*"), FILE_ATTRIBUTE_READONLY), Paths({WTEXT("sub")}));
}

TEST(OrderedRecurseFindFiles, SortsAllFiles) {
  Tree tree;
  SOrderedRecurseFindFiles files;
  EXPECT_EQ(files.FindFile(tree.Root()), 0);
  EXPECT_EQ(GetLastError(), DWORD(ERROR_FILE_NOT_FOUND));
  EXPECT_EQ(files.FindNextFileW(), 0);
  EXPECT_EQ(files.GetFilePath(), SString());
  for (const WCHAR* file : {WTEXT("b"), WTEXT("c\\a"), WTEXT("a")}) tree.File(file);
  ASSERT_EQ(files.FindFile(tree.Root()), 1);
  EXPECT_EQ(files.GetFilePath(), tree.Path(WTEXT("a")));
  EXPECT_EQ(files.FindNextFileW(), 1);
  EXPECT_EQ(files.FindNextFileW(), 1);
  EXPECT_EQ(files.GetFilePath(), tree.Path(WTEXT("c\\a")));
  EXPECT_EQ(files.FindNextFileW(), 0);
  EXPECT_EQ(files.GetFilePath(), tree.Path(WTEXT("c\\a")));
  EXPECT_EQ(files.GetPaths().GetCount(), 3);
  files.Clear();
  EXPECT_EQ(files.GetFilePath(), SString());
  EXPECT_EQ(files.FindFile(tree.Path(WTEXT("none\\*"))), 0);
  EXPECT_EQ(files.GetFailures().GetFirstError(), static_cast<unsigned long>(ERROR_PATH_NOT_FOUND));
}

// The same set as an independent walk of the same real tree gives, each entry with its size.
TEST(RecurseFindFiles, AgreesWithTheStandardLibraryOnTheSources) {
  namespace fs = std::filesystem;
  const fs::path root = fs::path(QXCORE_SOURCE_DIR) / "qxcore";
  std::map<std::string, std::uint64_t> expected, found;
  for (const fs::directory_entry& entry : fs::recursive_directory_iterator(root))
    if (entry.is_regular_file()) expected[entry.path().lexically_relative(root).generic_string()] = entry.file_size();
  ASSERT_GT(expected.size(), 100u);
  const SString base = SFile::NormalizeDirectoryName(SString(QXCORE_SOURCE_DIR) + WTEXT("/qxcore"));
  SRecurseFindFiles files;
  for (int more = files.FindFile(base); more; more = files.FindNextFileW()) {
    SString relative = files.GetFilePath().Mid(base.Length() + 1);
    relative.ReplaceAll(WCHAR('\\'), WCHAR('/'));
    EXPECT_TRUE(found.emplace(test::Narrow(test::Text(relative)), files.GetLength()).second);
  }
  EXPECT_EQ(found, expected);
}

// Folders that a cloud service fills when they are opened carry the mark of links and are none.
TEST(FileFind, OnlyNameSurrogatesAreLinks) {
  constexpr DWORD kFolder = FILE_ATTRIBUTE_DIRECTORY, kMark = FILE_ATTRIBUTE_REPARSE_POINT;
  constexpr DWORD kSymbolicLink = 0xA000000C, kMountPoint = 0xA0000003, kCloud = 0x9000601A, kDeduplicated = 0x80000013;
  for (const DWORD tag : {kSymbolicLink, kMountPoint, kCloud, kDeduplicated}) {
    WIN32_FIND_DATAW data = {};
    data.dwFileAttributes = kFolder | kMark;
    data.dwReserved0 = tag;
    KeepLinkMark(data);
    EXPECT_EQ(data.dwFileAttributes, tag == kSymbolicLink || tag == kMountPoint ? kFolder | kMark : kFolder) << tag;
  }
}

}  // namespace
