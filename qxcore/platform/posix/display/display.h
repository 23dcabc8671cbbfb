// What the window model asks of a display, and what a display reports to it. Headless is the default: nothing is
// shown, and all logic runs. QXCORE_DISPLAY names another one, which is a module of its own, loaded with the first
// window (module.h).
//
// A display serves the thread that opened it, which is the only one that hears of its events; calls from other
// threads are ignored, but for Wake() and the questions. It is never called with the model's lock held, but for the
// questions about the screen.
#pragma once

#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

#include "qxcore/platform/win32.h"

namespace platform {

// A top-level window as it is to be shown; pixels of the screen.
struct ShownWindow {
  enum class State { Normal, Minimised, Maximised };

  HWND window = nullptr;
  HWND owner = nullptr;  // stays below it; null for none
  std::u16string_view title;
  RECT rect{};    // the whole window
  RECT inside{};  // what border and caption leave of it, which a display with a window manager shows alone
  State state = State::Normal;
  bool isVisible = false;
  bool hasCaption = false;  // the window manager may give it a frame
  bool isPopup = false;     // a menu or the like: it has no frame and never gets the keyboard
  bool canSize = false;
};

// The pixels of a top-level window, frame included: 0x00RRGGBB.
struct ShownPixels {
  const std::uint32_t* pixels = nullptr;  // the top left one
  int stride = 0;                         // pixels from a row to the next
  int width = 0, height = 0;
};

// What a display reports, all of it from its Wait(). Points are on the screen.
class DisplayEvents {
 public:
  // The character of a key: the keyboard's layout decides, or the key has none.
  static constexpr char16_t kByLayout = 0xFFFF, kNoCharacter = 0;

  virtual void Mouse(UINT message, POINT point, int wheel) = 0;
  virtual void Key(WORD key, WORD scan, bool isUp, bool isExtended, char16_t character) = 0;
  // A character that no single key made, a UTF-16 code unit at a time.
  virtual void Character(char16_t unit) = 0;
  // The user moved or sized a window; the whole of it lies there now.
  virtual void Placed(HWND window, const RECT& rect) = 0;
  // The user asks for SC_CLOSE, SC_MINIMIZE, SC_MAXIMIZE or SC_RESTORE.
  virtual void Command(HWND window, UINT command) = 0;
  // The keyboard went to a window, or with null to none of this program.
  virtual void Activated(HWND window) = 0;
  // The display has lost the window's pixels and wants all of them by Present().
  virtual void Exposed(HWND window) = 0;
  // Files came by drag and drop; native paths.
  virtual void Dropped(HWND window, POINT point, const std::vector<std::string>& paths) = 0;

 protected:
  ~DisplayEvents() = default;
};

class Display {
 public:
  virtual ~Display() = default;

  // --- the screen: pixels, and dots per inch; 0 monitors where nothing is shown ---
  virtual SIZE ScreenSize() = 0;
  virtual RECT WorkArea() = 0;
  virtual UINT Dpi() = 0;
  virtual int Monitors() = 0;

  // --- top-level windows ---
  // Makes it so. Called with every change; what is as the display knows it already must cost nothing.
  virtual void Show(const ShownWindow& shown) = 0;
  virtual void SetTitle(HWND window, std::u16string_view title) = 0;
  // The program made it the active window.
  virtual void Activate(HWND window) = 0;
  // The pixels in `changed`, of the window, have changed. They are copied.
  virtual void Present(HWND window, const ShownPixels& pixels, const RECT& changed) = 0;
  virtual void Close(HWND window) = 0;

  // One of the IDC_ numbers; 0 hides the cursor.
  virtual void SetCursor(int shape) = 0;

  // The text that programs exchange. ClipboardText returns false when the clipboard holds no text, and on a display
  // without a clipboard.
  virtual bool ClipboardText(std::u16string* text) = 0;
  virtual void SetClipboardText(std::u16string_view text) = 0;

  // Waits for events, for a Wake() from any thread or at most `milliseconds`, and reports what came. Only called on
  // the thread that the display serves.
  virtual void Wait(DWORD milliseconds) = 0;
  virtual void Wake() = 0;
  // Whether it has events of its own and so must do the waiting of this thread.
  virtual bool Serves(DWORD thread) = 0;
};

// The display of the process; never null. Opened with the first window.
Display& TheDisplay();

// The model's side, set before any display is opened.
extern DisplayEvents* g_displayEvents;

}  // namespace platform
