// Contexts of the screen and of windows. A top-level window's pixels are a bitmap that keeps its content while the
// window changes its size; the windows below it draw on parts of it.
#include <algorithm>

#include "qxcore/platform/posix/draw/fill.h"
#include "qxcore/platform/posix/draw/window_surface.h"
#include "qxcore/platform/posix/window/deferred_copies.h"
#include "qxcore/platform/posix/window/on_display.h"
#include "qxcore/platform/posix/window/target.h"

using namespace draw;

namespace draw {

namespace {

using Kept = Ref<Bitmap>;

// A bitmap of a new size with what the former one held.
Ref<Bitmap> Resized(const Ref<Bitmap>& former, SIZE size) {
  Ref<Bitmap> bitmap(Bitmap::Make(std::max(size.cx, 1), std::max(size.cy, 1), 32));
  if (!bitmap) return former;
  int width = former ? std::min(former->m_surface.width, bitmap->m_surface.width) : 0;
  int height = former ? std::min(former->m_surface.height, bitmap->m_surface.height) : 0;
  for (int y = 0; y < height; ++y) std::copy_n(former->m_surface.Row(y), width, bitmap->m_surface.Row(y));
  return bitmap;
}

bool Fits(const Kept& slot, SIZE size) {
  return slot && slot->m_surface.width == std::max(size.cx, 1) && slot->m_surface.height == std::max(size.cy, 1);
}

// The bitmap in a top-level window's slot, made or resized as needed; null when there is no memory.
Ref<Bitmap> SurfaceIn(void** place, SIZE size) {
  if (!*place) *place = new Kept;
  Kept& slot = *static_cast<Kept*>(*place);
  if (Fits(slot, size)) return slot;
  platform::model::CopyNow();  // from what may be cut off
  slot = Resized(slot, size);
  return slot;
}

}  // namespace

// `clip` is in the context's own coordinates; null takes all that is visible.
HDC OpenWindow(HWND window, bool isWhole, const pixman_region32_t* clip) try {
  platform::model::Target target;
  if (!platform::model::FindTarget(window, isWhole, &target)) return nullptr;
  Ref<Bitmap> surface = SurfaceIn(target.surface, target.size);
  Ref<Context> dc(surface ? new Context(OBJ_DC) : nullptr);
  if (!dc) return NoMemory(HDC{});
  Area visible(target.visible.Pixman());
  if (clip) {
    Area within(clip);
    within.Offset(target.origin.x, target.origin.y);
    visible.And(within);
  }
  dc->m_window = window;
  dc->m_top = target.top;
  dc->SetTarget(surface, target.origin, visible);
  return EnterAs<HDC>(dc.get());
} catch (const std::bad_alloc&) {
  return NoMemory(HDC{});
}

const Surface* GrownSurface(void* surface, SIZE size) {
  Kept& slot = *static_cast<Kept*>(surface);
  if (!slot) return nullptr;
  const SIZE larger{std::max(size.cx, slot->m_surface.width), std::max(size.cy, slot->m_surface.height)};
  if (!Fits(slot, larger)) slot = Resized(slot, larger);
  return &slot->m_surface;
}

bool IsSurfaceInUse(void* surface) {
  const Kept& slot = *static_cast<Kept*>(surface);
  return slot && slot->m_references > 1;
}

void FreeWindowSurface(void* surface) { delete static_cast<Kept*>(surface); }

const Surface* WindowSurface(void* surface) {
  auto* slot = static_cast<Kept*>(surface);
  return slot && *slot ? &(*slot)->m_surface : nullptr;
}

}  // namespace draw

namespace {

// The screen: it has the screen's colours and measures text, but nothing of it can be drawn on.
HDC ScreenContext() try {
  static Bitmap* const pixel = [] {
    Bitmap* made = Bitmap::Make(1, 1, 32);
    if (!Enter(made)) throw std::bad_alloc();
    made->m_permanent = true;
    return made;
  }();
  auto* dc = new Context(OBJ_DC);
  if (dc) dc->SetTarget(pixel, POINT{}, Area());
  return EnterAs<HDC>(dc);
} catch (const std::bad_alloc&) {
  return NoMemory(HDC{});
}

// What was drawn on a window goes to the display.
void ShowDrawn(const Context& dc) {
  if (!dc.m_top || !dc.WasDrawnOn()) return;
  const Surface& surface = dc.m_surface;
  const Box& drawn = dc.VisibleExtents();
  platform::model::PresentOnDisplay(dc.m_top, {surface.pixels, surface.stride, surface.width, surface.height},
                                    {drawn.x1, drawn.y1, drawn.x2, drawn.y2});
}

}  // namespace

HDC GetDC(HWND window) { return window ? OpenWindow(window, false, nullptr) : ScreenContext(); }

HDC GetWindowDC(HWND window) { return window ? OpenWindow(window, true, nullptr) : ScreenContext(); }

int ReleaseDC(HWND, HDC handle) {
  auto* dc = Find<Context>(handle);
  if (!dc || dc->m_type != OBJ_DC) return 0;
  ShowDrawn(*dc);
  return Remove(handle) ? 1 : 0;
}

HWND WindowFromDC(HDC handle) {
  auto* dc = Find<Context>(handle);
  return dc ? dc->m_window : nullptr;
}
