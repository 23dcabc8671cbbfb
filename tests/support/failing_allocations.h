// Runs an operation with the first, second, third ... allocation failing, until it needs no more.
#pragma once

#include <gtest/gtest.h>

#include <vector>

#include "qxcore/container/node_pool.h"
#include "qxcore/container/string_map.h"
#include "qxcore/core/exception.h"
#include "qxcore/core/internal/memory_failures.h"
#include "qxcore/string/string.h"

// Takes all that the pools of small blocks have in stock, and gives it back at its end: what is taken from a pool then
// needs memory of the system, which can fail.
class DrainedPools {
 public:
  DrainedPools() {
    SMemFailAt(1, true);
    for (std::size_t size = sizeof(void*); size <= kLargestNode; size += sizeof(void*)) {
      while (Take(&SNodePools::Alloc, &SNodePools::Free, size)) {
      }
    }
    while (
        Take(&SStringMapAllocator::Alloc, &SStringMapAllocator::Free, sizeof(__STree::Entry) + 2 * sizeof(SString))) {
    }
    for (int length = 1; length <= kLongestPooled; length *= 2) {
      while (TakeText(length)) {
      }
    }
    SMemFailAt(0);
  }
  DrainedPools(const DrainedPools&) = delete;
  DrainedPools& operator=(const DrainedPools&) = delete;
  ~DrainedPools() {
    for (const Taken& one : m_taken) one.free(one.block, one.size, alignof(void*));
  }

 private:
  static constexpr std::size_t kLargestNode = 128;
  static constexpr int kLongestPooled = 2048;
  using Alloc = void* (*)(std::size_t, std::size_t);
  using Free = void (*)(void*, std::size_t, std::size_t);
  struct Taken {
    Free free;
    void* block;
    std::size_t size;
  };

  bool Take(Alloc alloc, Free free, std::size_t size) try {
    m_taken.push_back({free, alloc(size, alignof(void*)), size});
    return true;
  } catch (const SEOutOfMemory&) {
    return false;
  }
  bool TakeText(int length) try {
    SString text;
    text.GetBufferSetLength(length);
    m_texts.push_back(std::move(text));
    return true;
  } catch (const SEOutOfMemory&) {
    return false;
  }

  std::vector<Taken> m_taken;
  std::vector<SString> m_texts;
};

// `operation` is run anew each time; `check` is called after each failure, with allocation working
// again. Both ways: only the n-th fails, and all from the n-th on. Gives how many runs failed.
template <class Operation, class Check>
int WithEachAllocationFailing(Operation operation, Check check) {
  int failures = 0;
  for (bool forever : {false, true}) {
    for (long n = 1;; ++n) {
      bool hasThrown = false, hasFailed;
      {
        const DrainedPools pools;
        SMemFailAt(n, forever);
        try {
          operation();
        } catch (const SEOutOfMemory&) {
          hasThrown = true;
        }
        hasFailed = SMemHasFailed();
        SMemFailAt(0);
      }
      if (!hasFailed) break;
      EXPECT_TRUE(hasThrown || !forever) << "allocation " << n << " failed for ever, and nobody said so";
      if (hasThrown) {
        ++failures;
        check();
      }
      if (n > 100000) {
        ADD_FAILURE() << "the operation never succeeds";
        break;
      }
    }
  }
  return failures;
}
