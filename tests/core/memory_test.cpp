// The library's memory, the figures it keeps for diagnostics, and the reporter of failures nobody is told of.

#include "qxcore/core/memory.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cmath>
#include <map>
#include <random>
#include <string>
#include <thread>
#include <utility>
#include <vector>

#include "qxcore/core/assert_valid.h"
#include "qxcore/core/debug_counter.h"
#include "qxcore/core/exception.h"
#include "qxcore/core/internal/memory_failures.h"
#include "qxcore/core/raise_error.h"

namespace {

TEST(Memory, ResizingKeepsTheContentAndAFailureTheBlock) {
  auto* block = static_cast<char*>(SMemRealloc(nullptr, 10));
  std::fill_n(block, 10, 'x');
  for (std::size_t size = 10; size < 100000; size = size * 3 / 2) {
    SMemFailAt(1, true);
    EXPECT_THROW(SMemRealloc(block, size * 2), SEOutOfMemory);
    EXPECT_EQ(SMemTryAlloc(size), nullptr);
    SMemFailAt(0);
    block = static_cast<char*>(SMemRealloc(block, size));
    EXPECT_EQ(std::count(block, block + 10, 'x'), 10);
  }
  block = static_cast<char*>(SMemRealloc(block, 0));
  EXPECT_NE(block, nullptr) << "a block of nothing is one all the same";
  SMemFree(block);
  void* const nothing = SMemTryAlloc(0);
  EXPECT_NE(nothing, nullptr);
  SMemFree(nothing);
}

// A block with a stamp in every page of it, which no other block has.
class StampedBlock {
 public:
  StampedBlock(std::size_t size, unsigned stamp)
      : m_bytes(static_cast<char*>(SMemAlloc(size))), m_size(size), m_stamp(stamp) {
    StampFrom(0);
  }
  StampedBlock(StampedBlock&& other) noexcept
      : m_bytes(std::exchange(other.m_bytes, nullptr)), m_size(other.m_size), m_stamp(other.m_stamp) {}
  StampedBlock& operator=(StampedBlock&& other) noexcept {
    std::swap(m_bytes, other.m_bytes);
    std::swap(m_size, other.m_size);
    std::swap(m_stamp, other.m_stamp);
    return *this;
  }
  ~StampedBlock() { SMemFree(m_bytes); }

  void Resize(std::size_t size) {
    m_bytes = static_cast<char*>(SMemRealloc(m_bytes, size));
    const std::size_t before = std::exchange(m_size, size);
    EXPECT_EQ(FirstWrong(std::min(before, size)), -1) << before << " to " << size;
    StampFrom(std::min(before, size) / kPage * kPage);
  }
  void Check() const { EXPECT_EQ(FirstWrong(m_size), -1) << m_size; }

 private:
  static constexpr std::size_t kPage = 4096;

  char Expected(std::size_t at) const { return static_cast<char>(m_stamp * 31 + at / kPage * 7); }
  void StampFrom(std::size_t at) {
    for (; at < m_size; at += kPage) m_bytes[at] = Expected(at);
  }
  long FirstWrong(std::size_t size) const {
    for (std::size_t at = 0; at < size; at += kPage) {
      if (m_bytes[at] != Expected(at)) return static_cast<long>(at);
    }
    return -1;
  }

