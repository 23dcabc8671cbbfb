// The one place where the library takes memory, and where tests make it fail.
//
// Every block that the library allocates for itself comes from here, so that a failure always
// becomes SEOutOfMemory and every path behind a failure can be tested. Safe for several threads.
#pragma once

#include <cstddef>

#include "qxcore/platform/export.h"

// Takes size bytes (0 counts as 1), aligned for any fundamental type. Throws SEOutOfMemory; never
// returns null. Release with SMemFree.
QXCORE_API void* SMemAlloc(std::size_t size);

// The same, but returns null on failure.
QXCORE_API void* SMemTryAlloc(std::size_t size) noexcept;

// Resizes a block, keeping its content up to the smaller size. Throws SEOutOfMemory and leaves the
// old block as it was. A null block is allocated.
QXCORE_API void* SMemRealloc(void* block, std::size_t size);

// Gives a block back; null is ignored.
QXCORE_API void SMemFree(void* block) noexcept;

// For memory that must come from elsewhere (the platform's global memory): true when that allocation is
// to fail by an order of SMemFailAt; counts like an allocation.
QXCORE_API bool SMemMustFail() noexcept;

// Fault injection for tests: the n-th allocation from now on (n = 1 is the next one) fails; with
// forever set, all later ones fail, too. n = 0 switches failing off. Process-wide.
QXCORE_API void SMemFailAt(long n, bool forever = false) noexcept;

// True when a failure ordered by SMemFailAt has happened since the order.
QXCORE_API bool SMemHasFailed() noexcept;
