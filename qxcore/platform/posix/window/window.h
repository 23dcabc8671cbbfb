// What the model knows of one window. All of it is guarded by the one lock (handle_table.h), except where a
// comment says otherwise. A Window lives until its WM_NCDESTROY has been answered; code that called a
// procedure looks it up again by its handle.
#pragma once

#include <atomic>

#include "qxcore/platform/posix/window/class.h"
#include "qxcore/platform/posix/window/handle_table.h"
#include "qxcore/platform/posix/window/rect.h"
#include "qxcore/platform/posix/window/region.h"

namespace platform::model {

struct Dialog;

struct ScrollBar {
  int lowest = 0, highest = 100, position = 0, trackPosition = 0;
  UINT page = 0;
  UINT arrows = ESB_ENABLE_BOTH;
};

struct ScrollBars : OnModelHeap {
  ScrollBar horizontal, vertical;
};

struct Property {
  ATOM name;
  HANDLE value;
};

// See children_area.h.
struct ChildrenArea {
  Region covered;
  bool areApart = true;  // none of them lies over another
  bool isKnown = false;
};

struct Window : OnModelHeap {
  HWND handle = nullptr;
  Thread* thread = nullptr;  // null for the two roots
  Class* windowClass = nullptr;
  std::atomic<WNDPROC> procedure{nullptr};  // read without the lock by the window's own thread

  // The tree. Children stand from the top of the Z order to the bottom.
  Window* parent = nullptr;  // a root for top-level windows
  Window* owner = nullptr;   // top-level windows only
  Window* firstChild = nullptr;
  Window* lastChild = nullptr;
  Window* previous = nullptr;  // above
  Window* next = nullptr;      // below

  DWORD style = 0;
  DWORD exStyle = 0;
  HINSTANCE instance = nullptr;
  UINT_PTR idOrMenu = 0;  // a child's identifier, a top-level window's menu
  HMENU systemMenu = nullptr;
  LONG_PTR userData = 0;
  Text text;
  List<BYTE> extra;
  List<Property> properties;
  ScrollBars* scrollBars = nullptr;
  Dialog* dialog = nullptr;

  // Places, relative to the parent's client area.
  RECT window{};
  RECT client{};
  RECT normal{};  // the window rectangle of the restored state, while minimised or maximised
  bool hasMinPosition = false, hasMaxPosition = false;
  POINT minPosition{}, maxPosition{};
  bool restoreToMaximized = false;
  bool needsSize = false;  // WM_SIZE and WM_MOVE come with the first showing

  // What must be painted. Where a window leaves its children out, parts that they cover may be in it (UpdateOf).
  Region update;
  bool eraseUpdate = false, frameUpdate = false, internalPaint = false;
  bool wantsPaint = false;
  int childPaints = 0;                  // windows below this one, itself included, that want WM_PAINT
  std::uint64_t childrenInvalidAt = 0;  // the scene in which nothing could be added to what is to be painted below
  ChildrenArea children;

  // Numbers in lists that may have been given up since: what stands there names its window.
  std::size_t placing = 0;       // in the last batch
  std::size_t deferredCopy = 0;  // among its thread's (deferred_copies.h)

  bool isDialog = false;
  bool isActiveFrame = false;        // the state of the caption, by WM_NCACTIVATE
  bool isDestroyed = false;          // WM_DESTROY has been sent
  std::uint32_t toldActivation = 0;  // the last of its thread's changes of activation that it heard of
  bool shownWhenParentOpens = false;
  HWND lastActivePopup = nullptr;
  HICON icons[2] = {};      // ICON_SMALL, ICON_BIG
  void* surface = nullptr;  // a top-level window's pixels, kept by the drawing half

  ~Window() { delete scrollBars; }
  bool IsChild() const { return (style & (WS_CHILD | WS_POPUP)) == WS_CHILD; }
  bool IsVisible() const { return style & WS_VISIBLE; }
};

// The two roots, made with the first window; their threads are null. Under the lock.
Window* Desktop();
Window* MessageRoot();
inline bool IsRoot(const Window* window) { return window->thread == nullptr; }
// Whether the window and all its parents are visible.
bool IsShown(const Window* window);

// Under the lock: the window of a handle, or null with ERROR_INVALID_WINDOW_HANDLE.
inline Window* Expect(HWND handle) {
  Window* window = FindWindowObject(handle);
  if (window == nullptr) SetLastError(ERROR_INVALID_WINDOW_HANDLE);
  return window;
}
inline HWND HandleOf(const Window* window) { return window != nullptr ? window->handle : nullptr; }

}  // namespace platform::model
