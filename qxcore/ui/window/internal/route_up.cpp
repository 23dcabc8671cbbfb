#include "qxcore/ui/window/internal/route_up.h"

#include "qxcore/ui/app/application.h"
#include "qxcore/ui/window/window.h"

int SRouteUp(const SWnd& window, UINT id, int code, void* extra, S_CMDHANDLERINFO* info) {
  const bool isCommand = code == 0 || code == kSMsgUpdate;
  if (!isCommand || id < 0x8000 || id >= 0xF000) return 0;
  SWnd* parent = SWnd::FromHandlePermanent(::GetParent(window.m_hWnd));
  if (parent != nullptr && parent->OnCmdMsg(id, code, extra, info)) return 1;
  SWinApp* app = SGetApp();
  return app != nullptr && app->OnCmdMsg(id, code, extra, info);
}
