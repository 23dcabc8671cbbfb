// The fields of a window that GetWindowLong and SetWindowLong reach.

#include <cstring>

#include "qxcore/platform/posix/window/children_area.h"
#include "qxcore/platform/posix/window/paint.h"
#include "qxcore/platform/posix/window/place.h"
#include "qxcore/platform/posix/window/send.h"
#include "qxcore/platform/posix/window/tree.h"

namespace platform::model {
namespace {

LONG_PTR Read(const Window* window, int index) {
  switch (index) {
    case GWL_STYLE:
      return static_cast<LONG>(window->style);
    case GWL_EXSTYLE:
      return static_cast<LONG>(window->exStyle);
    case GWLP_WNDPROC:
      return reinterpret_cast<LONG_PTR>(window->procedure.load());
    case GWLP_HINSTANCE:
      return reinterpret_cast<LONG_PTR>(window->instance);
    case GWLP_HWNDPARENT:
      return reinterpret_cast<LONG_PTR>(HandleOf(window->IsChild() ? window->parent : window->owner));
    case GWLP_ID:
      return static_cast<LONG_PTR>(window->idOrMenu);
    case GWLP_USERDATA:
      return window->userData;
    default:
      return Fail<LONG_PTR>(ERROR_INVALID_INDEX);
  }
}

void Write(Window* window, int index, LONG_PTR value) {
  switch (index) {
    case GWLP_WNDPROC:
      window->procedure = reinterpret_cast<WNDPROC>(value);
      break;
    case GWLP_HINSTANCE:
      window->instance = reinterpret_cast<HINSTANCE>(value);
      break;
    case GWLP_HWNDPARENT:
      if (!window->IsChild()) window->owner = FindWindowObject(reinterpret_cast<HWND>(value));
      break;
    case GWLP_ID:
      window->idOrMenu = static_cast<UINT_PTR>(value);
      break;
    case GWLP_USERDATA:
      window->userData = value;
      break;
    default:
      SetLastError(ERROR_INVALID_INDEX);
  }
}

bool HoldsPointer(int index) { return index == GWLP_WNDPROC || index == GWLP_HINSTANCE || index == GWLP_HWNDPARENT; }

template <class Value>
LONG_PTR Extra(Window* window, int index, const Value* value) {
  if (index + sizeof(Value) > window->extra.size()) return Fail<LONG_PTR>(ERROR_INVALID_INDEX);
  Value old;
  std::memcpy(&old, window->extra.data() + index, sizeof old);
  if (value != nullptr) std::memcpy(window->extra.data() + index, value, sizeof old);
  return static_cast<LONG_PTR>(old);
}

// A style goes through the window, which may change its mind.
LONG_PTR SetStyle(HWND handle, int index, DWORD wanted) {
  STYLESTRUCT styles{0, wanted};
  {
    const Guard guard;
    const Window* window = Expect(handle);
    if (window == nullptr) return 0;
    styles.styleOld = index == GWL_STYLE ? window->style : window->exStyle;
  }
  Send(handle, WM_STYLECHANGING, static_cast<WPARAM>(index), reinterpret_cast<LPARAM>(&styles));
  {
    const Guard guard;
    Window* window = FindWindowObject(handle);
    if (window == nullptr) return 0;
    (index == GWL_STYLE ? window->style : window->exStyle) = styles.styleNew;
    SceneChanged(window);
  }
  Send(handle, WM_STYLECHANGED, static_cast<WPARAM>(index), reinterpret_cast<LPARAM>(&styles));
  return static_cast<LONG>(styles.styleOld);
}

template <class Value>
LONG_PTR Access(HWND handle, int index, const Value* value) {
  if (value != nullptr && (index == GWL_STYLE || index == GWL_EXSTYLE))
    return SetStyle(handle, index, static_cast<DWORD>(*value));
  const Guard guard;
  Window* window = Expect(handle);
  if (window == nullptr) return 0;
  if (index >= 0) return Extra(window, index, value);
  if (sizeof(Value) < sizeof(void*) && HoldsPointer(index)) return Fail<LONG_PTR>(ERROR_INVALID_INDEX);
  const LONG_PTR old = Read(window, index);
  if (value != nullptr) Write(window, index, *value);
  return old;
}

}  // namespace
}  // namespace platform::model

using namespace platform::model;

LONG GetWindowLongW(HWND window, int index) { return static_cast<LONG>(Access<LONG>(window, index, nullptr)); }
LONG SetWindowLongW(HWND window, int index, LONG value) { return static_cast<LONG>(Access(window, index, &value)); }
LONG_PTR GetWindowLongPtrW(HWND window, int index) { return Access<LONG_PTR>(window, index, nullptr); }
LONG_PTR SetWindowLongPtrW(HWND window, int index, LONG_PTR value) { return Access(window, index, &value); }
