// Making a window. CreateWindowExW reads as the list of what the program hears of it.

#include "qxcore/platform/posix/display/display.h"
#include "qxcore/platform/posix/window/atom.h"
#include "qxcore/platform/posix/window/children_area.h"
#include "qxcore/platform/posix/window/destroy.h"
#include "qxcore/platform/posix/window/place.h"
#include "qxcore/platform/posix/window/send.h"
#include "qxcore/platform/posix/window/tree.h"

namespace platform::model {
namespace {

// What the styles mean for each other: every top-level window is clipped against the others, one without WS_POPUP
// has a caption, and an edge follows from the frame.
DWORD CompleteStyle(DWORD style) {
  if (!(style & WS_CHILD)) style |= WS_CLIPSIBLINGS;
  if (!(style & (WS_CHILD | WS_POPUP))) style |= WS_CAPTION;
  return style;
}

DWORD CompleteExStyle(DWORD style, DWORD exStyle) {
  const bool hasEdge =
      (exStyle & WS_EX_DLGMODALFRAME) || (!(exStyle & WS_EX_STATICEDGE) && (style & (WS_DLGFRAME | WS_THICKFRAME)));
  return hasEdge ? exStyle | WS_EX_WINDOWEDGE : exStyle & ~WS_EX_WINDOWEDGE;
}

bool IsOverlapped(DWORD style) { return !(style & (WS_CHILD | WS_POPUP)); }

// Default places cascade over three quarters of the work area.
void ChooseDefaults(CREATESTRUCTW& create) {
  static std::atomic<int> cascade{0};
  if (create.x == CW_USEDEFAULT || create.cx == CW_USEDEFAULT) {
    if (!IsOverlapped(static_cast<DWORD>(create.style))) {
      if (create.x == CW_USEDEFAULT) create.x = create.y = 0;
      if (create.cx == CW_USEDEFAULT) create.cx = create.cy = 0;
      return;
    }
    const RECT area = TheDisplay().WorkArea();
    if (create.x == CW_USEDEFAULT) {
      const int step = GetSystemMetrics(SM_CYCAPTION) + GetSystemMetrics(SM_CYSIZEFRAME);
      create.x = create.y = step * (cascade++ % 8);
    }
    if (create.cx == CW_USEDEFAULT) {
      create.cx = Width(area) * 3 / 4 - create.x;
      create.cy = Height(area) * 3 / 4 - create.y;
    }
  }
}

struct Parentage {
  Window* parent;
  Window* owner;
};

// Null parent with the last error set when the styles and the given parent do not fit.
Parentage FindParentage(HWND given, DWORD style) {
  if (given == HWND_MESSAGE) return {MessageRoot(), nullptr};
  if (given == nullptr || given == Desktop()->handle) {
    if (style & WS_CHILD && given == nullptr) return Fail<Parentage>(ERROR_TLW_WITH_WSCHILD);
    return {Desktop(), nullptr};
  }
  Window* window = Expect(given);
  if (window == nullptr) return {};
  if ((style & (WS_CHILD | WS_POPUP)) == WS_CHILD) return {window, nullptr};
  Window* top = TopLevelOf(window);
  return {Desktop(), IsRoot(top) ? nullptr : top};
}

Window* MakeWindow(Thread* thread, const CREATESTRUCTW& create, HWND given) {
  EnsureSystemClasses();
  Class* windowClass = create.lpszClass != nullptr ? FindClass(create.lpszClass, create.hInstance) : nullptr;
  if (windowClass == nullptr) return Fail<Window*>(ERROR_CANNOT_FIND_WND_CLASS);
  const auto [parent, owner] = FindParentage(given, static_cast<DWORD>(create.style));
  if (parent == nullptr) return nullptr;

  Window* window = new Window;
  try {
    window->extra.resize(static_cast<std::size_t>(windowClass->windowExtra));
    window->handle = static_cast<HWND>(AddObject(Kind::Window, window, thread));
  } catch (...) {
    delete window;
    throw;
  }
  window->thread = thread;
  window->windowClass = windowClass;
  window->procedure = windowClass->procedure;
  window->owner = owner;
  window->style = static_cast<DWORD>(create.style) & ~WS_VISIBLE;
  window->exStyle = create.dwExStyle;
  window->instance = create.hInstance;
  window->idOrMenu = reinterpret_cast<UINT_PTR>(create.hMenu);
  window->window =
      window->client = {create.x, create.y, create.x + std::max(create.cx, 0), create.y + std::max(create.cy, 0)};
  window->needsSize = IsOverlapped(window->style);
  ++windowClass->windows;
  const bool isChild = window->IsChild();
  Link(window, parent, isChild ? parent->lastChild : nullptr);
  return window;
}

// The size that the window's own limits allow.
void LimitSize(HWND handle, CREATESTRUCTW& create) {
  const DWORD style = static_cast<DWORD>(create.style);
  if (!(style & WS_THICKFRAME) && !IsOverlapped(style)) return;
  const MINMAXINFO limits = AskLimits(handle);
  create.cx = std::clamp<int>(create.cx, std::min(limits.ptMinTrackSize.x, limits.ptMaxTrackSize.x),
                              std::max(limits.ptMinTrackSize.x, limits.ptMaxTrackSize.x));
  create.cy = std::clamp<int>(create.cy, std::min(limits.ptMinTrackSize.y, limits.ptMaxTrackSize.y),
                              std::max(limits.ptMinTrackSize.y, limits.ptMaxTrackSize.y));
}

// Sets the first place and works out the client area (WM_NCCALCSIZE).
void PlaceFirst(HWND handle, const CREATESTRUCTW& create) {
  RECT rect{create.x, create.y, create.x + std::max(create.cx, 0), create.y + std::max(create.cy, 0)};
  {
    const Guard guard;
    Window* window = FindWindowObject(handle);
    if (window == nullptr) return;
    window->window = rect;
    SceneChanged(window);
    const POINT origin = ParentOrigin(window);
    rect = Moved(rect, origin.x, origin.y);
  }
  Send(handle, WM_NCCALCSIZE, FALSE, reinterpret_cast<LPARAM>(&rect));
  const Guard guard;
  Window* window = FindWindowObject(handle);
  if (window == nullptr) return;
  const POINT origin = ParentOrigin(window);
  window->client = Moved(rect, -origin.x, -origin.y);
}

HMENU ClassMenu(const CREATESTRUCTW& create) {
  LPCWSTR name = nullptr;
  {
    const Guard guard;
    const Class* windowClass = FindClass(create.lpszClass, create.hInstance);
    if (windowClass == nullptr) return nullptr;
    name = windowClass->menuName.empty() ? windowClass->menuNumber : windowClass->menuName.c_str();
  }
  return name != nullptr ? LoadMenuW(create.hInstance, name) : nullptr;
}

}  // namespace

void SendSizeAndMove(HWND handle) {
  RECT client{};
  WPARAM how = SIZE_RESTORED;
  {
    const Guard guard;
    Window* window = FindWindowObject(handle);
    if (window == nullptr) return;
    window->needsSize = false;
    client = window->client;
    how = window->style & WS_MINIMIZE ? SIZE_MINIMIZED : window->style & WS_MAXIMIZE ? SIZE_MAXIMIZED : SIZE_RESTORED;
  }
  Send(handle, WM_SIZE, how, PointParam(Width(client), Height(client)));
  Send(handle, WM_MOVE, 0, PointParam(client.left, client.top));
}

void NotifyParent(HWND handle, UINT message) {
  HWND parent = nullptr;
  UINT_PTR id = 0;
  {
    const Guard guard;
    const Window* window = FindWindowObject(handle);
    if (window == nullptr || !window->IsChild() || (window->exStyle & WS_EX_NOPARENTNOTIFY)) return;
    parent = HandleOf(window->parent);
    id = window->idOrMenu;
  }
  // All parents up to the top-level window hear of it.
  while (parent != nullptr && parent != GetDesktopWindow()) {
    Send(parent, WM_PARENTNOTIFY, MAKEWPARAM(message, id), reinterpret_cast<LPARAM>(handle));
    const Guard guard;
    const Window* above = FindWindowObject(parent);
    if (above == nullptr || !above->IsChild() || (above->exStyle & WS_EX_NOPARENTNOTIFY)) return;
    parent = HandleOf(above->parent);
  }
}

}  // namespace platform::model

