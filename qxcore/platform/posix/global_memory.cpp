// Global memory blocks. A movable block is a record that its handle points into, two bytes past the
// start, so that it differs from a fixed block, whose handle is its address.

#include <cstdlib>
#include <cstring>
#include <memory>
#include <mutex>
#include <new>
#include <unordered_map>

#include "qxcore/platform/posix/failure.h"

namespace {

using platform::FailWith;

struct Block {
  Block() = default;
  Block(const Block&) = delete;
  Block& operator=(const Block&) = delete;
  ~Block() { std::free(data); }

  void* data = nullptr;  // null while discarded, that is, of size 0
  SIZE_T size = 0;
  SIZE_T capacity = 0;  // what was allocated
  unsigned locks = 0;
  bool movable = false;
};

constexpr std::uintptr_t kMovableMark = 2;

// The blocks that exist, so that a stale handle is an error and no crash.
class Blocks {
 public:
  static Blocks& Instance() {
    static Blocks* blocks = new Blocks;  // outlives every static object that may hold a block
    return *blocks;
  }

  // Throws when memory is out.
  HGLOBAL Add(SIZE_T size, bool movable, bool zero) {
    // A fixed block has an address, and so at least one byte.
    if (size == 0 && !movable) size = 1;
    auto block = std::make_unique<Block>();
    if (size > 0) block->data = zero ? std::calloc(size, 1) : std::malloc(size);
    if (size > 0 && block->data == nullptr) throw std::bad_alloc();
    block->size = block->capacity = size;
    block->movable = movable;
    const std::uintptr_t handle = movable ? reinterpret_cast<std::uintptr_t>(block.get()) + kMovableMark
                                          : reinterpret_cast<std::uintptr_t>(block->data);
    const std::lock_guard lock(m_mutex);
    m_byHandle.emplace(handle, std::move(block));
    return reinterpret_cast<HGLOBAL>(handle);
  }

  // Calls `action` with the block of a handle; returns `invalid`, with the last error set, for an unknown one.
  template <class Result, class Action>
  Result With(HGLOBAL handle, Result invalid, Action action) {
    const std::lock_guard lock(m_mutex);
    const auto found = m_byHandle.find(reinterpret_cast<std::uintptr_t>(handle));
    if (found == m_byHandle.end()) return FailWith(ERROR_INVALID_HANDLE, invalid);
    return action(*found->second);
  }

  bool Remove(HGLOBAL handle) {
    const std::lock_guard lock(m_mutex);
    const bool isKnown = m_byHandle.erase(reinterpret_cast<std::uintptr_t>(handle)) != 0;
    return isKnown || FailWith(ERROR_INVALID_HANDLE, false);
  }

 private:
  std::mutex m_mutex;
  std::unordered_map<std::uintptr_t, std::unique_ptr<Block>> m_byHandle;
};

// False when there is no memory; the block then stays as it was.
bool Reserve(Block& block, SIZE_T capacity) {
  void* data = std::realloc(block.data, capacity);
  if (data == nullptr) return false;
  block.data = data;
  block.capacity = capacity;
  return true;
}

// The same. What grows once will grow again: programs add a little at a time.
bool Resize(Block& block, SIZE_T size, bool zero) {
  if (size == 0) {
    std::free(block.data);
    block.data = nullptr;
    block.capacity = 0;
  } else if (size > block.capacity) {
    const SIZE_T spare = block.capacity / 4;
    if (!(size < block.capacity + spare && Reserve(block, block.capacity + spare)) && !Reserve(block, size))
      return false;
  } else if (size < block.size && !Reserve(block, size)) {
    return false;
  }
  if (zero && size > block.size) std::memset(static_cast<char*>(block.data) + block.size, 0, size - block.size);
  block.size = size;
  return true;
}

}  // namespace

HGLOBAL GlobalAlloc(UINT flags, SIZE_T size) {
  return platform::Guarded<HGLOBAL>(nullptr, [&] {
    return Blocks::Instance().Add(size, (flags & GMEM_MOVEABLE) != 0, (flags & GMEM_ZEROINIT) != 0);
  });
}

// A locked or fixed block is moved only with GMEM_MOVEABLE among the flags; here that means that it
// cannot change its size without, since nothing says whether it could grow where it is. A fixed
// block keeps its address, which is its handle, and can only shrink.
HGLOBAL GlobalReAlloc(HGLOBAL handle, SIZE_T size, UINT flags) {
  if ((flags & GMEM_MODIFY) != 0) return FailWith<HGLOBAL>(ERROR_INVALID_PARAMETER);
  return Blocks::Instance().With<HGLOBAL>(handle, nullptr, [&](Block& block) -> HGLOBAL {
    // Who holds the address of a locked block would be left with nothing.
    if (block.movable && block.locks > 0 && size == 0) return nullptr;
    const bool mayMove = block.movable && (block.locks == 0 || (flags & GMEM_MOVEABLE) != 0);
    if (!mayMove) {
      if (size > block.capacity) return FailWith<HGLOBAL>(ERROR_NOT_ENOUGH_MEMORY);
      block.size = size;
      return handle;
    }
    return Resize(block, size, (flags & GMEM_ZEROINIT) != 0) ? handle : FailWith<HGLOBAL>(ERROR_NOT_ENOUGH_MEMORY);
  });
}

LPVOID GlobalLock(HGLOBAL handle) {
  return Blocks::Instance().With<LPVOID>(handle, nullptr, [](Block& block) -> LPVOID {
    if (block.data == nullptr) return FailWith<LPVOID>(ERROR_DISCARDED);
    if (block.movable && block.locks < GMEM_LOCKCOUNT) ++block.locks;
    return block.data;
  });
}

BOOL GlobalUnlock(HGLOBAL handle) {
  return Blocks::Instance().With<BOOL>(handle, FALSE, [](Block& block) -> BOOL {
    if (!block.movable) return TRUE;
    if (block.locks == 0) return FailWith(ERROR_NOT_LOCKED);
    return --block.locks > 0 ? TRUE : FailWith(NO_ERROR);  // as published: the last unlock returns FALSE, too
  });
}

SIZE_T GlobalSize(HGLOBAL handle) {
  return Blocks::Instance().With<SIZE_T>(handle, 0, [](Block& block) { return block.size; });
}

HGLOBAL GlobalFree(HGLOBAL handle) {
  if (handle == nullptr) return nullptr;
  return Blocks::Instance().Remove(handle) ? nullptr : handle;
}