  char* m_bytes;
  std::size_t m_size;
  unsigned m_stamp;
};

// From a byte to 16 MB, as often small as large.
std::size_t AnySize(std::mt19937& random) {
  return static_cast<std::size_t>(std::exp2(std::uniform_real_distribution<>(0, 24)(random)));
}

TEST(Memory, BlocksOfAllSizesKeepTheirContentInAllThreads) {
  const auto work = [](unsigned seed) {
    std::mt19937 random(seed);
    std::vector<StampedBlock> blocks;
    for (unsigned step = 0; step < 2000; ++step) {
      const std::size_t at = blocks.empty() ? 0 : random() % blocks.size();
      switch (random() % 3) {
        case 0:
          if (blocks.size() < 12) blocks.emplace_back(AnySize(random), step);
          break;
        case 1:
          if (!blocks.empty()) blocks[at].Resize(AnySize(random));
          break;
        default:
          if (blocks.empty()) break;
          blocks[at].Check();
          blocks[at] = std::move(blocks.back());
          blocks.pop_back();
      }
    }
    for (const StampedBlock& block : blocks) block.Check();
  };
  std::vector<std::thread> threads;
  for (unsigned seed = 1; seed <= 3; ++seed) threads.emplace_back(work, seed);
  for (std::thread& thread : threads) thread.join();
}

TEST(Memory, LargeBlocksComeAndGoWithoutEnd) {
  // All of them together are larger than the address space of a 32-bit process, and so is what those that stay
  // would hold if each kept the place of one that went.
  std::vector<StampedBlock> stay;
  for (unsigned round = 0; round < 200; ++round) {
    {
      StampedBlock goes(100000, round);
      for (std::size_t size = 150000; size < 24'000'000; size = size * 3 / 2) goes.Resize(size);
    }
    stay.emplace_back(100000, round);
    stay.back().Resize(300000);
  }
  for (const StampedBlock& block : stay) block.Check();
  for (StampedBlock& block : stay) block.Resize(1);
  for (unsigned round = 0; round < 30; ++round) StampedBlock(std::size_t{100} << 20, round).Resize(1000);
}

using Figures = std::multimap<std::basic_string<WCHAR>, std::int32_t>;

Figures AllFigures() {
  Figures figures;
  const int count = SDbgForEachCounter([](const WCHAR* name, const WCHAR*, std::int32_t value,
                                          void* context) { static_cast<Figures*>(context)->emplace(name, value); },
                                       &figures);
  EXPECT_EQ(static_cast<std::size_t>(count), figures.size());
  return figures;
}

TEST(DebugCounters, AreWalkedWhileTheyAreRegistered) {
  const Figures before = AllFigures();
  std::int32_t first = 3, second = 5, never = 7;
  std::basic_string<WCHAR> name = WTEXT("of a test");
  EXPECT_EQ(SDbgAddCounter(name.c_str(), WTEXT("pieces"), &first), 1);
  EXPECT_EQ(SDbgAddCounter(name.c_str(), WTEXT("pieces"), &second), 1);
  name = WTEXT("the name was copied");
  first = 4;
  SMemFailAt(1, true);
  EXPECT_EQ(SDbgAddCounter(WTEXT("without memory"), WTEXT("pieces"), &never), 0);
  SMemFailAt(0);
  EXPECT_EQ(AllFigures().size(), before.size() + 2);
  EXPECT_EQ(AllFigures().lower_bound(WTEXT("of a test"))->second, 4);
  SDbgRemoveCounter(&never);
  SDbgRemoveCounter(&first);
  EXPECT_EQ(AllFigures().lower_bound(WTEXT("of a test"))->second, 5);
  SDbgRemoveCounter(&second);
  EXPECT_EQ(AllFigures(), before);
}

std::basic_string<WCHAR> g_reported;

TEST(ErrorReporter, GetsTheTextAndItsExceptionsEndThere) {
  const SErrorReporter before = g_SetErrorReporter(nullptr);
  g_RaiseError(WTEXT("nobody hears it"));
  EXPECT_EQ(g_SetErrorReporter([](const WCHAR* text) { g_reported = text; }), nullptr);
  g_RaiseError(WTEXT("failed: 100 %s"));
  EXPECT_EQ(g_reported, WTEXT("failed: 100 %s"));
  g_RaiseError(nullptr);
  EXPECT_EQ(g_reported, WTEXT(""));
  g_SetErrorReporter([](const WCHAR*) { throw SEOutOfMemory(); });
  g_RaiseError(WTEXT("x"));
  g_SetErrorReporter(before);
}

// Modules link to them; whatever they are given, they look at nothing.
TEST(AssertValid, IsCompiledOut) {
  int flag = 3;
  const void* const bad = reinterpret_cast<const void*>(std::uintptr_t{8});
  EXPECT_EQ(SAssertValidObject(static_cast<const SObject*>(bad), "file", 1, &flag), 1);
  EXPECT_EQ(SAssertValidObjectPtr(bad, nullptr, 0), 1);
  EXPECT_EQ(SAssertValidInterface(static_cast<const IUnknown*>(bad), "file", 1, &flag), 1);
  EXPECT_EQ(SAssertValidVirtual(nullptr, "file", 1), 1);
  EXPECT_EQ(flag, 3);
}

}  // namespace
