#include "qxcore/ui/frame/dock_site_frame.h"

#include "qxcore/ui/bar/size_parent.h"
#include "qxcore/ui/window/message_entries.h"

QXCORE_IMPLEMENT_CREATABLE_CLASS(SDockSiteFrameWnd, SFrameWnd, 2)

QXCORE_IMPLEMENT_MESSAGE_MAP(SDockSiteFrameWnd, SFrameWnd, on<kSMsgStatusText, &SDockSiteFrameWnd::OnStatusText>())

SDockSiteFrameWnd::~SDockSiteFrameWnd() = default;

static SStatusBar* StatusBarOf(HWND frame) {
  for (HWND child = ::GetWindow(frame, GW_CHILD); child != nullptr; child = ::GetWindow(child, GW_HWNDNEXT)) {
    if (auto* bar = SObjectCast<SStatusBar>(SWnd::FromHandlePermanent(child), &SStatusBar::classSStatusBar)) return bar;
  }
  return nullptr;
}

LRESULT SDockSiteFrameWnd::OnStatusText(WPARAM text, LPARAM user) {
  SStatusBar* bar = StatusBarOf(m_hWnd);
  if (bar == nullptr) return 0;
  if (text != 0) {
    m_texts.Show(*bar, user, reinterpret_cast<LPCWSTR>(text));
  } else {
    m_texts.Restore(*bar, user);
  }
  return 1;
}
