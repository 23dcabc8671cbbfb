// Where everything lies.

#include "qxcore/ui/app/internal/scaled_pixels.h"
#include "qxcore/ui/layout/internal/deferred_moves.h"
#include "qxcore/ui/layout/internal/size_box.h"
#include "qxcore/ui/layout/internal/splitter_codes.h"

int SSplitterWnd::Metric(int index) const { return ::GetSystemMetricsForDpi(index, static_cast<UINT>(m_dpi)); }

void SSplitterWnd::GetInsideRect(SRect* rect) const {
  *rect = GetClientRect();
  rect->Deflate(m_borderX, m_borderY);
  if (m_scrollStyle & WS_VSCROLL) rect->right -= Metric(SM_CXVSCROLL);
  if (m_scrollStyle & WS_HSCROLL) rect->bottom -= Metric(SM_CYHSCROLL);
  rect->right = std::max(rect->left, rect->right);
  rect->bottom = std::max(rect->top, rect->bottom);
}

// --- layout ---

// Where the columns and the rows begin.
struct SSplitterWnd::Grid {
  SRect inside;
  int left[kSMaxPanes], top[kSMaxPanes];
};

// A pane that is sized may end the splitter.
void SSplitterWnd::RecalcLayout() {
  if (m_hWnd == nullptr || m_rowCount == 0) return;
  const HWND window = m_hWnd;
  SRect inside;
  GetInsideRect(&inside);
  SSizePanes(m_columns.GetArray(), m_columnCount, inside.Width(), m_gapX, m_keepRatio);
  SSizePanes(m_rows.GetArray(), m_rowCount, inside.Height(), m_gapY, m_keepRatio);

  const Grid grid = LaidOut();
  SDeferredMoves moves((m_columnCount + 1) * (m_rowCount + 1) + 1);
  if (m_scrollStyle != 0) MoveChildren(moves, kSHorzScrollBarId, kSSizeBoxId, grid);
  MoveChildren(moves, kSPaneId, kSHorzScrollBarId - 1, grid);
  moves.End();
  if (FromHandlePermanent(window) == this) InvalidateRect(nullptr, 0);
}

SSplitterWnd::Grid SSplitterWnd::LaidOut() const {
  Grid grid;
  GetInsideRect(&grid.inside);
  for (int i = 0; i < m_columnCount; ++i) {
    grid.left[i] = grid.inside.left + SPaneStart(m_columns.GetArray(), i, m_gapX);
  }
  for (int i = 0; i < m_rowCount; ++i) grid.top[i] = grid.inside.top + SPaneStart(m_rows.GetArray(), i, m_gapY);
  return grid;
}

void SSplitterWnd::MoveChildren(SDeferredMoves& moves, UINT firstId, UINT lastId, const Grid& grid) {
  for (HWND child = ::GetWindow(m_hWnd, GW_CHILD); child != nullptr; child = ::GetWindow(child, GW_HWNDNEXT)) {
    const UINT id = static_cast<UINT>(::GetDlgCtrlID(child));
    if (id < firstId || id > lastId) continue;
    if (id == kSSizeBoxId) SUpdateSizeBox(child, m_hWnd);
    moves.Move(child, ChildRect(id, grid));
  }
}

// Children outside of the grid get an empty rectangle.
SRect SSplitterWnd::ChildRect(UINT id, const Grid& grid) const {
  if (id == kSSizeBoxId) {
    return SRect(grid.inside.BottomRight(), SSize(Metric(SM_CXVSCROLL), Metric(SM_CYHSCROLL)));
  }
  if (id >= kSVertScrollBarId) return ScrollBarRect(true, static_cast<int>(id - kSVertScrollBarId), grid);
  if (id >= kSHorzScrollBarId) return ScrollBarRect(false, static_cast<int>(id - kSHorzScrollBarId), grid);
  const int place = static_cast<int>(id - kSPaneId);
  return PaneRect(place / kSMaxPanes, place % kSMaxPanes, grid);
}

SRect SSplitterWnd::PaneRect(int row, int column, const Grid& grid) const {
  if (!IsPlace(row, column)) return SRect();
  const SPoint corner(grid.left[column], grid.top[row]);
  SRect rect(corner, SSize(m_columns[column].m_current, m_rows[row].m_current));
  if (!rect.IsEmpty()) rect.Inflate(m_borderShareX, m_borderShareY);
  return rect;
}

// The upright bar of a row, or the lying one of a column; the first leaves room for the split box.
SRect SSplitterWnd::ScrollBarRect(bool rows, int at, const Grid& grid) const {
  if (at >= Count(rows)) return SRect();
  const int room = at == 0 && CanGrow(rows) ? Thickness(rows) : 0;
  const int length = std::max(Table(rows)[at].m_current - room, 0);
  if (rows) return SRect(SPoint(grid.inside.right, grid.top[at] + room), SSize(Metric(SM_CXVSCROLL), length));
  return SRect(SPoint(grid.left[at] + room, grid.inside.bottom), SSize(length, Metric(SM_CYHSCROLL)));
}

