// SBitmap: a picture in memory that a memory context draws on. Threads: an object belongs to one thread at a time.
#pragma once

#include "qxcore/graphics/gdi_object.h"
#include "qxcore/graphics/rect.h"
#include "qxcore/string/string.h"

class QXCORE_API SBitmap : public SGdiObject {
  QXCORE_DECLARE_CREATABLE_CLASS(SBitmap)

  SBitmap() = default;
  explicit SBitmap(HBITMAP bitmap) : SGdiObject(bitmap) {}

  // A bitmap of the colours of a context. Sizes in pixels, above 0. Its content is black.
  int CreateCompatibleBitmap(HDC dc, int width, int height) {
    return Hold(::CreateCompatibleBitmap(dc, width, height));
  }
  // A bitmap whose pixels the program may read and write by GetBits: 32 bits each (blue, green, red, one unused
  // byte), rows from the top, without gaps. Content 0.
  int CreatePixels(int width, int height);
  // The bytes of a bitmap made by CreatePixels or read from a picture, else null; valid as long as the handle.
  // Call GdiFlush between drawing into it and using them.
  std::uint32_t* GetBits() const;
  // Width and height in pixels; 0 and 0 without a bitmap.
  SSize GetSize() const;

  // The handle; stays the object's.
  operator HBITMAP() const { return static_cast<HBITMAP>(m_hObject); }
};
