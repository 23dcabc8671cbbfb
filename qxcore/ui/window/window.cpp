#include "qxcore/ui/window/window.h"

#include "qxcore/core/handle_map.h"
#include "qxcore/platform/wide.h"
#include "qxcore/ui/app/modal_state.h"
#include "qxcore/ui/app/temp_maps.h"
#include "qxcore/ui/control/scroll_bar.h"
#include "qxcore/ui/window/thread_state.h"

QXCORE_IMPLEMENT_CREATABLE_CLASS(SWnd, SCmdTarget, 2)

namespace {

bool IsScrollBar(HWND window) {
  WCHAR name[12];
  return ::GetClassNameW(window, name, 12) == 9 && SStringView(name) == WTEXT("ScrollBar");
}

// Wrappers of windows. Handlers are given scroll bars as such, so a wrapper of one is of that class.
class WindowMap final : public SHandleMap {
 protected:
  SObject* MakeTemporary(void* handle) override {
    const HWND window = static_cast<HWND>(handle);
    SWnd* made = IsScrollBar(window) ? new SScrollBar : new SWnd;
    made->m_hWnd = window;
    return made;
  }
  // Without the handle the destructor has nothing to destroy.
  void DestroyTemporary(SObject* object) override {
    static_cast<SWnd*>(object)->m_hWnd = nullptr;
    delete object;
  }
};

}  // namespace

// Never ended: static objects of programs may outlive every order of destruction.
SHandleMap& SWnd::HandleMap() {
  static WindowMap& map = *new WindowMap;
  return map;
}

SWnd* SWnd::FromHandle(HWND window) { return static_cast<SWnd*>(HandleMap().FromHandle(window)); }

SWnd* SWnd::FromHandlePermanent(HWND window) { return static_cast<SWnd*>(HandleMap().FromHandlePermanent(window)); }

void SWnd::DeleteTempMap() { HandleMap().DeleteTempMap(); }

// Takes the pointer by value, so that no compiler concludes from `this` that it cannot be null.
static HWND HandleOrNull(const SWnd* window) { return window != nullptr ? window->m_hWnd : nullptr; }

HWND SWnd::GetSafeHwnd() const { return HandleOrNull(this); }

int SWnd::Attach(HWND window) {
  if (window == nullptr) return 0;
  HandleMap().SetPermanent(window, this);
  m_hWnd = window;
  SModalState::WindowsChanged();
  return 1;
}

HWND SWnd::Detach() {
  const HWND window = m_hWnd;
  if (window != nullptr) LeaveHandleMap();
  return window;
}

// Only this object's own entry is removed: a temporary object has none.
void SWnd::LeaveHandleMap() {
  if (FromHandlePermanent(m_hWnd) == this) HandleMap().RemovePermanent(m_hWnd);
  m_hWnd = nullptr;
}

SWnd::~SWnd() {
  for (auto* loop = SWndThreadState::Get().m_modalLoops; loop != nullptr; loop = loop->m_outer) {
    if (loop->m_window == this) loop->m_window = nullptr;
  }
  if (SWndThreadState& state = SWndThreadState::Get(); state.m_pending == this) state.m_pending = nullptr;
  if (m_hWnd == nullptr || FromHandlePermanent(m_hWnd) != this) return;
  const HWND window = m_hWnd;
  LeaveHandleMap();
  // Without an object nothing passes messages on to the control that the window was; it frees what it has with its
  // last.
  if (m_superWndProc != nullptr) ::SetWindowLongPtrW(window, GWLP_WNDPROC, reinterpret_cast<LONG_PTR>(m_superWndProc));
  ::DestroyWindow(window);
}

// A window that has a permanent object leaves the map with its last message. One of the class "SEditor" does not
// send that to the framework, and one without a permanent object has nobody to receive it. The map is asked before
// this object is touched again, for its last message may have deleted it.
int SWnd::DestroyWindow() {
  const HWND window = m_hWnd;
  if (window == nullptr) return 0;
  WCHAR name[80] = {};
  ::GetClassNameW(window, name, 80);
  const bool isEditor = platform::WideCompareNoCase(name, WTEXT("SEditor")) == 0;
  if (FromHandlePermanent(window) == nullptr) return SSent(DestroyUnowned(window));
  const int result = ::DestroyWindow(window);
  if (isEditor && FromHandlePermanent(window) == this) LeaveHandleMap();
  return SSent(result);
}

// While the window goes, handlers around it still find this object under its handle. Afterwards it is found no more,
// for the handle may be given out again; a temporary object stays alive until all of them go.
int SWnd::DestroyUnowned(HWND window) {
  const bool isTemporary = HandleMap().FromHandleTemporary(window) == this;
  SLockTempMaps();
  const int result = ::DestroyWindow(window);
  SUnlockTempMaps(0);
  if (isTemporary && HandleMap().FromHandleTemporary(window) != this) return result;
  m_hWnd = nullptr;
  HandleMap().DiscardTemporary(window);
  return result;
}

void SWnd::PostNcDestroy() {}

int SWnd::OnModalDisable(int) { return 1; }

int SWnd::UpdateData(int) { return 1; }

int SWnd::PreTranslateMessage(MSG*) { return 0; }

SScrollBar* SWnd::GetScrollBarCtrl(int) const { return nullptr; }

// An edit control is found by the system's own name of its class; classes derived from it are not.
void SWnd::SetReadOnly(int readOnly) {
  WCHAR name[30] = {};
  ::GetClassNameW(m_hWnd, name, 30);
  if (SStringView(name) == WTEXT("Edit")) {
    SendMessageW(EM_SETREADONLY, static_cast<WPARAM>(readOnly), 0);
  } else {
    EnableWindow(readOnly == 0);
  }
}

int SWnd::IsReadOnly() const {
  WCHAR name[30] = {};
  ::GetClassNameW(m_hWnd, name, 30);
  if (SStringView(name) == WTEXT("Edit")) return (GetStyle() & ES_READONLY) != 0;
  return !IsWindowEnabled();
}

int SWnd::SafeOnKillFocus(SWnd*) { return 0; }
