// Creation, tabs and what goes on to the parent and to the shown window.

#include "qxcore/ui/layout/tab_window.h"

#include "qxcore/ui/control/scroll_bar.h"
#include "qxcore/ui/frame/frame.h"
#include "qxcore/ui/frame/view.h"
#include "qxcore/ui/layout/internal/adopt.h"
#include "qxcore/ui/layout/internal/pane_focus.h"
#include "qxcore/ui/layout/internal/size_box.h"
#include "qxcore/ui/layout/internal/state_text.h"
#include "qxcore/ui/window/internal/route_up.h"
#include "qxcore/ui/window/message_entries.h"
#include "qxcore/ui/window/thread_state.h"

QXCORE_IMPLEMENT_CREATABLE_CLASS(STabWnd, SWnd, 2)

QXCORE_IMPLEMENT_MESSAGE_MAP(
    STabWnd, SWnd, on<WM_CREATE, &STabWnd::OnCreate>(), on<WM_DESTROY, &STabWnd::OnDestroy>(),
    on<WM_SIZE, &STabWnd::OnSize>(), on<WM_PAINT, &STabWnd::OnPaint>(), on<WM_ERASEBKGND, &STabWnd::OnEraseBkgnd>(),
    on<WM_LBUTTONDOWN, &STabWnd::OnLButtonDown>(), on<WM_LBUTTONDBLCLK, &STabWnd::OnLButtonDblClk>(),
    on<WM_LBUTTONUP, &STabWnd::OnLButtonUp>(), on<WM_MOUSEMOVE, &STabWnd::OnMouseMove>(),
    on<WM_CAPTURECHANGED, &STabWnd::OnCaptureChanged>(), on<WM_CANCELMODE, &STabWnd::OnCancelMode>(),
    on<WM_SETCURSOR, &STabWnd::OnSetCursor>(), on<WM_SETFOCUS, &STabWnd::OnSetFocus>(),
    on<WM_PARENTNOTIFY, &STabWnd::OnParentNotify>(), on<WM_HSCROLL, &STabWnd::OnHScroll>(),
    on<WM_VSCROLL, &STabWnd::OnVScroll>(), on<WM_SYSCOMMAND, &STabWnd::OnSysCommand>(),
    on<WM_SYSCOLORCHANGE, &STabWnd::OnSysColorChange>(), on<WM_SETTINGCHANGE, &STabWnd::OnSettingChange>(),
    on<0x02E0 /* WM_DPICHANGED */, &STabWnd::OnDpiChanged>(),
    on<0x02E3 /* WM_DPICHANGED_AFTERPARENT */, &STabWnd::OnDpiChangedAfterParent>(),
    on<kSMsgTabSetCurrent, &STabWnd::OnTabSetCurrent>(), notify<kSTabBeamId, kSTabChanging, &STabWnd::OnTabChanging>(),
    notify<kSTabBeamId, kSTabChanged, &STabWnd::OnTabChanged>())

STabWnd::STabWnd() { ReadMetrics(96); }

// While the beam goes, the window would still be asked about its tabs.
STabWnd::~STabWnd() {
  if (m_hWnd != nullptr) ::DestroyWindow(m_hWnd);
}

// --- creation ---

int STabWnd::Create(SWnd* parent, LPCWSTR name, SCreateContext* context, DWORD style, UINT id) {
  if (parent->GetSafeHwnd() == nullptr) return 0;
  return Create(nullptr, name, style, parent->GetClientRect(), parent, id, context);
}

int STabWnd::PreCreateWindow(CREATESTRUCTW* create) {
  if (create->lpszClass == nullptr) create->lpszClass = SRegisterWindowClass(CS_DBLCLKS);
  create->style |= WS_CLIPCHILDREN;
  return SWnd::PreCreateWindow(create);
}

int STabWnd::OnCreate(CREATESTRUCTW* create) {
  if (SWnd::OnCreate(create) == -1) return -1;
  const auto* context = static_cast<const SCreateContext*>(create->lpCreateParams);
  if (context != nullptr) m_context = *context;
  m_nextId = m_firstId = kSFirstTabId;
  m_flags &= ~kHasScrollBars;
  ReadMetrics(static_cast<int>(::GetDpiForWindow(m_hWnd)));
  if (!m_beam.Create(this, WS_CHILD | WS_VISIBLE | WS_CLIPSIBLINGS, kSTabBeamId)) return -1;
  if (m_noTabWnd != nullptr) SetNoTabWnd(m_noTabWnd);
  return 0;
}

