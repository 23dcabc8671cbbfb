// Mapped memory, views and files, on real files and between handles.

#include <gtest/gtest.h>

#include <cstring>
#include <random>
#include <string>
#include <utility>

#include "qxcore/system/file/mapped_file.h"
#include "tests/support/temp_folder.h"
#include "tests/support/wine.h"

namespace {

using test::ReadAll;
using test::TempFolder;
using test::WriteAll;

constexpr HRESULT Code(std::uint32_t code) { return static_cast<HRESULT>(code); }

SString Path(const test::Text& path) { return SString(path.c_str()); }

class MappedFileTest : public testing::Test {
 protected:
  SString Make(const std::string& content, const WCHAR* name = WTEXT("data")) {
    EXPECT_TRUE(WriteAll(m_folder.File(name), content));
    return Path(m_folder.File(name));
  }
  std::string Content(const WCHAR* name = WTEXT("data")) const { return ReadAll(m_folder.File(name)); }

  TempFolder m_folder;
};

std::string Bytes(std::size_t count) {
  std::mt19937 random(static_cast<unsigned>(count));
  std::string bytes(count, '\0');
  for (char& byte : bytes) byte = static_cast<char>(random());
  return bytes;
}

TEST(MappedMemory, OfThePagingFileIsZeroAndShared) {
  SMappedMemory memory;
  EXPECT_FALSE(memory.IsMapped());
  EXPECT_EQ(memory.CloseMapping(), 0);
  EXPECT_EQ(memory.CreateMapping(0, 0, nullptr), 0);
  SMappedView view(memory), second(memory);
  ASSERT_EQ(view.OpenView(0), 0);
  EXPECT_EQ(view.GetLength(), SMappedMemory::kDefaultSize);
  EXPECT_EQ(view.GetPointer()[SMappedMemory::kDefaultSize - 1], 0);
  ASSERT_EQ(second.CreateView(100, 65536), 0);
  view.GetPointer()[65536 + 99] = 7;
  EXPECT_EQ(second.GetPointer()[99], 7);
  // The view outlives the handle.
  EXPECT_EQ(memory.CloseMapping(), 0);
  EXPECT_EQ(second.GetPointer()[99], 7);
  EXPECT_EQ(second.CloseView(), 0);
  EXPECT_EQ(second.CloseView(), 1);
  EXPECT_EQ(memory.OpenMapping(0), 0);
  EXPECT_EQ(memory.OpenMapping(std::uint64_t{100}), 0);  // takes the place of the former
}

TEST(MappedMemory, HandlesAreAdoptedReleasedAndDuplicated) {
  SMappedMemory first;
  ASSERT_EQ(first.CreateMapping(std::uint64_t{1000}), 0);
  void* const handle = first.GetSafeMapping();
  SMappedMemory second(first);
  EXPECT_NE(second.GetSafeMapping(), handle);
  EXPECT_TRUE(second.IsMapped());
  EXPECT_EQ(first.Set(handle, true), 0);
  EXPECT_EQ(first.GetSafeMapping(), handle);  // the same changes nothing
  EXPECT_EQ(second.Set(first, false), 0);
  EXPECT_EQ(second.GetSafeMapping(), handle);
  EXPECT_FALSE(first.IsMapped());
  EXPECT_EQ(second.DetachMapping(), handle);
  EXPECT_FALSE(second.IsMapped());
  first.AttachMapping(handle);
  EXPECT_EQ(first.CloseMapping(), 0);
  first.AttachMapping(handle);
  EXPECT_EQ(first.CloseMapping(), Code(0x8099000B));
  EXPECT_FALSE(first.IsMapped());
  EXPECT_EQ(first.Set(handle, true), E_FAIL);
  EXPECT_FALSE(first.IsMapped());
}

TEST(MappedMemory, OneNameIsOneMemory) {
  SMappedMemory first, second, other;
  ASSERT_EQ(first.CreateMapping(std::uint64_t{5000}, WTEXT("qxcore test \u00E4/1")), 0);
  EXPECT_NE(GetLastError(), static_cast<DWORD>(ERROR_ALREADY_EXISTS));
  ASSERT_EQ(second.CreateMapping(std::uint64_t{100}, WTEXT("Local\\qxcore test \u00E4/1")), 0);
  EXPECT_EQ(GetLastError(), static_cast<DWORD>(ERROR_ALREADY_EXISTS));
  ASSERT_EQ(other.CreateMapping(std::uint64_t{5000}, WTEXT("qxcore test \u00E4/2")), 0);
  SMappedView a(first), b(second), c(other);
  ASSERT_EQ(a.OpenView(0), 0);
  ASSERT_EQ(b.OpenView(0), 0);
  ASSERT_EQ(c.OpenView(0), 0);
  std::strcpy(reinterpret_cast<char*>(a.GetPointer()), "shared");
  EXPECT_STREQ(reinterpret_cast<char*>(b.GetPointer()), "shared");
  EXPECT_EQ(*c.GetPointer(), 0);
  // With its last holder the memory goes.
  a.Done();
  first.Done();
  EXPECT_STREQ(reinterpret_cast<char*>(b.GetPointer()), "shared");
  b.Done();
  second.Done();
  ASSERT_EQ(first.CreateMapping(std::uint64_t{5000}, WTEXT("qxcore test \u00E4/1")), 0);
  EXPECT_NE(GetLastError(), static_cast<DWORD>(ERROR_ALREADY_EXISTS));
  ASSERT_EQ(a.Set(first), 0);
  ASSERT_EQ(a.OpenView(0), 0);
  EXPECT_EQ(*a.GetPointer(), 0);
  EXPECT_EQ(second.CreateMapping(std::uint64_t{1}, WTEXT("a\\b")), Code(0x80990014));
}

TEST_F(MappedFileTest, ViewsShowTheFileAndChangeIt) {
  const std::string bytes = Bytes(200000);
  SMappedFile file(Make(bytes));
  ASSERT_EQ(file.OpenMapping(0, 0, nullptr), 0);
  SMappedView view(file);
  ASSERT_EQ(view.OpenView(0, 65536, 0), 0);
  EXPECT_EQ(std::memcmp(view.GetPointer(), bytes.data() + 65536, bytes.size() - 65536), 0);
  EXPECT_EQ(view.GetOffset(), 65536u);
  view.GetPointer()[0] = static_cast<unsigned char>(~bytes[65536]);
  EXPECT_EQ(view.FlushView(), E_FAIL);  // all went well
  ASSERT_EQ(view.OpenView(100, 65536, 0), 0);
  EXPECT_EQ(view.GetSize(), 100u);
  EXPECT_EQ(view.CloseView(), 0);
  EXPECT_EQ(view.GetSize(), 0u);
  EXPECT_EQ(view.GetOffset(), 0u);
  EXPECT_EQ(view.Done(), 0);
  EXPECT_EQ(view.FlushView(), 1);
  EXPECT_EQ(file.Done(), 0);
  std::string changed = bytes;
  changed[65536] = static_cast<char>(~bytes[65536]);
  EXPECT_EQ(Content(), changed);
}

TEST_F(MappedFileTest, SizesAreRelativeToTheFileOrAbsolute) {
  SMappedFile file(Make("0123456789"));
  ASSERT_EQ(file.OpenMapping(90, 0, nullptr), 0);
  file.Done();
  EXPECT_EQ(Content(), "0123456789" + std::string(90, '\0'));
  SMappedFile larger(Path(m_folder.File(WTEXT("data"))));
  ASSERT_EQ(larger.CreateMapping(std::uint64_t{5000}), 0);
  larger.Done();
  EXPECT_EQ(Content().size(), 5000u);
  SMappedFile fresh(Path(m_folder.File(WTEXT("new"))));  // is made; 0 is the default size
  ASSERT_EQ(fresh.CreateMapping(0, 0, nullptr), 0);
  fresh.Done();
  EXPECT_EQ(Content(WTEXT("new")).size(), SMappedMemory::kDefaultSize);
  SMappedFile endless(Path(m_folder.File(WTEXT("data"))));
  EXPECT_EQ(endless.OpenMapping(~std::uint64_t{0}), Code(0x80990014));
}

TEST_F(MappedFileTest, FailuresHaveTheirCodes) {
  SMappedView view;
  EXPECT_EQ(view.OpenView(10), Code(0x80070057));
  EXPECT_EQ(view.CreateView(10), Code(0x80070057));
  EXPECT_EQ(view.CloseView(), 1);
  SMappedFile empty(Make(""));
  EXPECT_EQ(empty.OpenMapping(0, 0, nullptr), Code(0x80990014));
  EXPECT_EQ(GetLastError(), static_cast<DWORD>(ERROR_FILE_INVALID));
  SMappedFile folder(Path(m_folder.File(WTEXT("no\\such\\folder"))));
  EXPECT_EQ(folder.OpenMapping(0, 0, nullptr), Code(0x80990014));
  char byte;
  unsigned long count = 1;
  EXPECT_EQ(folder.Read(&byte, &count), Code(0x80990014));
  EXPECT_EQ(count, 0u);
  SMappedFile file(Make("content", WTEXT("other")));
  ASSERT_EQ(file.OpenMapping(0, 0, nullptr), 0);
  ASSERT_EQ(view.Set(file), 0);
  EXPECT_EQ(view.OpenView(8), Code(0x80004005));
  EXPECT_EQ(view.OpenView(0, std::uint64_t{4096}), Code(0x80004005));
  EXPECT_EQ(GetLastError(), static_cast<DWORD>(ERROR_MAPPED_ALIGNMENT));
  EXPECT_EQ(file.Read(&byte, nullptr), Code(0x80004003));
  EXPECT_EQ(file.Write(&byte, nullptr), Code(0x80004003));
  EXPECT_EQ(file.Seek(nullptr, 0), Code(0x80004003));
}

TEST_F(MappedFileTest, FilesForReadingOnlyAreReadOnly) {
  const SString path = Make("read only");
  SetFileAttributesW(path, FILE_ATTRIBUTE_READONLY);
  SMappedFile file(path);
  EXPECT_EQ(file.CreateMapping(std::uint64_t{100}), Code(0x80990014));
  ASSERT_EQ(file.OpenMapping(0, 0, nullptr), 0);
  SMappedView view(file);
  EXPECT_EQ(view.CreateView(0), Code(0x80004005));
  ASSERT_EQ(view.OpenView(0), 0);
  EXPECT_EQ(std::memcmp(view.GetPointer(), "read only", 9), 0);
  char text[20];
  unsigned long count = sizeof text;
  EXPECT_EQ(file.Read(text, &count), 0);
  EXPECT_EQ(count, 9u);
  unsigned long start = 0;
  EXPECT_EQ(file.Seek(&start, 0), 0);
  count = 1;
  EXPECT_EQ(file.Write("x", &count), Code(0x8099000D));
  EXPECT_EQ(count, 0u);
  file.Done();
  SetFileAttributesW(path, FILE_ATTRIBUTE_NORMAL);
  EXPECT_EQ(Content(), "read only");
}

TEST_F(MappedFileTest, TheCursorReadsWritesAndSeeks) {
  const std::string bytes = Bytes(100000);
  SMappedFile file(Make(bytes));
  std::string read(70000, '\0');
  unsigned long count = 70000;
  EXPECT_EQ(file.Read(read.data(), &count), 0);
  EXPECT_EQ(read, bytes.substr(0, 70000));
  count = 70000;
  EXPECT_EQ(file.Read(read.data(), &count), 0);
  EXPECT_EQ(count, 30000u);
  EXPECT_EQ(read.substr(0, 30000), bytes.substr(70000));
  count = 1;
  EXPECT_EQ(file.Read(read.data(), &count), 0);
  EXPECT_EQ(count, 0u);
  unsigned long position = 0ul - 10;
  EXPECT_EQ(file.Seek(&position, 1), 0);
  EXPECT_EQ(position, 99990u);
  count = 20;
  EXPECT_EQ(file.Write("abcdefghijklmnopqrst", &count), Code(0x8099000D));  // does not fit
  EXPECT_EQ(count, 10u);
  position = 0ul - 100001;
  EXPECT_EQ(file.Seek(&position, 1), Code(0x80990010));
  EXPECT_EQ(GetLastError(), 131u);
  position = 5;
  EXPECT_EQ(file.Seek(&position, 2), Code(0x80070057));
  EXPECT_EQ(file.Seek(&position, 0), 0);
  count = 3;
  EXPECT_EQ(file.Write("xyz", &count), 0);
  EXPECT_EQ(file.Flush(), E_FAIL);  // all went well
  EXPECT_EQ(file.GetView().CloseView(), 0);
  EXPECT_EQ(file.Flush(), 0);  // of the file, the right way round
  EXPECT_EQ(file.Done(), 0);
  EXPECT_EQ(file.Flush(), 1);
  EXPECT_EQ(Content(), bytes.substr(0, 5) + "xyz" + bytes.substr(8, 99982) + "abcdefghij");
}

TEST_F(MappedFileTest, ACursorMovesOverTheViewThatItIsGiven) {
  SMappedFile file(Make(Bytes(65536) + "0123456789"));
  ASSERT_EQ(file.OpenMapping(0, 0, nullptr), 0);
  ASSERT_EQ(file.GetView().Set(file), 0);
  ASSERT_EQ(file.GetView().OpenView(4, std::uint64_t{65536}), 0);
  char text[20];
  unsigned long count = sizeof text;
  EXPECT_EQ(file.Read(text, &count), 0);
  EXPECT_EQ(std::string(text, count), "0123");
  // Up to the end of the file, though the view's pages reach beyond it.
  SMappedFile rest(Make(Bytes(65536) + "0123456789", WTEXT("second")));
  ASSERT_EQ(rest.OpenMapping(0, 0, nullptr), 0);
  ASSERT_EQ(rest.GetView().Set(rest), 0);
  ASSERT_EQ(rest.GetView().OpenView(0, std::uint64_t{65536}), 0);
  count = sizeof text;
  EXPECT_EQ(rest.Read(text, &count), 0);
  EXPECT_EQ(std::string(text, count), "0123456789");
}

TEST_F(MappedFileTest, CopiesShareTheFileAndMovesEmptyTheOther) {
  SMappedFile file(Make("0123456789"));
  char text[4];
  unsigned long count = 4;
  ASSERT_EQ(file.Read(text, &count), 0);
  SMappedFile copy(file), taken;
  EXPECT_EQ(taken.Set(file, false), 0);
  EXPECT_FALSE(file.IsMapped());
  EXPECT_FALSE(file.GetView().HasView());
  for (SMappedFile* each : {&copy, &taken}) {
    count = 4;
    EXPECT_EQ(each->Read(text, &count), 0);
    EXPECT_EQ(std::string(text, count), "4567");
  }
  SMappedView view(taken.GetView());  // takes it over
  EXPECT_TRUE(view.HasView());
  EXPECT_FALSE(taken.GetView().HasView());
  SMappedView second;
  EXPECT_EQ(second.Set(view, false), 0);
  EXPECT_NE(second.GetPointer(), view.GetPointer());
  EXPECT_EQ(second.GetPointer()[0], '0');
  EXPECT_EQ(view.Done(), 0);
  EXPECT_EQ(copy.Done(), 0);
  EXPECT_EQ(taken.Done(), 0);
}

// Who cuts the file and who reads it are not the same.
TEST_F(MappedFileTest, AFileThatIsCutTakesNobodyDown) {
  const std::string bytes = Bytes(100000);
  SMappedFile file(Make(bytes));
  file.GetFile().Open(SFile::kCurrentAttributes, FILE_SHARE_READ | FILE_SHARE_WRITE);
  ASSERT_EQ(file.OpenMapping(0, 0, nullptr), 0);
  ASSERT_EQ(file.GetView().Set(file), 0);
  ASSERT_EQ(file.GetView().OpenView(100000), 0);
  SFile cutter(Path(m_folder.File(WTEXT("data"))));
  ASSERT_EQ(cutter.Open(SFile::kCurrentAttributes, FILE_SHARE_READ | FILE_SHARE_WRITE), 0);
  std::int64_t end = 10;
  ASSERT_EQ(cutter.Seek(end, FILE_BEGIN), 0);
  if (IsWindows()) {
    EXPECT_EQ(cutter.SetEndOfFile(), Code(0x8099000D));
    EXPECT_EQ(GetLastError(), 1224u);
    return;
  }
  ASSERT_EQ(cutter.SetEndOfFile(), 0);
  std::string read(100000, '\0');
  unsigned long count = 100000;
  EXPECT_EQ(file.Read(read.data(), &count), Code(0x8099000E));
  EXPECT_EQ(count, 4096u);
  EXPECT_EQ(read.substr(0, 10), bytes.substr(0, 10));
  count = 100000;
  EXPECT_EQ(file.Write(read.data(), &count), Code(0x8099000D));
  EXPECT_EQ(count, 0u);
}

}  // namespace
