#include "qxcore/ui/frame/frame.h"

#include <utility>

#include "qxcore/core/exception.h"
#include "qxcore/ui/app/application.h"
#include "qxcore/ui/frame/view.h"
#include "qxcore/ui/window/internal/resources.h"
#include "qxcore/ui/window/message_entries.h"
#include "qxcore/ui/window/thread_state.h"

QXCORE_IMPLEMENT_CREATABLE_CLASS(SFrameWnd, SWnd, 2)

// The wheel message of mice whose driver sends one of its own.
static const UINT g_wheelMessage = ::RegisterWindowMessageW(WTEXT("MSWHEEL_ROLLMSG"));

QXCORE_IMPLEMENT_MESSAGE_MAP(SFrameWnd, SWnd, on<WM_SETFOCUS, &SFrameWnd::OnSetFocus>(),
                             on<WM_CREATE, &SFrameWnd::OnCreate>(), on<WM_ERASEBKGND, &SFrameWnd::OnEraseBkgnd>(),
                             on<WM_HSCROLL, &SFrameWnd::OnHScroll>(), on<WM_VSCROLL, &SFrameWnd::OnVScroll>(),
                             on<WM_SETCURSOR, &SFrameWnd::OnSetCursor>(),
                             registered<&g_wheelMessage, &SFrameWnd::OnRegMouseWheel>())

constinit const SRect SFrameWnd::m_rcDefault(CW_USEDEFAULT, CW_USEDEFAULT, 0, 0);

SFrameWnd::~SFrameWnd() {
  if (m_activeView != nullptr) m_activeView->m_activeIn = nullptr;
  SetAccelTable(nullptr);
}

void SFrameWnd::PostNcDestroy() { delete this; }

// --- creation ---

int SFrameWnd::Create(LPCWSTR className, LPCWSTR title, DWORD style, const SRect& rect, SWnd* parent, LPCWSTR menuName,
                      DWORD exStyle, SCreateContext* context) {
  HMENU menu = nullptr;
  if (menuName != nullptr) {
    menu = SLoadMenu(menuName);
    if (menu == nullptr) {
      PostNcDestroy();
      return 0;
    }
  }
  const bool isDefault = rect == static_cast<const RECT&>(m_rcDefault);
  int created = 0;
  try {
    created = CreateEx(exStyle, className, title, style, rect.left, rect.top, isDefault ? CW_USEDEFAULT : rect.Width(),
                       isDefault ? CW_USEDEFAULT : rect.Height(), parent->GetSafeHwnd(), menu, context);
  } catch (...) {
    if (menu != nullptr) ::DestroyMenu(menu);
    throw;
  }
  if (!created && menu != nullptr) ::DestroyMenu(menu);
  return created;
}

int SFrameWnd::PreCreateWindow(CREATESTRUCTW* create) {
  if (create->lpszClass == nullptr) {
    create->lpszClass = SRegisterWindowClass(CS_DBLCLKS, ::LoadCursorW(nullptr, IDC_ARROW),
                                             reinterpret_cast<HBRUSH>(static_cast<ULONG_PTR>(COLOR_WINDOW + 1)),
                                             ::LoadIconW(nullptr, IDI_APPLICATION));
  }
  return SWnd::PreCreateWindow(create);
}

int SFrameWnd::OnCreate(CREATESTRUCTW* create) {
  return OnCreateHelper(create, static_cast<SCreateContext*>(create->lpCreateParams));
}

int SFrameWnd::OnCreateHelper(CREATESTRUCTW* create, SCreateContext* context) {
  if (SWnd::OnCreate(create) == -1) return -1;
  m_isInLayout = false;
  if (!OnCreateClient(create, context)) return -1;
  RecalcLayout();
  return 0;
}

int SFrameWnd::OnCreateClient(CREATESTRUCTW*, SCreateContext* context) {
  if (context == nullptr || context->m_viewClass == nullptr) return 1;
  return CreateView(context) != nullptr;
}

