// What the control classes share: a state each, and the messages that all of them answer alike.
//
// A class keeps its state behind the first pointer of its window's extra bytes, from WM_NCCREATE to WM_NCDESTROY.
#pragma once

#include "qxcore/platform/posix/window/memory.h"
#include "qxcore/platform/posix/window/rect.h"

namespace platform::controls {

// The extra bytes that a control class registers.
inline constexpr int kStateBytes = sizeof(LONG_PTR);

// The state of a control; null before WM_NCCREATE and after WM_NCDESTROY.
template <class State>
State* StateOf(HWND window) {
  return reinterpret_cast<State*>(GetWindowLongPtrW(window, 0));
}

// Makes the state; false without memory, and creating the window fails.
template <class State>
bool MakeState(HWND window) {
  return model::OrNoMemory<bool>(false, [&] {
    SetWindowLongPtrW(window, 0, reinterpret_cast<LONG_PTR>(new State));
    return true;
  });
}

template <class State>
void FreeState(HWND window) {
  delete StateOf<State>(window);
  SetWindowLongPtrW(window, 0, 0);
}

inline DWORD StyleOf(HWND window) { return static_cast<DWORD>(GetWindowLongW(window, GWL_STYLE)); }

// The area inside the window, from the origin on.
RECT ClientOf(HWND window);

// Sends WM_COMMAND with a notification to the control's parent.
void NotifyCommand(HWND control, UINT code);

// WM_SETTEXT of a control that shows its text. Returns TRUE.
LRESULT TakeText(HWND window, WPARAM wParam, LPARAM lParam);

// The context of a WM_PAINT or WM_PRINTCLIENT message with the control's font selected; the system's own paint
// cycle unless wParam brings a context. Null when there is nothing to paint on.
class Painting {
 public:
  Painting(HWND control, WPARAM wParam, HFONT font);
  ~Painting();
  Painting(const Painting&) = delete;
  Painting& operator=(const Painting&) = delete;
  operator HDC() const { return m_dc; }

 private:
  HWND m_control;
  PAINTSTRUCT m_paint{};
  bool m_isOwn;
  HDC m_dc;
  HGDIOBJ m_formerFont = nullptr;
};

// The procedure of a control class: what is common to all, and `handle` for the rest. A state with a member `font`
// keeps the font of WM_SETFONT there.
template <class State, void (*paint)(HWND, const State*, HDC), LRESULT (*handle)(HWND, State*, UINT, WPARAM, LPARAM)>
LRESULT ControlMessage(HWND window, UINT message, WPARAM wParam, LPARAM lParam) {
  State* state = StateOf<State>(window);
  if (message == WM_NCCREATE && !MakeState<State>(window)) return FALSE;
  if (message == WM_NCDESTROY) FreeState<State>(window);
  if (state == nullptr || message == WM_NCDESTROY) return DefWindowProcW(window, message, wParam, lParam);
  if constexpr (requires { state->font; }) {
    if (message == WM_GETFONT) return reinterpret_cast<LRESULT>(state->font);
    if (message == WM_SETFONT) {
      state->font = reinterpret_cast<HFONT>(wParam);
      if (LOWORD(lParam)) InvalidateRect(window, nullptr, TRUE);
      return 0;
    }
  }
  return model::OrNoMemory<LRESULT>(0, [&]() -> LRESULT {
    if (message == WM_ERASEBKGND) return TRUE;
    if (message != WM_PAINT && message != WM_PRINTCLIENT) return handle(window, state, message, wParam, lParam);
    const Painting dc(window, wParam, nullptr);
    if (dc != nullptr) paint(window, state, dc);
    return 0;
  });
}

}  // namespace platform::controls
