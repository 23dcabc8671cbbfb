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

// Under the lock. AddObject throws std::bad_alloc when memory is out or 65,535 handles are in use.
void* AddObject(Kind kind, void* object, Thread* thread);
void* FindObject(Kind kind, const void* handle);
void* RemoveObject(Kind kind, const void* handle);

template <class T, Kind kind, class Handle>
T* FindAs(Handle handle) {
  return static_cast<T*>(FindObject(kind, handle));
}

inline Window* FindWindowObject(HWND handle) { return FindAs<Window, Kind::Window>(handle); }

// Without the lock: the window if it belongs to `thread`, the caller's own; else null.
Window* FindOwnWindow(HWND handle, const Thread* thread);

// Calls `visit(handle, object)` for every object of the kind, under the lock.
void VisitObjects(Kind kind, void (*visit)(void* context, void* object), void* context);

}  // namespace platform::model
