// Small sums on lengths and rectangles, for the model and what paints for it.
#pragma once

#include <algorithm>

#include "qxcore/platform/win32.h"

namespace platform::model {

// A length at 96 dots an inch, on the screen.
inline int Scaled(int length) { return MulDiv(length, static_cast<int>(GetDpiForSystem()), 96); }
inline int Width(const RECT& rect) { return rect.right - rect.left; }
inline int Height(const RECT& rect) { return rect.bottom - rect.top; }
inline RECT Moved(const RECT& rect, int dx, int dy) {
  return {rect.left + dx, rect.top + dy, rect.right + dx, rect.bottom + dy};
}
inline RECT AtOrigin(const RECT& rect) { return {0, 0, Width(rect), Height(rect)}; }
inline bool Contains(const RECT& rect, POINT point) {
  return point.x >= rect.left && point.x < rect.right && point.y >= rect.top && point.y < rect.bottom;
}
inline bool Same(const RECT& a, const RECT& b) {
  return a.left == b.left && a.top == b.top && a.right == b.right && a.bottom == b.bottom;
}
inline RECT Common(const RECT& a, const RECT& b) {
  const RECT both{std::max(a.left, b.left), std::max(a.top, b.top), std::min(a.right, b.right),
                  std::min(a.bottom, b.bottom)};
  return both.left < both.right && both.top < both.bottom ? both : RECT{};
}
inline RECT Around(const RECT& a, const RECT& b) {
  return {std::min(a.left, b.left), std::min(a.top, b.top), std::max(a.right, b.right), std::max(a.bottom, b.bottom)};
}
inline bool IsEmpty(const RECT& rect) { return rect.left >= rect.right || rect.top >= rect.bottom; }
inline RECT Inflated(const RECT& rect, int dx, int dy) {
  return {rect.left - dx, rect.top - dy, rect.right + dx, rect.bottom + dy};
}
inline LPARAM PointParam(int x, int y) { return MAKELPARAM(x, y); }
inline POINT PointOf(LPARAM lParam) { return {GET_X_LPARAM(lParam), GET_Y_LPARAM(lParam)}; }

}  // namespace platform::model
