// Batches: windows that move together.

#include <algorithm>

#include "qxcore/platform/posix/window/children_area.h"
#include "qxcore/platform/posix/window/controls.h"
#include "qxcore/platform/posix/window/deferred_copies.h"
#include "qxcore/platform/posix/window/paint.h"
#include "qxcore/platform/posix/window/thread.h"
#include "qxcore/platform/posix/window/tree.h"

namespace platform::model {
namespace {

int g_batches = 0;  // under the lock

struct Batch : OnModelHeap {
  Batch() { ++g_batches; }
  ~Batch() { --g_batches; }
  Batch(const Batch&) = delete;
  Batch& operator=(const Batch&) = delete;

  List<Placing> placings;
  // For windows that move together.
  HWND parent = nullptr;
  Region before;  // what the parent's children covered; all of its client area, where that is invalid anyway
};

// What comes to light of the parent when all are in their new places: nothing where one window made room for another.
// All of it, when there is no memory to say what.
Region Uncovered(const Batch& batch, Window* parent) {
  try {
    Region uncovered = batch.before;
    uncovered.Subtract(AreaOfChildren(parent).covered);
    for (const Placing& placing : batch.placings)
      if (placing.wasShown && placing.place.flags & SWP_NOREDRAW) uncovered.Subtract(placing.from.window);
    return uncovered;
  } catch (const std::bad_alloc&) {
    return Region(AtOrigin(parent->client));
  }
}

void UncoverTogether(const Batch& batch) {
  const Guard guard;
  Window* parent = FindWindowObject(batch.parent);
  if (parent != nullptr && !IsClientInvalid(parent, Erase::Yes)) UncoverBetween(parent, Uncovered(batch, parent));
}

// A context that is open would draw where pixels wait.
void CopyIfInUse(HWND handle) {
  void* surface = nullptr;
  {
    const Guard guard;
    if (Window* window = FindWindowObject(handle)) surface = TopLevelOf(window)->surface;
  }
  if (surface != nullptr && g_painter.isInUse != nullptr && g_painter.isInUse(surface)) CopyNow();
}

// Windows that may be erased later change the screen once, all together, before they hear of it.
bool PlaceTogether(Batch* batch) {
  bool isDone = true;
  for (Placing& placing : batch->placings) isDone &= Begin(placing, Uncovers::Later);
  UncoverTogether(*batch);
  CopyIfInUse(CurrentThread()->deferredCopies.parent);
  for (Placing& placing : batch->placings) isDone &= placing.isDone && Finish(placing);
  return isDone;
}

bool PlaceOneByOne(Batch* batch) {
  bool isDone = true;
  for (Placing& placing : batch->placings) isDone &= PlaceNow(placing);
  return isDone;
}

// The parent of the windows, which is one as published; null where it is not, and for none.
Window* ParentOf(const Batch& batch) {
  Window* parent = nullptr;
  for (const Placing& placing : batch.placings) {
    const Window* window = FindWindowObject(placing.place.hwnd);
    if (window == nullptr) continue;
    if (parent != nullptr && window->parent != parent) return nullptr;
    parent = window->parent;
  }
  return parent;
}

bool ShowsWhole(const Window* window) {
  Region visible;
  VisibleRegion(window, false, &visible);
  return visible.Covers(visible.Bounds());
}

bool MayEraseLater(const Batch& batch) {
  return std::all_of(batch.placings.begin(), batch.placings.end(),
                     [](const Placing& placing) { return (placing.place.flags & SWP_DEFERERASE) != 0; });
}

// Whether the children of the windows' parent, and the parent itself, lie clear of all others. What one hid of another
// could not be told any more once both have moved.
bool CanMoveTogether(Batch* batch) {
  if (!MayEraseLater(*batch)) return false;
  return OrNoMemory<bool>(false, [batch] {
    const Guard guard;
    Window* parent = ParentOf(*batch);
    if (parent == nullptr || IsRoot(parent) || !ShowsWhole(parent)) return false;
    if (!AreChildrenApart(parent)) return false;
    batch->parent = parent->handle;
    batch->before =
        IsClientInvalid(parent, Erase::Yes) ? Region(AtOrigin(parent->client)) : AreaOfChildren(parent).covered;
    return true;
  });
}

// The request for a window that is in the batch already; null for the first one. Every pane of a large splitter asks.
WINDOWPOS* FormerRequest(Batch& batch, const Window* window) {
  List<Placing>& placings = batch.placings;
  const auto isOf = [window](const Placing& placing) { return placing.place.hwnd == window->handle; };
  if (window->placing < placings.size() && isOf(placings[window->placing])) return &placings[window->placing].place;
  if (g_batches == 1) return nullptr;  // no other batch had the window since
  const auto found = std::find_if(placings.begin(), placings.end(), isOf);
  return found != placings.end() ? &found->place : nullptr;
}

void Join(WINDOWPOS& place, const WINDOWPOS& later) {
  const UINT flags = later.flags;
  if (!(flags & SWP_NOZORDER)) place.hwndInsertAfter = later.hwndInsertAfter;
  if (!(flags & SWP_NOMOVE)) place.x = later.x, place.y = later.y;
  if (!(flags & SWP_NOSIZE)) place.cx = later.cx, place.cy = later.cy;
  constexpr UINT kDenials =
      SWP_NOSIZE | SWP_NOMOVE | SWP_NOZORDER | SWP_NOREDRAW | SWP_NOACTIVATE | SWP_NOCOPYBITS | SWP_NOOWNERZORDER;
  place.flags = (place.flags & flags & kDenials) | ((place.flags | flags) & ~kDenials);
}

}  // namespace
}  // namespace platform::model

