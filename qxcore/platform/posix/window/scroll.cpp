#include "qxcore/platform/posix/window/scroll.h"

#include "qxcore/platform/posix/window/controls.h"
#include "qxcore/platform/posix/window/default_proc.h"
#include "qxcore/platform/posix/window/frame.h"
#include "qxcore/platform/posix/window/paint.h"
#include "qxcore/platform/posix/window/send.h"
#include "qxcore/platform/posix/window/tree.h"

namespace platform::model {
namespace {

constexpr int kSmallestThumb = 8;  // pixels

ScrollBar* BarOf(Window* window, int which) {
  if (window->scrollBars == nullptr) window->scrollBars = new ScrollBars;
  return which == SB_HORZ ? &window->scrollBars->horizontal : &window->scrollBars->vertical;
}

DWORD StyleBit(int which) { return which == SB_HORZ ? WS_HSCROLL : WS_VSCROLL; }

void ShowBar(HWND handle, DWORD bits, bool show) {
  {
    const Guard guard;
    Window* window = FindWindowObject(handle);
    if (window == nullptr) return;
    const DWORD style = show ? window->style | bits : window->style & ~bits;
    if (style == window->style) return;
    window->style = style;
  }
  SetWindowPos(handle, nullptr, 0, 0, 0, 0, SWP_NOSIZE | SWP_NOMOVE | SWP_NOZORDER | SWP_NOACTIVATE | SWP_FRAMECHANGED);
}

}  // namespace

int LastPosition(const ScrollBar& bar) {
  return std::max(bar.lowest, bar.highest - static_cast<int>(bar.page > 0 ? bar.page - 1 : 0));
}

bool ChangeScrollBar(ScrollBar& bar, const SCROLLINFO& info) {
  const ScrollBar old = bar;
  if (info.fMask & SIF_PAGE) bar.page = info.nPage;
  if (info.fMask & SIF_POS) bar.position = info.nPos;
  if (info.fMask & SIF_RANGE) {
    const bool isValid = info.nMin <= info.nMax;
    bar.lowest = isValid ? info.nMin : 0;
    bar.highest = isValid ? info.nMax : 0;
  }
  const std::int64_t range = static_cast<std::int64_t>(bar.highest) - bar.lowest + 1;
  if (bar.page > range) bar.page = static_cast<UINT>(range);
  bar.position = std::clamp(bar.position, bar.lowest, LastPosition(bar));
  return old.lowest != bar.lowest || old.highest != bar.highest || old.page != bar.page || old.position != bar.position;
}

void ReadScrollBar(const ScrollBar& bar, SCROLLINFO& info) {
  if (info.fMask & SIF_PAGE) info.nPage = bar.page;
  if (info.fMask & SIF_POS) info.nPos = bar.position;
  if (info.fMask & SIF_TRACKPOS) info.nTrackPos = bar.trackPosition;
  if (info.fMask & SIF_RANGE) {
    info.nMin = bar.lowest;
    info.nMax = bar.highest;
  }
}

ScrollParts PartsOf(const ScrollBar& bar, int length) {
  ScrollParts parts;
  parts.arrow = std::min(GetSystemMetrics(SM_CXHSCROLL), length / 2);
  const int track = length - 2 * parts.arrow;
  const int last = LastPosition(bar);
  if (track <= kSmallestThumb || last <= bar.lowest || bar.arrows == ESB_DISABLE_BOTH) return parts;
  const std::int64_t range = static_cast<std::int64_t>(bar.highest) - bar.lowest + 1;
  parts.thumbSize = bar.page == 0 ? std::min(GetSystemMetrics(SM_CXHTHUMB), track - 1)
                                  : std::max<int>(static_cast<int>(track * bar.page / range), kSmallestThumb);
  const std::int64_t room = track - parts.thumbSize;
  const std::int64_t steps = static_cast<std::int64_t>(last) - bar.lowest;
  parts.thumb = parts.arrow + static_cast<int>(room * (static_cast<std::int64_t>(bar.position) - bar.lowest) / steps);
  return parts;
}

int PositionOfThumb(const ScrollBar& bar, int length, int thumb) {
  const ScrollParts parts = PartsOf(bar, length);
  const std::int64_t room = length - 2 * parts.arrow - parts.thumbSize;
  if (room <= 0) return bar.lowest;
  const std::int64_t offset = std::clamp<std::int64_t>(thumb - parts.arrow, 0, room);
  const std::int64_t steps = static_cast<std::int64_t>(LastPosition(bar)) - bar.lowest;
  return bar.lowest + static_cast<int>((offset * steps + room / 2) / room);
}

}  // namespace platform::model

