// The keyboard: from pane to pane, and on the bars.

#include "qxcore/ui/frame/frame.h"
#include "qxcore/ui/frame/view.h"
#include "qxcore/ui/layout/internal/pane_focus.h"
#include "qxcore/ui/layout/internal/splitter_codes.h"
#include "qxcore/ui/window/thread_state.h"

static bool IsDown(int key) { return ::GetKeyState(key) < 0; }

// --- panes ---

SWnd* SSplitterWnd::GetActivePane(int* row, int* column) {
  const SFrameWnd* frame = GetParentFrame();
  SWnd* view = frame != nullptr ? static_cast<SWnd*>(frame->GetActiveView()) : nullptr;
  if (view != nullptr && IsChildPane(view, row, column)) return view;
  for (HWND window = ::GetFocus(); window != nullptr; window = ::GetParent(window)) {
    SWnd* object = FromHandle(window);
    if (IsChildPane(object, row, column)) return object;
  }
  return nullptr;
}

// A view that is its frame's active one already takes the focus only when it is asked to.
void SSplitterWnd::SetActivePane(int row, int column, SWnd* window) {
  SWnd* target = window != nullptr ? window : GetPane(row, column);
  if (target == nullptr) return;
  SFrameWnd* frame = GetParentFrame();
  SView* view = SObjectCast<SView>(target, &SView::classSView);
  if (frame != nullptr && view != nullptr) frame->SetActiveView(view);
  SPaneFocus::Enter(target, false);
}

int SSplitterWnd::CanActivateNext(int) { return m_panes.GetCount() > 1; }

void SSplitterWnd::ActivateNext(int backward) {
  int row = 0, column = 0;
  if (GetActivePane(&row, &column) == nullptr) {
    IsChildPane(FromHandle(m_lastActive), &row, &column);
  }
  const int places = m_rowCount * m_columnCount;
  int place = row * m_columnCount + column;
  for (int i = 1; i < places; ++i) {
    place = (place + (backward ? places - 1 : 1)) % places;
    SWnd* pane = GetPane(place / m_columnCount, place % m_columnCount);
    if (pane == nullptr || !pane->IsWindowEnabled()) continue;
    SetActivePane(place / m_columnCount, place % m_columnCount, nullptr);
    if (backward) SPaneFocus::Enter(pane, true);
    return;
  }
}

// At its end the way goes on in the splitter or tab window around this one, if there is one.
bool SSplitterWnd::GoToNextPane(bool backward) {
  int row = 0, column = 0;
  const bool isInPane = GetActivePane(&row, &column) != nullptr;
  const int last = backward ? 0 : m_rowCount * m_columnCount - 1;
  const bool isAtEnd = isInPane && row * m_columnCount + column == last;
  if (!CanActivateNext(backward) || (isAtEnd && SPaneFocus::HasOuterStop(this))) return false;
  ActivateNext(backward);
  return true;
}

int SSplitterWnd::PreTranslateMessage(MSG* message) {
  if (message->message != WM_KEYDOWN || IsDown(VK_MENU)) return 0;
  if (m_isTracking && message->wParam == VK_ESCAPE) return StopTracking(0), 1;
  if (message->wParam == VK_F8 && !IsDown(VK_CONTROL)) return DoKeyboardSplit();
  if (message->wParam != VK_F6 || IsDown(VK_CONTROL)) return 0;
  if (m_keyboardBar != 0) return OnBarKey(VK_F6);
  return GoToNextPane(IsDown(VK_SHIFT));
}

// --- the bars ---

bool SSplitterWnd::HasBar(int code) const {
  if (code == kSHitVertSplitBox) return CanGrow(true) && (m_scrollStyle & WS_VSCROLL);
  if (code == kSHitHorzSplitBox) return CanGrow(false) && (m_scrollStyle & WS_HSCROLL);
  const bool rows = SIsOfRows(code);
  const int bar = SBarNumber(code);
  return code >= kSHitRowBar && bar + 1 < Count(rows) && (Table(rows)[bar].m_flags & SPaneInfo::kFixed) == 0;
}

// In the order of the codes, round and round; 0 when there is none.
int SSplitterWnd::NextBar(int code) const {
  constexpr int kEnd = kSHitColumnBar + kSMaxPanes;
  for (int i = 1; i <= kEnd; ++i) {
    const int next = (code + i) % kEnd;
    if (next != 0 && HasBar(next)) return next;
  }
  return 0;
}

int SSplitterWnd::DoKeyboardSplit() {
  const int next = m_hWnd != nullptr ? NextBar(m_keyboardBar) : 0;
  if (next == 0) return 0;
  EnterBar(next);
  return 1;
}

void SSplitterWnd::EnterBar(int code) {
  const int former = std::exchange(m_keyboardBar, code);
  if (former == 0) {
    if (const SWnd* pane = GetActivePane()) m_lastActive = pane->m_hWnd;
    m_rowsBefore = m_rows;
    m_columnsBefore = m_columns;
    SetFocus();
  }
  InvalidateBar(former);
  InvalidateBar(code);
}

