// How windows come into being and are bound to their objects.

#include "qxcore/core/exception.h"
#include "qxcore/ui/app/application.h"
#include "qxcore/ui/window/internal/creation.h"
#include "qxcore/ui/window/internal/guard.h"
#include "qxcore/ui/window/window.h"

void SWindowCreation::Install(SWndThreadState& state, SWnd* object) {
  if (state.m_pending == object) return;
  try {
    // What is kept from before is not this creation's.
    state.ThrowException();
    if (state.m_creationHook == nullptr) {
      state.m_creationHook = ::SetWindowsHookExW(WH_CBT, &Hook, nullptr, ::GetCurrentThreadId());
      const DWORD error = ::GetLastError();
      if (state.m_creationHook == nullptr && error == ERROR_NOT_ENOUGH_MEMORY) throw SEOutOfMemory();
      if (state.m_creationHook == nullptr) throw SECOMException(HResult(error));
    }
  } catch (...) {
    object->PostNcDestroy();
    throw;
  }
  state.m_pending = object;
}

// The hook sees a window before its first message. Its refusal, nonzero, makes the creation fail.
LRESULT CALLBACK SWindowCreation::Hook(int code, WPARAM wParam, LPARAM lParam) {
  return SGuarded(LRESULT{1}, [=] {
    SWndThreadState& state = SWndThreadState::Get();
    if (code != HCBT_CREATEWND || state.m_pending == nullptr) {
      return ::CallNextHookEx(state.m_creationHook, code, wParam, lParam);
    }
    Bind(*std::exchange(state.m_pending, nullptr), reinterpret_cast<HWND>(wParam));
    const HHOOK hook = std::exchange(state.m_creationHook, nullptr);
    const LRESULT result = ::CallNextHookEx(hook, code, wParam, lParam);
    ::UnhookWindowsHookEx(hook);
    return result;
  });
}

void SWindowCreation::Bind(SWnd& object, HWND window) {
  object.Attach(window);
  const WNDPROC previous = SetProcedure(window, &SWindowProcedure);
  if (previous != &SWindowProcedure) object.SetSuperWndProc(previous);
}

WNDPROC SWindowCreation::SetProcedure(HWND window, WNDPROC procedure) {
  return reinterpret_cast<WNDPROC>(::SetWindowLongPtrW(window, GWLP_WNDPROC, reinterpret_cast<LONG_PTR>(procedure)));
}

// A window that was bound and then failed without its last message is let go; one that exists although a handler
// threw is destroyed, for the caller learns of no window. The object is touched only while it has not been told of
// the end.
void SWindowCreation::Finish(SWndThreadState& state, const SWndThreadState::Creation& creation, HWND window) {
  const DWORD error = ::GetLastError();
  state.m_creations = creation.m_outer;
  state.m_pending = nullptr;
  state.RemoveHooks();
  if (window == nullptr && !creation.m_hasEnded) {
    if (creation.m_object->m_hWnd != nullptr) creation.m_object->LeaveHandleMap();
    creation.m_object->PostNcDestroy();
  }
  if (window != nullptr && state.HasException()) ::DestroyWindow(window);
  state.ThrowException();
  ::SetLastError(error);
}

HRESULT SWindowCreation::HResult(DWORD error) {
  return static_cast<HRESULT>(error == 0 ? 0x80004005u : 0x80070000u | (error & 0xFFFF));
}

int SWnd::Create(LPCWSTR className, LPCWSTR windowName, DWORD style, const SRect& rect, SWnd* parent, UINT id,
                 SCreateContext* context) {
  return CreateEx(0, className, windowName, style | WS_CHILD, rect.left, rect.top, rect.Width(), rect.Height(),
                  parent->GetSafeHwnd(), reinterpret_cast<HMENU>(static_cast<UINT_PTR>(id)), context);
}

int SWnd::CreateEx(DWORD exStyle, LPCWSTR className, LPCWSTR windowName, DWORD style, int x, int y, int width,
                   int height, HWND parent, HMENU menu, void* param) {
  CREATESTRUCTW create = {};
  create.dwExStyle = exStyle;
  create.lpszClass = className;
  create.lpszName = windowName;
  create.style = static_cast<LONG>(style);
  create.x = x;
  create.y = y;
  create.cx = width;
  create.cy = height;
  create.hwndParent = parent;
  create.hMenu = menu;
  create.hInstance = SGetInstance();
  create.lpCreateParams = param;
  int goesOn = 0;
  try {
    goesOn = PreCreateWindow(&create);
  } catch (...) {
    PostNcDestroy();
    throw;
  }
  if (!goesOn) {
    PostNcDestroy();
    return 0;
  }
  return SWindowCreation::Run(this, [&create] {
    return ::CreateWindowExW(create.dwExStyle, create.lpszClass, create.lpszName, static_cast<DWORD>(create.style),
                             create.x, create.y, create.cx, create.cy, create.hwndParent, create.hMenu,
                             create.hInstance, create.lpCreateParams);
  });
}

int SWnd::SubclassWindow(HWND window) {
  if (!Attach(window)) return 0;
  const WNDPROC previous = SWindowCreation::SetProcedure(window, &SWindowProcedure);
  const WNDPROC super = GetSuperWndProc();
  if (super == nullptr) {
    if (previous != &SWindowProcedure) m_superWndProc = previous;
  } else if (previous != super) {
    SWindowCreation::SetProcedure(window, previous);
  }
  return 1;
}

int SWnd::SubclassChild(int id, SWnd* child) { return child->SubclassWindow(::GetDlgItem(m_hWnd, id)); }

WNDPROC SWnd::GetSuperWndProc() const { return nullptr; }

void SWnd::SetSuperWndProc(WNDPROC procedure) { m_superWndProc = procedure; }

int SWnd::PreCreateWindow(CREATESTRUCTW* create) {
  if (create->lpszClass == nullptr) {
    create->lpszClass = SRegisterWindowClass(CS_DBLCLKS, ::LoadCursorW(nullptr, IDC_ARROW));
  }
  return 1;
}

// The attributes stand in the name, so one name is one class.
LPCWSTR SRegisterWindowClass(UINT classStyle, HCURSOR cursor, HBRUSH background, HICON icon) {
  SString name;
  const auto number = [](const void* handle) { return reinterpret_cast<unsigned long>(handle); };
  name.Format(WTEXT("SWnd:%x:%lx:%lx:%lx"), classStyle, number(cursor), number(background), number(icon));
  WNDCLASSEXW registered = {};
  registered.cbSize = sizeof(registered);
  registered.style = classStyle;
  registered.lpfnWndProc = &SWindowProcedure;
  registered.hInstance = SGetInstance();
  registered.hCursor = cursor;
  registered.hbrBackground = background;
  registered.hIcon = icon;
  registered.lpszClassName = name;
  ATOM atom = ::RegisterClassExW(&registered);
  if (atom == 0 && ::GetLastError() == ERROR_CLASS_ALREADY_EXISTS) {
    WNDCLASSEXW known = {};
    known.cbSize = sizeof(known);
    atom = static_cast<ATOM>(::GetClassInfoExW(registered.hInstance, name, &known));
  }
  if (atom == 0) throw SECOMException(SWindowCreation::HResult(::GetLastError()));
  return reinterpret_cast<LPCWSTR>(static_cast<ULONG_PTR>(atom));
}
