#include "qxcore/platform/posix/draw/fill.h"

#include <algorithm>

#if defined(__x86_64__)
#include <immintrin.h>
#endif

#include "qxcore/platform/internal/processor.h"

namespace draw {
namespace {

constexpr int kNarrow = 16;  // pixels of a row below which setting a call up costs more than it saves

#if defined(__x86_64__)

// Twice as wide as pixman's own fill, which most of the time of a gradient goes into.
__attribute__((target("avx2"))) void FillRow(std::uint32_t* row, int width, std::uint32_t pixel) {
  constexpr int kBlock = 8;
  static_assert(kNarrow >= kBlock, "a row holds a block");
  const __m256i block = _mm256_set1_epi32(static_cast<int>(pixel));
  auto store = [&](std::uint32_t * at) __attribute__((target("avx2"))) {
    _mm256_storeu_si256(reinterpret_cast<__m256i*>(at), block);
  };
  std::uint32_t* last = row + width - kBlock;
  store(row);  // up to where blocks lie within lines of the cache
  row += kBlock - (reinterpret_cast<std::uintptr_t>(row) / sizeof *row) % kBlock;
  for (; row + 3 * kBlock <= last; row += 4 * kBlock) {
    store(row);
    store(row + kBlock);
    store(row + 2 * kBlock);
    store(row + 3 * kBlock);
  }
  for (; row < last; row += kBlock) store(row);
  store(last);  // over what is filled already, so that no rest is left
}

bool FillWide(const Surface& surface, const Box& box, std::uint32_t pixel) {
  static const bool canUse = platform::CanUse(platform::Instructions::kAvx2);
  if (!canUse) return false;
  for (int y = box.y1; y < box.y2; ++y) FillRow(surface.Row(y) + box.x1, box.x2 - box.x1, pixel);
  return true;
}

#else

bool FillWide(const Surface&, const Box&, std::uint32_t) { return false; }

#endif

}  // namespace

void FillSolid(const Surface& surface, const Box& box, std::uint32_t pixel) {
  int width = box.x2 - box.x1;
  if (width >= kNarrow) {
    if (!FillWide(surface, box, pixel))
      pixman_fill(surface.pixels, surface.stride, 32, box.x1, box.y1, width, box.y2 - box.y1, pixel);
    return;
  }
  std::uint32_t* row = surface.Row(box.y1) + box.x1;
  for (int y = box.y1; y < box.y2; ++y, row += surface.stride) {
    for (int x = 0; x < width; ++x) row[x] = pixel;
  }
}

// --- where colours come from ---

Paint SolidPaint(const Context& dc, COLORREF color) {
  Paint paint;
  paint.kind = Paint::kSolid;
  paint.pixel = dc.m_surface.Nearest(PixelOf(color & 0xFFFFFF));
  return paint;
}

Paint PaintOf(const Context& dc, const Pen& pen) {
  if (pen.m_style == PS_NULL) return Paint();
  return SolidPaint(dc, pen.m_color.Value(dc.m_settings.penColor));
}

Paint PaintOf(const Context& dc, const Brush& brush) {
  if (brush.m_style == BS_NULL) return Paint();
  Paint paint = SolidPaint(dc, brush.m_color.Value(dc.m_settings.brushColor));
  paint.originX = dc.m_origin.x + dc.m_settings.brushOrigin.x;
  paint.originY = dc.m_origin.y + dc.m_settings.brushOrigin.y;
  if (brush.m_style == BS_HATCHED) {
    paint.kind = Paint::kHatch;
    paint.hatch = brush.m_hatch;
    paint.background = dc.m_surface.Nearest(PixelOf(dc.m_settings.bkColor));
    paint.transparent = dc.m_settings.bkMode == TRANSPARENT;
  } else if (brush.m_style == BS_PATTERN) {
    paint.kind = Paint::kPattern;
    paint.pattern = &brush.m_pattern->m_surface;
    // A pattern of one bit takes the context's colours: text for 0, background for 1.
    paint.pixel = dc.m_surface.Nearest(PixelOf(dc.m_settings.textColor));
    paint.background = dc.m_surface.Nearest(PixelOf(dc.m_settings.bkColor));
  }
  return paint;
}

namespace {

int Wrap(int value, int size) {
  int rest = value % size;
  return rest < 0 ? rest + size : rest;
}

// True where a hatch of 8 x 8 pixels has its line.
bool OnHatch(int hatch, int x, int y) {
  switch (hatch) {
    case HS_HORIZONTAL:
      return y == 3;
    case HS_VERTICAL:
      return x == 4;
    case HS_FDIAGONAL:
      return x == y;
    case HS_BDIAGONAL:
      return x == 7 - y;
    case HS_CROSS:
      return y == 3 || x == 4;
    default:
      return x == y || x == 7 - y;
  }
}

}  // namespace

void Paint::Fill(int x, int y, int count, std::uint32_t* pixels, bool* covered) const {
  if (kind == kPattern) {
    const std::uint32_t* row = pattern->Row(Wrap(y - originY, pattern->height));
    for (int i = 0; i < count; ++i) {
      std::uint32_t value = row[Wrap(x - originX + i, pattern->width)];
      pixels[i] = !pattern->mono ? value : value ? background : pixel;
    }
  } else if (kind == kHatch) {
    for (int i = 0; i < count; ++i) {
      bool line = OnHatch(hatch, Wrap(x - originX + i, 8), Wrap(y - originY, 8));
      pixels[i] = line ? pixel : background;
      if (covered) covered[i] = line || !transparent;
    }
    return;
  } else {
    std::fill_n(pixels, count, pixel);
  }
  if (covered) std::fill_n(covered, count, true);
}

// --- painting ---

namespace {

void CombineSolid(const Surface& surface, const Box& box, std::uint32_t pixel, int table) {
  for (int y = box.y1; y < box.y2; ++y) {
    std::uint32_t* row = surface.Row(y);
    for (int x = box.x1; x < box.x2; ++x) row[x] = Combine(table, pixel, row[x]);
  }
}

void CombineRows(const Surface& surface, const Box& box, const Paint& paint, int table) {
  constexpr int kChunk = 256;
  std::uint32_t pixels[kChunk];
  bool covered[kChunk];
  for (int y = box.y1; y < box.y2; ++y) {
    for (int x = box.x1; x < box.x2; x += kChunk) {
      int count = std::min(kChunk, box.x2 - x);
      paint.Fill(x, y, count, pixels, covered);
      std::uint32_t* row = surface.Row(y) + x;
      for (int i = 0; i < count; ++i) {
        if (covered[i]) row[i] = Combine(table, pixels[i], row[i]);
      }
    }
  }
}

}  // namespace

void PaintBox(const Context& dc, const Box& box, const Paint& paint, int rop2) {
  if (paint.kind == Paint::kNothing || rop2 == R2_NOP) return;
  const Surface& surface = dc.m_surface;
  int table = TableOfRop2(rop2);
  ForVisible(dc, box, [&](const Box& part) {
    if (paint.kind != Paint::kSolid)
      CombineRows(surface, part, paint, table);
    else if (rop2 == R2_COPYPEN)
      FillSolid(surface, part, paint.pixel);
    else
      CombineSolid(surface, part, paint.pixel, table);
  });
}

void PaintArea(const Context& dc, const Area& area, const Paint& paint, int rop2) {
  int count;
  const Box* boxes = area.Boxes(&count);
  for (int i = 0; i < count; ++i) PaintBox(dc, boxes[i], paint, rop2);
}

}  // namespace draw
