// The thin wrappers: one system call each, with this window's handle.

#include "qxcore/ui/app/message_box.h"
#include "qxcore/ui/control/scroll_bar.h"
#include "qxcore/ui/frame/dock_site_frame.h"
#include "qxcore/ui/window/thread_state.h"
#include "qxcore/ui/window/window.h"

// --- text ---

int SWnd::SetWindowTextW(LPCWSTR text) { return SSent(::SetWindowTextW(m_hWnd, text)); }

int SWnd::GetWindowTextLengthW() const { return SSent(::GetWindowTextLengthW(m_hWnd)); }

int SWnd::GetWindowTextW(LPWSTR buffer, int capacity) const {
  return SSent(::GetWindowTextW(m_hWnd, buffer, capacity));
}

// The length is an upper bound; the text may be shorter.
int SWnd::GetWindowTextW(SString* text) const {
  const int length = GetWindowTextLengthW();
  SString taken;
  const int copied = length > 0 ? GetWindowTextW(taken.Lock(length + 1), length + 1) : 0;
  if (length > 0) taken.Unlock(copied);
  *text = taken;
  return copied;
}

// --- the tree ---

SWnd* SWnd::GetParent() const { return FromHandle(::GetParent(m_hWnd)); }

SWnd* SWnd::GetTopLevelParent() const {
  HWND top = m_hWnd;
  for (HWND above = top; above != nullptr; above = ::GetParent(above)) top = above;
  return FromHandle(top);
}

SWnd* SWnd::GetTopLevelOwner() const {
  HWND top = m_hWnd;
  while ((::GetWindowLongW(top, GWL_STYLE) & WS_CHILD) != 0) top = ::GetParent(top);
  for (HWND owner = top; owner != nullptr; owner = ::GetWindow(owner, GW_OWNER)) top = owner;
  return FromHandle(top);
}

SFrameWnd* SWnd::GetParentFrame() const {
  if (m_hWnd == nullptr) return nullptr;
  for (HWND above = ::GetParent(m_hWnd); above != nullptr; above = ::GetParent(above)) {
    if (SWnd* object = FromHandlePermanent(above); object->IsKindOf(&SFrameWnd::classSFrameWnd)) {
      return static_cast<SFrameWnd*>(object);
    }
  }
  return nullptr;
}

SDockSiteFrameWnd* SWnd::GetTopLevelFrame() const {
  SDockSiteFrameWnd* found = nullptr;
  for (HWND above = m_hWnd; above != nullptr; above = ::GetParent(above)) {
    if (SWnd* object = FromHandlePermanent(above); object->IsKindOf(&SDockSiteFrameWnd::classSDockSiteFrameWnd)) {
      found = static_cast<SDockSiteFrameWnd*>(object);
    }
  }
  return found;
}

SWnd* SWnd::GetDlgItem(int id) const { return FromHandle(::GetDlgItem(m_hWnd, id)); }
int SWnd::GetDlgCtrlID() const { return static_cast<int>(::GetWindowLongPtrW(m_hWnd, GWLP_ID)); }
int SWnd::SetDlgCtrlID(int id) { return static_cast<int>(::SetWindowLongPtrW(m_hWnd, GWLP_ID, id)); }
SWnd* SWnd::SetParent(SWnd* parent) { return FromHandle(SSent(::SetParent(m_hWnd, parent->GetSafeHwnd()))); }
int SWnd::IsChild(const SWnd* window) const { return ::IsChild(m_hWnd, window->GetSafeHwnd()); }

// --- styles ---

static int ModifyLong(HWND window, int index, DWORD remove, DWORD add, UINT flags) {
  const DWORD old = static_cast<DWORD>(::GetWindowLongW(window, index));
  const DWORD wanted = (old & ~remove) | add;
  if (old == wanted) return 0;
  ::SetWindowLongW(window, index, static_cast<LONG>(wanted));
  if (flags != 0) {
    ::SetWindowPos(window, nullptr, 0, 0, 0, 0, SWP_NOSIZE | SWP_NOMOVE | SWP_NOZORDER | SWP_NOACTIVATE | flags);
  }
  return SSent(1);
}

