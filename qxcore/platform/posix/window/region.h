// A set of pixels that cleans up after itself; coordinates are relative to a window's top left corner unless a
// comment says otherwise.
#pragma once

#include <pixman.h>

#include "qxcore/platform/posix/window/memory.h"

namespace platform::model {

class Region {
 public:
  Region() { pixman_region32_init(&m_region); }
  explicit Region(const RECT& rect) : Region() { Add(rect); }
  // The union of boxes; empty ones add nothing.
  Region(const pixman_box32_t* boxes, std::size_t count) {
    pixman_region32_init_rects(&m_region, boxes, static_cast<int>(count));
  }
  Region(const Region& other) : Region() { pixman_region32_copy(&m_region, &other.m_region); }
  Region& operator=(const Region& other) {
    pixman_region32_copy(&m_region, &other.m_region);
    return *this;
  }
  ~Region() { pixman_region32_fini(&m_region); }

  bool IsEmpty() const { return !pixman_region32_not_empty(const_cast<pixman_region32_t*>(&m_region)); }
  void Clear() { pixman_region32_clear(&m_region); }
  void Add(const RECT& rect) {
    if (rect.left < rect.right && rect.top < rect.bottom)
      pixman_region32_union_rect(&m_region, &m_region, rect.left, rect.top, rect.right - rect.left,
                                 rect.bottom - rect.top);
  }
  void Add(const Region& other) { pixman_region32_union(&m_region, &m_region, &other.m_region); }
  void Subtract(const Region& other) { pixman_region32_subtract(&m_region, &m_region, &other.m_region); }
  void Subtract(const RECT& rect) { Subtract(Region(rect)); }
  void Intersect(const RECT& rect) { Intersect(Region(rect)); }
  void Intersect(const Region& other) { pixman_region32_intersect(&m_region, &m_region, &other.m_region); }
  void Move(int dx, int dy) {
    if (dx != 0 || dy != 0) pixman_region32_translate(&m_region, dx, dy);
  }
  RECT Bounds() const {
    const pixman_box32_t& box = m_region.extents;
    return {box.x1, box.y1, box.x2, box.y2};
  }
  // Whether none of it lies in the rectangle; cheaper than an intersection.
  bool Misses(const RECT& rect) const {
    pixman_box32_t box{rect.left, rect.top, rect.right, rect.bottom};
    return pixman_region32_contains_rectangle(const_cast<pixman_region32_t*>(&m_region), &box) == PIXMAN_REGION_OUT;
  }
  // Whether all of the rectangle lies in it.
  bool Holds(const RECT& rect) const {
    pixman_box32_t box{rect.left, rect.top, rect.right, rect.bottom};
    return pixman_region32_contains_rectangle(const_cast<pixman_region32_t*>(&m_region), &box) == PIXMAN_REGION_IN;
  }
  // Whether it is one rectangle that holds the given one.
  bool Covers(const RECT& rect) const {
    const RECT bounds = Bounds();
    return bounds.left <= rect.left && bounds.top <= rect.top && bounds.right >= rect.right &&
           bounds.bottom >= rect.bottom && pixman_region32_n_rects(const_cast<pixman_region32_t*>(&m_region)) == 1;
  }
  long long Area() const {
    int count = 0;
    const pixman_box32_t* box = pixman_region32_rectangles(const_cast<pixman_region32_t*>(&m_region), &count);
    long long area = 0;
    for (; count > 0; --count, ++box) area += static_cast<long long>(box->x2 - box->x1) * (box->y2 - box->y1);
    return area;
  }
  pixman_region32_t* Pixman() { return &m_region; }
  const pixman_region32_t* Pixman() const { return &m_region; }

 private:
  pixman_region32_t m_region;
};

}  // namespace platform::model
