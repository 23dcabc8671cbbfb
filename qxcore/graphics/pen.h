// SPen: what lines and outlines are drawn with. Threads: an object belongs to one thread at a time.
#pragma once

#include "qxcore/graphics/gdi_object.h"

class QXCORE_API SPen : public SGdiObject {
  QXCORE_DECLARE_CREATABLE_CLASS(SPen)

  SPen() = default;
  // As CreatePen; GetSafeHandle() is null when the system refuses.
  SPen(int style, int width, COLORREF color) { CreatePen(style, width, color); }
  explicit SPen(HPEN pen) : SGdiObject(pen) {}

  // A pen of a PS_ style, a width in pixels (0 counts as 1) and a colour. The broken styles are one wide.
  int CreatePen(int style, int width, COLORREF color) { return Hold(::CreatePen(style, width, color)); }
  // The description; 0 without a pen.
  int GetLogPen(LOGPEN* description) const { return GetObjectW(sizeof *description, description) != 0; }

  // The handle; stays the object's.
  operator HPEN() const { return static_cast<HPEN>(m_hObject); }
};
