// Streams and archives whose file, source or target fails: every call of the system in turn, every read, every write.

#include <gtest/gtest.h>

#include <algorithm>
#include <cerrno>
#include <string>

#include "qxcore/core/io_exceptions.h"
#include "qxcore/stream/input_buffer.h"
#include "qxcore/stream/output_file_on_change.h"
#include "qxcore/stream/output_stream.h"
#include "qxcore/stream/zip/zip_file.h"
#include "qxcore/stream/zip/zip_input_stream.h"
#include "tests/stream/zip_builder.h"
#include "tests/support/open_handles.h"
#include "tests/support/temp_folder.h"

#ifndef _WIN32
#include "tests/support/failing_calls.h"
#include "tests/support/file_size_limit.h"
#endif

namespace {

std::string SomeArchive() {
  test::ZipBuilder zip;
  std::string text;
  for (int i = 0; i < 3000; ++i) text += std::to_string(i * 7919 % 10007) + " ";
  zip.parts.emplace_back("stored", text, false);
  zip.parts.emplace_back("deflated", text);
  zip.parts.emplace_back("later", text);
  zip.parts.back().flags = 8;
  return zip.Make();
}

// Ends, as a stream does whose source fails, at the n-th read, and for ever after.
class FailingSource : public SInputBuffer {
 public:
  FailingSource(const std::string& bytes, long failAt)
      : SInputBuffer(bytes.data(), static_cast<unsigned long>(bytes.size())), m_left(failAt) {}
  using SInputBuffer::Read;
  unsigned long Read(void* buffer, unsigned long count) override {
    if (m_left > 0 && --m_left == 0) m_error = EIO;
    return m_error != 0 ? 0 : SInputBuffer::Read(buffer, count < 500 ? count : 500);
  }
  int GetError() const override { return m_error; }

 private:
  long m_left;
  int m_error = 0;
};

TEST(ZipFaults, AFailedReadNeverPassesAsTheEnd) {
  const std::string archive = SomeArchive();
  int failures = 0;
  for (long n = 1;; ++n) {
    FailingSource source(archive, n);
    SZipInputStream zip(source);
    int entries = 0;
    bool thrown = false;
    try {
      for (; zip.GetNextEntry() != nullptr; ++entries) zip.CloseEntry();
    } catch (const SException&) {
      thrown = true;
    }
    // A failure behind the last entry, in what is read ahead, does no harm.
    EXPECT_TRUE(thrown || entries == 3) << n;
    EXPECT_TRUE(!thrown || zip.GetError() != 0) << n;
    if (zip.GetError() == 0) break;
    if (thrown) ++failures;
  }
  EXPECT_GT(failures, 50);
}

// Throws at the n-th write.
class FailingTarget : public SOutputStream {
 public:
  explicit FailingTarget(long failAt) : m_left(failAt) {}
  void Write(int) override {}
  unsigned long Write(const void*, unsigned long count) override {
    if (--m_left == 0) throw SEIODiskFullException();
    return count;
  }

