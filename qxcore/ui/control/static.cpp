#include "qxcore/ui/control/static.h"

QXCORE_IMPLEMENT_CREATABLE_CLASS(SStatic, SWnd, 2)

SStatic::~SStatic() = default;

int SStatic::Create(LPCWSTR text, DWORD style, const SRect& rect, SWnd* parent, UINT id) {
  return Create(WTEXT("Static"), text, style, rect, parent, id);
}
