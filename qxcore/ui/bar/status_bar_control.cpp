// A status bar and its control: what the control is told, and the messages that pass it.

#include <algorithm>

#include "qxcore/graphics/window_dc.h"
#include "qxcore/ui/bar/internal/auto_size.h"
#include "qxcore/ui/bar/internal/pane_placing.h"
#include "qxcore/ui/bar/status_bar.h"
#include "qxcore/ui/bar/status_bar_layout.h"
#include "qxcore/ui/window/message_entries.h"

QXCORE_IMPLEMENT_MESSAGE_MAP(
    SStatusBar, SCtrlBar, on<WM_NCHITTEST, &SStatusBar::OnNcHitTest>(), on<WM_SIZE, &SStatusBar::OnSize>(),
    on<WM_PAINT, &SStatusBar::OnPaint>(), on<WM_NCCALCSIZE, &SStatusBar::OnNcCalcSize>(),
    reflected<WM_DRAWITEM, &SStatusBar::DrawItem>(), on<WM_SETTEXT, &SStatusBar::OnSetText>(),
    on<WM_GETTEXT, &SStatusBar::OnGetText>(), on<WM_GETTEXTLENGTH, &SStatusBar::OnGetTextLength>(),
    on<SB_SETMINHEIGHT, &SStatusBar::OnSetMinHeight>(), on<WM_DPICHANGED, &SStatusBar::OnDpiChanged>(),
    on<0x02E3 /* WM_DPICHANGED_AFTERPARENT */, &SStatusBar::OnDpiChangedAfterParent>(),
    on<WM_SETTINGCHANGE, &SStatusBar::OnSettingChange>(), on<WM_GETOBJECT, &SStatusBar::OnGetObject>())

namespace {

constexpr int kMostPanes = SB_SIMPLEID;  // the control takes no text for a pane of this index
constexpr int kPadding = 6;              // of each pane
constexpr COLORREF kOwnerDrawnText = 0x00808080;

// The three numbers of SB_GETBORDERS.
struct Borders {
  int m_horizontal = 0;
  int m_vertical = 0;
  int m_gap = 0;
};

Borders BordersOf(const SStatusBar& bar) {
  Borders borders;
  bar.SendMessageW(SB_GETBORDERS, 0, reinterpret_cast<LPARAM>(&borders));
  return borders;
}

}  // namespace

// --- widths ---

// The room for panes ends left of the grip, which a maximised parent hides.
SPaneSpace SStatusBar::GetPaneSpace() const {
  SRect rect = GetWindowRect();
  rect.MoveTo(SPoint());
  CalcNCOffsets(&rect, 1);
  const Borders borders = BordersOf(*this);
  if ((GetStyle() & SBARS_SIZEGRIP) && !::IsZoomed(::GetParent(m_hWnd))) {
    rect.right -= 2 * ::GetSystemMetrics(SM_CXBORDER) + borders.m_horizontal + ::GetSystemMetrics(SM_CXVSCROLL);
  }
  return {rect.Width(), borders.m_horizontal, borders.m_gap, Scaled(kPadding)};
}

void SStatusBar::UpdatePaneRects(int markTextDirty) {
  m_splice = m_panes.FindSplice();
  SStatusBarPanes* extra = m_layout != nullptr ? &m_layout->m_panes : nullptr;
  if (markTextDirty) {
    SVisitPanes(m_panes, m_splice, extra, [](SStatusBarPane& pane) { pane.m_flags |= SStatusBarPane::kTextDirty; });
  }
  if (m_hWnd == nullptr) return;
  int edges[kMostPanes] = {};
  const int count = SPlacePanes(m_panes, m_splice, extra, GetPaneSpace(), edges, kMostPanes);
  SendMessageW(SB_SETPARTS, static_cast<WPARAM>(count), reinterpret_cast<LPARAM>(edges));
  if (count == 0) SendEmptyPane();
}

// The control refuses to be without panes and would go on showing the last ones.
void SStatusBar::SendEmptyPane() {
  const int toTheEnd = -1;
  SendMessageW(SB_SETPARTS, 1, reinterpret_cast<LPARAM>(&toTheEnd));
  SendMessageW(SB_SETTEXTW, SBT_NOBORDERS, reinterpret_cast<LPARAM>(WTEXT("")));
}

SSize SStatusBar::GetBarLayout(int, int) {
  SRect insets;
  CalcNCOffsets(&insets, 1);
  SClientDC dc(m_hWnd);
  const SSelectObject font(dc, GetBarFont());
  TEXTMETRICW metrics = {};
  dc.GetTextMetricsW(&metrics);
  const int borders = 2 * (::GetSystemMetrics(SM_CYBORDER) + BordersOf(*this).m_vertical);
  const int height = borders - insets.Height() - metrics.tmInternalLeading + metrics.tmHeight - 1;
  return SSize(32767, std::max(height, m_minHeight));
}

// --- texts ---

