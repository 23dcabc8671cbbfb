#include "qxcore/platform/posix/draw/blend.h"

#include <cstring>
#ifdef __SSE2__
#include <emmintrin.h>
#endif

namespace draw {

namespace {

std::uint32_t Average(std::uint32_t to, std::uint32_t color, std::uint32_t cover) {
  auto channel = [&](int shift) {
    std::uint32_t sum = (to >> shift & 0xFF) * (255 - cover) + (color >> shift & 0xFF) * cover + 127;
    return sum / 255 << shift;
  };
  return channel(0) | channel(8) | channel(16);
}

void BlendPixels(std::uint32_t* row, const std::uint8_t* mask, int count, std::uint32_t color) {
  for (int x = 0; x < count; ++x) {
    if (mask[x] == 255)
      row[x] = color;
    else if (mask[x] != 0)
      row[x] = Average(row[x], color, mask[x]);
  }
}

#ifdef __SSE2__
// Two pixels in 16-bit lanes: (to * (255 - cover) + color * cover) / 255, rounded. The division is exact for this
// range: (n + 128 + (n + 128) / 256) / 256.
__m128i Average2(__m128i to, __m128i color, __m128i cover) {
  __m128i sum =
      _mm_add_epi16(_mm_mullo_epi16(to, _mm_sub_epi16(_mm_set1_epi16(255), cover)), _mm_mullo_epi16(color, cover));
  sum = _mm_add_epi16(sum, _mm_set1_epi16(128));
  return _mm_srli_epi16(_mm_add_epi16(sum, _mm_srli_epi16(sum, 8)), 8);
}

void BlendRow(std::uint32_t* row, const std::uint8_t* mask, int count, std::uint32_t color) {
  const __m128i zero = _mm_setzero_si128();
  const __m128i wide = _mm_unpacklo_epi8(_mm_set1_epi32(static_cast<int>(color)), zero);
  int x = 0;
  for (; x + 4 <= count; x += 4) {
    std::uint32_t covers;
    std::memcpy(&covers, mask + x, 4);
    if (covers == 0) continue;
    __m128i pixels = _mm_loadu_si128(reinterpret_cast<const __m128i*>(row + x));
    __m128i cover = _mm_cvtsi32_si128(static_cast<int>(covers));
    cover = _mm_unpacklo_epi8(cover, cover);
    cover = _mm_unpacklo_epi16(cover, cover);  // each cover four times
    __m128i low = Average2(_mm_unpacklo_epi8(pixels, zero), wide, _mm_unpacklo_epi8(cover, zero));
    __m128i high = Average2(_mm_unpackhi_epi8(pixels, zero), wide, _mm_unpackhi_epi8(cover, zero));
    _mm_storeu_si128(reinterpret_cast<__m128i*>(row + x), _mm_packus_epi16(low, high));
  }
  BlendPixels(row + x, mask + x, count - x, color);
}
#else
void BlendRow(std::uint32_t* row, const std::uint8_t* mask, int count, std::uint32_t color) {
  BlendPixels(row, mask, count, color);
}
#endif

// A surface of one bit takes what is covered at least by half.
void SetRow(std::uint32_t* row, const std::uint8_t* mask, int count, std::uint32_t color) {
  for (int x = 0; x < count; ++x) {
    if (mask[x] >= 128) row[x] = color;
  }
}

}  // namespace

void BlendGlyph(const Surface& surface, const Box& clip, int x, int y, const Glyph& glyph, std::uint32_t pixel) {
  Box part = Intersect({x, y, x + glyph.width, y + glyph.height}, clip);
  if (IsEmpty(part)) return;
  // Where there is room, the zeros behind a row are blended as well: they change nothing and keep to whole vectors.
  int count = part.x1 == x && x + glyph.stride <= clip.x2 ? glyph.stride : part.x2 - part.x1;
  const std::uint8_t* mask =
      glyph.mask.data() + static_cast<std::ptrdiff_t>(glyph.stride) * (part.y1 - y) + (part.x1 - x);
  std::uint32_t* row = surface.Row(part.y1) + part.x1;
  for (int line = part.y1; line < part.y2; ++line, mask += glyph.stride, row += surface.stride) {
    if (surface.mono)
      SetRow(row, mask, count, pixel);
    else
      BlendRow(row, mask, count, pixel);
  }
}

}  // namespace draw
