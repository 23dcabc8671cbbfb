#include "qxcore/platform/posix/window/queue.h"

#include <algorithm>
#include <chrono>

#include "qxcore/platform/posix/display/display.h"
#include "qxcore/platform/posix/window/deferred_copies.h"
#include "qxcore/platform/posix/window/send.h"
#include "qxcore/platform/posix/window/tree.h"

namespace platform::model {

POINT g_cursorPoint{};

namespace {

constexpr std::uint64_t kLongestWait = 60000;  // a wait ends now and then, so that no change of the clock lasts

DWORD MillisecondsUntil(const std::uint64_t* due) {
  if (due == nullptr) return INFINITE;
  const std::uint64_t now = Now();
  return *due > now ? static_cast<DWORD>(std::min(*due - now, kLongestWait)) : 0;
}

bool TakePosted(Thread* thread, MSG* message, const Filter& filter, bool remove) {
  for (std::size_t i = 0; i < thread->posted.Count(); ++i) {
    const MSG& posted = thread->posted.At(i);
    if (!filter.FitsMessage(posted.message) || !filter.FitsWindow(posted.hwnd)) continue;
    *message = posted;
    if (remove) thread->posted.Remove(i);
    return true;
  }
  return false;
}

bool TakeQuit(Thread* thread, MSG* message, bool remove) {
  if (!thread->quits || !thread->posted.IsEmpty()) return false;
  *message = {nullptr, WM_QUIT, static_cast<WPARAM>(thread->quitCode), 0, GetTickCount(), g_cursorPoint};
  if (remove) thread->quits = false;
  return true;
}

}  // namespace

bool Filter::FitsWindow(HWND candidate) const {
  if (window == nullptr || window == candidate) return true;
  if (window == reinterpret_cast<HWND>(static_cast<LONG_PTR>(-1))) return candidate == nullptr;
  return IsBelow(FindWindowObject(candidate), FindWindowObject(window));
}

void WaitForWake(Thread* thread, const std::uint64_t* due) {
  const DWORD wait = MillisecondsUntil(due);
  if (TheDisplay().Serves(thread->id)) {
    if (!thread->isWoken) {
      const Unguarded unguarded;
      CopyNow();  // what is shown must be complete while nothing happens
      TheDisplay().Wait(wait);
    }
  } else {
    std::unique_lock<std::mutex> lock(g_lock, std::adopt_lock);
    const auto woken = [&] { return thread->isWoken; };
    if (wait == INFINITE) {
      thread->wake.wait(lock, woken);
    } else {
      thread->wake.wait_until(lock, std::chrono::system_clock::now() + std::chrono::milliseconds(wait), woken);
    }
    lock.release();
  }
  thread->isWoken = false;
}

void Post(Thread* thread, HWND window, UINT message, WPARAM wParam, LPARAM lParam) {
  thread->posted.Push({window, message, wParam, lParam, static_cast<DWORD>(Now()), g_cursorPoint});
  thread->changed |= QS_POSTMESSAGE | QS_ALLPOSTMESSAGE;
  if (!thread->isWoken) Wake(thread);
}

void ForgetMessages(Thread* thread, HWND window) {
  for (std::size_t i = thread->posted.Count(); i-- > 0;)
    if (thread->posted.At(i).hwnd == window) thread->posted.Remove(i);
  std::erase_if(thread->timers, [&](const Timer& timer) { return timer.window == window; });
  AnswerSentMessages(thread, window);
}

bool TakeMessage(Thread* thread, MSG* message, const Filter& filter, bool remove) {
  HandleSentMessages(thread);
  const bool taken = TakePosted(thread, message, filter, remove) || TakeQuit(thread, message, remove) ||
                     TakeInput(thread, message, filter, remove) || TakePaint(thread, message, filter, remove) ||
                     TakeTimer(thread, message, filter, remove);
  if (taken) {
    thread->messageTime = message->time;
    thread->messagePoint = message->pt;
  }
  return taken;
}

void WaitForMessage(Thread* thread) { WaitForWake(thread, NextTimer(thread)); }

void BroadcastTo(void (*visit)(void* context, HWND window), void* context) {
  List<HWND> handles;
  {
    const Guard guard;
    for (const Window* window = Desktop()->firstChild; window != nullptr; window = window->next)
      handles.push_back(window->handle);
  }
  for (const HWND handle : handles) visit(context, handle);
}

}  // namespace platform::model

using namespace platform::model;

