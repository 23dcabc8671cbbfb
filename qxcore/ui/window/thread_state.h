// SWndThreadState: what the window framework keeps for each thread.
//
// A window is attached to its object on the thread that creates it, and Default() passes on the message that the
// thread is handling. The state belongs to the calling thread and lives as long as the thread.
#pragma once

#include <exception>

#include "qxcore/platform/export.h"
#include "qxcore/platform/win32.h"

class SWnd;

// The message that a thread is handling; all zero outside of any.
struct SCurrentMessage {
  HWND m_hWnd;      // the window that received it
  UINT m_message;   // the message itself
  WPARAM m_wParam;  // with its
  LPARAM m_lParam;  // arguments
};

class QXCORE_API SWndThreadState {
 public:
  // One window that is being created; a list on the stack, innermost first.
  struct Creation {
    SWnd* m_object;     // whose window it is
    bool m_hasEnded;    // PostNcDestroy was called: the object may be gone
    Creation* m_outer;  // the one around it, or null
  };

  // One modal loop that runs; a list on the stack, innermost first.
  struct ModalLoop {
    SWnd* m_window;      // whose loop it is; null once the object is gone
    int m_result;        // what EndModalLoop was given
    bool m_hasEnded;     // the loop ends as soon as it looks
    ModalLoop* m_outer;  // the one around it, or null
  };

  constexpr SWndThreadState() noexcept = default;
  SWndThreadState(const SWndThreadState&) = delete;
  SWndThreadState& operator=(const SWndThreadState&) = delete;

  // The state of the calling thread.
  static SWndThreadState& Get();

  HWND m_lastOwn = nullptr;           // the window of this thread that got a message last, until its end
  HWND m_lastAsked = nullptr;         // the window whose object was asked for last,
  SWnd* m_lastObject = nullptr;       // that object, or null,
  unsigned m_lastChanges = 0;         // and what SHandleMap::GetPermanentChanges was then
  SWnd* m_pending = nullptr;          // the object whose window is being created, until the hook has seen it
  SCurrentMessage m_current = {};     // the innermost message that is being handled
  HHOOK m_creationHook = nullptr;     // installed while m_pending waits for its window
  HHOOK m_secondHook = nullptr;       // a hook of a derived class's creation; CreateEx removes it
  DLGPROC m_dialogHook = nullptr;     // called after OnInitDialog with WM_INITDIALOG; may be null
  Creation* m_creations = nullptr;    // windows that are being created
  ModalLoop* m_modalLoops = nullptr;  // loops of RunModalLoop

  // Removes both hooks where they are installed.
  void RemoveHooks();

  // --- exceptions that were thrown under a function which the system called ---

  // Keeps the exception until a call of the library throws it on. The first one stays; a later one goes to the
  // error reporter.
  void KeepException(const std::exception_ptr& exception) noexcept;
  // True while an exception is kept.
  bool HasException() const { return m_exception != nullptr; }
  // Throws the kept exception, if there is one, and forgets it.
  void ThrowException() {
    if (m_exception != nullptr) [[unlikely]]
      ThrowKept();
  }
  // Takes the kept exception out; null when nothing is kept.
  std::exception_ptr TakeException() noexcept;

 private:
  [[noreturn]] void ThrowKept();

  std::exception_ptr* m_exception = nullptr;  // points to m_storage, or is null
  alignas(std::exception_ptr) unsigned char m_storage[sizeof(std::exception_ptr)] = {};
};

// Passes on the result of a system call that may have sent messages, and throws what a handler threw meanwhile.
template <class T>
T SSent(T result) {
  SWndThreadState::Get().ThrowException();
  return result;
}