using namespace platform::model;

HWND CreateWindowExW(DWORD exStyle, LPCWSTR className, LPCWSTR name, DWORD style, int x, int y, int width, int height,
                     HWND parent, HMENU menu, HINSTANCE instance, LPVOID parameter) {
  Thread* thread = CurrentThread();
  style = CompleteStyle(style);
  CREATESTRUCTW create{parameter, instance,  menu,
                       parent,    height,    width,
                       y,         x,         static_cast<LONG>(style),
                       name,      className, CompleteExStyle(style, exStyle)};
  ChooseDefaults(create);
  const bool isChild = (style & (WS_CHILD | WS_POPUP)) == WS_CHILD;
  if (!isChild && menu == nullptr) create.hMenu = ClassMenu(create);

  const HWND handle = OrNoMemory<HWND>(nullptr, [&]() -> HWND {
    const Guard guard;
    return HandleOf(MakeWindow(thread, create, parent));
  });
  if (handle == nullptr) return nullptr;

  CBT_CREATEWNDW record{&create, HWND_TOP};
  if (CbtRefuses(HCBT_CREATEWND, reinterpret_cast<WPARAM>(handle), reinterpret_cast<LPARAM>(&record))) {
    FreeWindow(handle);
    return nullptr;
  }
  LimitSize(handle, create);
  if (!Send(handle, WM_NCCREATE, 0, reinterpret_cast<LPARAM>(&create))) {
    EndWindow(handle);
    return nullptr;
  }
  PlaceFirst(handle, create);
  if (Send(handle, WM_CREATE, 0, reinterpret_cast<LPARAM>(&create)) == -1) {
    EndWindow(handle);
    return nullptr;
  }
  if (!WaitsForShow(handle)) SendSizeAndMove(handle);
  NotifyParent(handle, WM_CREATE);
  if (style & WS_VISIBLE && IsWindow(handle)) ShowWindow(handle, FirstShow(style));
  return IsWindow(handle) ? handle : nullptr;
}