using namespace platform::model;

int SetScrollInfo(HWND handle, int which, LPCSCROLLINFO info, BOOL redraw) {
  if (info == nullptr || (info->cbSize != sizeof(SCROLLINFO) && info->cbSize != sizeof(SCROLLINFO) - sizeof(int)))
    return Fail<int>(ERROR_INVALID_PARAMETER);
  if (which == SB_CTL)
    return static_cast<int>(Send(handle, SBM_SETSCROLLINFO, redraw != 0, reinterpret_cast<LPARAM>(info)));
  if (which != SB_HORZ && which != SB_VERT) return Fail<int>(ERROR_INVALID_PARAMETER);
  return OrNoMemory<int>(0, [&]() -> int {
    bool needed = true, changed = false, wasThere = false, keeps = info->fMask & SIF_DISABLENOSCROLL;
    int position = 0;
    {
      const Guard guard;
      Window* window = Expect(handle);
      if (window == nullptr) return 0;
      ScrollBar* bar = BarOf(window, which);
      changed = ChangeScrollBar(*bar, *info);
      position = bar->position;
      needed = LastPosition(*bar) > bar->lowest;
      wasThere = window->style & StyleBit(which);
      if (keeps) bar->arrows = needed ? ESB_ENABLE_BOTH : ESB_DISABLE_BOTH;
    }
    // A bar with nothing to scroll goes away, and comes back; not so when only its position was set.
    if (info->fMask & (SIF_RANGE | SIF_PAGE) && !(keeps && !needed)) {
      if (needed != wasThere) ShowBar(handle, StyleBit(which), needed);
    } else if (keeps && !wasThere) {
      ShowBar(handle, StyleBit(which), true);
    }
    if (redraw && changed) PaintFrame(handle);
    return position;
  });
}

BOOL GetScrollInfo(HWND handle, int which, LPSCROLLINFO info) {
  if (which == SB_CTL) return Send(handle, SBM_GETSCROLLINFO, 0, reinterpret_cast<LPARAM>(info)) != 0;
  const Guard guard;
  const Window* window = Expect(handle);
  if (window == nullptr) return FALSE;
  if (window->scrollBars == nullptr) {
    if (!(window->style & StyleBit(which))) return Fail(ERROR_NO_SCROLLBARS);
    ReadScrollBar(ScrollBar(), *info);
    return TRUE;
  }
  ReadScrollBar(which == SB_HORZ ? window->scrollBars->horizontal : window->scrollBars->vertical, *info);
  return TRUE;
}

int SetScrollPos(HWND window, int which, int position, BOOL redraw) {
  const int old = GetScrollPos(window, which);
  const SCROLLINFO info{sizeof info, SIF_POS, 0, 0, 0, position, 0};
  SetScrollInfo(window, which, &info, redraw);
  return old;
}

int GetScrollPos(HWND window, int which) {
  SCROLLINFO info{sizeof info, SIF_POS, 0, 0, 0, 0, 0};
  return GetScrollInfo(window, which, &info) ? info.nPos : 0;
}

BOOL SetScrollRange(HWND window, int which, int lowest, int highest, BOOL redraw) {
  if (!IsWindow(window)) return Fail(ERROR_INVALID_WINDOW_HANDLE);
  if (static_cast<std::int64_t>(highest) - lowest > 0x7FFFFFFF) return Fail(ERROR_INVALID_SCROLLBAR_RANGE);
  const SCROLLINFO info{sizeof info, SIF_RANGE, lowest, highest, 0, 0, 0};
  SetScrollInfo(window, which, &info, redraw);
  return TRUE;
}

BOOL GetScrollRange(HWND window, int which, LPINT lowest, LPINT highest) {
  SCROLLINFO info{sizeof info, SIF_RANGE, 0, 0, 0, 0, 0};
  const BOOL found = GetScrollInfo(window, which, &info);
  *lowest = info.nMin;
  *highest = info.nMax;
  return found;
}

BOOL ShowScrollBar(HWND window, int which, BOOL show) {
  if (!IsWindow(window)) return Fail(ERROR_INVALID_WINDOW_HANDLE);
  if (which == SB_CTL) {
    ShowWindow(window, show ? SW_SHOW : SW_HIDE);
    return TRUE;
  }
  ShowBar(window, which == SB_BOTH ? WS_HSCROLL | WS_VSCROLL : StyleBit(which), show);
  return TRUE;
}

