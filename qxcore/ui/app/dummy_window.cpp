#include "qxcore/ui/app/application.h"
#include "qxcore/ui/window/window.h"

// Nobody sees the window, and an object of static storage would end after the system's windows: it is never ended.
SWnd* SDummyWindow() {
  static SWnd& window = *new SWnd;
  if (window.m_hWnd == nullptr && !window.CreateEx(0, nullptr, WTEXT(""), WS_POPUP, 0, 0, 0, 0, nullptr, nullptr)) {
    return nullptr;
  }
  return &window;
}
