// The one place where the library takes memory.
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

// Frees a block; null is ignored.
QXCORE_API void SMemFree(void* block) noexcept;
