// The screen of an X server, over SDL: windows, events, the clipboard.

#include <sys/syscall.h>
#include <unistd.h>

#include <algorithm>
#include <atomic>
#include <cmath>
#include <memory>
#include <utility>
#include <vector>

#include "qxcore/platform/posix/display/sdl/desktop.h"
#include "qxcore/platform/posix/display/sdl/screen_window.h"

namespace platform::sdl {
namespace {

constexpr UINT kUsualDpi = 96;
constexpr Uint32 kFlushInterval = 16;  // milliseconds between two updates of the screen while nobody waits

DWORD ThisThread() { return static_cast<DWORD>(syscall(SYS_gettid)); }

class SdlDisplay final : public Display {
 public:
  explicit SdlDisplay(DisplayEvents& events) : m_events(events), m_desktop(AskDesktop()) {
    m_wakeEvent = SDL_RegisterEvents(1);
  }

  SIZE ScreenSize() override;
  RECT WorkArea() override;
  UINT Dpi() override;
  int Monitors() override { return std::max(SDL_GetNumVideoDisplays(), 1); }

  void Show(const ShownWindow& shown) override;
  void SetTitle(HWND window, std::u16string_view title) override;
  void Activate(HWND window) override;
  void Present(HWND window, const ShownPixels& pixels, const RECT& changed) override;
  void Close(HWND window) override;
  void SetCursor(int shape) override;
  bool ClipboardText(std::u16string* text) override;
  void SetClipboardText(std::u16string_view text) override;
  void Wait(DWORD milliseconds) override;
  void Wake() override;
  bool Serves(DWORD thread) override { return thread == m_thread; }

 private:
  bool IsOwnThread() const { return ThisThread() == m_thread; }
  ScreenWindow* Find(HWND window);
  ScreenWindow* FindByNumber(Uint32 number);
  ScreenWindow* Make(const ShownWindow& shown);
  void GiveKeyboardTo(HWND window);
  void Flush();

  void Handle(const SDL_Event& event);
  void OnWindow(const SDL_WindowEvent& event);
  void OnButton(const SDL_MouseButtonEvent& event);
  void FollowPointer();
  void OnMotion(const SDL_MouseMotionEvent& event);
  void OnWheel(const SDL_MouseWheelEvent& event);
  void OnKey(const SDL_KeyboardEvent& event);
  bool TakeModifier(WORD key, bool isUp);
  void LoseKeyboard();
  void OnText(std::string_view text);
  void OnDrop(const SDL_DropEvent& event);
  void OnPlace(HWND window);
  void OnStates(HWND window, ShownWindow::State state, UINT command);
  char16_t TakeCharacter(const SDL_Keysym& symbol);

