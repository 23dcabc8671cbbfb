// The heap under the library's memory. All functions may be called by several threads.
#pragma once

#include <cstddef>

namespace platform {

// Takes at least one byte, aligned for any fundamental type; null without memory.
void* AllocateMemory(std::size_t size) noexcept;

// Resizes a block, which may be null, to at least one byte; keeps its content up to the smaller size. Null without
// memory: then the old block is as it was.
void* ResizeMemory(void* block, std::size_t size) noexcept;

// Frees a block, which may be null.
void FreeMemory(void* block) noexcept;

}  // namespace platform
