// Files, mappings and dates near the edges of what they take: short contents, servers, fields just out of range,
// cursors at the ends of numbers.

#include <gtest/gtest.h>

#include <climits>
#include <functional>
#include <limits>
#include <random>
#include <string>

#include "qxcore/system/file/file.h"
#include "qxcore/system/file/find_failures.h"
#include "qxcore/system/file/mapped_file.h"
#include "qxcore/system/time/ole_date_time.h"
#include "qxcore/system/time/time.h"
#include "tests/support/temp_folder.h"
#include "tests/support/text.h"

namespace {

using test::TempFolder;
using test::WriteAll;

constexpr HRESULT Code(std::uint32_t code) { return static_cast<HRESULT>(code); }
SString Str(const test::Text& text) { return SString(text.c_str()); }

// --- contents ---

// By a second reading of the rule, over all short files of the bytes that it names.
short ContentOf(const std::string& bytes) {
  const auto starts = [&](const char* mark) {
    return bytes.compare(0, std::char_traits<char>::length(mark), mark) == 0;
  };
  if (bytes.empty()) return SFile::kEmptyContent;
  if (starts("\xEF\xBB\xBF")) return SFile::kUtf8Text;
  if (starts("\xFF\xFE")) return SFile::kUtf16Text;
  if (starts("\xFE\xFF")) return SFile::kReversedUtf16Text;
  const std::string controls("\0\1\2\3\4\5\6\16\17\20\21\22\23\24\25\26\27\30\31\34\35\36\37", 23);
  return bytes.find_first_of(controls) != std::string::npos ? SFile::kBinaryContent : SFile::kNarrowText;
}

TEST(FileContents, OfEveryShortFile) {
  TempFolder folder;
  const test::Text path = folder.File(WTEXT("short"));
  const SFile file(Str(path));
  const std::string kBytes(
      "\xEF\xBB\xBF\xFE\xFF"
      "a\0\x07\x0D\x0E\x1A\x1B\x1C",
      13);
  short type = 0;
  for (char first : kBytes) {
    for (char second : kBytes) {
      for (char third : {'\xBF', 'x'}) {
        const std::string bytes{first, second, third};
        for (std::size_t length : {std::size_t{1}, std::size_t{2}, std::size_t{3}}) {
          WriteAll(path, bytes.substr(0, length));
          ASSERT_EQ(file.GetContentType(&type), Code(SFile::kOk));
          ASSERT_EQ(type, ContentOf(bytes.substr(0, length))) << testing::PrintToString(bytes.substr(0, length));
        }
      }
    }
  }
}

// --- names ---

// What is split can be made again, from any parts.
TEST(FileNamesAtEdges, PartsMakeTheNameTheyCameFrom) {
  std::mt19937 random(17);
  const WCHAR* const kRoots[] = {WTEXT("C:\\"), WTEXT("\\\\server\\share\\")};
  const WCHAR* const kParts[] = {WTEXT("a"), WTEXT("b.c"), WTEXT("d e"), WTEXT("f.g.h"), WTEXT("x")};
  for (int round = 0; round < 500; ++round) {
    SString path = kRoots[random() % 2];
    for (unsigned depth = random() % 4; depth > 0; --depth) path += SString(kParts[random() % 5]) + WTEXT("\\");
    path += kParts[random() % 5];
    SString drive, directory, name, extension;
    ASSERT_EQ(SFile::SplitPath(path, drive, directory, name, extension), 1);
    SFile file;
    ASSERT_EQ(file.Init(drive, directory, name, extension), Code(SFile::kOk));
    ASSERT_EQ(file.GetFullName(), path);
    SString folder, rest;
    ASSERT_EQ(SFile::CheckSplitValidPath(path, &folder, &rest), 1);
    ASSERT_EQ(folder + rest, path);
    ASSERT_EQ(SFile::CheckSplitValidPath(path, nullptr, nullptr), 1);
    ASSERT_EQ(SFile::NormalizeDirectoryName(path + WTEXT("\\")), path);
    ASSERT_EQ(SFile::URLToPath(SFile::PathToURL(path)), path);
  }
  SString folder = WTEXT("old"), rest = WTEXT("old");
  for (const WCHAR* bad : {WTEXT("C:\\a\\b?c"), WTEXT("C:\\a*\\b"), WTEXT("C:\\a\\b.c|d"), WTEXT("C:\\a\\")}) {
    EXPECT_EQ(SFile::CheckSplitValidPath(bad, &folder, &rest), 0);
    EXPECT_TRUE(folder.IsEmpty() && rest.IsEmpty()) << "nothing is left of them";
  }
}

TEST(FileNamesAtEdges, RootsKeepTheirBackslash) {
  EXPECT_EQ(SFile::NormalizeDirectoryName(WTEXT("C:\\")), WTEXT("C:\\"));
  EXPECT_EQ(SFile::NormalizeDirectoryName(WTEXT("\\\\server\\share\\sub\\")), WTEXT("\\\\server\\share\\sub"));
  EXPECT_EQ(SFile::NormalizeFileName(WTEXT("C:\\no-such-file-here"), 1), WTEXT("C:\\no-such-file-here"));
  EXPECT_TRUE(SFile::NormalizeFileName(WTEXT(""), 1).IsEmpty());
  EXPECT_EQ(SFile::URLToPath(WTEXT("file://")), WTEXT("\\\\"));
  TempFolder folder;
  const SString real = SFile::ToLongNames(Str(folder.Path()));
  EXPECT_EQ(SFile::NormalizeFileName(real + WTEXT("\\.\\To Come"), 1), real + WTEXT("\\To Come"))
      << "the folder is spelled as it is, the file as it will be";
}

TEST(FileNamesAtEdges, NumbersOfDevices) {
  for (unsigned c = 1; c < 0x180; ++c) {
    const WCHAR number[] = {static_cast<WCHAR>(c), 0};
    if (c == '.' || c == ':' || c == '\\' || c == '/' || c == ' ') continue;
    const int expected = (c >= '1' && c <= '9') || c == 0xB9 || c == 0xB2 || c == 0xB3;
    for (const WCHAR* device : {WTEXT("COM"), WTEXT("lpt")})
      ASSERT_EQ(SFile::IsReserved(SString(device) + number), expected) << c;
    ASSERT_EQ(SFile::IsReserved(SString(WTEXT("COX")) + number), 0) << c;
  }
}

TEST(FileNamesAtEdges, FoldersAreMadeFromTheTop) {
  TempFolder folder;
  SString created;
  const SString base = Str(folder.Path());
  EXPECT_EQ(SFile::CreateFilePath(WTEXT("name alone"), &created), Code(SFile::kOk)) << "nothing is needed";
  EXPECT_EQ(SFile::CreateFilePath(WTEXT("\\name"), nullptr), Code(SFile::kOk));
  EXPECT_TRUE(created.IsEmpty());
  EXPECT_EQ(SFile::CreateFilePath(WTEXT(""), &created, 0), Code(SFile::kCreateDirectoryFailed));
  EXPECT_EQ(SFile::CreateFilePath(base + WTEXT("\\a\\b\\c"), &created, 0), Code(SFile::kOk));
  EXPECT_EQ(created.CompareNoCase(base + WTEXT("\\a")), 0) << "the first that was missing";
  EXPECT_EQ(SFile::CreateFilePath(base + WTEXT("\\a\\b\\c\\d\\file"), nullptr), Code(SFile::kOk));
  EXPECT_TRUE(SFile::IsDirectory(base + WTEXT("\\a\\b\\c\\d")));
  SString slashes = base + WTEXT("\\x\\y\\file");
  slashes.ReplaceAll(WCHAR('\\'), WCHAR('/'));
  EXPECT_EQ(SFile::CreateFilePath(slashes, &created), Code(SFile::kOk));
  EXPECT_TRUE(SFile::IsDirectory(base + WTEXT("\\x\\y"))) << "the platform takes both";
  EXPECT_FALSE(SFile::Exists(base + WTEXT("\\x\\y\\file")));
  WriteAll(folder.File(WTEXT("a\\file")), "");
  EXPECT_EQ(SFile::CreateFilePath(base + WTEXT("\\a\\file\\x"), &created, 0), Code(SFile::kCreateDirectoryFailed));
  EXPECT_NE(SFile::CreateFilePath(WTEXT("\\\\no-such-server\\share\\x\\y"), &created, 0), Code(SFile::kOk));
  unsigned long low = 7, high = 7;
  EXPECT_EQ(SFile::GetSize(base, low, high), Code(SFile::kGetSizeFailed)) << "a folder has none";
  EXPECT_EQ(low, 7u);
  EXPECT_FALSE(SFile::IsFile(base));
  EXPECT_FALSE(SFile::IsFile(WTEXT("")));
  EXPECT_FALSE(SFile::IsDirectory(base + WTEXT("\\a\\file")));
}

// The folders of masks, each said once in a row; ends and empty folders are no failures.
TEST(FindFailures, AreListedByTheFolderOfTheirMask) {
  class Sink final : public SFindFailureSink {
   public:
    void OnFolderNotRead(const SString& folder, unsigned long error) override {
      all += folder + WTEXT(" ") + SString(static_cast<long>(error)) + WTEXT(";");
    }
    SString all;
  } sink;
  SFindFailures failures;
  failures.SetSink(&sink);
  for (unsigned long none : {DWORD(ERROR_SUCCESS), DWORD(ERROR_FILE_NOT_FOUND), DWORD(ERROR_NO_MORE_FILES)})
    failures.AddSearch(WTEXT("C:\\dir\\*.*"), none);
  EXPECT_TRUE(failures.IsEmpty());
  failures.AddSearch(WTEXT("C:\\dir\\*.*"), ERROR_ACCESS_DENIED);
  failures.AddSearch(WTEXT("C:\\dir\\*.txt"), ERROR_ACCESS_DENIED);
  failures.AddSearch(WTEXT("C:\\*.*"), ERROR_ACCESS_DENIED);
  failures.AddSearch(WTEXT("*.*"), ERROR_ACCESS_DENIED);
  failures.AddSearch(WTEXT("C:*.*"), ERROR_ACCESS_DENIED);
  failures.AddSearch(WTEXT("\\*.*"), ERROR_ACCESS_DENIED);
  const SString deep = SString(WTEXT("C:\\")) + SString(test::Text(300, 'x').c_str());
  failures.AddSearch(deep + WTEXT("\\*.*"), ERROR_PATH_NOT_FOUND);
  EXPECT_EQ(sink.all, WTEXT("C:\\dir 5;C:\\ 5;. 5;C: 5;\\ 5;") + deep + WTEXT(" 123;"));
  EXPECT_EQ(failures.GetFirstError(), DWORD(ERROR_ACCESS_DENIED));
  failures.Clear();
  EXPECT_TRUE(failures.IsEmpty());
}

// All that an object says of its file.
SString StateOf(const SFile& file) {
  unsigned long low = 0, high = 0;
  std::int64_t position = -1;
  file.GetSize(low, high);
  if (file.IsOpen()) file.SavePosition(position);
  SString state;
  state.Format(WTEXT("%s|%s|%s|%s|%s open %d access %lx may be written %d size %lu at %d end %d"),
               file.GetDrive().GetSafePointer(), file.GetDirectory().GetSafePointer(), file.GetName().GetSafePointer(),
               file.GetExtension().GetSafePointer(), file.GetFullName().GetSafePointer(), file.IsOpen(),
               file.GetAccess(), file.CanBeWritten(), low, static_cast<int>(position),
               file.IsOpen() ? file.IsEOF() : 0);
  return state;
}

TEST(FileStates, ACopyOfAnOpenFileSaysWhatTheFirstSays) {
  TempFolder folder;
  const SString name = Str(folder.File(WTEXT("f.txt")));
  WriteAll(folder.File(WTEXT("f.txt")), "12345");
  const std::function<HRESULT(SFile&)> kWays[] = {
      [](SFile&) { return S_OK; }, [](SFile& file) { return file.Open(); },
      [](SFile& file) { return file.OpenExisting(); },
      [](SFile& file) { return file.OpenExisting(FILE_SHARE_READ | FILE_SHARE_WRITE); },
      [](SFile& file) { return file.Open(FILE_ATTRIBUTE_READONLY); }};
  for (const auto& open : kWays) {
    SFile file(name);
    ASSERT_EQ(open(file), Code(SFile::kOk));
    char bytes[2];
    unsigned long count = 2;
    if (file.IsOpen()) {
      ASSERT_EQ(file.Read(bytes, count), Code(SFile::kOk));
    }
    SFile copy;
    ASSERT_EQ(copy.Init(file), Code(SFile::kOk));
    EXPECT_EQ(StateOf(copy), StateOf(file));
    ASSERT_EQ(file.Close(), Code(SFile::kOk));
    EXPECT_EQ(file.GetAccess(), 0u);
    if (!copy.IsOpen()) continue;
    count = 2;
    EXPECT_EQ(copy.Read(bytes, count), Code(SFile::kOk)) << "it goes on alone";
    EXPECT_EQ(bytes[0], '3');
  }
}

TEST(FileStates, WhoMayWrite) {
  TempFolder folder;
  SFile file(Str(folder.File(WTEXT("f"))));
  EXPECT_FALSE(file.CanBeWritten()) << "there is none";
  EXPECT_FALSE(file.IsReadOnly());
  WriteAll(folder.File(WTEXT("f")), "12345");
  EXPECT_TRUE(file.CanBeWritten());
  ASSERT_EQ(file.Open(), Code(SFile::kOk));
  EXPECT_TRUE(file.CanBeWritten()) << "it is open for that";
  FILETIME created, written;
  EXPECT_EQ(file.GetDateTime(&created, 1), Code(SFile::kOk));
  EXPECT_EQ(file.GetDateTime(&written, 0), Code(SFile::kOk));
  EXPECT_EQ(file.CompareDateTime(&written, 0), 0);
  SFile copy;
  EXPECT_EQ(copy.Init(copy), Code(SFile::kOk));
  EXPECT_EQ(copy.Init(file), Code(SFile::kOk));
  EXPECT_TRUE(copy.IsOpen());
  EXPECT_EQ(file.Close(), Code(SFile::kOk));
  EXPECT_EQ(copy.Close(), Code(SFile::kOk));
  ASSERT_EQ(file.SetAttributes(FILE_ATTRIBUTE_READONLY), Code(SFile::kOk));
  EXPECT_TRUE(file.IsReadOnly());
  EXPECT_FALSE(file.CanBeWritten());
  ASSERT_EQ(file.SetAttributes(FILE_ATTRIBUTE_NORMAL), Code(SFile::kOk));
  EXPECT_TRUE(SFile::GetStatusText(Code(SFile::kOk)).IsEmpty());
  EXPECT_TRUE(SFile::GetStatusText(Code(SFile::kNotFound + 1)).IsEmpty());
  for (std::uint32_t code = SFile::kInvalidFilename; code <= SFile::kNotFound; ++code)
    EXPECT_FALSE(SFile::GetStatusText(Code(code)).IsEmpty()) << std::hex << code;
}

// --- mappings ---

TEST(MappedCursors, AtTheEndsOfNumbers) {
  TempFolder folder;
  WriteAll(folder.File(WTEXT("f")), "0123456789");
  SMappedFile mapped;
  unsigned long count = 4, position = 0;
  char bytes[16];
  EXPECT_EQ(mapped.Read(nullptr, &count), E_POINTER);
  EXPECT_EQ(mapped.Read(bytes, nullptr), E_POINTER);
  EXPECT_EQ(mapped.Write(nullptr, &count), E_POINTER);
  EXPECT_EQ(mapped.Write(bytes, nullptr), E_POINTER);
  EXPECT_EQ(mapped.Seek(nullptr, FILE_BEGIN), E_POINTER);
  EXPECT_EQ(mapped.Seek(&position, FILE_END), E_INVALIDARG);
  EXPECT_EQ(mapped.Flush(), 1) << "nothing to do";
  ASSERT_EQ(mapped.GetFile().Init(Str(folder.File(WTEXT("f")))), S_OK);
  count = sizeof bytes;
  EXPECT_EQ(mapped.Read(bytes, &count), S_OK);
  EXPECT_EQ(std::string(bytes, count), "0123456789");
  position = 0ul - 3;
  EXPECT_EQ(mapped.Seek(&position, FILE_CURRENT), S_OK);
  EXPECT_EQ(position, 7u);
  position = 0ul - 8;
  EXPECT_EQ(mapped.Seek(&position, FILE_CURRENT), Code(SFile::kSeekFailed)) << "before the beginning";
  EXPECT_EQ(GetLastError(), DWORD(ERROR_NEGATIVE_SEEK));
  position = std::numeric_limits<unsigned long>::max() - 2;
  EXPECT_EQ(mapped.Seek(&position, FILE_BEGIN), S_OK);
  position = 5;
  EXPECT_EQ(mapped.Seek(&position, FILE_CURRENT), Code(SFile::kSeekFailed)) << "behind the last number";
  EXPECT_EQ(GetLastError(), DWORD(ERROR_INVALID_PARAMETER));
  count = 1;
  EXPECT_EQ(mapped.Read(bytes, &count), S_OK);
  EXPECT_EQ(count, 0u);
  count = 1;
  EXPECT_EQ(mapped.Write("x", &count), Code(SFile::kWriteFailed));
  EXPECT_EQ(mapped.Set(mapped, true), S_OK) << "itself";
  position = 2;
  EXPECT_EQ(mapped.Seek(&position, FILE_BEGIN), S_OK);
  SMappedFile other;
  EXPECT_EQ(other.Set(mapped, true), S_OK);
  count = 3;
  EXPECT_EQ(other.Read(bytes, &count), S_OK);
  EXPECT_EQ(std::string(bytes, count), "234");
}

// --- dates ---

// Just outside and just inside, field by field.
TEST(DatesAtEdges, EachFieldHasItsRange) {
  const int kLow[] = {100, 1, 1, 0, 0, 0}, kHigh[] = {9999, 12, 31, 23, 59, 59};
  for (int field = 0; field < 6; ++field) {
    for (int end = 0; end < 2; ++end) {
      int values[] = {2000, 1, 15, 12, 30, 30};
      const int limit = end == 0 ? kLow[field] : kHigh[field];
      SOleDateTime date;
      const auto set = [&] {
        return date.SetDateTime(values[0], values[1], values[2], values[3], values[4], values[5]);
      };
      values[field] = limit;
      EXPECT_EQ(set(), SOleDateTime::kValid) << field << ' ' << end;
      SYSTEMTIME time;
      ASSERT_EQ(date.GetAsSystemTime(time), 1);
      const int back[] = {time.wYear, time.wMonth, time.wDay, time.wHour, time.wMinute, time.wSecond};
      EXPECT_EQ(back[field], limit);
      values[field] = end == 0 ? limit - 1 : limit + 1;
      EXPECT_EQ(set(), SOleDateTime::kInvalid) << field << ' ' << end;
    }
  }
  SOleDateTime date;
  if (sizeof(long) > 4) {
    date = static_cast<long>(static_cast<long long>(INT32_MAX) + 1);
    EXPECT_EQ(date.GetStatus(), SOleDateTime::kInvalid);
    date = static_cast<long>(static_cast<long long>(INT32_MIN) - 1);
    EXPECT_EQ(date.GetStatus(), SOleDateTime::kInvalid);
  }
  date = 86400L * 365;
  EXPECT_EQ(date.GetStatus(), SOleDateTime::kValid);
  EXPECT_EQ(date.GetTime(), 86400 * 365);
}

// Records with fields out of their range are the same moment as in order.
TEST(DatesAtEdges, RecordsAreBroughtIntoOrder) {
  std::mt19937 random(19);
  for (int round = 0; round < 2000; ++round) {
    std::tm fields = {};
    fields.tm_year = 70 + static_cast<int>(random() % 60);
    fields.tm_mon = static_cast<int>(random() % 60) - 30;
    fields.tm_mday = static_cast<int>(random() % 200) - 100;
    fields.tm_hour = static_cast<int>(random() % 100) - 50;
    fields.tm_min = static_cast<int>(random() % 300) - 150;
    fields.tm_sec = static_cast<int>(random() % 300) - 150;
    const std::tm given = fields;
    STime time;
    if (!time.SetGmtTm(&fields)) continue;
    // By days and seconds alone.
    std::tm plain = {};
    plain.tm_year = given.tm_year;
    plain.tm_mon = given.tm_mon;
    plain.tm_mday = 1;
    STime first;
    if (!first.SetGmtTm(&plain)) continue;
    ASSERT_EQ(time.GetTime(),
              first.GetTime() + ((given.tm_mday - 1) * 24 + given.tm_hour) * 3600 + given.tm_min * 60 + given.tm_sec);
    ASSERT_GE(fields.tm_mon, 0);
    ASSERT_LT(fields.tm_mon, 12);
    ASSERT_EQ(time.GetGmtYear(), fields.tm_year + 1900);
    ASSERT_EQ(time.GetGmtMonth(), fields.tm_mon + 1);
  }
  for (int year : {-500, -1, 0, 200, 5000}) {
    std::tm distant = {};
    distant.tm_year = year, distant.tm_mon = -5, distant.tm_mday = 1;
    STime time;
    EXPECT_EQ(time.SetGmtTm(&distant), 0) << year;
    EXPECT_EQ(time.GetTime(), -1);
  }
}

}  // namespace
