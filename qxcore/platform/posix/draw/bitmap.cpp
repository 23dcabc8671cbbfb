#include "qxcore/platform/posix/draw/bitmap.h"

#include <cstdlib>
#include <cstring>

#include "qxcore/platform/posix/draw/context.h"

namespace draw {

std::uint32_t Surface::BlackOrWhite(std::uint32_t pixel) {
  std::uint32_t red = pixel >> 16 & 0xFF, green = pixel >> 8 & 0xFF, blue = pixel & 0xFF;
  return 30 * red + 59 * green + 11 * blue > 100 * 127 ? kWhitePixel : 0;
}

Bitmap* Bitmap::Make(int width, int height, int bitCount, bool topDown) {
  constexpr int kLargest = 32767;
  if (width < 1 || height < 1 || width > kLargest || height > kLargest) return Fail<Bitmap*>(nullptr);
  auto* bitmap = new Bitmap;
  if (!bitmap) return NoMemory<Bitmap*>(nullptr);
  bitmap->m_memory = std::calloc(static_cast<std::size_t>(width) * height, 4);
  if (!bitmap->m_memory) {
    delete bitmap;
    return NoMemory<Bitmap*>(nullptr);
  }
  auto* pixels = static_cast<std::uint32_t*>(bitmap->m_memory);
  bitmap->m_surface = {topDown ? pixels : pixels + static_cast<std::ptrdiff_t>(width) * (height - 1),
                       topDown ? width : -width, width, height, bitCount == 1};
  bitmap->m_bitCount = bitCount;
  return bitmap;
}

Bitmap::~Bitmap() { std::free(m_memory); }

int RowBytes(int width, int bitCount, int unit) {
  return static_cast<int>((static_cast<long long>(width) * bitCount + 8 * unit - 1) / (8 * unit) * unit);
}

}  // namespace draw

using namespace draw;

// --- reading and writing rows of other formats ---

namespace {

// A row of `bitCount` bits a pixel into pixels; `colors` serves up to 8 bits.
void ReadRow(const BYTE* row, int bitCount, const std::uint32_t* colors, int width, std::uint32_t* pixels) {
  for (int x = 0; x < width; ++x) {
    switch (bitCount) {
      case 1:
        pixels[x] = colors[row[x / 8] >> (7 - x % 8) & 1];
        break;
      case 4:
        pixels[x] = colors[row[x / 2] >> (x % 2 ? 0 : 4) & 0xF];
        break;
      case 8:
        pixels[x] = colors[row[x]];
        break;
      case 24:
        pixels[x] = row[3 * x] | row[3 * x + 1] << 8 | row[3 * x + 2] << 16;
        break;
      default:
        std::memcpy(&pixels[x], row + 4 * x, 4);
    }
  }
}

void WriteRow(const std::uint32_t* pixels, int bitCount, int width, BYTE* row) {
  if (bitCount == 32) {
    std::memcpy(row, pixels, static_cast<std::size_t>(width) * 4);
    return;
  }
  for (int x = 0; x < width; ++x) {
    row[3 * x] = static_cast<BYTE>(pixels[x]);
    row[3 * x + 1] = static_cast<BYTE>(pixels[x] >> 8);
    row[3 * x + 2] = static_cast<BYTE>(pixels[x] >> 16);
  }
}

bool IsBitCount(UINT bitCount) {
  return bitCount == 1 || bitCount == 4 || bitCount == 8 || bitCount == 24 || bitCount == 32;
}

bool IsPlain(const BITMAPINFOHEADER& header) {
  return header.biSize >= sizeof header && header.biPlanes == 1 && header.biCompression == BI_RGB &&
         header.biHeight != 0 && header.biHeight != INT32_MIN;
}

}  // namespace

// --- the calls ---

HBITMAP CreateCompatibleBitmap(HDC handle, int width, int height) {
  auto* dc = Find<Context>(handle);
  if (!dc) return nullptr;
  Bitmap* bitmap = Bitmap::Make(width, height, dc->m_surface.mono ? 1 : 32);
  return bitmap ? EnterAs<HBITMAP>(bitmap) : nullptr;
}

