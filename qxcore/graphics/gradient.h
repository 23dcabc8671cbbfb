// SDrawGradient: fills a rectangle of a device context with a blend between two colours.
//
// The mode is a kind and, in its low four bits, a variant. Colours do not move evenly: over the extent of a blend
// they go 25 % of the way in the first quarter, 30 % in each of the middle quarters and 15 % in the last. Every kind
// is drawn in bands of one pixel; bands outside the clip region are skipped, except in a metafile. Kinds:
//
//   horizontal       bands from top to bottom
//   vertical         bands from left to right
//   diagonal up      lines at 45 degrees, from the bottom left corner to the top right one
//   diagonal down    the same from the top left corner to the bottom right one
//   corner           nested rectangles that share the top left corner, where the start colour is
//   centre           nested rectangles around a point, where the start colour is
//   button           a glossy button of the start colour alone: a light upper half over a plain lower one
//   3D               a panel from the start colour above to the end colour below, within a bevel that is lit from
//                    the top left; the bevel takes an eighth of the shorter side, from 2 to 12 pixels
//   gradient button  a button whose face is blended by the variant: 5 top to bottom, 6 left to right, 7 diagonally up,
//                    8 diagonally down
//
// In the other variants bit 0 exchanges the colours; for the first four kinds bit 1 mirrors: the blend runs over half
// of the extent and back.
//
// The kinds from corner on end with a frame of the frame type. An unknown kind draws nothing, and neither does an
// empty rectangle. Rectangles are put in order before they are used, without changing the caller's. Drawing throws
// SEOutOfMemory where a frame with round corners finds no memory.
// Threads: a value belongs to one thread at a time; the functions serve any thread.
#pragma once

#include "qxcore/graphics/dc.h"
#include "qxcore/graphics/rect.h"

class QXCORE_API SDrawGradient {
 public:
  // Kind and variant.
  enum GRADIENT_MODE : int {
    HORZ = 0x10,
    HORZ_REVERSED = 0x11,
    HORZ_MIRRORED = 0x12,
    HORZ_REVERSED_MIRRORED = 0x13,
    VERT = 0x20,
    VERT_REVERSED = 0x21,
    VERT_MIRRORED = 0x22,
    VERT_REVERSED_MIRRORED = 0x23,
    DIAG_UP = 0x40,
    DIAG_UP_REVERSED = 0x41,
    DIAG_UP_MIRRORED = 0x42,
    DIAG_UP_REVERSED_MIRRORED = 0x43,
    DIAG_DOWN = 0x80,
    DIAG_DOWN_REVERSED = 0x81,
    DIAG_DOWN_MIRRORED = 0x82,
    DIAG_DOWN_REVERSED_MIRRORED = 0x83,
    CORNER = 0x100,
    CENTER = 0x200,
    CENTER_REVERSED = 0x201,
    BUTTON = 0x400,
    PANEL_3D = 0x800,
    GRAD_BUTTON = 0x1000,
    GRAD_BUTTON_HORZ = 0x1005,
    GRAD_BUTTON_VERT = 0x1006,
    GRAD_BUTTON_DIAG_UP = 0x1007,
    GRAD_BUTTON_DIAG_DOWN = 0x1008,
  };

  // The outline around the filled area; its colours are shades of the gradient's.
  enum FRAME_TYPE : int {
    FRAME_NONE = 0,
    FRAME_RECT = 1,        // one dark line
    FRAME_ROUND_RECT = 2,  // one dark line with round corners; the buttons are filled within it
    FRAME_RAISED = 3,      // light at the left and top, dark at the right and bottom
    FRAME_SUNKEN = 4,      // the other way round
    FRAME_ETCHED = 5,      // a sunken line within a raised one
  };

  // Horizontal, from black to white, no frame, empty rectangles, corners of 8 x 8, scale 1.
  SDrawGradient() = default;

  // --- what is drawn ---

  int GetGradientMode() const { return m_mode; }  // a GRADIENT_MODE value
  void SetGradientMode(int mode) { m_mode = mode; }
  int GetFrameType() const { return m_frameType; }  // a FRAME_TYPE value
  void SetFrameType(int type) { m_frameType = type; }
  unsigned long GetStartColor() const { return m_startColor; }  // 0x00BBGGRR
  void SetStartColor(unsigned long color) { m_startColor = static_cast<std::uint32_t>(color); }
  unsigned long GetEndColor() const { return m_endColor; }  // 0x00BBGGRR
  void SetEndColor(unsigned long color) { m_endColor = static_cast<std::uint32_t>(color); }
  const SRect& GetStartRect() const { return m_startRect; }  // what DrawGradient fills, in logical units
  void SetStartRect(const SRect& rect) { m_startRect = rect; }
  const SRect& GetEndRect() const { return m_endRect; }  // kept for programs that move from one place to another
  void SetEndRect(const SRect& rect) { m_endRect = rect; }
  const SSize& GetRoundRectSize() const { return m_roundRectSize; }  // width and height of a corner's ellipse
  void SetRoundRectSize(const SSize& size) { m_roundRectSize = size; }
  double GetScale() const { return m_scale; }  // kept for programs that draw at several sizes
  void SetScale(double scale) { m_scale = scale; }

  // Mode, colours and the start rectangle, which becomes the end rectangle, too; or both.
  void SetGradient(int mode, unsigned long startColor, unsigned long endColor, const SRect& rect);
  void SetGradient(int mode, unsigned long startColor, unsigned long endColor, const SRect& startRect,
                   const SRect& endRect);

  // --- drawing; the context's settings are as before afterwards, its current position is not ---

  // What the mode names, with the start rectangle.
  void DrawGradient(SDC& dc) const;

  // Each kind; nothing is drawn unless the mode has its bit.
  void DrawHorzGradient(SDC& dc, const SRect& rect, unsigned long from, unsigned long to, int mode) const;
  void DrawVertGradient(SDC& dc, const SRect& rect, unsigned long from, unsigned long to, int mode) const;
  void DrawDiagUpGradient(SDC& dc, const SRect& rect, unsigned long from, unsigned long to, int mode) const;
  void DrawDiagDownGradient(SDC& dc, const SRect& rect, unsigned long from, unsigned long to, int mode) const;
  void DrawCornerGradient(SDC& dc, const SRect& rect, unsigned long from, unsigned long to, int mode,
                          int frameType) const;
  // Around the middle of the rectangle.
  void DrawCenterGradient(SDC& dc, const SRect& rect, unsigned long from, unsigned long to, int mode,
                          int frameType) const;
  // Around a point of the rectangle; one outside is moved to the nearest edge.
  void DrawCenterGradientEx(SDC& dc, const SRect& rect, const SPoint& center, unsigned long from, unsigned long to,
                            int mode, int frameType) const;
  void DrawButtonGradient(SDC& dc, const SRect& rect, unsigned long color, int mode, int frameType) const;
  void Draw3DGradient(SDC& dc, const SRect& rect, unsigned long from, unsigned long to, int mode, int frameType) const;
  void DrawGradButtonGradient(SDC& dc, const SRect& rect, unsigned long from, unsigned long to, int mode,
                              int frameType) const;

 private:
  int m_mode = HORZ;
  int m_frameType = FRAME_NONE;
  std::uint32_t m_startColor = 0x000000, m_endColor = 0xFFFFFF;
  SRect m_startRect, m_endRect;
  SSize m_roundRectSize{8, 8};
  double m_scale = 1;
};

static_assert(sizeof(SDrawGradient) == 64, "the fields in their order");
