// What a status bar and a status bar layout do alike when a pane of theirs changes.
//
// The owner has m_panes, and says what follows: UpdatePaneRects(markTextDirty) lays out what is shown, FitPane(pane)
// gives an auto-size pane the width of its text and returns whether that changed it, SendPane(position) gives the text
// to the control where the pane is shown.
#pragma once

#include <utility>

#include "qxcore/ui/bar/status_bar_panes.h"

template <class Owner>
struct SPaneOperations {
  static int Insert(Owner& owner, int index, int width, DWORD style) {
    if (owner.m_panes.InsertPane(index, width, style) < 0) return 0;
    owner.UpdatePaneRects(1);
    return 1;
  }

  static int Delete(Owner& owner, int index) {
    if (!owner.m_panes.DeletePane(index)) return 0;
    owner.UpdatePaneRects(1);
    return 1;
  }

  static int SetText(Owner& owner, int index, const SString* text, int update) {
    const int at = owner.m_panes.SetPaneText(index, text);
    if (at < 0) return 0;
    if (owner.FitPane(owner.m_panes[at])) owner.UpdatePaneRects(0);
    if (update && at < owner.m_panes.GetCount()) owner.SendPane(at);
    return 1;
  }

  static int SetStyle(Owner& owner, int index, DWORD style) {
    const int at = owner.m_panes.Find(index);
    if (at < 0) return 0;
    owner.m_panes[at].m_style = style;
    owner.FitPane(owner.m_panes[at]);
    owner.UpdatePaneRects(1);
    return 1;
  }

  static int SetWidth(Owner& owner, int index, int width) {
    const int at = owner.m_panes.Find(index);
    if (at < 0) return 0;
    if (std::exchange(owner.m_panes[at].m_width, width) != width) owner.UpdatePaneRects(0);
    return 1;
  }
};
