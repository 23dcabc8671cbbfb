// The stock objects, made when first asked for and never ended.
#pragma once

#include "qxcore/platform/posix/draw/object.h"

namespace draw {

// One of the WHITE_BRUSH to DC_PEN numbers; null for an unknown one.
Object* Stock(int index);
template <class T>
T* StockAs(int index) {
  return static_cast<T*>(Stock(index));
}

}  // namespace draw
