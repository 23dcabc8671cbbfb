#include "qxcore/ui/bar/progress_status_bar.h"

#include <utility>

#include "qxcore/graphics/window_dc.h"
#include "qxcore/ui/bar/internal/progress_area.h"
#include "qxcore/ui/window/message_entries.h"
#include "qxcore/ui/window/thread_state.h"

namespace {

constexpr UINT kProgressId = 1;
constexpr UINT kCancelId = 2;
constexpr UINT kCancelText = 260;  // in the library's string table
constexpr DWORD kCancelStyle = BS_CENTER;

}  // namespace

QXCORE_IMPLEMENT_CREATABLE_CLASS(SProgressStatusBar, SStatusBar, 2)

QXCORE_IMPLEMENT_MESSAGE_MAP(SProgressStatusBar, SStatusBar, on<WM_SIZE, &SProgressStatusBar::OnSize>(),
                             command<kCancelId, &SProgressStatusBar::OnCancel>(),
                             notify<kCancelId, static_cast<int>(NM_SETCURSOR), &SProgressStatusBar::OnCancelNotify>(),
                             on<WM_DPICHANGED, &SProgressStatusBar::OnDpiChanged>())

QXCORE_IMPLEMENT_MESSAGE_MAP(SProgressStatusBar::CancelButton, SButton,
                             on<WM_SETCURSOR, &SProgressStatusBar::CancelButton::OnSetCursor>(),
                             on<WM_GETDLGCODE, &SProgressStatusBar::CancelButton::OnGetDlgCode>(),
                             on<WM_KEYDOWN, &SProgressStatusBar::CancelButton::OnKeyDown>(),
                             on<WM_PAINT, &SProgressStatusBar::CancelButton::OnPaint>(),
                             on<WM_ERASEBKGND, &SProgressStatusBar::CancelButton::OnEraseBkgnd>())

SProgressStatusBar::~SProgressStatusBar() = default;
SProgressStatusBar::CancelButton::~CancelButton() = default;

// --- creation ---

int SProgressStatusBar::Create(SWnd* parent, DWORD barStyle, DWORD style, UINT id) {
  // The bar is not painted over its children.
  if (!SStatusBar::Create(parent, barStyle, style | WS_CLIPCHILDREN, id)) return 0;
  SString text;
  text.LoadStringW(kCancelText);
  if (!m_progress.Create(WS_CHILD, SRect(), this, kProgressId) ||
      !m_cancel.Create(text, WS_CHILD | WS_TABSTOP | kCancelStyle, SRect(), this, kCancelId)) {
    DestroyWindow();
    return 0;
  }
  if (GetFont() != GetBarFont()) SetFont(GetBarFont(), 0);
  SizeButton();
  return 1;
}

// The button is as large as its text, and 20 pixels wider.
void SProgressStatusBar::SizeButton() {
  m_progress.SetFont(GetBarFont(), 0);
  m_cancel.SetFont(GetBarFont(), 0);
  SString text;
  m_cancel.GetWindowTextW(&text);
  SClientDC dc(m_cancel.m_hWnd);
  const SSelectObject font(dc, GetBarFont());
  SRect rect;
  dc.DrawTextW(text.View(), rect, DT_CALCRECT | DT_SINGLELINE);
  rect.right += Scaled(20);
  m_cancel.MoveWindow(rect, 0);
}

// --- start and end ---

void SProgressStatusBar::StartProgress(int cancellable) {
  const std::uint32_t former = m_flags;
  m_flags = (m_flags & ~kCancelAllowed) | (cancellable ? kCancelAllowed : 0u);
  if (!InProgress()) {
    m_savedCursor = m_currentCursor = nullptr;
    m_flags |= kInProgress;
    m_focusBefore = ::GetFocus();
    PlaceProgress();
  } else if (former != m_flags) {
    PlaceProgress();
  }
  m_progress.EnableWindow(1);
  if (!cancellable || m_cancel.m_hWnd == nullptr) return;
  m_cancel.EnableWindow(1);
  m_cancel.SetFocus();
}

void SProgressStatusBar::EndProgress() {
  if (!InProgress()) return;
  if (m_savedCursor != nullptr && m_savedCursor != m_currentCursor) ::SetCursor(m_savedCursor);
  m_flags &= ~(kInProgress | kCancelAllowed | kCancelRequested);
  PlaceProgress();
  m_progress.SetStatus({});
}

void SProgressStatusBar::GetSetProgressStatus(Status* get, const Status* set) {
  const Status present = {m_progress.GetStatus(), m_flags};
  if (set != nullptr) {
    m_progress.SetStatus(set->m_progress);
    m_flags = set->m_flags & (kInProgress | kCancelAllowed | kCancelRequested);
    if ((m_flags ^ present.m_flags) & (kInProgress | kCancelAllowed)) PlaceProgress();
  }
  if (get != nullptr) *get = present;
}

// --- places ---

// Without panes, or without a main pane, the progress takes all of the bar.
SRect SProgressStatusBar::GetProgressPane() const {
  SRect pane;
  return GetPaneRect(kSMainPane, &pane) ? pane : GetClientRect();
}

