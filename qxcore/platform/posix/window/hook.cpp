#include "qxcore/platform/posix/window/send.h"

namespace platform::model {
namespace {

int IndexOf(int kind) { return kind == WH_CBT ? 0 : kind == WH_CALLWNDPROC ? 1 : -1; }

// Calls the hook of a handle, with CallNextHookEx leading to the one that was set before it.
LRESULT RunFrom(Thread* thread, HHOOK handle, int code, WPARAM wParam, LPARAM lParam) {
  HOOKPROC procedure = nullptr;
  HHOOK next = nullptr;
  {
    const Guard guard;
    const Hook* hook = FindAs<Hook, Kind::Hook>(handle);
    if (hook == nullptr) return 0;
    procedure = hook->procedure;
    next = hook->next != nullptr ? hook->next->handle : nullptr;
  }
  const HHOOK outer = thread->nextHook;
  thread->nextHook = next;
  const LRESULT result = [&]() noexcept { return procedure(code, wParam, lParam); }();
  thread->nextHook = outer;
  return result;
}

}  // namespace

LRESULT RunHook(Thread* thread, HookKind kind, int code, WPARAM wParam, LPARAM lParam) {
  HHOOK first = nullptr;
  {
    const Guard guard;
    const Hook* hook = thread->hooks[static_cast<int>(kind)];
    if (hook == nullptr) return 0;
    first = hook->handle;
  }
  return RunFrom(thread, first, code, wParam, lParam);
}

bool CbtRefuses(int code, WPARAM wParam, LPARAM lParam) {
  Thread* thread = CurrentThread();
  return HasHook(thread, HookKind::Cbt) && RunHook(thread, HookKind::Cbt, code, wParam, lParam) != 0;
}

}  // namespace platform::model

using namespace platform::model;

HHOOK SetWindowsHookExW(int kind, HOOKPROC procedure, HINSTANCE, DWORD threadId) {
  const int index = IndexOf(kind);
  if (index < 0) return Fail<HHOOK>(ERROR_INVALID_HOOK_FILTER);
  if (procedure == nullptr) return Fail<HHOOK>(ERROR_INVALID_FILTER_PROC);
  CurrentThread();
  return OrNoMemory<HHOOK>(nullptr, [&]() -> HHOOK {
    const Guard guard;
    Thread* thread = FindThread(threadId);
    if (thread == nullptr) return Fail<HHOOK>(ERROR_INVALID_PARAMETER);
    Hook* hook = new Hook;
    try {
      hook->handle = static_cast<HHOOK>(AddObject(Kind::Hook, hook, nullptr));
    } catch (...) {
      delete hook;
      throw;
    }
    hook->kind = kind;
    hook->procedure = procedure;
    hook->thread = thread;
    hook->next = thread->hooks[index];
    thread->hooks[index] = hook;
    return hook->handle;
  });
}

BOOL UnhookWindowsHookEx(HHOOK handle) {
  const Guard guard;
  Hook* hook = FindAs<Hook, Kind::Hook>(handle);
  if (hook == nullptr) return Fail(ERROR_INVALID_HOOK_HANDLE);
  std::atomic<Hook*>& first = hook->thread->hooks[IndexOf(hook->kind)];
  if (first == hook) {
    first = hook->next;
  } else {
    Hook* above = first;
    while (above->next != hook) above = above->next;
    above->next = hook->next;
  }
  RemoveObject(Kind::Hook, handle);
  delete hook;
  return TRUE;
}

LRESULT CallNextHookEx(HHOOK, int code, WPARAM wParam, LPARAM lParam) {
  Thread* thread = CurrentThread();
  return thread->nextHook != nullptr ? RunFrom(thread, thread->nextHook, code, wParam, lParam) : 0;
}
