#include "qxcore/ui/layout/internal/pane_focus.h"

#include "qxcore/ui/layout/splitter.h"
#include "qxcore/ui/layout/tab_window.h"

static SSplitterWnd* AsSplitter(SWnd* window) {
  return SObjectCast<SSplitterWnd>(window, &SSplitterWnd::classSSplitterWnd);
}

static STabWnd* AsTabs(SWnd* window) { return SObjectCast<STabWnd>(window, &STabWnd::classSTabWnd); }

bool SPaneFocus::HasOuterStop(const SWnd* window) {
  HWND above = window->m_hWnd;
  while ((::GetWindowLongW(above, GWL_STYLE) & WS_CHILD) != 0) {
    above = ::GetParent(above);
    SWnd* object = SWnd::FromHandlePermanent(above);
    SSplitterWnd* splitter = AsSplitter(object);
    STabWnd* tabs = AsTabs(object);
    if ((splitter != nullptr && splitter->CanActivateNext()) || (tabs != nullptr && tabs->GetTabCount() > 0)) {
      return true;
    }
  }
  return false;
}

static void EnterSplitter(SSplitterWnd& splitter, bool backward) {
  const int columns = splitter.GetColumnCount();
  const int places = splitter.GetRowCount() * columns;
  for (int i = 0; i < places; ++i) {
    const int place = backward ? places - 1 - i : i;
    SWnd* pane = splitter.GetPane(place / columns, place % columns);
    if (pane == nullptr) continue;
    splitter.SetActivePane(place / columns, place % columns);
    if (backward) SPaneFocus::Enter(pane, true);
    return;
  }
}

void SPaneFocus::Enter(SWnd* window, bool backward) {
  if (SSplitterWnd* splitter = AsSplitter(window)) {
    EnterSplitter(*splitter, backward);
  } else if (STabWnd* tabs = AsTabs(window)) {
    SWnd* shown = tabs->ShownWindow();
    if (shown != nullptr && !backward) {
      Enter(shown, false);
    } else {
      tabs->m_beam.SetFocus();
    }
  } else if (::GetFocus() != window->m_hWnd) {
    window->SetFocus();
  }
}
