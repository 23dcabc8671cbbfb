// The class "msctls_progress32": how far some work is.

#include <algorithm>
#include <cstdint>
#include <utility>

#include "qxcore/platform/posix/controls/painting.h"

namespace platform::controls {

namespace {

struct Progress {
  int low = 0, high = 100, position = 0, step = 10;
  COLORREF bar = CLR_DEFAULT, background = CLR_DEFAULT;
};

// --- positions: each returns the former one ---

LRESULT Move(HWND window, Progress& progress, std::int64_t position) {
  const auto inRange = std::max<std::int64_t>(progress.low, std::min<std::int64_t>(position, progress.high));
  InvalidateRect(window, nullptr, FALSE);
  return std::exchange(progress.position, static_cast<int>(inRange));
}

// Behind the end it begins anew.
LRESULT StepIt(HWND window, Progress& progress) {
  std::int64_t next = std::int64_t{progress.position} + progress.step;
  if (next > progress.high) next = progress.low;
  return Move(window, progress, next);
}

// Returns the former range, its ends cut to 16 bits.
LRESULT SetRange(HWND window, Progress& progress, int low, int high) {
  const LRESULT former = static_cast<LRESULT>(static_cast<DWORD>(MAKELONG(progress.low, progress.high)));
  progress.low = low;
  progress.high = high;
  Move(window, progress, progress.position);
  return former;
}

LRESULT GetRange(const Progress& progress, bool low, PBRANGE* range) {
  if (range != nullptr) *range = {progress.low, progress.high};
  return low ? progress.low : progress.high;
}

LRESULT SetColor(HWND window, COLORREF* color, LPARAM lParam) {
  InvalidateRect(window, nullptr, FALSE);
  return static_cast<LRESULT>(std::exchange(*color, static_cast<COLORREF>(lParam)));
}

// --- painting ---

void Fill(HDC dc, const RECT& rect, COLORREF color, int otherwise) {
  SetBkColor(dc, color == CLR_DEFAULT ? GetSysColor(otherwise) : color);
  ExtTextOutW(dc, 0, 0, ETO_OPAQUE, &rect, nullptr, 0, nullptr);
}

// The filled part grows to the right, or upward; the rest is painted beside it, nothing twice.
void Paint(HWND window, const Progress* state, HDC dc) {
  const Progress& progress = *state;
  RECT area = ClientOf(window);
  DrawEdge(dc, &area, BDR_SUNKENOUTER, BF_RECT | BF_ADJUST);
  const bool isVertical = (StyleOf(window) & PBS_VERTICAL) != 0;
  const std::int64_t length = isVertical ? area.bottom - area.top : area.right - area.left;
  const std::int64_t range = std::int64_t{progress.high} - progress.low;
  const int filled =
      range > 0 ? static_cast<int>(length * (std::int64_t{progress.position} - progress.low) / range) : 0;
  RECT done = area, rest = area;
  if (isVertical) {
    done.top = rest.bottom = area.bottom - filled;
  } else {
    done.right = rest.left = area.left + filled;
  }
  Fill(dc, done, progress.bar, COLOR_HIGHLIGHT);
  Fill(dc, rest, progress.background, COLOR_WINDOW);
}

LRESULT Handle(HWND window, Progress* state, UINT message, WPARAM wParam, LPARAM lParam) {
  Progress& progress = *state;
  const int number = static_cast<int>(wParam);
  switch (message) {
    case PBM_SETRANGE:
      return SetRange(window, progress, LOWORD(lParam), HIWORD(lParam));
    case PBM_SETRANGE32:
      return SetRange(window, progress, number, static_cast<int>(lParam));
    case PBM_GETRANGE:
      return GetRange(progress, wParam != 0, reinterpret_cast<PBRANGE*>(lParam));
    case PBM_SETPOS:
      return Move(window, progress, number);
    case PBM_GETPOS:
      return progress.position;
    case PBM_DELTAPOS:
      return Move(window, progress, std::int64_t{progress.position} + number);
    case PBM_SETSTEP:
      return std::exchange(progress.step, number);
    case PBM_GETSTEP:
      return progress.step;
    case PBM_STEPIT:
      return StepIt(window, progress);
    case PBM_SETBARCOLOR:
      return SetColor(window, &progress.bar, lParam);
    case PBM_SETBKCOLOR:
      return SetColor(window, &progress.background, lParam);
    case PBM_GETBARCOLOR:
      return static_cast<LRESULT>(progress.bar);
    case PBM_GETBKCOLOR:
      return static_cast<LRESULT>(progress.background);
    case WM_SYSCOLORCHANGE:
      return InvalidateRect(window, nullptr, FALSE), 0;
    default:
      return DefWindowProcW(window, message, wParam, lParam);
  }
}

}  // namespace

LRESULT CALLBACK ProgressProcedure(HWND window, UINT message, WPARAM wParam, LPARAM lParam) {
  return ControlMessage<Progress, &Paint, &Handle>(window, message, wParam, lParam);
}

}  // namespace platform::controls
