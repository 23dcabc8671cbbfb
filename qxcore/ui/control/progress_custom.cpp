#include "qxcore/ui/control/progress_custom.h"

#include <algorithm>

#include "qxcore/graphics/window_dc.h"
#include "qxcore/ui/app/ui_font.h"
#include "qxcore/ui/window/message_entries.h"

QXCORE_IMPLEMENT_CREATABLE_CLASS(SCustomProgressCtrl, SWnd, 2)

QXCORE_IMPLEMENT_MESSAGE_MAP(SCustomProgressCtrl, SWnd, on<WM_PAINT, &SCustomProgressCtrl::OnPaint>(),
                             on<WM_ERASEBKGND, &SCustomProgressCtrl::OnEraseBkgnd>(),
                             on<WM_SIZE, &SCustomProgressCtrl::OnSize>(),
                             on<WM_SYSCOLORCHANGE, &SCustomProgressCtrl::OnSysColorChange>(),
                             on<WM_SETFONT, &SCustomProgressCtrl::OnSetFont>(),
                             on<WM_GETFONT, &SCustomProgressCtrl::OnGetFont>())

SCustomProgressCtrl::~SCustomProgressCtrl() = default;

int SCustomProgressCtrl::Create(DWORD style, const SRect& rect, SWnd* parent, UINT id) {
  return Create(nullptr, nullptr, style, rect, parent, id);
}

// --- the status ---

void SCustomProgressCtrl::SetRange(std::int64_t low, std::int64_t high) { SetStatus({low, high, m_status.m_position}); }

std::int64_t SCustomProgressCtrl::SetPos(std::int64_t position) {
  const std::int64_t former = m_status.m_position;
  SetStatus({m_status.m_low, m_status.m_high, position});
  return former;
}

void SCustomProgressCtrl::SetStatus(const Status& status) {
  m_status = status;
  m_status.m_position = std::max(status.m_low, std::min(status.m_position, status.m_high));
  if (m_hWnd == nullptr) return;
  const Shown shown = WhatToShow();
  if (shown == m_shown) return;
  m_shown = shown;
  Invalidate(0);
}

// The part that is done, 0 to 1. Differences may be too wide for 64 bits.
double SCustomProgressCtrl::Done() const {
  if (m_status.m_high <= m_status.m_low) return 0;
  const double range = static_cast<double>(m_status.m_high) - static_cast<double>(m_status.m_low);
  return std::min((static_cast<double>(m_status.m_position) - static_cast<double>(m_status.m_low)) / range, 1.0);
}

int SCustomProgressCtrl::GetPercent() const {
  const int percent = static_cast<int>(Done() * 100);
  return percent == 100 && m_status.m_position != m_status.m_high ? 99 : percent;
}

// --- painting ---

SCustomProgressCtrl::Shown SCustomProgressCtrl::WhatToShow() const {
  return {static_cast<int>(GetClientRect().Width() * Done()), GetPercent()};
}

// One text, drawn twice: each half fills its background and what lies on it in one call.
void SCustomProgressCtrl::OnPaint() {
  SPaintDC dc(m_hWnd);
  m_shown = WhatToShow();
  SString text;
  text.Format(WTEXT("%d %%"), m_shown.m_percent);

  const SRect area = GetClientRect();
  const SSelectObject font(dc, m_font != nullptr ? m_font : SGetDefaultUIFont());
  const SSize size = dc.GetTextExtent(text.View());
  const SPoint at((area.Width() - size.cx) / 2, (area.Height() - size.cy) / 2);
  const auto draw = [&](const SRect& half, int background, int foreground) {
    dc.SetBkColor(::GetSysColor(background));
    dc.SetTextColor(::GetSysColor(foreground));
    dc.ExtTextOutW(at.x, at.y, ETO_OPAQUE | ETO_CLIPPED, &half, text.View());
  };
  draw(SRect(0, 0, m_shown.m_fill, area.bottom), COLOR_HIGHLIGHT, COLOR_HIGHLIGHTTEXT);
  draw(SRect(m_shown.m_fill, 0, area.right, area.bottom), COLOR_WINDOW, COLOR_WINDOWTEXT);
}

int SCustomProgressCtrl::OnEraseBkgnd(SDC*) { return 1; }

void SCustomProgressCtrl::OnSize(UINT, int, int) {
  Default();
  Invalidate(0);
}

void SCustomProgressCtrl::OnSysColorChange() {
  SWnd::OnSysColorChange();
  Invalidate(0);
}

LRESULT SCustomProgressCtrl::OnSetFont(WPARAM font, LPARAM redraw) {
  m_font = reinterpret_cast<HFONT>(font);
  if (LOWORD(redraw) != 0) Invalidate(0);
  return 0;
}

LRESULT SCustomProgressCtrl::OnGetFont(WPARAM, LPARAM) { return reinterpret_cast<LRESULT>(m_font); }
