// Copies between contexts, with the ternary raster operations, and single pixels.
#include <cstring>

#include "qxcore/platform/posix/draw/fill.h"
#include "qxcore/platform/posix/draw/recorder.h"

using namespace draw;

namespace {

// A raster operation's byte is its truth table: bit 4 * pattern + 2 * source + destination.
int TableOf(DWORD rop) { return static_cast<int>(rop >> 16 & 0xFF); }
bool UsesSource(int table) { return ((table >> 2 ^ table) & 0x33) != 0; }
bool UsesPattern(int table) { return ((table >> 4 ^ table) & 0xF) != 0; }

std::uint32_t Combine3(int table, std::uint32_t pattern, std::uint32_t source, std::uint32_t destination) {
  return (pattern & Combine(table >> 4, source, destination)) | (~pattern & Combine(table, source, destination));
}

// What a copy reads: pixels of the source's surface, or a copy of them where source and target overlap.
struct Source {
  Surface surface;
  std::vector<std::uint32_t> copied;
};

// How the pixels of one depth become those of another: colours of the target for 0 and 1, of the source for 1.
struct Conversion {
  bool toColors = false, toMono = false;
  std::uint32_t zero = 0, one = 0, background = 0;

  Conversion(const Context& to, const Settings& fromSettings, bool fromMono)
      : toColors(fromMono && !to.m_surface.mono),
        toMono(!fromMono && to.m_surface.mono),
        zero(PixelOf(to.m_settings.textColor)),
        one(PixelOf(to.m_settings.bkColor)),
        background(PixelOf(fromSettings.bkColor)) {}

  std::uint32_t operator()(std::uint32_t pixel) const {
    if (toColors) return pixel ? one : zero;
    if (toMono) return pixel == background ? kWhitePixel : 0;
    return pixel & 0xFFFFFF;
  }
};

// For each target pixel the source pixel that it shows. A larger target shows the one under its middle (the first of
// two), a smaller one the last of the columns, but the first of the rows that fall on it.
struct Axis {
  long long to, toSize, from, fromSize;  // sizes above 0
  bool mirrored, showsFirst;

  int At(int target) const {
    long long step = mirrored ? toSize - 1 - (target - to) : target - to;
    if (fromSize <= toSize) return static_cast<int>(from + ((2 * step + 1) * fromSize - 1) / (2 * toSize));
    if (showsFirst) return static_cast<int>(from + (step == 0 ? 0 : LastOf(step - 1) + 1));
    return static_cast<int>(from + LastOf(step));
  }

  long long LastOf(long long step) const { return (2 * fromSize * (step + 1) - toSize) / (2 * toSize); }
};

// A length with a sign, as the pixels that it covers: a negative one goes left from its first pixel, that included.
struct Extent {
  int start, size;

