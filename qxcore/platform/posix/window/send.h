// How messages reach procedures. None of these functions is called with the lock held.
#pragma once

#include "qxcore/platform/posix/window/thread.h"

namespace platform::model {

// Calls a procedure. A C++ exception may not leave a procedure: it ends the process here, where the reason can
// still be seen, instead of unwinding through functions that are not written for it.
LRESULT CallProcedure(WNDPROC procedure, HWND window, UINT message, WPARAM wParam, LPARAM lParam) noexcept;

LRESULT Send(HWND window, UINT message, WPARAM wParam = 0, LPARAM lParam = 0);

// Handles what other threads sent to this one. With the lock held; gives it back meanwhile.
void HandleSentMessages(Thread* thread);
// Under the lock: answers 0 to what was sent to the window, or to any window of the thread with a null one.
void AnswerSentMessages(Thread* thread, HWND window);

enum class HookKind { Cbt = 0, CallProcedure = 1 };
inline bool HasHook(const Thread* thread, HookKind kind) {
  return thread->hooks[static_cast<int>(kind)].load(std::memory_order_relaxed) != nullptr;
}
LRESULT RunHook(Thread* thread, HookKind kind, int code, WPARAM wParam, LPARAM lParam);
// Runs the WH_CBT hooks of the calling thread; true when one of them refuses.
bool CbtRefuses(int code, WPARAM wParam, LPARAM lParam);

}  // namespace platform::model
