// The guard of the current directory: where it goes, and when it comes back.

#include "qxcore/system/file/current_directory.h"

#include <gtest/gtest.h>

#include <algorithm>

#include "qxcore/system/file/file.h"
#include "qxcore/system/file/file_find.h"
#include "tests/support/temp_folder.h"
#include "tests/support/text.h"

#ifndef _WIN32
#include <unistd.h>
#endif

namespace {

using Guard = SCurrentDirectory;

// Two folders, and the directory of before restored whatever a test leaves.
class CurrentDirectory : public testing::Test {
 protected:
  CurrentDirectory() : m_start(Guard::Get()), m_one(Make(WTEXT("One"))), m_two(Make(WTEXT("two"))) {}
  ~CurrentDirectory() override { Guard::Set(m_start); }

  SString Make(const WCHAR* name) const {
    const SString path(m_folder.File(name).c_str());
    SFile::CreateDirectoryW(path);
    return SFile::ToLongNames(path);
  }
  static SString Upper(SString text) {
    text.ToUpper();
    return text;
  }

  test::TempFolder m_folder;
  SString m_start, m_one, m_two;
};

TEST_F(CurrentDirectory, GetAndSet) {
  EXPECT_EQ(Guard::Get(), SFile::NormalizeDirectoryName(WTEXT(".")));
  EXPECT_EQ(Guard::Set(m_one), 1);
  EXPECT_EQ(Guard::Get(), m_one);
  EXPECT_EQ(Guard::Set(m_one + WTEXT("\\none")), 0);
  EXPECT_EQ(Guard::Get(), m_one);
  EXPECT_EQ(Guard::Set(WTEXT("C:\\")), 1);
  EXPECT_EQ(Guard::Get(), SString(WTEXT("C:\\")));
  EXPECT_EQ(SFile::IsDirectory(Guard::GetDefaultTemporaryDirectory()), 1);
}

TEST_F(CurrentDirectory, AssignAndRestore) {
  Guard guard;
  EXPECT_EQ(guard.Restore(), 0);  // nothing was assigned
  EXPECT_EQ(guard.Assign(m_one), 1);
  EXPECT_EQ(Guard::Get(), m_one);
  EXPECT_EQ(guard.Restore(), 1);
  EXPECT_EQ(Guard::Get(), m_start);
  Guard::Set(m_one);
  EXPECT_EQ(guard.Restore(), 0);  // forgotten
  EXPECT_EQ(Guard::Get(), m_one);
  // There already, in whatever spelling.
  EXPECT_EQ(guard.Assign(Upper(m_one) + WTEXT("\\")), 0);
  EXPECT_EQ(Guard::Get(), m_one);
  EXPECT_EQ(guard.Restore(1), 0);
  EXPECT_EQ(guard.Assign(WTEXT("..\\two\\.")), 1);
  EXPECT_EQ(Guard::Get(), m_two);
  // Kept, it can be restored again and again.
  for (int i = 0; i < 2; ++i) {
    EXPECT_EQ(guard.Restore(1), 1);
    EXPECT_EQ(Guard::Get(), m_one);
    Guard::Set(m_two);
  }
  guard.CancelRestore();
  EXPECT_EQ(guard.Restore(), 0);
  EXPECT_EQ(Guard::Get(), m_two);
  EXPECT_EQ(guard.Assign(SString()), 1);
  EXPECT_EQ(Guard::Get().CompareNoCase(Guard::GetDefaultTemporaryDirectory()), 0);
}

// Somebody else's choice stands, unless the guard is told not to mind.
TEST_F(CurrentDirectory, WhenSomebodyElseHasMovedOn) {
  Guard guard;
  guard.Assign(m_one, 0);
  Guard::Set(m_two);
  EXPECT_EQ(guard.Restore(1), 0);
  EXPECT_EQ(Guard::Get(), m_two);
  Guard::Set(Upper(m_one));
  EXPECT_EQ(guard.Restore(1), 1);  // the same in other letters
  EXPECT_EQ(Guard::Get(), m_start);
  guard.Assign(m_one, 1);
  Guard::Set(m_two);
  EXPECT_EQ(guard.Restore(), 1);
  EXPECT_EQ(Guard::Get(), m_start);
}

TEST_F(CurrentDirectory, FailedAssignmentsChangeNothing) {
  Guard guard;
  EXPECT_EQ(guard.Assign(m_one + WTEXT("\\none")), 0);
  EXPECT_EQ(GetLastError(), DWORD(ERROR_FILE_NOT_FOUND));
  EXPECT_EQ(Guard::Get(), m_start);
  EXPECT_EQ(guard.Restore(1), 0);
  EXPECT_EQ(guard.Assign(SString(test::Text(400, 'x').c_str())), 0);
  EXPECT_EQ(Guard::Get(), m_start);
  // The folder to return to has gone.
  SString gone = Make(WTEXT("gone"));
  Guard::Set(gone);
  EXPECT_EQ(guard.Assign(m_one), 1);
  ASSERT_EQ(SFile::RemoveDirectoryW(gone), 0);
  EXPECT_EQ(guard.Restore(1), 0);
  EXPECT_EQ(GetLastError(), DWORD(ERROR_FILE_NOT_FOUND));
  EXPECT_EQ(Guard::Get(), m_one);
}

TEST_F(CurrentDirectory, TheEndOfTheGuardRestores) {
  {
    Guard guard(m_one);
    EXPECT_EQ(Guard::Get(), m_one);
  }
  EXPECT_EQ(Guard::Get(), m_start);
  {
    Guard guard(m_one);
    Guard::Set(m_two);
  }
  EXPECT_EQ(Guard::Get(), m_two);
  {
    Guard guard(m_one, 1);
    guard.CancelRestore();
  }
  EXPECT_EQ(Guard::Get(), m_one);
}

#ifndef _WIN32
// Somebody removed it: relative names lead nowhere then, least of all to the root.
TEST_F(CurrentDirectory, ThatIsGone) {
  ASSERT_EQ(Guard::Set(m_two), 1);
  std::string native = test::Narrow(test::Text(m_two)).substr(2);
  std::replace(native.begin(), native.end(), '\\', '/');
  ASSERT_EQ(rmdir(native.c_str()), 0);
  EXPECT_EQ(Guard::Get(), SString());
  EXPECT_EQ(GetLastError(), DWORD(ERROR_PATH_NOT_FOUND));
  EXPECT_EQ(SFile::GetCurrentDrive(), SString());
  EXPECT_EQ(SFile::Exists(WTEXT("etc")), 0);
  EXPECT_EQ(SFile::Exists(WTEXT("C:etc")), 0);
  EXPECT_EQ(SFile::Exists(WTEXT("\\etc")), 1);
  EXPECT_EQ(SFile::NormalizeFileName(WTEXT("etc")), SString());
  EXPECT_EQ(SFile().Init(SString(WTEXT("etc"))), static_cast<HRESULT>(SFile::kInvalidFilename));
  EXPECT_EQ(SFile(SString(), SString(), WTEXT("etc"), SString()).Exists(), 0);
  SFileFind find;
  EXPECT_EQ(find.FindFile(), 0);
  EXPECT_EQ(GetLastError(), DWORD(ERROR_PATH_NOT_FOUND));
  Guard guard;
  EXPECT_EQ(guard.Assign(m_one), 1);
  EXPECT_EQ(guard.Restore(), 0);  // there is nothing to return to
  EXPECT_EQ(Guard::Get(), m_one);
}

// The system tells the folder behind a link; that is no moving on.
TEST_F(CurrentDirectory, BehindALink) {
  const std::string native = test::Narrow(m_folder.Path()).substr(2);
  std::string link = native + "/link";
  std::replace(link.begin(), link.end(), '\\', '/');
  ASSERT_EQ(symlink("One", link.c_str()), 0);
  Guard guard;
  EXPECT_EQ(guard.Assign(SString(m_folder.File(WTEXT("link")).c_str())), 1);
  EXPECT_EQ(Guard::Get(), m_one);
  EXPECT_EQ(guard.Restore(), 1);
  EXPECT_EQ(Guard::Get(), m_start);
}
#endif

}  // namespace
