// Which parts of windows are invalid: kept with the window as a region, turned into WM_PAINT when the queue is
// otherwise empty.

#include <iterator>

#include "qxcore/platform/posix/window/children_area.h"
#include "qxcore/platform/posix/window/controls.h"
#include "qxcore/platform/posix/window/frame.h"
#include "qxcore/platform/posix/window/paint.h"
#include "qxcore/platform/posix/window/place.h"
#include "qxcore/platform/posix/window/queue.h"
#include "qxcore/platform/posix/window/send.h"
#include "qxcore/platform/posix/window/tree.h"

namespace platform::model {
namespace {

// A child's rectangle relative to the parent's window.
RECT ChildInWindow(const Window* parent, const Window* child) {
  const RECT client = ClientInWindow(parent);
  return Moved(child->window, client.left, client.top);
}

// Whether nothing can be added to what is to be painted of a window of which `shown` shows.
bool IsAllInvalid(const Window* window, const RECT& shown) {
  if (!window->wantsPaint || !window->eraseUpdate || !window->frameUpdate) return false;
  if (window->firstChild != nullptr && window->childrenInvalidAt != g_scene) return false;
  return window->update.Covers(shown);
}

void InvalidateChildren(Window* window, const Region& region, Erase erase, Children children) {
  if (window->childrenInvalidAt == g_scene) return;
  const RECT bounds = region.Bounds(), clip = Common(ClipByParents(window), ClientInWindow(window));
  bool areAllInvalid = true;
  for (Window* child = window->firstChild; child != nullptr; child = child->next) {
    if (!child->IsVisible()) continue;
    const RECT place = ChildInWindow(window, child), shown = Common(place, clip);
    if (IsEmpty(shown) || IsAllInvalid(child, Moved(shown, -place.left, -place.top))) continue;
    areAllInvalid = false;
    if (IsEmpty(Common(shown, bounds)) || region.Misses(place)) continue;
    Region part = region;
    part.Intersect(place);
    if (part.IsEmpty()) continue;
    part.Move(-place.left, -place.top);
    Invalidate(child, part, erase, children);
    if (child->wantsPaint) child->frameUpdate = true;
  }
  if (areAllInvalid) window->childrenInvalidAt = g_scene;
}

void MarkInvalid(Window* window, const Region& region, Erase erase) {
  const RECT client = ClientInWindow(window);
  if (!Same(Common(region.Bounds(), client), region.Bounds())) window->frameUpdate = true;
  if (!region.Misses(client) && erase == Erase::Yes) window->eraseUpdate = true;
  window->update.Add(region);
  SetWantsPaint(window, true);
}

Region SiblingsAbove(const Window* window) {
  Region region;
  for (const Window* other = window->previous; other != nullptr; other = other->previous)
    if (other->IsVisible() && !IsEmpty(Common(other->window, window->window)))
      region.Add(Moved(other->window, -window->window.left, -window->window.top));
  return region;
}

// All of the window but the part that is kept of it. Where that is to be painted as it is, as after sizes to and fro,
// there is nothing to add.
void InvalidateAround(Window* window, const RECT& whole, const RECT& kept) {
  const RECT sides[] = {{whole.left, whole.top, whole.right, kept.top},
                        {whole.left, kept.top, kept.left, kept.bottom},
                        {kept.right, kept.top, whole.right, kept.bottom},
                        {whole.left, kept.bottom, whole.right, whole.bottom}};
  const bool isMarked = window->firstChild == nullptr && window->eraseUpdate &&
                        (window->frameUpdate || Same(ClientInWindow(window), whole));
  pixman_box32_t added[std::size(sides)];
  std::size_t count = 0;
  for (const RECT& side : sides)
    if (!IsEmpty(side) && !(isMarked && window->update.Holds(side)))
      added[count++] = {side.left, side.top, side.right, side.bottom};
  if (count > 0) Invalidate(window, Region(added, count), Erase::Yes, Children::All);
}

}  // namespace

RECT ClipByParents(const Window* window) {
  RECT clip = AtOrigin(window->window);
  int dx = window->window.left, dy = window->window.top;
  for (const Window* above = window->parent; above != nullptr && !IsRoot(above); above = above->parent) {
    clip = Common(clip, Moved(AtOrigin(above->client), -dx, -dy));
    dx += above->client.left;
    dy += above->client.top;
  }
  return clip;
}

bool IsClientInvalid(const Window* window, Erase erase) {
  const bool isMarked = window->wantsPaint && (erase == Erase::No || window->eraseUpdate);
  return isMarked && window->update.Covers(ClientInWindow(window));
}

bool IsUnpainted(const Window* window) {
  const bool isMarked = window->wantsPaint && window->eraseUpdate && window->frameUpdate;
  return isMarked && window->firstChild == nullptr && IsAllInvalid(window, ClipByParents(window));
}

void SetWantsPaint(Window* window, bool wants) {
  if (window->wantsPaint == wants) return;
  window->wantsPaint = wants;
  const int step = wants ? 1 : -1;
  for (Window* each = window; each != nullptr; each = each->parent) each->childPaints += step;
  window->thread->paints += step;
  if (!wants) return;
  window->thread->changed |= QS_PAINT;
  if (!window->thread->isWoken) Wake(window->thread);
}

void VisibleRegion(const Window* window, bool withoutChildren, Region* region) {
  region->Clear();
  if (!IsShown(window)) return;
  region->Add(ClipByParents(window));
  int dx = 0, dy = 0;
  for (const Window* each = window; !IsRoot(each) && !IsRoot(each->parent); each = each->parent) {
    if (each->style & WS_CLIPSIBLINGS) {
      Region covered = SiblingsAbove(each);
      covered.Move(dx, dy);
      region->Subtract(covered);
    }
    const RECT place = ChildInWindow(each->parent, each);
    dx -= place.left;
    dy -= place.top;
  }
  if (withoutChildren) SubtractChildren(window, region);
}

void Invalidate(Window* window, const Region& region, Erase erase, Children children) {
  if (IsRoot(window) || !IsShown(window)) return;
  Region part = region;
  part.Intersect(ClipByParents(window));
  if (part.IsEmpty()) return;
  const bool clips = window->style & WS_CLIPCHILDREN;
  if (children == Children::All || (children == Children::Unclipped && !clips))
    InvalidateChildren(window, part, erase, children);
  if (!clips) return MarkInvalid(window, part, erase);
  // All of the client area stays one rectangle: nothing can be added to it, whatever the children do.
  const bool isAll = part.Covers(ClientInWindow(window));
  const Region all = isAll ? part : Region();
  SubtractChildren(window, &part);
  if (!part.IsEmpty()) MarkInvalid(window, isAll ? all : part, erase);
}

Region UpdateOf(const Window* window) {
  Region update = window->update;
  if (window->style & WS_CLIPCHILDREN && !update.IsEmpty()) SubtractChildren(window, &update);
  return update;
}

void Validate(Window* window, const Region* region, Children children) {
  if (window->IsVisible()) ForgetAllInvalid(window);
  if (region != nullptr) {
    window->update.Subtract(*region);
  } else {
    window->update.Clear();
  }
  if (UpdateOf(window).IsEmpty()) {
    window->update.Clear();
    window->eraseUpdate = window->frameUpdate = false;
    if (!window->internalPaint) SetWantsPaint(window, false);
  }
  if (children == Children::No || window->childPaints == 0) return;
  for (Window* child = window->firstChild; child != nullptr; child = child->next) {
    if (region == nullptr) {
      Validate(child, nullptr, children);
      continue;
    }
    const RECT place = ChildInWindow(window, child);
    Region part = *region;
    part.Move(-place.left, -place.top);
    Validate(child, &part, children);
  }
}

void ForgetAllInvalid(Window* window) {
  if (window->parent != nullptr) window->parent->childrenInvalidAt = 0;
}

void DropPaint(Window* window) {
  if (window->childPaints == 0) return;
  window->internalPaint = false;
  Validate(window, nullptr, Children::No);
  for (Window* child = window->firstChild; child != nullptr; child = child->next) DropPaint(child);
}

void SpoilByOrder(Window* window) {
  for (Window* other = window->parent->firstChild; other != nullptr; other = other->next) {
    if (other == window || !other->IsVisible()) continue;
    const RECT both = Common(window->window, other->window);
    if (IsEmpty(both)) continue;
    for (Window* each : {window, other})
      Invalidate(each, Region(Moved(both, -each->window.left, -each->window.top)), Erase::Yes, Children::All);
  }
}

void UncoverBetween(Window* parent, Region uncovered) {
  if (!IsShown(parent)) return;
  const RECT client = ClientInWindow(parent);
  uncovered.Move(client.left, client.top);
  uncovered.Intersect(Common(client, ClipByParents(parent)));
  if (!uncovered.IsEmpty()) MarkInvalid(parent, uncovered, Erase::Yes);
}

bool UncoverByMove(Window* window, const RECT& oldWindow) {
  Window* parent = window->parent;
  if (IsRoot(parent)) return false;
  const RECT client = ClientInWindow(parent);
  Region uncovered(oldWindow);
  if (IsShown(window)) uncovered.Subtract(window->window);
  uncovered.Move(client.left, client.top);
  uncovered.Intersect(client);
  if (uncovered.IsEmpty()) return false;
  Invalidate(parent, uncovered, Erase::Yes, Children::All);
  return true;
}

void SpoilByMove(Window* window, const RECT& oldWindow, const RECT& oldClient, bool wasShown, UINT flags) {
  const RECT whole = AtOrigin(window->window);
  if (!wasShown) {
    Invalidate(window, Region(whole), Erase::Yes, Children::All);
    if (window->wantsPaint) window->frameUpdate = true;
    return;
  }
  const bool sameSize = Width(oldWindow) == Width(whole) && Height(oldWindow) == Height(whole);
  if (sameSize && !(flags & SWP_FRAMECHANGED) && !(flags & SWP_NOCOPYBITS)) return;
  const UINT classStyle = window->windowClass->style;
  const bool redraws = (flags & SWP_NOCOPYBITS) ||
                       ((classStyle & CS_HREDRAW) && Width(oldClient) != Width(window->client)) ||
                       ((classStyle & CS_VREDRAW) && Height(oldClient) != Height(window->client));
  RECT kept = ClientInWindow(window);
  kept.right = std::min(kept.right, kept.left + Width(oldClient));
  kept.bottom = std::min(kept.bottom, kept.top + Height(oldClient));
  const RECT oldPlace = Moved(oldClient, -oldWindow.left, -oldWindow.top);
  if (sameSize && Same(oldPlace, ClientInWindow(window)) && !redraws) return;
  // Of what the children showed nothing is left outside, and nowhere when all of the window is given up.
  if (flags & SWP_NOCOPYBITS) {
    Invalidate(window, Region(whole), Erase::Yes, Children::All);
  } else {
    InvalidateAround(window, whole, kept);
  }
  if (redraws) Invalidate(window, Region(whole), Erase::Yes, Children::Unclipped);
}

// A parent that does not leave its children out paints first; they would be painted over.
bool WaitsForParent(const Window* window) {
  for (const Window* above = window->parent; above != nullptr && !IsRoot(above); above = above->parent)
    if (above->wantsPaint && !(above->style & WS_CLIPCHILDREN)) return true;
  return false;
}

bool TakePaint(Thread* thread, MSG* message, const Filter& filter, bool remove) {
  if (thread->paints == 0 || !filter.FitsMessage(WM_PAINT)) return false;
  const Window* top = Desktop();
  for (Window* window = top->firstChild; window != nullptr;) {
    if (window->wantsPaint && window->thread == thread && filter.FitsWindow(window->handle)) {
      *message = {window->handle, WM_PAINT, 0, 0, static_cast<DWORD>(Now()), g_cursorPoint};
      if (remove && window->internalPaint) {
        window->internalPaint = false;
        if (UpdateOf(window).IsEmpty()) SetWantsPaint(window, false);
      }
      return true;
    }
    // Into the children only where one of them wants it.
    if (window->childPaints > (window->wantsPaint ? 1 : 0) && window->firstChild != nullptr) {
      window = window->firstChild;
      continue;
    }
    while (window != top && window->next == nullptr) window = window->parent;
    window = window != top ? window->next : nullptr;
  }
  return false;
}

}  // namespace platform::model

