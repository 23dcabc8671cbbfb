// Dragging bars and split boxes with the mouse.

#include "qxcore/ui/layout/internal/splitter_codes.h"
#include "qxcore/ui/window/thread_state.h"

// --- the tracker ---

// The tracker lies over the panes, so they must not be clipped while it is shown.
void SSplitterWnd::StartTracking(int code) {
  if (code == kSHitNothing || m_isTracking || m_hWnd == nullptr) return;
  GetHitRect(code, &m_tracker);
  m_trackedFrom = m_tracker;
  m_trackedCode = code;
  m_isTracking = 1;
  SetCapture();
  ModifyStyle(WS_CLIPCHILDREN, 0);
  OnInvertTracker(m_tracker);
  SetSplitCursor(code);
}

void SSplitterWnd::StopTracking(int accept) {
  if (!m_isTracking) return;
  OnInvertTracker(m_tracker);
  ModifyStyle(0, WS_CLIPCHILDREN);
  m_isTracking = 0;
  const int code = std::exchange(m_trackedCode, 0);
  const HWND window = m_hWnd;
  if (::GetCapture() == window) SSent(::ReleaseCapture());
  if (!accept || m_tracker == m_trackedFrom || FromHandlePermanent(window) != this) return;

  SRect inside;
  GetInsideRect(&inside);
  const SPoint moved = m_tracker.TopLeft();
  if (code == kSHitVertSplitBox) {
    SplitRow(moved.y + TrackerThickness(true) / 2 - inside.top);
  } else if (code == kSHitHorzSplitBox) {
    SplitColumn(moved.x + TrackerThickness(false) / 2 - inside.left);
  } else if (code >= kSHitColumnBar) {
    TrackColumnSize(moved.x, code - kSHitColumnBar);
  } else {
    TrackRowSize(moved.y, code - kSHitRowBar);
  }
}

void SSplitterWnd::MoveTracker(SPoint topLeft) {
  SPoint corner = m_tracker.TopLeft();
  if (SIsOfRows(m_trackedCode)) {
    corner.y = std::clamp<int>(topLeft.y, m_limit.top, std::max(m_limit.top, m_limit.bottom));
  } else {
    corner.x = std::clamp<int>(topLeft.x, m_limit.left, std::max(m_limit.left, m_limit.right));
  }
  if (corner == m_tracker.TopLeft()) return;
  OnInvertTracker(m_tracker);
  m_tracker.MoveTo(corner);
  OnInvertTracker(m_tracker);
}

// --- what a drag comes to ---

void SSplitterWnd::TrackRowSize(int y, int row) {
  SRect inside;
  GetInsideRect(&inside);
  TrackSize(true, row, y, inside.top, inside.bottom);
}

void SSplitterWnd::TrackColumnSize(int x, int column) {
  SRect inside;
  GetInsideRect(&inside);
  TrackSize(false, column, x, inside.left, inside.right);
}

// A tracker cannot leave the panes, so at their begin it stands for a bar that lies there, and at the end for one that
// leaves no room behind it; so do all places beyond.
void SSplitterWnd::TrackSize(bool rows, int bar, int place, int begin, int end) {
  if (bar < 0 || bar >= Count(rows) - 1) return;
  const int half = TrackerThickness(rows) / 2;
  const int start = begin + SPaneStart(std::as_const(Table(rows)).GetArray(), bar, Gap(rows));
  MoveBarTo(rows, bar, (place <= begin ? begin : std::min(place, end) + half) - start);
}

// In a dynamic splitter a pane that would be below its minimum goes.
void SSplitterWnd::MoveBarTo(bool rows, int bar, int size) {
  SPaneInfo* panes = Table(rows).GetArray();
  const int behind = panes[bar].m_current + panes[bar + 1].m_current - size;
  const bool isGone = size < std::max(panes[bar].m_min, 1);
  const bool isNextGone = bar + 2 == Count(rows) && behind < std::max(panes[bar + 1].m_min, 1);
  if (m_paneClass != nullptr && (isGone || isNextGone)) {
    const int gone = isGone ? bar : bar + 1;
    rows ? DeleteRow(gone) : DeleteColumn(gone);
    return;
  }
  OpenSizes(rows)[bar] = isGone ? panes[bar].m_current : 0;
  SMoveBar(panes, Count(rows), bar, size, m_keepRatio);
  RecalcLayout();
}

// --- mouse ---

void SSplitterWnd::OnLButtonDown(UINT, SPoint point) {
  if (m_isTracking) return;
  StartTracking(HitTest(point));
  m_grab = SPoint(point.x - m_tracker.left, point.y - m_tracker.top);
}

void SSplitterWnd::OnMouseMove(UINT, SPoint point) {
  if (!m_isTracking) {
    Default();
  } else if (GetCapture() != this) {
    StopTracking(0);
  } else {
    MoveTracker(SPoint(point.x - m_grab.x, point.y - m_grab.y));
  }
}

void SSplitterWnd::OnLButtonUp(UINT, SPoint) { StopTracking(1); }

void SSplitterWnd::OnLButtonDblClk(UINT, SPoint point) {
  const int code = HitTest(point);
  StopTracking(0);
  if (code == kSHitNothing) return;
  if (SIsSplitBox(code)) {
    OpenBar(code);
  } else if (m_paneClass == nullptr) {
    ToggleBar(code);
  } else if (code >= kSHitColumnBar) {
    DeleteColumn(code - kSHitColumnBar);
  } else {
    DeleteRow(code - kSHitRowBar);
  }
}

void SSplitterWnd::OnCancelMode() {
  StopTracking(0);
  SWnd::OnCancelMode();
}

void SSplitterWnd::OnCaptureChanged(SWnd*) { StopTracking(0); }

// --- cursors ---

int SSplitterWnd::OnSetCursor(SWnd* window, UINT hit, UINT) {
  if (window != this || hit != HTCLIENT || m_isTracking) return static_cast<int>(Default());
  POINT point = {};
  ::GetCursorPos(&point);
  ScreenToClient(&point);
  SetSplitCursor(HitTest(point));
  return 1;
}

void SSplitterWnd::SetSplitCursor(int code) {
  const LPCWSTR name = code == kSHitNothing ? IDC_ARROW : SIsOfRows(code) ? IDC_SIZENS : IDC_SIZEWE;
  ::SetCursor(::LoadCursorW(nullptr, name));
}
