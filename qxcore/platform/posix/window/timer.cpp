#include <algorithm>

#include "qxcore/platform/posix/window/queue.h"

namespace platform::model {
namespace {

Timer* FindTimer(Thread* thread, HWND window, UINT_PTR id) {
  for (Timer& timer : thread->timers)
    if (timer.window == window && timer.id == id) return &timer;
  return nullptr;
}

UINT_PTR UnusedId(Thread* thread) {
  UINT_PTR id = 0x7FFF;
  while (FindTimer(thread, nullptr, id) != nullptr) --id;
  return id;
}

}  // namespace

bool TakeTimer(Thread* thread, MSG* message, const Filter& filter, bool remove) {
  if (thread->timers.empty() || !filter.FitsMessage(WM_TIMER)) return false;
  const std::uint64_t now = Now();
  Timer* first = nullptr;
  for (Timer& timer : thread->timers)
    if (timer.due <= now && filter.FitsWindow(timer.window) && (first == nullptr || timer.due < first->due))
      first = &timer;
  if (first == nullptr) return false;
  *message = {first->window,           WM_TIMER,     first->id, reinterpret_cast<LPARAM>(first->procedure),
              static_cast<DWORD>(now), g_cursorPoint};
  if (remove) first->due = now + first->interval;
  return true;
}

const std::uint64_t* NextTimer(const Thread* thread) {
  const std::uint64_t* next = nullptr;
  for (const Timer& timer : thread->timers)
    if (next == nullptr || timer.due < *next) next = &timer.due;
  return next;
}

}  // namespace platform::model

using namespace platform::model;

UINT_PTR SetTimer(HWND handle, UINT_PTR id, UINT interval, TIMERPROC procedure) {
  Thread* thread = CurrentThread();
  return OrNoMemory<UINT_PTR>(0, [&]() -> UINT_PTR {
    const Guard guard;
    if (handle != nullptr) {
      const Window* window = Expect(handle);
      if (window == nullptr) return 0;
      if (window->thread != thread) return Fail<UINT_PTR>(ERROR_ACCESS_DENIED);
    }
    Timer* timer = FindTimer(thread, handle, id);
    if (timer == nullptr) {
      if (handle == nullptr) id = UnusedId(thread);
      thread->timers.push_back({});
      timer = &thread->timers.back();
    }
    interval = std::clamp<UINT>(interval, USER_TIMER_MINIMUM, USER_TIMER_MAXIMUM);
    *timer = {handle, id, interval, procedure, Now() + interval};
    return id != 0 ? id : 1;
  });
}

BOOL KillTimer(HWND window, UINT_PTR id) {
  Thread* thread = CurrentThread();
  const Guard guard;
  return std::erase_if(thread->timers, [&](const Timer& timer) { return timer.window == window && timer.id == id; }) >
         0;
}
