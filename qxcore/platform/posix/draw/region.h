// A set of pixels, and the shapes that the system's rules turn into one.
#pragma once

#include <pixman.h>

#include <algorithm>
#include <vector>

#include "qxcore/platform/posix/draw/object.h"

namespace draw {

using Box = pixman_box32_t;

inline bool IsEmpty(const Box& box) { return box.x1 >= box.x2 || box.y1 >= box.y2; }
inline Box Intersect(const Box& a, const Box& b) {
  return {std::max(a.x1, b.x1), std::max(a.y1, b.y1), std::min(a.x2, b.x2), std::min(a.y2, b.y2)};
}
// The box of two corners in any order.
inline Box BoxOf(int left, int top, int right, int bottom) {
  return {std::min(left, right), std::min(top, bottom), std::max(left, right), std::max(top, bottom)};
}

// A pixman region as a value. What needs memory throws std::bad_alloc; an operation in place then leaves an empty
// area, an assignment leaves the former one.
class Area {
 public:
  Area() { pixman_region32_init(&m_region); }
  explicit Area(const Box& box) : Area() { SetBox(box); }
  explicit Area(const pixman_region32_t* region) : Area() {
    Check(pixman_region32_copy(&m_region, const_cast<pixman_region32_t*>(region)));
  }
  Area(const Area& other) : Area(&other.m_region) {}
  Area(Area&& other) noexcept : Area() { std::swap(m_region, other.m_region); }
  Area& operator=(Area other) noexcept {
    std::swap(m_region, other.m_region);
    return *this;
  }
  ~Area() { pixman_region32_fini(&m_region); }

  void SetBox(const Box& box);
  // The union of boxes in any order.
  void SetBoxes(const std::vector<Box>& boxes);

  bool Empty() const { return !pixman_region32_not_empty(Data()); }
  const Box& Extents() const { return m_region.extents; }
  const Box* Boxes(int* count) const { return pixman_region32_rectangles(Data(), count); }
  bool Equals(const Area& other) const { return pixman_region32_equal(Data(), other.Data()); }
  bool Contains(int x, int y) const { return pixman_region32_contains_point(Data(), x, y, nullptr); }
  bool Meets(const Box& box) const;

  void Offset(int dx, int dy) { pixman_region32_translate(&m_region, dx, dy); }
  void And(const Area& other) { Check(pixman_region32_intersect(&m_region, &m_region, other.Data())); }
  void And(const Box& box) {
    Check(pixman_region32_intersect_rect(&m_region, &m_region, box.x1, box.y1, box.x2 - box.x1, box.y2 - box.y1));
  }
  void Or(const Area& other) { Check(pixman_region32_union(&m_region, &m_region, other.Data())); }
  void Less(const Area& other) { Check(pixman_region32_subtract(&m_region, &m_region, other.Data())); }
  // RGN_AND to RGN_COPY with another one.
  void Combine(const Area& other, int mode);
  // For calls that take the region itself.
  pixman_region32_t* Pixman() { return &m_region; }
  // NULLREGION, SIMPLEREGION or COMPLEXREGION.
  int Complexity() const;

 private:
  static void Check(pixman_bool_t hasMemory) {
    if (!hasMemory) throw std::bad_alloc();
  }
  pixman_region32_t* Data() const { return const_cast<pixman_region32_t*>(&m_region); }
  pixman_region32_t m_region;
};

// The pixels of the shapes, by the rules of the shapes' calls: right and bottom edges lie outside.
// Of a polygon only the rows within `rows` are taken.
constexpr Box kEverywhere{-(1 << 27), -(1 << 27), 1 << 27, 1 << 27};
Area PolygonArea(const POINT* points, int count, int fillMode, const Box& rows = kEverywhere);
Area EllipseArea(const Box& box);
Area RoundRectArea(const Box& box, int cornerWidth, int cornerHeight);

class RegionObject final : public Object {
 public:
  static bool IsType(DWORD type) { return type == OBJ_REGION; }
  explicit RegionObject(Area area) : Object(OBJ_REGION), m_area(std::move(area)) {}
  Area m_area;
};

}  // namespace draw
