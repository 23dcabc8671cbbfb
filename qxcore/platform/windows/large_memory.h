// Memory in which large blocks live apart from the C runtime's heap.
//
// That heap copies a large block whenever it grows, and gives each back to the system at once, so that every page of
// the next one is made and cleared anew, which takes longer than to fill it. Here a large block is a region of the
// address space of its own; it grows where it stands as long as the addresses behind it are free. Regions that were
// freed are kept for the next blocks: at most 32 MB that nobody uses, as much as the heap of other systems holds back.
// They are given back when memory runs short. All functions may be called by several threads.
#pragma once

#include <cstddef>

namespace platform {

// What AllocateMemory, ResizeMemory and FreeMemory promise.
void* AllocateApart(std::size_t size) noexcept;
void* ResizeApart(void* block, std::size_t size) noexcept;
void FreeApart(void* block) noexcept;

}  // namespace platform
