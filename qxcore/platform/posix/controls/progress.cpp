// The class "msctls_progress32".

#include <utility>

#include "qxcore/platform/posix/controls/painting.h"

namespace platform::controls {
namespace {

struct Progress : model::OnModelHeap {
  int lowest = 0, highest = 100, position = 0, step = 10;
  COLORREF bar = CLR_DEFAULT, background = CLR_DEFAULT;
};

int Move(HWND window, Progress* progress, int position) {
  const int old = progress->position;
  progress->position = std::clamp(position, progress->lowest, progress->highest);
  if (progress->position != old) InvalidateRect(window, nullptr, FALSE);
  return old;
}

LRESULT SetRange(HWND window, Progress* progress, int lowest, int highest) {
  const LRESULT old = MAKELRESULT(progress->lowest, progress->highest);
  progress->lowest = lowest;
  progress->highest = std::max(lowest, highest);
  progress->position = std::clamp(progress->position, progress->lowest, progress->highest);
  InvalidateRect(window, nullptr, FALSE);
  return old;
}

COLORREF SetColor(HWND window, COLORREF* color, LPARAM wanted) {
  InvalidateRect(window, nullptr, FALSE);
  return std::exchange(*color, static_cast<COLORREF>(wanted));
}

void Fill(HDC dc, const RECT& rect, COLORREF color, int usual) {
  if (color == CLR_DEFAULT) {
    FillRect(dc, &rect, GetSysColorBrush(usual));
    return;
  }
  const HBRUSH brush = CreateSolidBrush(color);
  FillRect(dc, &rect, brush);
  DeleteObject(brush);
}

void Paint(HWND window, const Progress* progress, HDC dc) {
  RECT rect;
  GetClientRect(window, &rect);
  DrawEdge(dc, &rect, BDR_SUNKENOUTER, BF_RECT | BF_ADJUST);
  const bool isVertical = GetWindowLongW(window, GWL_STYLE) & PBS_VERTICAL;
  const int length = isVertical ? model::Height(rect) : model::Width(rect);
  const std::int64_t range = static_cast<std::int64_t>(progress->highest) - progress->lowest;
  const std::int64_t reached = static_cast<std::int64_t>(progress->position) - progress->lowest;
  const int done = range > 0 ? static_cast<int>(length * reached / range) : 0;
  RECT full = rect, rest = rect;
  if (isVertical) {
    full.top = rest.bottom = rect.bottom - done;
  } else {
    full.right = rest.left = rect.left + done;
  }
  Fill(dc, rest, progress->background, COLOR_3DFACE);
  Fill(dc, full, progress->bar, COLOR_HIGHLIGHT);
}

}  // namespace

LRESULT CALLBACK ProgressProcedure(HWND window, UINT message, WPARAM wParam, LPARAM lParam) {
  Progress* progress = StateOf<Progress>(window);
  if (progress == nullptr && message != WM_NCCREATE) return DefWindowProcW(window, message, wParam, lParam);
  switch (message) {
    case WM_NCCREATE:
      if (!MakeState<Progress>(window)) return FALSE;
      break;
    case WM_NCDESTROY:
      FreeState<Progress>(window);
      break;
    case WM_ERASEBKGND:
      return TRUE;
    case WM_PAINT: {
      PAINTSTRUCT paint;
      const HDC dc = BeginPaint(window, &paint);
      if (dc != nullptr) Paint(window, progress, dc);
      EndPaint(window, &paint);
      return 0;
    }
    case WM_PRINTCLIENT:
      Paint(window, progress, reinterpret_cast<HDC>(wParam));
      return 0;
    case PBM_SETRANGE:
      return SetRange(window, progress, LOWORD(lParam), HIWORD(lParam));
    case PBM_SETRANGE32:
      return SetRange(window, progress, static_cast<int>(wParam), static_cast<int>(lParam));
    case PBM_GETRANGE:
      if (lParam) *reinterpret_cast<PBRANGE*>(lParam) = {progress->lowest, progress->highest};
      return wParam ? progress->lowest : progress->highest;
    case PBM_SETPOS:
      return Move(window, progress, static_cast<int>(wParam));
    case PBM_DELTAPOS:
      return Move(window, progress, progress->position + static_cast<int>(wParam));
    case PBM_SETSTEP:
      return std::exchange(progress->step, static_cast<int>(wParam));
    case PBM_STEPIT: {
      // Behind the end it begins anew.
      const int next = progress->position + progress->step;
      return Move(window, progress, next > progress->highest ? progress->lowest : next);
    }
    case PBM_GETPOS:
      return progress->position;
    case PBM_GETSTEP:
      return progress->step;
    case PBM_SETBARCOLOR:
      return SetColor(window, &progress->bar, lParam);
    case PBM_SETBKCOLOR:
      return SetColor(window, &progress->background, lParam);
    case PBM_GETBARCOLOR:
      return progress->bar;
    case PBM_GETBKCOLOR:
      return progress->background;
    default:
      break;
  }
  return DefWindowProcW(window, message, wParam, lParam);
}

}  // namespace platform::controls
