#include "qxcore/ui/bar/status_bar_layout.h"

#include <utility>

#include "qxcore/ui/app/ui_font.h"
#include "qxcore/ui/bar/internal/auto_size.h"
#include "qxcore/ui/window/thread_state.h"

SStatusBarLayout::~SStatusBarLayout() {
  try {
    Detach();
  } catch (...) {
    SWndThreadState::Get().KeepException(std::current_exception());
  }
}

void SStatusBarLayout::Attach(SStatusBar* bar) {
  if (bar == m_bar) return;
  Detach();
  if (bar == nullptr) return;
  m_bar = bar;
  m_next = std::exchange(bar->m_attached, this);
  SetDpi(bar->m_dpi);
}

SStatusBar* SStatusBarLayout::Detach() {
  SStatusBar* bar = m_bar;
  if (bar == nullptr) return nullptr;
  const bool wasActive = IsActive();
  bar->Unlink(this);
  if (wasActive) bar->UpdatePaneRects(1);
  return bar;
}

int SStatusBarLayout::Activate(int activate) {
  if (m_bar == nullptr) return 0;
  if (activate || IsActive()) m_bar->SetExtraLayout(activate ? this : nullptr);
  return 1;
}

// --- panes ---

void SStatusBarLayout::Changed(int markTextDirty) {
  if (IsActive()) m_bar->UpdatePaneRects(markTextDirty);
}

int SStatusBarLayout::InsertPane(int index, int width, DWORD style) {
  if (m_panes.InsertPane(index, width, style) < 0) return 0;
  Changed(1);
  return 1;
}

int SStatusBarLayout::DeletePane(int index) {
  if (!m_panes.DeletePane(index)) return 0;
  Changed(1);
  return 1;
}

int SStatusBarLayout::SetPaneText(int index, const SString* text, int update) {
  const int at = m_panes.SetPaneText(index, text);
  if (at < 0) return 0;
  if (SFitToText(m_panes[at], m_bar->GetSafeHwnd(), SGetDefaultUIFont(m_dpi))) Changed(0);
  if (update && IsActive() && at < m_panes.GetCount()) m_bar->SendText(m_panes[at], m_bar->m_splice + at);
  return 1;
}

int SStatusBarLayout::SetPaneStyle(int index, DWORD style) {
  const int at = m_panes.Find(index);
  if (at < 0) return 0;
  m_panes[at].m_style = style;
  SFitToText(m_panes[at], m_bar->GetSafeHwnd(), SGetDefaultUIFont(m_dpi));
  Changed(1);
  return 1;
}

int SStatusBarLayout::SetPaneWidth(int index, int width) {
  const int at = m_panes.Find(index);
  if (at < 0) return 0;
  if (std::exchange(m_panes[at].m_width, width) != width) Changed(0);
  return 1;
}

void SStatusBarLayout::SetDpi(int dpi) {
  if (dpi == m_dpi) return;
  m_panes.ScaleWidths(m_dpi, dpi);
  m_dpi = dpi;
  for (SStatusBarPane& pane : m_panes) SFitToText(pane, m_bar->GetSafeHwnd(), SGetDefaultUIFont(dpi));
}
