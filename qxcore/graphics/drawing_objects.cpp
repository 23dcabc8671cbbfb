// The class records of the drawing objects that are all inline.
#include "qxcore/graphics/brush.h"
#include "qxcore/graphics/pen.h"
#include "qxcore/graphics/region.h"

QXCORE_IMPLEMENT_CREATABLE_CLASS(SPen, SGdiObject, 1)
QXCORE_IMPLEMENT_CREATABLE_CLASS(SBrush, SGdiObject, 1)
QXCORE_IMPLEMENT_CREATABLE_CLASS(SRgn, SGdiObject, 1)