void SSplitterWnd::LeaveBars() { InvalidateBar(std::exchange(m_keyboardBar, 0)); }

// Before rows and columns come or go: what the user moves may be another one then.
void SSplitterWnd::EndUse() {
  StopTracking(0);
  LeaveBars();
}

void SSplitterWnd::CancelBars() {
  if (m_rowsBefore.GetCount() == m_rowCount) m_rows = m_rowsBefore;
  if (m_columnsBefore.GetCount() == m_columnCount) m_columns = m_columnsBefore;
  RecalcLayout();
}

void SSplitterWnd::OnSetFocus(SWnd* oldFocus) {
  if (m_keyboardBar != 0) {
    SWnd::OnSetFocus(oldFocus);
    return;
  }
  int row = 0, column = 0;
  if (m_lastActive != nullptr) IsChildPane(FromHandle(m_lastActive), &row, &column);
  SetActivePane(row, column);
}

void SSplitterWnd::OnKillFocus(SWnd* newFocus) {
  LeaveBars();
  SWnd::OnKillFocus(newFocus);
}

void SSplitterWnd::OnKeyDown(UINT key, UINT, UINT) {
  if (m_isTracking && key == VK_ESCAPE) {
    StopTracking(0);
  } else if (m_keyboardBar == 0 || !OnBarKey(key)) {
    Default();
  }
}

// Returns false for a key that means nothing on a bar.
bool SSplitterWnd::OnBarKey(UINT key) {
  const int code = m_keyboardBar;
  const HWND window = m_hWnd;
  switch (key) {
    case VK_F8:
      DoKeyboardSplit();
      return true;
    case VK_RETURN:
      OpenBar(code);
      return true;
    case VK_ESCAPE:
      CancelBars();
      if (FromHandlePermanent(window) != this) return true;
      [[fallthrough]];
    case VK_TAB:
    case VK_F6:
      LeaveBars();
      OnSetFocus(nullptr);  // passes it on to the pane that had it
      return true;
    case VK_LEFT:
    case VK_RIGHT:
    case VK_UP:
    case VK_DOWN:
    case VK_HOME:
    case VK_END:
      StepBar(code, key);
      return true;
    default:
      return false;
  }
}

// A split box splits the first row or column in its middle; then the new bar has the keyboard.
void SSplitterWnd::OpenBar(int code) {
  if (code >= kSHitRowBar) {
    ToggleBar(code);
    return;
  }
  const bool rows = SIsOfRows(code);
  const HWND window = m_hWnd;
  const int middle = (Table(rows)[0].m_current - Gap(rows)) / 2;
  const bool isDone = rows ? SplitRow(middle) : SplitColumn(middle);
  if (!isDone || FromHandlePermanent(window) != this) return;
  if (m_keyboardBar == code) EnterBar(rows ? kSHitRowBar : kSHitColumnBar);
}

int SSplitterWnd::ToggleBar(int code) {
  if (code < kSHitRowBar || !HasBar(code)) return 0;
  const bool rows = SIsOfRows(code);
  const int bar = SBarNumber(code);
  SPaneInfo* panes = Table(rows).GetArray();
  int& open = OpenSizes(rows)[bar];
  int size = 0;
  if (panes[bar].m_current == 0) {
    const int half = (panes[bar].m_current + panes[bar + 1].m_current) / 2;
    size = std::max(open > 0 ? open : half, panes[bar].m_min);
    open = 0;
  } else {
    open = panes[bar].m_current;
  }
  SMoveBar(panes, Count(rows), bar, size, m_keepRatio);
  RecalcLayout();
  return 1;
}

// Both neighbours keep their minima.
void SSplitterWnd::StepBar(int code, UINT key) {
  const bool rows = SIsOfRows(code);
  const bool isAlong = key == VK_HOME || key == VK_END || rows == (key == VK_UP || key == VK_DOWN);
  if (code < kSHitRowBar || !isAlong) return;
  const int bar = SBarNumber(code);
  SPaneInfo* panes = Table(rows).GetArray();
  const int step = IsDown(VK_CONTROL) ? 1 : ::MulDiv(8, m_dpi, 96);
  const int low = panes[bar].m_min;
  const int high = panes[bar].m_current + panes[bar + 1].m_current - panes[bar + 1].m_min;
  int size = panes[bar].m_current;
  if (key == VK_HOME) size = low;
  if (key == VK_END) size = high;
  if (key == VK_LEFT || key == VK_UP) size -= step;
  if (key == VK_RIGHT || key == VK_DOWN) size += step;
  size = std::clamp(size, std::min(low, high), high);
  OpenSizes(rows)[bar] = 0;
  SMoveBar(panes, Count(rows), bar, size, m_keepRatio);
  RecalcLayout();
}