// A view deletes itself, whether its creation succeeds or not; an object of another class that is no window is
// not one of ours to keep.
SWnd* SFrameWnd::CreateView(SCreateContext* context, UINT id) {
  SObject* object = context->m_viewClass->CreateObject();
  SWnd* window = SObjectCast<SWnd>(object, &SWnd::classSWnd);
  if (window == nullptr) {
    delete object;
    return nullptr;
  }
  if (!window->Create(nullptr, nullptr, WS_CHILD | WS_VISIBLE, SRect(), this, id, context)) return nullptr;
  if (SView* view = SObjectCast<SView>(window, &SView::classSView); view != nullptr && m_activeView == nullptr) {
    SetActiveView(view, 0);
  }
  return window;
}

// --- the view ---

void SFrameWnd::SetActiveView(SView* view, int notify) {
  SView* former = std::exchange(m_activeView, view);
  if (former == view) return;
  if (former != nullptr) former->m_activeIn = nullptr;
  if (view != nullptr) {
    if (view->m_activeIn != nullptr) view->m_activeIn->m_activeView = nullptr;
    view->m_activeIn = this;
  }
  if (!notify) return;
  if (former != nullptr) former->OnActivateView(0, view, former);
  // The first call may have changed the choice.
  if (view != nullptr && m_activeView == view) view->OnActivateView(1, view, former);
}

void SFrameWnd::OnSetFocus(SWnd* oldFocus) {
  if (m_activeView != nullptr) {
    m_activeView->SetFocus();
  } else {
    SWnd::OnSetFocus(oldFocus);
  }
}

// A view covers the client area and paints all of it.
int SFrameWnd::OnEraseBkgnd(SDC*) { return m_activeView != nullptr ? 1 : static_cast<int>(Default()); }

// The frame's own scroll bars belong to the view.
bool SFrameWnd::PassToView() {
  const SCurrentMessage current = SWndThreadState::Get().m_current;
  if (m_activeView == nullptr || current.m_lParam != 0) return false;
  m_activeView->SendMessageW(current.m_message, current.m_wParam, current.m_lParam);
  return true;
}

void SFrameWnd::OnHScroll(UINT code, UINT position, SScrollBar* bar) {
  if (!PassToView()) SWnd::OnHScroll(code, position, bar);
}

void SFrameWnd::OnVScroll(UINT code, UINT position, SScrollBar* bar) {
  if (!PassToView()) SWnd::OnVScroll(code, position, bar);
}

int SFrameWnd::OnSetCursor(SWnd*, UINT, UINT) {
  if (const SWinApp* app = SGetApp(); app != nullptr && app->GetWaitCount() > 0) {
    RestoreWaitCursor();
    return 1;
  }
  return static_cast<int>(Default());
}

// The message carries the turn alone; the keys are asked for.
LRESULT SFrameWnd::OnRegMouseWheel(WPARAM wParam, LPARAM lParam) {
  const auto isDown = [](int key) { return ::GetKeyState(key) < 0; };
  const WORD keys = static_cast<WORD>((isDown(VK_CONTROL) ? MK_CONTROL : 0) | (isDown(VK_SHIFT) ? MK_SHIFT : 0));
  HWND target = ::GetFocus();
  if (target == nullptr || target == m_hWnd) target = m_activeView->GetSafeHwnd();
  if (target == nullptr) return 0;
  return SSent(::SendMessageW(target, WM_MOUSEWHEEL, MAKEWPARAM(keys, static_cast<WORD>(wParam)), lParam));
}

// --- layout ---

