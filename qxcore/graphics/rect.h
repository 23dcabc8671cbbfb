// SPoint, SSize and SRect: the system's records of geometry with the operations that one expects of them.
//
// They are the records themselves (same layout, no further field), so each converts freely to and from POINT,
// SIZE and RECT, and passes wherever a pointer to one is wanted. Right and bottom lie outside a rectangle, so
// its width is right - left. Sums may not leave the range of a LONG.
// Threads: a value belongs to one thread at a time; the functions serve any thread.
#pragma once

#include <algorithm>

#include "qxcore/platform/win32.h"

// A width and a height, or a distance.
class SSize : public SIZE {
 public:
  // 0 and 0, two numbers, or a record.
  constexpr SSize() : SIZE{0, 0} {}
  constexpr SSize(int width, int height) : SIZE{width, height} {}
  constexpr SSize(const SIZE& size) : SIZE(size) {}

  // Sums and differences, number by number.
  constexpr SSize operator+(const SIZE& size) const { return SSize(cx + size.cx, cy + size.cy); }
  constexpr SSize operator-(const SIZE& size) const { return SSize(cx - size.cx, cy - size.cy); }
  constexpr SSize operator-() const { return SSize(-cx, -cy); }
  constexpr SSize& operator+=(const SIZE& size) { return *this = *this + size; }
  constexpr SSize& operator-=(const SIZE& size) { return *this = *this - size; }
  constexpr bool operator==(const SIZE& size) const { return cx == size.cx && cy == size.cy; }
  // Two of the class are no less alike when exchanged, which C++20 tries; without this one, that is ambiguous.
  constexpr bool operator==(const SSize& size) const { return *this == static_cast<const SIZE&>(size); }
};

// A place.
class SPoint : public POINT {
 public:
  // The origin, two numbers, or a record.
  constexpr SPoint() : POINT{0, 0} {}
  constexpr SPoint(int left, int top) : POINT{left, top} {}
  constexpr SPoint(const POINT& point) : POINT(point) {}
  // The coordinates that a mouse message carries in its LPARAM, with their signs.
  static constexpr SPoint FromLParam(LPARAM packed) {
    return SPoint(static_cast<short>(packed & 0xFFFF), static_cast<short>(packed >> 16 & 0xFFFF));
  }

  // Moves it.
  constexpr void Offset(int dx, int dy) { *this += SSize(dx, dy); }

  // Moved by a distance; the difference of two points is one.
  constexpr SPoint operator+(const SIZE& size) const { return SPoint(x + size.cx, y + size.cy); }
  constexpr SPoint operator-(const SIZE& size) const { return SPoint(x - size.cx, y - size.cy); }
  constexpr SSize operator-(const POINT& point) const { return SSize(x - point.x, y - point.y); }
  constexpr SPoint& operator+=(const SIZE& size) { return *this = *this + size; }
  constexpr SPoint& operator-=(const SIZE& size) { return *this = *this - size; }
  constexpr bool operator==(const POINT& point) const { return x == point.x && y == point.y; }
  constexpr bool operator==(const SPoint& point) const { return *this == static_cast<const POINT&>(point); }
};

// A rectangle. It is empty when its width or its height is 0 or less; what combines rectangles takes an empty
// one for no area at all.
class SRect : public RECT {
 public:
  // All 0, four edges, a record, an origin and a size, or two corners.
  constexpr SRect() : RECT{0, 0, 0, 0} {}
  constexpr SRect(int fromLeft, int fromTop, int toRight, int toBottom) : RECT{fromLeft, fromTop, toRight, toBottom} {}
  constexpr SRect(const RECT& rect) : RECT(rect) {}
  constexpr SRect(const POINT& origin, const SIZE& size)
      : RECT{origin.x, origin.y, origin.x + size.cx, origin.y + size.cy} {}
  constexpr SRect(const POINT& topLeft, const POINT& bottomRight)
      : RECT{topLeft.x, topLeft.y, bottomRight.x, bottomRight.y} {}

  // The record, where the system's calls want a pointer.
  constexpr operator LPRECT() { return this; }
  constexpr operator LPCRECT() const { return this; }

  // --- what it says ---

