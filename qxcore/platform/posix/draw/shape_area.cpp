// Polygons and ellipses as sets of pixels.
#include <algorithm>
#include <cstdint>
#include <cstdlib>

#include "qxcore/platform/posix/draw/region.h"

namespace draw {

namespace {

// An edge of a polygon that crosses scan lines, from top (within) to bottom (without).
struct Edge {
  std::int64_t x, y, dx, dy;  // dy > 0
  int bottom, direction;      // +1 downward, -1 upward

  // Where the edge crosses line `atY`, rounded up: the first pixel to its right.
  int At(int atY) const {
    std::int64_t numerator = dx * (atY - y);
    std::int64_t quotient = numerator / dy;
    if (numerator % dy > 0) ++quotient;
    return static_cast<int>(x + quotient);
  }
};

struct Crossing {
  int x, direction;
  bool operator<(const Crossing& other) const { return x < other.x; }
};

std::vector<Edge> EdgesOf(const POINT* points, int count) {
  std::vector<Edge> edges;
  for (int i = 0; i < count; ++i) {
    POINT a = points[i], b = points[(i + 1) % count];
    int direction = 1;
    if (a.y == b.y) continue;
    if (a.y > b.y) std::swap(a, b), direction = -1;
    edges.push_back({a.x, a.y, std::int64_t{b.x} - a.x, std::int64_t{b.y} - a.y, b.y, direction});
  }
  std::sort(edges.begin(), edges.end(), [](const Edge& a, const Edge& b) { return a.y < b.y; });
  return edges;
}

// The spans between sorted crossings that the fill mode counts as inside.
void AddSpans(const std::vector<Crossing>& crossings, int y, int fillMode, std::vector<Box>& boxes) {
  int winding = 0;
  for (std::size_t i = 0; i + 1 < crossings.size(); ++i) {
    winding += fillMode == ALTERNATE ? (winding ? -1 : 1) : crossings[i].direction;
    if (winding != 0 && crossings[i].x < crossings[i + 1].x)
      boxes.push_back({crossings[i].x, y, crossings[i + 1].x, y + 1});
  }
}

}  // namespace

Area PolygonArea(const POINT* points, int count, int fillMode, const Box& rows) {
  std::vector<Edge> edges = EdgesOf(points, count);
  std::vector<Box> boxes;
  std::vector<const Edge*> active;
  std::vector<Crossing> crossings;
  std::size_t next = 0;
  int y = edges.empty() ? rows.y2 : std::max(static_cast<int>(edges.front().y), rows.y1);
  for (; y < rows.y2 && (next < edges.size() || !active.empty()); ++y) {
    for (; next < edges.size() && edges[next].y <= y; ++next) active.push_back(&edges[next]);
    std::erase_if(active, [y](const Edge* edge) { return edge->bottom <= y; });
    crossings.clear();
    for (const Edge* edge : active) crossings.push_back({edge->At(y), edge->direction});
    std::sort(crossings.begin(), crossings.end());
    AddSpans(crossings, y, fillMode, boxes);
  }
  Area area;
  area.SetBoxes(boxes);
  return area;
}

Area EllipseArea(const Box& box) { return RoundRectArea(box, box.x2 - box.x1, box.y2 - box.y1); }

// The corners follow the midpoint algorithm of A. Zingl, "A Rasterizing Algorithm for Drawing Curves" (2012), for
// an ellipse in a rectangle: the error of the implicit equation decides which coordinate steps.
Area RoundRectArea(const Box& box, int cornerWidth, int cornerHeight) {
  int width = std::min(box.x2 - box.x1, cornerWidth), height = std::min(box.y2 - box.y1, cornerHeight);
  Area area;
  constexpr int kLargest = 65535;  // beyond it the products of the error would not fit
  if (IsEmpty(box) || width > kLargest || height > kLargest) return area;
  if (width < 2 || height < 2) {
    area.SetBox(box);
    return area;
  }
  std::int64_t a = width - 1, b = height - 1;
  std::int64_t stepX = 8 * b * b, stepY = 8 * a * a;
  std::int64_t dx = 4 * b * b * (1 - a), dy = 4 * a * a * (1 + b % 2), error = dx + dy + a * a * (b % 2);
  // The inset of each row, from the middle of the ellipse to its tip, which is never without a pixel.
  const int tip = (width - 1) / 2;
  int x = 0, y = height / 2;
  std::vector<int> inset(static_cast<std::size_t>(height), tip);
  int row = y;
  inset[static_cast<std::size_t>(row)] = 0;
  while (x <= width / 2) {
    std::int64_t twice = 2 * error;
    if (twice >= dx) {
      ++x;
      error += dx += stepX;
    }
    if (twice <= dy) {
      ++row;
      error += dy += stepY;
      if (row < height) inset[static_cast<std::size_t>(row)] = std::min(x, tip);
    }
  }
  std::vector<Box> boxes;
  for (int line = height / 2; line < height; ++line) {
    int left = box.x1 + inset[static_cast<std::size_t>(line)], right = box.x2 - inset[static_cast<std::size_t>(line)];
    int below = box.y2 - height + line, above = box.y1 + height - 1 - line;
    if (left < right) {
      boxes.push_back({left, above, right, above + 1});
      boxes.push_back({left, below, right, below + 1});
    }
  }
  boxes.push_back({box.x1, box.y1 + (height + 1) / 2, box.x2, box.y2 - height / 2});
  boxes.erase(std::remove_if(boxes.begin(), boxes.end(), [](const Box& b2) { return IsEmpty(b2); }), boxes.end());
  area.SetBoxes(boxes);
  return area;
}

}  // namespace draw
