// Resources, messages, global memory and the small questions to the system.

#include <gtest/gtest.h>

#include <string>
#include <thread>

#include "qxcore/platform/module.h"
#include "qxcore/platform/wide.h"

namespace {

using Text = std::basic_string<WCHAR>;

TEST(LastError, BelongsToTheThread) {
  SetLastError(5);
  DWORD elsewhere = 5;
  std::thread([&] { elsewhere = GetLastError(); }).join();
  EXPECT_NE(elsewhere, 5u);
  SetLastError(5);
  EXPECT_EQ(GetLastError(), 5u);
}

TEST(Resources, TextsOfTheLibrary) {
  WCHAR text[200];
  EXPECT_EQ(LoadStringW(platform::ModuleHandle(), 200, text, 200), 23);
  EXPECT_EQ(Text(text), WTEXT("Cannot open for reading"));
  EXPECT_EQ(LoadStringW(platform::ModuleHandle(), 200, text, 7), 6);  // cut, terminated
  EXPECT_EQ(Text(text), WTEXT("Cannot"));
  EXPECT_EQ(LoadStringW(platform::ModuleHandle(), 60000, text, 200), 0);
  WCHAR* inPlace = nullptr;
  const int length = LoadStringW(platform::ModuleHandle(), 200, reinterpret_cast<WCHAR*>(&inPlace), 0);
  ASSERT_EQ(length, 23);
  EXPECT_EQ(Text(inPlace, 23), WTEXT("Cannot open for reading"));
  EXPECT_NE(FindResourceW(platform::ModuleHandle(), MAKEINTRESOURCEW(200 / 16 + 1), MAKEINTRESOURCEW(6)), nullptr);
  EXPECT_EQ(FindResourceW(platform::ModuleHandle(), MAKEINTRESOURCEW(4000), MAKEINTRESOURCEW(6)), nullptr);
}

Text Message(DWORD code) {
  WCHAR* text = nullptr;
  const DWORD length =
      FormatMessageW(FORMAT_MESSAGE_ALLOCATE_BUFFER | FORMAT_MESSAGE_FROM_SYSTEM | FORMAT_MESSAGE_IGNORE_INSERTS,
                     nullptr, code, 0, reinterpret_cast<WCHAR*>(&text), 0, nullptr);
  if (length == 0) return Text();
  Text message(text, length);
  LocalFree(text);
  return message;
}

TEST(Messages, SystemTexts) {
  EXPECT_NE(Message(ERROR_FILE_NOT_FOUND).find(WTEXT("\r\n")), Text::npos);
  EXPECT_FALSE(Message(ERROR_ACCESS_DENIED).empty());
  EXPECT_FALSE(Message(static_cast<DWORD>(E_OUTOFMEMORY)).empty());
  EXPECT_EQ(Message(0x8099FFFF), Text());
  EXPECT_EQ(GetLastError(), DWORD(ERROR_MR_MID_NOT_FOUND));
  WCHAR small[4];
  EXPECT_EQ(FormatMessageW(FORMAT_MESSAGE_FROM_SYSTEM, nullptr, ERROR_ACCESS_DENIED, 0, small, 4, nullptr), 0u);
  EXPECT_EQ(GetLastError(), DWORD(ERROR_INSUFFICIENT_BUFFER));
#ifndef _WIN32
  EXPECT_EQ(Message(static_cast<DWORD>(E_OUTOFMEMORY)),
            WTEXT("Not enough memory resources are available to complete this operation.\r\n"));
#endif
}

TEST(GlobalMemory, LocksAndSizes) {
  const HGLOBAL block = GlobalAlloc(GMEM_MOVEABLE | GMEM_ZEROINIT, 100);
  ASSERT_NE(block, nullptr);
  EXPECT_GE(GlobalSize(block), 100u);
  auto* bytes = static_cast<char*>(GlobalLock(block));
  ASSERT_NE(bytes, nullptr);
  for (int i = 0; i < 100; ++i) EXPECT_EQ(bytes[i], 0);
  bytes[99] = 'x';
  EXPECT_EQ(GlobalLock(block), bytes);
  EXPECT_TRUE(GlobalUnlock(block));
  EXPECT_FALSE(GlobalUnlock(block));
  EXPECT_EQ(GetLastError(), DWORD(NO_ERROR));
  EXPECT_FALSE(GlobalUnlock(block));
  EXPECT_EQ(GetLastError(), DWORD(ERROR_NOT_LOCKED));
  const HGLOBAL grown = GlobalReAlloc(block, 100000, GMEM_MOVEABLE | GMEM_ZEROINIT);
  ASSERT_NE(grown, nullptr);
  EXPECT_GE(GlobalSize(grown), 100000u);
  bytes = static_cast<char*>(GlobalLock(grown));
  EXPECT_EQ(bytes[99], 'x');
  EXPECT_EQ(bytes[99999], 0);
  GlobalUnlock(grown);
  EXPECT_EQ(GlobalFree(grown), nullptr);
}

TEST(GlobalMemory, FixedBlocksAreTheirAddress) {
  const HGLOBAL block = GlobalAlloc(GPTR, 10);
  EXPECT_EQ(GlobalLock(block), block);
  EXPECT_EQ(GlobalFree(block), nullptr);
}

TEST(System, SmallQuestions) {
  EXPECT_EQ(MulDiv(7, 3, 2), 11);  // 10.5 rounds away from zero
  EXPECT_EQ(MulDiv(-7, 3, 2), -11);
  EXPECT_EQ(MulDiv(7, -3, -2), 11);
  EXPECT_EQ(MulDiv(1, 1, 0), -1);
  EXPECT_EQ(MulDiv(0x7FFFFFFF, 2, 1), -1);
  EXPECT_EQ(MulDiv(0x7FFFFFFF, 0x7FFFFFFF, 0x7FFFFFFF), 0x7FFFFFFF);
  SYSTEM_INFO info;
  GetSystemInfo(&info);
  EXPECT_EQ(info.dwAllocationGranularity, 65536u);
  EXPECT_GE(info.dwPageSize, 4096u);
  EXPECT_EQ(GetACP(), 1252u);
  EXPECT_EQ(GetOEMCP(), 437u);
}

TEST(Folding, Composition) {
  WCHAR text[16];
  EXPECT_EQ(FoldStringW(MAP_COMPOSITE, WTEXT("\x00E9x"), -1, text, 16), 4);
  EXPECT_EQ(Text(text), WTEXT("e\x0301x"));
  EXPECT_EQ(FoldStringW(MAP_PRECOMPOSED, WTEXT("e\x0301x"), -1, text, 16), 3);
  EXPECT_EQ(Text(text), WTEXT("\x00E9x"));
#ifndef _WIN32  // Wine 8 gives 2
  EXPECT_EQ(FoldStringW(MAP_COMPOSITE, WTEXT("\x00E9"), 1, text, 1), 0);
  EXPECT_EQ(GetLastError(), DWORD(ERROR_INSUFFICIENT_BUFFER));
#endif
  EXPECT_EQ(FoldStringW(MAP_COMPOSITE, WTEXT("\x00E9"), 1, nullptr, 0), 2);
}

}  // namespace