  constexpr int Width() const { return right - left; }
  constexpr int Height() const { return bottom - top; }
  constexpr SSize Size() const { return SSize(Width(), Height()); }
  constexpr SPoint TopLeft() const { return SPoint(left, top); }
  constexpr SPoint TopRight() const { return SPoint(right, top); }
  constexpr SPoint BottomLeft() const { return SPoint(left, bottom); }
  constexpr SPoint BottomRight() const { return SPoint(right, bottom); }
  // The middle, rounded toward the top left.
  constexpr SPoint CenterPoint() const { return SPoint(left + (Width() >> 1), top + (Height() >> 1)); }
  constexpr bool IsEmpty() const { return right <= left || bottom <= top; }
  // True when all four numbers are 0.
  constexpr bool IsNull() const { return left == 0 && top == 0 && right == 0 && bottom == 0; }
  // True for a point inside; the right and the bottom edge are outside.
  constexpr bool Contains(const POINT& point) const {
    return point.x >= left && point.x < right && point.y >= top && point.y < bottom;
  }
  // True when all of a rectangle that is not empty lies inside.
  constexpr bool Contains(const RECT& rect) const {
    return !SRect(rect).IsEmpty() && rect.left >= left && rect.right <= right && rect.top >= top &&
           rect.bottom <= bottom;
  }
  // True when the two share at least one pixel.
  constexpr bool Intersects(const RECT& rect) const { return !(*this & rect).IsEmpty(); }

  // --- changes in place ---

  constexpr void Set(int fromLeft, int fromTop, int toRight, int toBottom) {
    *this = SRect(fromLeft, fromTop, toRight, toBottom);
  }
  constexpr void SetEmpty() { *this = SRect(); }
  constexpr void Offset(int dx, int dy) { left += dx, right += dx, top += dy, bottom += dy; }
  constexpr void Offset(const SIZE& distance) { Offset(distance.cx, distance.cy); }
  constexpr void MoveTo(const POINT& origin) { Offset(origin.x - left, origin.y - top); }
  // Moves each edge outward; negative numbers move it inward.
  constexpr void Inflate(int dx, int dy) { left -= dx, right += dx, top -= dy, bottom += dy; }
  // Moves each edge inward by a number of its own.
  constexpr void Deflate(int byLeft, int byTop, int byRight, int byBottom) {
    left += byLeft, top += byTop, right -= byRight, bottom -= byBottom;
  }
  constexpr void Deflate(int dx, int dy) { Inflate(-dx, -dy); }
  // Exchanges edges so that left <= right and top <= bottom.
  constexpr void Normalize() {
    if (right < left) std::swap(left, right);
    if (bottom < top) std::swap(top, bottom);
  }

  // --- combinations ---

  // What both share; all 0 when they share nothing.
  constexpr SRect operator&(const RECT& rect) const {
    SRect shared(std::max(left, rect.left), std::max(top, rect.top), std::min(right, rect.right),
                 std::min(bottom, rect.bottom));
    return IsEmpty() || SRect(rect).IsEmpty() || shared.IsEmpty() ? SRect() : shared;
  }
  // The smallest rectangle around both; an empty one is ignored.
  constexpr SRect operator|(const RECT& rect) const {
    if (IsEmpty()) return SRect(rect).IsEmpty() ? SRect() : SRect(rect);
    if (SRect(rect).IsEmpty()) return *this;
    return SRect(std::min(left, rect.left), std::min(top, rect.top), std::max(right, rect.right),
                 std::max(bottom, rect.bottom));
  }
  constexpr SRect operator+(const SIZE& distance) const {
    return SRect(left + distance.cx, top + distance.cy, right + distance.cx, bottom + distance.cy);
  }
  constexpr SRect operator-(const SIZE& distance) const { return *this + -SSize(distance); }
  constexpr SRect& operator&=(const RECT& rect) { return *this = *this & rect; }
  constexpr SRect& operator|=(const RECT& rect) { return *this = *this | rect; }
  constexpr SRect& operator+=(const SIZE& distance) { return *this = *this + distance; }
  constexpr SRect& operator-=(const SIZE& distance) { return *this = *this - distance; }
  constexpr bool operator==(const RECT& rect) const {
    return left == rect.left && top == rect.top && right == rect.right && bottom == rect.bottom;
  }
  constexpr bool operator==(const SRect& rect) const { return *this == static_cast<const RECT&>(rect); }
};

static_assert(sizeof(SRect) == 16 && sizeof(SPoint) == 8 && sizeof(SSize) == 8, "the records themselves");