using namespace platform::model;

namespace {

// A rectangle or region of the client area as a region of the window; the whole client area for neither.
bool Wanted(const Window* window, const RECT* rect, HRGN handle, Region* region) {
  const RECT client = ClientInWindow(window);
  if (rect != nullptr) {
    region->Add(*rect);
  } else if (handle != nullptr) {
    pixman_region32_t* given = platform::g_painter.region != nullptr ? platform::g_painter.region(handle) : nullptr;
    if (given == nullptr) return Fail<bool>(ERROR_INVALID_HANDLE);
    pixman_region32_copy(region->Pixman(), given);
  } else {
    region->Add(AtOrigin(client));
  }
  region->Move(client.left, client.top);
  return true;
}

Children ChildrenOf(UINT flags) {
  return flags & RDW_NOCHILDREN ? Children::No : flags & RDW_ALLCHILDREN ? Children::All : Children::Unclipped;
}

// Whether all of the client area is invalid as it is: who changes much in a row asks for that each time.
bool IsInvalidAlready(HWND handle, bool erase) {
  const Guard guard;
  const Window* window = FindWindowObject(handle);
  if (window == nullptr || (window->firstChild != nullptr && !(window->style & WS_CLIPCHILDREN))) return false;
  return IsClientInvalid(window, erase ? Erase::Yes : Erase::No);
}

void Change(Window* window, const RECT* rect, HRGN handle, const Region& wanted, UINT flags) {
  const Children children = ChildrenOf(flags);
  if (flags & RDW_INVALIDATE) {
    Region region = wanted;
    if ((flags & RDW_FRAME) && rect == nullptr && handle == nullptr) {
      region.Add(AtOrigin(window->window));
    } else if (!(flags & RDW_FRAME)) {
      region.Intersect(ClientInWindow(window));
    }
    Invalidate(window, region, flags & RDW_ERASE ? Erase::Yes : Erase::No, children);
  } else if (flags & RDW_VALIDATE) {
    if (flags & RDW_NOERASE) window->eraseUpdate = false;
    if (flags & RDW_NOFRAME) window->frameUpdate = false;
    const bool isAll = rect == nullptr && handle == nullptr;
    Validate(window, isAll ? nullptr : &wanted, children == Children::Unclipped ? Children::All : children);
  }
  if (flags & RDW_INTERNALPAINT) {
    window->internalPaint = true;
    SetWantsPaint(window, true);
  } else if (flags & RDW_NOINTERNALPAINT) {
    window->internalPaint = false;
    if (UpdateOf(window).IsEmpty()) SetWantsPaint(window, false);
  }
}

// The windows of a subtree that want WM_PAINT, parents first.
platform::model::List<HWND> Waiting(HWND top, bool deep) {
  platform::model::List<HWND> handles;
  const Guard guard;
  const Window* first = FindWindowObject(top);
  if (first == nullptr) return handles;
  for (const Window* window = first; window != nullptr; window = NextInTree(window, first)) {
    if (window->wantsPaint) handles.push_back(window->handle);
    if (!deep) break;
  }
  return handles;
}

bool StillWaits(HWND handle) {
  const Guard guard;
  const Window* window = FindWindowObject(handle);
  return window != nullptr && window->wantsPaint;
}

void PaintNow(HWND top, bool deep) {
  for (const HWND handle : Waiting(top, deep))
    if (StillWaits(handle)) Send(handle, WM_PAINT);
}

}  // namespace

