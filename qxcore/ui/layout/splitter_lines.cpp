// Rows and columns that come and go, with their panes and scroll bars.

#include "qxcore/ui/layout/splitter.h"
#include "qxcore/ui/window/thread_state.h"

static UINT ScrollBarId(bool rows, int at) {
  return (rows ? kSVertScrollBarId : kSHorzScrollBarId) + static_cast<UINT>(at);
}

static UINT PaneId(bool rows, int line, int across) {
  return rows ? SSplitterWnd::IdFromRowCol(line, across) : SSplitterWnd::IdFromRowCol(across, line);
}

// --- splitting ---

int SSplitterWnd::SplitRow(int before) { return Split(true, before); }
int SSplitterWnd::SplitColumn(int before) { return Split(false, before); }

// The parts of the line become ideal sizes; where the ratio is kept, so do the sizes of the others.
int SSplitterWnd::Split(bool rows, int before) {
  if (m_hWnd == nullptr || m_paneClass == nullptr || !CanGrow(rows)) return 0;
  const SPaneInfo* panes = std::as_const(Table(rows)).GetArray();
  int line = 0, start = 0;
  while (line + 1 < Count(rows) && before >= start + panes[line].m_current + Gap(rows)) {
    start += panes[line++].m_current + Gap(rows);
  }
  const int minimum = panes[line].m_min;
  const int first = before - start;
  if (first < minimum || first < 0) return 0;
  const int second = panes[line].m_current - first - Gap(rows);
  const bool isLaidOut = panes[line].m_current > 0;
  if (isLaidOut && (second < minimum || second < 0)) return 0;
  StopTracking(0);
  if (!InsertLine(rows, line + 1)) return 0;

  SPaneInfo* changed = Table(rows).GetArray();
  if (m_keepRatio) {
    for (int i = 0; i < Count(rows); ++i) changed[i].m_ideal = changed[i].m_current;
  }
  changed[line].m_ideal = first;
  changed[line + 1].m_ideal = std::max(second, 0);
  RecalcLayout();
  return 1;
}

// Makes room for a line and fills it with new panes. When one of them cannot be made, the line goes again.
bool SSplitterWnd::InsertLine(bool rows, int at) {
  struct Undo {
    SSplitterWnd& splitter;
    bool rows;
    int at;
    bool isNeeded = true;
    ~Undo() {
      if (isNeeded) splitter.RemoveLine(rows, at);
    }
  };
  SPaneInfo info;
  info.m_min = Table(rows)[at - 1].m_min;
  OpenSizes(rows).Insert(at, 0);
  Table(rows).Insert(at, info);
  ++(rows ? m_rowCount : m_columnCount);
  for (int line = Count(rows) - 1; line > at; --line) RenumberLine(rows, line - 1, line);

  Undo undo{*this, rows, at};
  for (int across = 0; across < Count(!rows); ++across) {
    const int row = rows ? at : across, column = rows ? across : at;
    if (AddPane(row, column, m_paneClass, SSize(-1, -1)) == nullptr) return false;
  }
  MakeScrollBars();
  undo.isNeeded = false;
  return true;
}

// --- deleting ---

void SSplitterWnd::DeleteRow(int row) { DeleteLine(true, row); }
void SSplitterWnd::DeleteColumn(int column) { DeleteLine(false, column); }

// The focus goes to the pane that takes the deleted one's place.
void SSplitterWnd::DeleteLine(bool rows, int at) {
  if (at < 0 || at >= Count(rows) || Count(rows) == 1) return;
  int row = -1, column = -1;
  GetActivePane(&row, &column);
  const bool hadFocus = (rows ? row : column) == at;
  EndUse();
  const HWND window = m_hWnd;
  RemoveLine(rows, at);
  if (FromHandlePermanent(window) != this) return;
  RecalcLayout();
  if (hadFocus && FromHandlePermanent(window) == this)
    SetActivePane(std::min(row, m_rowCount - 1), std::min(column, m_columnCount - 1));
}

