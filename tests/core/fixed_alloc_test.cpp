// Fixed-size allocators: order, trimming, statistics, memory running out, several threads.

#include "qxcore/core/fixed_alloc.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cstring>
#include <map>
#include <random>
#include <set>
#include <string>
#include <thread>
#include <vector>

#include "qxcore/core/debug_counter.h"
#include "qxcore/core/exception.h"
#include "qxcore/core/internal/memory_failures.h"

namespace {

std::vector<char*> AllocMany(SFixedAlloc& alloc, int count) {
  std::vector<char*> elements;
  for (int i = 0; i < count; ++i) elements.push_back(static_cast<char*>(alloc.Alloc()));
  return elements;
}

TEST(FixedAlloc, Alloc_GivesABlockFromItsLowestElementUp) {
  SFixedAlloc alloc(24, 4, nullptr, nullptr);
  auto elements = AllocMany(alloc, 4);
  for (int i = 1; i < 4; ++i) EXPECT_EQ(elements[i], elements[0] + 24 * i);
  alloc.Free(elements[2]);
  alloc.Free(elements[0]);
  EXPECT_EQ(alloc.Alloc(), elements[0]) << "the element freed last comes first";
  EXPECT_EQ(alloc.Alloc(), elements[2]);
}

TEST(FixedAlloc, ElementsPerBlock_FollowThePageSize) {
  auto perBlock = [](unsigned size) { return SFixedAlloc(size, 0, nullptr, nullptr).GetElementsPerBlock(); };
  SYSTEM_INFO system;
  GetSystemInfo(&system);
  ASSERT_EQ(system.dwPageSize, 4096u);
  ASSERT_EQ(system.dwAllocationGranularity, 65536u);
  EXPECT_EQ(perBlock(48), 85u);
  EXPECT_EQ(perBlock(240), 17u);
  EXPECT_EQ(perBlock(241), 135u) << "half of the granularity";
  EXPECT_EQ(perBlock(3855), 8u);
  EXPECT_EQ(perBlock(40000), 4u);
  EXPECT_EQ(perBlock(5000), 0u);
  EXPECT_THROW(SFixedAlloc(5000, 0, nullptr, nullptr).Alloc(), SEOutOfMemory);
}

TEST(FixedAlloc, FreeUnused_ReleasesWholeBlocksOnly) {
  SFixedAlloc alloc(32, 8, WTEXT("trimmed"), nullptr);
  long total = SFixedAlloc::GetTotalBytes();
  std::int32_t blockBytes = 32 * 8 + static_cast<std::int32_t>(sizeof(void*));
  auto elements = AllocMany(alloc, 24);
  EXPECT_EQ(alloc.GetBytes(), 3 * blockBytes);
  EXPECT_EQ(SFixedAlloc::GetTotalBytes(), total + 3 * blockBytes);
  EXPECT_EQ(alloc.FreeUnused(), 0) << "nothing was freed";
  for (int i = 8; i < 16; ++i) alloc.Free(elements[i]);
  alloc.Free(elements[0]);
  std::memset(elements[1], 0x5A, 7 * 32);
  EXPECT_EQ(alloc.FreeUnused(), 1);
  EXPECT_EQ(alloc.FreeUnused(), 0);
  EXPECT_EQ(alloc.GetElementsInUse(), 15);
  EXPECT_EQ(alloc.GetBytes(), 2 * blockBytes);
  EXPECT_TRUE(std::all_of(elements[1], elements[8 - 1] + 32, [](char c) { return c == 0x5A; }));
  EXPECT_EQ(alloc.Alloc(), elements[0]) << "what stayed free can be had again";
  EXPECT_EQ(alloc.FreeAll(), 2);
  EXPECT_EQ(alloc.GetBytes(), 0);
  EXPECT_EQ(SFixedAlloc::GetTotalBytes(), total);
}

TEST(FixedAlloc, RandomUse_GivesDistinctElementsAndReturnsEverything) {
  std::mt19937 random(11);
  for (unsigned size : {1u, 8u, 13u, 48u}) {
    SFixedAlloc alloc(size, 1 + random() % 40, WTEXT("random"), nullptr);
    std::map<char*, char> used;  // element, the byte it is filled with
    for (int step = 0; step < 20000; ++step) {
      if (used.empty() || random() % 100 < (step / 2000 % 2 == 0 ? 60u : 40u)) {
        auto* element = static_cast<char*>(alloc.Alloc());
        char fill = static_cast<char>(random());
        std::memset(element, fill, alloc.GetAllocSize());
        auto [place, isNew] = used.emplace(element, fill);
        ASSERT_TRUE(isNew);
        if (auto next = std::next(place); next != used.end()) {
          ASSERT_GE(next->first - element, static_cast<long>(alloc.GetAllocSize()));
        }
      } else {
        auto place = std::next(used.begin(), static_cast<long>(random() % std::min<std::size_t>(used.size(), 50)));
        for (unsigned i = 0; i < alloc.GetAllocSize(); ++i) ASSERT_EQ(place->first[i], place->second);
        alloc.Free(place->first);
        used.erase(place);
      }
      if (random() % 500 == 0) {
        alloc.FreeUnused();
        ASSERT_EQ(alloc.GetElementsInUse(), static_cast<int>(used.size()));
      }
    }
    for (auto& [element, fill] : used) alloc.Free(element);
    alloc.FreeUnused();
    EXPECT_EQ(alloc.GetBytes(), 0) << "size " << size;
  }
}

TEST(FixedAlloc, FreeAll_ForgetsTheFreeElementsToo) {
  SFixedAlloc alloc(32, 4, WTEXT("all"), nullptr);
  for (int round = 0; round < 3; ++round) {
    auto elements = AllocMany(alloc, 9);
    alloc.Free(elements[8]);
    alloc.Free(elements[2]);
    EXPECT_EQ(alloc.FreeAll(), 3);
    EXPECT_EQ(alloc.GetElementsInUse(), 0);
    EXPECT_EQ(alloc.FreeUnused(), 0) << "what was freed before is gone";
    const std::set<char*> fresh = [&] {
      auto again = AllocMany(alloc, 8);
      for (char* element : again) std::memset(element, round, 32);
      return std::set<char*>(again.begin(), again.end());
    }();
    EXPECT_EQ(fresh.size(), 8u);
    EXPECT_EQ(alloc.GetBytes(), 2 * (32 * 4 + static_cast<std::int32_t>(sizeof(void*))));
    alloc.FreeAll();
  }
}

TEST(FixedAlloc, OnIdle_WaitsForABlockfulUnlessTold) {
  SFixedAlloc alloc(16, 4, WTEXT("idle"), nullptr);
  auto elements = AllocMany(alloc, 8);
  for (int i = 0; i < 3; ++i) alloc.Free(elements[i]);
  EXPECT_EQ(alloc.OnIdle(0), 0);
  alloc.Free(elements[4]);
  std::int32_t full = alloc.GetBytes();
  EXPECT_EQ(alloc.OnIdle(0), 0);  // four frees, but in two blocks
  EXPECT_EQ(alloc.GetBytes(), full);
  alloc.Free(elements[3]);
  EXPECT_EQ(alloc.OnIdle(0), 0);
  EXPECT_EQ(alloc.GetBytes(), full) << "one free since that trim is not enough";
  EXPECT_EQ(alloc.OnIdle(1), 0);
  EXPECT_EQ(alloc.GetBytes(), full / 2);
}

TEST(FixedAlloc, Lists_NullIsCommonAndTheObjectAllocatorsHaveTheirOwn) {
  SIdleConsumerList list;
  SIdleConsumerList* common = SIdleConsumerList::Common();
  int commonCount = common->GetCount();
  int queueCount = SObjectFixedAllocatorBase::IdleQueue()->GetCount();
  {
    SFixedAlloc a(16, 4, nullptr, nullptr), b(16, 4, nullptr, &list), c(b);
    SObjectFixedAllocatorBase d(16, 4, nullptr, nullptr), e(16, 4, nullptr, &list), f(d);
    EXPECT_EQ(common->GetCount(), commonCount + 1);
    EXPECT_EQ(list.GetCount(), 3);
    EXPECT_EQ(SObjectFixedAllocatorBase::IdleQueue()->GetCount(), queueCount + 2);
  }
  EXPECT_EQ(common->GetCount(), commonCount);
  EXPECT_EQ(list.GetCount(), 0);
}

std::map<std::basic_string<WCHAR>, std::int32_t> Counters() {
  std::map<std::basic_string<WCHAR>, std::int32_t> counters;
  SDbgForEachCounter(
      [](const WCHAR* name, const WCHAR* unit, std::int32_t value, void* context) {
        std::basic_string<WCHAR> key(name);
        (*static_cast<decltype(counters)*>(context))[key.append(WTEXT("/")).append(unit)] = value;
      },
      &counters);
  return counters;
}

TEST(FixedAlloc, Statistics_AreDebugCountersOfNamedAllocators) {
  SFixedAlloc unnamed(16, 4, nullptr, nullptr);
  unnamed.Alloc();
  EXPECT_EQ(unnamed.GetBytes(), -1);
  {
    SFixedAlloc named(16, 4, WTEXT("counted"), nullptr);
    SFixedAlloc copy(named);
    EXPECT_EQ(copy.GetBytes(), -1);
    EXPECT_EQ(copy.GetAllocSize(), 16u);
    named.Alloc();
    EXPECT_EQ(Counters().at(WTEXT("counted/elements")), 1);
    EXPECT_EQ(Counters().at(WTEXT("counted/bytes")), named.GetBytes());
  }
  EXPECT_EQ(Counters().count(WTEXT("counted/bytes")), 0u);
}

TEST(FixedAlloc, OutOfMemory_LeavesTheAllocatorUsable) {
  SFixedAlloc alloc(16, 4, WTEXT("short"), nullptr);
  auto elements = AllocMany(alloc, 4);
  SMemFailAt(1, true);
  EXPECT_THROW(alloc.Alloc(), SEOutOfMemory);
  EXPECT_EQ(alloc.GetElementsInUse(), 4);
  for (char* element : elements) alloc.Free(element);
  EXPECT_EQ(alloc.FreeUnused(), 1) << "a trim takes no memory";
  SMemFailAt(0);
  EXPECT_NE(alloc.Alloc(), nullptr);
  EXPECT_THROW(SFixedAlloc(1u << 20, 1u << 20, nullptr, nullptr).Alloc(), SEOutOfMemory) << "no overflow";
}

TEST(FixedAlloc, Threads_ShareOneAllocator) {
  SFixedAlloc alloc(sizeof(int) * 4, 16, WTEXT("threads"), nullptr);
  auto work = [&alloc](int id) {
    std::mt19937 random(static_cast<unsigned>(id));
    std::vector<int*> mine;
    for (int step = 0; step < 20000; ++step) {
      if (mine.empty() || random() % 2 == 0) {
        mine.push_back(static_cast<int*>(alloc.Alloc()));
        std::fill_n(mine.back(), 4, id);
      } else {
        std::swap(mine[random() % mine.size()], mine.back());
        ASSERT_EQ(std::count(mine.back(), mine.back() + 4, id), 4);
        alloc.Free(mine.back());
        mine.pop_back();
      }
      if (step % 1000 == 999) alloc.FreeUnused();
    }
    for (int* element : mine) alloc.Free(element);
  };
  std::vector<std::thread> threads;
  for (int id = 1; id <= 4; ++id) threads.emplace_back(work, id);
  for (std::thread& thread : threads) thread.join();
  EXPECT_EQ(alloc.GetElementsInUse(), 0);
  alloc.FreeUnused();
  EXPECT_EQ(alloc.GetBytes(), 0);
}

}  // namespace