// The beam's object can be used for another window afterwards.
void STabWnd::OnDestroy() {
  StopDrag();
  m_shown = nullptr;
  m_noTabWnd = nullptr;  // it goes as well
  while (m_beam.GetCount() > 0) m_beam.DeleteTab(m_beam.GetCount() - 1);
  SWnd::OnDestroy();
}

// Skips what the scroll bars and the beam have; beyond the range of words, identifiers that are free again.
UINT STabWnd::GetNextID() {
  const auto isTaken = [this](UINT id) {
    return id == kSTabHorzScrollBarId || id == kSTabBeamId || id == kSTabVertScrollBarId || id == kSTabSizeBoxId ||
           (m_hWnd != nullptr && ::GetDlgItem(m_hWnd, static_cast<int>(id)) != nullptr);
  };
  for (UINT tried = 0; tried <= 0xFFFF - m_firstId; ++tried) {
    const UINT id = m_nextId;
    m_nextId = id == 0xFFFF ? m_firstId : id + 1;
    if (!isTaken(id)) return id;
  }
  return 0;
}

// --- tabs ---

SWnd* STabWnd::ShownWindow() const { return GetTabWindow(m_beam.GetCurSel()); }

SWnd* STabWnd::InsertTab(int index, SClassInfo* windowClass, LPCWSTR text, SCreateContext* context, UINT id) {
  if (m_hWnd == nullptr || index < 0 || index > GetTabCount() || windowClass == nullptr) return nullptr;
  SObject* object = windowClass->CreateObject();
  SWnd* window = SObjectCast<SWnd>(object, &SWnd::classSWnd);
  if (window == nullptr) {
    delete object;
    return nullptr;
  }
  SCreateContext* from = context != nullptr ? context : &m_context;
  if (!window->Create(nullptr, nullptr, WS_CHILD, SRect(), this, id != 0 ? id : GetNextID(), from)) return nullptr;
  const HWND self = m_hWnd;
  const int inserted = EnterTab(index, window, text);
  return FromHandlePermanent(self) == this ? GetTabWindow(inserted) : nullptr;
}

SWnd* STabWnd::AddTab(SClassInfo* windowClass, LPCWSTR text, SCreateContext* context, UINT id) {
  return InsertTab(GetTabCount(), windowClass, text, context, id);
}

int STabWnd::InsertTab(int index, SWnd* window, LPCWSTR text) {
  const HWND handle = window->GetSafeHwnd();
  if (m_hWnd == nullptr || index < 0 || index > GetTabCount() || handle == nullptr || GetTabIndex(window) >= 0) {
    return -1;
  }
  window->ShowWindow(SW_HIDE);
  SAdopt(window, this);
  window->SetDlgCtrlID(static_cast<int>(GetNextID()));
  return EnterTab(index, window, text);
}

int STabWnd::AddTab(SWnd* window, LPCWSTR text) { return InsertTab(GetTabCount(), window, text); }

int STabWnd::EnterTab(int index, SWnd* window, LPCWSTR text) {
  const int inserted = m_beam.InsertTab(index, text, window, -1);
  SFrameWnd* frame = GetParentFrame();
  SView* view = SObjectCast<SView>(window, &SView::classSView);
  if (frame != nullptr && view != nullptr && frame->GetActiveView() == nullptr) frame->SetActiveView(view, 0);
  if (ShownWindow() == window) ShowCurrent(false);
  return inserted;
}

void STabWnd::RemoveTab(int index) {
  const bool wasShown = index == m_beam.GetCurSel();
  m_beam.DeleteTab(index);
  if (wasShown) ShowCurrent(false);
}

int STabWnd::DeleteTab(int index) {
  SWnd* window = GetTabWindow(index);
  if (window == nullptr) return 0;
  const HWND handle = window->m_hWnd;
  RemoveTab(index);
  SSent(::DestroyWindow(handle));
  return 1;
}