  DisplayEvents& m_events;
  const Desktop m_desktop;
  const DWORD m_thread = ThisThread();
  std::vector<std::unique_ptr<ScreenWindow>> m_windows;
  HWND m_active = nullptr;  // as the model has it
  bool m_focusChanged = false;
  std::vector<WORD> m_modifiers;   // those that were reported as down
  bool m_movesUnderMouse = false;  // a window is moved while a button is down
  POINT m_followed{};              // where the pointer was then
  Uint32 m_lastFlush = 0;
  Uint32 m_wakeEvent = 0;
  std::atomic<bool> m_isWoken{false};
  std::vector<std::string> m_dropped;
};

// --- the screen ---

SIZE SdlDisplay::ScreenSize() {
  SIZE size{1, 1};
  for (int i = 0; i < SDL_GetNumVideoDisplays(); ++i) {
    SDL_Rect bounds;
    if (SDL_GetDisplayBounds(i, &bounds) != 0) continue;
    size = {std::max(size.cx, bounds.x + bounds.w), std::max(size.cy, bounds.y + bounds.h)};
  }
  return size;
}

RECT SdlDisplay::WorkArea() {
  SDL_Rect area;
  if (SDL_GetDisplayUsableBounds(0, &area) == 0) return {area.x, area.y, area.x + area.w, area.y + area.h};
  const SIZE size = ScreenSize();
  return {0, 0, size.cx, size.cy};
}

UINT SdlDisplay::Dpi() {
  static const UINT asked = DpiOfEnvironment();
  if (asked != 0) return asked;
  return m_desktop.dpi != 0 ? m_desktop.dpi : kUsualDpi;
}

// --- windows ---

ScreenWindow* SdlDisplay::Find(HWND window) {
  for (const auto& each : m_windows)
    if (each->Handle() == window) return each.get();
  return nullptr;
}

ScreenWindow* SdlDisplay::FindByNumber(Uint32 number) {
  SDL_Window* window = SDL_GetWindowFromID(number);
  for (const auto& each : m_windows)
    if (window != nullptr && each->Sdl() == window) return each.get();
  return nullptr;
}

ScreenWindow* SdlDisplay::Make(const ShownWindow& shown) {
  const ScreenWindow* owner = shown.owner != nullptr ? Find(shown.owner) : nullptr;
  auto made =
      std::make_unique<ScreenWindow>(shown, m_desktop.hasWindowManager, owner != nullptr ? owner->Sdl() : nullptr);
  if (made->Sdl() == nullptr) return nullptr;
  m_windows.push_back(std::move(made));
  return m_windows.back().get();
}

void SdlDisplay::Show(const ShownWindow& shown) {
  if (!IsOwnThread()) return;
  ScreenWindow* window = Find(shown.window);
  if (!shown.isVisible) {
    if (window != nullptr) window->Hide();
    return;
  }
  if (window == nullptr) window = Make(shown);
  if (window != nullptr && window->Show(shown) && SDL_GetMouseState(nullptr, nullptr) != 0) m_movesUnderMouse = true;
}

void SdlDisplay::SetTitle(HWND handle, std::u16string_view title) {
  if (!IsOwnThread()) return;
  if (ScreenWindow* window = Find(handle)) window->SetTitle(title);
}

// Without a window manager the keyboard stays with a window until it is given to another one.
void SdlDisplay::GiveKeyboardTo(HWND handle) {
  ScreenWindow* window = Find(handle);
  if (window == nullptr || window->IsPopup()) return;
  if (!m_desktop.hasWindowManager) SDL_SetWindowInputFocus(window->Sdl());
}

void SdlDisplay::Activate(HWND handle) {
  if (!IsOwnThread()) return;
  m_active = handle;
  ScreenWindow* window = Find(handle);
  if (window == nullptr || window->IsPopup() || SDL_GetKeyboardFocus() == window->Sdl()) return;
  SDL_RaiseWindow(window->Sdl());
  GiveKeyboardTo(handle);
}

void SdlDisplay::Present(HWND handle, const ShownPixels& pixels, const RECT& changed) {
  if (!IsOwnThread()) return;
  ScreenWindow* window = Find(handle);
  if (window == nullptr) return;
  window->Present(pixels, changed);
  if (SDL_GetTicks() - m_lastFlush >= kFlushInterval) Flush();
}

void SdlDisplay::Flush() {
  for (const auto& window : m_windows) window->Flush();
  m_lastFlush = SDL_GetTicks();
}

void SdlDisplay::Close(HWND handle) {
  if (!IsOwnThread()) return;
  const bool wasPopup = Find(handle) != nullptr && Find(handle)->IsPopup();
  if (m_active == handle) m_active = nullptr;
  if (wasPopup) GiveKeyboardTo(m_active);  // before it goes, or keys in between would reach nobody
  std::erase_if(m_windows, [&](const auto& window) { return window->Handle() == handle; });
}

void SdlDisplay::SetCursor(int shape) {
  if (!IsOwnThread()) return;
  SDL_ShowCursor(shape != 0 ? SDL_ENABLE : SDL_DISABLE);
  if (shape != 0) SDL_SetCursor(CursorOf(shape));
}

// --- the clipboard ---

bool SdlDisplay::ClipboardText(std::u16string* text) {
  if (!IsOwnThread() || !SDL_HasClipboardText()) return false;
  char* bytes = SDL_GetClipboardText();
  if (bytes == nullptr) return false;
  *text = FromUtf8(bytes);
  SDL_free(bytes);
  return true;
}

void SdlDisplay::SetClipboardText(std::u16string_view text) {
  if (!IsOwnThread()) return;
  SDL_SetClipboardText(ToUtf8(text).c_str());
  SDL_PumpEvents();  // sends it to the server
}

// --- events ---

// Handlers run the program, which may wait in turn: each event is taken before it is handled.
void SdlDisplay::Wait(DWORD milliseconds) {
  Flush();
  SDL_Event event;
  if (m_movesUnderMouse) milliseconds = std::min<DWORD>(milliseconds, kFlushInterval);
  const int limit = milliseconds == INFINITE ? -1 : static_cast<int>(std::min<DWORD>(milliseconds, 1 << 30));
  bool hasEvent = limit != 0 ? SDL_WaitEventTimeout(&event, limit) : SDL_PollEvent(&event);
  for (; hasEvent; hasEvent = SDL_PollEvent(&event)) Handle(event);
  FollowPointer();
  if (std::exchange(m_focusChanged, false) && SDL_GetKeyboardFocus() == nullptr) {
    LoseKeyboard();
  }
}

void SdlDisplay::Wake() {
  if (IsOwnThread() || m_isWoken.exchange(true)) return;
  SDL_Event event{};
  event.type = m_wakeEvent;
  SDL_PushEvent(&event);
}

void SdlDisplay::Handle(const SDL_Event& event) {
  if (event.type == m_wakeEvent) {
    m_isWoken = false;
    return;
  }
  switch (event.type) {
    case SDL_WINDOWEVENT:
      return OnWindow(event.window);
    case SDL_MOUSEMOTION:
      return OnMotion(event.motion);
    case SDL_MOUSEBUTTONDOWN:
    case SDL_MOUSEBUTTONUP:
      return OnButton(event.button);
    case SDL_MOUSEWHEEL:
      return OnWheel(event.wheel);
    case SDL_KEYDOWN:
    case SDL_KEYUP:
      return OnKey(event.key);
    case SDL_TEXTINPUT:
      return OnText(event.text.text);
    case SDL_DROPBEGIN:
    case SDL_DROPFILE:
    case SDL_DROPTEXT:
    case SDL_DROPCOMPLETE:
      return OnDrop(event.drop);
    default:
      return;
  }
}

void SdlDisplay::OnWindow(const SDL_WindowEvent& event) {
  ScreenWindow* window = FindByNumber(event.windowID);
  if (window == nullptr) return;
  const HWND handle = window->Handle();
  switch (event.event) {
    case SDL_WINDOWEVENT_EXPOSED:
      window->LosePixels();
      return m_events.Exposed(handle);
    case SDL_WINDOWEVENT_MOVED:
    case SDL_WINDOWEVENT_SIZE_CHANGED:
      return OnPlace(handle);
    case SDL_WINDOWEVENT_MINIMIZED:
      return OnStates(handle, ShownWindow::State::Minimised, SC_MINIMIZE);
    case SDL_WINDOWEVENT_MAXIMIZED:
      return OnStates(handle, ShownWindow::State::Maximised, SC_MAXIMIZE);
    case SDL_WINDOWEVENT_RESTORED:
      return OnStates(handle, ShownWindow::State::Normal, SC_RESTORE);
    case SDL_WINDOWEVENT_CLOSE:
      return m_events.Command(handle, SC_CLOSE);
    case SDL_WINDOWEVENT_FOCUS_GAINED:
      if (window->IsPopup()) return;
      m_active = handle;
      return m_events.Activated(handle);
    case SDL_WINDOWEVENT_FOCUS_LOST:
      m_focusChanged = true;
      return;
    default:
      return;
  }
}

// The model may want another size than the user gave the window; Show() then comes back with that.
void SdlDisplay::OnPlace(HWND handle) {
  ScreenWindow* window = Find(handle);
  RECT whole{};
  if (window == nullptr || !window->TakePlace(&whole)) return;
  m_events.Placed(handle, whole);
  m_events.Exposed(handle);
}

void SdlDisplay::OnStates(HWND handle, ShownWindow::State state, UINT command) {
  const ScreenWindow* window = Find(handle);
  if (window != nullptr && window->State() != state) m_events.Command(handle, command);
}

// --- the mouse ---

UINT MessageOf(const SDL_MouseButtonEvent& event) {
  const bool isDown = event.type == SDL_MOUSEBUTTONDOWN;
  switch (event.button) {
    case SDL_BUTTON_LEFT:
      return isDown ? WM_LBUTTONDOWN : WM_LBUTTONUP;
    case SDL_BUTTON_RIGHT:
      return isDown ? WM_RBUTTONDOWN : WM_RBUTTONUP;
    case SDL_BUTTON_MIDDLE:
      return isDown ? WM_MBUTTONDOWN : WM_MBUTTONUP;
    default:
      return 0;
  }
}

void SdlDisplay::OnButton(const SDL_MouseButtonEvent& event) {
  const ScreenWindow* window = FindByNumber(event.windowID);
  const UINT message = MessageOf(event);
  FollowPointer();
  if (event.type == SDL_MOUSEBUTTONUP) m_movesUnderMouse = false;
  if (window != nullptr && message != 0) m_events.Mouse(message, window->OnScreen(event.x, event.y), 0);
}

void SdlDisplay::OnMotion(const SDL_MouseMotionEvent& event) {
  const ScreenWindow* window = FindByNumber(event.windowID);
  if (window != nullptr && !m_movesUnderMouse) m_events.Mouse(WM_MOUSEMOVE, window->OnScreen(event.x, event.y), 0);
}

// Events have their point in the window, and SDL leaves out those at the point of the one before. While a window
// follows the mouse, both say nothing of the pointer's place.
void SdlDisplay::FollowPointer() {
  POINT point{};
  if (!m_movesUnderMouse || !FindPointer(&point.x, &point.y)) return;
  if (point.x != m_followed.x || point.y != m_followed.y) m_events.Mouse(WM_MOUSEMOVE, m_followed = point, 0);
}

void SdlDisplay::OnWheel(const SDL_MouseWheelEvent& event) {
  const ScreenWindow* window = FindByNumber(event.windowID);
  if (window == nullptr) return;
  const float sign = event.direction == SDL_MOUSEWHEEL_FLIPPED ? -1.0f : 1.0f;
  const auto turns = [&](float turned) { return static_cast<int>(std::lround(turned * sign * WHEEL_DELTA)); };
  const POINT point = window->OnScreen(event.mouseX, event.mouseY);
  if (const int turned = turns(event.preciseY)) m_events.Mouse(WM_MOUSEWHEEL, point, turned);
  if (const int turned = turns(event.preciseX)) m_events.Mouse(WM_MOUSEHWHEEL, point, turned);
}

// --- the keyboard ---

// The text of a key follows its press in the queue. A key that prints and has none is the beginning of a composed
// character; keys with Ctrl, and those that print nothing, are the layout's.
char16_t SdlDisplay::TakeCharacter(const SDL_Keysym& symbol) {
  SDL_Event next;
  if (SDL_PeepEvents(&next, 1, SDL_PEEKEVENT, SDL_FIRSTEVENT, SDL_LASTEVENT) == 1 && next.type == SDL_TEXTINPUT) {
    const std::u16string text = FromUtf8(next.text.text);
    if (text.size() == 1) {
      SDL_PeepEvents(&next, 1, SDL_GETEVENT, SDL_TEXTINPUT, SDL_TEXTINPUT);
      return text[0];
    }
    return DisplayEvents::kNoCharacter;  // it comes by itself
  }
  const bool isPrinting = symbol.sym >= SDLK_SPACE && symbol.sym != SDLK_DELETE && !(symbol.sym & SDLK_SCANCODE_MASK);
  return isPrinting && !(symbol.mod & (KMOD_CTRL | KMOD_ALT)) ? DisplayEvents::kNoCharacter : DisplayEvents::kByLayout;
}

// Whether a modifier has changed. With each change of the window that has the keyboard, a popup's included, SDL reports
// all keys as released, and then those that are still held as pressed.
bool SdlDisplay::TakeModifier(WORD key, bool isUp) {
  const auto known = std::find(m_modifiers.begin(), m_modifiers.end(), key);
  if (isUp) {
    if (known == m_modifiers.end() || IsModifierHeld(key)) return false;
    m_modifiers.erase(known);
  } else {
    if (known != m_modifiers.end()) return false;
    m_modifiers.push_back(key);
  }
  return true;
}

// Where another program has the keyboard, nobody hears which keys are released.
void SdlDisplay::LoseKeyboard() {
  for (const WORD key : std::exchange(m_modifiers, {})) m_events.Key(key, 0, true, false, DisplayEvents::kByLayout);
  m_active = nullptr;
  m_events.Activated(nullptr);
}

void SdlDisplay::OnKey(const SDL_KeyboardEvent& event) {
  const Key key = KeyOf(event.keysym);
  const bool isUp = event.type == SDL_KEYUP;
  const bool isModifier = key.number == VK_SHIFT || key.number == VK_CONTROL || key.number == VK_MENU;
  if (isModifier && !TakeModifier(key.number, isUp)) return;
  const char16_t character = isUp ? DisplayEvents::kByLayout : TakeCharacter(event.keysym);
  if (key.number != 0) {
    m_events.Key(key.number, static_cast<WORD>(event.keysym.scancode & 0xFF), isUp, key.isExtended, character);
  } else if (character != DisplayEvents::kByLayout && character != DisplayEvents::kNoCharacter) {
    m_events.Character(character);
  }
}

void SdlDisplay::OnText(std::string_view text) {
  for (const char16_t unit : FromUtf8(text)) m_events.Character(unit);
}

// --- drag and drop ---

void SdlDisplay::OnDrop(const SDL_DropEvent& event) {
  if (event.type == SDL_DROPBEGIN) m_dropped.clear();
  if (event.type == SDL_DROPFILE && event.file != nullptr) m_dropped.emplace_back(event.file);
  if (event.file != nullptr) SDL_free(event.file);
  const ScreenWindow* window = FindByNumber(event.windowID);
  if (event.type != SDL_DROPCOMPLETE || window == nullptr || m_dropped.empty()) return;
  int x = 0, y = 0;
  FindPointer(&x, &y);
  m_events.Dropped(window->Handle(), {x, y}, std::exchange(m_dropped, {}));
}

// What SDL does for games by itself and a program with windows does not want.
void SetHints() {
  SDL_SetHint(SDL_HINT_NO_SIGNAL_HANDLERS, "1");
  SDL_SetHint(SDL_HINT_QUIT_ON_LAST_WINDOW_CLOSE, "0");
  SDL_SetHint(SDL_HINT_VIDEO_ALLOW_SCREENSAVER, "1");
  SDL_SetHint(SDL_HINT_MOUSE_FOCUS_CLICKTHROUGH, "1");
  SDL_SetHint(SDL_HINT_FRAMEBUFFER_ACCELERATION, "0");  // else each update takes milliseconds
  SDL_SetHint(SDL_HINT_VIDEODRIVER, "x11");             // the environment (SDL_VIDEODRIVER) comes before
}

}  // namespace
}  // namespace platform::sdl

extern "C" __attribute__((visibility("default"))) platform::Display* qxcore_open_display(
    int version, platform::DisplayEvents& events, const char** reason) {
  if (version != platform::kDisplayVersion) return nullptr;
  SDL_SetMainReady();
  platform::sdl::SetHints();
  if (SDL_Init(SDL_INIT_VIDEO) != 0) {
    *reason = SDL_GetError();
    return nullptr;
  }
  platform::sdl::OutliveWindows();
  return new platform::sdl::SdlDisplay(events);
}