  Extent(int first, int length) : start(length < 0 ? first + length + 1 : first), size(std::abs(length)) {}
};

void StretchBox(const Context& to, const Box& part, const Source& source, const Axis& axisX, const Axis& axisY,
                const Conversion& convert, const Paint& pattern, int table) {
  const Surface& surface = source.surface;
  std::vector<std::uint32_t> brush(static_cast<std::size_t>(part.x2 - part.x1));
  for (int y = part.y1; y < part.y2; ++y) {
    int fromY = axisY.At(y);
    if (fromY < 0 || fromY >= surface.height) continue;
    if (UsesPattern(table)) pattern.Fill(part.x1, y, part.x2 - part.x1, brush.data(), nullptr);
    const std::uint32_t* fromRow = surface.Row(fromY);
    std::uint32_t* row = to.m_surface.Row(y);
    for (int x = part.x1; x < part.x2; ++x) {
      int fromX = axisX.At(x);
      if (fromX < 0 || fromX >= surface.width) continue;
      row[x] = Combine3(table, brush[static_cast<std::size_t>(x - part.x1)], convert(fromRow[fromX]), row[x]);
    }
  }
}

// The frequent case: the same size, the same depth, a plain copy.
void CopyBox(const Context& to, const Box& part, const Surface& from, int dx, int dy) {
  Box known = Intersect(part, {-dx, -dy, from.width - dx, from.height - dy});
  if (IsEmpty(known)) return;
  std::size_t bytes = static_cast<std::size_t>(known.x2 - known.x1) * 4;
  for (int y = known.y1; y < known.y2; ++y)
    std::memcpy(to.m_surface.Row(y) + known.x1, from.Row(y + dy) + known.x1 + dx, bytes);
}

// The same within one surface: rows go in the order in which none is written over before it is read.
void MoveBox(const Surface& surface, const Box& part, int dx, int dy) {
  const Box known = Intersect(part, {-dx, -dy, surface.width - dx, surface.height - dy});
  if (IsEmpty(known)) return;
  const std::size_t bytes = static_cast<std::size_t>(known.x2 - known.x1) * 4;
  const int rows = known.y2 - known.y1;
  for (int i = 0; i < rows; ++i) {
    const int y = dy >= 0 ? known.y1 + i : known.y2 - 1 - i;
    std::memmove(surface.Row(y) + known.x1, surface.Row(y + dy) + known.x1 + dx, bytes);
  }
}

// Where source and target are the same surface, the part that is read is copied first; `x` and `y` then count from
// the copy's corner.
Source SourceOf(const Context& to, const Surface& from, Extent& x, Extent& y) {
  Source source{from, {}};
  if (to.m_surface.pixels != from.pixels) return source;
  const Box read = Intersect({x.start, y.start, x.start + x.size, y.start + y.size}, {0, 0, from.width, from.height});
  if (IsEmpty(read)) return source;
  const int width = read.x2 - read.x1;
  source.copied.reserve(static_cast<std::size_t>(width) * (read.y2 - read.y1));
  for (int row = read.y1; row < read.y2; ++row)
    source.copied.insert(source.copied.end(), from.Row(row) + read.x1, from.Row(row) + read.x2);
  source.surface.pixels = source.copied.data();
  source.surface.stride = source.surface.width = width;
  source.surface.height = read.y2 - read.y1;
  x.start -= read.x1;
  y.start -= read.y1;
  return source;
}

struct Rectangle4 {
  int x, y, width, height;
};

void Stretch(Context& to, const Rectangle4& target, const Surface& from, const Settings& fromSettings,
             const Rectangle4& origin, int table) {
  if (target.width == 0 || target.height == 0 || origin.width == 0 || origin.height == 0) return;
  Conversion convert(to, fromSettings, from.mono);
  Paint pattern = UsesPattern(table) ? PaintOf(to, *to.m_settings.brush) : Paint();
  Extent toX(target.x, target.width), toY(target.y, target.height);
  Extent fromX(origin.x, origin.width), fromY(origin.y, origin.height);
  Axis axisX{toX.start, toX.size, fromX.start, fromX.size, (target.width < 0) != (origin.width < 0), false};
  Axis axisY{toY.start, toY.size, fromY.start, fromY.size, (target.height < 0) != (origin.height < 0), true};
  const bool plain = table == TableOf(SRCCOPY) && !convert.toColors && !convert.toMono && !axisX.mirrored &&
                     !axisY.mirrored && toX.size == fromX.size && toY.size == fromY.size;
  const Box box{toX.start, toY.start, toX.start + toX.size, toY.start + toY.size};
  const Box* clip = to.SingleClip();
  if (plain && clip != nullptr && to.m_surface.pixels == from.pixels)
    return MoveBox(from, Intersect(box, *clip), fromX.start - box.x1, fromY.start - box.y1);
  const Source source = SourceOf(to, from, fromX, fromY);
  axisX.from = fromX.start;
  axisY.from = fromY.start;
  ForVisible(to, box, [&](const Box& part) {
    if (plain)
      CopyBox(to, part, source.surface, fromX.start - box.x1, fromY.start - box.y1);
    else
      StretchBox(to, part, source, axisX, axisY, convert, pattern, table);
  });
}

// What a metafile keeps of a source: the pixels, and the colours that they are converted with.
struct KeptSource {
  Ref<Bitmap> bitmap;
  Settings settings;
};

BOOL StretchFrom(Context& to, const Rectangle4& target, const Surface& from, const Settings& fromSettings,
                 const Rectangle4& origin, int table);

bool RecordStretch(Context& to, const Rectangle4& target, const Surface& from, const Settings& fromSettings,
                   const Rectangle4& origin, int table) {
  if (!to.m_recorder) return false;
  KeptSource kept{Bitmap::Make(from.width, from.height, from.mono ? 1 : 32), fromSettings};
  if (!kept.bitmap) throw std::bad_alloc();
  for (int y = 0; y < from.height; ++y)
    std::memcpy(kept.bitmap->m_surface.Row(y), from.Row(y), static_cast<std::size_t>(from.width) * 4);
  to.m_recorder->Add([=](HDC handle) {
    StretchFrom(*Find<Context>(handle), target, kept.bitmap->m_surface, kept.settings, origin, table);
  });
  return true;
}

// `target` in logical units, `origin` in pixels of the source's surface.
BOOL StretchFrom(Context& to, const Rectangle4& target, const Surface& from, const Settings& fromSettings,
                 const Rectangle4& origin, int table) {
  if (RecordStretch(to, target, from, fromSettings, origin, table)) return TRUE;
  int x = to.X(target.x), y = to.Y(target.y);
  Stretch(to, {x, y, to.X(target.x + target.width) - x, to.Y(target.y + target.height) - y}, from, fromSettings, origin,
          table);
  return TRUE;
}

}  // namespace