using namespace platform::model;

HDWP BeginDeferWindowPos(int count) {
  if (count < 0) return Fail<HDWP>(ERROR_INVALID_PARAMETER);
  return OrNoMemory<HDWP>(nullptr, [&]() -> HDWP {
    const Guard guard;
    Batch* batch = new Batch;
    try {
      batch->placings.reserve(static_cast<std::size_t>(count));
      return static_cast<HDWP>(AddObject(Kind::Batch, batch, nullptr));
    } catch (...) {
      delete batch;
      throw;
    }
  });
}

// A second request for a window joins the first. A failure ends the batch, as published.
HDWP DeferWindowPos(HDWP handle, HWND window, HWND after, int x, int y, int width, int height, UINT flags) {
  const Guard guard;
  Batch* batch = FindAs<Batch, Kind::Batch>(handle);
  if (batch == nullptr) return Fail<HDWP>(ERROR_INVALID_DWP_HANDLE);
  const auto end = [&](DWORD error) {
    delete static_cast<Batch*>(RemoveObject(Kind::Batch, handle));
    return Fail<HDWP>(error);
  };
  Window* object = FindWindowObject(window);
  if (object == nullptr) return end(ERROR_INVALID_WINDOW_HANDLE);
  const WINDOWPOS request{window, after, x, y, width, height, flags};
  if (WINDOWPOS* former = FormerRequest(*batch, object)) {
    Join(*former, request);
    return handle;
  }
  try {
    object->placing = batch->placings.size();
    batch->placings.push_back({request});
    return handle;
  } catch (const std::bad_alloc&) {
    return end(ERROR_NOT_ENOUGH_MEMORY);
  }
}

BOOL EndDeferWindowPos(HDWP handle) {
  Batch* batch = nullptr;
  {
    const Guard guard;
    batch = static_cast<Batch*>(RemoveObject(Kind::Batch, handle));
  }
  if (batch == nullptr) return Fail(ERROR_INVALID_DWP_HANDLE);
  const BOOL result = CanMoveTogether(batch) ? PlaceTogether(batch) : PlaceOneByOne(batch);
  const Guard guard;
  delete batch;
  return result;
}