BOOL PostMessageW(HWND handle, UINT message, WPARAM wParam, LPARAM lParam) {
  Thread* self = CurrentThread();
  return OrNoMemory<BOOL>(FALSE, [&]() -> BOOL {
    if (handle == HWND_BROADCAST) {
      Broadcast([&](HWND each) { PostMessageW(each, message, wParam, lParam); });
      return TRUE;
    }
    const Guard guard;
    Thread* thread = self;
    if (handle != nullptr) {
      const Window* window = Expect(handle);
      if (window == nullptr) return FALSE;
      if (IsRoot(window)) return TRUE;  // nobody reads the desktop's queue
      thread = window->thread;
    }
    Post(thread, handle, message, wParam, lParam);
    return TRUE;
  });
}

BOOL PostThreadMessageW(DWORD id, UINT message, WPARAM wParam, LPARAM lParam) {
  CurrentThread();
  return OrNoMemory<BOOL>(FALSE, [&]() -> BOOL {
    const Guard guard;
    Thread* thread = FindThread(id);
    if (thread == nullptr) return Fail(ERROR_INVALID_THREAD_ID);
    Post(thread, nullptr, message, wParam, lParam);
    return TRUE;
  });
}

void PostQuitMessage(int code) {
  Thread* thread = CurrentThread();
  const Guard guard;
  thread->quits = true;
  thread->quitCode = code;
  Wake(thread);
}

BOOL GetMessageW(MSG* message, HWND window, UINT first, UINT last) {
  Thread* thread = CurrentThread();
  return OrNoMemory<BOOL>(-1, [&]() -> BOOL {
    const Guard guard;
    const Filter filter{window, first, last};
    if (window != nullptr && window != reinterpret_cast<HWND>(static_cast<LONG_PTR>(-1)) && Expect(window) == nullptr)
      return -1;
    while (!TakeMessage(thread, message, filter, true)) WaitForMessage(thread);
    return message->message != WM_QUIT;
  });
}

BOOL PeekMessageW(MSG* message, HWND window, UINT first, UINT last, UINT remove) {
  Thread* thread = CurrentThread();
  return OrNoMemory<BOOL>(FALSE, [&]() -> BOOL {
    const Guard guard;
    if (platform::TheDisplay().Serves(thread->id)) {  // lets it report what came meanwhile
      const Unguarded unguarded;
      platform::TheDisplay().Wait(0);
    }
    return TakeMessage(thread, message, {window, first, last}, remove & PM_REMOVE);
  });
}

BOOL WaitMessage() {
  Thread* thread = CurrentThread();
  return OrNoMemory<BOOL>(FALSE, [&]() -> BOOL {
    const Guard guard;
    MSG message;
    while (!TakeMessage(thread, &message, {nullptr, 0, 0}, false)) WaitForMessage(thread);
    return TRUE;
  });
}

LRESULT DispatchMessageW(const MSG* message) {
  if (message->message == WM_TIMER && message->lParam != 0) {
    const auto procedure = reinterpret_cast<TIMERPROC>(message->lParam);
    [&]() noexcept { procedure(message->hwnd, WM_TIMER, message->wParam, GetTickCount()); }();
    return 0;
  }
  if (message->hwnd == nullptr) return 0;
  Thread* thread = CurrentThread();
  const Window* window = FindOwnWindow(message->hwnd, thread);
  if (window == nullptr) return Fail<LRESULT>(ERROR_INVALID_WINDOW_HANDLE);
  return CallProcedure(window->procedure.load(std::memory_order_relaxed), message->hwnd, message->message,
                       message->wParam, message->lParam);
}

DWORD GetQueueStatus(UINT flags) {
  Thread* thread = CurrentThread();
  const Guard guard;
  UINT now = 0;
  if (!thread->posted.IsEmpty()) now |= QS_POSTMESSAGE | QS_ALLPOSTMESSAGE;
  if (!thread->sent.IsEmpty()) now |= QS_SENDMESSAGE;
  if (thread->paints > 0) now |= QS_PAINT;
  for (std::size_t i = 0; i < thread->input.Count(); ++i) {
    const UINT message = thread->input.At(i).message.message;
    now |= message <= WM_KEYLAST ? QS_KEY : message == WM_MOUSEMOVE ? QS_MOUSEMOVE : QS_MOUSEBUTTON;
  }
  const std::uint64_t* due = NextTimer(thread);
  if (due != nullptr && *due <= Now()) now |= QS_TIMER;
  const UINT changed = thread->changed & now;
  thread->changed &= ~flags;
  return MAKELONG(changed & flags, now & flags);
}

DWORD GetMessagePos() {
  const POINT point = CurrentThread()->messagePoint;
  return static_cast<DWORD>(MAKELONG(point.x, point.y));
}

LONG GetMessageTime() { return static_cast<LONG>(CurrentThread()->messageTime); }

LPARAM GetMessageExtraInfo() { return CurrentThread()->messageExtra; }
