#include "qxcore/ui/window/internal/cross_thread.h"

#include <mutex>

#include "qxcore/ui/window/thread_state.h"

namespace {

// The sends that are under way. The first one is the latest.
std::mutex g_mutex;
constinit SCrossThreadSend* g_sends = nullptr;

}  // namespace

SCrossThreadSend::SCrossThreadSend(HWND window, UINT message, WPARAM wParam, LPARAM lParam) noexcept
    : m_window(window), m_message(message), m_wParam(wParam), m_lParam(lParam) {
  m_receiver = ::GetWindowThreadProcessId(window, nullptr);
  const std::lock_guard lock(g_mutex);
  m_next = g_sends;
  g_sends = this;
}

SCrossThreadSend::~SCrossThreadSend() {
  const std::lock_guard lock(g_mutex);
  SCrossThreadSend** link = &g_sends;
  while (*link != this) link = &(*link)->m_next;
  *link = m_next;
}

bool SCrossThreadSend::IsOf(HWND window, UINT message, WPARAM wParam, LPARAM lParam, DWORD receiver) const noexcept {
  return m_window == window && m_message == message && m_wParam == wParam && m_lParam == lParam &&
         m_receiver == receiver && m_exception == nullptr;
}

void SCrossThreadSend::Deliver(HWND window, UINT message, WPARAM wParam, LPARAM lParam) noexcept {
  SWndThreadState& state = SWndThreadState::Get();
  const std::lock_guard lock(g_mutex);
  for (SCrossThreadSend* send = g_sends; send != nullptr; send = send->m_next) {
    if (send->IsOf(window, message, wParam, lParam, ::GetCurrentThreadId())) {
      send->m_exception = state.TakeException();
      return;
    }
  }
}
