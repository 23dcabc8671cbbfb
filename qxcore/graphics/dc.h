// SDC: an object around a device context, and the scopes that select and save.
//
// An SDC owns its handle when it made it (SMemoryDC, SMetafileDC, the contexts of windows in window_dc.h) or when
// it was told to by Attach; it ends it in its destructor. Selecting never passes ownership: select with
// SSelectObject, and the former object comes back at the end of the scope, whatever happened in between; save
// with SSaveDC, and all settings come back.
//
// Members are the system's calls of the same name with the handle filled in; coordinates are logical units, which
// are pixels unless a mapping was set. A bool says whether the system did it. A context belongs to one thread.
#pragma once

#include "qxcore/core/object.h"
#include "qxcore/graphics/gdi_object.h"
#include "qxcore/graphics/rect.h"
#include "qxcore/string/string.h"

class QXCORE_API SDC : public SObject {
  QXCORE_DECLARE_CREATABLE_CLASS(SDC)

  SDC() = default;
  // The owner of `dc`.
  explicit SDC(HDC dc) { Attach(dc); }
  ~SDC() override;
  SDC(const SDC&) = delete;
  SDC& operator=(const SDC&) = delete;

  // The object that holds a context: the one that attached it, or else a temporary one that lives until the
  // application is idle and never ends the context. Null for null.
  static SDC* FromHandle(HDC dc);
  // The object that attached a context, or null.
  static SDC* FromHandlePermanent(HDC dc);
  // Ends the temporary objects.
  static void DeleteTempMap();

  // Takes over a context; what was held before is ended. Returns 0 and changes nothing for null.
  int Attach(HDC dc);
  // Gives the context up without ending it, and returns it.
  HDC Detach();
  // Ends the context with DeleteDC. Returns 1 if there was one and the system took it back.
  int DeleteDC();

  // The handle; null for a null object pointer, too.
  HDC GetSafeHdc() const;
  // The handle; stays the object's.
  operator HDC() const { return m_hDC; }
  // True when the context records a metafile of either kind: then nothing is visible, and all must be drawn.
  bool IsMetafile() const;

  // --- state ---

  // Keeps all settings; the number is for RestoreDC, which also takes -1 for the last one. 0 on failure.
  int SaveDC() { return ::SaveDC(m_hDC); }
  bool RestoreDC(int saved) { return ::RestoreDC(m_hDC, saved) != 0; }
  int GetDeviceCaps(int index) const { return ::GetDeviceCaps(m_hDC, index); }
  // Selects an object and returns the former one; null when the object is invalid or, for a bitmap, when another
  // context has it. A region becomes the clip region and stays the caller's.
  HGDIOBJ SelectObject(HGDIOBJ object) { return ::SelectObject(m_hDC, object); }
  HGDIOBJ SelectStockObject(int index) { return ::SelectObject(m_hDC, ::GetStockObject(index)); }
  // The selected object of an OBJ_ kind; stays the system's.
  HGDIOBJ GetCurrentObject(unsigned int type) const { return ::GetCurrentObject(m_hDC, type); }

  // Each returns the former value; CLR_INVALID or 0 on failure.
  COLORREF SetBkColor(COLORREF color) { return ::SetBkColor(m_hDC, color); }
  COLORREF SetTextColor(COLORREF color) { return ::SetTextColor(m_hDC, color); }
  int SetBkMode(int mode) { return ::SetBkMode(m_hDC, mode); }
  int SetROP2(int mode) { return ::SetROP2(m_hDC, mode); }
  int SetPolyFillMode(int mode) { return ::SetPolyFillMode(m_hDC, mode); }
  int SetStretchBltMode(int mode) { return ::SetStretchBltMode(m_hDC, mode); }
  unsigned int SetTextAlign(unsigned int align) { return ::SetTextAlign(m_hDC, align); }
  SPoint SetBrushOrg(const POINT& origin);
  COLORREF GetBkColor() const { return ::GetBkColor(m_hDC); }
  COLORREF GetTextColor() const { return ::GetTextColor(m_hDC); }
  int GetBkMode() const { return ::GetBkMode(m_hDC); }
  int GetROP2() const { return ::GetROP2(m_hDC); }
  unsigned int GetTextAlign() const { return ::GetTextAlign(m_hDC); }

