#include "tools/qxworkbench/line_view.h"

#include <algorithm>

#include "qxcore/graphics/window_dc.h"
#include "qxcore/ui/window/message_entries.h"

QXCORE_IMPLEMENT_MESSAGE_MAP(LineView, SView, on<WM_CREATE, &LineView::OnCreate>(),
                             on<WM_ERASEBKGND, &LineView::OnEraseBkgnd>(), on<WM_SIZE, &LineView::OnSize>(),
                             on<WM_VSCROLL, &LineView::OnVScroll>(), on<WM_HSCROLL, &LineView::OnHScroll>(),
                             on<WM_MOUSEWHEEL, &LineView::OnMouseWheel>(), on<WM_KEYDOWN, &LineView::OnKeyDown>(),
                             on<WM_SETFOCUS, &LineView::OnSetFocus>(), on<WM_KILLFOCUS, &LineView::OnKillFocus>(),
                             on<WM_SYSCOLORCHANGE, &LineView::OnSysColorChange>(),
                             on<WM_SETTINGCHANGE, &LineView::OnSettingChange>(),
                             on<WM_DPICHANGED, &LineView::OnDpiChanged>())

// --- font and size ---

int LineView::OnCreate(CREATESTRUCTW* create) {
  if (SView::OnCreate(create) == -1) return -1;
  m_dpi = static_cast<int>(::GetDpiForWindow(m_hWnd));
  ReadFont();
  return 0;
}

void LineView::ReadFont() {
  m_font = MakeFont(m_dpi);
  SClientDC dc(m_hWnd);
  const SSelectObject font(dc, m_font);
  TEXTMETRICW metrics = {};
  dc.GetTextMetricsW(&metrics);
  m_rowHeight = std::max(1, static_cast<int>(metrics.tmHeight) + Scaled(2));
  m_characterWidth = std::max(1, static_cast<int>(metrics.tmAveCharWidth));
}

SRect LineView::RowsRect() const {
  SRect rect = GetClientRect();
  rect.top = std::min(rect.bottom, rect.top + HeadHeight());
  return rect;
}

int LineView::PageRows() const { return std::max(1, RowsRect().Height() / m_rowHeight); }

int LineView::RowAt(SPoint point) const {
  const SRect rows = RowsRect();
  if (point.y < rows.top || point.y >= rows.bottom) return -1;
  const int row = m_first + (point.y - rows.top) / m_rowHeight;
  return row < RowCount() ? row : -1;
}

void LineView::InvalidateRow(int row) {
  SRect rect = RowsRect();
  rect.top += (row - m_first) * m_rowHeight;
  rect.bottom = rect.top + m_rowHeight;
  if (row >= m_first && rect.top < RowsRect().bottom) InvalidateRect(&rect, 0);
}

// --- painting ---

void LineView::OnDraw(SDC* dc) {
  const SRect clip = dc->GetClipBox();
  const SSelectObject font(*dc, m_font);
  SRect rect = GetClientRect();
  rect.bottom = rect.top + HeadHeight();
  if (clip.top < rect.bottom) DrawHead(dc, rect);
  int row = m_first;
  const SRect rows = RowsRect();
  for (int top = rows.top; top < std::min(rows.bottom, clip.bottom) && row < RowCount(); top += m_rowHeight, ++row) {
    if (top + m_rowHeight > clip.top) DrawRow(dc, row, SRect(rows.left, top, rows.right, top + m_rowHeight));
  }
  rect = rows;
  rect.top += (row - m_first) * m_rowHeight;
  if (rect.top < rect.bottom) dc->FillSolidRect(rect, ::GetSysColor(COLOR_WINDOW));
}

// --- scrolling ---

void LineView::RowsChanged() {
  const auto set = [this](int bar, SCROLLINFO& former, int last, int page, int position) {
    SCROLLINFO info = {};
    info.cbSize = sizeof info;
    info.fMask = SIF_ALL | SIF_DISABLENOSCROLL;
    info.nMax = std::max(0, last);
    info.nPage = static_cast<UINT>(page);
    info.nPos = position;
    const bool isSame =
        former.cbSize != 0 && former.nMax == info.nMax && former.nPage == info.nPage && former.nPos == info.nPos;
    former = info;
    if (!isSame) SetScrollInfo(bar, &info);
  };
  m_first = std::clamp(m_first, 0, std::max(0, RowCount() - PageRows()));
  if (!HasScrollBars()) return;
  set(SB_VERT, m_vertical, RowCount() - 1, PageRows(), m_first);
  if (ContentWidth() == 0) return;
  const int width = RowsRect().Width();
  m_left = std::clamp(m_left, 0, std::max(0, ContentWidth() - width));
  set(SB_HORZ, m_horizontal, ContentWidth() - 1, width, m_left);
}

