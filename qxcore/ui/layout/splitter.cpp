// Creation, panes, sizes and what goes on to the parent.

#include "qxcore/ui/layout/splitter.h"

#include "qxcore/ui/frame/frame.h"
#include "qxcore/ui/frame/view.h"
#include "qxcore/ui/layout/internal/adopt.h"
#include "qxcore/ui/layout/internal/size_box.h"
#include "qxcore/ui/window/internal/route_up.h"
#include "qxcore/ui/window/message_entries.h"
#include "qxcore/ui/window/thread_state.h"

QXCORE_IMPLEMENT_CREATABLE_CLASS(SSplitterWnd, SWnd, 2)

QXCORE_IMPLEMENT_MESSAGE_MAP(
    SSplitterWnd, SWnd, on<WM_NCCREATE, &SSplitterWnd::OnNcCreate>(), on<WM_DESTROY, &SSplitterWnd::OnDestroy>(),
    on<WM_SIZE, &SSplitterWnd::OnSize>(), on<WM_PAINT, &SSplitterWnd::OnPaint>(),
    on<WM_ERASEBKGND, &SSplitterWnd::OnEraseBkgnd>(), on<WM_LBUTTONDOWN, &SSplitterWnd::OnLButtonDown>(),
    on<WM_LBUTTONDBLCLK, &SSplitterWnd::OnLButtonDblClk>(), on<WM_LBUTTONUP, &SSplitterWnd::OnLButtonUp>(),
    on<WM_MOUSEMOVE, &SSplitterWnd::OnMouseMove>(), on<WM_MOUSEWHEEL, &SSplitterWnd::OnMouseWheel>(),
    on<WM_SETCURSOR, &SSplitterWnd::OnSetCursor>(), on<WM_KEYDOWN, &SSplitterWnd::OnKeyDown>(),
    on<WM_SETFOCUS, &SSplitterWnd::OnSetFocus>(), on<WM_KILLFOCUS, &SSplitterWnd::OnKillFocus>(),
    on<WM_CANCELMODE, &SSplitterWnd::OnCancelMode>(), on<WM_CAPTURECHANGED, &SSplitterWnd::OnCaptureChanged>(),
    on<WM_PARENTNOTIFY, &SSplitterWnd::OnParentNotify>(), on<WM_HSCROLL, &SSplitterWnd::OnHScroll>(),
    on<WM_VSCROLL, &SSplitterWnd::OnVScroll>(), on<WM_SYSCOMMAND, &SSplitterWnd::OnSysCommand>(),
    on<WM_DISPLAYCHANGE, &SSplitterWnd::OnDisplayChange>(), on<WM_SYSCOLORCHANGE, &SSplitterWnd::OnSysColorChange>(),
    on<0x02E0 /* WM_DPICHANGED */, &SSplitterWnd::OnDpiChanged>(),
    on<0x02E3 /* WM_DPICHANGED_AFTERPARENT */, &SSplitterWnd::OnDpiChangedAfterParent>(),
    on<WM_GETOBJECT, &SSplitterWnd::OnGetObject>())

SSplitterWnd::SSplitterWnd() { m_panes.GrowTo(5); }
SSplitterWnd::~SSplitterWnd() = default;

// --- creation ---

static void Prepare(STableDumb<SPaneInfo>& table, STableDumb<int>& openSizes, int count, int minimum) {
  SPaneInfo info;
  info.m_min = std::max(minimum, 0);
  table.Clear();
  openSizes.Clear();
  for (int i = 0; i < count; ++i) {
    table.Add(info);
    openSizes.Add(0);
  }
}

static bool IsLineCount(int count) { return count >= 1 && count <= kSMaxPanes; }

int SSplitterWnd::Create(SWnd* parent, int maxRows, int maxColumns, SIZE minPane, SCreateContext* context, DWORD style,
                         UINT id) {
  if (context == nullptr || context->m_viewClass == nullptr || !IsLineCount(maxRows) || !IsLineCount(maxColumns) ||
      !CreateWindowOf(parent, style, id)) {
    return 0;
  }
  m_maxRows = maxRows;
  m_maxColumns = maxColumns;
  m_paneClass = context->m_viewClass;
  m_context = *context;
  MakeGrid(1, 1, minPane);
  if (AddPane(0, 0, m_paneClass, SSize(), context) == nullptr) return DestroyWindow(), 0;
  RecalcLayout();
  return 1;
}