DWORD SWnd::GetStyle() const { return static_cast<DWORD>(::GetWindowLongW(m_hWnd, GWL_STYLE)); }
DWORD SWnd::GetExStyle() const { return static_cast<DWORD>(::GetWindowLongW(m_hWnd, GWL_EXSTYLE)); }
int SWnd::ModifyStyle(DWORD remove, DWORD add, UINT flags) { return ModifyLong(m_hWnd, GWL_STYLE, remove, add, flags); }
int SWnd::ModifyStyleEx(DWORD remove, DWORD add, UINT flags) {
  return ModifyLong(m_hWnd, GWL_EXSTYLE, remove, add, flags);
}

// --- state and place ---

int SWnd::EnableWindow(int enable) { return SSent(::EnableWindow(m_hWnd, enable)); }
int SWnd::IsWindowEnabled() const { return ::IsWindowEnabled(m_hWnd); }
int SWnd::IsWindowVisible() const { return ::IsWindowVisible(m_hWnd); }
int SWnd::IsIconic() const { return ::IsIconic(m_hWnd); }
int SWnd::IsZoomed() const { return ::IsZoomed(m_hWnd); }
int SWnd::ShowWindow(int show) { return SSent(::ShowWindow(m_hWnd, show)); }
int SWnd::UpdateWindow() { return SSent(::UpdateWindow(m_hWnd)); }

int SWnd::MoveWindow(const SRect& rect, int repaint) {
  return SSent(::MoveWindow(m_hWnd, rect.left, rect.top, rect.Width(), rect.Height(), repaint));
}

int SWnd::SetWindowPos(HWND after, int x, int y, int width, int height, UINT flags) {
  return SSent(::SetWindowPos(m_hWnd, after, x, y, width, height, flags));
}

void SWnd::CalcWindowRect(RECT* rect, UINT adjust) {
  ::AdjustWindowRectEx(rect, GetStyle(), ::GetMenu(m_hWnd) != nullptr && (GetStyle() & WS_CHILD) == 0, GetExStyle());
  if (adjust == 0) return;
  if ((GetStyle() & WS_VSCROLL) != 0) rect->right += ::GetSystemMetrics(SM_CXVSCROLL);
  if ((GetStyle() & WS_HSCROLL) != 0) rect->bottom += ::GetSystemMetrics(SM_CYHSCROLL);
}

SRect SWnd::GetClientRect() const {
  SRect rect;
  ::GetClientRect(m_hWnd, &rect);
  return rect;
}

SRect SWnd::GetWindowRect() const {
  SRect rect;
  ::GetWindowRect(m_hWnd, &rect);
  return rect;
}

void SWnd::Invalidate(int erase) { ::InvalidateRect(m_hWnd, nullptr, erase); }
void SWnd::InvalidateRect(const RECT* rect, int erase) { ::InvalidateRect(m_hWnd, rect, erase); }
void SWnd::ClientToScreen(POINT* point) const { ::ClientToScreen(m_hWnd, point); }
void SWnd::ScreenToClient(POINT* point) const { ::ScreenToClient(m_hWnd, point); }
void SWnd::ClientToScreen(RECT* rect) const { ::MapWindowPoints(m_hWnd, nullptr, reinterpret_cast<POINT*>(rect), 2); }
void SWnd::ScreenToClient(RECT* rect) const { ::MapWindowPoints(nullptr, m_hWnd, reinterpret_cast<POINT*>(rect), 2); }

int SWnd::MapWindowPoints(SWnd* to, POINT* points, UINT count) const {
  return ::MapWindowPoints(m_hWnd, to->GetSafeHwnd(), points, count);
}

// --- input ---

SWnd* SWnd::SetFocus() { return FromHandle(SSent(::SetFocus(m_hWnd))); }
SWnd* SWnd::GetFocus() { return FromHandle(::GetFocus()); }
SWnd* SWnd::SetCapture() { return FromHandle(SSent(::SetCapture(m_hWnd))); }
SWnd* SWnd::GetCapture() { return FromHandle(::GetCapture()); }
UINT_PTR SWnd::SetTimer(UINT_PTR id, UINT milliseconds) { return ::SetTimer(m_hWnd, id, milliseconds, nullptr); }
int SWnd::KillTimer(UINT_PTR id) { return ::KillTimer(m_hWnd, id); }

