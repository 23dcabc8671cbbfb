// What all drawing objects have in common: selecting, deleting, describing.
#include <cstring>

#include "qxcore/platform/posix/draw/font_object.h"
#include "qxcore/platform/posix/draw/recorder.h"
#include "qxcore/platform/posix/draw/select.h"
#include "qxcore/platform/posix/draw/stock.h"

namespace draw {

namespace {

HGDIOBJ SelectBitmap(Context& dc, Bitmap* bitmap) {
  if (dc.m_type != OBJ_MEMDC || (bitmap->m_user && bitmap->m_user != &dc)) return Fail<HGDIOBJ>(nullptr);
  Ref<Bitmap> former = dc.m_settings.bitmap;
  if (former.get() == bitmap) return bitmap->m_handle;
  if (former->m_user == &dc) former->m_user = nullptr;
  if (!bitmap->m_permanent) bitmap->m_user = &dc;
  dc.m_settings.bitmap = bitmap;
  dc.SetTarget(dc.m_settings.bitmap);
  return former->m_handle;
}

template <class T>
HGDIOBJ Exchange(Ref<T>& selected, Object* object) {
  HGDIOBJ former = selected->m_handle;
  selected = static_cast<T*>(object);
  return former;
}

}  // namespace

HGDIOBJ Select(Context& dc, Object* object) {
  switch (object->m_type) {
    case OBJ_PEN:
      return Exchange(dc.m_settings.pen, object);
    case OBJ_BRUSH:
      return Exchange(dc.m_settings.brush, object);
    case OBJ_FONT:
      return Exchange(dc.m_settings.font, object);
    case OBJ_BITMAP:
      return SelectBitmap(dc, static_cast<Bitmap*>(object));
    default:
      return Fail<HGDIOBJ>(nullptr);
  }
}

static HGDIOBJ RecordAndSelect(Context& dc, Object* object) {
  if (object->m_type != OBJ_BITMAP)
    Record(dc, [keep = Ref<Object>(object)](HDC to) { RecordAndSelect(*Find<Context>(to), keep.get()); });
  return Select(dc, object);
}

}  // namespace draw

using namespace draw;

HGDIOBJ SelectObject(HDC handle, HGDIOBJ objectHandle) {
  auto* dc = Find<Context>(handle);
  Object* object = FindObject(objectHandle);
  if (!dc || !object) return Fail<HGDIOBJ>(nullptr, ERROR_INVALID_HANDLE);
  if (object->m_type == OBJ_REGION)
    return reinterpret_cast<HGDIOBJ>(static_cast<INT_PTR>(SelectClipRgn(handle, static_cast<HRGN>(objectHandle))));
  return RecordAndSelect(*dc, object);
}

BOOL DeleteObject(HGDIOBJ handle) {
  Object* object = FindObject(handle);
  if (!object) return FALSE;
  if (Context::IsType(object->m_type)) return DeleteDC(static_cast<HDC>(handle));
  if (object->m_permanent) return TRUE;
  return static_cast<bool>(Remove(handle));
}

DWORD GetObjectType(HGDIOBJ handle) {
  Object* object = FindObject(handle);
  return object && object->m_type != kImageListType ? object->m_type : Fail(0u, ERROR_INVALID_HANDLE);
}

HGDIOBJ GetCurrentObject(HDC handle, UINT type) {
  auto* dc = Find<Context>(handle);
  if (!dc) return nullptr;
  switch (type) {
    case OBJ_PEN:
      return dc->m_settings.pen->m_handle;
    case OBJ_BRUSH:
      return dc->m_settings.brush->m_handle;
    case OBJ_FONT:
      return dc->m_settings.font->m_handle;
    case OBJ_BITMAP:
      return dc->m_target ? dc->m_target->m_handle : nullptr;
    default:
      return Fail<HGDIOBJ>(nullptr);
  }
}

// --- descriptions ---

namespace {

template <class Record>
int Describe(const Record& record, int size, LPVOID buffer) {
  if (!buffer) return sizeof record;
  if (size < static_cast<int>(sizeof record)) return 0;
  std::memcpy(buffer, &record, sizeof record);
  return sizeof record;
}

// A description may be asked for in part, as far as its fields before the face's name go.
int DescribeFont(const LOGFONTW& font, int size, LPVOID buffer) {
  int bytes = std::min(size, static_cast<int>(sizeof font));
  if (!buffer) return sizeof font;
  std::memcpy(buffer, &font, static_cast<std::size_t>(std::max(bytes, 0)));
  return bytes;
}

BITMAP DescriptionOf(const Bitmap& bitmap) {
  return {0,
          bitmap.m_surface.width,
          bitmap.m_surface.height,
          RowBytes(bitmap.m_surface.width, bitmap.m_bitCount, 2),
          1,
          static_cast<WORD>(bitmap.m_bitCount),
          bitmap.m_section ? bitmap.m_memory : nullptr};
}

}  // namespace

int GetObjectW(HANDLE handle, int size, LPVOID buffer) {
  Object* object = FindObject(handle);
  if (!object) return Fail(0, ERROR_INVALID_HANDLE);
  switch (object->m_type) {
    case OBJ_PEN: {
      auto* pen = static_cast<Pen*>(object);
      return Describe(LOGPEN{static_cast<UINT>(pen->m_style), {pen->m_width, 0}, pen->m_color.Value(0)}, size, buffer);
    }
    case OBJ_BRUSH: {
      auto* brush = static_cast<Brush*>(object);
      return Describe(LOGBRUSH{brush->m_style, brush->m_color.Value(0xFFFFFF), static_cast<ULONG_PTR>(brush->m_hatch)},
                      size, buffer);
    }
    case OBJ_BITMAP:
      return Describe(DescriptionOf(*static_cast<Bitmap*>(object)), size, buffer);
    case OBJ_FONT:
      return DescribeFont(static_cast<FontObject*>(object)->m_description, size, buffer);
    default:
      return Fail(0, ERROR_INVALID_HANDLE);
  }
}
