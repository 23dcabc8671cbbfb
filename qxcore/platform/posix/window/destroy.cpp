// The end of a window. DestroyWindow reads as the list of what the program hears of it.

#include "qxcore/platform/posix/window/destroy.h"

#include "qxcore/platform/posix/display/display.h"
#include "qxcore/platform/posix/window/activate.h"
#include "qxcore/platform/posix/window/controls.h"
#include "qxcore/platform/posix/window/dialog.h"
#include "qxcore/platform/posix/window/paint.h"
#include "qxcore/platform/posix/window/queue.h"
#include "qxcore/platform/posix/window/send.h"
#include "qxcore/platform/posix/window/tree.h"

namespace platform::model {
namespace {

// Everything that may still lead to the window. Under the lock.
void ForgetWindow(Window* window) {
  Thread* thread = window->thread;
  ForgetMessages(thread, window->handle);
  for (HWND* kept : {&thread->active, &thread->focus, &thread->capture, &thread->menuOwner, &thread->caret.window,
                     &thread->trackedLeave})
    if (*kept == window->handle) *kept = nullptr;
  SetWantsPaint(window, false);
}

HWND FirstChildOf(HWND handle) {
  const Guard guard;
  const Window* window = FindWindowObject(handle);
  return window != nullptr ? HandleOf(window->firstChild) : nullptr;
}

// Top-level windows that the window owns; one at a time, since each may take others with it.
HWND OwnedBy(HWND handle) {
  const Guard guard;
  const Window* owner = FindWindowObject(handle);
  if (owner == nullptr || owner->parent == nullptr || !IsRoot(owner->parent)) return nullptr;
  for (const Window* window = Desktop()->firstChild; window != nullptr; window = window->next)
    if (window->owner == owner && window->thread == owner->thread && !window->isDestroyed) return window->handle;
  return nullptr;
}

void DestroyOwned(HWND handle) {
  HWND last = nullptr;
  while (const HWND owned = OwnedBy(handle)) {
    if (owned == last) return;  // a hook keeps it alive
    last = owned;
    DestroyWindow(owned);
  }
}

// WM_DESTROY to the window, then to what is below it, parents first.
void SendDestroy(HWND handle) {
  {
    const Guard guard;
    Window* window = FindWindowObject(handle);
    if (window == nullptr) return;
    window->isDestroyed = true;
    if (window->thread->caret.window == handle) window->thread->caret = {};
  }
  Send(handle, WM_DESTROY);
  HWND child = FirstChildOf(handle);
  while (child != nullptr) {
    const HWND next = GetWindow(child, GW_HWNDNEXT);
    SendDestroy(child);
    child = IsWindow(next) ? next : nullptr;
  }
}

void HideBeforeEnd(HWND handle) {
  bool isVisible = false, isChild = false;
  {
    const Guard guard;
    const Window* window = FindWindowObject(handle);
    if (window == nullptr) return;
    isVisible = window->IsVisible();
    isChild = window->IsChild();
  }
  if (!isVisible) return;
  if (isChild) {
    ShowWindow(handle, SW_HIDE);
  } else {
    SetWindowPos(handle, nullptr, 0, 0, 0, 0, SWP_NOMOVE | SWP_NOSIZE | SWP_NOZORDER | SWP_NOACTIVATE | SWP_HIDEWINDOW);
  }
}

bool IsChildWindow(HWND handle) {
  const Guard guard;
  const Window* window = FindWindowObject(handle);
  return window != nullptr && window->IsChild();
}

// The menus go with their window.
void DestroyMenusOf(HWND handle) {
  HMENU menu = nullptr, systemMenu = nullptr;
  {
    const Guard guard;
    const Window* window = FindWindowObject(handle);
    if (window == nullptr) return;
    if (!window->IsChild()) menu = reinterpret_cast<HMENU>(window->idOrMenu);
    systemMenu = window->systemMenu;
  }
  if (menu != nullptr) DestroyMenu(menu);
  if (systemMenu != nullptr) DestroyMenu(systemMenu);
}

}  // namespace

void FreeWindow(HWND handle) {
  DestroyMenusOf(handle);
  Window* window = nullptr;
  {
    const Guard guard;
    window = FindWindowObject(handle);
    if (window == nullptr) return;
    ForgetWindow(window);
    if (!window->IsChild())
      for (Window* other = Desktop()->firstChild; other != nullptr; other = other->next)
        if (other->owner == window) other->owner = nullptr;
    if (window->parent != nullptr) Unlink(window);
    --window->windowClass->windows;
    RemoveObject(Kind::Window, handle);
    FreeDialog(window);
  }
  if (window->surface != nullptr && g_painter.freeSurface != nullptr) g_painter.freeSurface(window->surface);
  delete window;
}

void EndWindow(HWND handle) {
  HWND last = nullptr;
  while (const HWND child = FirstChildOf(handle)) {
    if (child == last) break;
    last = child;
    EndWindow(child);
  }
  Send(handle, WM_NCDESTROY);
  FreeWindow(handle);
}

void FreeWindowsOf(Thread* thread) {
  for (;;) {
    HWND handle = nullptr;
    {
      const Guard guard;
      struct Search {
        Thread* thread;
        HWND found;
      } search{thread, nullptr};
      VisitObjects(
          Kind::Window,
          [](void* context, void* object) {
            auto* wanted = static_cast<Search*>(context);
            const auto* window = static_cast<Window*>(object);
            if (window->thread == wanted->thread && window->firstChild == nullptr) wanted->found = window->handle;
          },
          &search);
      handle = search.found;
    }
    if (handle == nullptr) return;
    FreeWindow(handle);
  }
}

}  // namespace platform::model

using namespace platform::model;

BOOL DestroyWindow(HWND handle) {
  Thread* thread = CurrentThread();
  {
    const Guard guard;
    const Window* window = Expect(handle);
    if (window == nullptr) return FALSE;
    if (window->thread != thread) return Fail(ERROR_ACCESS_DENIED);
  }
  if (CbtRefuses(HCBT_DESTROYWND, reinterpret_cast<WPARAM>(handle), 0)) return FALSE;
  if (thread->menuOwner == handle) EndMenu();

  NotifyParent(handle, WM_DESTROY);
  if (!IsWindow(handle)) return TRUE;
  HideBeforeEnd(handle);
  if (!IsWindow(handle)) return TRUE;
  if (!IsChildWindow(handle)) {
    DestroyOwned(handle);
    if (GetActiveWindow() == handle) ActivateAnother(handle);
    if (!IsWindow(handle)) return TRUE;
  }
  LeaveFocus(handle);
  platform::TheDisplay().Close(handle);
  SendDestroy(handle);
  if (!IsWindow(handle)) return TRUE;
  EndWindow(handle);
  return TRUE;
}
