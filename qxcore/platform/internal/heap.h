// The heap under the library's memory: the C runtime's, with large blocks apart where that one is slow with them.
#pragma once

#include <cstddef>
#include <cstdlib>

#ifdef _WIN32
#include "qxcore/platform/windows/large_memory.h"
#endif

namespace platform {

// Takes at least one byte, aligned for any fundamental type; null without memory.
inline void* AllocateMemory(std::size_t size) noexcept {
#ifdef _WIN32
  return AllocateApart(size);
#else
  return std::malloc(size);
#endif
}

// Resizes a block, which may be null, to at least one byte; keeps its content up to the smaller size. Null without
// memory: then the old block is as it was.
inline void* ResizeMemory(void* block, std::size_t size) noexcept {
#ifdef _WIN32
  return ResizeApart(block, size);
#else
  return std::realloc(block, size);
#endif
}

// Frees a block, which may be null.
inline void FreeMemory(void* block) noexcept {
#ifdef _WIN32
  FreeApart(block);
#else
  std::free(block);
#endif
}

}  // namespace platform