 private:
  long m_left;
};

TEST(ZipFaults, AFailedWriteIsTheWritersException) {
  test::TempFolder folder;
  ASSERT_TRUE(test::WriteAll(folder.File(WTEXT("a.zip")), SomeArchive()));
  const SString path(folder.File(WTEXT("a.zip")).c_str());
  FailingTarget first(1), never(0);
  EXPECT_THROW(SZipFile::ExtractTo(path, WTEXT("deflated"), first), SEIODiskFullException);
  SZipFile::ExtractTo(path, WTEXT("deflated"), never);
}

#ifndef _WIN32

// Wherever the disk is full, at the first byte or when the last ones are flushed by the close: no half file stays.
TEST(ZipFaults, AnExtractionThatFailsLeavesNoFile) {
  test::TempFolder folder;
  ASSERT_TRUE(test::WriteAll(folder.File(WTEXT("a.zip")), SomeArchive()));
  const SString archive(folder.File(WTEXT("a.zip")).c_str());
  const test::Text target = folder.File(WTEXT("target"));
  SZipFile::ExtractFile(archive, WTEXT("deflated"), SString(target.c_str()));
  const std::string whole = test::ReadAll(target);
  for (const std::size_t limit : {std::size_t{0}, std::size_t{1}, whole.size() / 2, whole.size() - 1}) {
    test::RemoveAll(target);
    const int before = CountOpenHandles();
    {
      const test::FileSizeLimit full(limit);
      EXPECT_THROW(SZipFile::ExtractFile(archive, WTEXT("deflated"), SString(target.c_str())), SEIOException) << limit;
    }
    EXPECT_EQ(GetFileAttributesW(target.c_str()), INVALID_FILE_ATTRIBUTES) << limit;
    EXPECT_EQ(CountOpenHandles(), before);
  }
  // What had room for all of it is whole.
  const test::FileSizeLimit enough(whole.size());
  SZipFile::ExtractFile(archive, WTEXT("deflated"), SString(target.c_str()));
  EXPECT_EQ(test::ReadAll(target), whole);
}

// A link and what it leads to are not the extraction's to remove.
TEST(ZipFaults, AnExtractionThatFailsLeavesLinksAndDevices) {
  test::TempFolder folder;
  std::string damaged = SomeArchive();
  damaged[damaged.rfind("PK\x01\x02", damaged.rfind("stored")) + 16] ^= 1;  // the checksum in the directory
  ASSERT_TRUE(test::WriteAll(folder.File(WTEXT("a.zip")), damaged));
  ASSERT_TRUE(test::WriteAll(folder.File(WTEXT("kept")), "former"));
  std::string link = test::Narrow(folder.File(WTEXT("link"))).substr(2);
  std::replace(link.begin(), link.end(), '\\', '/');
  ASSERT_EQ(symlink("kept", link.c_str()), 0);
  const SString archive(folder.File(WTEXT("a.zip")).c_str());
  EXPECT_THROW(SZipFile::ExtractFile(archive, WTEXT("stored"), SString(folder.File(WTEXT("link")).c_str())),
               SEZipException);
  EXPECT_NE(GetFileAttributesW(folder.File(WTEXT("link")).c_str()) & FILE_ATTRIBUTE_REPARSE_POINT, 0u);
  EXPECT_EQ(test::ReadAll(folder.File(WTEXT("kept"))), "") << "half an entry would look like a whole one";
  EXPECT_THROW(SZipFile::ExtractFile(archive, WTEXT("stored"), SString(WTEXT("C:\\dev\\null"))), SEZipException);
  EXPECT_NE(GetFileAttributesW(WTEXT("C:\\dev\\null")), INVALID_FILE_ATTRIBUTES);
}

// The comparison that cannot read the file, the file that cannot be written: what is there at the end is the new
// content, or the caller was told.
TEST(OutputFileOnChangeFaults, NoFailedCallPassesAsDone) {
  test::TempFolder folder;
  const test::Text path = folder.File(WTEXT("out"));
  const std::string former(40000, 'f'), content = former.substr(0, 39999) + "g";
  for (const std::string& wanted : {former, content}) {
    for (const int error : {EIO, ENOSPC, EACCES}) {
      int said = -1;
      WithEachCallFailing(
          error,
          [&] {
            const Orders orders = g_orders;  // the file is made anew without failures
            g_orders = {};
            ASSERT_TRUE(test::WriteAll(path, former));
            g_orders = orders;
            said = -1;
            try {
              SOutputFileOnChange out{SString(path.c_str())};
              out.Write(wanted.data(), static_cast<unsigned long>(wanted.size()));
              out.Close(&said);
            } catch (const SEIOException&) {
            }
          },
          [&](bool failed) {
            if (said >= 0) {
              EXPECT_EQ(test::ReadAll(path), wanted);
            }
            if (!failed) {
              EXPECT_EQ(said, wanted != former);
            }
          });
    }
  }
}

TEST(ZipFaults, ADirectoryThatCannotBeReadIsNeverShort) {
  test::TempFolder folder;
  ASSERT_TRUE(test::WriteAll(folder.File(WTEXT("a.zip")), SomeArchive()));
  const SString path(folder.File(WTEXT("a.zip")).c_str());
  const int before = CountOpenHandles();
  for (const int error : {EIO, ENOMEM}) {
    int entries = 0;
    bool told = false;
    WithEachCallFailing(
        error,
        [&] {
          entries = 0;
          told = false;
          try {
            SZipFile zip(path);
            for (int found = zip.FindFile(nullptr, 0); found; found = zip.FindNextFileW()) ++entries;
            told = zip.HasFailed() != 0;
          } catch (const SEZipException&) {
            told = true;
          }
        },
        [&](bool failed) {
          EXPECT_TRUE(told || entries == 3);
          if (!failed) {
            EXPECT_FALSE(told);
          }
          EXPECT_EQ(CountOpenHandles(), before);
        });
  }
}

#endif

}  // namespace
