// SFile on real files: names, every status code, sharing, searches, folders.

#include "qxcore/system/file/file.h"

#include <gtest/gtest.h>

#ifndef _WIN32
#include <sys/stat.h>
#endif

#include <set>
#include <string>
#include <tuple>

#include "tests/support/temp_folder.h"
#include "tests/support/text.h"
#include "tests/support/wine.h"

namespace {

using test::ReadAll;
using test::TempFolder;
using test::WriteAll;

SString Str(const test::Text& text) { return SString(text.c_str()); }
HRESULT Code(SFile::Status status) { return static_cast<HRESULT>(status); }

using Parts = std::tuple<SString, SString, SString, SString>;

Parts Split(const WCHAR* path) {
  SString drive, directory, name, extension;
  SFile::SplitPath(path, drive, directory, name, extension);
  return {drive, directory, name, extension};
}

// The current directory as a split name has it.
SString Here() {
  SString here = SFile::GetCurrentDirectoryW();
  return here.Mid(1);
}

TEST(FileNames, Splitting) {
  const SString none, drive(WTEXT("C:\\"));
  EXPECT_EQ(Split(WTEXT("C:\\dir\\sub\\name.ext")), Parts(drive, WTEXT("dir\\sub\\"), WTEXT("name"), WTEXT("ext")));
  EXPECT_EQ(Split(WTEXT("C:\\name")), Parts(drive, none, WTEXT("name"), none));
  EXPECT_EQ(Split(WTEXT("D:\\x.tar.gz")), Parts(WTEXT("D:\\"), none, WTEXT("x.tar"), WTEXT("gz")));
  EXPECT_EQ(Split(WTEXT("C:\\a.b\\c")), Parts(drive, WTEXT("a.b\\"), WTEXT("c"), none));
  EXPECT_EQ(Split(WTEXT("\\\\server\\share\\dir\\f.txt")),
            Parts(WTEXT("\\\\server\\"), WTEXT("share\\dir\\"), WTEXT("f"), WTEXT("txt")));
  EXPECT_EQ(Split(WTEXT("\\rooted.txt")), Parts(SFile::GetCurrentDrive(), none, WTEXT("rooted"), WTEXT("txt")));
  EXPECT_EQ(Split(WTEXT("plain.txt")), Parts(SFile::GetCurrentDrive(), Here(), WTEXT("plain"), WTEXT("txt")));
  EXPECT_EQ(Split(WTEXT("sub\\f")), Parts(SFile::GetCurrentDrive(), Here() + WTEXT("\\sub\\"), WTEXT("f"), none));
  EXPECT_EQ(Split(WTEXT("C:")), Parts(drive, Here(), none, none));
  EXPECT_EQ(Split(WTEXT("C:\\dir\\")), Parts(drive, WTEXT("dir\\"), none, none));
  SString a, b, c, d;
  EXPECT_EQ(SFile::SplitPath(WTEXT("C:"), a, b, c, d), 0);
  EXPECT_EQ(SFile::SplitPath(WTEXT("C:\\.profile"), a, b, c, d), 0);  // all of it is an extension
  EXPECT_EQ(SFile::SplitPath(WTEXT(""), a, b, c, d), 0);
  SString same(WTEXT("C:\\x\\y.z"));
  EXPECT_EQ(SFile::SplitPath(same, a, same, c, d), 1);
  EXPECT_EQ(same, SString(WTEXT("x\\")));
}

TEST(FileNames, MakingAndChecking) {
  SFile file(WTEXT("C:"), WTEXT("dir\\sub"), WTEXT("name"), WTEXT("ext"));
  EXPECT_EQ(file.GetFullName(), SString(WTEXT("C:\\dir\\sub\\name.ext")));
  EXPECT_EQ(file.GetDirectory(), SString(WTEXT("dir\\sub\\")));
  EXPECT_TRUE(file.CheckFilename());
  file.Init(WTEXT("C:\\"), WTEXT("\\dir"), WTEXT("name"), SString());
  EXPECT_EQ(file.GetFullName(), SString(WTEXT("C:\\dir\\name")));
  file.Init(SString(), SString(), WTEXT("n"), WTEXT("x"));
  EXPECT_EQ(file.GetFullName(), SFile::GetCurrentDrive() + Here() + WTEXT("\\n.x"));
  file.Init(WTEXT("C:\\"), SString(), WTEXT("n"), WTEXT("x"));
  EXPECT_EQ(file.GetFullName(), SString(WTEXT("C:\\n.x")));  // of a given drive, the root
  file.Init(SString(), SString(), WTEXT("n"), WTEXT("x"));
  // Round trip: what was made splits into the same parts, and they make the same name.
  const SString made = file.GetFullName();
  EXPECT_EQ(file.SplitFilename(), 1);
  file.MakeFilename();
  EXPECT_EQ(file.GetFullName(), made);
  EXPECT_EQ(SFile(made).GetDirectory(), file.GetDirectory());

  EXPECT_EQ(file.Init(SString(WTEXT("C:\\what?.txt"))), Code(SFile::kInvalidFilename));
  EXPECT_EQ(file.Init(SString(WTEXT("C:\\a:b\\x.txt"))), Code(SFile::kInvalidFilename));
  EXPECT_EQ(file.Init(SString(WTEXT("C:\\a/b"))), Code(SFile::kInvalidFilename));
  EXPECT_EQ(file.Init(SString(WTEXT("C:"))), Code(SFile::kInvalidFilename));
  EXPECT_EQ(file.Init(SString(WTEXT("C:\\a\\b\\x.txt"))), Code(SFile::kOk));
  EXPECT_EQ(file.Init(file.GetFullName()), Code(SFile::kOk));  // its own name
  EXPECT_EQ(file.GetName(), SString(WTEXT("x")));
  EXPECT_EQ(SFile().CheckFilename(), 0);
  SString directory, name;
  EXPECT_EQ(SFile::CheckSplitValidPath(WTEXT("C:\\a\\b.c"), &directory, &name), 1);
  EXPECT_EQ(directory, SString(WTEXT("C:\\a\\")));
  EXPECT_EQ(name, SString(WTEXT("b.c")));
  EXPECT_EQ(SFile::CheckSplitValidPath(WTEXT("C:\\b.c"), &directory, &name), 1);
  EXPECT_EQ(directory, SString(WTEXT("C:\\")));
  EXPECT_EQ(name, SString(WTEXT("b.c")));
  EXPECT_EQ(SFile::CheckSplitValidPath(WTEXT("C:\\a\\b|c"), &directory, nullptr), 0);
  EXPECT_TRUE(directory.IsEmpty());
}

TEST(FileNames, NormalForms) {
  EXPECT_EQ(SFile::NormalizeDirectoryName(WTEXT("C:/a/./b\\..\\c\\")), SString(WTEXT("C:\\a\\c")));
  EXPECT_EQ(SFile::NormalizeDirectoryName(WTEXT("C:\\")), SString(WTEXT("C:\\")));
  EXPECT_EQ(SFile::NormalizeDirectoryName(SString()), SString());
  EXPECT_EQ(SFile::NormalizeDirectoryName(SString(test::Text(300, 'x').c_str())), SString());
  EXPECT_EQ(SFile::NormalizeDirectoryName(WTEXT(".")), SFile::GetCurrentDrive() + Here());
  TempFolder folder;
  WriteAll(folder.File(WTEXT("MixedCase.Txt")), "");
  const SString real = Str(folder.File(WTEXT("MixedCase.Txt")));
  SString other = Str(folder.Path()) + WTEXT("\\x\\..\\mixedcase.txt");
#ifndef _WIN32  // Wine 8 leaves letters as they were given
  EXPECT_EQ(SFile::NormalizeFileName(other, 1).Right(14), real.Right(14));
#endif
  EXPECT_EQ(SFile::NormalizeFileName(other).Right(14), SString(WTEXT("\\mixedcase.txt")));
  EXPECT_EQ(SFile::NormalizeFileName(Str(folder.File(WTEXT("new.TXT"))), 1).Right(8), SString(WTEXT("\\new.TXT")));
  EXPECT_EQ(SFile::ToLongNames(WTEXT("C:\\no\\such\\file")), SString(WTEXT("C:\\no\\such\\file")));
  // A short name is another name of the same file.
  const SString shorter = SFile::ToShortNames(Str(folder.File(WTEXT("MixedCase.Txt"))));
  EXPECT_EQ(SFile::Exists(shorter), 1);
  EXPECT_EQ(SFile::ToLongNames(shorter).CompareNoCase(SFile::ToLongNames(real)), 0);
  EXPECT_EQ(SFile::ToShortNames(WTEXT("C:\\no\\such\\file")), SString(WTEXT("C:\\no\\such\\file")));
}

TEST(FileNames, Urls) {
  EXPECT_EQ(SFile::PathToURL(WTEXT("C:\\a b\\x.txt")), SString(WTEXT("file:///C|/a b/x.txt")));
  EXPECT_EQ(SFile::PathToURL(WTEXT("\\\\server\\share\\x")), SString(WTEXT("file://server/share/x")));
  EXPECT_EQ(SFile::PathToURL(WTEXT(".\\x")), SString(WTEXT("file:///./x")));
  EXPECT_EQ(SFile::PathToURL(SString()), SString());
  EXPECT_EQ(SFile::PathToURL(SString(test::Text(300, 'x').c_str())), SString());
  for (const WCHAR* path :
       {WTEXT("C:\\a b\\x.txt"), WTEXT("\\\\server\\share\\%20"), WTEXT(".\\rel\\x"), WTEXT("C:\\")})
    EXPECT_EQ(SFile::URLToPath(SFile::PathToURL(path)), SString(path));
  EXPECT_EQ(SFile::URLToPath(WTEXT("FILE:///c:/x")), SString(WTEXT("c:\\x")));
  EXPECT_EQ(SFile::URLToPath(WTEXT("http://x/y")), SString(WTEXT("http://x/y")));
  EXPECT_EQ(SFile::IsFileURL(WTEXT("FILE://x")), 1);
  EXPECT_EQ(SFile::IsFileURL(WTEXT("FILE://x"), 1), 0);
  EXPECT_EQ(SFile::IsFileURL(WTEXT("file:/x")), 0);
}

TEST(FileNames, ReservedOnes) {
  for (const WCHAR* name :
       {WTEXT("con"), WTEXT("C:\\x\\NUL.txt"), WTEXT("prn "), WTEXT("Com1"), WTEXT("lpt9.a.b"), WTEXT("COM\x00B9")})
    EXPECT_EQ(SFile::IsReserved(name), 1) << test::Narrow(name);
  for (const WCHAR* name :
       {WTEXT("console"), WTEXT("com"), WTEXT("COM0"), WTEXT("com10"), WTEXT("con\\x"), WTEXT("xcon"), WTEXT("")})
    EXPECT_EQ(SFile::IsReserved(name), 0) << test::Narrow(name);
}

TEST(Files, OpenWriteSeekRead) {
  TempFolder folder;
  SFile file(Str(folder.File(WTEXT("a.bin"))));
  EXPECT_EQ(file.OpenExisting(), Code(SFile::kNotFound));
  EXPECT_EQ(file.Open(), Code(SFile::kOk));
  EXPECT_EQ(file.GetAccess(), static_cast<unsigned long>(GENERIC_READ | GENERIC_WRITE));
  unsigned long count = 10;
  EXPECT_EQ(file.Write("0123456789", count), Code(SFile::kOk));
  EXPECT_EQ(count, 10u);
  EXPECT_EQ(file.IsEOF(), 1);
  std::int64_t saved = 0, position = -3;
  EXPECT_EQ(file.SavePosition(saved), Code(SFile::kOk));
  EXPECT_EQ(file.Seek(position, FILE_END), Code(SFile::kOk));
  EXPECT_EQ(position, 7);
  EXPECT_EQ(file.IsEOF(), 0);
  char bytes[16];
  count = 16;
  EXPECT_EQ(file.Read(bytes, count), Code(SFile::kOk));
  EXPECT_EQ(std::string(bytes, count), "789");
  count = 16;
  EXPECT_EQ(file.Read(bytes, count), Code(SFile::kOk));  // the end is no failure
  EXPECT_EQ(count, 0u);
  position = -20;
  EXPECT_EQ(file.Seek(position, FILE_CURRENT), Code(SFile::kSeekFailed));
  EXPECT_EQ(GetLastError(), DWORD(ERROR_NEGATIVE_SEEK));
  EXPECT_EQ(position, -20);
  constexpr std::int64_t kFar = (std::int64_t{3} << 32) + 5;  // behind 12 GiB, in a file with holes
  EXPECT_EQ(file.RestorePosition(kFar), Code(SFile::kOk));
  EXPECT_EQ(file.SavePosition(position), Code(SFile::kOk));
  EXPECT_EQ(position, kFar);
  EXPECT_EQ(file.RestorePosition(4), Code(SFile::kOk));
  EXPECT_EQ(file.SetEndOfFile(), Code(SFile::kOk));
  EXPECT_EQ(file.Flush(), Code(SFile::kOk));
  unsigned long low = 0, high = 1;
  EXPECT_EQ(file.GetSize(low, high), Code(SFile::kOk));
  EXPECT_EQ(low, 4u);
  EXPECT_EQ(high, 0u);
  SFile twin(file);  // the same open file
  count = 1;
  EXPECT_EQ(twin.Write("X", count), Code(SFile::kOk));
  EXPECT_EQ(file.Close(), Code(SFile::kOk));
  EXPECT_EQ(file.Close(), Code(SFile::kOk));
  EXPECT_EQ(file.GetAccess(), 0u);
  count = 1;
  EXPECT_EQ(twin.Write("Y", count), Code(SFile::kOk));
  EXPECT_EQ(twin.Done(), Code(SFile::kOk));
  EXPECT_TRUE(twin.GetFullName().IsEmpty());
  EXPECT_EQ(ReadAll(folder.File(WTEXT("a.bin"))), "0123XY");
}

TEST(Files, EveryFailureHasItsCode) {
  TempFolder folder;
  SFile none(Str(folder.File(WTEXT("no\\such.file"))));
  unsigned long count = 1, low, high, attributes;
  std::int64_t position = 0;
  char byte;
  FILETIME time = {0, 0};
  short type;
  const HRESULT results[] = {none.Open(),
                             none.Create(),
                             none.OpenExisting(),
                             none.Write("x", count),
                             none.Read(&byte, count),
                             none.Flush(),
                             none.Seek(position, FILE_BEGIN),
                             none.SavePosition(position),
                             none.RestorePosition(0),
                             none.SetEndOfFile(),
                             none.GetAttributes(attributes),
                             none.SetAttributes(0x20),
                             none.GetSize(low, high),
                             none.GetDateTime(&time),
                             none.GetContentType(&type),
                             none.Rename(WTEXT("x")),
                             none.Copy(WTEXT("x"), 0),
                             none.Delete(),
                             none.FindFirst(SString()),
                             none.FindFirst(Str(folder.File(WTEXT("zz*")))),
                             none.FindNext()};
  const SFile::Status expected[] = {SFile::kOpenFailed,
                                    SFile::kCreateFailed,
                                    SFile::kNotFound,
                                    SFile::kWriteFailed,
                                    SFile::kReadFailed,
                                    SFile::kFlushFailed,
                                    SFile::kSeekFailed,
                                    SFile::kSeekFailed,
                                    SFile::kSeekFailed,
                                    SFile::kWriteFailed,
                                    SFile::kGetAttributesFailed,
                                    SFile::kSetAttributesFailed,
                                    SFile::kGetSizeFailed,
                                    SFile::kGetTimeFailed,
                                    SFile::kOpenFailed,
                                    SFile::kMoveFailed,
                                    SFile::kCopyFailed,
                                    SFile::kDeleteFailed,
                                    SFile::kInvalidFilename,
                                    SFile::kNotFound,
                                    SFile::kFindNextFailed};
  static_assert(std::size(results) == std::size(expected));
  for (std::size_t i = 0; i < std::size(results); ++i) EXPECT_EQ(results[i], Code(expected[i])) << i;
  EXPECT_EQ(none.CompareDateTime(&time), -2);
  EXPECT_EQ(none.IsEOF(), 1);
  EXPECT_EQ(SFile::SetCurrentDirectoryW(none.GetFullName()), Code(SFile::kSetDirectoryFailed));
  EXPECT_EQ(SFile::CreateDirectoryW(Str(folder.Path())), Code(SFile::kCreateDirectoryFailed));
  EXPECT_EQ(SFile::RemoveDirectoryW(none.GetFullName()), Code(SFile::kRemoveDirectoryFailed));
  for (std::uint32_t code = SFile::kInvalidFilename; code <= SFile::kNotFound; ++code)
    EXPECT_FALSE(SFile::GetStatusText(static_cast<HRESULT>(code)).IsEmpty()) << code;
  EXPECT_EQ(SFile::GetStatusText(Code(SFile::kNotFound)), SString(WTEXT("The specified file was not found")));
  EXPECT_EQ(SFile::GetStatusText(E_FAIL), SString());
}

// A handle that somebody else closed behind the object's back.
TEST(Files, CloseTellsOfABadHandle) {
  TempFolder folder;
  SFile file(Str(folder.File(WTEXT("a"))));
  file.Open();
  EXPECT_TRUE(CloseHandle(file.GetHandle()));
  EXPECT_EQ(file.Close(), Code(SFile::kCloseFailed));
  EXPECT_EQ(GetLastError(), DWORD(ERROR_INVALID_HANDLE));
  file.Open();
  CloseHandle(file.GetHandle());
  SFile copy;
  EXPECT_EQ(copy.Init(file), E_FAIL);
  EXPECT_EQ(copy.GetFullName(), file.GetFullName());
  EXPECT_EQ(file.Init(SString(WTEXT("C:\\x"))), Code(SFile::kCloseFailed));
}

TEST(Files, SharingAndReadOnly) {
  TempFolder folder;
  const test::Text path = folder.File(WTEXT("a"));
  WriteAll(path, "content");
  SFile file(Str(path));
  EXPECT_EQ(file.OpenExisting(FILE_SHARE_READ | FILE_SHARE_WRITE), Code(SFile::kOk));
  EXPECT_EQ(file.GetAccess(), static_cast<unsigned long>(GENERIC_READ));
  file.Close();
  // Somebody holds it open for writing.
  const HANDLE writer = CreateFileW(path.c_str(), GENERIC_WRITE, FILE_SHARE_READ, nullptr, OPEN_EXISTING, 0, nullptr);
  EXPECT_EQ(file.OpenExisting(FILE_SHARE_READ), Code(SFile::kRestricted));
  EXPECT_EQ(file.GetAccess(), static_cast<unsigned long>(GENERIC_READ));
  EXPECT_EQ(file.Open(), Code(SFile::kOpenFailed));
  EXPECT_EQ(file.CanBeWritten(), 0);
  CloseHandle(writer);
  EXPECT_EQ(file.CanBeWritten(), 1);
  EXPECT_EQ(file.SetAttributes(FILE_ATTRIBUTE_READONLY), Code(SFile::kOk));
  EXPECT_EQ(file.IsReadOnly(), 1);
  EXPECT_EQ(file.CanBeWritten(), 0);
  EXPECT_EQ(file.OpenExisting(), Code(SFile::kOk));
  EXPECT_EQ(file.GetAccess(), static_cast<unsigned long>(GENERIC_READ));
  EXPECT_EQ(file.Open(), Code(SFile::kOk));
  EXPECT_EQ(file.GetAccess(), static_cast<unsigned long>(GENERIC_READ));
  file.Close();
  if (!IsWine()) {  // which lets the superuser write it
    EXPECT_EQ(CreateFileW(path.c_str(), GENERIC_WRITE, 0, nullptr, OPEN_EXISTING, 0, nullptr), INVALID_HANDLE_VALUE);
    EXPECT_EQ(GetLastError(), DWORD(ERROR_ACCESS_DENIED));
  }
  EXPECT_EQ(file.Delete(), Code(SFile::kDeleteFailed));
  EXPECT_EQ(GetLastError(), DWORD(ERROR_ACCESS_DENIED));
  EXPECT_EQ(file.SetAttributes(FILE_ATTRIBUTE_NORMAL), Code(SFile::kOk));
  EXPECT_EQ(file.Delete(), Code(SFile::kOk));
  EXPECT_EQ(file.Exists(), 0);
}

TEST(Files, PropertiesAndContent) {
  TempFolder folder;
  const test::Text path = folder.File(WTEXT("a"));
  SFile file(Str(path));
  unsigned long attributes = 0;
  EXPECT_EQ(file.GetAttributes(attributes), Code(SFile::kGetAttributesFailed));
  EXPECT_EQ(GetLastError(), DWORD(ERROR_FILE_NOT_FOUND));
  WriteAll(path, "12345");
  EXPECT_EQ(file.GetAttributes(attributes), Code(SFile::kOk));
  EXPECT_EQ(attributes & ~static_cast<unsigned long>(FILE_ATTRIBUTE_NORMAL),
            static_cast<unsigned long>(FILE_ATTRIBUTE_ARCHIVE));
  WIN32_FILE_ATTRIBUTE_DATA data;
  ASSERT_TRUE(GetFileAttributesExW(path.c_str(), GetFileExInfoStandard, &data));
  EXPECT_EQ(data.nFileSizeLow, 5u);
  const std::pair<std::string, short> contents[] = {{"", SFile::kEmptyContent},
                                                    {"text\r\n", SFile::kNarrowText},
                                                    {std::string("a\0b", 3), SFile::kBinaryContent},
                                                    {"\xEF\xBB\xBFx", SFile::kUtf8Text},
                                                    {"\xFF\xFEx", SFile::kUtf16Text},
                                                    {"\xFE\xFF", SFile::kReversedUtf16Text},
                                                    {"caf\xE9", SFile::kNarrowText},
                                                    {"\x7F"
                                                     "ELF\x02",
                                                     SFile::kBinaryContent}};
  for (const auto& [bytes, expected] : contents) {
    WriteAll(path, bytes);
    short type = -1;
    EXPECT_EQ(file.GetContentType(&type), Code(SFile::kOk));
    EXPECT_EQ(type, expected);
  }
  EXPECT_EQ(file.IsFile(), 1);
  EXPECT_EQ(file.IsDirectory(), 0);
  EXPECT_EQ(SFile::IsDirectory(Str(folder.Path())), 1);
  EXPECT_EQ(SFile::IsFile(Str(folder.Path())), 0);
  EXPECT_EQ(SFile::Exists(SString()), 0);
  FILETIME byName, byHandle, created;
  EXPECT_EQ(file.GetDateTime(&byName), Code(SFile::kOk));
  EXPECT_EQ(file.GetDateTime(&created, 1), Code(SFile::kOk));
  EXPECT_LE(CompareFileTime(&created, &byName), 0);
  EXPECT_GT(byName.dwHighDateTime, 0x01D00000u);  // later than 2014
  file.OpenExisting();
  EXPECT_EQ(file.GetDateTime(&byHandle), Code(SFile::kOk));
  EXPECT_EQ(CompareFileTime(&byName, &byHandle), 0);
  EXPECT_EQ(file.CompareDateTime(&byName), 0);
  ++byName.dwHighDateTime;
  EXPECT_EQ(file.CompareDateTime(&byName), -1);
  byName.dwHighDateTime -= 2;
  EXPECT_EQ(file.CompareDateTime(&byName), 1);
}

// A failure with its code and the platform's reason.
void ExpectFailure(HRESULT result, SFile::Status status, DWORD error) {
  EXPECT_EQ(GetLastError(), error);
  EXPECT_EQ(result, Code(status));
}

TEST(Files, RenameCopyDelete) {
  TempFolder folder;
  const auto named = [&folder](const WCHAR* name) { return Str(folder.File(name)); };
  WriteAll(folder.File(WTEXT("a.txt")), "A");
  WriteAll(folder.File(WTEXT("b.txt")), "B");
  SFile file(named(WTEXT("a.txt")));
  ExpectFailure(file.Rename(named(WTEXT("b.txt"))), SFile::kMoveFailed, ERROR_ALREADY_EXISTS);
  ExpectFailure(SFile(named(WTEXT("no"))).Rename(named(WTEXT("x"))), SFile::kMoveFailed, ERROR_FILE_NOT_FOUND);
  EXPECT_EQ(file.GetName(), SString(WTEXT("a")));
  EXPECT_EQ(file.Rename(named(WTEXT("c.dat"))), Code(SFile::kOk));
  EXPECT_EQ(file.GetName(), SString(WTEXT("c")));
  EXPECT_EQ(file.GetExtension(), SString(WTEXT("dat")));
  ExpectFailure(file.Copy(named(WTEXT("b.txt")), 0), SFile::kCopyFailed, ERROR_FILE_EXISTS);
  EXPECT_EQ(file.Copy(named(WTEXT("b.txt")), 1), Code(SFile::kOk));
  EXPECT_EQ(ReadAll(folder.File(WTEXT("b.txt"))), "A");
  WriteAll(folder.File(WTEXT("new")), "new");
  EXPECT_TRUE(MoveFileExW(named(WTEXT("new")), named(WTEXT("b.txt")), MOVEFILE_REPLACE_EXISTING));
  EXPECT_EQ(ReadAll(folder.File(WTEXT("b.txt"))), "new");
  // It moves, but its new name is all extension.
  EXPECT_EQ(file.Rename(named(WTEXT(".hidden"))), Code(SFile::kMoveFailed));
  EXPECT_EQ(ReadAll(folder.File(WTEXT(".hidden"))), "A");
  EXPECT_EQ(SFile::Delete(named(WTEXT(".hidden"))), Code(SFile::kOk));
  ExpectFailure(SFile::Delete(named(WTEXT(".hidden"))), SFile::kDeleteFailed, ERROR_FILE_NOT_FOUND);

  const SString sub = named(WTEXT("sub"));
  EXPECT_EQ(SFile::CreateDirectoryW(sub), Code(SFile::kOk));
  ExpectFailure(SFile::CreateDirectoryW(sub), SFile::kCreateDirectoryFailed, ERROR_ALREADY_EXISTS);
  ExpectFailure(SFile::CreateDirectoryW(named(WTEXT("x\\y"))), SFile::kCreateDirectoryFailed, ERROR_PATH_NOT_FOUND);
  ExpectFailure(SFile::Delete(sub), SFile::kDeleteFailed, ERROR_ACCESS_DENIED);
  ExpectFailure(SFile::RemoveDirectoryW(Str(folder.Path())), SFile::kRemoveDirectoryFailed, ERROR_DIR_NOT_EMPTY);
  ExpectFailure(SFile::RemoveDirectoryW(named(WTEXT("b.txt"))), SFile::kRemoveDirectoryFailed, ERROR_DIRECTORY);
  EXPECT_EQ(SFile::RemoveDirectoryW(sub), Code(SFile::kOk));
}

TEST(Files, SearchInOneFolder) {
  TempFolder folder;
  for (const WCHAR* name : {WTEXT("a.txt"), WTEXT("b.txt"), WTEXT("c.dat"), WTEXT(".rc")})
    WriteAll(folder.File(name), "");
  SFile file;
  std::set<SString> names;
  EXPECT_EQ(file.FindFirst(Str(folder.File(WTEXT("*.txt")))), Code(SFile::kOk));
  do {
    EXPECT_EQ(file.Exists(), 1);
    EXPECT_EQ(file.GetExtension(), SString(WTEXT("txt")));
    names.insert(file.GetName());
  } while (file.FindNext() == Code(SFile::kOk));
  EXPECT_EQ(GetLastError(), DWORD(ERROR_NO_MORE_FILES));
  EXPECT_EQ(names, (std::set<SString>{SString(WTEXT("a")), SString(WTEXT("b"))}));
  EXPECT_EQ(file.FindClose(), Code(SFile::kOk));
  EXPECT_EQ(file.FindNext(), Code(SFile::kFindNextFailed));
  int count = 0;
  EXPECT_EQ(file.FindFirst(Str(folder.File(WTEXT("*")))), Code(SFile::kOk));
  do ++count;
  while (file.FindNext() == Code(SFile::kOk));
  EXPECT_EQ(count, 4);  // without "." and ".."
  test::RemoveAll(folder.File(WTEXT("a.txt")));
  SFile::CreateDirectoryW(Str(folder.File(WTEXT("empty"))));
  EXPECT_EQ(file.FindFirst(Str(folder.File(WTEXT("empty\\*")))), Code(SFile::kNotFound));
}

TEST(Files, FolderPaths) {
  TempFolder folder;
  SString created;
  const SString deep = Str(folder.File(WTEXT("x\\y\\z\\file.txt")));
  EXPECT_EQ(SFile::CreateFilePath(deep, &created), Code(SFile::kOk));
  EXPECT_EQ(created, Str(folder.File(WTEXT("x"))));
  EXPECT_EQ(SFile::IsDirectory(Str(folder.File(WTEXT("x\\y\\z")))), 1);
  EXPECT_EQ(SFile::Exists(deep), 0);
  EXPECT_EQ(SFile::CreateFilePath(deep, &created, 0), Code(SFile::kOk));
  EXPECT_EQ(created, deep);
  EXPECT_EQ(SFile::CreateFilePath(deep, &created, 0), Code(SFile::kOk));
  EXPECT_EQ(created, SString());
  WriteAll(folder.File(WTEXT("f")), "");
  EXPECT_EQ(SFile::CreateFilePath(Str(folder.File(WTEXT("f\\g\\h"))), &created), Code(SFile::kCreateDirectoryFailed));
  EXPECT_EQ(SFile::CreateFilePath(WTEXT("nofolder"), nullptr), Code(SFile::kOk));
  SString slashes = Str(folder.File(WTEXT("x\\y\\f.txt")));
  slashes.ReplaceAll(WCHAR('\\'), WCHAR('/'));
  EXPECT_EQ(SFile::CreateFilePath(slashes, &created), Code(SFile::kOk));
  EXPECT_TRUE(SFile::IsDirectory(Str(folder.File(WTEXT("x\\y")))));
  const SString before = SFile::NormalizeDirectoryName(WTEXT("."));
  EXPECT_EQ(SFile::SetCurrentDrive(Str(folder.Path())), Code(SFile::kOk));
  EXPECT_EQ((SFile::GetCurrentDrive() + Here()).Right(12), Str(folder.Path()).Right(12));
  EXPECT_EQ(SFile::SetCurrentDirectoryW(before), Code(SFile::kOk));
  EXPECT_EQ(SFile::IsDirectory(SFile::GetTempDirectory()), 1);
  EXPECT_EQ(SFile::IsDirectory(SFile::GetSystemDirectoryW()), 1);
  EXPECT_EQ(SFile::IsDirectory(SFile::GetWindowsDirectoryW()), 1);
  const SString temporary = SFile::GetTempFileNameW(Str(folder.Path()), WTEXT("prefix"));
  EXPECT_EQ(SFile::IsFile(temporary), 1);
  EXPECT_EQ(temporary.Mid(Str(folder.Path()).Length() + 1, 3).CompareNoCase(WTEXT("pre")), 0);
  EXPECT_EQ(SFile::GetTempFileNameW(Str(folder.File(WTEXT("none"))), WTEXT("p")), SString());
  EXPECT_GT(SFile::GetFreeDiskSpace(Str(folder.Path())), 0u);
  EXPECT_GE(SFile::GetTotalDiskSpace(Str(folder.Path())), SFile::GetFreeDiskSpace(Str(folder.Path())));
  EXPECT_EQ(SFile::GetFreeDiskSpace(Str(folder.File(WTEXT("none")))), 0u);
}

#ifndef _WIN32
TEST(FilesOnLinux, FullDisk) {
  SFile file(SString(WTEXT("C:\\dev\\full")));
  ASSERT_EQ(file.Open(FILE_ATTRIBUTE_NORMAL, FILE_SHARE_READ | FILE_SHARE_WRITE), Code(SFile::kOk));
  unsigned long count = 5;
  EXPECT_EQ(file.Write("hello", count), Code(SFile::kWriteFailed));
  EXPECT_EQ(count, 0u);
  EXPECT_EQ(GetLastError(), DWORD(ERROR_DISK_FULL));
}

TEST(FilesOnLinux, ReadErrors) {
  SFile file(SString(WTEXT("C:\\proc\\self\\mem")));
  ASSERT_EQ(file.OpenExisting(FILE_SHARE_READ | FILE_SHARE_WRITE), Code(SFile::kOk));
  char bytes[4];
  unsigned long count = 4;
  EXPECT_EQ(file.Read(bytes, count), Code(SFile::kReadFailed));
  EXPECT_EQ(count, 0u);
}
#endif

TEST(Files, NativePathsAndBack) {
  if (IsWindows()) {
    EXPECT_EQ(SFile::FromNative("C:\\Gr\xC3\xB6\xC3\x9F"
                                "e\\\xF0\x9F\x99\x82"),
              SString(WTEXT("C:\\Gr\xF6\xDF"
                            "e\\\xD83D\xDE42")));
    EXPECT_EQ(SFile::ToNative(SString(WTEXT("a\\\xD83D\xDE42"))), "a\\\xF0\x9F\x99\x82");
    return;
  }
  for (const char* path : {"/", "/usr/a:b", "rel/a?b", "x/", "/latin\xE9/back\\slash",
                           "/Gr\xC3\xB6\xC3\x9F"
                           "e/\xF0\x9F\x99\x82",
                           "..", "/private\xEF\x81\x81", ""})
    EXPECT_EQ(SFile::ToNative(SFile::FromNative(path)), path);
  EXPECT_EQ(SFile::FromNative("/usr/a:b"), SString(WTEXT("C:\\usr\\a\xF03A"
                                                         "b")));
  EXPECT_EQ(SFile::ToNative(SString(WTEXT("c:/usr\\x"))), "/usr/x");
  EXPECT_EQ(SFile::ToNative(SString(WTEXT("D:\\x"))), "");
  EXPECT_EQ(SFile::ToNative(SString(WTEXT("\\\\server\\share"))), "");
}

#ifndef _WIN32
TEST(Files, APipeIsNotWaitedFor) {
  TempFolder folder;
  const SString pipe = Str(folder.File(WTEXT("pipe")));
  ASSERT_EQ(mkfifo(SFile::ToNative(pipe).c_str(), 0600), 0);
  short type = 99;
  EXPECT_EQ(SFile(pipe).GetContentType(&type), Code(SFile::kOpenFailed));
  EXPECT_EQ(type, 99);
}
#endif

}  // namespace
