// The message map of SWnd and its handlers.

#include "qxcore/ui/app/application.h"
#include "qxcore/ui/app/ui_sys_data.h"
#include "qxcore/ui/control/scroll_bar.h"
#include "qxcore/ui/window/command_ui.h"
#include "qxcore/ui/window/menu.h"
#include "qxcore/ui/window/message_entries.h"
#include "qxcore/ui/window/thread_state.h"
#include "qxcore/ui/window/window.h"

QXCORE_IMPLEMENT_MESSAGE_MAP(SWnd, SCmdTarget, on<WM_ACTIVATE, &SWnd::OnActivate>(),
                             on<WM_ACTIVATEAPP, &SWnd::OnActivateApp>(), on<WM_CANCELMODE, &SWnd::OnCancelMode>(),
                             on<WM_CHARTOITEM, &SWnd::OnCharToItem>(), on<WM_CLOSE, &SWnd::OnClose>(),
                             on<WM_COMPAREITEM, &SWnd::OnCompareItem>(), on<WM_CREATE, &SWnd::OnCreate>(),
                             on<WM_DELETEITEM, &SWnd::OnDeleteItem>(), on<WM_DESTROY, &SWnd::OnDestroy>(),
                             on<WM_DISPLAYCHANGE, &SWnd::OnDisplayChange>(),
                             on<0x02E0 /* WM_DPICHANGED */, &SWnd::OnDpiChanged>(),
                             on<WM_DRAWITEM, &SWnd::OnDrawItem>(), on<WM_ENABLE, &SWnd::OnEnable>(),
                             on<WM_ENDSESSION, &SWnd::OnEndSession>(), on<WM_ENTERIDLE, &SWnd::OnEnterIdle>(),
                             on<WM_HELP, &SWnd::OnHelpInfo>(), on<WM_HSCROLL, &SWnd::OnHScroll>(),
                             on<WM_INITMENUPOPUP, &SWnd::OnInitMenuPopup>(), on<WM_KILLFOCUS, &SWnd::OnKillFocus>(),
                             on<WM_MEASUREITEM, &SWnd::OnMeasureItem>(), on<WM_MENUSELECT, &SWnd::OnMenuSelect>(),
                             on<WM_MOUSEACTIVATE, &SWnd::OnMouseActivate>(), on<WM_NCACTIVATE, &SWnd::OnNcActivate>(),
                             on<WM_NCCALCSIZE, &SWnd::OnNcCalcSize>(), on<WM_NCCREATE, &SWnd::OnNcCreate>(),
                             on<WM_NCDESTROY, &SWnd::OnNcDestroy>(), on<WM_NCHITTEST, &SWnd::OnNcHitTest>(),
                             on<WM_NCLBUTTONDBLCLK, &SWnd::OnNcButton>(), on<WM_NCLBUTTONDOWN, &SWnd::OnNcButton>(),
                             on<WM_NCLBUTTONUP, &SWnd::OnNcButton>(), on<WM_NCMBUTTONDBLCLK, &SWnd::OnNcButton>(),
                             on<WM_NCMBUTTONDOWN, &SWnd::OnNcButton>(), on<WM_NCMBUTTONUP, &SWnd::OnNcButton>(),
                             on<WM_NCMOUSEMOVE, &SWnd::OnNcMouseMove>(), on<WM_NCPAINT, &SWnd::OnNcPaint>(),
                             on<WM_NCRBUTTONDBLCLK, &SWnd::OnNcButton>(), on<WM_NCRBUTTONDOWN, &SWnd::OnNcButton>(),
                             on<WM_NCRBUTTONUP, &SWnd::OnNcButton>(), on<WM_PARENTNOTIFY, &SWnd::OnParentNotify>(),
                             on<WM_QUERYENDSESSION, &SWnd::OnQueryEndSession>(), on<WM_SETFOCUS, &SWnd::OnSetFocus>(),
                             on<WM_SETTINGCHANGE, &SWnd::OnSettingChange>(), on<WM_SHOWWINDOW, &SWnd::OnShowWindow>(),
                             on<WM_SYSCOLORCHANGE, &SWnd::OnSysColorChange>(), on<WM_SYSCOMMAND, &SWnd::OnSysCommand>(),
                             on<WM_THEMECHANGED, &SWnd::OnThemeChanged>(), on<WM_TIMECHANGE, &SWnd::OnTimeChange>(),
                             on<WM_VKEYTOITEM, &SWnd::OnVKeyToItem>(), on<WM_VSCROLL, &SWnd::OnVScroll>(),
                             on<WM_FONTCHANGE, &SWnd::OnFontChange>())

