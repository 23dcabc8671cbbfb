#include "qxcore/platform/posix/draw/line.h"

#include <cmath>
#include <cstdlib>

#include "qxcore/platform/posix/draw/recorder.h"

namespace draw {

namespace {

// --- broken pens: lengths of dash and gap by turns, in pixels ---

struct Pattern {
  int count;
  int lengths[6];
};

const Pattern* PatternOf(int style) {
  static constexpr Pattern kDash{2, {18, 6}}, kDot{2, {3, 3}}, kDashDot{4, {9, 6, 3, 6}},
      kDashDotDot{6, {9, 3, 3, 3, 3, 3}};
  switch (style) {
    case PS_DASH:
      return &kDash;
    case PS_DOT:
      return &kDot;
    case PS_DASHDOT:
      return &kDashDot;
    case PS_DASHDOTDOT:
      return &kDashDotDot;
    default:
      return nullptr;
  }
}

// Whether a pixel of a broken line belongs to a dash.
bool OnDash(const Pattern& pattern, int phase) {
  int total = 0;
  for (int i = 0; i < pattern.count; ++i) total += pattern.lengths[i];
  int rest = phase % total, i = 0;
  while (rest >= pattern.lengths[i]) rest -= pattern.lengths[i++];
  return i % 2 == 0;
}

// Paints pixel by pixel along the line: dashes with the pen, gaps with the background or not at all.
class Plotter {
 public:
  Plotter(const Context& dc, int* phase)
      : m_dc(dc),
        m_pen(PaintOf(dc, *dc.m_settings.pen)),
        m_gap(dc.m_settings.bkMode == OPAQUE ? SolidPaint(dc, dc.m_settings.bkColor) : Paint()),
        m_pattern(PatternOf(dc.m_settings.pen->m_style)),
        m_phase(phase) {}

  bool Broken() const { return m_pattern != nullptr; }
  void Run(int x, int y, int count) { PaintBox(m_dc, {x, y, x + count, y + 1}, m_pen, m_dc.m_settings.rop2); }
  void Column(int x, int y, int count) { PaintBox(m_dc, {x, y, x + 1, y + count}, m_pen, m_dc.m_settings.rop2); }
  void Pixel(int x, int y) {
    bool dash = !m_pattern || OnDash(*m_pattern, (*m_phase)++);
    PaintBox(m_dc, {x, y, x + 1, y + 1}, dash ? m_pen : m_gap, m_dc.m_settings.rop2);
  }
  void Skip(long long pixels) {
    if (m_pattern) *m_phase = static_cast<int>((*m_phase + pixels) % 5544);  // a multiple of all patterns' lengths
  }

 private:
  const Context& m_dc;
  Paint m_pen, m_gap;
  const Pattern* m_pattern;
  int* m_phase;
};

// The pixels of Bresenham's line from `from` to before `to`: at step i along the long axis the short coordinate is
// (2 * shortLength * i + longLength - bias) / (2 * longLength), rounded down. A tie goes to the start, but in the
// octants where the system lets it go on, bias is 0.
struct Slope {
  bool alongX;
  int longStep, shortStep;
  long long longLength, shortLength;
  int bias;

