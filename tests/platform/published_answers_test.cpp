// What the platform's calls answer to odd questions: names that end in backslashes, files that are held open, buffers
// that are too small or not there, texts that are cut. The answers are those of the published documentation, and of
// Windows where programs rely on more than that; the same on both targets.

#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "qxcore/platform/wide.h"
#include "tests/support/registry_root.h"
#include "tests/support/temp_folder.h"
#include "tests/support/wine.h"

namespace {

using test::ReadAll;
using test::TempFolder;
using test::Text;
using test::WriteAll;

class PublishedAnswers : public testing::Test {
 protected:
  PublishedAnswers() {
    WriteAll(Path(WTEXT("a.txt")), "A");
    WriteAll(Path(WTEXT("b.txt")), "B");
    CreateDirectoryW(Path(WTEXT("Sub")).c_str(), nullptr);
  }
  Text Path(const WCHAR* name) const { return m_folder.File(name); }

  TempFolder m_folder;
};

// The last error of a call that fails; 0 when it does not.
template <class Result>
DWORD Error(Result succeeded) {
  return succeeded ? 0 : GetLastError();
}

// --- names ---

Text Found(const Text& pattern) {
  WIN32_FIND_DATAW data;
  const HANDLE search = FindFirstFileW(pattern.c_str(), &data);
  if (search == INVALID_HANDLE_VALUE) return Text();
  FindClose(search);
  return data.cFileName;
}

TEST_F(PublishedAnswers, DotsAtTheEndOfASearchNameTheFolder) {
  EXPECT_EQ(Found(Path(WTEXT("Sub\\."))), WTEXT("Sub"));
  EXPECT_EQ(Found(Path(WTEXT("a.txt\\."))), WTEXT("a.txt"));
  EXPECT_EQ(Found(Path(WTEXT("Sub\\.."))), m_folder.Path().substr(m_folder.Path().rfind('\\') + 1));
  EXPECT_EQ(Found(Path(WTEXT("Sub\\"))), Text());
  EXPECT_EQ(Found(Path(WTEXT("a.txt\\"))), Text());
}

TEST_F(PublishedAnswers, AFileHasNoBackslashAtItsEnd) {
  const Text file = Path(WTEXT("a.txt\\")), other = Path(WTEXT("c.txt"));
  EXPECT_EQ(Error(DeleteFileW(file.c_str())), DWORD(ERROR_INVALID_NAME));
  EXPECT_EQ(Error(MoveFileW(file.c_str(), other.c_str())), DWORD(ERROR_INVALID_NAME));
  EXPECT_EQ(Error(CopyFileW(file.c_str(), other.c_str(), TRUE)), DWORD(ERROR_INVALID_NAME));
  EXPECT_EQ(Error(SetFileAttributesW(file.c_str(), FILE_ATTRIBUTE_NORMAL)), DWORD(ERROR_INVALID_NAME));
  EXPECT_EQ(CreateFileW(file.c_str(), GENERIC_READ, 7, nullptr, OPEN_EXISTING, 0, nullptr), INVALID_HANDLE_VALUE);
  EXPECT_EQ(GetLastError(), DWORD(ERROR_INVALID_NAME));
  EXPECT_EQ(ReadAll(Path(WTEXT("a.txt"))), "A");
  EXPECT_TRUE(MoveFileW(Path(WTEXT("Sub\\")).c_str(), Path(WTEXT("Sub2")).c_str()));
}

TEST_F(PublishedAnswers, NamesThatAreNone) {
  for (const WCHAR* prefix : {WTEXT("\\\\?\\"), WTEXT("\\\\.\\")}) {
    EXPECT_EQ(Error(DeleteFileW(prefix)), DWORD(ERROR_INVALID_NAME));
    EXPECT_EQ(Error(CreateDirectoryW(prefix, nullptr)), DWORD(ERROR_INVALID_NAME));
    EXPECT_EQ(Error(DeleteFileW((Text(prefix) + WTEXT("x")).c_str())), DWORD(ERROR_FILE_NOT_FOUND));
  }
  EXPECT_EQ(Error(DeleteFileW(WTEXT("\\\\x"))), DWORD(ERROR_PATH_NOT_FOUND));
  EXPECT_EQ(Error(CopyFileW(nullptr, WTEXT("x"), TRUE)), DWORD(ERROR_INVALID_PARAMETER));
  EXPECT_EQ(Error(SetCurrentDirectoryW(WTEXT(""))), DWORD(ERROR_INVALID_NAME));
  EXPECT_EQ(Error(GetLongPathNameW(nullptr, nullptr, 0)), DWORD(ERROR_INVALID_PARAMETER));
  EXPECT_EQ(Error(RemoveDirectoryW(WTEXT("\\"))), DWORD(ERROR_DIR_NOT_EMPTY));
}

TEST_F(PublishedAnswers, LongAndShortNamesKeepTheFormOfThePath) {
  WCHAR before[MAX_PATH], spelled[2 * MAX_PATH];
  GetCurrentDirectoryW(MAX_PATH, before);
  ASSERT_TRUE(SetCurrentDirectoryW(m_folder.Path().c_str()));
  for (const auto call : {GetLongPathNameW, GetShortPathNameW}) {
    EXPECT_EQ(call(WTEXT("sub"), spelled, 2 * MAX_PATH), 3u);
    EXPECT_EQ(Text(spelled), WTEXT("Sub"));
    EXPECT_EQ(call(WTEXT(".\\sub\\"), spelled, 2 * MAX_PATH), 6u);
    EXPECT_EQ(Text(spelled), WTEXT(".\\Sub\\"));
    EXPECT_EQ(call(WTEXT("sub\\.."), spelled, 2 * MAX_PATH), 6u);
    EXPECT_EQ(call(WTEXT("sub"), spelled, 3), 4u);
    EXPECT_EQ(call(WTEXT("a.tx?"), spelled, 2 * MAX_PATH), 0u);
    EXPECT_EQ(GetLastError(), DWORD(ERROR_INVALID_NAME));
  }
  SetCurrentDirectoryW(before);
}

TEST(PublishedAnswersOfTheSystem, ABufferThatIsTooSmallForTheTemporaryFolder) {
  WCHAR text[4] = {'x', 'y', 'z', 0};
  EXPECT_GT(GetTempPathW(3, text), 3u);
  EXPECT_EQ(Text(text, 3), Text(3, 0));
}

// --- files that are held open ---

TEST_F(PublishedAnswers, FilesThatAreHeldOpen) {
  const Text a = Path(WTEXT("a.txt")), b = Path(WTEXT("b.txt")), ini = Path(WTEXT("i.ini"));
  for (const DWORD access : {DWORD(GENERIC_READ), DWORD(GENERIC_WRITE)}) {
    for (const DWORD share : {0u, 1u, 2u, 3u, 4u, 7u}) {
      SCOPED_TRACE(testing::Message() << std::hex << access << ' ' << share);
      WriteAll(a, "A");
      WriteAll(b, "B");
      HANDLE held = CreateFileW(b.c_str(), access, share, nullptr, OPEN_EXISTING, 0, nullptr);
      EXPECT_EQ(Error(MoveFileExW(a.c_str(), b.c_str(), MOVEFILE_REPLACE_EXISTING)), DWORD(ERROR_ACCESS_DENIED));
      const DWORD mayWrite = (share & FILE_SHARE_WRITE) != 0 ? 0 : ERROR_SHARING_VIOLATION;
      EXPECT_EQ(Error(CopyFileW(a.c_str(), b.c_str(), FALSE)), mayWrite);
      CloseHandle(held);
      EXPECT_EQ(ReadAll(b), mayWrite == 0 ? "A" : "B");

      WriteAll(ini, "[s]\r\nk=v\r\n");
      held = CreateFileW(ini.c_str(), access, share, nullptr, OPEN_EXISTING, 0, nullptr);
      const bool sharesBoth = (share & 3) == 3;
      EXPECT_EQ(Error(WritePrivateProfileStringW(WTEXT("s"), WTEXT("k"), WTEXT("w"), ini.c_str())),
                DWORD(sharesBoth ? 0 : ERROR_SHARING_VIOLATION));
      WCHAR value[8];
      GetPrivateProfileStringW(WTEXT("s"), WTEXT("k"), WTEXT("none"), value, 8, ini.c_str());
      EXPECT_EQ(Text(value), (share & FILE_SHARE_READ) == 0 ? WTEXT("none") : sharesBoth ? WTEXT("w") : WTEXT("v"));
      // What the holder writes then is in the file.
      if (access == GENERIC_WRITE && sharesBoth) {
        DWORD done;
        EXPECT_TRUE(WriteFile(held, "; by", 4, &done, nullptr));
      }
      CloseHandle(held);
      if (access == GENERIC_WRITE && sharesBoth) {
        EXPECT_EQ(ReadAll(ini).substr(0, 4), "; by");
      }
    }
  }
}

TEST_F(PublishedAnswers, AReplacedNameIsSpelledAsItWasGiven) {
  EXPECT_TRUE(MoveFileExW(Path(WTEXT("a.txt")).c_str(), Path(WTEXT("B.TXT")).c_str(), MOVEFILE_REPLACE_EXISTING));
  EXPECT_EQ(ReadAll(Path(WTEXT("b.txt"))), "A");
  if (!IsWine()) {  // which keeps the old spelling
    EXPECT_EQ(Found(Path(WTEXT("b*"))), WTEXT("B.TXT"));
  }
}

TEST_F(PublishedAnswers, AReadOnlyFileIsNotDeletedAtTheEnd) {
  const Text a = Path(WTEXT("a.txt"));
  SetFileAttributesW(a.c_str(), FILE_ATTRIBUTE_READONLY);
  const HANDLE file =
      CreateFileW(a.c_str(), GENERIC_READ, 7, nullptr, OPEN_EXISTING, FILE_FLAG_DELETE_ON_CLOSE, nullptr);
  if (file != INVALID_HANDLE_VALUE) CloseHandle(file);
  EXPECT_EQ(ReadAll(a), "A");
}

TEST_F(PublishedAnswers, BuffersThatAreNotThere) {
  const HANDLE file =
      CreateFileW(Path(WTEXT("a.txt")).c_str(), GENERIC_READ | GENERIC_WRITE, 0, nullptr, OPEN_EXISTING, 0, nullptr);
  DWORD done;
  EXPECT_EQ(Error(ReadFile(file, nullptr, 1, &done, nullptr)), DWORD(ERROR_NOACCESS));
  EXPECT_EQ(Error(WriteFile(file, nullptr, 1, &done, nullptr)), DWORD(ERROR_INVALID_USER_BUFFER));
  CloseHandle(file);
}

// --- initialisation files ---

std::string Ask(const Text& file, const WCHAR* section, const WCHAR* key) {
  WCHAR text[64];
  const DWORD length = GetPrivateProfileStringW(section, key, WTEXT("def"), text, 64, file.c_str());
  std::string answer;
  for (DWORD i = 0; i < length; ++i) answer += text[i] == 0 ? '|' : static_cast<char>(text[i]);
  return answer;
}

TEST_F(PublishedAnswers, SectionsWithoutKeysOrNames) {
  const Text ini = Path(WTEXT("p.ini"));
  WriteAll(ini, "x=0\r\n[]\r\ne=1\r\n[s]\r\nk=v\r\n[t]\r\n");
  EXPECT_EQ(Ask(ini, WTEXT("none"), nullptr), "def");
  EXPECT_EQ(Ask(ini, WTEXT("t"), nullptr), "def");
  EXPECT_EQ(Ask(ini, WTEXT("s"), nullptr), "k|");
  EXPECT_EQ(Ask(ini, nullptr, nullptr), "s|t|");
  EXPECT_EQ(Ask(ini, WTEXT(""), WTEXT("x")), "0");
  EXPECT_EQ(Ask(ini, WTEXT(""), WTEXT("e")), "def");
  EXPECT_EQ(Error(WritePrivateProfileStringW(nullptr, WTEXT("k"), WTEXT("v"), ini.c_str())),
            DWORD(ERROR_FILE_NOT_FOUND));
  EXPECT_TRUE(WritePrivateProfileStringW(WTEXT(""), WTEXT("y"), WTEXT("2"), ini.c_str()));
  EXPECT_EQ(Ask(ini, WTEXT(""), WTEXT("y")), "2");
  EXPECT_EQ(Ask(ini, WTEXT("s"), WTEXT("k")), "v");
}

// --- memory, mappings, the registry, texts ---

TEST(PublishedAnswersOfTheSystem, BlocksThatBecomeEmpty) {
  const HGLOBAL block = GlobalAlloc(GMEM_MOVEABLE, 10);
  GlobalLock(block);
  EXPECT_EQ(GlobalReAlloc(block, 0, GMEM_MOVEABLE), nullptr);
  EXPECT_EQ(GlobalSize(block), 10u);
  GlobalUnlock(block);
  EXPECT_NE(GlobalReAlloc(block, 0, GMEM_MOVEABLE), nullptr);
  EXPECT_EQ(GlobalSize(block), 0u);
  GlobalFree(block);
  const HGLOBAL fixed = GlobalAlloc(GMEM_FIXED, 0);
  EXPECT_EQ(GlobalSize(fixed), 1u);
  GlobalFree(fixed);
}

TEST(PublishedAnswersOfTheSystem, RightsOfMappings) {
  const HANDLE mapping = CreateFileMappingW(INVALID_HANDLE_VALUE, nullptr, PAGE_READWRITE, 0, 65536, nullptr);
  const auto maps = [](HANDLE handle, DWORD access) {
    void* const view = MapViewOfFile(handle, access, 0, 0, 0);
    const DWORD error = Error(view);
    if (view != nullptr) UnmapViewOfFile(view);
    return error;
  };
  const auto duplicate = [mapping](DWORD access) {
    HANDLE twin = nullptr;
    EXPECT_TRUE(DuplicateHandle(GetCurrentProcess(), mapping, GetCurrentProcess(), &twin, access, FALSE, 0));
    return twin;
  };
  EXPECT_EQ(maps(mapping, 0), 0u);
  const HANDLE reader = duplicate(FILE_MAP_READ), nothing = duplicate(0);
  EXPECT_EQ(maps(reader, FILE_MAP_READ), 0u);
  EXPECT_EQ(maps(reader, FILE_MAP_COPY), 0u);
  EXPECT_EQ(maps(reader, FILE_MAP_WRITE), DWORD(ERROR_ACCESS_DENIED));
  EXPECT_EQ(maps(nothing, FILE_MAP_READ), DWORD(ERROR_ACCESS_DENIED));
  for (const HANDLE handle : {mapping, reader, nothing}) CloseHandle(handle);
}

TEST(PublishedAnswersOfTheSystem, RegistryTextsAreCompletedAndBadPointersRefused) {
  const test::RegistryRoot root;
  HKEY key = nullptr;
  ASSERT_EQ(RegCreateKeyExW(HKEY_CURRENT_USER, root.Path(), 0, nullptr, 0, KEY_ALL_ACCESS, nullptr, &key, nullptr), 0);
  // Odd, so that Windows does not complete it when it is set.
  ASSERT_EQ(RegSetValueExW(key, WTEXT("t"), 0, REG_SZ, reinterpret_cast<const BYTE*>(WTEXT("abc")), 5), 0);
  BYTE data[16];
  for (BYTE& byte : data) byte = 0xAA;
  DWORD size = sizeof data;
  EXPECT_EQ(RegQueryValueExW(key, WTEXT("t"), nullptr, nullptr, data, &size), 0);
  EXPECT_EQ(size, 5u);
  EXPECT_EQ(data[5], 0);
  EXPECT_EQ(data[6], 0);
  EXPECT_EQ(data[7], 0xAA);
  EXPECT_EQ(RegSetValueExW(key, WTEXT("t"), 0, REG_SZ, nullptr, 4), LSTATUS(ERROR_NOACCESS));
  EXPECT_EQ(RegSetValueExW(key, WTEXT("t"), 0, REG_BINARY, reinterpret_cast<const BYTE*>(16), 4),
            LSTATUS(ERROR_NOACCESS));
  size = 99;
  EXPECT_EQ(RegQueryValueExW(key, WTEXT("none"), nullptr, nullptr, data, &size), LSTATUS(ERROR_FILE_NOT_FOUND));
  EXPECT_EQ(size, 99u);
  RegCloseKey(key);
}

TEST(PublishedAnswersOfTheSystem, ReferencesAndMessagesWithoutRoom) {
  WCHAR text[16] = {'x', 0};
  EXPECT_EQ(ExpandEnvironmentStringsW(WTEXT("abc"), text, 2), 4u);
  EXPECT_EQ(GetLastError(), DWORD(ERROR_INSUFFICIENT_BUFFER));
  WCHAR* message = text;
  EXPECT_EQ(
      FormatMessageW(FORMAT_MESSAGE_ALLOCATE_BUFFER, nullptr, 5, 0, reinterpret_cast<LPWSTR>(&message), 0, nullptr),
      0u);
  EXPECT_EQ(message, nullptr);
  for (const DWORD code : {21u, 33u, 67u, 111u, 161u, 1018u, 1784u}) {
    WCHAR words[256];
    EXPECT_GT(FormatMessageW(FORMAT_MESSAGE_FROM_SYSTEM | FORMAT_MESSAGE_IGNORE_INSERTS, nullptr, code, 0, words, 256,
                             nullptr),
              4u)
        << code;
  }
}

// --- code pages ---

std::vector<int> Decoded(UINT page, const char* text) {
  WCHAR wide[64];
  const int length = MultiByteToWideChar(page, 0, text, -1, wide, 64);
  return std::vector<int>(wide, wide + length);
}

TEST(PublishedAnswersOfTheSystem, CutTextsKeepTheirTerminator) {
  for (const UINT page : {932u, 936u, 949u, 950u, 20932u}) {
    CPINFOEXW info;
    ASSERT_TRUE(GetCPInfoExW(page, 0, &info));
    // A lead byte of all of them.
    EXPECT_EQ(Decoded(page, "x\xE4"), (std::vector<int>{'x', info.UnicodeDefaultChar, 0})) << page;
    EXPECT_EQ(MultiByteToWideChar(page, 0, "x\xE4", -1, nullptr, 0), 3) << page;
  }
  for (const char* cut : {"x+", "x+A", "x+AH", "x+AHg"}) EXPECT_EQ(Decoded(65000, cut).back(), 0) << cut;
  if (!IsWindows()) {  // Wine does not have the page
    EXPECT_EQ(Decoded(50220, "a\x1B$B\x46").back(), 0);
  }
}

// Every character there and back, and the form that it takes.
TEST(PublishedAnswersOfTheSystem, Utf7) {
  for (unsigned c = 0; c < 0x10000; c += c < 0x300 ? 1 : 37) {
    const WCHAR text[3] = {static_cast<WCHAR>(c), 'a', static_cast<WCHAR>(c)};
    char bytes[32];
    WCHAR back[8];
    const int length = WideCharToMultiByte(65000, 0, text, 3, bytes, 32, nullptr, nullptr);
    ASSERT_EQ(MultiByteToWideChar(65000, 0, bytes, length, back, 8), 3) << c;
    EXPECT_EQ(Text(back, 3), Text(text, 3)) << c;
  }
  const auto encode = [](const WCHAR* text) {
    char bytes[64];
    return std::string(bytes, WideCharToMultiByte(65000, 0, text, -1, bytes, 64, nullptr, nullptr) - 1);
  };
  EXPECT_EQ(encode(WTEXT("A!\x4E2D+.\xD83D\xDE00~")), "A+ACFOLQ-+-.+2D3eAAB+-");
  EXPECT_EQ(encode(WTEXT("a\xE9-b\tc")), "a+AOk--b\tc");
  EXPECT_EQ(Decoded(65000, "\x01\x7F~\\+-+AGEAYg!+,"),
            (std::vector<int>{1, 0x7F, '~', '\\', '+', 'a', 'b', '!', ',', 0}));
}

TEST(PublishedAnswersOfTheSystem, WhatDoesNotFitUsesNoDefault) {
  BOOL used = TRUE;
  char bytes[4];
  EXPECT_EQ(WideCharToMultiByte(1252, 0, WTEXT("ab\x4E2D"), 3, bytes, 2, nullptr, &used), 0);
  EXPECT_FALSE(used);
  EXPECT_EQ(WideCharToMultiByte(1252, 0, WTEXT("ab\x4E2D"), 3, nullptr, 0, nullptr, &used), 3);
  EXPECT_TRUE(used);
}

}  // namespace