void SWnd::OnActivate(UINT, SWnd*, int) { Default(); }
void SWnd::OnActivateApp(int, DWORD) { Default(); }
void SWnd::OnCancelMode() { Default(); }
void SWnd::OnClose() { Default(); }
int SWnd::OnCreate(CREATESTRUCTW*) { return static_cast<int>(Default()); }
void SWnd::OnDestroy() { Default(); }
void SWnd::OnDisplayChange(UINT, int, int) { Default(); }
void SWnd::OnEnable(int) { Default(); }
void SWnd::OnEndSession(int) { Default(); }
void SWnd::OnEnterIdle(UINT, SWnd*) { Default(); }
int SWnd::OnHelpInfo(HELPINFO*) { return static_cast<int>(Default()); }
void SWnd::OnMenuSelect(UINT, UINT, HMENU) { Default(); }
int SWnd::OnMouseActivate(SWnd*, UINT, UINT) { return static_cast<int>(Default()); }
int SWnd::OnNcActivate(int) { return static_cast<int>(Default()); }
int SWnd::OnNcCalcSize(int, NCCALCSIZE_PARAMS*) { return static_cast<int>(Default()); }
int SWnd::OnNcCreate(CREATESTRUCTW*) { return static_cast<int>(Default()); }
LRESULT SWnd::OnNcHitTest(SPoint) { return Default(); }
void SWnd::OnNcButton(UINT, SPoint) { Default(); }
void SWnd::OnNcMouseMove(UINT, SPoint) { Default(); }
void SWnd::OnNcPaint() { Default(); }
int SWnd::OnQueryEndSession() { return static_cast<int>(Default()); }
void SWnd::OnSetFocus(SWnd*) { Default(); }
void SWnd::OnShowWindow(int, UINT) { Default(); }
void SWnd::OnSysCommand(UINT, LPARAM) { Default(); }
void SWnd::OnThemeChanged() { Default(); }
void SWnd::OnTimeChange() { Default(); }

void SWnd::OnKillFocus(SWnd* newFocus) {
  const HWND window = m_hWnd;
  Default();
  if (FromHandlePermanent(window) == this) SafeOnKillFocus(newFocus);
}

// --- the last message ---

// What is left to a window after its last message is the system's: its class's procedure is put back unless
// somebody else has changed it meanwhile. Everything up to PostNcDestroy happens even when a handler of the
// system's side threw.
void SWnd::OnNcDestroy() {
  const HWND window = m_hWnd;
  if (SWinApp* app = SGetApp(); app != nullptr && app->m_mainWnd == this) {
    ::PostQuitMessage(0);
    app->m_mainWnd = nullptr;
  }
  const LONG_PTR before = ::GetWindowLongPtrW(window, GWLP_WNDPROC);
  SWndThreadState& state = SWndThreadState::Get();
  try {
    Default();
  } catch (...) {
    state.KeepException(std::current_exception());
  }
  if (const WNDPROC super = GetSuperWndProc()) {
    if (::GetWindowLongPtrW(window, GWLP_WNDPROC) == before) {
      ::SetWindowLongPtrW(window, GWLP_WNDPROC, reinterpret_cast<LONG_PTR>(super));
    }
  }
  LeaveHandleMap();
  m_superWndProc = nullptr;
  for (auto* creation = state.m_creations; creation != nullptr; creation = creation->m_outer) {
    if (creation->m_object == this) creation->m_hasEnded = true;
  }
  PostNcDestroy();
}

// --- notifications of controls: the control first ---

void SWnd::OnParentNotify(UINT, LPARAM lParam) {
  const UINT what = LOWORD(SWndThreadState::Get().m_current.m_wParam);
  const bool isAboutChild = what == WM_CREATE || what == WM_DESTROY;
  LRESULT result = 0;
  if (isAboutChild && ReflectLastMsg(reinterpret_cast<HWND>(lParam), &result)) return;
  Default();
}

// Menus draw items, too; they have no control.
static HWND ControlOf(UINT type, HWND window) { return type == ODT_MENU ? nullptr : window; }

void SWnd::OnDrawItem(int, DRAWITEMSTRUCT* item) {
  LRESULT result = 0;
  if (!ReflectLastMsg(ControlOf(item->CtlType, item->hwndItem), &result)) Default();
}

