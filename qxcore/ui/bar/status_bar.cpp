// The panes of a status bar: the list, and what follows from a change of it.

#include "qxcore/ui/bar/status_bar.h"

#include <utility>

#include "qxcore/ui/app/internal/scaled_pixels.h"
#include "qxcore/ui/app/ui_font.h"
#include "qxcore/ui/app/ui_sys_data.h"
#include "qxcore/ui/bar/internal/auto_size.h"
#include "qxcore/ui/bar/internal/pane_operations.h"
#include "qxcore/ui/bar/internal/pane_placing.h"
#include "qxcore/ui/bar/status_bar_layout.h"

QXCORE_IMPLEMENT_CREATABLE_CLASS(SStatusBar, SCtrlBar, 2)

// The major version of the system. Before 4, bars had a frame of their own.
static int SystemVersion() { return static_cast<int>(::GetVersion() & 0xFF); }

SStatusBar::SStatusBar() {
  m_topBorder = 2;
  if (SystemVersion() >= 4) return;
  m_leftBorder = m_rightBorder = 2;
  m_bottomBorder = 1;
}

SStatusBar::~SStatusBar() {
  while (m_attached != nullptr) Unlink(m_attached);
}

// --- creation ---

int SStatusBar::Create(SWnd* parent, DWORD barStyle, DWORD style, UINT id) {
  const INITCOMMONCONTROLSEX classes = {sizeof classes, ICC_BAR_CLASSES};
  ::InitCommonControlsEx(&classes);
  SetBarStyle(barStyle);
  style |= CCS_NOMOVEY | CCS_NORESIZE | CCS_NOPARENTALIGN | CCS_NODIVIDER;
  if (parent != nullptr && (parent->GetStyle() & WS_THICKFRAME)) style |= SBARS_SIZEGRIP;
  if (!Create(STATUSCLASSNAMEW, nullptr, style, SRect(), parent, id)) return 0;
  SetFont(GetBarFont(), 0);
  SetDpi(SGetUISysData()->m_dpi);
  UpdatePaneRects(1);
  return 1;
}

int SStatusBar::PreCreateWindow(CREATESTRUCTW* create) {
  constexpr DWORD kBorderKinds = 0x0F000000;
  if (SystemVersion() >= 4 && GetBarStyle() >> 24 == 0x88) SetBarStyle(GetBarStyle() & ~kBorderKinds);
  return SCtrlBar::PreCreateWindow(create);
}

// --- panes ---

int SStatusBar::InsertPane(int index, int width, DWORD style) {
  return SPaneOperations<SStatusBar>::Insert(*this, index, width, style);
}

int SStatusBar::DeletePane(int index) { return SPaneOperations<SStatusBar>::Delete(*this, index); }

int SStatusBar::SetPaneText(int index, const SString* text, int update) {
  return SPaneOperations<SStatusBar>::SetText(*this, index, text, update);
}

int SStatusBar::SetPaneStyle(int index, DWORD style) {
  return SPaneOperations<SStatusBar>::SetStyle(*this, index, style);
}

int SStatusBar::SetPaneWidth(int index, int width) {
  return SPaneOperations<SStatusBar>::SetWidth(*this, index, width);
}

bool SStatusBar::FitPane(SStatusBarPane& pane) { return SFitToText(pane, m_hWnd, GetBarFont()); }

void SStatusBar::SendPane(int position) {
  SendText(m_panes[position], SControlIndex(position, m_splice, ExtraCount()));
}

int SStatusBar::GetPaneRect(int index, SRect* rect) const {
  const int at = m_panes.Find(index);
  return at >= 0 ? GetControlRect(SControlIndex(at, m_splice, ExtraCount()), rect) : 0;
}

int SStatusBar::GetControlRect(int controlIndex, SRect* rect) const {
  return SendMessageW(SB_GETRECT, static_cast<WPARAM>(controlIndex), reinterpret_cast<LPARAM>(rect)) != 0;
}

// --- layouts ---

int SStatusBar::ExtraCount() const { return m_layout != nullptr ? m_layout->m_panes.GetCount() : 0; }

void SStatusBar::SetExtraLayout(SStatusBarLayout* layout) {
  if (layout != nullptr) layout->Attach(this);
  m_layout = layout;
  UpdatePaneRects(1);
}

int SStatusBar::GetExtraLayoutItemRect(int index, SRect* rect) const {
  const int at = m_layout != nullptr ? m_layout->m_panes.Find(index) : -1;
  return at >= 0 ? GetControlRect(m_splice + at, rect) : 0;
}

// Takes a layout out of the list without any message.
void SStatusBar::Unlink(SStatusBarLayout* layout) {
  SStatusBarLayout** link = &m_attached;
  while (*link != layout) link = &(*link)->m_next;
  *link = std::exchange(layout->m_next, nullptr);
  layout->m_bar = nullptr;
  if (m_layout == layout) m_layout = nullptr;
}

// --- sizes ---

HFONT SStatusBar::GetBarFont() const { return SGetDefaultUIFont(m_dpi); }

// What the bar holds in pixels keeps its size in inches.
void SStatusBar::SetDpi(int dpi) {
  if (dpi <= 0 || dpi == m_dpi) return;
  for (std::int32_t* pixels : {&m_leftBorder, &m_topBorder, &m_rightBorder, &m_bottomBorder, &m_minHeight}) {
    *pixels = SScaledPixels(*pixels, dpi, m_dpi);
  }
  m_panes.ScaleWidths(m_dpi, dpi);
  m_dpi = dpi;
  for (SStatusBarPane& pane : m_panes) FitPane(pane);
  for (SStatusBarLayout* layout = m_attached; layout != nullptr; layout = layout->m_next) layout->SetDpi(dpi);
}
