// The queues of messages.
#pragma once

#include "qxcore/platform/posix/window/thread.h"

namespace platform::model {

// With the lock held; gives it back while it waits: until Wake(), or until `due` (of Now()) when that is given.
void WaitForWake(Thread* thread, const std::uint64_t* due);

// What a caller of GetMessage and PeekMessage wants.
struct Filter {
  HWND window;
  UINT first, last;
  bool FitsMessage(UINT message) const { return (first == 0 && last == 0) || (message >= first && message <= last); }
  // Under the lock.
  bool FitsWindow(HWND candidate) const;
};

// Under the lock. Throws std::bad_alloc.
void Post(Thread* thread, HWND window, UINT message, WPARAM wParam, LPARAM lParam);
// Under the lock: forgets everything that waits for the window.
void ForgetMessages(Thread* thread, HWND window);

// Takes the next message of the thread, or looks at it; false when no message waits. With the lock held; gives it
// back while messages are sent. Throws std::bad_alloc.
bool TakeMessage(Thread* thread, MSG* message, const Filter& filter, bool remove);
// Waits until there may be a message. With the lock held.
void WaitForMessage(Thread* thread);

// Parts of TakeMessage, each in its own source.
bool TakeInput(Thread* thread, MSG* message, const Filter& filter, bool remove);
bool TakePaint(Thread* thread, MSG* message, const Filter& filter, bool remove);
bool TakeTimer(Thread* thread, MSG* message, const Filter& filter, bool remove);
const std::uint64_t* NextTimer(const Thread* thread);

// The point of the mouse on the screen. Under the lock.
extern POINT g_cursorPoint;

// Calls `visit(handle)` for every top-level window, without the lock.
void BroadcastTo(void (*visit)(void* context, HWND window), void* context);
template <class Visit>
void Broadcast(Visit visit) {
  BroadcastTo([](void* context, HWND window) { (*static_cast<Visit*>(context))(window); }, &visit);
}

}  // namespace platform::model
