#include "qxcore/graphics/bitmap.h"

QXCORE_IMPLEMENT_CREATABLE_CLASS(SBitmap, SGdiObject, 1)

int SBitmap::CreatePixels(int width, int height) {
  BITMAPINFO info{};
  info.bmiHeader.biSize = sizeof info.bmiHeader;
  info.bmiHeader.biWidth = width;
  info.bmiHeader.biHeight = -height;
  info.bmiHeader.biPlanes = 1;
  info.bmiHeader.biBitCount = 32;
  void* bits;
  return Hold(::CreateDIBSection(nullptr, &info, DIB_RGB_COLORS, &bits, nullptr, 0));
}

std::uint32_t* SBitmap::GetBits() const {
  BITMAP description;
  if (!GetObjectW(sizeof description, &description) || description.bmBitsPixel != 32) return nullptr;
  return static_cast<std::uint32_t*>(description.bmBits);
}

SSize SBitmap::GetSize() const {
  BITMAP description;
  if (!GetObjectW(sizeof description, &description)) return SSize();
  return SSize(description.bmWidth, description.bmHeight);
}