int STabWnd::DetachTab(SWnd* window) {
  const int index = GetTabIndex(window);
  if (index < 0) return 0;
  RemoveTab(index);
  return 1;
}

// A window that destroys itself takes its tab along.
void STabWnd::OnParentNotify(UINT message, LPARAM lParam) {
  const HWND window = m_hWnd, child = reinterpret_cast<HWND>(lParam);
  if (LOWORD(message) == WM_DESTROY) {
    if (m_noTabWnd->GetSafeHwnd() == child) m_noTabWnd = nullptr;
    const int index = GetTabIndex(FromHandlePermanent(child));
    if (index >= 0) RemoveTab(index);
  }
  if (FromHandlePermanent(window) == this) SWnd::OnParentNotify(message, lParam);
}

// --- what is shown ---

SWnd* STabWnd::GetActiveTab(int* index) const {
  if (index != nullptr) *index = m_beam.GetCurSel();
  return ShownWindow();
}

bool STabWnd::HoldsFocus(HWND window) const {
  const HWND focus = ::GetFocus();
  return window != nullptr && focus != nullptr && (focus == window || ::IsChild(window, focus));
}

int STabWnd::ActivateTab(int index, int focus) {
  if (GetTabWindow(index) == nullptr) return 0;
  m_beam.SetCurSel(index);
  ShowCurrent(focus != 0);
  return 1;
}

void STabWnd::ActivateView(SWnd* window) {
  SFrameWnd* frame = GetParentFrame();
  SView* view = SObjectCast<SView>(window, &SView::classSView);
  if (frame != nullptr && view != nullptr) frame->SetActiveView(view);
}

// The new window is visible and has the focus before the former one goes, so that neither a hole nor a window
// outside is seen in between. Whoever hears of it may end the whole.
void STabWnd::ShowCurrent(bool focus) {
  const HWND self = m_hWnd;
  SWnd* window = m_beam.GetCount() > 0 ? ShownWindow() : m_noTabWnd;
  const HWND former = m_shown;
  const HWND shown = window->GetSafeHwnd();
  const bool takesFocus = focus || HoldsFocus(former);
  m_shown = shown;
  RecalcLayout(0);
  const auto lives = [&] { return FromHandlePermanent(self) == this; };
  const auto isCurrent = [&] { return lives() && m_shown == shown && shown != nullptr; };
  if (takesFocus && isCurrent()) ActivateView(window);
  if (takesFocus && isCurrent()) SPaneFocus::Enter(window, false);
  if (!lives()) return;
  if (former != nullptr && former != m_shown && ::IsWindow(former)) SSent(::ShowWindow(former, SW_HIDE));
  if (lives() && m_shown == nullptr) InvalidateRect(nullptr, 0);
}

void STabWnd::SetNoTabText(LPCWSTR text) {
  m_noTabText = text != nullptr ? text : WTEXT("");
  if (m_hWnd != nullptr) InvalidateRect(nullptr, 0);
}

void STabWnd::SetNoTabWnd(SWnd* window, int redraw) {
  m_noTabWnd = window;
  if (window->GetSafeHwnd() != nullptr && m_hWnd != nullptr && ::GetParent(window->m_hWnd) != m_hWnd) {
    window->ShowWindow(SW_HIDE);
    SAdopt(window, this);
  }
  if (redraw && m_hWnd != nullptr && m_beam.GetCount() == 0) ShowCurrent(false);
}

int STabWnd::GetTabText(int index, LPWSTR buffer, int capacity) const {
  if (capacity <= 0) return 0;
  const SStringView text = GetTabText(index).View().substr(0, static_cast<std::size_t>(capacity) - 1);
  std::copy(text.begin(), text.end(), buffer);
  buffer[text.size()] = 0;
  return static_cast<int>(text.size());
}

// --- notifications of the beam ---

// The window around may refuse.
void STabWnd::OnTabChanging(NMHDR* record, LRESULT* result) {
  *result = SSent(::SendMessageW(::GetParent(m_hWnd), WM_NOTIFY, record->idFrom, reinterpret_cast<LPARAM>(record)));
}

