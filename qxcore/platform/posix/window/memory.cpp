#include "qxcore/platform/posix/window/memory.h"

#include "qxcore/core/memory.h"

namespace platform::model {

void* Allocate(std::size_t size) {
  void* block = SMemTryAlloc(size);
  if (block == nullptr) throw std::bad_alloc();
  return block;
}

void Release(void* block) noexcept { SMemFree(block); }

}  // namespace platform::model
