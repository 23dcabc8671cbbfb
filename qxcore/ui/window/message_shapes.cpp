#include "qxcore/ui/window/message_shapes.h"

#include "qxcore/graphics/dc.h"
#include "qxcore/ui/control/scroll_bar.h"
#include "qxcore/ui/window/menu.h"
#include "qxcore/ui/window/window.h"

SWnd* SMsgObjects::Window(std::intptr_t handle) { return SWnd::FromHandle(reinterpret_cast<HWND>(handle)); }
SDC* SMsgObjects::Context(std::intptr_t handle) { return SDC::FromHandle(reinterpret_cast<HDC>(handle)); }
SMenu* SMsgObjects::Menu(std::intptr_t handle) { return SMenu::FromHandle(reinterpret_cast<HMENU>(handle)); }

SScrollBar* SMsgObjects::ScrollBar(std::intptr_t handle) {
  return SObjectCast<SScrollBar>(Window(handle), &SScrollBar::classSScrollBar);
}
