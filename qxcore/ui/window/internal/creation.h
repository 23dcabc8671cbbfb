// How a window is bound to its object while the system creates it.
#pragma once

#include <utility>

#include "qxcore/platform/win32.h"
#include "qxcore/ui/window/thread_state.h"

class SWnd;

struct SWindowCreation {
  // Calls `create`, which returns the handle of a new window, and binds the first window that it creates to the
  // object. Returns 1, or 0 when there is no window; then PostNcDestroy has been called once, as it has when this
  // throws: what a handler threw, or SECOMException when the creation hook cannot be installed.
  template <class Create>
  static int Run(SWnd* object, Create create) {
    SWndThreadState& state = SWndThreadState::Get();
    Install(state, object);
    SWndThreadState::Creation creation{object, false, state.m_creations};
    state.m_creations = &creation;
    const HWND window = create();
    Finish(state, creation, window);
    return window != nullptr ? 1 : 0;
  }

  // Sets a window's procedure and returns the former one.
  static WNDPROC SetProcedure(HWND window, WNDPROC procedure);
  // A code of GetLastError in the form of COM.
  static HRESULT HResult(DWORD error);

 private:
  static void Install(SWndThreadState& state, SWnd* object);
  static void Finish(SWndThreadState& state, const SWndThreadState::Creation& creation, HWND window);
  static LRESULT CALLBACK Hook(int code, WPARAM wParam, LPARAM lParam);
  static void Bind(SWnd& object, HWND window);
};
