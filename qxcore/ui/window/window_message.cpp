// The road of a message: from the window procedure through the object to its handler.

#include "qxcore/core/handle_map.h"
#include "qxcore/platform/internal/own_window.h"
#include "qxcore/ui/app/temp_maps.h"
#include "qxcore/ui/frame/dialog.h"
#include "qxcore/ui/window/internal/cross_thread.h"
#include "qxcore/ui/window/internal/guard.h"
#include "qxcore/ui/window/internal/message_cache.h"
#include "qxcore/ui/window/window.h"

namespace {

// The message that the thread is handling, for as long as it is; then the outer one is current again.
class CurrentMessage {
 public:
  CurrentMessage(SWndThreadState& state, const SCurrentMessage& message) : m_state(state), m_outer(state.m_current) {
    state.m_current = message;
    SLockTempMaps();
  }
  CurrentMessage(const CurrentMessage&) = delete;
  CurrentMessage& operator=(const CurrentMessage&) = delete;
  ~CurrentMessage() {
    m_state.m_current = m_outer;
    SUnlockTempMaps(0);
  }

 private:
  SWndThreadState& m_state;
  const SCurrentMessage m_outer;
};

// The shapes that handle messages, a bit each: 1 to 52 without those of commands.
constexpr std::uint64_t Bit(int shape) { return std::uint64_t{1} << shape; }
constexpr std::uint64_t kMessageShapes = (Bit(53) - Bit(1)) & ~(Bit(2) | Bit(4) | Bit(47) | Bit(49) | Bit(50));
bool HandlesMessages(std::uintptr_t shape) { return shape <= 52 && (kMessageShapes >> shape & 1) != 0; }

// The object of a window, or null. Messages come in runs for one window, so the last answer is remembered.
SWnd* ObjectOf(SWndThreadState& state, HWND window) {
  const unsigned changes = SWnd::HandleMap().GetPermanentChanges();
  if (window != state.m_lastAsked || changes != state.m_lastChanges) {
    state.m_lastObject = SWnd::FromHandlePermanent(window);
    state.m_lastAsked = window;
    state.m_lastChanges = changes;
  }
  return state.m_lastObject;
}

// What a message returns whose handler threw.
LRESULT RefusalOf(UINT message) { return message == WM_CREATE ? -1 : 0; }

}  // namespace

LRESULT CALLBACK SWindowProcedure(HWND window, UINT message, WPARAM wParam, LPARAM lParam) {
  SWndThreadState& state = SWndThreadState::Get();
  state.m_lastOwn = window;
  const LRESULT result = SGuarded(state, RefusalOf(message), [&] {
    SWnd* object = ObjectOf(state, window);
    if (object == nullptr) return ::DefWindowProcW(window, message, wParam, lParam);
    const CurrentMessage current(state, {window, message, wParam, lParam});
    if (message == WM_INITDIALOG && object->IsKindOf(&SDlg::classSDlg)) {
      return static_cast<SDlg*>(object)->HandleInitDialog(wParam, lParam);
    }
    return object->WindowProc(message, wParam, lParam);
  });
  if (message == WM_NCDESTROY) state.m_lastOwn = nullptr;
  if (state.HasException()) [[unlikely]]
    SCrossThreadSend::Deliver(window, message, wParam, lParam);
  return result;
}

LRESULT SWnd::WindowProc(UINT message, WPARAM wParam, LPARAM lParam) {
  LRESULT result = 0;
  if (OnWndMsg(message, wParam, lParam, &result)) return result;
  return DefWindowProcW(message, wParam, lParam);
}

int SWnd::OnWndMsg(UINT message, WPARAM wParam, LPARAM lParam, LRESULT* result) {
  if (message == WM_COMMAND) {
    const int handled = OnCommand(wParam, lParam);
    if (handled && result != nullptr) *result = 1;
    return handled;
  }
  if (message == WM_NOTIFY) return OnNotify(wParam, lParam, result);
  const SMsgEntry* entry = SFindInCache(GetMessageMap(), message);
  if (entry == nullptr) return 0;
  return CallMapped(*entry, wParam, lParam, result);
}

// Shapes that are no shapes, and those of commands, handle no message. A registered entry's shape is fixed; its
// signature is an address.
int SWnd::CallMapped(const SMsgEntry& entry, WPARAM wParam, LPARAM lParam, LRESULT* result) {
  if (entry.m_message != kSMsgRegistered && !HandlesMessages(entry.m_signature.m_number)) return 0;
  const LRESULT returned = entry.m_handler(this, wParam, lParam);
  if (result != nullptr) *result = returned;
  return 1;
}

LRESULT SWnd::DefWindowProcW(UINT message, WPARAM wParam, LPARAM lParam) {
  if (m_superWndProc != nullptr) return SSent(::CallWindowProcW(m_superWndProc, m_hWnd, message, wParam, lParam));
  if (const WNDPROC super = GetSuperWndProc()) {
    return SSent(::CallWindowProcW(super, m_hWnd, message, wParam, lParam));
  }
  return SSent(::DefWindowProcW(m_hWnd, message, wParam, lParam));
}

LRESULT SWnd::Default() {
  const SCurrentMessage& current = SWndThreadState::Get().m_current;
  return DefWindowProcW(current.m_message, current.m_wParam, current.m_lParam);
}

// The system is asked whose window it is only where the thread does not remember it.
LRESULT SWnd::SendMessageW(UINT message, WPARAM wParam, LPARAM lParam) const {
  SWndThreadState& state = SWndThreadState::Get();
  LRESULT result = 0;
  if (m_hWnd == state.m_lastOwn || platform::IsOwnWindow(m_hWnd)) [[likely]] {
    result = ::SendMessageW(m_hWnd, message, wParam, lParam);
  } else {
    const SCrossThreadSend send(m_hWnd, message, wParam, lParam);
    result = ::SendMessageW(m_hWnd, message, wParam, lParam);
    send.ThrowException();
  }
  state.ThrowException();
  return result;
}

int SWnd::PostMessageW(UINT message, WPARAM wParam, LPARAM lParam) const {
  return ::PostMessageW(m_hWnd, message, wParam, lParam);
}

// The next sibling is asked for before the message is sent: the child may be gone afterwards.
static void SendToChildren(HWND parent, const SCurrentMessage& message, bool deep, bool onlyPermanent) {
  HWND next = nullptr;
  for (HWND child = ::GetWindow(parent, GW_CHILD); child != nullptr; child = next) {
    next = ::GetWindow(child, GW_HWNDNEXT);
    if (!onlyPermanent || SWnd::FromHandlePermanent(child) != nullptr) {
      SSent(::SendMessageW(child, message.m_message, message.m_wParam, message.m_lParam));
    }
    if (deep) SendToChildren(child, message, deep, onlyPermanent);
  }
}

void SWnd::SendMessageToDescendants(UINT message, WPARAM wParam, LPARAM lParam, int deep, int onlyPermanent) {
  SendToChildren(m_hWnd, {m_hWnd, message, wParam, lParam}, deep != 0, onlyPermanent != 0);
}

int SWnd::WalkPreTranslateTree(HWND stop, MSG* message) {
  for (HWND window = message->hwnd; window != nullptr; window = ::GetParent(window)) {
    SWnd* object = FromHandlePermanent(window);
    if (object != nullptr && object->PreTranslateMessage(message)) return 1;
    if (window == stop || (::GetWindowLongW(window, GWL_STYLE) & WS_CHILD) == 0) break;
  }
  return 0;
}
