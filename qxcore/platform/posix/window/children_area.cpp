#include "qxcore/platform/posix/window/children_area.h"

#include <iterator>

#include "qxcore/platform/posix/window/frame.h"

namespace platform::model {
namespace {

pixman_box32_t BoxOf(const RECT& rect) { return {rect.left, rect.top, rect.right, rect.bottom}; }

// Boxes that are taken from a region together, which is cheaper than one by one.
class Cuts {
 public:
  explicit Cuts(Region* region) : m_region(region) {}
  Cuts(const Cuts&) = delete;
  Cuts& operator=(const Cuts&) = delete;
  ~Cuts() { Make(); }
  void Add(const RECT& rect) {
    if (m_region->Misses(rect)) return;
    if (m_count == std::size(m_boxes)) Make();
    m_boxes[m_count++] = BoxOf(rect);
  }

 private:
  void Make() {
    if (m_count > 0) m_region->Subtract(Region(m_boxes, m_count));
    m_count = 0;
  }
  Region* m_region;
  std::size_t m_count = 0;
  pixman_box32_t m_boxes[64];
};

void SubtractOneByOne(const Window* window, Region* region) {
  const RECT bounds = region->Bounds();
  Cuts cuts(region);
  for (const Window* child = window->firstChild; child != nullptr; child = child->next)
    if (child->IsVisible() && !IsEmpty(Common(child->window, bounds))) cuts.Add(child->window);
}

// Whether the visible children lie in rows as those of a splitter do: each to the right of the one before it and as
// high, or below it and all of its row. Then they lie apart, which takes no region to find out.
bool LieInRows(const Window* parent) {
  const Window* former = nullptr;
  for (const Window* child = parent->firstChild; child != nullptr; child = child->next) {
    if (!child->IsVisible() || IsEmpty(child->window)) continue;
    const RECT& place = child->window;
    if (former != nullptr && place.top < former->window.bottom) {
      const RECT& row = former->window;
      if (place.top != row.top || place.bottom != row.bottom || place.left < row.right) return false;
    }
    former = child;
  }
  return true;
}

}  // namespace

std::uint64_t g_scene = 1;

void SceneChanged(Window* window) {
  ++g_scene;
  if (window->parent != nullptr) window->parent->children.isKnown = false;
}

const ChildrenArea& AreaOfChildren(Window* parent) {
  ChildrenArea& children = parent->children;
  if (children.isKnown) return children;
  std::size_t count = 0;
  for (const Window* child = parent->firstChild; child != nullptr; child = child->next) ++count;
  List<pixman_box32_t> boxes;
  boxes.reserve(count);
  constexpr long long kLargest = 1LL << 60;  // no screen is as large
  long long sum = 0;
  for (const Window* child = parent->firstChild; child != nullptr; child = child->next) {
    if (!child->IsVisible() || IsEmpty(child->window)) continue;
    boxes.push_back(BoxOf(child->window));
    if (sum <= kLargest) sum += static_cast<long long>(Width(child->window)) * Height(child->window);
  }
  children.covered = Region(boxes.data(), boxes.size());
  children.areApart = sum <= kLargest && children.covered.Area() == sum;
  children.isKnown = true;
  return children;
}

bool AreChildrenApart(Window* parent) {
  return (!parent->children.isKnown && LieInRows(parent)) || AreaOfChildren(parent).areApart;
}

void SubtractChildren(const Window* window, Region* region) {
  const RECT client = ClientInWindow(window);
  region->Move(-client.left, -client.top);
  if (window->children.isKnown) {
    region->Subtract(window->children.covered);
  } else {
    SubtractOneByOne(window, region);
  }
  region->Move(client.left, client.top);
}

}  // namespace platform::model
