#include "qxcore/ui/app/temp_maps.h"

#include "qxcore/graphics/dc.h"
#include "qxcore/graphics/font.h"
#include "qxcore/graphics/gdi_object.h"
#include "qxcore/graphics/image_list.h"
#include "qxcore/ui/window/menu.h"
#include "qxcore/ui/window/window.h"

static constinit long g_lockCount = 0;

long SLockTempMaps() noexcept { return ++g_lockCount; }

long SUnlockTempMaps(int deleteTemps) {
  if (g_lockCount > 0) --g_lockCount;
  if (g_lockCount == 0 && deleteTemps != 0) {
    SWnd::DeleteTempMap();
    SImageList::DeleteTempMap();
    SMenu::DeleteTempMap();
    SDC::DeleteTempMap();
    SGdiObject::DeleteTempMap();
    SFontOld::DeleteTempMap();
  }
  return g_lockCount;
}