// The record names the control by its identifier alone.
void SWnd::OnMeasureItem(int, MEASUREITEMSTRUCT* item) {
  const HWND control = item->CtlType == ODT_MENU ? nullptr : ::GetDlgItem(m_hWnd, static_cast<int>(item->CtlID));
  LRESULT result = 0;
  if (!ReflectLastMsg(control, &result)) Default();
}

void SWnd::OnDeleteItem(int, DELETEITEMSTRUCT* item) {
  LRESULT result = 0;
  if (!ReflectLastMsg(ControlOf(item->CtlType, item->hwndItem), &result)) Default();
}

int SWnd::OnCompareItem(int, COMPAREITEMSTRUCT* item) {
  LRESULT result = 0;
  return static_cast<int>(ReflectLastMsg(item->hwndItem, &result) ? result : Default());
}

// The control's handle stands in lParam.
static bool ReflectToLParam(LRESULT* result) {
  return SWnd::ReflectLastMsg(reinterpret_cast<HWND>(SWndThreadState::Get().m_current.m_lParam), result) != 0;
}

int SWnd::OnVKeyToItem(UINT, SWnd*, UINT) {
  LRESULT result = 0;
  return static_cast<int>(ReflectToLParam(&result) ? result : Default());
}

int SWnd::OnCharToItem(UINT, SWnd*, UINT) {
  LRESULT result = 0;
  return static_cast<int>(ReflectToLParam(&result) ? result : Default());
}

void SWnd::OnHScroll(UINT, UINT, SScrollBar*) {
  LRESULT result = 0;
  if (!ReflectToLParam(&result)) Default();
}

void SWnd::OnVScroll(UINT, UINT, SScrollBar*) {
  LRESULT result = 0;
  if (!ReflectToLParam(&result)) Default();
}

// --- changes of the system's appearance ---

// The system tells top-level windows only.
static bool IsTopLevel(HWND window) { return (::GetWindowLongW(window, GWL_STYLE) & WS_CHILD) == 0; }

void SWnd::PassOnAppearance(int dpi) {
  if (!IsTopLevel(m_hWnd)) return;
  SUpdateUISysData(dpi);
  const SCurrentMessage current = SWndThreadState::Get().m_current;
  SendMessageToDescendants(current.m_message, current.m_wParam, current.m_lParam, 1, 1);
}

void SWnd::OnSysColorChange() {
  const HWND window = m_hWnd;
  Default();
  if (FromHandlePermanent(window) == this) PassOnAppearance();
}

void SWnd::OnSettingChange(UINT, LPCWSTR) {
  const HWND window = m_hWnd;
  Default();
  if (FromHandlePermanent(window) == this) PassOnAppearance();
}

void SWnd::OnFontChange() {
  const HWND window = m_hWnd;
  Default();
  if (FromHandlePermanent(window) == this) PassOnAppearance();
}

// The children first: the window is laid out again with the place that the message suggests.
LRESULT SWnd::OnDpiChanged(WPARAM wParam, LPARAM) {
  const HWND window = m_hWnd;
  PassOnAppearance(LOWORD(wParam));
  return FromHandlePermanent(window) == this ? Default() : 0;
}

// A top-level window of the library has passed WM_DPICHANGED on. Another one does not, but the system tells each of its
// children.
LRESULT SWnd::OnDpiChangedAfterParent(WPARAM, LPARAM) {
  if (FromHandlePermanent(::GetAncestor(m_hWnd, GA_ROOT)) != nullptr) return Default();
  const UINT dpi = ::GetDpiForWindow(m_hWnd);
  SUpdateUISysData(static_cast<int>(dpi));
  return SendMessageW(WM_DPICHANGED, MAKEWPARAM(dpi, dpi));
}

// --- the state of menu items ---

// Every item is asked for before it is shown. An item that opens a menu with commands of its own is left alone.
void SWnd::OnInitMenuPopup(SMenu* menu, UINT, int isSystemMenu) {
  if (isSystemMenu || menu == nullptr) {
    Default();
    return;
  }
  const HMENU handle = menu->GetSafeHandle();
  const int count = ::GetMenuItemCount(handle);
  for (int i = 0; i < count; ++i) {
    const UINT id = ::GetMenuItemID(handle, i);
    if (id == 0 || id == static_cast<UINT>(-1)) continue;
    SCmdUI ui;
    ui.m_id = id;
    ui.m_index = static_cast<UINT>(i);
    ui.m_menu = menu;
    ui.m_sender = this;
    ui.DoUpdate(this, 1);
    // A handler may have changed the menu.
    if (::GetMenuItemCount(handle) != count) break;
  }
}
