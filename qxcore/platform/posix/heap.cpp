#include "qxcore/platform/internal/heap.h"

#include <cstdlib>

namespace platform {

void* AllocateMemory(std::size_t size) noexcept { return std::malloc(size); }
void* ResizeMemory(void* block, std::size_t size) noexcept { return std::realloc(block, size); }
void FreeMemory(void* block) noexcept { std::free(block); }

}  // namespace platform
