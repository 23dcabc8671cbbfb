#include "qxcore/platform/posix/window/activate.h"

#include "qxcore/platform/posix/display/display.h"
#include "qxcore/platform/posix/window/send.h"
#include "qxcore/platform/posix/window/tree.h"

namespace platform::model {
namespace {

bool CanBeActive(const Window* window, const Thread* thread) {
  return window != nullptr && window->thread == thread && window->parent == Desktop() && window->IsVisible() &&
         !(window->style & WS_DISABLED) && !window->isDestroyed;
}

WPARAM WithMinimised(HWND handle, UINT how) { return MAKEWPARAM(how, IsIconic(handle) ? 1 : 0); }

// The thread's next top-level window that has not heard of this change of the activation or of a later one.
HWND NextToTell(const Thread* thread, std::uint32_t change) {
  const Guard guard;
  for (Window* window = Desktop()->firstChild; window != nullptr; window = window->next) {
    if (window->thread != thread || (window->style & WS_CHILD) || window->toldActivation >= change) continue;
    window->toldActivation = change;
    return window->handle;
  }
  return nullptr;
}

// Handlers may make, destroy and reorder windows; marks take no memory, where a list of them could be short of it.
void TellApplication(BOOL active) {
  Thread* thread = CurrentThread();
  const std::uint32_t change = ++thread->activations;
  while (const HWND handle = NextToTell(thread, change)) Send(handle, WM_ACTIVATEAPP, active != 0, thread->id);
}

void Remember(Thread* thread, HWND handle) {
  const Guard guard;
  thread->active = handle;
  Window* window = FindWindowObject(handle);
  if (window == nullptr) return;
  RaiseTopLevel(window);
  Window* root = window;
  while (root->owner != nullptr) root = root->owner;
  root->lastActivePopup = handle;
}

void ChangeFocus(Thread* thread, HWND handle) {
  HWND previous = nullptr;
  {
    const Guard guard;
    previous = thread->focus;
    if (previous == handle) return;
    thread->focus = handle;
  }
  if (IsWindow(previous)) Send(previous, WM_KILLFOCUS, reinterpret_cast<WPARAM>(handle));
  if (handle != nullptr && GetFocus() == handle) Send(handle, WM_SETFOCUS, reinterpret_cast<WPARAM>(previous));
}

// Whether the window may have the focus: neither it nor a parent is minimised or disabled.
bool MayHaveFocus(const Window* window) {
  for (; window != nullptr && !IsRoot(window); window = window->parent)
    if (window->style & (WS_MINIMIZE | WS_DISABLED)) return false;
  return true;
}

HWND TopLevelHandle(HWND handle) { return GetAncestor(handle, GA_ROOT); }

}  // namespace

void RaiseTopLevel(Window* window) {
  Window* parent = window->parent;
  if (parent != Desktop()) return;
  if (parent->firstChild != window) {
    Unlink(window);
    Link(window, parent, nullptr);
  }
  // Lowest first, so that their order among themselves stays.
  for (Window* other = parent->lastChild; other != nullptr;) {
    Window* above = other->previous;
    if (other->owner == window && other != parent->firstChild) RaiseTopLevel(other);
    other = above;
    if (other == window) break;
  }
}

bool Activate(HWND handle, By by, bool moveFocus) {
  Thread* thread = CurrentThread();
  const HWND previous = GetActiveWindow();
  if (previous == handle) return true;

  CBTACTIVATESTRUCT record{by == By::Mouse, previous};
  if (CbtRefuses(HCBT_ACTIVATE, reinterpret_cast<WPARAM>(handle), reinterpret_cast<LPARAM>(&record))) return false;
  if (IsWindow(previous)) {
    if (!Send(previous, WM_NCACTIVATE, FALSE, reinterpret_cast<LPARAM>(handle)) && IsWindow(handle)) return false;
    Send(previous, WM_ACTIVATE, WithMinimised(previous, WA_INACTIVE), reinterpret_cast<LPARAM>(handle));
  }
  if (handle != nullptr && !IsWindow(handle)) return false;
  Remember(thread, handle);
  if (handle != nullptr && TheDisplay().Serves(thread->id)) TheDisplay().Activate(handle);
  if ((previous == nullptr) != (handle == nullptr)) TellApplication(handle != nullptr);
  if (handle != nullptr && GetActiveWindow() == handle) {
    Send(handle, WM_NCACTIVATE, TRUE, reinterpret_cast<LPARAM>(previous));
    Send(handle, WM_ACTIVATE, WithMinimised(handle, by == By::Mouse ? WA_CLICKACTIVE : WA_ACTIVE),
         reinterpret_cast<LPARAM>(previous));
  }
  const HWND focus = GetFocus();
  if (moveFocus && GetActiveWindow() == handle && (focus == nullptr || TopLevelHandle(focus) != handle))
    ChangeFocus(thread, handle);
  return IsWindow(handle) || handle == nullptr;
}

void ActivateAnother(HWND handle) {
  Thread* thread = CurrentThread();
  HWND next = nullptr;
  {
    const Guard guard;
    const Window* window = FindWindowObject(handle);
    if (window == nullptr) return;
    const Window* owner = window->owner;
    if (CanBeActive(owner, thread)) {
      next = owner->handle;
    } else {
      for (const Window* other = Desktop()->firstChild; other != nullptr && next == nullptr; other = other->next)
        if (other != window && CanBeActive(other, thread)) next = other->handle;
    }
  }
  Activate(next, By::Program, true);
}

void LeaveFocus(HWND handle) {
  const HWND focus = GetFocus();
  if (focus == nullptr || (focus != handle && !IsChild(handle, focus))) return;
  HWND next = nullptr;
  {
    const Guard guard;
    const Window* window = FindWindowObject(handle);
    if (window != nullptr && window->IsChild()) next = HandleOf(window->parent);
  }
  if (next != nullptr && SetFocus(next) != nullptr) return;
  ChangeFocus(CurrentThread(), nullptr);
}

}  // namespace platform::model

