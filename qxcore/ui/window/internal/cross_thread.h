// A message that is sent to a window of another thread: an exception of its handler travels to the sender.
#pragma once

#include <exception>

#include "qxcore/platform/win32.h"

// Stands around a call that sends to another thread. The receiver finds it by the message.
class SCrossThreadSend {
 public:
  SCrossThreadSend(HWND window, UINT message, WPARAM wParam, LPARAM lParam) noexcept;
  SCrossThreadSend(const SCrossThreadSend&) = delete;
  SCrossThreadSend& operator=(const SCrossThreadSend&) = delete;
  ~SCrossThreadSend();

  // Throws what the receiver's handler threw.
  void ThrowException() const {
    if (m_exception != nullptr) std::rethrow_exception(m_exception);
  }

  // On the receiver's thread, after the message was handled: hands the exception that its thread keeps to the
  // sender of this message, when that is another thread.
  static void Deliver(HWND window, UINT message, WPARAM wParam, LPARAM lParam) noexcept;

 private:
  bool IsOf(HWND window, UINT message, WPARAM wParam, LPARAM lParam, DWORD receiver) const noexcept;

  HWND m_window;
  UINT m_message;
  WPARAM m_wParam;
  LPARAM m_lParam;
  DWORD m_receiver;  // the thread of the window; 0 for an unknown window
  std::exception_ptr m_exception;
  SCrossThreadSend* m_next = nullptr;
};
