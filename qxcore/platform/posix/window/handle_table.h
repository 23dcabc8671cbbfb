// The handles of windows, menus and the like: a generation and a slot, so that a stale handle is an error
// and never somebody else's object. And the one lock of the window model.
//
// Invariants:
// 1. The lock guards the handle table, the tree, the queues and all that hangs on them. It is never held while
//    a procedure, a hook, a painting or a display function runs.
// 2. A slot that belongs to a thread is given back by that thread alone. So a thread finds its own windows
//    without the lock.
#pragma once

#include <atomic>
#include <mutex>

#include "qxcore/platform/posix/window/memory.h"

namespace platform::model {

struct Thread;
struct Window;

extern std::mutex g_lock;
class Guard {
 public:
  Guard() { g_lock.lock(); }
  ~Guard() { g_lock.unlock(); }
  Guard(const Guard&) = delete;
  Guard& operator=(const Guard&) = delete;
};

// Gives the lock back for a scope in which functions of the program run.
class Unguarded {
 public:
  Unguarded() { g_lock.unlock(); }
  ~Unguarded() { g_lock.lock(); }
  Unguarded(const Unguarded&) = delete;
  Unguarded& operator=(const Unguarded&) = delete;
};

enum class Kind : BYTE { Free, Window, Menu, Accelerators, Hook, Batch, Cursor };

// A place in the table. Slots stand in chunks that never move.
struct Slot {
  std::atomic<Thread*> thread{nullptr};
  std::atomic<std::uint32_t> handle{0};  // of the object that is in it; 0 while it is free
  void* object = nullptr;
  Kind kind = Kind::Free;
  std::uint16_t generation = 0;
  std::uint32_t nextFree = 0;
};
constexpr std::uint32_t kChunk = 1024;
constexpr std::uint32_t kChunks = 64;  // a slot's number has sixteen bits
extern std::atomic<Slot*> g_chunks[kChunks];

inline Slot* SlotAt(std::uint32_t number) {
  Slot* chunk = g_chunks[number / kChunk].load(std::memory_order_acquire);
  return chunk != nullptr ? &chunk[number % kChunk] : nullptr;
}
// The slot that a handle names, whatever is in it now; null for a value that is no handle.
inline Slot* SlotNamedBy(const void* handle) {
  const auto value = reinterpret_cast<std::uintptr_t>(handle);
  return value >= 0x10000 && value <= 0x7FFFFFFF ? SlotAt(value & 0xFFFF) : nullptr;
}

// The slot that holds the object of this kind and handle; null without. Under the lock.
inline Slot* FindSlot(Kind kind, const void* handle) {
  Slot* slot = SlotNamedBy(handle);
  const bool fits = slot != nullptr && slot->kind == kind &&
                    slot->handle.load(std::memory_order_relaxed) == reinterpret_cast<std::uintptr_t>(handle);
  return fits ? slot : nullptr;
}

// Under the lock. AddObject throws std::bad_alloc when memory is out or 65,535 handles are in use.
void* AddObject(Kind kind, void* object, Thread* thread);
inline void* FindObject(Kind kind, const void* handle) {
  const Slot* slot = FindSlot(kind, handle);
  return slot != nullptr ? slot->object : nullptr;
}
void* RemoveObject(Kind kind, const void* handle);

template <class T, Kind kind, class Handle>
T* FindAs(Handle handle) {
  return static_cast<T*>(FindObject(kind, handle));
}

inline Window* FindWindowObject(HWND handle) { return FindAs<Window, Kind::Window>(handle); }

// Without the lock: the window if it belongs to `thread`, the caller's own; else null. Every message that is sent
// asks this.
inline Window* FindOwnWindow(HWND handle, const Thread* thread) {
  Slot* slot = SlotNamedBy(handle);
  // The order matters: once the slot is seen to be the caller's own, nobody else changes it.
  if (slot == nullptr || slot->thread.load(std::memory_order_acquire) != thread) return nullptr;
  const bool isCurrent = slot->handle.load(std::memory_order_relaxed) == reinterpret_cast<std::uintptr_t>(handle);
  return isCurrent ? static_cast<Window*>(slot->object) : nullptr;
}

// Calls `visit(handle, object)` for every object of the kind, under the lock.
void VisitObjects(Kind kind, void (*visit)(void* context, void* object), void* context);

}  // namespace platform::model
