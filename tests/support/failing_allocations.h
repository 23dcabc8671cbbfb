// Runs an operation with the first, second, third ... allocation failing, until it needs no more.
#pragma once

#include <gtest/gtest.h>

#include "qxcore/core/exception.h"
#include "qxcore/core/internal/memory_failures.h"

// `operation` is run anew each time; `check` is called after each failure, with allocation working
// again. Both ways: only the n-th fails, and all from the n-th on. Gives how many runs failed.
template <class Operation, class Check>
int WithEachAllocationFailing(Operation operation, Check check) {
  int failures = 0;
  for (bool forever : {false, true}) {
    for (long n = 1;; ++n) {
      bool hasThrown = false;
      SMemFailAt(n, forever);
      try {
        operation();
      } catch (const SEOutOfMemory&) {
        hasThrown = true;
      }
      bool hasFailed = SMemHasFailed();
      SMemFailAt(0);
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
