// SetWindowPos and its relatives. SetWindowPos reads as the list of what the program hears of it.

#include "qxcore/platform/posix/window/place.h"

#include "qxcore/platform/posix/window/activate.h"
#include "qxcore/platform/posix/window/children_area.h"
#include "qxcore/platform/posix/window/controls.h"
#include "qxcore/platform/posix/window/default_proc.h"
#include "qxcore/platform/posix/window/deferred_copies.h"
#include "qxcore/platform/posix/window/on_display.h"
#include "qxcore/platform/posix/window/paint.h"
#include "qxcore/platform/posix/window/placing.h"
#include "qxcore/platform/posix/window/send.h"
#include "qxcore/platform/posix/window/thread.h"
#include "qxcore/platform/posix/window/tree.h"

namespace platform::model {
namespace {

constexpr UINT kAnyChange = SWP_NOSIZE | SWP_NOMOVE | SWP_NOZORDER | SWP_FRAMECHANGED | SWP_SHOWWINDOW | SWP_HIDEWINDOW;
constexpr UINT kNoChange = SWP_NOSIZE | SWP_NOMOVE | SWP_NOZORDER;

bool IsTopmost(const Window* window) { return window->exStyle & WS_EX_TOPMOST; }

// The sibling below which the window belongs; null for the top. Windows that are topmost stay above the others.
Window* PlaceInOrder(const Window* window, HWND after) {
  Window* parent = window->parent;
  if (after == HWND_BOTTOM) return parent->lastChild != window ? parent->lastChild : window->previous;
  if (Window* above = FindWindowObject(after); above != nullptr && above != window && above->parent == parent)
    return above;
  if (IsTopmost(window)) return nullptr;
  Window* last = nullptr;
  if (parent == Desktop())
    for (Window* each = parent->firstChild; each != nullptr && (IsTopmost(each) || each == window); each = each->next)
      if (each != window) last = each;
  return last;
}

// Whether the place in the Z order is the one that is asked for already.
bool IsInPlace(const Window* window, HWND after) {
  if (after == HWND_TOP) return window->previous == nullptr;
  if (after == HWND_TOPMOST) return IsTopmost(window) && window->previous == nullptr;
  if (after == HWND_NOTOPMOST) return !IsTopmost(window);
  if (after == HWND_BOTTOM) return window->next == nullptr;
  return after == window->handle || (window->previous != nullptr && window->previous->handle == after);
}

// Completes a request: what changes nothing is marked so. Under the lock.
void Settle(const Window* window, WINDOWPOS& place) {
  place.cx = std::clamp(place.cx, 0, 32767);
  place.cy = std::clamp(place.cy, 0, 32767);
  const RECT& now = window->window;
  if (place.flags & SWP_NOSIZE) {
    place.cx = Width(now);
    place.cy = Height(now);
  }
  if (place.flags & SWP_NOMOVE) {
    place.x = now.left;
    place.y = now.top;
  }
  if (place.cx == Width(now) && place.cy == Height(now)) place.flags |= SWP_NOSIZE;
  if (place.x == now.left && place.y == now.top) place.flags |= SWP_NOMOVE;
  if (window->IsVisible()) {
    place.flags &= ~SWP_SHOWWINDOW;
  } else {
    place.flags &= ~SWP_HIDEWINDOW;
    if (!(place.flags & SWP_SHOWWINDOW)) place.flags |= SWP_NOREDRAW;
  }
  if (!(place.flags & SWP_NOZORDER) && IsInPlace(window, place.hwndInsertAfter)) place.flags |= SWP_NOZORDER;
}

// The new rectangles; asks the window for its client area when the size or the frame changes.
NewPlace Measure(const WINDOWPOS& place, const NewPlace& now) {
  const RECT moved{place.x, place.y, place.x + place.cx, place.y + place.cy};
  const bool asks = (place.flags & SWP_FRAMECHANGED) || !(place.flags & SWP_NOSIZE);
  if (!asks) return {moved, Moved(now.client, moved.left - now.window.left, moved.top - now.window.top)};
  WINDOWPOS copy = place;
  NCCALCSIZE_PARAMS parameters{{moved, now.window, now.client}, &copy};
  Send(place.hwnd, WM_NCCALCSIZE, TRUE, reinterpret_cast<LPARAM>(&parameters));
  return {moved, parameters.rgrc[0]};
}

// Puts the window into the order, and the windows it owns above it. Under the lock.
void Reorder(Window* window, HWND after) {
  if (after == HWND_TOPMOST) window->exStyle |= WS_EX_TOPMOST;
  if (after == HWND_NOTOPMOST || after == HWND_BOTTOM) window->exStyle &= ~WS_EX_TOPMOST;
  Window* parent = window->parent;
  Window* above = PlaceInOrder(window, after);
  if (above != window->previous) {
    if (above == window) return;
    Unlink(window);
    Link(window, parent, above);
    if (window->IsChild() && window->IsVisible()) SpoilByOrder(window);
  }
  if (parent == Desktop() && after == HWND_TOP) RaiseTopLevel(window);
}

// Where a window has no pixels that could move along: it is hidden there. Windows of a batch have nothing above them.
Region HiddenPart(const Window* window, Uncovers uncovers) {
  const RECT whole = AtOrigin(window->window), clip = ClipByParents(window);
  if (uncovers == Uncovers::Later && Same(whole, clip)) return {};
  Region hidden(whole), visible(clip);
  if (uncovers == Uncovers::Now) VisibleRegion(window, false, &visible);
  hidden.Subtract(visible);
  return hidden;
}

// What was hidden moves along, and may show now.
void SpoilHidden(Window* window, Region hidden, const Placing& placing) {
  if (hidden.IsEmpty() || !placing.isShown) return;
  const NewPlace &from = placing.from, &to = placing.to;
  const int dx = to.client.left - to.window.left - (from.client.left - from.window.left);
  const int dy = to.client.top - to.window.top - (from.client.top - from.window.top);
  hidden.Move(dx, dy);
  Invalidate(window, hidden, Erase::Yes, Children::All);
}

// Under the lock: the change itself, and what of the screen it spoils.
void Apply(Window* window, Placing& placing, Uncovers uncovers) {
  WINDOWPOS& place = placing.place;
  const NewPlace& to = placing.to;
  const RECT oldClient = window->client;
  const bool moves = window->window.left != to.window.left || window->window.top != to.window.top;
  const bool wasVisible = window->IsVisible();
  placing.from = {window->window, window->client};
  placing.wasShown = IsShown(window);
  const bool takesPixels = moves && window->IsChild() && placing.wasShown && !(place.flags & SWP_NOREDRAW);
  Region hidden;
  if (takesPixels) hidden = HiddenPart(window, uncovers);
  placing.isUnpainted = IsUnpainted(window);
  if (!(place.flags & SWP_NOZORDER)) Reorder(window, place.hwndInsertAfter);
  window->window = to.window;
  window->client = to.client;
  if (place.flags & SWP_SHOWWINDOW) window->style |= WS_VISIBLE;
  if (place.flags & SWP_HIDEWINDOW) {
    window->style &= ~WS_VISIBLE;
    DropPaint(window);
  }
  placing.isShown = window->IsVisible() == wasVisible ? placing.wasShown : IsShown(window);
  if (wasVisible || window->IsVisible()) SceneChanged(window);
  if (oldClient.left == to.client.left && oldClient.top == to.client.top) place.flags |= kNoClientMove;
  if (Width(oldClient) == Width(to.client) && Height(oldClient) == Height(to.client)) place.flags |= kNoClientSize;
  if (place.flags & SWP_NOREDRAW) return;
  if (placing.wasShown && uncovers == Uncovers::Now) placing.spoilsParent = UncoverByMove(window, placing.from.window);
  SpoilHidden(window, std::move(hidden), placing);
  if (placing.isShown) SpoilByMove(window, placing.from.window, oldClient, placing.wasShown, place.flags);
  placing.isUnpainted |= IsUnpainted(window);
}

// Under the lock: whether pixels that wait to be copied would be looked for in the wrong place afterwards. In a batch,
// siblings may move.
bool MovesOthers(const Window* window, const Placing& placing, Uncovers uncovers) {
  const DeferredCopies& deferred = CurrentThread()->deferredCopies;
  if (deferred.copies.empty()) return false;
  if (uncovers == Uncovers::Later && HandleOf(window->parent) == deferred.parent) return false;
  const RECT &from = window->client, &to = placing.to.client;
  return from.left != to.left || from.top != to.top || placing.place.flags & (SWP_SHOWWINDOW | SWP_HIDEWINDOW);
}

// The request as the window wants it, and the place that it asks for. False when there is no such window any more.
bool Propose(Placing& placing) {
  WINDOWPOS& place = placing.place;
  const HWND handle = place.hwnd;
  if (!(place.flags & SWP_NOSENDCHANGING)) Send(handle, WM_WINDOWPOSCHANGING, 0, reinterpret_cast<LPARAM>(&place));
  NewPlace now;
  {
    const Guard guard;
    const Window* window = Expect(handle);
    if (window == nullptr) return false;
    Settle(window, place);
    now = {window->window, window->client};
  }
  placing.to = Measure(place, now);
  return true;
}

HWND ParentHandle(HWND handle) {
  const Guard guard;
  const Window* window = FindWindowObject(handle);
  return window != nullptr && window->IsChild() ? HandleOf(window->parent) : nullptr;
}

}  // namespace

bool Begin(Placing& placing, Uncovers uncovers) {
  if (!Propose(placing)) return false;
  const HWND handle = placing.place.hwnd;
  const Guard guard;
  Window* window = Expect(handle);
  if (window != nullptr && MovesOthers(window, placing, uncovers)) {
    {
      const Unguarded unguarded;
      CopyNow();
    }
    window = Expect(handle);
  }
  if (window == nullptr) return false;
  Apply(window, placing, uncovers);
  placing.isWaiting = CopyLater(window, placing);
  return placing.isDone = true;
}

bool Finish(Placing& placing) {
  WINDOWPOS& place = placing.place;
  const HWND handle = place.hwnd;
  ShowOnDisplay(handle);
  if (!(place.flags & (SWP_NOACTIVATE | SWP_HIDEWINDOW))) {
    if (ParentHandle(handle) != nullptr) {
      Send(handle, WM_CHILDACTIVATE);
    } else {
      SetForegroundWindow(handle);
    }
  }
  if (!(place.flags & (SWP_NOREDRAW | SWP_DEFERERASE))) {
    if (const HWND parent = placing.spoilsParent ? ParentHandle(handle) : nullptr) EraseNow(parent);
    EraseNow(handle);
  }
  if ((place.flags & kAnyChange) != kNoChange) Send(handle, WM_WINDOWPOSCHANGED, 0, reinterpret_cast<LPARAM>(&place));
  return IsWindow(handle);
}

bool PlaceNow(Placing& placing) {
  if (!Begin(placing, Uncovers::Now)) return false;
  if (placing.isWaiting) CopyNow();
  ShiftClient(placing);
  return Finish(placing);
}

LRESULT DefaultPosChanging(HWND handle, WINDOWPOS* place) {
  if (place->flags & SWP_NOSIZE) return 0;
  DWORD style = 0;
  {
    const Guard guard;
    const Window* window = FindWindowObject(handle);
    if (window == nullptr) return 0;
    style = window->style;
  }
  if (!(style & WS_THICKFRAME) && (style & (WS_POPUP | WS_CHILD))) return 0;
  const MINMAXINFO limits = AskLimits(handle);
  place->cx = std::min<int>(place->cx, limits.ptMaxTrackSize.x);
  place->cy = std::min<int>(place->cy, limits.ptMaxTrackSize.y);
  if (!(style & WS_MINIMIZE)) {
    place->cx = std::max<int>(place->cx, limits.ptMinTrackSize.x);
    place->cy = std::max<int>(place->cy, limits.ptMinTrackSize.y);
  }
  return 0;
}

LRESULT DefaultPosChanged(HWND handle, const WINDOWPOS* place) {
  RECT client{};
  DWORD style = 0;
  {
    const Guard guard;
    const Window* window = FindWindowObject(handle);
    if (window == nullptr) return 0;
    client = window->client;
    style = window->style;
  }
  if (!(place->flags & kNoClientMove)) Send(handle, WM_MOVE, 0, PointParam(client.left, client.top));
  if (!(place->flags & kNoClientSize) || (place->flags & kStateChanged)) {
    const WPARAM how = style & WS_MINIMIZE ? SIZE_MINIMIZED : style & WS_MAXIMIZE ? SIZE_MAXIMIZED : SIZE_RESTORED;
    if (how == SIZE_MINIMIZED) client = {};
    Send(handle, WM_SIZE, how, PointParam(Width(client), Height(client)));
  }
  return 0;
}

}  // namespace platform::model

using namespace platform::model;

BOOL SetWindowPos(HWND handle, HWND after, int x, int y, int width, int height, UINT flags) {
  CurrentThread();
  {
    const Guard guard;
    const Window* window = Expect(handle);
    if (window == nullptr) return FALSE;
    if (IsRoot(window)) return FALSE;
  }
  Placing placing{{handle, after, x, y, width, height, flags}};
  return PlaceNow(placing);
}

BOOL MoveWindow(HWND window, int x, int y, int width, int height, BOOL repaint) {
  return SetWindowPos(window, nullptr, x, y, width, height,
                      SWP_NOZORDER | SWP_NOACTIVATE | (repaint ? 0u : SWP_NOREDRAW));
}

BOOL BringWindowToTop(HWND window) { return SetWindowPos(window, HWND_TOP, 0, 0, 0, 0, SWP_NOSIZE | SWP_NOMOVE); }