void SWnd::SetFont(HFONT font, int redraw) {
  SendMessageW(WM_SETFONT, reinterpret_cast<WPARAM>(font), MAKELPARAM(redraw != 0, 0));
}
HFONT SWnd::GetFont() const { return reinterpret_cast<HFONT>(SendMessageW(WM_GETFONT)); }
HMENU SWnd::GetMenuHandle() const { return ::GetMenu(m_hWnd); }
int SWnd::SetMenu(HMENU menu) { return SSent(::SetMenu(m_hWnd, menu)); }

int SWnd::MessageBoxW(LPCWSTR text, LPCWSTR caption, UINT type) { return SMessageBox(text, type, caption, m_hWnd); }

// --- scrolling: the window's own bar, or the control that stands in for it ---

namespace {
struct Bar {
  HWND window;
  int kind;
};
}  // namespace

static Bar BarOf(const SWnd* window, int bar) {
  if (const SScrollBar* control = window->GetScrollBarCtrl(bar)) return {control->m_hWnd, SB_CTL};
  return {window->m_hWnd, bar};
}

int SWnd::GetScrollPos(int bar) const {
  const Bar place = BarOf(this, bar);
  return ::GetScrollPos(place.window, place.kind);
}

int SWnd::SetScrollPos(int bar, int position, int redraw) {
  const Bar place = BarOf(this, bar);
  return SSent(::SetScrollPos(place.window, place.kind, position, redraw));
}

void SWnd::GetScrollRange(int bar, int* low, int* high) const {
  const Bar place = BarOf(this, bar);
  ::GetScrollRange(place.window, place.kind, low, high);
}

void SWnd::SetScrollRange(int bar, int low, int high, int redraw) {
  const Bar place = BarOf(this, bar);
  SSent(::SetScrollRange(place.window, place.kind, low, high, redraw));
}

int SWnd::GetScrollInfo(int bar, SCROLLINFO* info, UINT mask) const {
  const Bar place = BarOf(this, bar);
  info->cbSize = sizeof(*info);
  info->fMask = mask;
  return ::GetScrollInfo(place.window, place.kind, info);
}

int SWnd::SetScrollInfo(int bar, SCROLLINFO* info, int redraw) {
  const Bar place = BarOf(this, bar);
  info->cbSize = sizeof(*info);
  return SSent(::SetScrollInfo(place.window, place.kind, info, redraw));
}

// With a page, its last line stands at the end of the range.
int SWnd::GetScrollLimit(int bar) const {
  SCROLLINFO info = {};
  if (!GetScrollInfo(bar, &info, SIF_RANGE | SIF_PAGE)) return 0;
  return info.nMax - (info.nPage > 1 ? static_cast<int>(info.nPage) - 1 : 0);
}

void SWnd::ScrollWindow(int x, int y, const RECT* rect, const RECT* clip) {
  SSent(::ScrollWindow(m_hWnd, x, y, rect, clip));
}

int SWnd::EnableScrollBar(int bar, UINT arrows) {
  return SSent(::EnableScrollBar(m_hWnd, static_cast<UINT>(bar), arrows));
}

void SWnd::EnableScrollBarCtrl(int bar, int enable) {
  if (SScrollBar* control = GetScrollBarCtrl(bar)) {
    control->EnableWindow(enable);
  } else {
    ShowScrollBar(bar, enable);
  }
}

int SWnd::ShowScrollBar(int bar, int show) {
  const Bar place = BarOf(this, bar);
  return SSent(::ShowScrollBar(place.window, place.kind, show));
}

// --- carets, dropped files ---

void SWnd::CreateSolidCaret(int width, int height) { ::CreateCaret(m_hWnd, nullptr, width, height); }
void SWnd::CreateGrayCaret(int width, int height) {
  ::CreateCaret(m_hWnd, reinterpret_cast<HBITMAP>(static_cast<ULONG_PTR>(1)), width, height);
}
void SWnd::ShowCaret() { ::ShowCaret(m_hWnd); }
void SWnd::HideCaret() { ::HideCaret(m_hWnd); }
void SWnd::SetCaretPos(const POINT& point) { ::SetCaretPos(point.x, point.y); }
void SWnd::DragAcceptFiles(int accept) {
  ModifyStyleEx(accept ? 0 : WS_EX_ACCEPTFILES, accept ? WS_EX_ACCEPTFILES : 0);
}
