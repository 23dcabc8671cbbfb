// SBrush: what areas are filled with. Threads: an object belongs to one thread at a time.
#pragma once

#include <type_traits>

#include "qxcore/graphics/gdi_object.h"

class QXCORE_API SBrush : public SGdiObject {
  QXCORE_DECLARE_CREATABLE_CLASS(SBrush)

  SBrush() = default;
  // A brush of one colour; GetSafeHandle() is null when the system refuses.
  template <class Color>
  requires std::is_integral_v<Color>
  explicit SBrush(Color color) { CreateSolidBrush(static_cast<COLORREF>(color)); }
  explicit SBrush(HBRUSH brush) : SGdiObject(brush) {}

  // One colour.
  int CreateSolidBrush(COLORREF color) { return Hold(::CreateSolidBrush(color)); }
  // Lines of a HS_ style in a colour; between them the context's background shows.
  int CreateHatchBrush(int hatch, COLORREF color) { return Hold(::CreateHatchBrush(hatch, color)); }
  // A copy of a bitmap, repeated from the context's brush origin.
  int CreatePatternBrush(HBITMAP bitmap) { return Hold(::CreatePatternBrush(bitmap)); }
  // The system's brush for a COLOR_ index, which follows the system's colours.
  int CreateSysColorBrush(int index) { return Hold(::GetSysColorBrush(index)); }
  // The description; 0 without a brush.
  int GetLogBrush(LOGBRUSH* description) const { return GetObjectW(sizeof *description, description) != 0; }

  // The handle; stays the object's.
  operator HBRUSH() const { return static_cast<HBRUSH>(m_hObject); }
};