HBITMAP CreateBitmap(int width, int height, UINT planes, UINT bitCount, const void* bits) {
  if (planes != 1 || !IsBitCount(bitCount)) return Fail<HBITMAP>(nullptr);
  Bitmap* bitmap = Bitmap::Make(width, height, static_cast<int>(bitCount));
  if (!bitmap) return nullptr;
  if (bits) {
    std::uint32_t colors[256];
    for (std::uint32_t i = 0; i < 256; ++i) colors[i] = bitCount == 1 ? (i ? kWhitePixel : 0) : i * 0x010101;
    int bytes = RowBytes(width, static_cast<int>(bitCount), 2);
    for (int y = 0; y < height; ++y)
      ReadRow(static_cast<const BYTE*>(bits) + static_cast<std::ptrdiff_t>(bytes) * y, static_cast<int>(bitCount),
              colors, width, bitmap->m_surface.Row(y));
  }
  return EnterAs<HBITMAP>(bitmap);
}

HBITMAP CreateDIBSection(HDC, const BITMAPINFO* info, UINT usage, void** bits, HANDLE section, DWORD) {
  if (bits) *bits = nullptr;
  const BITMAPINFOHEADER& header = info->bmiHeader;
  if (!IsPlain(header) || header.biBitCount != 32 || usage != DIB_RGB_COLORS || section) return Fail<HBITMAP>(nullptr);
  Bitmap* bitmap = Bitmap::Make(header.biWidth, std::abs(header.biHeight), 32, header.biHeight < 0);
  if (!bitmap) return nullptr;
  bitmap->m_section = true;
  if (bits) *bits = bitmap->m_memory;
  return EnterAs<HBITMAP>(bitmap);
}

int GetDIBits(HDC, HBITMAP handle, UINT start, UINT lines, LPVOID bits, BITMAPINFO* info, UINT usage) {
  auto* bitmap = Find<Bitmap>(handle);
  if (!bitmap) return 0;
  BITMAPINFOHEADER& header = info->bmiHeader;
  const Surface& surface = bitmap->m_surface;
  if (!bits && header.biBitCount == 0) {
    header.biWidth = surface.width;
    header.biHeight = surface.height;
    header.biPlanes = 1;
    header.biBitCount = static_cast<WORD>(bitmap->m_bitCount);
    header.biCompression = BI_RGB;
    header.biSizeImage = static_cast<DWORD>(RowBytes(surface.width, bitmap->m_bitCount, 4) * surface.height);
    return surface.height;
  }
  if (!IsPlain(header) || usage != DIB_RGB_COLORS || (header.biBitCount != 24 && header.biBitCount != 32) ||
      header.biWidth != surface.width)
    return Fail(0);
  int height = std::abs(header.biHeight), bytes = RowBytes(surface.width, header.biBitCount, 4);
  if (!bits) return height;
  UINT done = 0;
  for (; done < lines && start + done < static_cast<UINT>(std::min(height, surface.height)); ++done) {
    int scan = static_cast<int>(start + done);
    int y = header.biHeight < 0 ? scan : height - 1 - scan;
    if (y < surface.height)
      WriteRow(surface.Row(y), header.biBitCount, surface.width,
               static_cast<BYTE*>(bits) + static_cast<std::ptrdiff_t>(bytes) * done);
  }
  return static_cast<int>(done);
}

int SetDIBits(HDC, HBITMAP handle, UINT start, UINT lines, const void* bits, const BITMAPINFO* info, UINT usage) {
  auto* bitmap = Find<Bitmap>(handle);
  if (!bitmap) return 0;
  const BITMAPINFOHEADER& header = info->bmiHeader;
  const Surface& surface = bitmap->m_surface;
  if (!IsPlain(header) || usage != DIB_RGB_COLORS || (header.biBitCount != 24 && header.biBitCount != 32) ||
      header.biWidth != surface.width)
    return Fail(0);
  int height = std::abs(header.biHeight), bytes = RowBytes(surface.width, header.biBitCount, 4);
  UINT done = 0;
  for (; done < lines && start + done < static_cast<UINT>(std::min(height, surface.height)); ++done) {
    int scan = static_cast<int>(start + done);
    int y = header.biHeight < 0 ? scan : height - 1 - scan;
    if (y >= surface.height) continue;
    std::uint32_t* row = surface.Row(y);
    ReadRow(static_cast<const BYTE*>(bits) + static_cast<std::ptrdiff_t>(bytes) * done, header.biBitCount, nullptr,
            surface.width, row);
    for (int x = 0; surface.mono && x < surface.width; ++x) row[x] = surface.Nearest(row[x]);
  }
  return static_cast<int>(done);
}
