// Contexts made, ended, saved, and their plain settings.
#include "qxcore/platform/posix/draw/font_object.h"
#include "qxcore/platform/posix/draw/recorder.h"

using namespace draw;

namespace {

// The bitmap of a memory context before one is selected; shared and never ended.
Bitmap* DefaultBitmap() {
  static Bitmap* const bitmap = [] {
    Bitmap* made = Bitmap::Make(1, 1, 1);
    if (!Enter(made)) throw std::bad_alloc();
    made->m_permanent = true;
    return made;
  }();
  return bitmap;
}

}  // namespace

HDC CreateCompatibleDC(HDC compatible) try {
  if (compatible && !Find<Context>(compatible)) return nullptr;
  const Ref<Bitmap> bitmap(DefaultBitmap());
  auto* dc = new Context(OBJ_MEMDC);
  if (dc) {
    dc->m_settings.bitmap = bitmap;
    dc->SetTarget(bitmap);
  }
  return EnterAs<HDC>(dc);
} catch (const std::bad_alloc&) {
  return NoMemory(HDC{});
}

BOOL DeleteDC(HDC handle) {
  auto* dc = Find<Context>(handle);
  return dc && dc->m_type != OBJ_DC && Remove(handle);
}

int SaveDC(HDC handle) try {
  auto* dc = Find<Context>(handle);
  if (!dc) return 0;
  Record(*dc, [](HDC to) { SaveDC(to); });
  dc->m_saved.push_back(dc->m_settings);
  return static_cast<int>(dc->m_saved.size());
} catch (const std::bad_alloc&) {
  return NoMemory(0);
}

BOOL RestoreDC(HDC handle, int saved) {
  auto* dc = Find<Context>(handle);
  if (!dc) return FALSE;
  int count = static_cast<int>(dc->m_saved.size());
  int target = saved < 0 ? count + 1 + saved : saved;
  if (target < 1 || target > count) return Fail(FALSE);
  // What is played back may have saved more: count from the top.
  Record(*dc, [back = target - count - 1](HDC to) { RestoreDC(to, back); });
  Ref<Bitmap> current = dc->m_settings.bitmap;
  dc->m_settings = std::move(dc->m_saved[static_cast<std::size_t>(target - 1)]);
  dc->m_saved.erase(dc->m_saved.begin() + target - 1, dc->m_saved.end());
  if (dc->m_settings.bitmap.get() != current.get()) {
    if (current->m_user == dc) current->m_user = nullptr;
    if (!dc->m_settings.bitmap->m_permanent) dc->m_settings.bitmap->m_user = dc;
    dc->SetTarget(dc->m_settings.bitmap);
  }
  dc->UpdateMapping();
  dc->UpdateClip();
  return TRUE;
}

// Sizes are those of the screen that the metrics describe.
int GetDeviceCaps(HDC handle, int index) {
  auto* dc = Find<Context>(handle);
  if (!dc) return 0;
  int dpi = static_cast<int>(GetDpiForSystem());
  switch (index) {
    case BITSPIXEL:
      return dc->m_surface.mono ? 1 : 32;
    case PLANES:
      return 1;
    case HORZRES:
      return GetSystemMetrics(SM_CXSCREEN);
    case VERTRES:
      return GetSystemMetrics(SM_CYSCREEN);
    case HORZSIZE:
      return MulDiv(GetSystemMetrics(SM_CXSCREEN), 254, dpi * 10);
    case VERTSIZE:
      return MulDiv(GetSystemMetrics(SM_CYSCREEN), 254, dpi * 10);
    case LOGPIXELSX:
    case LOGPIXELSY:
      return dpi;
    default:
      return 0;
  }
}

BOOL GdiFlush() { return TRUE; }

// --- settings of one value: each returns the former one ---

