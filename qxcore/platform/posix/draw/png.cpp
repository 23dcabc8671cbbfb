#include "qxcore/platform/internal/png.h"

#include <png.h>

#include <cstring>

namespace platform {

namespace {

constexpr HRESULT kInvalidData = static_cast<HRESULT>(0x80070000u | ERROR_INVALID_DATA);

// Frees what libpng holds for a picture.
struct Image : png_image {
  Image() : png_image{} { version = PNG_IMAGE_VERSION; }
  ~Image() { png_image_free(this); }
  Image(const Image&) = delete;
  Image& operator=(const Image&) = delete;
};

// Three bytes a pixel, as the file holds them.
std::vector<BYTE> WithoutPadding(const Pixels& pixels) {
  std::vector<BYTE> rows;
  rows.reserve(pixels.data.size() * 3);
  for (std::uint32_t pixel : pixels.data) {
    for (int shift : {0, 8, 16}) rows.push_back(static_cast<BYTE>(pixel >> shift));
  }
  return rows;
}

}  // namespace

HRESULT EncodePng(const Pixels& pixels, std::vector<BYTE>* bytes) {
  bytes->clear();
  Image image;
  image.width = static_cast<png_uint_32>(pixels.width);
  image.height = static_cast<png_uint_32>(pixels.height);
  image.format = PNG_FORMAT_BGR;
  std::vector<BYTE> rows = WithoutPadding(pixels);
  png_alloc_size_t size = 0;
  if (!png_image_write_to_memory(&image, nullptr, &size, 0, rows.data(), 0, nullptr)) return E_FAIL;
  bytes->resize(size);
  if (png_image_write_to_memory(&image, bytes->data(), &size, 0, rows.data(), 0, nullptr)) {
    bytes->resize(size);
    return S_OK;
  }
  bytes->clear();
  return E_FAIL;
}

HRESULT DecodePng(const BYTE* bytes, std::size_t count, Pixels* pixels) {
  *pixels = Pixels();
  Image image;
  if (!png_image_begin_read_from_memory(&image, bytes, count)) return kInvalidData;
  if (image.width > kLargestSide || image.height > kLargestSide) return kInvalidData;
  image.format = PNG_FORMAT_BGR;
  std::vector<BYTE> rows(PNG_IMAGE_SIZE(image));
  const png_color white{255, 255, 255};
  if (!png_image_finish_read(&image, &white, rows.data(), 0, nullptr)) return kInvalidData;
  pixels->width = static_cast<int>(image.width);
  pixels->height = static_cast<int>(image.height);
  pixels->data.resize(rows.size() / 3);
  for (std::size_t i = 0; i < pixels->data.size(); ++i)
    pixels->data[i] = rows[3 * i] | std::uint32_t{rows[3 * i + 1]} << 8 | std::uint32_t{rows[3 * i + 2]} << 16;
  return S_OK;
}

}  // namespace platform
