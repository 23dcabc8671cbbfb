// Files that are written only if their content changes.

#include "qxcore/stream/output_file_on_change.h"

#include <gtest/gtest.h>

#include <cerrno>
#include <chrono>
#include <string>
#include <thread>

#include "qxcore/core/error_cause.h"
#include "qxcore/core/io_exceptions.h"
#include "qxcore/system/file/file.h"
#include "tests/support/failing_allocations.h"
#include "tests/support/temp_folder.h"
#include "tests/support/text.h"

namespace {

using test::ReadAll;
using test::TempFolder;
using test::WriteAll;

SString Str(const test::Text& text) { return SString(text.c_str()); }

// Writes the content in pieces; gives what Close says.
int Put(const test::Text& path, const std::string& content) {
  SOutputFileOnChange out(Str(path));
  std::size_t at = 0;
  for (std::size_t piece = 1; at < content.size(); piece = piece * 3 + 1) {
    const std::size_t count = std::min(piece, content.size() - at);
    out.Write(content.data() + at, static_cast<unsigned long>(count));
    at += count;
  }
  out.Flush();
  int changed = -1, again = -1;
  out.Close(&changed);
  out.Close(&again);
  EXPECT_EQ(again, changed);
  EXPECT_THROW(out.Write('x'), SEIOWriteFailed);
  return changed;
}

// A time stamp long ago, which a write would lose.
void MakeReadOnly(const test::Text& path, bool readOnly) {
  SetFileAttributesW(path.c_str(), readOnly ? FILE_ATTRIBUTE_READONLY : FILE_ATTRIBUTE_NORMAL);
}

TEST(OutputFileOnChange, WritesOnlyWhatDiffers) {
  TempFolder folder;
  const test::Text path = folder.File(WTEXT("out"));
  std::string content(100000, 'c');
  EXPECT_EQ(Put(path, content), 1);  // new
  EXPECT_EQ(ReadAll(path), content);
  FILETIME before, after;
  SFile file(Str(path));
  file.GetDateTime(&before);
  std::this_thread::sleep_for(std::chrono::milliseconds(30));
  EXPECT_EQ(Put(path, content), 0);
  file.GetDateTime(&after);
  EXPECT_EQ(CompareFileTime(&before, &after), 0);
  for (std::size_t at : {0u, 16383u, 16384u, 99999u}) {  // around the blocks of the comparison
    content[at] ^= 1;
    EXPECT_EQ(Put(path, content), 1);
    EXPECT_EQ(ReadAll(path), content);
  }
  content.resize(10);  // cut to the new length
  EXPECT_EQ(Put(path, content), 1);
  EXPECT_EQ(ReadAll(path), content);
  EXPECT_EQ(Put(path, content + "more"), 1);
  EXPECT_EQ(ReadAll(path), content + "more");
  EXPECT_EQ(Put(path, ""), 1);
  EXPECT_EQ(ReadAll(path), "");
  EXPECT_EQ(Put(path, ""), 0);
}

TEST(OutputFileOnChange, AReadOnlyFileMayStayAsItIs) {
  TempFolder folder;
  const test::Text path = folder.File(WTEXT("out"));
  WriteAll(path, "same");
  MakeReadOnly(path, true);
  EXPECT_EQ(Put(path, "same"), 0);
  // A changed one cannot be written; the output waits for another try.
  SOutputFileOnChange out(Str(path));
  out.Write("other", 5);
  EXPECT_ANY_THROW(out.Close());
  EXPECT_EQ(ReadAll(path), "same");
  MakeReadOnly(path, false);
  int changed = 0;
  out.Close(&changed);
  EXPECT_EQ(changed, 1);
  EXPECT_EQ(ReadAll(path), "other");
}

TEST(OutputFileOnChange, TheDestructorCloses) {
  TempFolder folder;
  const test::Text path = folder.File(WTEXT("out"));
  WriteAll(path, "old");
  {
    SOutputFileOnChange out(Str(path));
    out.Write("new", 3);
    EXPECT_EQ(ReadAll(path), "old");
  }
  EXPECT_EQ(ReadAll(path), "new");
  { SOutputFileOnChange out(Str(folder.File(WTEXT("created")))); }
  EXPECT_EQ(ReadAll(folder.File(WTEXT("created"))), "");
}

TEST(OutputFileOnChange, Failures) {
  TempFolder folder;
  EXPECT_THROW(SOutputFileOnChange(Str(folder.File(WTEXT("no\\file")))), SEIOCantOpenForWriting);
  {
    SOutputFileOnChange onFolder(Str(folder.Path()));
    EXPECT_THROW(onFolder.Close(nullptr), SEIOCantOpenForWriting);
  }
  const test::Text path = folder.File(WTEXT("out"));
  const SString name = Str(path);
  WithEachAllocationFailing(
      [&] {
        WriteAll(path, "old");
        SOutputFileOnChange out(name);
        const std::string content(20000, 'n');
        out.Write(content.data(), 20000);
        out.Close();
      },
      [&] {
        const std::string left = ReadAll(path);
        EXPECT_TRUE(left == "old" || left.empty()) << "a failed write adds nothing, and a failed Close changes nothing";
      });
  EXPECT_EQ(ReadAll(path), std::string(20000, 'n'));
#ifndef _WIN32
  SOutputFileOnChange full(SString(WTEXT("C:\\dev\\full")));
  full.Write('x');
  EXPECT_THROW(full.Close(nullptr), SEIOWriteFailed);
#endif
}

// A Close that failed is the caller's to repeat: the destructor must not write over what was mended meanwhile.
TEST(OutputFileOnChangeFaults, ADestructorBehindAFailedCloseWritesNothing) {
  TempFolder folder;
  const test::Text path = folder.File(WTEXT("file"));
  WriteAll(path, "old");
  {
    SOutputFileOnChange out{Str(path)};
    out.Write("new content", 11);
    SetFileAttributesW(path.c_str(), FILE_ATTRIBUTE_READONLY);
    try {
      out.Close();
      ADD_FAILURE() << "a file that may not be written was written";
    } catch (const SEIOException& failure) {
      EXPECT_EQ(SGetErrorCause(failure), EACCES);
    }
    SetFileAttributesW(path.c_str(), FILE_ATTRIBUTE_NORMAL);
    WriteAll(path, "mended");
  }
  EXPECT_EQ(ReadAll(path), "mended");
  SOutputFileOnChange out{Str(path)};
  out.Write("again", 5);
  SetFileAttributesW(path.c_str(), FILE_ATTRIBUTE_READONLY);
  EXPECT_THROW(out.Close(), SEIOException);
  SetFileAttributesW(path.c_str(), FILE_ATTRIBUTE_NORMAL);
  out.Close();
  EXPECT_EQ(ReadAll(path), "again");
}

}  // namespace
