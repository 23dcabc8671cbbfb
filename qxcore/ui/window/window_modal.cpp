// Modal loops. Each one has a record on the stack, so that loops nest and survive their window.

#include "qxcore/ui/app/application.h"
#include "qxcore/ui/window/internal/modal_loop.h"
#include "qxcore/ui/window/window.h"

SModalLoop::SModalLoop(SWnd* window)
    : m_state(SWndThreadState::Get()), m_record{window, -1, false, m_state.m_modalLoops} {
  m_state.m_modalLoops = &m_record;
}

SModalLoop::~SModalLoop() { m_state.m_modalLoops = m_record.m_outer; }

SWndThreadState::ModalLoop* SModalLoop::InnermostOf(const SWnd* window) {
  SWndThreadState::ModalLoop* loop = SWndThreadState::Get().m_modalLoops;
  while (loop != nullptr && (loop->m_window != window || loop->m_hasEnded)) loop = loop->m_outer;
  return loop;
}

bool SModalLoop::Exists(const SWnd* window) {
  SWndThreadState::ModalLoop* loop = SWndThreadState::Get().m_modalLoops;
  while (loop != nullptr && loop->m_window != window) loop = loop->m_outer;
  return loop != nullptr;
}

// The object is touched only while it exists.
bool SModalLoop::Continues() const {
  return !m_record.m_hasEnded && m_record.m_window != nullptr && m_record.m_window->ContinueModal();
}

namespace {

bool IsQueueEmpty() {
  MSG message;
  return !::PeekMessageW(&message, nullptr, 0, 0, PM_NOREMOVE);
}

// Takes one message without an application object.
int PumpWithoutApp() {
  MSG message;
  if (::GetMessageW(&message, nullptr, 0, 0) <= 0) return 0;
  if (!SWnd::WalkPreTranslateTree(nullptr, &message)) {
    ::TranslateMessage(&message);
    ::DispatchMessageW(&message);
  }
  return SSent(1);
}

}  // namespace

int SWnd::IsRunningModalLoop() const { return SModalLoop::InnermostOf(this) != nullptr; }

int SWnd::ContinueModal() { return SModalLoop::InnermostOf(this) != nullptr && m_hWnd != nullptr; }

// The loop may wait for a message, perhaps on behalf of an inner one.
void SWnd::EndModalLoop(int result) {
  SWndThreadState::ModalLoop* loop = SModalLoop::InnermostOf(this);
  if (loop == nullptr) return;
  loop->m_result = result;
  loop->m_hasEnded = true;
  ::PostMessageW(m_hWnd, WM_NULL, 0, 0);
}

int SWnd::RunModalLoop(DWORD flags) { return SModalLoop(this).Run(flags); }

int SModalLoop::Run(DWORD flags) {
  SWnd* window = m_record.m_window;
  SWinApp* app = SGetApp();
  bool mustShow = (flags & kSModalShowOnIdle) != 0 && !window->IsWindowVisible();
  bool mayIdle = true;
  while (Continues()) {
    if (mayIdle && IsQueueEmpty()) {
      mayIdle = false;
      if (mustShow) {
        mustShow = false;
        window->ShowWindow(SW_SHOWNORMAL);
        if (m_record.m_window != nullptr) window->UpdateWindow();
      } else if (app != nullptr && (flags & kSModalNoIdle) == 0) {
        app->DoIdle();
      }
      continue;
    }
    if (!(app != nullptr ? app->PumpMessage() : PumpWithoutApp())) {
      // The quit belongs to the loop around this one.
      ::PostQuitMessage(app != nullptr ? static_cast<int>(app->CurrentMessage().wParam) : 0);
      break;
    }
    mayIdle = true;
  }
  return m_record.m_result;
}