namespace {

template <class T, class F>
T Set(HDC handle, T Settings::*field, T value, T failed, F again) {
  auto* dc = Find<Context>(handle);
  if (!dc) return failed;
  Record(*dc, [again, value](HDC to) { again(to, value); });
  return std::exchange(dc->m_settings.*field, value);
}

template <class T>
T Get(HDC handle, T Settings::*field, T failed) {
  auto* dc = Find<Context>(handle);
  return dc ? dc->m_settings.*field : failed;
}

bool Within(int value, int first, int last) {
  if (value >= first && value <= last) return true;
  SetLastError(ERROR_INVALID_PARAMETER);
  return false;
}

}  // namespace

COLORREF SetBkColor(HDC dc, COLORREF color) {
  return Set(dc, &Settings::bkColor, color, COLORREF{CLR_INVALID}, &SetBkColor);
}
COLORREF GetBkColor(HDC dc) { return Get(dc, &Settings::bkColor, COLORREF{CLR_INVALID}); }

COLORREF SetTextColor(HDC dc, COLORREF color) {
  return Set(dc, &Settings::textColor, color, COLORREF{CLR_INVALID}, &SetTextColor);
}
COLORREF GetTextColor(HDC dc) { return Get(dc, &Settings::textColor, COLORREF{CLR_INVALID}); }

COLORREF SetDCBrushColor(HDC dc, COLORREF color) {
  return Set(dc, &Settings::brushColor, color, COLORREF{CLR_INVALID}, &SetDCBrushColor);
}
COLORREF SetDCPenColor(HDC dc, COLORREF color) {
  return Set(dc, &Settings::penColor, color, COLORREF{CLR_INVALID}, &SetDCPenColor);
}

int SetBkMode(HDC dc, int mode) {
  return Within(mode, TRANSPARENT, OPAQUE) ? Set(dc, &Settings::bkMode, mode, 0, &SetBkMode) : 0;
}
int GetBkMode(HDC dc) { return Get(dc, &Settings::bkMode, 0); }

int SetROP2(HDC dc, int mode) {
  return Within(mode, R2_BLACK, R2_WHITE) ? Set(dc, &Settings::rop2, mode, 0, &SetROP2) : 0;
}
int GetROP2(HDC dc) { return Get(dc, &Settings::rop2, 0); }

int SetPolyFillMode(HDC dc, int mode) {
  return Within(mode, ALTERNATE, WINDING) ? Set(dc, &Settings::polyFillMode, mode, 0, &SetPolyFillMode) : 0;
}
int GetPolyFillMode(HDC dc) { return Get(dc, &Settings::polyFillMode, 0); }

int SetStretchBltMode(HDC dc, int mode) {
  return Within(mode, BLACKONWHITE, HALFTONE) ? Set(dc, &Settings::stretchMode, mode, 0, &SetStretchBltMode) : 0;
}
int GetStretchBltMode(HDC dc) { return Get(dc, &Settings::stretchMode, 0); }

UINT SetTextAlign(HDC dc, UINT align) { return Set(dc, &Settings::textAlign, align, UINT{GDI_ERROR}, &SetTextAlign); }
UINT GetTextAlign(HDC dc) { return Get(dc, &Settings::textAlign, UINT{GDI_ERROR}); }

// --- settings of two values ---

namespace {

template <class T, class F>
BOOL SetPair(HDC handle, T Settings::*field, T value, T* old, F again) {
  auto* dc = Find<Context>(handle);
  if (!dc) return FALSE;
  Record(*dc, again);
  T former = std::exchange(dc->m_settings.*field, value);
  if (old) *old = former;
  dc->UpdateMapping();
  return TRUE;
}

template <class T>
BOOL GetPair(HDC handle, T Settings::*field, T* value) {
  auto* dc = Find<Context>(handle);
  if (!dc) return FALSE;
  *value = dc->m_settings.*field;
  return TRUE;
}

}  // namespace