void SProgressStatusBar::PlaceProgress() {
  if (m_hWnd == nullptr) return;
  const bool hasButton = InProgress() && (m_flags & kCancelAllowed);
  if (!hasButton) HideButton();
  if (!InProgress()) {
    m_progress.ShowWindow(SW_HIDE);
    return;
  }
  const SSize button = m_cancel.GetWindowRect().Size();
  const SProgressPlaces places = SPlaceProgress(GetProgressPane(), Scaled(2), hasButton ? &button : nullptr);
  m_progress.MoveWindow(places.m_progress);
  m_progress.ShowWindow(SW_SHOWNA);
  if (!hasButton) return;
  m_cancel.MoveWindow(places.m_button);
  m_cancel.ShowWindow(SW_SHOWNA);
}

// The focus goes back before the button is hidden, or it would be nobody's.
void SProgressStatusBar::HideButton() {
  if (::GetFocus() == m_cancel.m_hWnd && m_cancel.m_hWnd != nullptr) {
    const HWND focus = ::IsWindow(m_focusBefore) ? m_focusBefore : ::GetParent(m_hWnd);
    SSent(::SetFocus(focus));
  }
  m_cancel.ShowWindow(SW_HIDE);
}

void SProgressStatusBar::OnSize(UINT type, int width, int height) {
  SStatusBar::OnSize(type, width, height);
  if (InProgress()) PlaceProgress();
}

LRESULT SProgressStatusBar::OnDpiChanged(WPARAM wParam, LPARAM lParam) {
  const LRESULT result = SStatusBar::OnDpiChanged(wParam, lParam);
  SizeButton();
  PlaceProgress();
  return result;
}

// --- the button ---

void SProgressStatusBar::OnCancel() {
  if (m_flags & kCancelAllowed) m_flags |= kCancelRequested;
}

// The work shows the wait cursor; over the button the arrow says that it can be pressed.
void SProgressStatusBar::OnCancelNotify(NMHDR*, LRESULT* result) {
  if (!InProgress()) return;
  const HCURSOR arrow = ::LoadCursorW(nullptr, IDC_ARROW);
  const HCURSOR shown = ::SetCursor(arrow);
  if (shown != arrow) m_savedCursor = shown;
  m_currentCursor = arrow;
  *result = 1;
}

int SProgressStatusBar::CancelButton::OnSetCursor(SWnd*, UINT, UINT) {
  NMHDR header = {m_hWnd, kCancelId, NM_SETCURSOR};
  const auto lParam = reinterpret_cast<LPARAM>(&header);
  if (GetParent()->SendMessageW(WM_NOTIFY, header.idFrom, lParam)) return 1;
  return static_cast<int>(Default());
}

UINT SProgressStatusBar::CancelButton::OnGetDlgCode() { return static_cast<UINT>(Default()) | DLGC_WANTALLKEYS; }

void SProgressStatusBar::CancelButton::OnKeyDown(UINT key, UINT, UINT) {
  if (key == VK_RETURN || key == VK_ESCAPE) {
    SendMessageW(BM_CLICK);
  } else {
    Default();
  }
}

// --- how the button looks ---

// The control paints some changes of its state at once; they are painted over.
LRESULT SProgressStatusBar::CancelButton::WindowProc(UINT message, WPARAM wParam, LPARAM lParam) {
  if (message == BM_GETSTATE || m_hWnd == nullptr) return SButton::WindowProc(message, wParam, lParam);
  const HWND window = m_hWnd;
  const LRESULT state = ::SendMessageW(window, BM_GETSTATE, 0, 0);
  const LRESULT result = SButton::WindowProc(message, wParam, lParam);
  const bool lives = ::IsWindow(window) && FromHandlePermanent(window) == this;
  if (lives && ::SendMessageW(window, BM_GETSTATE, 0, 0) != state) Invalidate(0);
  return result;
}

// A frame in the text's colour shows the focus.
void SProgressStatusBar::CancelButton::OnPaint() {
  SPaintDC dc(m_hWnd);
  const LRESULT state = SendMessageW(BM_GETSTATE);
  const bool isPushed = (state & BST_PUSHED) != 0;
  SRect rect = GetClientRect();
  dc.FillSolidRect(rect, ::GetSysColor(COLOR_3DFACE));
  const SSelectObject font(dc, GetFont());
  SString text;
  GetWindowTextW(&text);
  dc.SetBkMode(TRANSPARENT);
  dc.SetTextColor(::GetSysColor(IsWindowEnabled() ? COLOR_BTNTEXT : COLOR_GRAYTEXT));
  SRect place = rect;
  if (isPushed) place.Offset(1, 1);
  dc.DrawTextW(text.View(), place, DT_SINGLELINE | DT_CENTER | DT_VCENTER);
  if (state & BST_FOCUS) {
    dc.FrameRect(rect, ::GetSysColorBrush(COLOR_BTNTEXT));
  } else {
    dc.DrawEdge(rect, isPushed ? BDR_SUNKENOUTER : BDR_RAISEDINNER, BF_RECT);
  }
}
