// A failure that waits: a read that already has something to deliver returns that, and the next one throws.
// Threads: an object belongs to one thread at a time.
#pragma once

#include <exception>
#include <utility>

// At most one exception; a later one takes the place of the former.
class SPendingFailure {
 public:
  // Keeps the exception that is being handled.
  void Keep() { m_failure = std::current_exception(); }
  // Drops the kept one.
  void Forget() { m_failure = nullptr; }
  // Whether one is kept.
  bool IsThere() const { return m_failure != nullptr; }
  // Throws what is kept, once; does nothing without one.
  void Throw() {
    if (m_failure != nullptr) std::rethrow_exception(std::exchange(m_failure, nullptr));
  }

 private:
  std::exception_ptr m_failure;
};
