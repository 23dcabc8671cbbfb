// Where the beam, the scroll bars and the shown window lie, the border between beam and scroll bar, the keyboard.

#include "qxcore/ui/app/internal/scaled_pixels.h"
#include "qxcore/ui/layout/internal/buffered_paint.h"
#include "qxcore/ui/layout/internal/deferred_moves.h"
#include "qxcore/ui/layout/internal/edges.h"
#include "qxcore/ui/layout/internal/pane_focus.h"
#include "qxcore/ui/layout/internal/size_box.h"
#include "qxcore/ui/layout/tab_window.h"

struct STabWnd::Places {
  SRect m_window, m_beam, m_horz, m_vert, m_box;
};

// The gap is stated for 96 dots an inch, and the two lines by which the beam is higher as well.
void STabWnd::ReadMetrics(int dpi) {
  const UINT dots = static_cast<UINT>(dpi);
  m_gap = SScaledPixels(m_gap, dpi, m_dpi);
  m_dpi = dpi;
  m_vertWidth = ::GetSystemMetricsForDpi(SM_CXVSCROLL, dots);
  m_horzHeight = ::GetSystemMetricsForDpi(SM_CXHSCROLL, dots);
  m_beamHeight = m_horzHeight + ::MulDiv(2, dpi, 96);
}

void STabWnd::MakeScrollBars() {
  if (m_flags & kHasScrollBars) return;
  m_flags |= kHasScrollBars;
  const auto make = [this](DWORD style, UINT id) {
    ::CreateWindowExW(0, WTEXT("ScrollBar"), nullptr, style | WS_CHILD, 0, 0, 0, 0, m_hWnd,
                      reinterpret_cast<HMENU>(static_cast<UINT_PTR>(id)), nullptr, nullptr);
    SWndThreadState::Get().ThrowException();
  };
  make(SBS_HORZ, kSTabHorzScrollBarId);
  make(SBS_VERT, kSTabVertScrollBarId);
  make(SBS_SIZEBOX | WS_DISABLED, kSTabSizeBoxId);
}

// The beam keeps its share of the width, reckoned from where it was set, so that nothing is lost by rounding.
void STabWnd::KeepShare(int clientWidth) {
  if (clientWidth <= 0) return;
  if (m_shareOfClient == 0) {
    m_shareOfBeam = clientWidth / 2 * 100;
    m_shareOfClient = clientWidth;
  }
  const long long share = static_cast<long long>(m_shareOfBeam) * clientWidth / m_shareOfClient;
  m_beamHundredfold = static_cast<int>(std::min<long long>(share, static_cast<long long>(clientWidth) * 100));
  m_beamWidth = m_beamHundredfold / 100;
}

STabWnd::Places STabWnd::FindPlaces() const {
  const SRect client = GetClientRect();
  const bool hasHorz = m_flags & kWantsHorz, hasVert = m_flags & kWantsVert;
  const int strip = std::max<int>(client.bottom - m_beamHeight, client.top);
  const int right = std::max<int>(client.right - (hasVert ? m_vertWidth : 0), client.left);
  const int barTop = std::max<int>(client.bottom - m_horzHeight, client.top);
  Places places;
  places.m_window = SRect(client.left, client.top, right, strip);
  if (hasVert) places.m_vert = SRect(right, client.top, client.right, strip);
  if (!hasHorz) {
    places.m_beam = SRect(client.left, strip, client.right, client.bottom);
    return places;
  }
  places.m_beam = SRect(client.left, strip, std::min(m_beamWidth, right), client.bottom);
  places.m_horz = SRect(std::min<int>(places.m_beam.right + m_gap, right), barTop, right, client.bottom);
  if (hasVert) places.m_box = SRect(right, barTop, client.right, client.bottom);
  return places;
}

