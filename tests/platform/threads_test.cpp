// What the portable layer shares between threads: tables made at the first use, handles, global memory.

#include <gtest/gtest.h>

#include <atomic>
#include <string>
#include <thread>
#include <vector>

#include "qxcore/platform/interlocked.h"
#include "tests/support/temp_folder.h"

namespace {

template <class Work>
void InThreads(int count, Work work) {
  std::atomic<bool> go{false};
  std::vector<std::thread> threads;
  for (int i = 0; i < count; ++i)
    threads.emplace_back([&, i] {
      while (!go) std::this_thread::yield();
      work(i);
    });
  go = true;
  for (std::thread& thread : threads) thread.join();
}

TEST(Threads, CodePagesAreMadeOnce) {
  std::atomic<int> wrong{0};
  InThreads(4, [&](int) {
    for (UINT page : {28595u, 936u, 20866u, 65001u, 65000u, 1257u}) {
      const WCHAR text[] = {0x41, 0x416, 0};
      char bytes[16];
      WCHAR back[16];
      const int length = WideCharToMultiByte(page, 0, text, -1, bytes, 16, nullptr, nullptr);
      if (length < 1 || MultiByteToWideChar(page, 0, bytes, length, back, 16) < 1 || back[0] != 0x41) ++wrong;
    }
  });
  EXPECT_EQ(wrong, 0);
}

TEST(Threads, HandlesAndGlobalMemory) {
  test::TempFolder folder;
  std::atomic<int> wrong{0};
  InThreads(4, [&](int number) {
    const test::Text path = folder.File(WTEXT("file")) + static_cast<WCHAR>('0' + number);
    for (int round = 0; round < 50; ++round) {
      const std::string content(static_cast<std::size_t>(round), static_cast<char>('a' + number));
      if (!test::WriteAll(path, content) || test::ReadAll(path) != content) ++wrong;
      const HGLOBAL block = GlobalAlloc(GMEM_MOVEABLE, 100);
      auto* bytes = static_cast<char*>(GlobalLock(block));
      if (bytes == nullptr) {
        ++wrong;
        continue;
      }
      bytes[99] = 'x';
      GlobalUnlock(block);
      if (GlobalFree(block) != nullptr) ++wrong;
    }
  });
  EXPECT_EQ(wrong, 0);
}

TEST(Threads, ShortLockKeepsOthersOut) {
  platform::ShortLock lock;
  long count = 0;
  InThreads(4, [&](int) {
    for (int i = 0; i < 20000; ++i) {
      lock.lock();
      ++count;
      lock.unlock();
    }
  });
  EXPECT_EQ(count, 80000);
}

}  // namespace