// The record may go while the control handles the message.
void SStatusBar::SendText(SStatusBarPane& pane, int controlIndex) {
  if (m_hWnd == nullptr || controlIndex >= kMostPanes || (pane.m_flags & SStatusBarPane::kTextDirty) == 0) return;
  pane.m_flags &= ~SStatusBarPane::kTextDirty;
  const SString text = pane.m_text;
  const std::uint32_t style = pane.m_style;
  SetFont(GetBarFont(), 0);
  const DWORD type = (style & 0xFFFF) | (style & kSPaneOwnerDraw ? SBT_OWNERDRAW : 0);
  const LPCWSTR shown = style & kSPaneKeepText ? nullptr : text.GetSafePointer();
  SendMessageW(SB_SETTEXTW, static_cast<DWORD>(controlIndex) | type, reinterpret_cast<LPARAM>(shown));
}

// A control may paint as soon as it gets a text, and painting comes back here.
void SStatusBar::UpdatePaneStrings() {
  if (m_isSending) return;
  struct Sending {
    bool& flag;
    ~Sending() { flag = false; }
  } sending{m_isSending = true};
  for (int i = 0; i < m_panes.GetCount(); ++i) SendText(m_panes[i], SControlIndex(i, m_splice, ExtraCount()));
  for (int i = 0; i < ExtraCount(); ++i) SendText(m_layout->m_panes[i], m_splice + i);
}

void SStatusBar::OnPaint() {
  UpdatePaneStrings();
  Default();
}

const SStatusBarPane* SStatusBar::FindShown(int controlIndex) const {
  const int extra = ExtraCount();
  const bool isExtra = controlIndex >= m_splice && controlIndex < m_splice + extra;
  if (isExtra) return &m_layout->m_panes.GetConst(controlIndex - m_splice);
  const int at = m_panes.Find(controlIndex < m_splice ? controlIndex : controlIndex - extra);
  return at >= 0 && controlIndex >= 0 ? &m_panes.GetConst(at) : nullptr;
}

void SStatusBar::DrawItem(DRAWITEMSTRUCT* item) {
  const int index = static_cast<int>(item->itemID);
  const SStatusBarPane* pane = FindShown(index);
  SRect rect;
  if (pane == nullptr || !GetControlRect(index, &rect)) return;
  const SString text = pane->m_text;
  const UINT reading = pane->m_style & SBT_RTLREADING ? DT_RTLREADING | DT_RIGHT : 0;
  rect.left += Scaled(3);
  SDC* dc = SDC::FromHandle(item->hDC);
  const COLORREF background = dc->SetBkColor(::GetSysColor(COLOR_3DFACE));
  const COLORREF foreground = dc->SetTextColor(kOwnerDrawnText);
  dc->DrawTextW(text.View(), rect, DT_SINGLELINE | DT_VCENTER | DT_NOPREFIX | reading);
  dc->SetTextColor(foreground);
  dc->SetBkColor(background);
}

// The window's text is that of the first pane.
int SStatusBar::OnSetText(LPCWSTR text) {
  if (m_panes.IsEmpty()) return -1;
  const SString stored(text);
  return SetPaneText(0, &stored, 1) ? 0 : -1;
}

int SStatusBar::OnGetText(int capacity, LPWSTR buffer) {
  if (capacity <= 0 || buffer == nullptr) return 0;
  const SString text = m_panes.GetPaneText(0);
  const SStringView shown = text.View().substr(0, static_cast<std::size_t>(capacity) - 1);
  buffer[shown.copy(buffer, shown.size())] = 0;
  return static_cast<int>(shown.size());
}

int SStatusBar::OnGetTextLength() { return m_panes.GetPaneText(0).Length(); }

// --- sizes ---

// Only the grip is more than client area.
LRESULT SStatusBar::OnNcHitTest(SPoint) { return Default() == HTBOTTOMRIGHT ? HTBOTTOMRIGHT : HTCLIENT; }

int SStatusBar::OnNcCalcSize(int, NCCALCSIZE_PARAMS* sizes) {
  SRect rect(sizes->rgrc[0]);
  CalcNCOffsets(&rect, 1);
  rect.top -= Scaled(2);
  sizes->rgrc[0] = rect;
  return 0;
}

void SStatusBar::OnSize(UINT, int, int) {
  Default();
  UpdatePaneRects(0);
}

LRESULT SStatusBar::OnSetMinHeight(WPARAM height, LPARAM) {
  const LRESULT isAccepted = Default();
  if (isAccepted) m_minHeight = static_cast<int>(height);
  return isAccepted;
}

LRESULT SStatusBar::OnDpiChanged(WPARAM wParam, LPARAM) {
  const LRESULT result = Default();
  SetDpi(LOWORD(wParam));
  SetFont(GetBarFont(), 0);
  UpdatePaneRects(1);
  return result;
}

// The interface font may be another one.
void SStatusBar::OnSettingChange(UINT what, LPCWSTR area) {
  SCtrlBar::OnSettingChange(what, area);
  for (SStatusBarPane& pane : m_panes) SFitToText(pane, m_hWnd, GetBarFont());
  SetFont(GetBarFont(), 0);
  UpdatePaneRects(1);
}
