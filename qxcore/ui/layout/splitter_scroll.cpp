// The scroll bars that panes share: one for each column at the bottom, one for each row at the right.

#include "qxcore/ui/control/scroll_bar.h"
#include "qxcore/ui/frame/view.h"
#include "qxcore/ui/layout/splitter.h"
#include "qxcore/ui/window/message_shapes.h"
#include "qxcore/ui/window/thread_state.h"

static int BarId(bool columns, int line) {
  return static_cast<int>(columns ? kSHorzScrollBarId : kSVertScrollBarId) + line;
}

SScrollBar* SSplitterWnd::GetPaneScrollBar(const SWnd* pane, int bar) const {
  int row = 0, column = 0;
  if (!IsChildPane(pane, &row, &column)) return nullptr;
  const HWND control = ::GetDlgItem(m_hWnd, bar == SB_HORZ ? BarId(true, column) : BarId(false, row));
  return SMsgObjects::ScrollBar(reinterpret_cast<std::intptr_t>(control));
}

// Each pane finds the bar where it was, so that a line further is a line for all of them.
void SSplitterWnd::ScrollLine(bool columns, int line, UINT code, UINT position) {
  const HWND window = m_hWnd;
  const HWND bar = ::GetDlgItem(window, BarId(columns, line));
  const int before = ::GetScrollPos(bar, SB_CTL);
  bool isFirst = true;
  for (int across = 0; across < Count(columns); ++across) {
    const int row = columns ? across : line, column = columns ? line : across;
    const HWND pane = ::GetDlgItem(window, static_cast<int>(IdFromRowCol(row, column)));
    if (pane == nullptr) continue;
    if (!std::exchange(isFirst, false)) ::SetScrollPos(bar, SB_CTL, before, FALSE);
    SSent(::SendMessageW(pane, columns ? WM_HSCROLL : WM_VSCROLL,
                         MAKEWPARAM(static_cast<WORD>(code), static_cast<WORD>(position)),
                         reinterpret_cast<LPARAM>(bar)));
    if (FromHandlePermanent(window) != this) return;
  }
}

void SSplitterWnd::OnHScroll(UINT code, UINT position, SScrollBar* bar) {
  const int column = bar != nullptr ? bar->GetDlgCtrlID() - BarId(true, 0) : -1;
  if (column >= 0 && column < m_columnCount) {
    ScrollLine(true, column, code, position);
  } else {
    SWnd::OnHScroll(code, position, bar);
  }
}

void SSplitterWnd::OnVScroll(UINT code, UINT position, SScrollBar* bar) {
  const int row = bar != nullptr ? bar->GetDlgCtrlID() - BarId(false, 0) : -1;
  if (row >= 0 && row < m_rowCount) {
    ScrollLine(false, row, code, position);
  } else {
    SWnd::OnVScroll(code, position, bar);
  }
}

int SSplitterWnd::DoScroll(SView* view, UINT code, int scroll) {
  int row = 0, column = 0;
  if (!IsChildPane(view, &row, &column)) return 0;
  int done = 0;
  const HWND window = m_hWnd;
  const auto along = [&](bool columns, int line, UINT part) {
    if (part == 0xFF || ::GetDlgItem(m_hWnd, BarId(columns, line)) == nullptr) return;
    done = 1;
    if (scroll) ScrollLine(columns, line, part, 0);
  };
  along(true, column, code & 0xFF);
  if (FromHandlePermanent(window) == this) along(false, row, code >> 8 & 0xFF);
  return done;
}

int SSplitterWnd::ScrollPaneBy(bool columns, int line, int distance, int scroll) {
  const HWND bar = ::GetDlgItem(m_hWnd, BarId(columns, line));
  SCROLLINFO info = {};
  info.cbSize = sizeof info;
  info.fMask = SIF_ALL;
  if (bar == nullptr || !::GetScrollInfo(bar, SB_CTL, &info)) return 0;
  const long long last = info.nMax - std::max<long long>(static_cast<long long>(info.nPage) - 1, 0);
  const long long target = std::clamp<long long>(static_cast<long long>(info.nPos) + distance, info.nMin,
                                                 std::max<long long>(last, info.nMin));
  if (target == info.nPos) return 0;
  if (scroll) ScrollLine(columns, line, SB_THUMBPOSITION, static_cast<UINT>(target));
  return 1;
}

int SSplitterWnd::DoScrollBy(SView* view, SSize distance, int scroll) {
  int row = 0, column = 0;
  if (!IsChildPane(view, &row, &column)) return 0;
  const HWND window = m_hWnd;
  const int horizontal = ScrollPaneBy(true, column, distance.cx, scroll);
  const bool lives = FromHandlePermanent(window) == this;
  return (lives && ScrollPaneBy(false, row, distance.cy, scroll)) || horizontal;
}

// The wheel comes here when the pane under the pointer does not want it.
int SSplitterWnd::OnMouseWheel(UINT, short turn, SPoint point) {
  ScreenToClient(&point);
  int row = 0;
  const HWND pane = ::ChildWindowFromPoint(m_hWnd, point);
  UINT lines = 3;
  ::SystemParametersInfoW(SPI_GETWHEELSCROLLLINES, 0, &lines, 0);
  if (!(m_scrollStyle & WS_VSCROLL) || !IsChildPane(FromHandle(pane), &row) || lines == 0) {
    return static_cast<int>(Default());
  }
  m_wheelTurn += turn;
  const int notches = m_wheelTurn / WHEEL_DELTA;
  m_wheelTurn -= notches * WHEEL_DELTA;
  const bool isByPage = lines > 100;
  const UINT code = isByPage ? (notches > 0 ? SB_PAGEUP : SB_PAGEDOWN) : (notches > 0 ? SB_LINEUP : SB_LINEDOWN);
  const int steps = std::abs(notches) * (isByPage ? 1 : static_cast<int>(lines));
  const HWND window = m_hWnd;
  for (int i = 0; i < steps && FromHandlePermanent(window) == this; ++i) ScrollLine(false, row, code, 0);
  return 1;
}
