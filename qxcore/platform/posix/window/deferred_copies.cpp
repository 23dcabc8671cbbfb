#include "qxcore/platform/posix/window/deferred_copies.h"

#include "qxcore/platform/posix/window/controls.h"
#include "qxcore/platform/posix/window/frame.h"
#include "qxcore/platform/posix/window/paint.h"
#include "qxcore/platform/posix/window/thread.h"
#include "qxcore/platform/posix/window/tree.h"

namespace platform::model {
namespace {

// What stays valid between two places of a window: `kept` relative to the window in its new place, from `source` on,
// relative to the parent's client area. All of it when the window only moved, else the part of the client area that was
// and is there.
struct Stay {
  RECT kept;
  POINT source;
};

Stay StayOf(const NewPlace& from, const NewPlace& to) {
  const RECT oldClient = Moved(from.client, -from.window.left, -from.window.top);
  RECT kept = Moved(to.client, -to.window.left, -to.window.top);
  const bool isSame =
      Same(oldClient, kept) && Width(from.window) == Width(to.window) && Height(from.window) == Height(to.window);
  if (isSame) return {AtOrigin(to.window), {from.window.left, from.window.top}};
  kept.right = std::min(kept.right, kept.left + Width(oldClient));
  kept.bottom = std::min(kept.bottom, kept.top + Height(oldClient));
  return {kept, {from.client.left, from.client.top}};
}

// The note on a window; null without.
DeferredCopy* FindCopy(DeferredCopies& deferred, const Window* window) {
  const std::size_t at = window->deferredCopy;
  const bool isThere = at < deferred.copies.size() && deferred.copies[at].window == window->handle;
  return isThere ? &deferred.copies[at] : nullptr;
}

// The pixels have not been copied since an earlier move: they are where they were before that.
void Extend(DeferredCopy& copy, const Stay& stay, const RECT& oldWindow) {
  const int dx = stay.kept.left - (stay.source.x - oldWindow.left);
  const int dy = stay.kept.top - (stay.source.y - oldWindow.top);
  const RECT former = Moved(copy.kept, dx, dy);
  copy.kept = Common(former, stay.kept);
  copy.at.x += copy.kept.left - former.left;
  copy.at.y += copy.kept.top - former.top;
}

bool StaysValid(const Placing& placing) {
  constexpr UINT kNothingStays = SWP_NOCOPYBITS | SWP_SHOWWINDOW | SWP_HIDEWINDOW;
  return !placing.isUnpainted && !(placing.place.flags & kNothingStays) && placing.isShown;
}

// For one more.
void MakeRoom(DeferredCopies& deferred) {
  const std::size_t count = deferred.copies.size();
  if (count == deferred.copies.capacity()) deferred.copies.reserve(2 * count + 16);
  deferred.moves.reserve(deferred.copies.capacity());
}

bool Note(DeferredCopies& deferred, Window* window, const Placing& placing) {
  const Stay stay = StayOf(placing.from, placing.to);
  if (DeferredCopy* copy = FindCopy(deferred, window)) {
    Extend(*copy, stay, placing.from.window);
    return false;
  }
  const RECT& now = window->window;
  if (stay.source.x == now.left + stay.kept.left && stay.source.y == now.top + stay.kept.top) return false;
  MakeRoom(deferred);
  window->deferredCopy = deferred.copies.size();
  deferred.copies.push_back({window->handle, stay.kept, stay.source});
  const RECT source = Moved(AtOrigin(stay.kept), stay.source.x, stay.source.y);
  deferred.sources = deferred.copies.size() > 1 ? Around(deferred.sources, source) : source;
  deferred.parent = HandleOf(window->parent);
  return true;
}

void PaintAnew(HWND window) {
  RedrawWindow(window, nullptr, nullptr, RDW_INVALIDATE | RDW_ERASE | RDW_FRAME | RDW_ALLCHILDREN);
}

// Under the lock: one of the notes as a copy on the surface of the top-level window; empty for a window that has gone.
MovedPixels OnSurface(const DeferredCopy& copy, const Window* parent, POINT origin) {
  MovedPixels moved;
  const Window* window = FindWindowObject(copy.window);
  if (window == nullptr || window->parent != parent || IsEmpty(copy.kept)) return moved;
  moved.dx = window->window.left + copy.kept.left - copy.at.x;
  moved.dy = window->window.top + copy.kept.top - copy.at.y;
  if (moved.dx == 0 && moved.dy == 0) return moved;
  VisibleRegion(window, false, &moved.to);
  moved.to.Intersect(copy.kept);
  moved.to.Move(origin.x + window->window.left, origin.y + window->window.top);
  return moved;
}

POINT OriginOnSurface(Window* parent) {
  const RECT client = ClientScreenRect(parent), top = ScreenRect(TopLevelOf(parent));
  return {client.left - top.left, client.top - top.top};
}

// What the copies are made on; a null surface where nothing is.
struct Canvas {
  HWND top = nullptr;
  void* surface = nullptr;
  SIZE size{};
};

// The notes become moves.
Canvas Resolve(DeferredCopies& deferred) {
  const Guard guard;
  Window* parent = FindWindowObject(deferred.parent);
  if (parent == nullptr || !IsShown(parent)) return {};
  const POINT origin = OriginOnSurface(parent);
  for (const DeferredCopy& copy : deferred.copies) {
    const MovedPixels moved = OnSurface(copy, parent, origin);
    if (!moved.to.IsEmpty()) deferred.moves.push_back(moved);
  }
  const Window* top = TopLevelOf(parent);
  return {top->handle, top->surface, {Width(top->window), Height(top->window)}};
}

bool CopyAll(DeferredCopies& deferred) {
  const Canvas canvas = Resolve(deferred);
  const List<MovedPixels>& moves = deferred.moves;
  if (canvas.surface == nullptr || moves.empty()) return true;
  return g_painter.movePixels(canvas.top, canvas.surface, canvas.size, moves.data(), moves.size());
}

}  // namespace

bool CopyLater(Window* window, const Placing& placing) {
  if (g_painter.movePixels == nullptr || !window->IsChild() || !StaysValid(placing)) return false;
  try {
    return Note(CurrentThread()->deferredCopies, window, placing);
  } catch (const std::bad_alloc&) {
    Invalidate(window, Region(AtOrigin(window->window)), Erase::Yes, Children::All);
    window->frameUpdate |= window->wantsPaint;
    return false;
  }
}

void ShiftClient(const Placing& placing) {
  if (g_painter.movePixels == nullptr) return;
  Canvas canvas;
  MovedPixels moved;
  {
    const Guard guard;
    const Window* window = FindWindowObject(placing.place.hwnd);
    if (window == nullptr || window->parent != Desktop() || !StaysValid(placing)) return;
    const Stay stay = StayOf(placing.from, placing.to);
    moved.dx = stay.kept.left - (stay.source.x - placing.from.window.left);
    moved.dy = stay.kept.top - (stay.source.y - placing.from.window.top);
    VisibleRegion(window, false, &moved.to);
    moved.to.Intersect(stay.kept);
    canvas = {window->handle, window->surface, {Width(window->window), Height(window->window)}};
  }
  if (canvas.surface == nullptr || moved.to.IsEmpty() || (moved.dx == 0 && moved.dy == 0)) return;
  if (!g_painter.movePixels(canvas.top, canvas.surface, canvas.size, &moved, 1)) PaintAnew(canvas.top);
}

void CopyBefore(HWND top, const RECT& used) {
  const DeferredCopies& deferred = CurrentThread()->deferredCopies;
  if (deferred.copies.empty()) return;
  {
    const Guard guard;
    Window* parent = FindWindowObject(deferred.parent);
    if (parent != nullptr) {
      if (TopLevelOf(parent)->handle != top) return;
      const POINT origin = OriginOnSurface(parent);
      const RECT inParent = Moved(used, -origin.x, -origin.y);
      const bool isElsewhere =
          IsEmpty(Common(inParent, deferred.sources)) && IsEmpty(Common(inParent, AtOrigin(parent->client)));
      if (isElsewhere) return;
    }
  }
  CopyNow();
}

// The notes are taken away first: to invalidate may draw.
void CopyNow() {
  DeferredCopies& waiting = CurrentThread()->deferredCopies;
  if (waiting.copies.empty()) return;
  DeferredCopies deferred;
  std::swap(deferred, waiting);
  if (!CopyAll(deferred)) {
    for (const DeferredCopy& copy : deferred.copies) PaintAnew(copy.window);
  }
  deferred.copies.clear();
  deferred.moves.clear();
  if (waiting.copies.empty()) std::swap(deferred, waiting);  // for the room
}

}  // namespace platform::model
