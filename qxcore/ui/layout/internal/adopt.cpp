#include "qxcore/ui/layout/internal/adopt.h"

#include "qxcore/ui/layout/splitter.h"
#include "qxcore/ui/layout/tab_window.h"

static void TakeOut(SWnd* window, SWnd* former) {
  int row = 0, column = 0;
  if (auto* tabs = SObjectCast<STabWnd>(former, &STabWnd::classSTabWnd)) {
    tabs->DetachTab(window);
  } else if (auto* splitter = SObjectCast<SSplitterWnd>(former, &SSplitterWnd::classSSplitterWnd)) {
    if (splitter->IsChildPane(window, &row, &column)) splitter->RemovePane(row, column);
  }
}

void SAdopt(SWnd* window, SWnd* parent) {
  const HWND former = ::GetParent(window->m_hWnd);
  if (former != parent->m_hWnd) TakeOut(window, SWnd::FromHandlePermanent(former));
  window->ModifyStyle(WS_POPUP, WS_CHILD);
  if (former != parent->m_hWnd) window->SetParent(parent);
}