BOOL RedrawWindow(HWND handle, const RECT* rect, HRGN region, UINT flags) {
  return OrNoMemory<BOOL>(FALSE, [&]() -> BOOL {
    if (handle == nullptr) handle = GetDesktopWindow();
    {
      const Guard guard;
      Window* window = Expect(handle);
      if (window == nullptr) return FALSE;
      Region wanted;
      if (!Wanted(window, rect, region, &wanted)) return FALSE;
      Change(window, rect, region, wanted, flags);
    }
    const bool deep = !(flags & RDW_NOCHILDREN);
    if (flags & RDW_UPDATENOW) {
      PaintNow(handle, deep);
    } else if (flags & RDW_ERASENOW) {
      for (const HWND each : Waiting(handle, deep)) EraseNow(each);
    }
    return TRUE;
  });
}

BOOL UpdateWindow(HWND window) { return RedrawWindow(window, nullptr, nullptr, RDW_UPDATENOW | RDW_ALLCHILDREN); }

// A null window means all windows, as published.
BOOL InvalidateRect(HWND window, const RECT* rect, BOOL erase) {
  if (window == nullptr) {
    const UINT flags = RDW_INVALIDATE | RDW_ALLCHILDREN | RDW_ERASE | RDW_FRAME | RDW_ERASENOW;
    return RedrawWindow(nullptr, nullptr, nullptr, flags);
  }
  if (rect == nullptr && IsInvalidAlready(window, erase)) return TRUE;
  return RedrawWindow(window, rect, nullptr, RDW_INVALIDATE | (erase ? RDW_ERASE : 0));
}

BOOL InvalidateRgn(HWND window, HRGN region, BOOL erase) {
  return RedrawWindow(window, nullptr, region, RDW_INVALIDATE | (erase ? RDW_ERASE : 0));
}

BOOL ValidateRect(HWND window, const RECT* rect) {
  return RedrawWindow(window, rect, nullptr, RDW_VALIDATE | RDW_NOCHILDREN);
}

BOOL ValidateRgn(HWND window, HRGN region) {
  return RedrawWindow(window, nullptr, region, RDW_VALIDATE | RDW_NOCHILDREN);
}