using namespace platform::model;

HWND GetActiveWindow() {
  Thread* thread = CurrentThread();
  const Guard guard;
  return FindWindowObject(thread->active) != nullptr ? thread->active : nullptr;
}

HWND GetForegroundWindow() { return GetActiveWindow(); }

HWND SetActiveWindow(HWND handle) {
  const HWND previous = GetActiveWindow();
  if (handle != nullptr) {
    const Guard guard;
    const Window* window = Expect(handle);
    if (window == nullptr) return nullptr;
    if ((window->style & (WS_POPUP | WS_CHILD)) == WS_CHILD) return previous;
  }
  return Activate(handle, By::Program, true) ? previous : nullptr;
}

BOOL SetForegroundWindow(HWND handle) {
  if (!IsWindow(handle)) return Fail(ERROR_INVALID_WINDOW_HANDLE);
  const HWND top = TopLevelHandle(handle);
  return GetWindowThreadProcessId(top, nullptr) == GetCurrentThreadId() && Activate(top, By::Program, true);
}

HWND GetFocus() {
  Thread* thread = CurrentThread();
  const Guard guard;
  return FindWindowObject(thread->focus) != nullptr ? thread->focus : nullptr;
}

HWND SetFocus(HWND handle) {
  Thread* thread = CurrentThread();
  const HWND previous = GetFocus();
  if (handle != nullptr) {
    const Guard guard;
    const Window* window = Expect(handle);
    if (window == nullptr) return nullptr;
    if (handle == previous) return previous;
    if (window->thread != thread) return Fail<HWND>(ERROR_ACCESS_DENIED);
    if (!MayHaveFocus(window)) return nullptr;
  } else if (previous == nullptr) {
    return nullptr;
  }
  if (CbtRefuses(HCBT_SETFOCUS, reinterpret_cast<WPARAM>(handle), reinterpret_cast<LPARAM>(previous))) return nullptr;
  if (handle != nullptr) {
    const HWND top = TopLevelHandle(handle);
    if (top != GetActiveWindow() && !Activate(top, By::Program, false)) return nullptr;
    if (!IsWindow(handle) || TopLevelHandle(handle) != GetActiveWindow()) return nullptr;
  }
  ChangeFocus(thread, handle);
  return previous;
}