// The window that is sized may end the whole.
void STabWnd::RecalcLayout(int redraw) {
  if (m_hWnd == nullptr) return;
  const HWND self = m_hWnd;
  MakeScrollBars();
  KeepShare(GetClientRect().Width());
  const Places places = FindPlaces();
  const HWND box = ::GetDlgItem(m_hWnd, static_cast<int>(kSTabSizeBoxId));
  if (box != nullptr && !places.m_box.IsEmpty()) SUpdateSizeBox(box, m_hWnd);

  SDeferredMoves moves(5);
  const auto place = [&moves](HWND window, const SRect& rect) {
    if (window != nullptr) moves.Move(window, rect, rect.IsEmpty() ? SWP_HIDEWINDOW : SWP_SHOWWINDOW);
  };
  moves.Move(m_beam.m_hWnd, places.m_beam);
  place(::GetDlgItem(m_hWnd, static_cast<int>(kSTabHorzScrollBarId)), places.m_horz);
  place(::GetDlgItem(m_hWnd, static_cast<int>(kSTabVertScrollBarId)), places.m_vert);
  place(box, places.m_box);
  if (m_shown != nullptr) moves.Move(m_shown, places.m_window, SWP_SHOWWINDOW);
  moves.End();
  if (FromHandlePermanent(self) != this) return;
  InvalidateRect(nullptr, 0);
  if (redraw) m_beam.InvalidateRect(nullptr, 0);
}

void STabWnd::ShowScrollBar(UINT bar, int show) {
  const std::uint32_t both = kWantsHorz | kWantsVert;
  const std::uint32_t bits = bar == SB_BOTH   ? both
                             : bar == SB_HORZ ? std::uint32_t{kWantsHorz}
                                              : std::uint32_t{kWantsVert};
  m_flags = show ? m_flags | bits : m_flags & ~bits;
  RecalcLayout(1);
}

void STabWnd::OnSize(UINT type, int, int) {
  if (type != SIZE_MINIMIZED) RecalcLayout(0);
}

LRESULT STabWnd::OnDpiChanged(WPARAM wParam, LPARAM) {
  if (LOWORD(wParam) != 0) ReadMetrics(LOWORD(wParam));
  RecalcLayout(1);
  return 0;
}

void STabWnd::OnSettingChange(UINT what, LPCWSTR area) {
  SWnd::OnSettingChange(what, area);
  ReadMetrics(m_dpi);
  RecalcLayout(1);
}

void STabWnd::OnSysColorChange() {
  SWnd::OnSysColorChange();
  if (m_hWnd != nullptr) InvalidateRect(nullptr, 0);
}

// --- painting: what no child covers ---

int STabWnd::OnEraseBkgnd(SDC*) { return 1; }

void STabWnd::OnPaint() {
  SBufferedPaint paint(m_hWnd);
  SDC* dc = paint.Get();
  if (dc == nullptr) return;
  const Places places = FindPlaces();
  const SRect client = GetClientRect();
  const int line = std::max(m_dpi / 96, 1);
  SFillWithSystemColor(*dc, client, COLOR_3DFACE);
  SFillWithSystemColor(*dc, SRect(client.left, places.m_beam.top, client.right, places.m_beam.top + line),
                       COLOR_3DDKSHADOW);
  if (SRect grip = GripRect(); !grip.IsEmpty()) {
    grip.Deflate(line, 3 * line);
    SDrawEdges(*dc, grip, line, line, COLOR_3DHILIGHT, COLOR_3DSHADOW);
  }
  if (m_shown != nullptr || m_noTabText.Length() == 0) return;
  const SSelectObject font(*dc, m_beam.GetTextFont());
  dc->SetBkMode(TRANSPARENT);
  dc->SetTextColor(::GetSysColor(COLOR_BTNTEXT));
  SRect area = places.m_window;
  dc->DrawTextW(m_noTabText, area, DT_CENTER | DT_VCENTER | DT_SINGLELINE | DT_NOPREFIX | DT_END_ELLIPSIS);
}

// --- the border between beam and scroll bar ---

SRect STabWnd::GripRect() const {
  if (!(m_flags & kWantsHorz)) return SRect();
  const Places places = FindPlaces();
  return SRect(places.m_beam.right, places.m_beam.top, places.m_horz.left, places.m_beam.bottom);
}