int SSplitterWnd::CreateStatic(SWnd* parent, int rows, int columns, DWORD style, UINT id) {
  if (!IsLineCount(rows) || !IsLineCount(columns) || !CreateWindowOf(parent, style, id)) return 0;
  m_maxRows = rows;
  m_maxColumns = columns;
  m_paneClass = nullptr;
  m_context = SCreateContext();
  MakeGrid(rows, columns, SSize());
  RecalcLayout();
  return 1;
}

// The scroll bars are windows of their own, so the splitter itself has none.
int SSplitterWnd::CreateWindowOf(SWnd* parent, DWORD style, UINT id) {
  constexpr DWORD kScroll = WS_HSCROLL | WS_VSCROLL;
  if (m_hWnd != nullptr || parent->GetSafeHwnd() == nullptr) return 0;
  m_rowCount = m_columnCount = 0;
  m_scrollStyle = style & kScroll;
  return Create(nullptr, nullptr, style & ~kScroll, parent->GetClientRect(), parent, id);
}

void SSplitterWnd::MakeGrid(int rows, int columns, SIZE minPane) {
  Prepare(m_rows, m_openRows, rows, minPane.cy);
  Prepare(m_columns, m_openColumns, columns, minPane.cx);
  m_rowCount = rows;
  m_columnCount = columns;
  MakeScrollBars();
}

int SSplitterWnd::PreCreateWindow(CREATESTRUCTW* create) {
  if (create->lpszClass == nullptr) create->lpszClass = SRegisterWindowClass(CS_DBLCLKS);
  create->style |= WS_CLIPCHILDREN;
  return SWnd::PreCreateWindow(create);
}

int SSplitterWnd::OnNcCreate(CREATESTRUCTW* create) {
  ScaleTo(static_cast<int>(::GetDpiForWindow(m_hWnd)));
  return SWnd::OnNcCreate(create);
}

void SSplitterWnd::OnDestroy() {
  StopTracking(0);
  m_keyboardBar = 0;
  m_lastActive = nullptr;
  m_panes.Clear();
  SWnd::OnDestroy();
}

// --- panes ---

bool SSplitterWnd::IsPlace(int row, int column) const {
  return row >= 0 && row < m_rowCount && column >= 0 && column < m_columnCount;
}

SWnd* SSplitterWnd::AddPane(int row, int column, SClassInfo* paneClass, SIZE size, SCreateContext* context) {
  if (m_hWnd == nullptr || !IsPlace(row, column) || paneClass == nullptr || GetPane(row, column) != nullptr) {
    return nullptr;
  }
  SObject* object = paneClass->CreateObject();
  SWnd* pane = SObjectCast<SWnd>(object, &SWnd::classSWnd);
  if (pane == nullptr) {
    delete object;
    return nullptr;
  }
  SCreateContext* from = context != nullptr ? context : &m_context;
  const SRect place(SPoint(), SSize(std::max<int>(size.cx, 0), std::max<int>(size.cy, 0)));
  if (!pane->Create(nullptr, nullptr, WS_CHILD | WS_VISIBLE, place, this, IdFromRowCol(row, column), from)) {
    return nullptr;
  }
  return EnterPane(pane, size, row, column);
}

SWnd* SSplitterWnd::AddPane(int row, int column, SWnd* window, SIZE size) {
  const HWND handle = window->GetSafeHwnd();
  if (m_hWnd == nullptr || !IsPlace(row, column) || handle == nullptr) return nullptr;
  if (SWnd* present = GetPane(row, column); present != nullptr && present != window) return nullptr;
  ForgetPane(handle);
  SAdopt(window, this);
  window->SetDlgCtrlID(static_cast<int>(IdFromRowCol(row, column)));
  window->ShowWindow(SW_SHOWNA);
  return EnterPane(window, size, row, column);
}

// The first view that there is becomes its frame's active one; the last pane of the grid completes the layout.
SWnd* SSplitterWnd::EnterPane(SWnd* pane, SIZE size, int row, int column) {
  if (size.cy >= 0) m_rows[row].m_ideal = size.cy;
  if (size.cx >= 0) m_columns[column].m_ideal = size.cx;
  m_panes.Add(pane->m_hWnd);
  SFrameWnd* frame = GetParentFrame();
  SView* view = SObjectCast<SView>(pane, &SView::classSView);
  if (frame != nullptr && view != nullptr && frame->GetActiveView() == nullptr) frame->SetActiveView(view, 0);
  if (m_panes.GetCount() == m_rowCount * m_columnCount) RecalcLayout();
  return pane;
}