  // --- mapping ---

  int SetMapMode(int mode) { return ::SetMapMode(m_hDC, mode); }
  SPoint SetViewportOrg(const POINT& origin);
  SPoint OffsetViewportOrg(const SIZE& distance);
  SPoint SetWindowOrg(const POINT& origin);
  SSize SetViewportExt(const SIZE& extent);
  SSize SetWindowExt(const SIZE& extent);
  // The same points in pixels of the device, or back.
  bool LPtoDP(POINT* points, int count) const { return ::LPtoDP(m_hDC, points, count) != 0; }
  bool DPtoLP(POINT* points, int count) const { return ::DPtoLP(m_hDC, points, count) != 0; }

  // --- clipping: the results are NULLREGION, SIMPLEREGION, COMPLEXREGION, ERROR ---

  // The region is copied; null removes the clip region. It is in pixels of the device.
  int SelectClipRgn(HRGN region) { return ::SelectClipRgn(m_hDC, region); }
  int SelectClipRgn(HRGN region, int mode) { return ::ExtSelectClipRgn(m_hDC, region, mode); }
  int IntersectClipRect(const RECT& rect) {
    return ::IntersectClipRect(m_hDC, rect.left, rect.top, rect.right, rect.bottom);
  }
  int ExcludeClipRect(const RECT& rect) {
    return ::ExcludeClipRect(m_hDC, rect.left, rect.top, rect.right, rect.bottom);
  }
  // The smallest rectangle around what can be drawn on.
  SRect GetClipBox() const;
  // True when at least one pixel of the rectangle can be drawn on; see IsMetafile.
  bool RectVisible(const RECT& rect) const { return ::RectVisible(m_hDC, &rect) != 0; }

  // --- areas ---

  bool FillRect(const RECT& rect, HBRUSH brush) { return ::FillRect(m_hDC, &rect, brush) != 0; }
  // Fills with one colour, by an empty text on an opaque background; the background colour stays as it was.
  void FillSolidRect(const RECT& rect, COLORREF color);
  bool FrameRect(const RECT& rect, HBRUSH brush) { return ::FrameRect(m_hDC, &rect, brush) != 0; }
  // A frame of one pixel, left and top in one colour, right and bottom in another.
  void Draw3dRect(const RECT& rect, COLORREF topLeft, COLORREF bottomRight);
  bool InvertRect(const RECT& rect) { return ::InvertRect(m_hDC, &rect) != 0; }
  bool DrawFocusRect(const RECT& rect) { return ::DrawFocusRect(m_hDC, &rect) != 0; }
  bool DrawEdge(RECT& rect, unsigned int edge, unsigned int flags) {
    return ::DrawEdge(m_hDC, &rect, edge, flags) != 0;
  }
  bool DrawFrameControl(RECT& rect, unsigned int type, unsigned int state) {
    return ::DrawFrameControl(m_hDC, &rect, type, state) != 0;
  }
  bool FillRgn(HRGN region, HBRUSH brush) { return ::FillRgn(m_hDC, region, brush) != 0; }

  // --- lines and shapes: outlined with the pen, filled with the brush ---

  // Sets the current position and returns the former one.
  SPoint MoveTo(const POINT& to);
  SPoint MoveTo(int x, int y) { return MoveTo(SPoint(x, y)); }
  // Draws from the current position to a point, which becomes the position and is itself left out.
  bool LineTo(const POINT& to) { return ::LineTo(m_hDC, to.x, to.y) != 0; }
  bool LineTo(int x, int y) { return ::LineTo(m_hDC, x, y) != 0; }
  bool Polyline(const POINT* points, int count) { return ::Polyline(m_hDC, points, count) != 0; }
  bool Polygon(const POINT* points, int count) { return ::Polygon(m_hDC, points, count) != 0; }
  bool Rectangle(const RECT& rect) { return ::Rectangle(m_hDC, rect.left, rect.top, rect.right, rect.bottom) != 0; }
  bool RoundRect(const RECT& rect, const SIZE& corner) {
    return ::RoundRect(m_hDC, rect.left, rect.top, rect.right, rect.bottom, corner.cx, corner.cy) != 0;
  }
  bool Ellipse(const RECT& rect) { return ::Ellipse(m_hDC, rect.left, rect.top, rect.right, rect.bottom) != 0; }
  COLORREF GetPixel(const POINT& at) const { return ::GetPixel(m_hDC, at.x, at.y); }
  bool SetPixel(const POINT& at, COLORREF color) { return ::SetPixelV(m_hDC, at.x, at.y, color) != 0; }

