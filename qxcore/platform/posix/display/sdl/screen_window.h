// One top-level window on the screen.
//
// With a window manager, the screen has what is inside of the frame and the manager draws its own frame around that;
// without one, and for windows without a caption, all of the window is there.
//
// What the user does to the window comes as an event and is kept here before it is reported, so that Show(), which the
// report leads to, finds nothing to do. Only for the thread of the display.
#pragma once

#include "qxcore/platform/posix/display/sdl/sdl.h"

namespace platform::sdl {

class ScreenWindow {
 public:
  ScreenWindow(const ShownWindow& shown, bool hasManager, SDL_Window* owner);
  ~ScreenWindow();
  ScreenWindow(const ScreenWindow&) = delete;
  ScreenWindow& operator=(const ScreenWindow&) = delete;

  HWND Handle() const { return m_handle; }
  SDL_Window* Sdl() const { return m_window; }  // null when SDL cannot make it
  bool IsPopup() const { return m_isPopup; }
  ShownWindow::State State() const { return m_state; }

  // Makes place, size and state so. Returns true when the window was moved.
  bool Show(const ShownWindow& shown);
  void Hide();
  void SetTitle(std::u16string_view title);

  // A point of the screen for one of the window's, as events have it.
  POINT OnScreen(int x, int y) const { return {m_content.left + x, m_content.top + y}; }

  // The user moved or sized the window: true when that is news, with the rectangle of the whole window.
  bool TakePlace(RECT* whole);
  // All pixels are needed again.
  void LosePixels() { m_hasAllPixels = false; }
  void Present(const ShownPixels& pixels, const RECT& changed);
  // Brings what was presented to the screen.
  void Flush();

 private:
  RECT ContentOf(const ShownWindow& shown) const;
  void ShowState(ShownWindow::State state);
  bool ShowPlace(const RECT& content);

  HWND m_handle;
  SDL_Window* m_window = nullptr;
  bool m_isFramed;  // by the window manager
  bool m_isManaged;
  bool m_isPopup;
  bool m_isShown = false;
  ShownWindow::State m_state = ShownWindow::State::Normal;
  RECT m_content{};  // what is on the screen, as the model knows it
  RECT m_frame{};    // how far the whole window reaches over that at each side
  bool m_hasAllPixels = false;
  RECT m_changed{};  // of the content, not yet on the screen
};

}  // namespace platform::sdl