// --- bars and boxes ---

// A strip across the panes.
static SRect Across(bool rows, const SRect& inside, int at, int thickness) {
  return rows ? SRect(inside.left, at, inside.right, at + thickness)
              : SRect(at, inside.top, at + thickness, inside.bottom);
}

SRect SSplitterWnd::BoxRect(int code, const SRect& inside) const {
  if (code == kSHitVertSplitBox) return SRect(inside.TopRight(), SSize(Metric(SM_CXVSCROLL), m_barHeight));
  return SRect(inside.BottomLeft(), SSize(m_barWidth, Metric(SM_CYHSCROLL)));
}

SRect SSplitterWnd::BarRect(int code, const SRect& inside) const {
  const bool rows = SIsOfRows(code);
  const int bar = SBarNumber(code);
  const SPaneInfo* panes = Table(rows).GetArray();
  const int start = SPaneStart(panes, bar, Gap(rows)) + panes[bar].m_current;
  return Across(rows, inside, (rows ? inside.top : inside.left) + start, Gap(rows));
}

// The last pixel of a split box belongs to the scroll bar behind it.
int SSplitterWnd::HitTest(SPoint point) const {
  SRect inside;
  GetInsideRect(&inside);
  SRect box = BoxRect(kSHitVertSplitBox, inside);
  box.bottom -= 1;
  if (CanGrow(true) && (m_scrollStyle & WS_VSCROLL) && box.Contains(point)) return kSHitVertSplitBox;
  box = BoxRect(kSHitHorzSplitBox, inside);
  box.right -= 1;
  if (CanGrow(false) && (m_scrollStyle & WS_HSCROLL) && box.Contains(point)) return kSHitHorzSplitBox;

  if (!inside.Contains(point)) return kSHitNothing;
  const int column = SBarAt(m_columns.GetArray(), m_columnCount, m_gapX, point.x - inside.left);
  if (column >= 0) return kSHitColumnBar + column;
  const int row = SBarAt(m_rows.GetArray(), m_rowCount, m_gapY, point.y - inside.top);
  return row >= 0 ? kSHitRowBar + row : kSHitNothing;
}

int SSplitterWnd::TrackerThickness(bool rows) const { return std::max(Thickness(rows) - 2 * Border(rows) + 1, 1); }

void SSplitterWnd::GetHitRect(int code, SRect* rect) {
  SRect inside;
  GetInsideRect(&inside);
  const bool rows = SIsOfRows(code);
  const int thickness = TrackerThickness(rows);
  SRect bar = inside;
  if (code >= kSHitRowBar) bar = BarRect(code, inside);
  *rect = Across(rows, inside, (rows ? bar.top : bar.left) - thickness / 2, thickness);
  m_limit = inside;
  (rows ? m_limit.bottom : m_limit.right) -= thickness;
}

void SSplitterWnd::InvalidateBar(int code) {
  if (!HasBar(code) || m_hWnd == nullptr) return;
  SRect inside;
  GetInsideRect(&inside);
  OnDrawSplitter(nullptr, kSplitBar, code >= kSHitRowBar ? BarRect(code, inside) : BoxRect(code, inside));
}

// --- what changes the layout: a drag would end at a place of the former one ---

void SSplitterWnd::OnSize(UINT type, int, int) {
  StopTracking(0);
  if (type != SIZE_MINIMIZED) RecalcLayout();
}

void SSplitterWnd::OnDisplayChange(UINT, int, int) {
  Default();
  RecalcLayout();
}

LRESULT SSplitterWnd::OnDpiChanged(WPARAM wParam, LPARAM) {
  StopTracking(0);
  ScaleTo(LOWORD(wParam));
  RecalcLayout();
  return 0;
}

// Shares are no pixels.
static void Scale(STableDumb<SPaneInfo>& table, int dpi, int former, bool scaleIdeals) {
  for (SPaneInfo& info : table) {
    info.m_min = SScaledPixels(info.m_min, dpi, former);
    if (scaleIdeals) info.m_ideal = SScaledPixels(info.m_ideal, dpi, former);
  }
}

void SSplitterWnd::ScaleTo(int dpi) {
  const int former = m_dpi;
  if (dpi <= 0 || dpi == former) return;
  for (int* size :
       {&m_barWidth, &m_barHeight, &m_borderShareX, &m_borderShareY, &m_gapX, &m_gapY, &m_borderX, &m_borderY}) {
    *size = SScaledPixels(*size, dpi, former);
  }
  for (STableDumb<SPaneInfo>* table : {&m_rows, &m_columns, &m_rowsBefore, &m_columnsBefore}) {
    Scale(*table, dpi, former, !m_keepRatio);
  }
  for (STableDumb<int>* sizes : {&m_openRows, &m_openColumns}) {
    for (int& size : *sizes) size = SScaledPixels(size, dpi, former);
  }
  m_dpi = dpi;
}
