// Pens, brushes, and what both come down to: where a pixel's colour comes from.
#pragma once

#include "qxcore/platform/posix/draw/bitmap.h"

namespace draw {

// What `Brush` and `Pen` take their colour from, so that objects of the system follow its changes.
struct ColorSource {
  enum Kind { kFixed, kSystem, kOfContext } kind = kFixed;
  COLORREF color = 0;
  int index = 0;  // of the system colour

  COLORREF Value(COLORREF ofContext) const {
    return kind == kFixed ? color : kind == kSystem ? GetSysColor(index) : ofContext;
  }
};

class Pen final : public Object {
 public:
  static bool IsType(DWORD type) { return type == OBJ_PEN; }
  Pen(int style, int width, ColorSource color) : Object(OBJ_PEN), m_style(style), m_width(width), m_color(color) {}
  int m_style, m_width;  // the width as it was given
  ColorSource m_color;
};

class Brush final : public Object {
 public:
  static bool IsType(DWORD type) { return type == OBJ_BRUSH; }
  Brush(UINT style, ColorSource color, int hatch = 0)
      : Object(OBJ_BRUSH), m_style(style), m_color(color), m_hatch(hatch) {}
  UINT m_style;  // a BS_ number
  ColorSource m_color;
  int m_hatch;
  Ref<Bitmap> m_pattern;
};

class Context;

// What an area is painted with.
struct Paint {
  enum Kind { kNothing, kSolid, kHatch, kPattern } kind = kNothing;
  std::uint32_t pixel = 0;       // solid, hatch
  std::uint32_t background = 0;  // hatch
  bool transparent = false;      // hatch: the background stays
  int hatch = 0;
  const Surface* pattern = nullptr;
  int originX = 0, originY = 0;  // on the surface

  // The pixels of a row; false in *covered where nothing is painted (may be null).
  void Fill(int x, int y, int count, std::uint32_t* pixels, bool* covered) const;
};

Paint PaintOf(const Context& dc, const Brush& brush);
Paint PaintOf(const Context& dc, const Pen& pen);
Paint SolidPaint(const Context& dc, COLORREF color);

}  // namespace draw