BOOL EnableScrollBar(HWND handle, UINT which, UINT arrows) {
  if (which == SB_CTL) {
    // First the arrows: a control that is enabled or disabled changes them by itself.
    const BOOL changed = Send(handle, SBM_ENABLE_ARROWS, arrows) != 0;
    if (arrows == ESB_ENABLE_BOTH || arrows == ESB_DISABLE_BOTH) EnableWindow(handle, arrows == ESB_ENABLE_BOTH);
    return changed;
  }
  return OrNoMemory<BOOL>(FALSE, [&]() -> BOOL {
    BOOL changed = FALSE;
    {
      const Guard guard;
      Window* window = Expect(handle);
      if (window == nullptr) return FALSE;
      for (const int each : {SB_HORZ, SB_VERT}) {
        if (which != SB_BOTH && static_cast<int>(which) != each) continue;
        ScrollBar* bar = BarOf(window, each);
        if (bar->arrows != arrows) changed = TRUE;
        bar->arrows = arrows;
      }
    }
    if (changed) PaintFrame(handle);
    return changed;
  });
}

// Without a painter the pixels stay; what must be painted anew and the children's places are the same.
int ScrollWindowEx(HWND handle, int dx, int dy, const RECT* rect, const RECT* clip, HRGN update, LPRECT updateRect,
                   UINT flags) {
  constexpr int kEmpty = 1, kSimple = 2, kComplex = 3;
  return OrNoMemory<int>(0, [&]() -> int {
    RECT area{};
    Region exposed;
    List<std::pair<HWND, RECT>> children;
    {
      const Guard guard;
      Window* window = Expect(handle);
      if (window == nullptr) return 0;
      const RECT client = AtOrigin(window->client);
      area = rect != nullptr ? Common(*rect, client) : client;
      const RECT clipped = clip != nullptr ? Common(*clip, client) : rect != nullptr ? area : client;
      // What moves into the clip was somewhere before; the rest comes to light.
      exposed.Add(Common(area, clipped));
      exposed.Add(Common(Moved(area, dx, dy), clipped));
      exposed.Subtract(Common(Moved(Common(area, clipped), dx, dy), clipped));
      // What was to be painted moves along.
      const RECT inWindow = ClientInWindow(window);
      Region waiting = UpdateOf(window);
      waiting.Move(-inWindow.left, -inWindow.top);
      waiting.Intersect(area);
      waiting.Move(dx, dy);
      waiting.Intersect(clipped);
      exposed.Add(waiting);
      if (flags & SW_SCROLLCHILDREN)
        for (const Window* child = window->firstChild; child != nullptr; child = child->next)
          if (rect == nullptr || Width(Common(child->window, *rect)) > 0)
            children.push_back({child->handle, child->window});
      if (updateRect != nullptr) *updateRect = exposed.Bounds();
      if (update != nullptr && platform::g_painter.region != nullptr)
        if (pixman_region32_t* target = platform::g_painter.region(update))
          pixman_region32_copy(target, exposed.Pixman());
    }
    if (platform::g_painter.copyPixels != nullptr) platform::g_painter.copyPixels(handle, area, dx, dy);
    for (const auto& [child, place] : children)
      SetWindowPos(child, nullptr, place.left + dx, place.top + dy, 0, 0,
                   SWP_NOZORDER | SWP_NOSIZE | SWP_NOACTIVATE | SWP_NOREDRAW);
    const Guard guard;
    Window* window = FindWindowObject(handle);
    if (window == nullptr) return 0;
    const int kind = exposed.IsEmpty() ? kEmpty : pixman_region32_n_rects(exposed.Pixman()) == 1 ? kSimple : kComplex;
    if (flags & (SW_INVALIDATE | SW_ERASE)) {
      const RECT inWindow = ClientInWindow(window);
      exposed.Move(inWindow.left, inWindow.top);
      Invalidate(window, exposed, flags & SW_ERASE ? Erase::Yes : Erase::No, Children::Unclipped);
    }
    return kind;
  });
}

BOOL ScrollWindow(HWND window, int dx, int dy, const RECT* rect, const RECT* clip) {
  return ScrollWindowEx(window, dx, dy, rect, clip, nullptr, nullptr,
                        (rect != nullptr ? 0u : SW_SCROLLCHILDREN) | SW_INVALIDATE | SW_ERASE) != 0;
}