  // --- copies ---

  bool BitBlt(const RECT& to, HDC from, const POINT& fromTopLeft, DWORD operation = SRCCOPY) {
    return ::BitBlt(m_hDC, to.left, to.top, to.right - to.left, to.bottom - to.top, from, fromTopLeft.x, fromTopLeft.y,
                    operation) != 0;
  }
  bool StretchBlt(const RECT& to, HDC from, const RECT& source, DWORD operation = SRCCOPY) {
    return ::StretchBlt(m_hDC, to.left, to.top, to.right - to.left, to.bottom - to.top, from, source.left, source.top,
                        source.right - source.left, source.bottom - source.top, operation) != 0;
  }
  bool PatBlt(const RECT& rect, DWORD operation) {
    return ::PatBlt(m_hDC, rect.left, rect.top, rect.right - rect.left, rect.bottom - rect.top, operation) != 0;
  }

  // --- text ---

  bool GetTextMetricsW(TEXTMETRICW* metrics) const { return ::GetTextMetricsW(m_hDC, metrics) != 0; }
  // Width and height of one line in the selected font.
  SSize GetTextExtent(SStringView text) const;
  bool TextOutW(int x, int y, SStringView text) {
    return ::TextOutW(m_hDC, x, y, text.data(), static_cast<int>(text.size())) != 0;
  }
  bool ExtTextOutW(int x, int y, unsigned int options, const RECT* rect, SStringView text,
                   const int* advances = nullptr) {
    return ::ExtTextOutW(m_hDC, x, y, options, rect, text.data(), static_cast<UINT>(text.size()), advances) != 0;
  }
  // Draws text into a rectangle as the DT_ flags say and returns its height; with DT_CALCRECT only measures and
  // changes the rectangle. The text itself is never changed.
  int DrawTextW(SStringView text, RECT& rect, unsigned int format) {
    return ::DrawTextW(m_hDC, text.data(), static_cast<int>(text.size()), &rect, format & ~DT_MODIFYSTRING);
  }

  HDC m_hDC = nullptr;  // the handle; set it by Attach and Detach
};

// A context that draws into the bitmap selected into it; at first one of a single black pixel.
class QXCORE_API SMemoryDC : public SDC {
  QXCORE_DECLARE_CREATABLE_CLASS(SMemoryDC)

  // Compatible with a context, or with the screen for null. GetSafeHdc() is null when the system refuses.
  explicit SMemoryDC(HDC compatible = nullptr) { Attach(::CreateCompatibleDC(compatible)); }
};

// Selects an object for a scope: the former one comes back at its end. The object must stay the caller's until then.
class QXCORE_API SSelectObject {
 public:
  // Selects `object` into `dc`.
  SSelectObject(HDC dc, HGDIOBJ object) : m_dc(dc), m_former(::SelectObject(dc, object)) {}
  ~SSelectObject() {
    if (m_former) ::SelectObject(m_dc, m_former);
  }
  SSelectObject(const SSelectObject&) = delete;
  SSelectObject& operator=(const SSelectObject&) = delete;

  // False when the system refused to select the object.
  explicit operator bool() const { return m_former != nullptr; }

 private:
  HDC m_dc;
  HGDIOBJ m_former;
};

// Keeps all settings of a context for a scope and brings them back at its end.
class QXCORE_API SSaveDC {
 public:
  // Saves the settings of `dc`.
  explicit SSaveDC(HDC dc) : m_dc(dc), m_saved(::SaveDC(dc)) {}
  ~SSaveDC() {
    if (m_saved) ::RestoreDC(m_dc, m_saved);
  }
  SSaveDC(const SSaveDC&) = delete;
  SSaveDC& operator=(const SSaveDC&) = delete;

 private:
  HDC m_dc;
  int m_saved;
};
