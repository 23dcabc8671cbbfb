// Bitmaps to and from PNG files. Threads: an object belongs to one thread at a time.
#pragma once

#include "qxcore/graphics/bitmap.h"
#include "qxcore/graphics/dc.h"

// Writes a bitmap as a PNG file of 24 bits a pixel. A file that is there is replaced when the new one is whole, and
// keeps its rights; until then the new one stands beside it as NAME.0.new (or the next number that is free). A
// symbolic link is replaced by the file; a device is written to. Returns 0; E_INVALIDARG for an invalid bitmap, the
// error of the file as an HRESULT, or E_FAIL where the encoder fails; what was there before stays then, and nothing
// else is left. Throws SEOutOfMemory.
QXCORE_API HRESULT SWritePicture(const SString& file, HBITMAP bitmap);

// The same of what a context shows in the area, in its pixels: a window, say, without a copy of all its pixels. A part
// that is covered or outside is whatever BitBlt makes of it. E_INVALIDARG for a context without a handle or an empty
// area, E_OUTOFMEMORY where the system makes no bitmap as wide as it.
QXCORE_API HRESULT SWritePicture(const SString& file, const SDC& source, const SRect& area);

// Reads a PNG file into a bitmap as CreatePixels makes it, transparent parts laid over white. Returns 0; the error of
// the file, or ERROR_INVALID_DATA (0x8007000D) for one that is not a PNG, is damaged or larger than 256 MiB or 32767
// pixels on a side; the bitmap is as it was then. Throws SEOutOfMemory.
QXCORE_API HRESULT SReadPicture(const SString& file, SBitmap* bitmap);