SWnd* SSplitterWnd::GetPane(int row, int column) const {
  return IsPlace(row, column) ? GetDlgItem(static_cast<int>(IdFromRowCol(row, column))) : nullptr;
}

int SSplitterWnd::IsChildPane(const SWnd* window, int* row, int* column) const {
  const HWND handle = window->GetSafeHwnd();
  if (handle == nullptr || ::GetParent(handle) != m_hWnd) return 0;
  const int place = ::GetDlgCtrlID(handle) - static_cast<int>(kSPaneId);
  if (place < 0 || !IsPlace(place / kSMaxPanes, place % kSMaxPanes)) return 0;
  if (row != nullptr) *row = place / kSMaxPanes;
  if (column != nullptr) *column = place % kSMaxPanes;
  return 1;
}

void SSplitterWnd::RemovePane(int row, int column) {
  SWnd* pane = GetPane(row, column);
  if (pane == nullptr) return;
  ForgetPane(pane->m_hWnd);
  pane->SetDlgCtrlID(0);
  pane->ShowWindow(SW_HIDE);
}

void SSplitterWnd::DeletePane(int row, int column) {
  SWnd* pane = GetPane(row, column);
  if (pane == nullptr) return;
  const HWND handle = pane->m_hWnd;
  RemovePane(row, column);
  SSent(::DestroyWindow(handle));
}

void SSplitterWnd::ForgetPane(HWND pane) {
  if (m_lastActive == pane) m_lastActive = nullptr;
  for (int i = m_panes.GetCount(); i-- > 0;) {
    if (std::as_const(m_panes)[i] == pane) m_panes.Remove(i);
  }
}

// A pane that destroys itself leaves its place empty.
void SSplitterWnd::OnParentNotify(UINT message, LPARAM lParam) {
  if (LOWORD(message) == WM_DESTROY) ForgetPane(reinterpret_cast<HWND>(lParam));
  SWnd::OnParentNotify(message, lParam);
}

// --- sizes ---

void SSplitterWnd::SetRowInfo(int row, int ideal, int minimum, int fixed) {
  if (row >= 0 && row < m_rowCount) m_rows[row].Set(ideal, minimum, fixed);
}

void SSplitterWnd::SetColumnInfo(int column, int ideal, int minimum, int fixed) {
  if (column >= 0 && column < m_columnCount) m_columns[column].Set(ideal, minimum, fixed);
}

static void Report(const SPaneInfo& info, int* current, int* minimum, int* fixed) {
  if (current != nullptr) *current = info.m_current;
  if (minimum != nullptr) *minimum = info.m_min;
  if (fixed != nullptr) *fixed = (info.m_flags & SPaneInfo::kFixed) != 0;
}

void SSplitterWnd::GetRowInfo(int row, int* current, int* minimum, int* fixed) const {
  Report(row >= 0 && row < m_rowCount ? m_rows[row] : SPaneInfo(), current, minimum, fixed);
}

void SSplitterWnd::GetColumnInfo(int column, int* current, int* minimum, int* fixed) const {
  Report(column >= 0 && column < m_columnCount ? m_columns[column] : SPaneInfo(), current, minimum, fixed);
}

// --- what goes on to the parent ---

int SSplitterWnd::OnCmdMsg(UINT id, int code, void* extra, S_CMDHANDLERINFO* info) {
  return SWnd::OnCmdMsg(id, code, extra, info) || SRouteUp(*this, id, code, extra, info);
}

int SSplitterWnd::OnCommand(WPARAM wParam, LPARAM lParam) {
  if (SWnd::OnCommand(wParam, lParam)) return 1;
  return lParam != 0 && SSent(::SendMessageW(::GetParent(m_hWnd), WM_COMMAND, wParam, lParam)) != 0;
}

int SSplitterWnd::OnNotify(WPARAM wParam, LPARAM lParam, LRESULT* result) {
  if (SWnd::OnNotify(wParam, lParam, result)) return 1;
  *result = SSent(::SendMessageW(::GetParent(m_hWnd), WM_NOTIFY, wParam, lParam));
  return 1;
}

void SSplitterWnd::OnSysCommand(UINT id, LPARAM lParam) {
  if (!SPassOnSizing(m_hWnd, id, lParam)) Default();
}
