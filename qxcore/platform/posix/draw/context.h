// A device context: what is drawn on, where, and with which settings.
#pragma once

#include <memory>
#include <vector>

#include "qxcore/platform/posix/draw/font_object.h"
#include "qxcore/platform/posix/draw/pen_brush.h"
#include "qxcore/platform/posix/draw/region.h"

namespace draw {

class Recorder;

// From logical units to pixels of the device.
struct Mapping {
  bool shiftOnly = true;
  int dx = 0, dy = 0;                                 // when shiftOnly
  double scaleX = 1, scaleY = 1, addX = 0, addY = 0;  // else

  int X(int x) const { return shiftOnly ? x + dx : Round(x * scaleX + addX); }
  int Y(int y) const { return shiftOnly ? y + dy : Round(y * scaleY + addY); }
  int Width(int width) const { return shiftOnly ? width : Round(width * scaleX); }
  int Height(int height) const { return shiftOnly ? height : Round(height * scaleY); }
  static int Round(double value);
};

// What SaveDC keeps.
struct Settings {
  Ref<Pen> pen;
  Ref<Brush> brush;
  Ref<FontObject> font;
  Ref<Bitmap> bitmap;  // of a memory context
  COLORREF bkColor = 0xFFFFFF, textColor = 0, brushColor = 0xFFFFFF, penColor = 0;
  int bkMode = OPAQUE, rop2 = R2_COPYPEN, polyFillMode = ALTERNATE, stretchMode = BLACKONWHITE;
  UINT textAlign = 0;
  POINT position{}, brushOrigin{};
  int mapMode = MM_TEXT;
  POINT windowOrigin{}, viewportOrigin{};
  SIZE windowExtent{1, 1}, viewportExtent{1, 1};
  bool clipped = false;
  Area clip;  // in pixels of the device
};

class Context final : public Object {
 public:
  static bool IsType(DWORD type) {
    return type == OBJ_MEMDC || type == OBJ_DC || type == OBJ_METADC || type == OBJ_ENHMETADC;
  }
  explicit Context(DWORD type);
  ~Context() override;

  // --- what is drawn on ---

  // Draws on a bitmap from now on; all of it is visible.
  void SetTarget(const Ref<Bitmap>& bitmap);
  // Draws on a part of a window's surface: the device's origin, and what is visible of it, on the surface.
  void SetTarget(const Ref<Bitmap>& surface, POINT origin, const Area& visible);

  Surface m_surface;
  POINT m_origin{};  // of the device, on the surface
  Ref<Bitmap> m_target;
  HWND m_window = nullptr;
  HWND m_top = nullptr;                  // the top-level window whose surface it is
  std::unique_ptr<Recorder> m_recorder;  // of a metafile

  // --- settings ---

  Settings m_settings;
  std::vector<Settings> m_saved;

  // Call after changing what a mapping or a clip region is made of.
  void UpdateMapping();
  void UpdateClip() { m_clipValid = false; }

  // From logical units to pixels of the surface.
  const Mapping& Map() const { return m_map; }
  int X(int x) const { return m_map.X(x); }
  int Y(int y) const { return m_map.Y(y); }
  // The same rectangle in pixels of the surface, with its edges in order.
  Box Map(const RECT& rect) const { return BoxOf(X(rect.left), Y(rect.top), X(rect.right), Y(rect.bottom)); }
  Box Map(int left, int top, int right, int bottom) const { return Map(RECT{left, top, right, bottom}); }

  // What can be drawn on, in pixels of the surface.
  const Area& Clip() const {
    if (!m_clipValid) ComputeClip();
    return m_clip;
  }
  // The only rectangle of the clip region; null when there are several or none.
  const Box* SingleClip() const {
    if (!m_clipValid) ComputeClip();
    return m_single ? &m_clip.Extents() : nullptr;
  }

  // Call it before pixels are read; whoever draws asks for the clip region.
  void PrepareToRead() const { Clip(); }
  // Whether anything may have been drawn: all drawing asks for the clip region.
  bool WasDrawnOn() const { return m_wasDrawnOn; }
  const Box& VisibleExtents() const { return m_visible.Extents(); }

  // Further scaling, of what a metafile plays into a rectangle.
  void SetPlayback(double scaleX, double scaleY, double addX, double addY);
  void EndPlayback();

 private:
  void ComputeClip() const;

  Area m_visible;
  Mapping m_map;
  double m_playScaleX = 1, m_playScaleY = 1, m_playAddX = 0, m_playAddY = 0;
  mutable Area m_clip;
  mutable bool m_clipValid = false, m_single = false, m_wasDrawnOn = false;
};

}  // namespace draw
