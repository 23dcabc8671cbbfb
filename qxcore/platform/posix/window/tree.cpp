#include "qxcore/platform/posix/window/tree.h"

#include "qxcore/platform/internal/own_window.h"
#include "qxcore/platform/posix/display/display.h"
#include "qxcore/platform/posix/window/atom.h"
#include "qxcore/platform/posix/window/children_area.h"
#include "qxcore/platform/posix/window/paint.h"
#include "qxcore/platform/posix/window/queue.h"

namespace platform::model {
namespace {

struct Roots {
  Window desktop, messages;
};

Window* MakeRoot(Window& root, ATOM name) {
  EnsureSystemClasses();
  root.windowClass = FindClass(reinterpret_cast<LPCWSTR>(static_cast<ULONG_PTR>(name)), nullptr);
  root.procedure = &DefWindowProcW;
  root.style = WS_POPUP | WS_VISIBLE | WS_CLIPCHILDREN | WS_CLIPSIBLINGS;
  const SIZE size = TheDisplay().ScreenSize();
  root.window = root.client = {0, 0, size.cx, size.cy};
  root.handle = static_cast<HWND>(AddObject(Kind::Window, &root, nullptr));
  return &root;
}

Roots& TheRoots() {
  static Roots* roots = new Roots;
  return *roots;
}

constexpr ATOM kDesktopClass = 0x8001;

}  // namespace

Window* Desktop() {
  Window& root = TheRoots().desktop;
  return root.handle != nullptr ? &root : MakeRoot(root, kDesktopClass);
}

Window* MessageRoot() {
  Window& root = TheRoots().messages;
  return root.handle != nullptr ? &root : MakeRoot(root, kDesktopClass);
}

bool IsShown(const Window* window) {
  for (; !IsRoot(window); window = window->parent)
    if (!window->IsVisible()) return false;
  return window == Desktop();
}

void Link(Window* window, Window* parent, Window* after) {
  window->parent = parent;
  window->previous = after;
  window->next = after != nullptr ? after->next : parent->firstChild;
  (window->previous != nullptr ? window->previous->next : parent->firstChild) = window;
  (window->next != nullptr ? window->next->previous : parent->lastChild) = window;
  for (Window* above = parent; above != nullptr; above = above->parent) above->childPaints += window->childPaints;
  if (window->IsVisible()) SceneChanged(window);
}

void Unlink(Window* window) {
  if (window->IsVisible()) SceneChanged(window);
  Window* parent = window->parent;
  (window->previous != nullptr ? window->previous->next : parent->firstChild) = window->next;
  (window->next != nullptr ? window->next->previous : parent->lastChild) = window->previous;
  for (Window* above = parent; above != nullptr; above = above->parent) above->childPaints -= window->childPaints;
  window->parent = window->previous = window->next = nullptr;
}

bool IsBelow(const Window* window, const Window* ancestor) {
  if (window == nullptr || ancestor == nullptr) return false;
  while (window->IsChild() && window->parent != nullptr) {
    window = window->parent;
    if (window == ancestor) return true;
  }
  return false;
}

Window* TopLevelOf(Window* window) {
  while (window->parent != nullptr && !IsRoot(window->parent)) window = window->parent;
  return window;
}

Window* NextInTree(const Window* window, const Window* top) {
  if (window->firstChild != nullptr) return window->firstChild;
  while (window != top) {
    if (window->next != nullptr) return window->next;
    window = window->parent;
  }
  return nullptr;
}

POINT ParentOrigin(const Window* window) {
  POINT origin{};
  for (const Window* above = window->parent; above != nullptr; above = above->parent) {
    origin.x += above->client.left;
    origin.y += above->client.top;
  }
  return origin;
}

RECT ScreenRect(const Window* window) {
  const POINT origin = ParentOrigin(window);
  return Moved(window->window, origin.x, origin.y);
}

RECT ClientScreenRect(const Window* window) {
  const POINT origin = ParentOrigin(window);
  return Moved(window->client, origin.x, origin.y);
}

Window* ParentOrOwner(const Window* window) {
  if (window->style & WS_POPUP) return window->owner;
  return window->style & WS_CHILD ? window->parent : nullptr;
}

}  // namespace platform::model

using namespace platform::model;

namespace {

Window* Relative(Window* window, UINT which) {
  switch (which) {
    case GW_HWNDFIRST:
      return window->parent != nullptr ? window->parent->firstChild : nullptr;
    case GW_HWNDLAST:
      return window->parent != nullptr ? window->parent->lastChild : nullptr;
    case GW_HWNDNEXT:
      return window->next;
    case GW_HWNDPREV:
      return window->previous;
    case GW_OWNER:
      return window->owner;
    case GW_CHILD:
      return window->firstChild;
    default:
      SetLastError(ERROR_INVALID_PARAMETER);
      return nullptr;
  }
}

Window* Ancestor(Window* window, UINT which) {
  switch (which) {
    case GA_PARENT:
      return window->parent;
    case GA_ROOT:
      return IsRoot(window) ? nullptr : TopLevelOf(window);
    case GA_ROOTOWNER: {
      if (IsRoot(window)) return nullptr;
      while (Window* above = ParentOrOwner(window)) window = above;
      return window;
    }
    default:
      return nullptr;
  }
}

// The handles of a subtree or of the children alone, taken at once: the callback may change the tree.
List<HWND> HandlesBelow(const Window* top, bool deep) {
  List<HWND> handles;
  if (!deep) {
    for (const Window* child = top->firstChild; child != nullptr; child = child->next) handles.push_back(child->handle);
    return handles;
  }
  for (const Window* window = NextInTree(top, top); window != nullptr; window = NextInTree(window, top))
    handles.push_back(window->handle);
  return handles;
}

bool StillLives(HWND handle) {
  const Guard guard;
  return FindWindowObject(handle) != nullptr;
}

BOOL CallEach(const List<HWND>& handles, WNDENUMPROC callback, LPARAM data) {
  for (const HWND handle : handles) {
    if (!StillLives(handle)) continue;
    if (![&]() noexcept { return callback(handle, data); }()) return FALSE;
  }
  return TRUE;
}

bool Matches(const Window* window, ATOM className, LPCWSTR name) {
  if (className != 0 && window->windowClass->name != className) return false;
  return name == nullptr || window->text == name;
}

}  // namespace

