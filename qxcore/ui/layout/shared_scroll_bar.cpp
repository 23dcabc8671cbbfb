#include "qxcore/ui/layout/shared_scroll_bar.h"

#include "qxcore/ui/layout/splitter.h"
#include "qxcore/ui/layout/tab_window.h"

SScrollBar* SSharedScrollBar(const SWnd* window, int bar) {
  const HWND handle = window->GetSafeHwnd();
  SWnd* parent = handle != nullptr ? SWnd::FromHandlePermanent(::GetParent(handle)) : nullptr;
  if (auto* splitter = SObjectCast<SSplitterWnd>(parent, &SSplitterWnd::classSSplitterWnd)) {
    return splitter->GetPaneScrollBar(window, bar);
  }
  auto* tabs = SObjectCast<STabWnd>(parent, &STabWnd::classSTabWnd);
  return tabs != nullptr && tabs->GetActiveTab() == window ? tabs->GetTabScrollBar(bar) : nullptr;
}
