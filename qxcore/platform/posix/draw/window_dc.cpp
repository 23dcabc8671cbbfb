// Contexts of the screen and of windows.
#include "qxcore/platform/posix/draw/context.h"

using namespace draw;

namespace {

// The screen: it has the screen's colours and measures text, but nothing of it can be drawn on.
HDC ScreenContext() {
  static Bitmap* const pixel = [] {
    Bitmap* made = Bitmap::Make(1, 1, 32);
    if (Enter(made)) made->m_permanent = true;
    return made;
  }();
  auto* dc = new Context(OBJ_DC);
  if (dc && pixel) dc->SetTarget(pixel, POINT{}, Area());
  return EnterAs<HDC>(dc);
}

}  // namespace

HDC GetDC(HWND window) { return window ? Fail<HDC>(nullptr, ERROR_INVALID_HANDLE) : ScreenContext(); }

HDC GetWindowDC(HWND window) { return GetDC(window); }

int ReleaseDC(HWND, HDC handle) {
  auto* dc = Find<Context>(handle);
  return dc && dc->m_type == OBJ_DC && Remove(handle);
}

HWND WindowFromDC(HDC handle) {
  auto* dc = Find<Context>(handle);
  return dc ? dc->m_window : nullptr;
}