  Slope(POINT from, POINT to) {
    long long dx = static_cast<long long>(to.x) - from.x, dy = static_cast<long long>(to.y) - from.y;
    alongX = std::llabs(dx) >= std::llabs(dy);
    longLength = alongX ? std::llabs(dx) : std::llabs(dy);
    shortLength = alongX ? std::llabs(dy) : std::llabs(dx);
    longStep = (alongX ? dx : dy) < 0 ? -1 : 1;
    shortStep = (alongX ? dy : dx) < 0 ? -1 : 1;
    bias = shortStep > 0 ? 1 : 0;
  }
  long long Short(long long i) const { return (2 * shortLength * i + longLength - bias) / (2 * longLength); }
};

// The steps along one axis that lie within [low, high).
void Limit(int start, int step, int low, int high, long long* first, long long* last) {
  long long a = step > 0 ? static_cast<long long>(low) - start : static_cast<long long>(start) - high + 1;
  long long b = step > 0 ? static_cast<long long>(high) - start : static_cast<long long>(start) - low + 1;
  *first = std::max(*first, a);
  *last = std::min(*last, b);
}

void DrawSloped(const Context& dc, Plotter& plot, POINT from, const Slope& slope) {
  const Box& clip = dc.Clip().Extents();
  long long first = 0, last = slope.longLength;
  Limit(slope.alongX ? from.x : from.y, slope.longStep, slope.alongX ? clip.x1 : clip.y1,
        slope.alongX ? clip.x2 : clip.y2, &first, &last);
  plot.Skip(std::min(first, slope.longLength));
  for (long long i = first; i < last; ++i) {
    int along = static_cast<int>(i) * slope.longStep, across = static_cast<int>(slope.Short(i)) * slope.shortStep;
    if (slope.alongX)
      plot.Pixel(from.x + along, from.y + across);
    else
      plot.Pixel(from.x + across, from.y + along);
  }
  plot.Skip(slope.longLength - std::max(last, first));
}

}  // namespace

void DrawLine(const Context& dc, POINT from, POINT to, int* phase) {
  Plotter plot(dc, phase);
  if (!plot.Broken() && from.y == to.y) {
    if (from.x < to.x) plot.Run(from.x, from.y, to.x - from.x);
    if (from.x > to.x) plot.Run(to.x + 1, from.y, from.x - to.x);
    return;
  }
  if (!plot.Broken() && from.x == to.x) {
    if (from.y < to.y) plot.Column(from.x, from.y, to.y - from.y);
    if (from.y > to.y) plot.Column(from.x, to.y + 1, from.y - to.y);
    return;
  }
  Slope slope(from, to);
  if (slope.longLength > 0) DrawSloped(dc, plot, from, slope);
}

// --- wide pens ---

int PenWidth(const Context& dc) { return std::max(1, dc.Map().Width(dc.m_settings.pen->m_width)); }

namespace {

// One wide line with round ends: a bar along it and a disc at each end.
Area WideLine(POINT from, POINT to, int width) {
  auto disc = [width](POINT at) {
    int left = at.x - width / 2, top = at.y - width / 2;
    return EllipseArea({left, top, left + width, top + width});
  };
  Area area = disc(from);
  area.Or(disc(to));
  double dx = to.x - from.x, dy = to.y - from.y, length = std::hypot(dx, dy);
  if (length > 0) {
    double acrossX = -dy / length * width / 2, acrossY = dx / length * width / 2;
    POINT corners[4] = {{Mapping::Round(from.x + acrossX), Mapping::Round(from.y + acrossY)},
                        {Mapping::Round(to.x + acrossX), Mapping::Round(to.y + acrossY)},
                        {Mapping::Round(to.x - acrossX), Mapping::Round(to.y - acrossY)},
                        {Mapping::Round(from.x - acrossX), Mapping::Round(from.y - acrossY)}};
    area.Or(PolygonArea(corners, 4, WINDING));
  }
  return area;
}

}  // namespace

void DrawLines(const Context& dc, const POINT* points, int count, bool closed) {
  const Pen& pen = *dc.m_settings.pen;
  if (pen.m_style == PS_NULL) return;
  int lines = closed ? count : count - 1, width = PenWidth(dc), phase = 0;
  if (width == 1) {
    for (int i = 0; i < lines; ++i) DrawLine(dc, points[i], points[(i + 1) % count], &phase);
    return;
  }
  Area area;
  for (int i = 0; i < lines; ++i) area.Or(WideLine(points[i], points[(i + 1) % count], width));
  PaintArea(dc, area, PaintOf(dc, pen), dc.m_settings.rop2);
}

}  // namespace draw

using namespace draw;

BOOL MoveToEx(HDC handle, int x, int y, POINT* old) {
  auto* dc = Find<Context>(handle);
  if (!dc) return FALSE;
  Record(*dc, [=](HDC to) { MoveToEx(to, x, y, nullptr); });
  POINT former = std::exchange(dc->m_settings.position, POINT{x, y});
  if (old) *old = former;
  return TRUE;
}

BOOL GetCurrentPositionEx(HDC handle, POINT* position) {
  auto* dc = Find<Context>(handle);
  if (!dc) return FALSE;
  *position = dc->m_settings.position;
  return TRUE;
}

BOOL LineTo(HDC handle, int x, int y) try {
  auto* dc = Find<Context>(handle);
  if (!dc) return FALSE;
  POINT from = std::exchange(dc->m_settings.position, POINT{x, y});
  if (Record(*dc, [=](HDC to) { LineTo(to, x, y); })) return TRUE;
  POINT line[2] = {{dc->X(from.x), dc->Y(from.y)}, {dc->X(x), dc->Y(y)}};
  DrawLines(*dc, line, 2, false);
  return TRUE;
} catch (const std::bad_alloc&) {
  return NoMemory(FALSE);
}

// Records a call with points, or draws with them in pixels of the surface.
template <class Draw>
static BOOL WithPoints(HDC handle, const POINT* points, int count, BOOL (*again)(HDC, const POINT*, int), Draw draw) {
  auto* dc = Find<Context>(handle);
  if (!dc) return FALSE;
  if (count < 2) return Fail(FALSE);
  std::vector<POINT> copy(points, points + count);
  if (!dc->m_recorder) {
    for (POINT& point : copy) point = {dc->X(point.x), dc->Y(point.y)};
    draw(*dc, copy.data());
    return TRUE;
  }
  return Record(*dc,
                [copy = std::move(copy), again](HDC to) { again(to, copy.data(), static_cast<int>(copy.size())); });
}

BOOL Polyline(HDC handle, const POINT* points, int count) try {
  return WithPoints(handle, points, count, &Polyline,
                    [=](const Context& dc, const POINT* mapped) { DrawLines(dc, mapped, count, false); });
} catch (const std::bad_alloc&) {
  return NoMemory(FALSE);
}

BOOL Polygon(HDC handle, const POINT* points, int count) try {
  return WithPoints(handle, points, count, &Polygon, [=](const Context& dc, const POINT* mapped) {
    const Settings& set = dc.m_settings;
    PaintArea(dc, PolygonArea(mapped, count, set.polyFillMode, dc.Clip().Extents()), PaintOf(dc, *set.brush), set.rop2);
    DrawLines(dc, mapped, count, true);
  });
} catch (const std::bad_alloc&) {
  return NoMemory(FALSE);
}