void STabWnd::SetBeamWidth(int width) {
  const int client = m_hWnd != nullptr ? GetClientRect().Width() : 0;
  if (client <= 0) return;
  const int most = std::max(client - ((m_flags & kWantsVert) ? m_vertWidth : 0) - m_gap, 0);
  m_shareOfBeam = std::clamp(width, 0, most) * 100;
  m_shareOfClient = client;
  RecalcLayout(1);
}

void STabWnd::OnLButtonDown(UINT, SPoint point) {
  if (!GripRect().Contains(point)) return;
  m_isDragging = true;
  m_grab = point.x - m_beamWidth;
  SetCapture();
}

void STabWnd::OnMouseMove(UINT, SPoint point) {
  if (m_isDragging && point.x - m_grab != m_beamWidth) SetBeamWidth(point.x - m_grab);
}

void STabWnd::StopDrag() {
  if (!std::exchange(m_isDragging, false)) return;
  if (::GetCapture() == m_hWnd) SSent(::ReleaseCapture());
}

void STabWnd::OnLButtonUp(UINT, SPoint) { StopDrag(); }
void STabWnd::OnCaptureChanged(SWnd*) { m_isDragging = false; }

void STabWnd::OnCancelMode() {
  StopDrag();
  SWnd::OnCancelMode();
}

void STabWnd::OnLButtonDblClk(UINT, SPoint point) {
  if (GripRect().Contains(point)) SetBeamWidth(GetClientRect().Width() / 2);
}

int STabWnd::OnSetCursor(SWnd* window, UINT hit, UINT) {
  POINT point = {};
  ::GetCursorPos(&point);
  ScreenToClient(&point);
  if (window != this || hit != HTCLIENT) return static_cast<int>(Default());
  ::SetCursor(::LoadCursorW(nullptr, GripRect().Contains(point) ? IDC_SIZEWE : IDC_ARROW));
  return 1;
}

// --- keyboard ---

static bool IsDown(int key) { return ::GetKeyState(key) < 0; }

void STabWnd::OnSetFocus(SWnd*) {
  SWnd* window = ShownWindow() != nullptr ? ShownWindow() : m_noTabWnd;
  SPaneFocus::Enter(window != nullptr ? window : &m_beam, false);
}

int STabWnd::PreTranslateMessage(MSG* message) {
  if (message->message != WM_KEYDOWN || IsDown(VK_MENU)) return 0;
  const UINT key = static_cast<UINT>(message->wParam);
  if (key == VK_F6) return !IsDown(VK_CONTROL) && GoToNextStop(IsDown(VK_SHIFT));
  if (message->hwnd == m_beam.m_hWnd && OnBeamKey(key)) return 1;
  return IsDown(VK_CONTROL) && OnTabKey(key);
}

bool STabWnd::OnTabKey(UINT key) {
  const int count = GetTabCount();
  const bool isBack = key == VK_PRIOR || (key == VK_TAB && IsDown(VK_SHIFT));
  if ((key != VK_TAB && key != VK_PRIOR && key != VK_NEXT) || count < 2) return false;
  m_beam.ChooseTab((m_beam.GetCurSel() + (isBack ? count - 1 : 1)) % count);
  return true;
}

bool STabWnd::OnBeamKey(UINT key) {
  const bool isControl = IsDown(VK_CONTROL);
  if (isControl && (key == VK_LEFT || key == VK_RIGHT)) {
    const int step = ::MulDiv(8, m_dpi, 96);
    SetBeamWidth(m_beamWidth + (key == VK_LEFT ? -step : step));
    return true;
  }
  if (isControl || (key != VK_RETURN && key != VK_ESCAPE && key != VK_TAB) || ShownWindow() == nullptr) return false;
  SPaneFocus::Enter(ShownWindow(), false);
  return true;
}

// The window and the beam are two stops of F6; at the end the way goes on in the window around this one.
bool STabWnd::GoToNextStop(bool backward) {
  SWnd* window = ShownWindow();
  const bool isOnBeam = ::GetFocus() == m_beam.m_hWnd;
  const bool isAtEnd = isOnBeam != backward;
  if (window == nullptr || (isAtEnd && SPaneFocus::HasOuterStop(this))) return false;
  if (isOnBeam) {
    SPaneFocus::Enter(window, backward);
  } else {
    m_beam.SetFocus();
  }
  return true;
}
