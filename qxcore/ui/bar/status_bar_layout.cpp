#include "qxcore/ui/bar/status_bar_layout.h"

#include <utility>

#include "qxcore/ui/app/ui_font.h"
#include "qxcore/ui/bar/internal/auto_size.h"
#include "qxcore/ui/bar/internal/pane_operations.h"
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

int SStatusBarLayout::InsertPane(int index, int width, DWORD style) {
  return SPaneOperations<SStatusBarLayout>::Insert(*this, index, width, style);
}

int SStatusBarLayout::DeletePane(int index) { return SPaneOperations<SStatusBarLayout>::Delete(*this, index); }

int SStatusBarLayout::SetPaneText(int index, const SString* text, int update) {
  return SPaneOperations<SStatusBarLayout>::SetText(*this, index, text, update);
}

int SStatusBarLayout::SetPaneStyle(int index, DWORD style) {
  return SPaneOperations<SStatusBarLayout>::SetStyle(*this, index, style);
}

int SStatusBarLayout::SetPaneWidth(int index, int width) {
  return SPaneOperations<SStatusBarLayout>::SetWidth(*this, index, width);
}

void SStatusBarLayout::UpdatePaneRects(int markTextDirty) {
  if (IsActive()) m_bar->UpdatePaneRects(markTextDirty);
}

bool SStatusBarLayout::FitPane(SStatusBarPane& pane) {
  return SFitToText(pane, m_bar->GetSafeHwnd(), SGetDefaultUIFont(m_dpi));
}

void SStatusBarLayout::SendPane(int position) {
  if (IsActive()) m_bar->SendText(m_panes[position], m_bar->m_splice + position);
}

void SStatusBarLayout::SetDpi(int dpi) {
  if (dpi == m_dpi) return;
  m_panes.ScaleWidths(m_dpi, dpi);
  m_dpi = dpi;
  for (SStatusBarPane& pane : m_panes) FitPane(pane);
}
