// Where tests make the library's memory fail.
#pragma once

#include "qxcore/platform/export.h"

// For memory that must come from elsewhere (the platform's global memory): true when that allocation is
// to fail by an order of SMemFailAt; counts like an allocation.
QXCORE_API bool SMemMustFail() noexcept;

// Fault injection for tests: the n-th allocation from now on (n = 1 is the next one) fails; with
// forever set, all later ones fail, too. n = 0 switches failing off. Process-wide.
QXCORE_API void SMemFailAt(long n, bool forever = false) noexcept;

// True when a failure ordered by SMemFailAt has happened since the order.
QXCORE_API bool SMemHasFailed() noexcept;