BOOL SetBrushOrgEx(HDC dc, int x, int y, POINT* old) {
  return SetPair(dc, &Settings::brushOrigin, POINT{x, y}, old, [=](HDC to) { SetBrushOrgEx(to, x, y, nullptr); });
}
BOOL GetBrushOrgEx(HDC dc, POINT* origin) { return GetPair(dc, &Settings::brushOrigin, origin); }

BOOL SetWindowOrgEx(HDC dc, int x, int y, POINT* old) {
  return SetPair(dc, &Settings::windowOrigin, POINT{x, y}, old, [=](HDC to) { SetWindowOrgEx(to, x, y, nullptr); });
}
BOOL GetWindowOrgEx(HDC dc, POINT* origin) { return GetPair(dc, &Settings::windowOrigin, origin); }

BOOL SetViewportOrgEx(HDC dc, int x, int y, POINT* old) {
  return SetPair(dc, &Settings::viewportOrigin, POINT{x, y}, old, [=](HDC to) { SetViewportOrgEx(to, x, y, nullptr); });
}
BOOL GetViewportOrgEx(HDC dc, POINT* origin) { return GetPair(dc, &Settings::viewportOrigin, origin); }

BOOL OffsetViewportOrgEx(HDC dc, int dx, int dy, POINT* old) {
  POINT former;
  if (!GetViewportOrgEx(dc, &former)) return FALSE;
  if (old) *old = former;
  return SetViewportOrgEx(dc, former.x + dx, former.y + dy, nullptr);
}

// Extents count in the scaled modes only; elsewhere the calls succeed and change nothing.
namespace {

template <class F>
BOOL SetExtent(HDC handle, SIZE Settings::*field, SIZE extent, SIZE* old, F again) {
  SIZE former;
  if (!GetPair(handle, field, &former)) return FALSE;
  if (old) *old = former;
  if (GetMapMode(handle) == MM_TEXT) return TRUE;
  if (extent.cx == 0 || extent.cy == 0) return Fail(FALSE);
  return SetPair(handle, field, extent, old, again);
}

}  // namespace

BOOL SetWindowExtEx(HDC dc, int cx, int cy, SIZE* old) {
  return SetExtent(dc, &Settings::windowExtent, SIZE{cx, cy}, old,
                   [=](HDC to) { SetWindowExtEx(to, cx, cy, nullptr); });
}

BOOL SetViewportExtEx(HDC dc, int cx, int cy, SIZE* old) {
  return SetExtent(dc, &Settings::viewportExtent, SIZE{cx, cy}, old,
                   [=](HDC to) { SetViewportExtEx(to, cx, cy, nullptr); });
}

int SetMapMode(HDC handle, int mode) {
  auto* dc = Find<Context>(handle);
  if (!dc) return 0;
  if (mode != MM_TEXT && mode != MM_ISOTROPIC && mode != MM_ANISOTROPIC) return Fail(0);
  Record(*dc, [mode](HDC to) { SetMapMode(to, mode); });
  int former = std::exchange(dc->m_settings.mapMode, mode);
  dc->UpdateMapping();
  return former;
}
int GetMapMode(HDC dc) { return Get(dc, &Settings::mapMode, 0); }

BOOL LPtoDP(HDC handle, POINT* points, int count) {
  auto* dc = Find<Context>(handle);
  if (!dc) return FALSE;
  for (POINT* point = points; point < points + count; ++point)
    *point = {dc->X(point->x) - dc->m_origin.x, dc->Y(point->y) - dc->m_origin.y};
  return TRUE;
}

BOOL DPtoLP(HDC handle, POINT* points, int count) {
  auto* dc = Find<Context>(handle);
  if (!dc) return FALSE;
  const Mapping& map = dc->Map();
  for (POINT* point = points; point < points + count; ++point)
    *point = {Mapping::Round((point->x + dc->m_origin.x - map.addX) / map.scaleX),
              Mapping::Round((point->y + dc->m_origin.y - map.addY) / map.scaleY)};
  return TRUE;
}
