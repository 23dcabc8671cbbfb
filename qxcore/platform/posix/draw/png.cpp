#include "qxcore/platform/internal/png.h"

#include <png.h>

#include <csetjmp>
#include <new>

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

// --- writing: row by row, so that no second copy of the pixels is made ---

// libpng is C, which no exception may pass.
void Append(png_structp png, png_bytep piece, std::size_t count) {
  auto* bytes = static_cast<std::vector<BYTE>*>(png_get_io_ptr(png));
  bool hasRoom = true;
  try {
    bytes->insert(bytes->end(), piece, piece + count);
  } catch (const std::bad_alloc&) {
    hasRoom = false;
  }
  if (!hasRoom) png_error(png, "memory is out");
}

// Windows and drawings are flat: filters take time and make them larger.
bool WriteRows(png_structp png, png_infop info, PixelRows& rows) {
  constexpr int kFastest = 1;
  const SIZE size = rows.Size();
  if (setjmp(png_jmpbuf(png))) return false;
  png_set_IHDR(png, info, static_cast<png_uint_32>(size.cx), static_cast<png_uint_32>(size.cy), 8, PNG_COLOR_TYPE_RGB,
               PNG_INTERLACE_NONE, PNG_COMPRESSION_TYPE_DEFAULT, PNG_FILTER_TYPE_DEFAULT);
  png_set_sRGB(png, info, PNG_sRGB_INTENT_PERCEPTUAL);
  png_set_compression_level(png, kFastest);
  png_set_filter(png, PNG_FILTER_TYPE_BASE, PNG_FILTER_NONE);
  png_write_info(png, info);
  png_set_bgr(png);
  png_set_filler(png, 0, PNG_FILLER_AFTER);
  for (int first = 0, count = 0; first < size.cy; first += count) {
    const std::uint32_t* row = rows.Read(first, &count);
    if (row == nullptr) return false;
    for (int y = 0; y < count; ++y, row += size.cx) png_write_row(png, reinterpret_cast<png_const_bytep>(row));
  }
  png_write_end(png, info);
  return true;
}

void Quiet(png_structp, png_const_charp) {}
void Leave(png_structp png, png_const_charp) { png_longjmp(png, 1); }

}  // namespace

HRESULT EncodePng(PixelRows& rows, std::vector<BYTE>* bytes) {
  bytes->clear();
  png_structp png = png_create_write_struct(PNG_LIBPNG_VER_STRING, nullptr, &Leave, &Quiet);
  png_infop info = png != nullptr ? png_create_info_struct(png) : nullptr;
  if (info != nullptr) png_set_write_fn(png, bytes, &Append, nullptr);
  const bool isWritten = info != nullptr && WriteRows(png, info, rows);
  png_destroy_write_struct(&png, &info);
  if (isWritten) return S_OK;
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
