// Finders over what only other systems have: links, foreign names, names that differ in case, folders without
// permission, paths that are too long.

#include <gtest/gtest.h>

#ifndef _WIN32

#include <fcntl.h>
#include <grp.h>
#include <sys/stat.h>
#include <sys/wait.h>
#include <unistd.h>

#include <algorithm>
#include <map>
#include <set>
#include <string>
#include <vector>

#include "qxcore/system/file/file.h"
#include "qxcore/system/file/ordered_recurse_find_files.h"
#include "qxcore/system/file/recurse_find.h"
#include "tests/support/temp_folder.h"
#include "tests/support/text.h"

namespace {

using test::TempFolder;

SString Str(const test::Text& text) { return SString(text.c_str()); }

// A folder that is filled in the system's own terms.
class NativeTree {
 public:
  NativeTree() : m_native(test::Narrow(m_folder.Path()).substr(2)) {
    std::replace(m_native.begin(), m_native.end(), '\\', '/');
  }
  ~NativeTree() { [[maybe_unused]] const int result = std::system(("chmod -R u+rwx " + m_native).c_str()); }

  std::string Native(const std::string& name) const { return m_native + "/" + name; }
  void File(const std::string& name) const {
    const int file = open(Native(name).c_str(), O_CREAT | O_WRONLY, 0666);
    ASSERT_GE(file, 0) << name;
    ASSERT_EQ(write(file, name.data(), name.size()), static_cast<ssize_t>(name.size()));
    close(file);
  }
  void Folder(const std::string& name) const { ASSERT_EQ(mkdir(Native(name).c_str(), 0777), 0) << name; }
  void Link(const std::string& target, const std::string& name) const {
    ASSERT_EQ(symlink(target.c_str(), Native(name).c_str()), 0) << name;
  }
  SString Path(const WCHAR* name) const { return Str(m_folder.File(name)); }