// A pane that is destroyed may end the splitter.
void SSplitterWnd::RemoveLine(bool rows, int at) {
  const HWND window = m_hWnd;
  for (int across = 0; across < Count(!rows); ++across) {
    rows ? DeletePane(at, across) : DeletePane(across, at);
    if (FromHandlePermanent(window) != this) return;
  }
  if (const HWND bar = ::GetDlgItem(m_hWnd, static_cast<int>(ScrollBarId(rows, at)))) SSent(::DestroyWindow(bar));
  for (int line = at + 1; line < Count(rows); ++line) RenumberLine(rows, line, line - 1);
  --(rows ? m_rowCount : m_columnCount);
  Table(rows).Remove(at);
  OpenSizes(rows).Remove(at);
}

void SSplitterWnd::RenumberLine(bool rows, int from, int to) {
  const auto renumber = [this](UINT former, UINT id) {
    const HWND child = ::GetDlgItem(m_hWnd, static_cast<int>(former));
    if (child != nullptr) ::SetWindowLongPtrW(child, GWLP_ID, static_cast<LONG_PTR>(id));
  };
  for (int across = 0; across < kSMaxPanes; ++across) renumber(PaneId(rows, from, across), PaneId(rows, to, across));
  renumber(ScrollBarId(rows, from), ScrollBarId(rows, to));
}

// At the end; without change when a pane cannot be made.
bool SSplitterWnd::GrowTo(bool rows, int count) {
  const int former = Count(rows);
  if (count > former && (m_paneClass == nullptr || count > (rows ? m_maxRows : m_maxColumns))) return false;
  while (Count(rows) < count) {
    if (InsertLine(rows, Count(rows))) continue;
    ShrinkTo(rows, former);
    return false;
  }
  return true;
}

void SSplitterWnd::ShrinkTo(bool rows, int count) {
  while (m_hWnd != nullptr && Count(rows) > count) RemoveLine(rows, Count(rows) - 1);
}

// --- scroll bars ---

int SSplitterWnd::CreateScrollBarCtrl(DWORD style, UINT id) {
  const HWND bar = ::CreateWindowExW(0, WTEXT("ScrollBar"), nullptr, style | WS_CHILD | WS_VISIBLE, 0, 0, 0, 0, m_hWnd,
                                     reinterpret_cast<HMENU>(static_cast<UINT_PTR>(id)), nullptr, nullptr);
  return SSent(bar) != nullptr;
}

// Makes those that are missing.
void SSplitterWnd::MakeScrollBars() {
  const auto make = [this](DWORD style, UINT id) {
    if (::GetDlgItem(m_hWnd, static_cast<int>(id)) == nullptr) CreateScrollBarCtrl(style, id);
  };
  const bool hasHorz = m_scrollStyle & WS_HSCROLL, hasVert = m_scrollStyle & WS_VSCROLL;
  for (int column = 0; hasHorz && column < m_columnCount; ++column) make(SBS_HORZ, ScrollBarId(false, column));
  for (int row = 0; hasVert && row < m_rowCount; ++row) make(SBS_VERT, ScrollBarId(true, row));
  if (hasHorz && hasVert) make(SBS_SIZEBOX | WS_DISABLED, kSSizeBoxId);
}

// Destroys those that are no longer asked for.
void SSplitterWnd::DestroyScrollBars() {
  const bool hasHorz = m_scrollStyle & WS_HSCROLL, hasVert = m_scrollStyle & WS_VSCROLL;
  const auto destroy = [this](UINT firstId, int count) {
    for (int i = 0; i < count; ++i) {
      const HWND bar = ::GetDlgItem(m_hWnd, static_cast<int>(firstId) + i);
      if (bar != nullptr) SSent(::DestroyWindow(bar));
    }
  };
  if (!hasHorz) destroy(kSHorzScrollBarId, kSMaxPanes);
  if (!hasVert) destroy(kSVertScrollBarId, kSMaxPanes);
  if (!hasHorz || !hasVert) destroy(kSSizeBoxId, 1);
}

void SSplitterWnd::SetScrollStyle(DWORD style) {
  m_scrollStyle = style & (WS_HSCROLL | WS_VSCROLL);
  if (m_hWnd == nullptr) return;
  DestroyScrollBars();
  MakeScrollBars();
  RecalcLayout();
}
