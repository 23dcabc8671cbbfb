// What the platform's calls answer near the edges of what they take: wrong arguments with their published errors,
// buffers that are too small, blocks of memory beside a model, the page of symbols.

#include <gtest/gtest.h>

#include <algorithm>
#include <map>
#include <random>
#include <string>
#include <vector>

#include "qxcore/platform/wide.h"
#include "tests/support/last_error.h"
#include "tests/support/temp_folder.h"
#include "tests/support/wine.h"

namespace {

using test::TempFolder;
using test::Text;
using test::WriteAll;

constexpr DWORD kBadParameter = ERROR_INVALID_PARAMETER;

// --- code pages ---

constexpr UINT kSymbols = 42;

TEST(SymbolPage, BytesLieInThePrivateArea) {
  for (int byte = 0; byte < 256; ++byte) {
    const char one = static_cast<char>(byte);
    WCHAR character = 0;
    ASSERT_EQ(MultiByteToWideChar(kSymbols, 0, &one, 1, &character, 1), 1);
    ASSERT_EQ(character, byte < 0x20 ? byte : 0xF000 + byte) << byte;
    char back = 0;
    ASSERT_EQ(WideCharToMultiByte(kSymbols, 0, &character, 1, &back, 1, nullptr, nullptr), 1);
    ASSERT_EQ(back, one);
  }
  const std::string text = "abc";
  EXPECT_EQ(MultiByteToWideChar(kSymbols, 0, text.data(), 3, nullptr, 0), 3) << "the size that is needed";
  WCHAR small[2];
  EXPECT_EQ(ErrorOf([&] { return MultiByteToWideChar(kSymbols, 0, text.data(), 3, small, 2); }),
            DWORD(ERROR_INSUFFICIENT_BUFFER));
  const WCHAR letter = 'A';
  char byte = 0;
  EXPECT_EQ(ErrorOf([&] { return WideCharToMultiByte(kSymbols, 0, &letter, 1, &byte, 1, nullptr, nullptr); }),
            DWORD(ERROR_NO_UNICODE_TRANSLATION))
      << "a letter is no symbol";
}

TEST(Conversions, WrongArgumentsAreRefused) {
  const char bytes[] = "abc";
  const WCHAR wide[] = {'a', 'b', 'c', 0};
  WCHAR text[8];
  char back[8];
  for (const UINT page : {1252u, 932u, 65000u, 65001u, 42u}) {
    EXPECT_EQ(ErrorOf([&] { return MultiByteToWideChar(page, 0, nullptr, 3, text, 8); }), kBadParameter) << page;
    EXPECT_EQ(ErrorOf([&] { return MultiByteToWideChar(page, 0, bytes, 0, text, 8); }), kBadParameter) << page;
    EXPECT_EQ(ErrorOf([&] { return MultiByteToWideChar(page, 0, bytes, 3, text, -1); }), kBadParameter) << page;
    EXPECT_EQ(ErrorOf([&] { return MultiByteToWideChar(page, 0, bytes, 3, nullptr, 8); }), kBadParameter) << page;
    const auto toBytes = [&](const WCHAR* from, int count, char* to, int room) {
      return ErrorOf([&] { return WideCharToMultiByte(page, 0, from, count, to, room, nullptr, nullptr); });
    };
    EXPECT_EQ(toBytes(nullptr, 3, back, 8), kBadParameter) << page;
    EXPECT_EQ(toBytes(wide, 0, back, 8), kBadParameter) << page;
    EXPECT_EQ(toBytes(wide, 3, back, -1), kBadParameter) << page;
    EXPECT_EQ(toBytes(wide, 3, nullptr, 8), kBadParameter) << page;
  }
  EXPECT_EQ(ErrorOf([&] { return MultiByteToWideChar(12345, 0, bytes, 3, text, 8); }), kBadParameter);
  EXPECT_EQ(ErrorOf([&] { return WideCharToMultiByte(12345, 0, wide, 3, back, 8, nullptr, nullptr); }), kBadParameter);
  // This page says nothing of characters that it replaces; Wine takes the arguments all the same.
  BOOL used = FALSE;
  if (!IsWine()) {
    EXPECT_EQ(ErrorOf([&] { return WideCharToMultiByte(CP_UTF8, 0, wide, 3, back, 8, "?", nullptr); }), kBadParameter);
    EXPECT_EQ(ErrorOf([&] { return WideCharToMultiByte(CP_UTF8, 0, wide, 3, back, 8, nullptr, &used); }),
              kBadParameter);
  }
  const WCHAR half[] = {0xD800, 'x'};
  EXPECT_EQ(
      ErrorOf([&] { return WideCharToMultiByte(CP_UTF8, WC_ERR_INVALID_CHARS, half, 2, back, 8, nullptr, nullptr); }),
      DWORD(ERROR_NO_UNICODE_TRANSLATION));
  EXPECT_EQ(ErrorOf([&] { return MultiByteToWideChar(CP_UTF8, MB_ERR_INVALID_CHARS, "\xC3(", 2, text, 8); }),
            DWORD(ERROR_NO_UNICODE_TRANSLATION));
}

// --- memory ---

TEST(GlobalMemory, RandomChanges_KeepTheContent) {
  struct Block {
    HGLOBAL handle;
    std::string content;
  };
  std::mt19937 random(23);
  std::vector<Block> blocks;
  for (int step = 0; step < 4000; ++step) {
    const SIZE_T size = 1 + random() % (random() % 8 == 0 ? 100000 : 300);
    if (blocks.empty() || (random() % 6 == 0 && blocks.size() < 20)) {
      const HGLOBAL made = GlobalAlloc(GMEM_MOVEABLE | GMEM_ZEROINIT, size);
      ASSERT_NE(made, nullptr);
      blocks.push_back({made, std::string(size, '\0')});
    }
    const std::size_t which = random() % blocks.size();
    Block& block = blocks[which];
    switch (random() % 4) {
      case 0: {
        ASSERT_EQ(GlobalReAlloc(block.handle, size, GMEM_MOVEABLE | GMEM_ZEROINIT), block.handle);
        block.content.resize(size, '\0');
        break;
      }
      case 1: {
        auto* bytes = static_cast<char*>(GlobalLock(block.handle));
        ASSERT_NE(bytes, nullptr);
        const std::size_t at = random() % block.content.size();
        bytes[at] = block.content[at] = static_cast<char>(random());
        GlobalUnlock(block.handle);
        break;
      }
      case 2:
        if (random() % 4 != 0) break;
        ASSERT_EQ(GlobalFree(block.handle), nullptr);
        blocks.erase(blocks.begin() + static_cast<std::ptrdiff_t>(which));
        break;
      default: {
        ASSERT_EQ(GlobalSize(block.handle), block.content.size());
        const void* bytes = GlobalLock(block.handle);
        ASSERT_EQ(std::string(static_cast<const char*>(bytes), block.content.size()), block.content) << step;
        GlobalUnlock(block.handle);
      }
    }
  }
  for (const Block& block : blocks) EXPECT_EQ(GlobalFree(block.handle), nullptr);
}

TEST(GlobalMemory, LocksAndSizesOfNothing) {
  const HGLOBAL movable = GlobalAlloc(GMEM_MOVEABLE, 100);
  EXPECT_NE(GlobalLock(movable), nullptr);
  EXPECT_NE(GlobalLock(movable), nullptr);
  EXPECT_TRUE(GlobalUnlock(movable)) << "one lock is left";
  SetLastError(0xDEAD);
  EXPECT_FALSE(GlobalUnlock(movable));
  EXPECT_EQ(GetLastError(), DWORD(NO_ERROR)) << "the last one is no failure";
  EXPECT_EQ(ErrorOf([&] { return GlobalUnlock(movable); }), DWORD(ERROR_NOT_LOCKED));
  EXPECT_EQ(GlobalReAlloc(movable, 0, GMEM_MOVEABLE), movable);
  EXPECT_EQ(GlobalSize(movable), 0u);
  EXPECT_EQ(GlobalFree(movable), nullptr);
  EXPECT_EQ(GlobalFree(nullptr), nullptr);

  const HGLOBAL fixed = GlobalAlloc(0, 64);
  EXPECT_EQ(GlobalLock(fixed), fixed) << "its handle is its address";
  EXPECT_TRUE(GlobalUnlock(fixed));
  EXPECT_EQ(GlobalFree(fixed), nullptr);
}

#ifndef _WIN32  // Wine crashes on some of these, and may have given the handle away again
TEST(GlobalMemory, HandlesThatAreNone) {
  const HGLOBAL gone = GlobalAlloc(GMEM_MOVEABLE, 10);
  GlobalFree(gone);
  EXPECT_EQ(ErrorOf([&] { return GlobalLock(gone) != nullptr; }), DWORD(ERROR_INVALID_HANDLE));
  EXPECT_EQ(ErrorOf([&] { return GlobalUnlock(gone); }), DWORD(ERROR_INVALID_HANDLE));
  EXPECT_EQ(ErrorOf([&] { return GlobalSize(gone) != 0; }), DWORD(ERROR_INVALID_HANDLE));
  EXPECT_EQ(ErrorOf([&] { return GlobalReAlloc(gone, 5, GMEM_MOVEABLE) != nullptr; }), DWORD(ERROR_INVALID_HANDLE));
  EXPECT_EQ(GlobalFree(gone), gone) << "it comes back";
  const HGLOBAL kept = GlobalAlloc(GMEM_MOVEABLE, 10);
  EXPECT_EQ(ErrorOf([&] { return GlobalReAlloc(kept, 5, GMEM_MODIFY) != nullptr; }), kBadParameter);
  constexpr SIZE_T kTooMuch = SIZE_T{1} << 62;
  EXPECT_EQ(ErrorOf([&] { return GlobalAlloc(GMEM_MOVEABLE, kTooMuch) != nullptr; }), DWORD(ERROR_NOT_ENOUGH_MEMORY));
  EXPECT_EQ(ErrorOf([&] { return GlobalAlloc(GMEM_ZEROINIT, kTooMuch) != nullptr; }), DWORD(ERROR_NOT_ENOUGH_MEMORY));
  EXPECT_EQ(ErrorOf([&] { return GlobalReAlloc(kept, kTooMuch, GMEM_MOVEABLE) != nullptr; }),
            DWORD(ERROR_NOT_ENOUGH_MEMORY));
  EXPECT_EQ(GlobalSize(kept), 10u) << "it stays as it was";
  GlobalFree(kept);
  const HGLOBAL fixed = GlobalAlloc(0, 64);
  EXPECT_EQ(GlobalReAlloc(fixed, 32, 0), fixed);
  EXPECT_EQ(GlobalReAlloc(fixed, 64, 0), fixed) << "it has had that room";
  EXPECT_EQ(ErrorOf([&] { return GlobalReAlloc(fixed, 65, 0) != nullptr; }), DWORD(ERROR_NOT_ENOUGH_MEMORY));
  GlobalFree(fixed);
}
#endif

// --- folders and names ---

TEST(FolderCalls, FillBuffersThatAreLargeEnough) {
  WCHAR whole[MAX_PATH], part[MAX_PATH];
  const DWORD length = GetTempPathW(MAX_PATH, whole);
  ASSERT_GT(length, 0u);
  EXPECT_EQ(whole[length - 1], '\\');
  EXPECT_EQ(GetTempPathW(0, nullptr), length + 1);
  EXPECT_EQ(GetTempPathW(length, part), length + 1) << "no room for the NUL";
  EXPECT_EQ(GetTempPathW(length + 1, part), length);

  const DWORD current = GetCurrentDirectoryW(MAX_PATH, whole);
  ASSERT_GT(current, 0u);
  EXPECT_EQ(GetCurrentDirectoryW(current, part), current + 1);
  EXPECT_EQ(GetCurrentDirectoryW(current + 1, part), current);

  WCHAR* name = nullptr;
  EXPECT_EQ(GetFullPathNameW(WTEXT("C:\\one\\..\\two\\three"), MAX_PATH, whole, &name), 12u);
  EXPECT_EQ(Text(whole), WTEXT("C:\\two\\three"));
  EXPECT_EQ(Text(name), WTEXT("three"));
  GetFullPathNameW(WTEXT("C:\\two\\"), MAX_PATH, whole, &name);
  EXPECT_EQ(name, nullptr) << "a folder has no such part";
  EXPECT_EQ(GetFullPathNameW(WTEXT("C:\\two\\three"), 5, whole, nullptr), 13u);

  TempFolder folder;
  ULARGE_INTEGER available, total, free;
  EXPECT_TRUE(GetDiskFreeSpaceExW(folder.Path().c_str(), &available, &total, &free));
  EXPECT_LE(available.QuadPart, total.QuadPart);
  EXPECT_LE(free.QuadPart, total.QuadPart);
  EXPECT_TRUE(GetDiskFreeSpaceExW(folder.Path().c_str(), nullptr, nullptr, nullptr));
  EXPECT_TRUE(GetDiskFreeSpaceExW(nullptr, &available, nullptr, nullptr));
  EXPECT_FALSE(GetDiskFreeSpaceExW(folder.File(WTEXT("missing")).c_str(), &available, nullptr, nullptr));
}

TEST(FolderCalls, TemporaryNames) {
  TempFolder folder;
  WCHAR name[MAX_PATH];
  EXPECT_EQ(GetTempFileNameW(folder.Path().c_str(), WTEXT("prefix"), 0x1234, name), 0x1234u);
  EXPECT_EQ(Text(name), folder.File(WTEXT("pre1234.tmp"))) << "no more than three characters";
  EXPECT_EQ(GetFileAttributesW(name), INVALID_FILE_ATTRIBUTES) << "with a number nothing is made";
  const UINT made = GetTempFileNameW((folder.Path() + WTEXT("\\")).c_str(), nullptr, 0, name);
  EXPECT_NE(made, 0u);
  EXPECT_NE(GetFileAttributesW(name), INVALID_FILE_ATTRIBUTES);
  EXPECT_EQ(ErrorOf([&] { return GetTempFileNameW(folder.File(WTEXT("missing")).c_str(), WTEXT("p"), 0, name); }),
            DWORD(ERROR_DIRECTORY));
  if (IsWine()) return;  // which looks for the folder first
  EXPECT_EQ(ErrorOf([&] { return GetTempFileNameW(Text(MAX_PATH, 'x').c_str(), WTEXT("p"), 1, name); }),
            DWORD(ERROR_BUFFER_OVERFLOW));
}

// --- files ---

TEST(FileCalls, TimesSizesAndHandles) {
  TempFolder folder;
  const Text path = folder.File(WTEXT("f"));
  WriteAll(path, "12345");
  const HANDLE file = CreateFileW(path.c_str(), GENERIC_READ, FILE_SHARE_READ, nullptr, OPEN_EXISTING, 0, nullptr);
  ASSERT_NE(file, INVALID_HANDLE_VALUE);
  FILETIME created, read, written, one;
  EXPECT_TRUE(GetFileTime(file, &created, &read, &written));
  EXPECT_TRUE(GetFileTime(file, &one, nullptr, nullptr));
  EXPECT_EQ(CompareFileTime(&one, &created), 0);
  EXPECT_TRUE(GetFileTime(file, nullptr, &one, nullptr));
  EXPECT_TRUE(GetFileTime(file, nullptr, nullptr, &one));
  EXPECT_EQ(CompareFileTime(&one, &written), 0);
  LARGE_INTEGER distance, place;
  distance.QuadPart = -2;
  EXPECT_TRUE(SetFilePointerEx(file, distance, &place, FILE_END));
  EXPECT_EQ(place.QuadPart, 3);
  EXPECT_EQ(ErrorOf([&] { return SetFilePointerEx(file, distance, &place, 3); }), kBadParameter);
  distance.QuadPart = -9;
  EXPECT_EQ(ErrorOf([&] { return SetFilePointerEx(file, distance, &place, FILE_CURRENT); }),
            DWORD(ERROR_NEGATIVE_SEEK));
  distance.QuadPart = 0;
  EXPECT_TRUE(SetFilePointerEx(file, distance, nullptr, FILE_CURRENT));
  DWORD done = 9;
  char bytes[8];
  EXPECT_EQ(ErrorOf([&] { return WriteFile(file, "x", 1, &done, nullptr); }), DWORD(ERROR_ACCESS_DENIED));
  EXPECT_EQ(done, 0u);
  EXPECT_TRUE(ReadFile(file, bytes, sizeof bytes, &done, nullptr));
  EXPECT_EQ(done, 2u);

  HANDLE twin = nullptr;
  EXPECT_TRUE(DuplicateHandle(GetCurrentProcess(), file, GetCurrentProcess(), &twin, 0, FALSE,
                              DUPLICATE_SAME_ACCESS | DUPLICATE_CLOSE_SOURCE));
  if (twin != file) {  // the value of the first one, which was closed, may be given again
    EXPECT_FALSE(ReadFile(file, bytes, 1, &done, nullptr));
  }
  EXPECT_TRUE(SetFilePointerEx(twin, distance, &place, FILE_BEGIN));
  EXPECT_TRUE(ReadFile(twin, bytes, sizeof bytes, &done, nullptr));
  EXPECT_EQ(done, 5u);
  EXPECT_TRUE(CloseHandle(twin));
}

// Which dispositions and accesses go together.
TEST(FileCalls, OrdersThatContradictThemselves) {
  TempFolder folder;
  const Text path = folder.File(WTEXT("f"));
  WriteAll(path, "12345");
  const auto open = [](const Text& name, DWORD access, DWORD disposition, DWORD flags) {
    const HANDLE file = CreateFileW(name.c_str(), access, FILE_SHARE_READ, nullptr, disposition, flags, nullptr);
    if (file != INVALID_HANDLE_VALUE) CloseHandle(file);
    return file != INVALID_HANDLE_VALUE;
  };
  for (const DWORD disposition : {0u, 6u, 99u})
    EXPECT_EQ(ErrorOf([&] { return open(path, GENERIC_READ, disposition, 0); }), kBadParameter) << disposition;
  if (!IsWine()) {  // which empties the file
    EXPECT_EQ(ErrorOf([&] { return open(path, GENERIC_READ, TRUNCATE_EXISTING, 0); }), kBadParameter);
  }
  EXPECT_EQ(ErrorOf([&] { return open(folder.Path(), GENERIC_READ, OPEN_EXISTING, 0); }), DWORD(ERROR_ACCESS_DENIED));
  EXPECT_TRUE(open(folder.Path(), GENERIC_READ, OPEN_EXISTING, FILE_FLAG_BACKUP_SEMANTICS));
  EXPECT_TRUE(open(path, 0, OPEN_EXISTING, 0)) << "for its properties alone";
  EXPECT_TRUE(open(path, GENERIC_WRITE, OPEN_EXISTING, FILE_FLAG_WRITE_THROUGH));
  EXPECT_EQ(test::ReadAll(path), "12345");
  EXPECT_TRUE(open(path, GENERIC_WRITE, TRUNCATE_EXISTING, 0));
  EXPECT_EQ(test::ReadAll(path), "");
  EXPECT_EQ(ErrorOf([&] { return open(folder.File(WTEXT("no\\f")), GENERIC_WRITE, CREATE_NEW, 0); }),
            DWORD(ERROR_PATH_NOT_FOUND));
}

TEST(MappingCalls, ContradictionsAreRefused) {
  const auto map = [](DWORD protection, DWORD high, DWORD low) {
    const HANDLE mapping = CreateFileMappingW(INVALID_HANDLE_VALUE, nullptr, protection, high, low, nullptr);
    if (mapping != nullptr) CloseHandle(mapping);
    return mapping != nullptr;
  };
  EXPECT_EQ(ErrorOf([&] { return map(PAGE_READWRITE, 0, 0); }), kBadParameter) << "no file, no size";
  EXPECT_EQ(ErrorOf([&] { return map(0, 0, 100); }), kBadParameter);
  EXPECT_TRUE(map(PAGE_READWRITE, 0, 100));
  TempFolder folder;
  const Text path = folder.File(WTEXT("f"));
  WriteAll(path, "12345");
  const HANDLE file = CreateFileW(path.c_str(), GENERIC_READ, FILE_SHARE_READ, nullptr, OPEN_EXISTING, 0, nullptr);
  EXPECT_EQ(CreateFileMappingW(file, nullptr, PAGE_READWRITE, 0, 0, nullptr), nullptr) << "it was opened for reading";
  const HANDLE mapping = CreateFileMappingW(file, nullptr, PAGE_READONLY, 0, 0, nullptr);
  ASSERT_NE(mapping, nullptr);
  EXPECT_EQ(CreateFileMappingW(file, nullptr, PAGE_READONLY, 0, 100, nullptr), nullptr) << "it cannot grow";
  EXPECT_EQ(MapViewOfFile(mapping, FILE_MAP_WRITE, 0, 0, 0), nullptr);
  EXPECT_EQ(MapViewOfFile(mapping, FILE_MAP_READ, 0, 4096, 0), nullptr) << "not a multiple of the granularity";
  EXPECT_EQ(MapViewOfFile(file, FILE_MAP_READ, 0, 0, 0), nullptr) << "no mapping";
  const void* view = MapViewOfFile(mapping, FILE_MAP_READ, 0, 0, 0);
  ASSERT_NE(view, nullptr);
  EXPECT_EQ(std::string(static_cast<const char*>(view), 5), "12345");
  void* own = MapViewOfFile(mapping, FILE_MAP_COPY, 0, 0, 0);
  ASSERT_NE(own, nullptr);
  static_cast<char*>(own)[0] = 'x';
  EXPECT_EQ(static_cast<const char*>(view)[0], '1') << "a copy is its holder's alone";
  EXPECT_TRUE(UnmapViewOfFile(own));
  EXPECT_TRUE(UnmapViewOfFile(view));
  EXPECT_EQ(ErrorOf([&] { return UnmapViewOfFile(view); }), DWORD(ERROR_INVALID_ADDRESS));
  EXPECT_FALSE(FlushViewOfFile(view, 0));
  CloseHandle(mapping);
  CloseHandle(file);
}

// --- dates ---

TEST(LocaleDates, BuffersFlagsAndFields) {
  const SYSTEMTIME good = {2024, 2, 4, 29, 13, 5, 6, 0};
  WCHAR text[100];
  const auto date = [&](DWORD flags, const SYSTEMTIME* time, int room) {
    return GetDateFormatW(LOCALE_USER_DEFAULT, flags, time, nullptr, text, room);
  };
  const auto clock = [&](DWORD flags, const SYSTEMTIME* time, int room) {
    return GetTimeFormatW(LOCALE_USER_DEFAULT, flags, time, nullptr, text, room);
  };
  for (const DWORD flags : {DWORD(DATE_SHORTDATE), DWORD(DATE_LONGDATE)}) {
    const int size = date(flags, &good, 0);
    ASSERT_GT(size, 5);
    EXPECT_EQ(ErrorOf([&] { return date(flags, &good, size - 1); }), DWORD(ERROR_INSUFFICIENT_BUFFER));
    EXPECT_EQ(date(flags, &good, size), size);
    EXPECT_NE(Text(text).find(WTEXT("2024")), Text::npos);
  }
  const int size = clock(0, &good, 0);
  ASSERT_GT(size, 5);
  EXPECT_EQ(ErrorOf([&] { return clock(0, &good, size - 1); }), DWORD(ERROR_INSUFFICIENT_BUFFER));
  EXPECT_EQ(clock(0, &good, size), size);
  EXPECT_GT(date(DATE_SHORTDATE, nullptr, 100), 5) << "today";
  EXPECT_GT(clock(0, nullptr, 100), 5) << "now";
  EXPECT_EQ(ErrorOf([&] { return date(DATE_SHORTDATE, &good, -1); }), kBadParameter);
  for (SYSTEMTIME bad : {SYSTEMTIME{2023, 2, 0, 29, 0, 0, 0, 0}, SYSTEMTIME{2023, 13, 0, 1, 0, 0, 0, 0}})
    if (!IsWine()) {
      EXPECT_EQ(ErrorOf([&] { return date(DATE_SHORTDATE, &bad, 100); }), kBadParameter);
    }
  for (SYSTEMTIME bad : {SYSTEMTIME{2023, 1, 0, 1, 24, 0, 0, 0}, SYSTEMTIME{2023, 1, 0, 1, 0, 60, 0, 0},
                         SYSTEMTIME{2023, 1, 0, 1, 0, 0, 60, 0}, SYSTEMTIME{2023, 1, 0, 1, 0, 0, 0, 1000}})
    EXPECT_EQ(ErrorOf([&] { return clock(0, &bad, 100); }), kBadParameter);
}

}  // namespace