void LineView::SetScrollBarsAnew() {
  m_vertical = m_horizontal = {};
  RowsChanged();
}

void LineView::ScrollTo(int firstRow) {
  const int first = std::clamp(firstRow, 0, std::max(0, RowCount() - PageRows()));
  if (first == m_first) return;
  m_first = first;
  RowsChanged();
  Invalidate(0);
}

void LineView::SetLeft(int left) {
  const int bounded = std::clamp(left, 0, std::max(0, ContentWidth() - RowsRect().Width()));
  if (bounded == m_left) return;
  m_left = bounded;
  RowsChanged();
  Invalidate(0);
}

void LineView::ShowRow(int row) {
  if (row < m_first) ScrollTo(row);
  if (row >= m_first + PageRows()) ScrollTo(row - PageRows() + 1);
}

// Where a scroll bar's message leads.
static int Scrolled(const SWnd& window, int bar, UINT code, int position, int line, int page, int last) {
  SCROLLINFO info = {};
  switch (code) {
    case SB_LINEUP:
      return position - line;
    case SB_LINEDOWN:
      return position + line;
    case SB_PAGEUP:
      return position - page;
    case SB_PAGEDOWN:
      return position + page;
    case SB_TOP:
      return 0;
    case SB_BOTTOM:
      return last;
    case SB_THUMBTRACK:
    case SB_THUMBPOSITION:
      // The message carries 16 bits only.
      return window.GetScrollInfo(bar, &info, SIF_TRACKPOS) ? info.nTrackPos : position;
    default:
      return position;
  }
}

void LineView::OnVScroll(UINT code, UINT, SScrollBar*) {
  ScrollTo(Scrolled(*this, SB_VERT, code, m_first, 1, PageRows(), RowCount()));
}

void LineView::OnHScroll(UINT code, UINT, SScrollBar*) {
  SetLeft(Scrolled(*this, SB_HORZ, code, m_left, m_characterWidth, RowsRect().Width() / 2, ContentWidth()));
}

int LineView::OnMouseWheel(UINT, short turn, SPoint) {
  UINT lines = 3;
  ::SystemParametersInfoW(SPI_GETWHEELSCROLLLINES, 0, &lines, 0);
  if (lines > static_cast<UINT>(PageRows())) lines = static_cast<UINT>(PageRows());
  m_wheel += turn * static_cast<int>(lines);
  ScrollTo(m_first - m_wheel / WHEEL_DELTA);
  m_wheel %= WHEEL_DELTA;
  return 1;
}

void LineView::OnKeyDown(UINT key, UINT, UINT) {
  switch (key) {
    case VK_UP:
      return ScrollTo(m_first - 1);
    case VK_DOWN:
      return ScrollTo(m_first + 1);
    case VK_PRIOR:
      return ScrollTo(m_first - PageRows());
    case VK_NEXT:
      return ScrollTo(m_first + PageRows());
    case VK_HOME:
      SetLeft(0);
      return ScrollTo(0);
    case VK_END:
      return ScrollTo(RowCount());
    case VK_LEFT:
      return SetLeft(m_left - 4 * m_characterWidth);
    case VK_RIGHT:
      return SetLeft(m_left + 4 * m_characterWidth);
    default:
      Default();
  }
}

// --- changes from outside ---

void LineView::OnSize(UINT, int, int) {
  Default();
  RowsChanged();
}

void LineView::OnSetFocus(SWnd* oldFocus) {
  SView::OnSetFocus(oldFocus);
  Invalidate(0);
}

void LineView::OnKillFocus(SWnd* newFocus) {
  SView::OnKillFocus(newFocus);
  Invalidate(0);
}

void LineView::OnSysColorChange() {
  SView::OnSysColorChange();
  Invalidate(0);
}

void LineView::OnSettingChange(UINT what, LPCWSTR area) {
  SView::OnSettingChange(what, area);
  ReadFont();
  RowsChanged();
  Invalidate(0);
}

LRESULT LineView::OnDpiChanged(WPARAM wParam, LPARAM lParam) {
  const LRESULT result = SView::OnDpiChanged(wParam, lParam);
  m_dpi = LOWORD(wParam);
  ReadFont();
  RowsChanged();
  Invalidate(0);
  return result;
}
