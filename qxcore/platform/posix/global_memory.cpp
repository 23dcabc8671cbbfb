// Global memory blocks. A movable block is a record that its handle points into, two bytes past the
// start, so that it can be told from a fixed block, whose handle is its address.

#include <cstdlib>
#include <cstring>
#include <mutex>
#include <new>
#include <unordered_map>

#include "qxcore/platform/win32.h"

namespace {

struct Block {
  void* data;  // null while discarded, that is, of size 0
  SIZE_T size;
  SIZE_T capacity;  // what was allocated
  unsigned locks;
  bool movable;
};

constexpr std::uintptr_t kMovableMark = 2;

// The blocks that exist, so that a stale handle is an error and no crash.
class Blocks {
 public:
  static Blocks& Instance() {
    static Blocks* blocks = new Blocks;  // outlives every static object that may hold a block
    return *blocks;
  }

  HGLOBAL Add(SIZE_T size, bool movable, bool zero) {
    void* data = nullptr;
    // A fixed block has an address, and so at least one byte.
    if (size == 0 && !movable) size = 1;
    if (size > 0) {
      data = zero ? std::calloc(size, 1) : std::malloc(size);
      if (data == nullptr) return nullptr;
    }
    const std::lock_guard lock(m_mutex);
    try {
      Block* block = new Block{data, size, size, 0, movable};
      const std::uintptr_t handle =
          movable ? reinterpret_cast<std::uintptr_t>(block) + kMovableMark : reinterpret_cast<std::uintptr_t>(data);
      try {
        m_byHandle.emplace(handle, block);
      } catch (...) {
        delete block;
        throw;
      }
      return reinterpret_cast<HGLOBAL>(handle);
    } catch (const std::bad_alloc&) {
      std::free(data);
      return nullptr;
    }
  }

  // Calls `action` with the block of a handle; returns `invalid`, with the last error set, for an unknown one.
  template <class Result, class Action>
  Result With(HGLOBAL handle, Result invalid, Action action) {
    const std::lock_guard lock(m_mutex);
    const auto found = m_byHandle.find(reinterpret_cast<std::uintptr_t>(handle));
    if (found == m_byHandle.end()) {
      SetLastError(ERROR_INVALID_HANDLE);
      return invalid;
    }
    return action(*found->second);
  }

  bool Remove(HGLOBAL handle) {
    const std::lock_guard lock(m_mutex);
    const auto found = m_byHandle.find(reinterpret_cast<std::uintptr_t>(handle));
    if (found == m_byHandle.end()) {
      SetLastError(ERROR_INVALID_HANDLE);
      return false;
    }
    std::free(found->second->data);
    delete found->second;
    m_byHandle.erase(found);
    return true;
  }

 private:
  std::mutex m_mutex;
  std::unordered_map<std::uintptr_t, Block*> m_byHandle;
};

// False when there is no memory; the block then stays as it was.
bool Resize(Block& block, SIZE_T size, bool zero) {
  if (size == 0) {
    std::free(block.data);
    block.data = nullptr;
  } else {
    void* data = std::realloc(block.data, size);
    if (data == nullptr) return false;
    if (zero && size > block.size) std::memset(static_cast<char*>(data) + block.size, 0, size - block.size);
    block.data = data;
  }
  block.size = block.capacity = size;
  return true;
}

}  // namespace

HGLOBAL GlobalAlloc(UINT flags, SIZE_T size) {
  const HGLOBAL block = Blocks::Instance().Add(size, (flags & GMEM_MOVEABLE) != 0, (flags & GMEM_ZEROINIT) != 0);
  if (block == nullptr) SetLastError(ERROR_NOT_ENOUGH_MEMORY);
  return block;
}

// A locked or fixed block is moved only with GMEM_MOVEABLE among the flags; here that means that it
// cannot change its size without, since nothing says whether it could grow where it is. A fixed
// block keeps its address, which is its handle, and can only shrink.
HGLOBAL GlobalReAlloc(HGLOBAL handle, SIZE_T size, UINT flags) {
  if ((flags & GMEM_MODIFY) != 0) {
    SetLastError(ERROR_INVALID_PARAMETER);
    return nullptr;
  }
  return Blocks::Instance().With<HGLOBAL>(handle, nullptr, [&](Block& block) -> HGLOBAL {
    // Who holds the address of a locked block would be left with nothing.
    if (block.movable && block.locks > 0 && size == 0) return nullptr;
    const bool mayMove = block.movable && (block.locks == 0 || (flags & GMEM_MOVEABLE) != 0);
    if (!mayMove) {
      if (size > block.capacity) {
        SetLastError(ERROR_NOT_ENOUGH_MEMORY);
        return nullptr;
      }
      block.size = size;
      return handle;
    }
    if (!Resize(block, size, (flags & GMEM_ZEROINIT) != 0)) {
      SetLastError(ERROR_NOT_ENOUGH_MEMORY);
      return nullptr;
    }
    return handle;
  });
}

LPVOID GlobalLock(HGLOBAL handle) {
  return Blocks::Instance().With<LPVOID>(handle, nullptr, [](Block& block) -> LPVOID {
    if (block.data == nullptr) {
      SetLastError(ERROR_DISCARDED);
      return nullptr;
    }
    if (block.movable && block.locks < GMEM_LOCKCOUNT) ++block.locks;
    return block.data;
  });
}

BOOL GlobalUnlock(HGLOBAL handle) {
  return Blocks::Instance().With<BOOL>(handle, FALSE, [](Block& block) -> BOOL {
    if (!block.movable) return TRUE;
    if (block.locks == 0) {
      SetLastError(ERROR_NOT_LOCKED);
      return FALSE;
    }
    if (--block.locks > 0) return TRUE;
    SetLastError(NO_ERROR);
    return FALSE;
  });
}

SIZE_T GlobalSize(HGLOBAL handle) {
  return Blocks::Instance().With<SIZE_T>(handle, 0, [](Block& block) { return block.size; });
}

UINT GlobalFlags(HGLOBAL handle) {
  return Blocks::Instance().With<UINT>(handle, GMEM_INVALID_HANDLE, [](Block& block) -> UINT {
    return block.locks | (block.movable && block.data == nullptr ? GMEM_DISCARDED : 0);
  });
}

HGLOBAL GlobalFree(HGLOBAL handle) {
  if (handle == nullptr) return nullptr;
  return Blocks::Instance().Remove(handle) ? nullptr : handle;
}
