// Bitmaps. Whatever their format outside, pixels are kept with 32 bits: blue, green, red, and a byte that drawing
// leaves 0. A bitmap of one bit holds black and white only.
#pragma once

#include <cstdint>

#include "qxcore/platform/posix/draw/object.h"

namespace draw {

// A colour as a pixel and back.
inline std::uint32_t PixelOf(COLORREF color) { return (color & 0xFF) << 16 | (color & 0xFF00) | (color >> 16 & 0xFF); }
inline COLORREF ColorOf(std::uint32_t pixel) { return PixelOf(pixel); }

constexpr std::uint32_t kWhitePixel = 0xFFFFFF;

// The pixels that something is drawn on.
struct Surface {
  std::uint32_t* pixels = nullptr;  // the top left one
  int stride = 0;                   // pixels from a row to the next; negative when the rows go up
  int width = 0, height = 0;
  bool mono = false;

  std::uint32_t* Row(int y) const { return pixels + static_cast<std::ptrdiff_t>(stride) * y; }
  // A colour as this surface can hold it.
  std::uint32_t Nearest(std::uint32_t pixel) const { return mono ? BlackOrWhite(pixel) : pixel; }

 private:
  static std::uint32_t BlackOrWhite(std::uint32_t pixel);
};

class Bitmap final : public Object {
 public:
  static bool IsType(DWORD type) { return type == OBJ_BITMAP; }
  // A black bitmap; null with the last error set when there is no memory or a size is not within 1 to 32767.
  static Bitmap* Make(int width, int height, int bitCount, bool topDown = true);
  ~Bitmap() override;

  Surface m_surface;
  int m_bitCount = 32;     // as it was asked for
  bool m_section = false;  // the program has the address of its bits
  void* m_memory = nullptr;
  const Object* m_user = nullptr;  // the context that it is selected into

 private:
  Bitmap() : Object(OBJ_BITMAP) {}
};

// The bytes of a row of pixels, as device-dependent bitmaps count them (even) and as others do (by fours).
int RowBytes(int width, int bitCount, int unit);

}  // namespace draw