bool platform::IsOwnWindow(HWND handle) noexcept { return FindOwnWindow(handle, CurrentThread()) != nullptr; }

BOOL IsWindow(HWND handle) {
  if (FindOwnWindow(handle, CurrentThread()) != nullptr) return TRUE;
  const Guard guard;
  return FindWindowObject(handle) != nullptr;
}

HWND GetDesktopWindow() {
  return OrNoMemory<HWND>(nullptr, [] {
    const Guard guard;
    return Desktop()->handle;
  });
}

HWND GetParent(HWND handle) {
  const Guard guard;
  const Window* window = Expect(handle);
  return window != nullptr ? HandleOf(ParentOrOwner(window)) : nullptr;
}

HWND GetAncestor(HWND handle, UINT which) {
  const Guard guard;
  Window* window = Expect(handle);
  return window != nullptr ? HandleOf(Ancestor(window, which)) : nullptr;
}

HWND GetWindow(HWND handle, UINT which) {
  const Guard guard;
  Window* window = Expect(handle);
  return window != nullptr ? HandleOf(Relative(window, which)) : nullptr;
}

HWND GetTopWindow(HWND handle) { return GetWindow(handle != nullptr ? handle : GetDesktopWindow(), GW_CHILD); }

HWND GetLastActivePopup(HWND handle) {
  const Guard guard;
  const Window* window = Expect(handle);
  if (window == nullptr) return handle;
  return FindWindowObject(window->lastActivePopup) != nullptr ? window->lastActivePopup : handle;
}

BOOL IsChild(HWND parent, HWND handle) {
  const Guard guard;
  return IsBelow(FindWindowObject(handle), FindWindowObject(parent));
}

HWND FindWindowExW(HWND parent, HWND after, LPCWSTR className, LPCWSTR name) {
  return OrNoMemory<HWND>(nullptr, [&]() -> HWND {
    const Guard guard;
    const Window* root = parent == nullptr ? Desktop() : parent == HWND_MESSAGE ? MessageRoot() : Expect(parent);
    if (root == nullptr) return nullptr;
    const ATOM atom = className != nullptr ? FindName(className) : 0;
    if (className != nullptr && atom == 0) return nullptr;
    const Window* first = root->firstChild;
    if (after != nullptr) {
      const Window* before = Expect(after);
      if (before == nullptr) return nullptr;
      if (before->parent != root) return nullptr;
      first = before->next;
    }
    for (const Window* window = first; window != nullptr; window = window->next)
      if (Matches(window, atom, name)) return window->handle;
    return nullptr;
  });
}

HWND FindWindowW(LPCWSTR className, LPCWSTR name) { return FindWindowExW(nullptr, nullptr, className, name); }

BOOL EnumChildWindows(HWND parent, WNDENUMPROC callback, LPARAM data) {
  return OrNoMemory<BOOL>(FALSE, [&]() -> BOOL {
    List<HWND> handles;
    {
      const Guard guard;
      const Window* top = parent != nullptr ? Expect(parent) : Desktop();
      if (top == nullptr) return FALSE;
      handles = HandlesBelow(top, parent != nullptr);
    }
    return CallEach(handles, callback, data);
  });
}

BOOL EnumWindows(WNDENUMPROC callback, LPARAM data) { return EnumChildWindows(nullptr, callback, data); }

BOOL EnumThreadWindows(DWORD thread, WNDENUMPROC callback, LPARAM data) {
  return OrNoMemory<BOOL>(FALSE, [&]() -> BOOL {
    List<HWND> handles;
    {
      const Guard guard;
      for (const Window* window = Desktop()->firstChild; window != nullptr; window = window->next)
        if (window->thread->id == thread) handles.push_back(window->handle);
    }
    return CallEach(handles, callback, data);
  });
}

DWORD GetWindowThreadProcessId(HWND handle, LPDWORD process) {
  CurrentThread();
  const Guard guard;
  const Window* window = Expect(handle);
  if (window == nullptr) return 0;
  if (process != nullptr) *process = GetCurrentProcessId();
  return window->thread != nullptr ? window->thread->id : 1;
}

BOOL IsWindowVisible(HWND handle) {
  const Guard guard;
  const Window* window = Expect(handle);
  return window != nullptr && IsShown(window);
}

BOOL IsWindowUnicode(HWND handle) { return IsWindow(handle); }
