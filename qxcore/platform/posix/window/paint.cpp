// The messages of painting: erasing, BeginPaint and EndPaint, and what WM_SETREDRAW holds back.

#include "qxcore/platform/posix/window/paint.h"

#include "qxcore/platform/posix/window/children_area.h"
#include "qxcore/platform/posix/window/controls.h"
#include "qxcore/platform/posix/window/default_proc.h"
#include "qxcore/platform/posix/window/deferred_copies.h"
#include "qxcore/platform/posix/window/frame.h"
#include "qxcore/platform/posix/window/send.h"
#include "qxcore/platform/posix/window/tree.h"

namespace platform::model {
namespace {

HDC OpenContext(HWND handle, const Region& region) {
  return g_painter.openContext != nullptr ? g_painter.openContext(handle, region.Pixman(), DCX_CACHE) : nullptr;
}

void CloseContext(HWND handle, HDC context) {
  if (context != nullptr && g_painter.closeContext != nullptr) g_painter.closeContext(handle, context);
}

struct Due {
  bool frame = false, erase = false;
  Region client;  // relative to the client area
};

// What is due, and the answer that WM_NCPAINT is on its way.
Due TakeDue(HWND handle) {
  Due due;
  const Guard guard;
  Window* window = FindWindowObject(handle);
  if (window == nullptr) return due;
  due.frame = window->frameUpdate;
  due.erase = window->eraseUpdate;
  window->frameUpdate = false;
  ForgetAllInvalid(window);
  const RECT client = ClientInWindow(window);
  window->update.Intersect(client);
  due.client = UpdateOf(window);
  due.client.Move(-client.left, -client.top);
  if (due.client.IsEmpty() && !window->internalPaint) SetWantsPaint(window, false);
  return due;
}

void SetErase(HWND handle, bool erase) {
  const Guard guard;
  Window* window = FindWindowObject(handle);
  if (window == nullptr) return;
  window->eraseUpdate = erase;
  ForgetAllInvalid(window);
}

}  // namespace

void EraseNow(HWND handle) {
  {
    const Guard guard;
    const Window* window = FindWindowObject(handle);
    if (window == nullptr || !window->wantsPaint || !(window->frameUpdate || window->eraseUpdate)) return;
    if (WaitsForParent(window)) return;
  }
  const Due due = TakeDue(handle);
  if (due.frame) Send(handle, WM_NCPAINT, 1);
  if (!due.erase || due.client.IsEmpty() || !IsWindow(handle)) return;
  const HDC context = OpenContext(handle, due.client);
  const bool isErased = Send(handle, WM_ERASEBKGND, reinterpret_cast<WPARAM>(context)) != 0;
  CloseContext(handle, context);
  SetErase(handle, !isErased);
}

LRESULT DefaultEraseBackground(HWND handle, HDC context) {
  HBRUSH brush = nullptr;
  {
    const Guard guard;
    const Window* window = FindWindowObject(handle);
    if (window == nullptr || window->windowClass->background == nullptr) return 0;
    brush = window->windowClass->background;
  }
  if (g_painter.eraseBackground != nullptr && context != nullptr) g_painter.eraseBackground(handle, context, brush);
  return 1;
}

LRESULT DefaultPaint(HWND handle) {
  PAINTSTRUCT paint;
  BeginPaint(handle, &paint);
  EndPaint(handle, &paint);
  return 0;
}

// While redrawing is off the window counts as hidden, as the system has it.
LRESULT DefaultSetRedraw(HWND handle, BOOL redraw) {
  CopyNow();
  const Guard guard;
  Window* window = FindWindowObject(handle);
  if (window == nullptr) return 0;
  if (redraw) {
    window->style |= WS_VISIBLE;
    SceneChanged(window);
  } else {
    window->style &= ~WS_VISIBLE;
    SceneChanged(window);
    DropPaint(window);
  }
  return 0;
}

}  // namespace platform::model

using namespace platform::model;

HDC BeginPaint(HWND handle, PAINTSTRUCT* paint) {
  *paint = {};
  if (!IsWindow(handle)) return Fail<HDC>(ERROR_INVALID_WINDOW_HANDLE);
  HideCaret(handle);
  const Due due = TakeDue(handle);
  if (due.frame) Send(handle, WM_NCPAINT, 1);
  {
    const Guard guard;
    Window* window = Expect(handle);
    if (window == nullptr) return nullptr;
    window->internalPaint = false;
    Validate(window, nullptr, Children::No);
  }
  paint->rcPaint = due.client.Bounds();
  paint->hdc = OpenContext(handle, due.client);
  if (due.erase) paint->fErase = !Send(handle, WM_ERASEBKGND, reinterpret_cast<WPARAM>(paint->hdc));
  return paint->hdc;
}

BOOL EndPaint(HWND handle, const PAINTSTRUCT* paint) {
  CloseContext(handle, paint->hdc);
  ShowCaret(handle);
  return TRUE;
}

BOOL GetUpdateRect(HWND handle, LPRECT rect, BOOL erase) {
  if (erase) EraseNow(handle);
  const Guard guard;
  const Window* window = Expect(handle);
  if (window == nullptr) return FALSE;
  const RECT client = ClientInWindow(window);
  Region region = UpdateOf(window);
  region.Intersect(client);
  if (rect != nullptr) *rect = region.IsEmpty() ? RECT{} : Moved(region.Bounds(), -client.left, -client.top);
  return !region.IsEmpty();
}

int GetUpdateRgn(HWND handle, HRGN target, BOOL erase) {
  if (erase) EraseNow(handle);
  const Guard guard;
  const Window* window = Expect(handle);
  pixman_region32_t* result = platform::g_painter.region != nullptr ? platform::g_painter.region(target) : nullptr;
  if (window == nullptr || result == nullptr) return 0;
  const RECT client = ClientInWindow(window);
  Region region = UpdateOf(window);
  region.Intersect(client);
  region.Move(-client.left, -client.top);
  pixman_region32_copy(result, region.Pixman());
  constexpr int kEmpty = 1, kSimple = 2, kComplex = 3;
  return region.IsEmpty() ? kEmpty : pixman_region32_n_rects(result) == 1 ? kSimple : kComplex;
}

// Nothing is painted and kept back: the calls only remember which window it is.
BOOL LockWindowUpdate(HWND handle) {
  static HWND locked = nullptr;
  const Guard guard;
  if (handle != nullptr && FindWindowObject(locked) != nullptr) return FALSE;
  if (handle == nullptr) {
    if (Window* window = FindWindowObject(locked))
      Invalidate(window, Region(AtOrigin(window->window)), Erase::Yes, Children::All);
  } else if (Expect(handle) == nullptr) {
    return FALSE;
  }
  locked = handle;
  return TRUE;
}
