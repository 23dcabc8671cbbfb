// The guard around every function that the system calls: no exception leaves it.
#pragma once

#include <exception>

#include "qxcore/ui/window/thread_state.h"

// Sets an exception aside that was already kept, so that the body runs as if there were none, and puts it back:
// it came first, so one of the body's goes to the reporter. Every message passes here; without an exception it costs
// two tests.
class SExceptionsAside {
 public:
  explicit SExceptionsAside(SWndThreadState& state) : m_state(state) {
    if (state.HasException()) [[unlikely]]
      m_aside = state.TakeException();
  }
  SExceptionsAside(const SExceptionsAside&) = delete;
  SExceptionsAside& operator=(const SExceptionsAside&) = delete;
  ~SExceptionsAside() {
    if (m_aside != nullptr) [[unlikely]]
      PutBack();
  }

 private:
  [[gnu::noinline]] void PutBack() {
    const std::exception_ptr later = m_state.TakeException();
    m_state.KeepException(m_aside);
    if (later != nullptr) m_state.KeepException(later);
  }

  SWndThreadState& m_state;
  std::exception_ptr m_aside;
};

// Runs the body; when it throws, keeps the exception for the next call of the library that can throw it on, and
// returns `refusal`.
template <class Result, class Body>
Result SGuarded(SWndThreadState& state, Result refusal, Body body) noexcept {
  const SExceptionsAside aside(state);
  try {
    return body();
  } catch (...) {
    state.KeepException(std::current_exception());
    return refusal;
  }
}
template <class Result, class Body>
Result SGuarded(Result refusal, Body body) noexcept {
  return SGuarded(SWndThreadState::Get(), refusal, body);
}
