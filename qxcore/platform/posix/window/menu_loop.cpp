// The loop itself: from its first message to its last.

#include "qxcore/platform/posix/window/menu_loop.h"

#include "qxcore/platform/posix/window/queue.h"
#include "qxcore/platform/posix/window/send.h"

namespace platform::model {

constexpr UINT kNothing = 0xFFFF;

MenuLoop::~MenuLoop() {
  if (!m_hasBegun) return;
  Leave();
  for (const Level& level : m_levels)
    if (IsWindow(level.popup)) DestroyWindow(level.popup);
}

bool MenuLoop::Begin() {
  Thread* thread = CurrentThread();
  {
    const Guard guard;
    if (thread->inMenuLoop) return false;
    thread->inMenuLoop = true;
    thread->menuOwner = m_owner;
  }
  m_hasBegun = true;
  SetCapture(m_owner);
  Send(m_owner, WM_ENTERMENULOOP, m_isBar ? FALSE : TRUE);
  Send(m_owner, WM_SETCURSOR, reinterpret_cast<WPARAM>(m_owner), MAKELPARAM(HTCAPTION, 0));
  if (Notifies()) Send(m_owner, WM_INITMENU, reinterpret_cast<WPARAM>(Top().menu));
  return true;
}

void MenuLoop::Leave() {
  Thread* thread = CurrentThread();
  const Guard guard;
  thread->inMenuLoop = false;
  thread->menuOwner = nullptr;
  m_hasBegun = false;
}

// Returns the chosen command, or 0.
UINT MenuLoop::Run() {
  MSG message;
  while (!m_isOver && Continues()) {
    if (!PeekMessageW(&message, nullptr, 0, 0, PM_NOREMOVE)) {
      Send(m_owner, WM_ENTERIDLE, MSGF_MENU, reinterpret_cast<LPARAM>(Deepest().popup));
      if (!m_isOver && Continues()) WaitForAny();
      continue;
    }
    if (IsPressBeside(message)) break;
    if (!PeekMessageW(&message, nullptr, 0, 0, PM_REMOVE)) continue;
    if (message.message == WM_QUIT) {
      PostQuitMessage(static_cast<int>(message.wParam));
      break;
    }
    if (!TakeMouse(message) && !TakeKey(message)) {
      TranslateMessage(&message);
      DispatchMessageW(&message);
    }
  }
  return m_command;
}

void MenuLoop::End() {
  Leave();
  if (GetCapture() == m_owner) ReleaseCapture();
  while (m_levels.size() > 1) Close();
  CloseTop();
  if (Notifies()) Send(m_owner, WM_MENUSELECT, MAKEWPARAM(0, kNothing), 0);
  Send(m_owner, WM_EXITMENULOOP, m_isBar ? FALSE : TRUE);
  if (m_command == 0 || m_flags & TPM_RETURNCMD) return;
  PostMessageW(m_owner, m_isSystemCommand ? WM_SYSCOMMAND : WM_COMMAND, m_command, 0);
}

bool MenuLoop::Continues() const {
  Thread* thread = CurrentThread();
  const Guard guard;
  return thread->menuOwner == m_owner && FindWindowObject(m_owner) != nullptr;
}

void MenuLoop::WaitForAny() {
  Thread* thread = CurrentThread();
  MSG message;
  const Guard guard;
  while (thread->menuOwner == m_owner && !TakeMessage(thread, &message, {nullptr, 0, 0}, false)) WaitForMessage(thread);
}

}  // namespace platform::model