BOOL StretchBlt(HDC toHandle, int x, int y, int width, int height, HDC fromHandle, int fromX, int fromY, int fromWidth,
                int fromHeight, DWORD rop) try {
  int table = TableOf(rop);
  if (!UsesSource(table)) return PatBlt(toHandle, x, y, width, height, rop);
  auto* to = Find<Context>(toHandle);
  auto* from = Find<Context>(fromHandle);
  if (!to || !from || from->m_recorder) return Fail(FALSE, ERROR_INVALID_HANDLE);
  from->PrepareToRead();
  int left = from->X(fromX), top = from->Y(fromY);
  Rectangle4 origin{left, top, from->X(fromX + fromWidth) - left, from->Y(fromY + fromHeight) - top};
  return StretchFrom(*to, {x, y, width, height}, from->m_surface, from->m_settings, origin, table);
} catch (const std::bad_alloc&) {
  return NoMemory(FALSE);
}

BOOL BitBlt(HDC to, int x, int y, int width, int height, HDC from, int fromX, int fromY, DWORD rop) {
  return StretchBlt(to, x, y, width, height, from, fromX, fromY, width, height, rop);
}

BOOL PatBlt(HDC handle, int x, int y, int width, int height, DWORD rop) try {
  auto* dc = Find<Context>(handle);
  if (!dc) return FALSE;
  int table = TableOf(rop);
  if (UsesSource(table)) return Fail(FALSE);
  if (Record(*dc, [=](HDC to) { PatBlt(to, x, y, width, height, rop); })) return TRUE;
  // Without a source the table's bits 0, 1 (no pattern) and 4, 5 (pattern) are those of a binary operation.
  int rop2 = (table & 3) + (table >> 4 & 3) * 4 + 1;
  Paint paint = UsesPattern(table) ? PaintOf(*dc, *dc->m_settings.brush) : SolidPaint(*dc, 0);
  PaintBox(*dc, dc->Map(x, y, x + width, y + height), paint, rop2);
  return TRUE;
} catch (const std::bad_alloc&) {
  return NoMemory(FALSE);
}

COLORREF GetPixel(HDC handle, int x, int y) try {
  auto* dc = Find<Context>(handle);
  if (!dc || dc->m_recorder) return CLR_INVALID;
  int atX = dc->X(x), atY = dc->Y(y);
  return dc->Clip().Contains(atX, atY) ? ColorOf(dc->m_surface.Row(atY)[atX]) : CLR_INVALID;
} catch (const std::bad_alloc&) {
  return NoMemory(COLORREF{CLR_INVALID});
}

BOOL SetPixelV(HDC handle, int x, int y, COLORREF color) try {
  auto* dc = Find<Context>(handle);
  if (!dc) return FALSE;
  if (Record(*dc, [=](HDC to) { SetPixelV(to, x, y, color); })) return TRUE;
  int atX = dc->X(x), atY = dc->Y(y);
  PaintBox(*dc, {atX, atY, atX + 1, atY + 1}, SolidPaint(*dc, color), dc->m_settings.rop2);
  return TRUE;
} catch (const std::bad_alloc&) {
  return NoMemory(FALSE);
}

COLORREF SetPixel(HDC dc, int x, int y, COLORREF color) {
  return SetPixelV(dc, x, y, color) ? GetPixel(dc, x, y) : CLR_INVALID;
}
