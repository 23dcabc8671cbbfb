// Drawing where memory is short: each call fails in its own way, and the context is as usable as before. The system's
// own drawing on Windows takes its memory elsewhere.
#ifndef _WIN32

#include <gtest/gtest.h>

#include <cstdlib>
#include <functional>
#include <new>

#include "qxcore/core/exception.h"
#include "qxcore/core/internal/memory_failures.h"
#include "qxcore/graphics/bitmap.h"
#include "qxcore/graphics/gradient.h"
#include "qxcore/graphics/metafile.h"

// The standard containers' memory fails by the same orders as the library's.
void* operator new(std::size_t size, const std::nothrow_t&) noexcept {
  return SMemMustFail() ? nullptr : std::malloc(size != 0 ? size : 1);
}
void* operator new(std::size_t size) {
  void* block = operator new(size, std::nothrow);
  if (block == nullptr) throw std::bad_alloc();
  return block;
}
void operator delete(void* block) noexcept { std::free(block); }
void operator delete(void* block, std::size_t) noexcept { std::free(block); }

namespace {

// Runs an operation with its first, second, ... allocation failing, until it needs no more. It returns whether the call
// succeeded.
void WithShortMemory(const char* name, const std::function<bool()>& operation) {
  int failures = 0;
  for (long n = 1;; ++n) {
    SetLastError(0);
    SMemFailAt(n);
    bool succeeded = false, threw = false;
    try {
      succeeded = operation();
    } catch (...) {
      threw = true;
    }
    const bool hasFailed = SMemHasFailed();
    const DWORD error = GetLastError();
    SMemFailAt(0);
    ASSERT_FALSE(threw) << name << ", allocation " << n;
    if (!hasFailed) {
      EXPECT_TRUE(succeeded) << name;
      break;
    }
    ++failures;
    EXPECT_FALSE(succeeded) << name << ", allocation " << n;
    EXPECT_EQ(error, static_cast<DWORD>(ERROR_NOT_ENOUGH_MEMORY)) << name << ", allocation " << n;
  }
  EXPECT_GT(failures, 0) << name << " needs no memory";
}

template <class Handle>
bool DeleteMade(Handle handle) {
  return handle != nullptr && DeleteObject(handle);
}

TEST(ShortMemory, FailsTheCallAlone) {
  SMemoryDC dc;
  SBitmap bitmap;
  bitmap.CreatePixels(60, 40);
  SSelectObject select(dc, bitmap);
  const POINT star[] = {{5, 5}, {50, 8}, {10, 35}, {30, 1}, {45, 38}};
  HRGN ring = CreateEllipticRgn(0, 0, 30, 30), other = CreatePolygonRgn(star, 5, WINDING);
  LOGFONTW font{};
  SString(WTEXT("Liberation Serif")).View().copy(font.lfFaceName, LF_FACESIZE - 1);
  LONG height = 20;
  RECT box{2, 2, 55, 38};

  WithShortMemory("context", [] { return DeleteMade(CreateCompatibleDC(nullptr)); });
  WithShortMemory("pen", [] { return DeleteMade(CreatePen(PS_SOLID, 3, 0)); });
  WithShortMemory("bitmap", [] { return DeleteMade(CreateBitmap(3, 3, 1, 32, nullptr)); });
  WithShortMemory("round region", [] { return DeleteMade(CreateRoundRectRgn(0, 0, 40, 30, 10, 10)); });
  WithShortMemory("polygon region", [&] { return DeleteMade(CreatePolygonRgn(star, 5, ALTERNATE)); });
  WithShortMemory("screen", [] {
    HDC screen = GetDC(nullptr);
    return screen != nullptr && ReleaseDC(nullptr, screen);
  });
  WithShortMemory("saving", [&] { return SaveDC(dc) != 0; });
  WithShortMemory("polygon", [&] { return Polygon(dc, star, 5); });
  WithShortMemory("polyline", [&] { return Polyline(dc, star, 5); });
  WithShortMemory("ellipse", [&] { return Ellipse(dc, 1, 1, 50, 30); });
  WithShortMemory("round rectangle", [&] { return RoundRect(dc, 1, 1, 50, 30, 8, 8); });
  WithShortMemory("stretch within", [&] { return StretchBlt(dc, 5, 5, 20, 20, dc, 0, 0, 10, 10, SRCCOPY); });
  WithShortMemory("text", [&] {
    font.lfHeight = ++height;  // no face is kept of this size
    HFONT made = CreateFontIndirectW(&font);
    if (made == nullptr) return false;
    SSelectObject selectFont(dc, made);
    const bool drawn = TextOutW(dc, 1, 1, WTEXT("Text \x05D0\x05D1"), 7);
    DeleteObject(made);
    return drawn;
  });
  WithShortMemory("text in a box", [&] {
    return DrawTextW(dc, WTEXT("some words to be broken"), -1, &box, DT_WORDBREAK | DT_CENTER) > 0;
  });
  HIMAGELIST list = ImageList_Create(4, 4, ILC_COLOR32, 0, 0);
  WithShortMemory("picture list", [&] { return ImageList_Add(list, bitmap, nullptr) >= 0; });

  // All is as before, and works.
  EXPECT_EQ(CombineRgn(ring, ring, other, RGN_AND), COMPLEXREGION);
  EXPECT_EQ(SelectClipRgn(dc, ring), COMPLEXREGION);
  EXPECT_TRUE(Ellipse(dc, 1, 1, 50, 30));
  EXPECT_EQ(ImageList_GetImageCount(list), 60 / 4) << "none of the failed attempts'";
  ImageList_Destroy(list);
  DeleteObject(ring);
  DeleteObject(other);
}

// A recording that lacks a call is not handed out.
TEST(ShortMemory, EndsRecordings) {
  WithShortMemory("metafile", [] {
    HDC dc = CreateMetaFileW(nullptr);
    if (dc == nullptr) return false;
    SetBkColor(dc, 1);
    LineTo(dc, 5, 5);
    HMETAFILE metafile = CloseMetaFile(dc);
    return metafile != nullptr && DeleteMetaFile(metafile);
  });
}

// Above the platform a shortage is the library's exception.
TEST(ShortMemory, OfAGradientsFrameIsThrown) {
  SMemoryDC dc;
  SBitmap bitmap;
  bitmap.CreatePixels(60, 40);
  SSelectObject select(dc, bitmap);
  SDrawGradient gradient;
  gradient.SetGradient(SDrawGradient::BUTTON, 0x404040, 0xC0C0C0, SRect(0, 0, 60, 40));
  gradient.SetFrameType(SDrawGradient::FRAME_ROUND_RECT);
  SMemFailAt(1);
  EXPECT_THROW(gradient.DrawGradient(dc), SEOutOfMemory);
  SMemFailAt(0);
  gradient.DrawGradient(dc);
  EXPECT_NE(dc.GetPixel(SPoint(30, 20)), 0u);
}

}  // namespace

#endif