void STabWnd::OnTabChanged(NMHDR* record, LRESULT* result) {
  const HWND window = m_hWnd;
  // On the tabs the keyboard stays where it is.
  ShowCurrent(::GetFocus() != m_beam.m_hWnd);
  *result = 0;
  if (FromHandlePermanent(window) != this) return;
  SSent(::SendMessageW(::GetParent(window), WM_NOTIFY, record->idFrom, reinterpret_cast<LPARAM>(record)));
}

LRESULT STabWnd::OnTabSetCurrent(WPARAM wParam, LPARAM lParam) {
  const int index =
      lParam != 0 ? GetTabIndex(FromHandlePermanent(reinterpret_cast<HWND>(lParam))) : static_cast<int>(wParam);
  return m_beam.ChooseTab(index);
}

// --- scroll bars ---

SScrollBar* STabWnd::GetTabScrollBar(int bar) const {
  const bool isHorz = bar == SB_HORZ;
  if (m_hWnd == nullptr || !(m_flags & (isHorz ? kWantsHorz : kWantsVert))) return nullptr;
  const UINT id = isHorz ? kSTabHorzScrollBarId : kSTabVertScrollBarId;
  return SMsgObjects::ScrollBar(reinterpret_cast<std::intptr_t>(::GetDlgItem(m_hWnd, static_cast<int>(id))));
}

void STabWnd::PassToShown(UINT message, UINT code, UINT position, SScrollBar* bar) {
  if (m_shown == nullptr) return;
  SSent(::SendMessageW(m_shown, message, MAKEWPARAM(static_cast<WORD>(code), static_cast<WORD>(position)),
                       reinterpret_cast<LPARAM>(bar->GetSafeHwnd())));
}

void STabWnd::OnHScroll(UINT code, UINT position, SScrollBar* bar) { PassToShown(WM_HSCROLL, code, position, bar); }
void STabWnd::OnVScroll(UINT code, UINT position, SScrollBar* bar) { PassToShown(WM_VSCROLL, code, position, bar); }

// --- what goes on to the parent ---

int STabWnd::OnCmdMsg(UINT id, int code, void* extra, S_CMDHANDLERINFO* info) {
  return SWnd::OnCmdMsg(id, code, extra, info) || SRouteUp(*this, id, code, extra, info);
}

int STabWnd::OnCommand(WPARAM wParam, LPARAM lParam) {
  if (SWnd::OnCommand(wParam, lParam)) return 1;
  return lParam != 0 && SSent(::SendMessageW(::GetParent(m_hWnd), WM_COMMAND, wParam, lParam)) != 0;
}

int STabWnd::OnNotify(WPARAM wParam, LPARAM lParam, LRESULT* result) {
  if (SWnd::OnNotify(wParam, lParam, result)) return 1;
  *result = SSent(::SendMessageW(::GetParent(m_hWnd), WM_NOTIFY, wParam, lParam));
  return 1;
}

void STabWnd::OnSysCommand(UINT id, LPARAM lParam) {
  if (!SPassOnSizing(m_hWnd, id, lParam)) Default();
}

// --- the state as text: "tabs 1 SHOWN+1 FIRST BEAM-HUNDREDFOLD CLIENT-WIDTH" ---

SString STabWnd::GetState() const {
  SStateWriter writer;
  writer.Word(WTEXT("tabs")).Number(1).Number(m_beam.GetCurSel() + 1).Number(m_beam.GetFirstVisible());
  return writer.Number(m_shareOfBeam).Number(m_shareOfClient).Text();
}

int STabWnd::SetState(const SString& state) {
  constexpr int kMost = 0x7FFFFFFF;
  int version = 0, shown = 0, first = 0, beam = 0, client = 0;
  SStateReader reader(state);
  reader.Word(WTEXT("tabs")).Number(&version, 1).Number(&shown, kMost).Number(&first, kMost);
  reader.Number(&beam, kMost).Number(&client, kMost);
  if (m_hWnd == nullptr || !reader.IsAtEnd() || version != 1) return 0;
  m_shareOfBeam = beam;
  m_shareOfClient = client;
  RecalcLayout(1);
  m_beam.SetFirstVisible(first);
  if (shown > 0) ActivateTab(shown - 1, 0);
  return 1;
}
