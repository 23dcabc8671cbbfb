// Pictures as PNG (ISO/IEC 15948) bytes and back: libpng on Linux, the system's imaging component on Windows, which is
// loaded when it is first needed.
#pragma once

#include <cstdint>
#include <vector>

#include "qxcore/platform/win32.h"

namespace platform {

// Pixels as bitmaps have them: blue, green, red, and a byte that is 0; rows from the top, without gaps.
struct Pixels {
  int width = 0, height = 0;
  std::vector<std::uint32_t> data;
};

constexpr int kLargestSide = 32767;

// Where a picture comes from that is written. Nothing here throws.
class PixelRows {
 public:
  virtual SIZE Size() const = 0;
  // Rows from `first` on, as Pixels has them, and how many there are, at least one; valid until the next call. Each row
  // is asked for once, from the top on. Null when they cannot be had.
  virtual const std::uint32_t* Read(int first, int* count) = 0;

 protected:
  ~PixelRows() = default;
};

// The bytes of a file with these pixels; 0, or an error code with *bytes empty. May throw std::bad_alloc.
HRESULT EncodePng(PixelRows& rows, std::vector<BYTE>* bytes);

// The pixels of a file, transparent parts laid over white. 0, ERROR_INVALID_DATA as an HRESULT for bytes that are no
// PNG, are damaged or have a side of more than kLargestSide; *pixels is empty then. May throw std::bad_alloc.
HRESULT DecodePng(const BYTE* bytes, std::size_t count, Pixels* pixels);

}  // namespace platform
