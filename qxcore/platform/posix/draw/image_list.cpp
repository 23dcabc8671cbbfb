// Lists of small pictures: each a bitmap whose top byte says whether the pixel is drawn.
#include <algorithm>

#include "qxcore/platform/posix/draw/fill.h"
#include "qxcore/platform/posix/draw/recorder.h"

using namespace draw;

namespace {

constexpr std::uint32_t kDrawn = 0xFF000000;

class ImageList final : public Object {
 public:
  static bool IsType(DWORD type) { return type == kImageListType; }
  ImageList(int width, int height) : Object(kImageListType), m_width(width), m_height(height) {}
  int m_width, m_height;
  COLORREF m_background = CLR_NONE;
  std::vector<Ref<Bitmap>> m_images;
};

// Adds the pictures of a bitmap; drawn(x, y) says which pixels count.
template <class F>
int AddImages(ImageList& list, const Bitmap& images, F drawn) {
  int first = static_cast<int>(list.m_images.size()), count = images.m_surface.width / list.m_width;
  int height = std::min(list.m_height, images.m_surface.height);
  if (count < 1) return Fail(-1);
  std::vector<Ref<Bitmap>> all = list.m_images;
  for (int i = 0; i < count; ++i) {
    Ref<Bitmap> image(Bitmap::Make(list.m_width, list.m_height, 32));
    if (!image) return Fail(-1, ERROR_NOT_ENOUGH_MEMORY);
    for (int y = 0; y < height; ++y) {
      for (int x = 0; x < list.m_width; ++x) {
        int fromX = i * list.m_width + x;
        std::uint32_t pixel = images.m_surface.Row(y)[fromX] & 0xFFFFFF;
        image->m_surface.Row(y)[x] = drawn(fromX, y) ? pixel | kDrawn : pixel;
      }
    }
    all.push_back(image);
  }
  list.m_images.swap(all);
  return first;
}

void DrawImage(Context& dc, int x, int y, const Ref<Bitmap>& image, COLORREF background) {
  if (Record(dc, [=](HDC to) { DrawImage(*Find<Context>(to), x, y, image, background); })) return;
  const Surface& from = image->m_surface;
  int left = dc.X(x), top = dc.Y(y);
  Box box{left, top, left + from.width, top + from.height};
  if (background != CLR_NONE) PaintBox(dc, box, SolidPaint(dc, background), R2_COPYPEN);
  ForVisible(dc, box, [&](const Box& part) {
    for (int row = part.y1; row < part.y2; ++row) {
      const std::uint32_t* pixels = from.Row(row - top) - left;
      for (int column = part.x1; column < part.x2; ++column) {
        if (pixels[column] & kDrawn) dc.m_surface.Row(row)[column] = dc.m_surface.Nearest(pixels[column] & 0xFFFFFF);
      }
    }
  });
}

}  // namespace

HIMAGELIST ImageList_Create(int width, int height, UINT, int, int) {
  if (width < 1 || height < 1) return Fail<HIMAGELIST>(nullptr);
  return EnterAs<HIMAGELIST>(new ImageList(width, height));
}

BOOL ImageList_Destroy(HIMAGELIST list) { return Find<ImageList>(list) && Remove(list); }

int ImageList_GetImageCount(HIMAGELIST handle) {
  auto* list = Find<ImageList>(handle);
  return list ? static_cast<int>(list->m_images.size()) : 0;
}

BOOL ImageList_GetIconSize(HIMAGELIST handle, int* width, int* height) {
  auto* list = Find<ImageList>(handle);
  if (!list) return FALSE;
  *width = list->m_width;
  *height = list->m_height;
  return TRUE;
}

int ImageList_Add(HIMAGELIST handle, HBITMAP imagesHandle, HBITMAP maskHandle) try {
  auto* list = Find<ImageList>(handle);
  auto* images = Find<Bitmap>(imagesHandle);
  auto* mask = maskHandle ? Find<Bitmap>(maskHandle) : nullptr;
  if (!list || !images || (maskHandle && !mask)) return -1;
  return AddImages(*list, *images, [mask](int x, int y) {
    return !mask || x >= mask->m_surface.width || y >= mask->m_surface.height ||
           !(mask->m_surface.Row(y)[x] & 0xFFFFFF);
  });
} catch (const std::bad_alloc&) {
  return NoMemory(-1);
}

int ImageList_AddMasked(HIMAGELIST handle, HBITMAP imagesHandle, COLORREF transparent) try {
  auto* list = Find<ImageList>(handle);
  auto* images = Find<Bitmap>(imagesHandle);
  if (!list || !images) return -1;
  // The default colour is that of the first pixel.
  std::uint32_t pixel = transparent == CLR_DEFAULT ? images->m_surface.Row(0)[0] & 0xFFFFFF : PixelOf(transparent);
  return AddImages(*list, *images, [=](int x, int y) { return (images->m_surface.Row(y)[x] & 0xFFFFFF) != pixel; });
} catch (const std::bad_alloc&) {
  return NoMemory(-1);
}

BOOL ImageList_Remove(HIMAGELIST handle, int index) {
  auto* list = Find<ImageList>(handle);
  if (!list) return FALSE;
  if (index == -1) {
    list->m_images.clear();
    return TRUE;
  }
  if (index < 0 || index >= static_cast<int>(list->m_images.size())) return Fail(FALSE);
  list->m_images.erase(list->m_images.begin() + index);
  return TRUE;
}

BOOL ImageList_Draw(HIMAGELIST handle, int index, HDC dcHandle, int x, int y, UINT style) try {
  auto* list = Find<ImageList>(handle);
  auto* dc = Find<Context>(dcHandle);
  if (!list || !dc || index < 0 || index >= static_cast<int>(list->m_images.size())) return FALSE;
  bool transparent = style & ILD_TRANSPARENT;
  DrawImage(*dc, x, y, list->m_images[static_cast<std::size_t>(index)], transparent ? CLR_NONE : list->m_background);
  return TRUE;
} catch (const std::bad_alloc&) {
  return NoMemory(FALSE);
}

COLORREF ImageList_SetBkColor(HIMAGELIST handle, COLORREF color) {
  auto* list = Find<ImageList>(handle);
  return list ? std::exchange(list->m_background, color) : CLR_NONE;
}

COLORREF ImageList_GetBkColor(HIMAGELIST handle) {
  auto* list = Find<ImageList>(handle);
  return list ? list->m_background : CLR_NONE;
}
