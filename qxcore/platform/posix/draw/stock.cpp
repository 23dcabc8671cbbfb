#include "qxcore/platform/posix/draw/stock.h"

#include <iterator>
#include <string_view>

#include "qxcore/platform/posix/draw/font_object.h"
#include "qxcore/platform/posix/draw/pen_brush.h"

namespace draw {

namespace {

constexpr int kSystemColors = 31;

// Throws std::bad_alloc where memory is short.
Object* Keep(Object* object) {
  if (!Enter(object)) throw std::bad_alloc();
  object->m_permanent = true;
  return object;
}

void Discard(Object* object) {
  if (object) Remove(object->m_handle);
}

ColorSource Fixed(COLORREF color) { return {ColorSource::kFixed, color, 0}; }

FontObject* MakeFont(LONG height, LONG weight, BYTE pitchAndFamily, SStringView face) {
  LOGFONTW font{};
  font.lfHeight = height;
  font.lfWeight = weight;
  font.lfPitchAndFamily = pitchAndFamily;
  face.copy(font.lfFaceName, LF_FACESIZE - 1);
  return new FontObject(font);
}

Object* Make(int index) {
  const ColorSource ofContext{ColorSource::kOfContext, 0, 0};
  switch (index) {
    case WHITE_BRUSH:
      return new Brush(BS_SOLID, Fixed(0xFFFFFF));
    case LTGRAY_BRUSH:
      return new Brush(BS_SOLID, Fixed(0xC0C0C0));
    case GRAY_BRUSH:
      return new Brush(BS_SOLID, Fixed(0x808080));
    case DKGRAY_BRUSH:
      return new Brush(BS_SOLID, Fixed(0x404040));
    case BLACK_BRUSH:
      return new Brush(BS_SOLID, Fixed(0));
    case NULL_BRUSH:
      return new Brush(BS_NULL, Fixed(0));
    case WHITE_PEN:
      return new Pen(PS_SOLID, 0, Fixed(0xFFFFFF));
    case BLACK_PEN:
      return new Pen(PS_SOLID, 0, Fixed(0));
    case NULL_PEN:
      return new Pen(PS_NULL, 0, Fixed(0));
    case OEM_FIXED_FONT:
      return MakeFont(12, FW_NORMAL, FIXED_PITCH | FF_MODERN, WTEXT(""));
    case ANSI_FIXED_FONT:
      return MakeFont(12, FW_NORMAL, FIXED_PITCH | FF_MODERN, WTEXT("Courier"));
    case ANSI_VAR_FONT:
      return MakeFont(12, FW_NORMAL, VARIABLE_PITCH | FF_SWISS, WTEXT("MS Sans Serif"));
    case SYSTEM_FONT:
    case DEVICE_DEFAULT_FONT:
      return MakeFont(16, FW_BOLD, VARIABLE_PITCH | FF_SWISS, WTEXT("System"));
    case SYSTEM_FIXED_FONT:
      return MakeFont(16, FW_NORMAL, FIXED_PITCH | FF_MODERN, WTEXT("Courier"));
    case DEFAULT_GUI_FONT:
      return MakeFont(-MulDiv(11, static_cast<int>(GetDpiForSystem()), 96), FW_NORMAL, VARIABLE_PITCH | FF_SWISS,
                      WTEXT("MS Shell Dlg"));
    case DC_BRUSH:
      return new Brush(BS_SOLID, ofContext);
    case DC_PEN:
      return new Pen(PS_SOLID, 0, ofContext);
    default:
      return nullptr;
  }
}

struct Stocks {
  // All or none: without them no context can be made.
  Stocks() {
    try {
      for (int i = 0; i <= DC_PEN; ++i) {
        if (i != 9 && i != 15) objects[i] = Keep(Make(i));  // these numbers name nothing here
      }
      for (int i = 0; i < kSystemColors; ++i)
        systemBrushes[i] = Keep(new Brush(BS_SOLID, {ColorSource::kSystem, 0, i}));
    } catch (...) {
      for (Object* object : objects) Discard(object);
      for (Object* object : systemBrushes) Discard(object);
      throw;
    }
  }
  Object* objects[DC_PEN + 1] = {};
  Object* systemBrushes[kSystemColors] = {};
};

Stocks& TheStocks() {
  static Stocks stocks;
  return stocks;
}

}  // namespace

Object* Stock(int index) { return index >= 0 && index <= DC_PEN ? TheStocks().objects[index] : nullptr; }

}  // namespace draw

using namespace draw;

HGDIOBJ GetStockObject(int index) try {
  Object* object = Stock(index);
  return object ? object->m_handle : nullptr;
} catch (const std::bad_alloc&) {
  return NoMemory(HGDIOBJ{});
}

HBRUSH GetSysColorBrush(int index) try {
  if (index < 0 || index >= kSystemColors) return nullptr;
  return reinterpret_cast<HBRUSH>(TheStocks().systemBrushes[index]->m_handle);
} catch (const std::bad_alloc&) {
  return NoMemory(HBRUSH{});
}