int SFrameWnd::OnWndMsg(UINT message, WPARAM wParam, LPARAM lParam, LRESULT* result) {
  const HWND window = m_hWnd;
  const int handled = SWnd::OnWndMsg(message, wParam, lParam, result);
  if (FromHandlePermanent(window) != this) return handled;
  if (message == WM_DPICHANGED && lParam != 0) MoveWindow(*reinterpret_cast<const RECT*>(lParam));
  const bool isSized = message == WM_SIZE && wParam != SIZE_MINIMIZED;
  if (isSized || message == WM_DPICHANGED || message == WM_SETTINGCHANGE) RecalcLayout();
  return handled;
}

void SFrameWnd::RecalcLayout() {
  if (m_hWnd == nullptr || std::exchange(m_isInLayout, true)) return;
  // A bar may end the frame.
  struct Running {
    SFrameWnd* frame;
    const HWND window = frame->m_hWnd;
    ~Running() {
      if (FromHandlePermanent(window) == frame) frame->m_isInLayout = false;
    }
  } running{this};
  SSizeParent layout{::BeginDeferWindowPos(8), GetClientRect(), SSize(), 1};
  if (layout.m_batch == nullptr) throw SEOutOfMemory();
  HWND client = nullptr;
  for (HWND child = ::GetWindow(m_hWnd, GW_CHILD); child != nullptr;) {
    const HWND next = ::GetWindow(child, GW_HWNDNEXT);
    if (::GetWindowLongPtrW(child, GWLP_ID) == static_cast<LONG_PTR>(kSFirstPane)) {
      client = child;
    } else {
      SSent(::SendMessageW(child, kSMsgSizeParent, 0, reinterpret_cast<LPARAM>(&layout)));
    }
    child = ::IsWindow(child) ? ::GetWindow(child, GW_HWNDNEXT) : next;
  }
  if (::IsWindow(client) && layout.m_batch != nullptr) {
    layout.m_batch = ::DeferWindowPos(layout.m_batch, client, nullptr, layout.m_rect.left, layout.m_rect.top,
                                      std::max(layout.m_rect.Width(), 0), std::max(layout.m_rect.Height(), 0),
                                      SWP_NOZORDER | SWP_NOACTIVATE);
  }
  const bool isShort = layout.m_batch == nullptr && ::GetLastError() == ERROR_NOT_ENOUGH_MEMORY;
  if (layout.m_batch != nullptr) ::EndDeferWindowPos(layout.m_batch);
  SWndThreadState::Get().ThrowException();
  if (isShort) throw SEOutOfMemory();
}

// --- accelerators, activation, routing ---

int SFrameWnd::LoadAccelTable(LPCWSTR name) {
  const HACCEL table = SLoadAccelerators(name);
  if (table == nullptr) return 0;
  SetAccelTable(table);
  return 1;
}

void SFrameWnd::SetAccelTable(HACCEL table) {
  if (const HACCEL former = std::exchange(m_accelerators, table); former != nullptr && former != table) {
    ::DestroyAcceleratorTable(former);
  }
}

HACCEL SFrameWnd::GetDefaultAccelerator() { return m_accelerators; }

int SFrameWnd::PreTranslateMessage(MSG* message) {
  if (message->message < WM_KEYFIRST || message->message > WM_KEYLAST) return 0;
  const HACCEL table = GetDefaultAccelerator();
  return table != nullptr && SSent(::TranslateAcceleratorW(m_hWnd, table, message));
}

SFrameWnd* SFrameWnd::GetActiveFrame() { return this; }

void SFrameWnd::ActivateFrame(int show) {
  if (show < 0) show = IsIconic() ? SW_RESTORE : SW_SHOW;
  ShowWindow(show);
  SSent(::BringWindowToTop(m_hWnd));
}

int SFrameWnd::OnCmdMsg(UINT id, int code, void* extra, S_CMDHANDLERINFO* info) {
  if (m_activeView != nullptr && m_activeView->OnCmdMsg(id, code, extra, info)) return 1;
  if (SCmdTarget::OnCmdMsg(id, code, extra, info)) return 1;
  SWinApp* app = SGetApp();
  return app != nullptr && app->OnCmdMsg(id, code, extra, info);
}
