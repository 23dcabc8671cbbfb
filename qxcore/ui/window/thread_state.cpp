#include "qxcore/ui/window/thread_state.h"

#include <new>
#include <utility>

#include "qxcore/ui/app/error_report.h"

// Constant-initialised and without a destructor, so that reaching it costs no guard; and placed where the loader puts
// it, so that it costs no call.
[[gnu::tls_model("initial-exec")]] static constinit thread_local SWndThreadState t_state;

SWndThreadState& SWndThreadState::Get() { return t_state; }

static void RemoveHook(HHOOK& hook) {
  if (hook != nullptr) ::UnhookWindowsHookEx(std::exchange(hook, nullptr));
}

void SWndThreadState::RemoveHooks() {
  RemoveHook(m_creationHook);
  RemoveHook(m_secondHook);
}

void SWndThreadState::KeepException(const std::exception_ptr& exception) noexcept {
  if (m_exception != nullptr) {
    SReportException(exception);
  } else {
    m_exception = new (m_storage) std::exception_ptr(exception);
  }
}

std::exception_ptr SWndThreadState::TakeException() noexcept {
  if (m_exception == nullptr) return nullptr;
  std::exception_ptr taken = std::move(*m_exception);
  std::exchange(m_exception, nullptr)->~exception_ptr();
  return taken;
}

void SWndThreadState::ThrowKept() { std::rethrow_exception(TakeException()); }