 private:
  TempFolder m_folder;
  std::string m_native;
};

std::multiset<SString> NamesOf(SFinder& finder, const SString& mask) {
  std::multiset<SString> names;
  for (int found = finder.FindFile(mask); found; found = finder.FindNextFileW()) names.insert(finder.GetFileName());
  return names;
}

std::multiset<SString> Names(std::initializer_list<const WCHAR*> names) {
  std::multiset<SString> set;
  for (const WCHAR* name : names) set.insert(SString(name));
  return set;
}

TEST(FinderLinks, AreReportedAndNeverEntered) {
  NativeTree tree;
  tree.Folder("real");
  tree.File("real/inside");
  tree.Link("real", "linked");
  tree.Link("..", "real/up");  // a loop
  tree.Link(".", "self");
  tree.Link("nowhere", "dangling");
  tree.Link("ring2", "ring1");
  tree.Link("ring1", "ring2");
  tree.Link("real/inside", "tofile");
  SFileFind find;
  std::map<SString, unsigned> kinds;
  for (int found = find.FindFile(tree.Path(WTEXT("*"))); found; found = find.FindNextFileW())
    kinds[find.GetFileName()] = static_cast<unsigned>(find.IsLink() * 2 + find.IsDirectory());
  EXPECT_EQ(kinds[WTEXT("real")], 1u);
  EXPECT_EQ(kinds[WTEXT("linked")], 3u);
  EXPECT_EQ(kinds[WTEXT("self")], 3u);
  EXPECT_EQ(kinds[WTEXT("dangling")], 2u);
  EXPECT_EQ(kinds[WTEXT("ring1")], 2u);
  EXPECT_EQ(kinds[WTEXT("tofile")], 2u);
  find.FindFile(tree.Path(WTEXT("tofile")));
  EXPECT_EQ(find.GetLength(), 11u);  // of what it leads to

  SRecurseFindFiles files;
  EXPECT_EQ(NamesOf(files, tree.Path(WTEXT("*"))),
            Names({WTEXT("inside"), WTEXT("dangling"), WTEXT("ring1"), WTEXT("ring2"), WTEXT("tofile")}));
  EXPECT_TRUE(files.GetFailures().IsEmpty());
  SRecurseFindFolders folders;
  EXPECT_EQ(NamesOf(folders, tree.Path(WTEXT("*"))),
            Names({WTEXT("real"), WTEXT("linked"), WTEXT("up"), WTEXT("self")}));
  EXPECT_TRUE(folders.GetFailures().IsEmpty());
  // Whoever names a link himself goes through it.
  EXPECT_EQ(NamesOf(files, tree.Path(WTEXT("linked\\*"))), Names({WTEXT("inside")}));
}

TEST(FinderNames, ForeignOnesAreFoundOpenedAndRenamed) {
  NativeTree tree;
  const std::string names[] = {"a:b",  "what?", "tab\there", "latin\xE9",        "back\\slash", "private\xEF\x81\x81",
                               "dot.", " ",     "\x01",      "\xED\xA0\x80lone", "<|>\"*",      "\xF0\x9F\x98\x80"};
  tree.Folder("in:side\xFF");
  std::set<std::string> expected, opened;
  for (const std::string& name : names) {
    tree.File("in:side\xFF/" + name);
    expected.insert("in:side\xFF/" + name);
  }
  SRecurseFindFiles files;
  std::vector<SString> paths;
  for (int found = files.FindFile(tree.Path(WTEXT("*"))); found; found = files.FindNextFileW())
    paths.push_back(files.GetFilePath());
  for (std::size_t i = 0; i < paths.size(); ++i) {
    SFile file(paths[i]);
    EXPECT_EQ(file.CheckFilename(), 1);
    ASSERT_EQ(file.OpenExisting(), 0);
    char bytes[64];
    unsigned long count = sizeof bytes;
    EXPECT_EQ(file.Read(bytes, count), 0);
    opened.insert(std::string(bytes, count));
    file.Close();
    const SString renamed = paths[i] + WTEXT("!");
    EXPECT_EQ(file.Rename(renamed), 0);
    EXPECT_EQ(SFile::URLToPath(SFile::PathToURL(renamed)), renamed);
  }
  EXPECT_EQ(opened, expected);
  for (const std::string& name : names) EXPECT_EQ(access(tree.Native("in:side\xFF/" + name + "!").c_str(), F_OK), 0);
}

// Both are entries; a name in its exact spelling is taken first.
TEST(FinderNames, DifferingOnlyInCase) {
  NativeTree tree;
  tree.Folder("Sub");
  tree.Folder("sub");
  tree.File("Sub/one");
  tree.File("sub/two");
  tree.File("sub/TWO");
  SRecurseFindFiles files;
  EXPECT_EQ(NamesOf(files, tree.Path(WTEXT("*"))), Names({WTEXT("one"), WTEXT("two"), WTEXT("TWO")}));
  EXPECT_EQ(NamesOf(files, tree.Path(WTEXT("Sub\\*"))), Names({WTEXT("one")}));
  EXPECT_EQ(NamesOf(files, tree.Path(WTEXT("sub\\t*"))), Names({WTEXT("two"), WTEXT("TWO")}));
  for (int found = files.FindFile(tree.Path(WTEXT("*"))); found; found = files.FindNextFileW()) {
    SFile file(files.GetFilePath());
    EXPECT_EQ(file.OpenExisting(), 0);
    unsigned long low = 0, high = 0;
    EXPECT_EQ(file.GetSize(low, high), 0);
    EXPECT_EQ(low, 7u);
  }
}

class Failures final : public SFindFailureSink {
 public:
  void OnFolderNotRead(const SString& folder, unsigned long error) override { m_errors[folder] = error; }
  std::map<SString, unsigned long> m_errors;
};

// Longer than 260 characters: the branch ends with the error for invalid names, the others go on.
TEST(FinderPaths, TooLongOnesEndTheirBranch) {
  NativeTree tree;
  tree.Folder("b");
  std::string deep = "a";
  tree.Folder(deep);
  int visible = 1;
  while (tree.Native(deep).size() < 400) {
    deep += "/" + std::string(40, 'd');
    tree.Folder(deep);
    if (tree.Native(deep.substr(0, deep.size() - 41)).size() + 2 <= 255) ++visible;
  }
  tree.File(deep + "/unreachable");
  tree.File("b/reachable");
  Failures sink;
  SRecurseFindFiles files;
  files.SetFailureSink(&sink);
  EXPECT_EQ(NamesOf(files, tree.Path(WTEXT("*"))), Names({WTEXT("reachable")}));
  EXPECT_EQ(GetLastError(), DWORD(ERROR_INVALID_NAME));
  EXPECT_EQ(files.GetFailures().GetCount(), 1);
  ASSERT_EQ(sink.m_errors.size(), 1u);
  const SString& folder = sink.m_errors.begin()->first;
  EXPECT_EQ(sink.m_errors.begin()->second, static_cast<unsigned long>(ERROR_INVALID_NAME));
  EXPECT_GT(folder.Length(), 255);
  EXPECT_LT(folder.Length(), 255 + 42);
  SRecurseFindFolders folders;
  EXPECT_EQ(NamesOf(folders, tree.Path(WTEXT("*"))).size(), static_cast<std::size_t>(visible) + 1);  // and "b"
  EXPECT_EQ(GetLastError(), DWORD(ERROR_INVALID_NAME));
  SOrderedRecurseFindFiles ordered;
  EXPECT_EQ(ordered.FindFile(tree.Path(WTEXT("*"))), 1);
  EXPECT_EQ(ordered.GetFailures().GetFirstFolder(), folder);
  const int removed = std::system(("rm -r " + tree.Native("a")).c_str());
  EXPECT_EQ(removed, 0);
}

// Runs a check as a user without rights, in a process of its own: 0 when it holds.
template <class Check>
int AsNobody(Check check) {
  const pid_t child = fork();
  if (child == 0) {
    const bool changed = setgroups(0, nullptr) == 0 && setgid(65534) == 0 && setuid(65534) == 0;
    _exit(changed ? check() : 99);
  }
  int status = 0;
  waitpid(child, &status, 0);
  return WIFEXITED(status) ? WEXITSTATUS(status) : 98;
}

TEST(FinderPermissions, FoldersThatMayNotBeRead) {
  NativeTree tree;
  for (const char* folder : {"shut", "shut/below", "listed", "open"}) tree.Folder(folder);
  for (const char* file : {"shut/a", "listed/b", "open/c"}) tree.File(file);
  chmod(tree.Native("shut").c_str(), 0);
  chmod(tree.Native("listed").c_str(), 0444);  // names, but nothing about them
  const auto walk = [&tree]() -> int {
    Failures sink;
    SRecurseFindFiles files;
    files.SetFailureSink(&sink);
    if (NamesOf(files, tree.Path(WTEXT("*"))) != Names({WTEXT("c")})) return 1;
    if (GetLastError() != ERROR_ACCESS_DENIED || files.GetFailures().GetCount() != 2) return 2;
    if (sink.m_errors[tree.Path(WTEXT("shut"))] != ERROR_ACCESS_DENIED) return 3;
    if (sink.m_errors[tree.Path(WTEXT("listed"))] != ERROR_ACCESS_DENIED) return 4;
    SRecurseFindFolders folders;
    if (NamesOf(folders, tree.Path(WTEXT("*"))) != Names({WTEXT("shut"), WTEXT("listed"), WTEXT("open")})) return 5;
    if (folders.FindFile(tree.Path(WTEXT("shut\\*"))) || GetLastError() != ERROR_ACCESS_DENIED) return 6;
    SFile file(tree.Path(WTEXT("shut\\a")));
    unsigned long attributes;
    if (file.GetAttributes(attributes) != static_cast<HRESULT>(SFile::kGetAttributesFailed)) return 7;
    if (SFile(tree.Path(WTEXT("open\\c"))).SetAttributes(1) != static_cast<HRESULT>(SFile::kSetAttributesFailed))
      return 8;
    if (SFile(tree.Path(WTEXT("new"))).Create(0x80) != static_cast<HRESULT>(SFile::kCreateFailed)) return 9;
    return 0;
  };
  if (geteuid() != 0) GTEST_SKIP() << "files of somebody else are needed; only the superuser can make them";
  EXPECT_EQ(AsNobody(walk), 0);
}

}  // namespace
#endif
