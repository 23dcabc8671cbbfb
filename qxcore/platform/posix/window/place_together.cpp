// Batches: windows that move together.

#include <algorithm>

#include "qxcore/platform/posix/window/controls.h"
#include "qxcore/platform/posix/window/paint.h"
#include "qxcore/platform/posix/window/placing.h"

namespace platform::model {
namespace {

struct Batch : OnModelHeap {
  List<Placing> placings;
  // For the end of windows that move together; their room is made at the beginning.
  List<PixelMove> moves;
  List<pixman_box32_t> left, taken;
};

pixman_box32_t BoxOf(const RECT& rect) { return {rect.left, rect.top, rect.right, rect.bottom}; }

// Under the lock: what comes to light of the parent when all are in their new places. Where one window made room for
// another, nothing does. The windows of a batch have one parent, as published; another one uncovers for itself.
void UncoverTogether(Batch* batch) {
  auto& [placings, moves, left, taken] = *batch;
  Window* parent = nullptr;
  for (const Placing& placing : placings) {
    Window* window = placing.isDone ? FindWindowObject(placing.place.hwnd) : nullptr;
    if (window == nullptr || !placing.wasShown || placing.place.flags & SWP_NOREDRAW) continue;
    if (parent == nullptr && !IsRoot(window->parent)) parent = window->parent;
    if (window->parent != parent) {
      UncoverByMove(window, placing.from.window);
      continue;
    }
    left.push_back(BoxOf(placing.from.window));
    if (IsShown(window)) taken.push_back(BoxOf(window->window));
  }
  if (parent == nullptr) return;
  Region uncovered(left.data(), left.size());
  uncovered.Subtract(Region(taken.data(), taken.size()));
  Uncover(parent, &uncovered);
}

bool Meets(const RECT& a, const RECT& b) {
  return a.left < b.right && b.left < a.right && a.top < b.bottom && b.top < a.bottom;
}

// Whether the pixels of `moves[at]` are written over before they are read, when all move in their order.
bool IsOverwritten(const List<PixelMove>& moves, std::size_t at) {
  const RECT source = Moved(moves[at].target, -moves[at].dx, -moves[at].dy);
  for (std::size_t i = 0; i < at; ++i)
    if (Meets(moves[i].target, source)) return true;
  return false;
}

bool IsAnyOverwritten(const List<PixelMove>& moves) {
  for (std::size_t at = 1; at < moves.size(); ++at)
    if (IsOverwritten(moves, at)) return true;
  return false;
}

// In a grid that shrinks each window moves to where the one before it was; in one that grows, the last must move first.
// A window whose pixels are lost either way is painted anew.
void MoveTogether(List<PixelMove>& moves) {
  const bool goesBack = IsAnyOverwritten(moves);
  if (goesBack) std::reverse(moves.begin(), moves.end());
  for (std::size_t at = 0; at < moves.size(); ++at) {
    const PixelMove& move = moves[at];
    if (goesBack && IsOverwritten(moves, at)) {
      RedrawWindow(move.window, nullptr, nullptr, RDW_INVALIDATE | RDW_ERASE | RDW_FRAME | RDW_ALLCHILDREN);
    } else {
      g_painter.movePixels(move.window, move.to, move.dx, move.dy);
    }
  }
}

// Windows that may be erased later change the screen once, all together, before they hear of it.
bool PlaceTogether(Batch* batch) {
  bool isDone = true;
  for (Placing& placing : batch->placings) isDone &= Begin(placing, Uncovers::Later);
  {
    const Guard guard;
    UncoverTogether(batch);
  }
  for (const Placing& placing : batch->placings) {
    const PixelMove move = placing.isDone ? KeptPixels(placing) : PixelMove{};
    if (move.window != nullptr) batch->moves.push_back(move);
  }
  MoveTogether(batch->moves);
  for (Placing& placing : batch->placings) isDone &= placing.isDone && IsWindow(placing.place.hwnd) && Finish(placing);
  return isDone;
}

bool PlaceOneByOne(Batch* batch) {
  bool isDone = true;
  for (Placing& placing : batch->placings) isDone &= PlaceNow(placing);
  return isDone;
}

bool MakeRoom(Batch* batch) {
  return OrNoMemory<bool>(false, [batch] {
    const std::size_t count = batch->placings.size();
    batch->moves.reserve(count);
    batch->left.reserve(count);
    batch->taken.reserve(count);
    return true;
  });
}

// Whether no window hides a part of another one. What it hid could not be told any more once both have moved.
bool AreApart(Batch* batch) {
  const Guard guard;
  List<pixman_box32_t>& places = batch->left;
  long long sum = 0;
  for (const Placing& placing : batch->placings) {
    const Window* window = FindWindowObject(placing.place.hwnd);
    if (window == nullptr || !IsShown(window)) continue;
    places.push_back(BoxOf(window->window));
    sum += Region(window->window).Area();
  }
  const bool areApart = Region(places.data(), places.size()).Area() == sum;
  places.clear();
  return areApart;
}

bool MayEraseLater(const Batch& batch) {
  return std::all_of(batch.placings.begin(), batch.placings.end(),
                     [](const Placing& placing) { return (placing.place.flags & SWP_DEFERERASE) != 0; });
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
  if (FindWindowObject(window) == nullptr) return end(ERROR_INVALID_WINDOW_HANDLE);
  for (Placing& placing : batch->placings) {
    WINDOWPOS& place = placing.place;
    if (place.hwnd != window) continue;
    if (!(flags & SWP_NOZORDER)) place.hwndInsertAfter = after;
    if (!(flags & SWP_NOMOVE)) place.x = x, place.y = y;
    if (!(flags & SWP_NOSIZE)) place.cx = width, place.cy = height;
    constexpr UINT kDenials =
        SWP_NOSIZE | SWP_NOMOVE | SWP_NOZORDER | SWP_NOREDRAW | SWP_NOACTIVATE | SWP_NOCOPYBITS | SWP_NOOWNERZORDER;
    place.flags = (place.flags & flags & kDenials) | ((place.flags | flags) & ~kDenials);
    return handle;
  }
  try {
    batch->placings.push_back({{window, after, x, y, width, height, flags}});
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
  const bool movesTogether = MayEraseLater(*batch) && MakeRoom(batch) && AreApart(batch);
  const BOOL result = movesTogether ? PlaceTogether(batch) : PlaceOneByOne(batch);
  delete batch;
  return result;
}
