// Pixels of windows that moved on the surface of their top-level window: several at once, each of which may lie where
// another one goes.
#include "qxcore/platform/posix/draw/move_pixels.h"

#include <cstring>

#include "qxcore/platform/posix/draw/window_surface.h"
#include "qxcore/platform/posix/window/on_display.h"

using platform::MovedPixels;

namespace draw {
namespace {

Box Bounds(const platform::model::Region& region) { return region.Pixman()->extents; }
Box Moved(const Box& box, int dx, int dy) { return {box.x1 + dx, box.y1 + dy, box.x2 + dx, box.y2 + dy}; }
bool Meets(const Box& a, const Box& b) { return !IsEmpty(Intersect(a, b)); }

// What a move reads and writes.
struct Extents {
  Box from, to;
};

// The moves in the order in which they are made.
class Plan {
 public:
  Plan(const MovedPixels* moves, std::size_t count) {
    m_extents.reserve(count);
    for (std::size_t i = 0; i < count; ++i) {
      const Box to = Bounds(moves[i].to);
      m_extents.push_back({Moved(to, -moves[i].dx, -moves[i].dy), to});
    }
    // In a grid that shrinks each window moves to where the one before it was; in one that grows, the last must move
    // first.
    m_goesBack = IsAnyOverwritten();
    if (m_goesBack) std::reverse(m_extents.begin(), m_extents.end());
  }

  std::size_t At(std::size_t step) const { return m_goesBack ? m_extents.size() - 1 - step : step; }
  // Whether an earlier step writes over what this one reads.
  bool IsOverwritten(std::size_t step) const {
    for (std::size_t i = 0; i < step; ++i)
      if (Meets(m_extents[i].to, m_extents[step].from)) return true;
    return false;
  }

 private:
  bool IsAnyOverwritten() const {
    for (std::size_t step = 1; step < m_extents.size(); ++step)
      if (IsOverwritten(step)) return true;
    return false;
  }
  std::vector<Extents> m_extents;
  bool m_goesBack = false;
};

// A copy of what a move reads.
struct Saved {
  std::vector<std::uint32_t> pixels;
  Box from{};

  const std::uint32_t* At(int x, int y) const {
    return pixels.data() + static_cast<std::size_t>(y - from.y1) * static_cast<std::size_t>(from.x2 - from.x1) +
           (x - from.x1);
  }
};

class Mover {
 public:
  explicit Mover(const Surface& surface) : m_surface(surface), m_all{0, 0, surface.width, surface.height} {}

  Saved Save(const MovedPixels& move) const {
    Saved saved;
    saved.from = Intersect(Moved(Bounds(move.to), -move.dx, -move.dy), m_all);
    if (IsEmpty(saved.from)) return saved;
    saved.pixels.reserve(static_cast<std::size_t>(saved.from.x2 - saved.from.x1) * (saved.from.y2 - saved.from.y1));
    for (int y = saved.from.y1; y < saved.from.y2; ++y)
      saved.pixels.insert(saved.pixels.end(), m_surface.Row(y) + saved.from.x1, m_surface.Row(y) + saved.from.x2);
    return saved;
  }

  // Rows go in the order in which none is written over before it is read.
  void Move(const Box& to, int dx, int dy) const {
    const Box part = Known(to, dx, dy);
    for (int i = 0, rows = part.y2 - part.y1; i < rows; ++i) {
      const int y = dy <= 0 ? part.y1 + i : part.y2 - 1 - i;
      std::memmove(m_surface.Row(y) + part.x1, m_surface.Row(y - dy) + part.x1 - dx, Bytes(part));
    }
  }

  void Restore(const Saved& saved, const MovedPixels& move) const {
    int count;
    const Box* boxes = pixman_region32_rectangles(const_cast<pixman_region32_t*>(move.to.Pixman()), &count);
    for (const Box* box = boxes; box < boxes + count; ++box) {
      const Box part = Known(*box, move.dx, move.dy);
      for (int y = part.y1; y < part.y2; ++y)
        std::memcpy(m_surface.Row(y) + part.x1, saved.At(part.x1 - move.dx, y - move.dy), Bytes(part));
    }
  }

 private:
  // The part of a target that lies on the surface, as does what it is copied from.
  Box Known(const Box& to, int dx, int dy) const {
    const Box part = Intersect(Intersect(to, m_all), Moved(m_all, dx, dy));
    return IsEmpty(part) ? Box{} : part;
  }
  static std::size_t Bytes(const Box& part) { return static_cast<std::size_t>(part.x2 - part.x1) * 4; }

  const Surface& m_surface;
  const Box m_all;
};

void MoveAll(const Surface& surface, const MovedPixels* moves, std::size_t count) {
  const Plan plan(moves, count);
  const Mover mover(surface);
  // The parts of one region could write over each other.
  const auto isSaved = [&](std::size_t step) {
    return pixman_region32_n_rects(const_cast<pixman_region32_t*>(moves[plan.At(step)].to.Pixman())) > 1 ||
           plan.IsOverwritten(step);
  };
  std::vector<Saved> saved(count);
  for (std::size_t step = 0; step < count; ++step)
    if (isSaved(step)) saved[step] = mover.Save(moves[plan.At(step)]);
  for (std::size_t step = 0; step < count; ++step) {
    const MovedPixels& move = moves[plan.At(step)];
    if (saved[step].pixels.empty()) {
      mover.Move(Bounds(move.to), move.dx, move.dy);
    } else {
      mover.Restore(saved[step], move);
    }
  }
}

Box BoundsOfAll(const MovedPixels* moves, std::size_t count) {
  Box all = Bounds(moves[0].to);
  for (std::size_t i = 1; i < count; ++i) {
    const Box to = Bounds(moves[i].to);
    all = {std::min(all.x1, to.x1), std::min(all.y1, to.y1), std::max(all.x2, to.x2), std::max(all.y2, to.y2)};
  }
  return all;
}

}  // namespace

bool MovePixels(HWND top, void* slot, SIZE size, const MovedPixels* moves, std::size_t count) try {
  const Surface* surface = GrownSurface(slot, size);
  if (surface == nullptr) return true;  // nothing was drawn yet
  MoveAll(*surface, moves, count);
  const Box changed = BoundsOfAll(moves, count);
  platform::model::PresentOnDisplay(top, {surface->pixels, surface->stride, surface->width, surface->height},
                                    {changed.x1, changed.y1, changed.x2, changed.y2});
  return true;
} catch (const std::bad_alloc&) {
  return false;
}

}  // namespace draw
