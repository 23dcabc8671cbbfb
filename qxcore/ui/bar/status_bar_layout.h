// SStatusBarLayout: a set of panes that can be spliced into a status bar, for example those of one kind of document.
//
// Attached to a bar, it is shown between Activate(1) and Activate(0), Detach, or the activation of another layout; its
// panes stand where the bar has kSPaneSplice. It may end before or after its bar. The pane operations are those of
// SStatusBar, with indices of the layout's own; widths are pixels at 96 dots an inch until it is attached, then those
// of the bar. For the user-interface thread.
#pragma once

#include "qxcore/ui/bar/status_bar.h"

class QXCORE_API SStatusBarLayout {
 public:
  SStatusBarLayout() = default;
  SStatusBarLayout(const SStatusBarLayout&) = delete;
  SStatusBarLayout& operator=(const SStatusBarLayout&) = delete;
  // Detaches. What a handler throws meanwhile is kept for the next call of the library that can throw it.
  ~SStatusBarLayout();

  // Attaches it to a bar, which stays the caller's; from another bar it is detached first.
  void Attach(SStatusBar* bar);
  // Takes its panes out of the bar, if they are shown, and returns the bar; null when there was none.
  SStatusBar* Detach();
  SStatusBar* GetBar() const { return m_bar; }  // null while detached
  // Shows its panes in the bar (nonzero) or takes them out. Returns 1, or 0 while it is detached.
  int Activate(int activate);
  int IsActive() const { return m_bar != nullptr && m_bar->m_layout == this; }

  // --- panes ---

  int InsertPane(int index, int width, DWORD style);
  int DeletePane(int index);
  int GetPaneText(int index, SString* text) const { return m_panes.GetPaneText(index, text); }
  SString GetPaneText(int index) const { return m_panes.GetPaneText(index); }
  int SetPaneText(int index, const SString* text, int update = 1);
  int SetMainPaneText(const SString* text, int update = 1) { return SetPaneText(kSMainPane, text, update); }
  DWORD GetPaneStyle(int index) const { return m_panes.GetPaneStyle(index); }
  int SetPaneStyle(int index, DWORD style);
  int GetPaneWidth(int index) const { return m_panes.GetPaneWidth(index); }
  int SetPaneWidth(int index, int width);
  int GetPaneCount() const { return m_panes.GetCount(); }

 private:
  friend class SStatusBar;
  friend struct SPaneOperations<SStatusBarLayout>;
  void UpdatePaneRects(int markTextDirty);
  bool FitPane(SStatusBarPane& pane);
  void SendPane(int position);
  void SetDpi(int dpi);

  SStatusBarPanes m_panes;
  SStatusBar* m_bar = nullptr;
  SStatusBarLayout* m_next = nullptr;  // the next one that is attached to the bar
  int m_dpi = 96;                      // what the widths are for: until it is attached 96, then the bar's
};
