#include "qxcore/platform/posix/display/sdl/screen_window.h"

#include <algorithm>
#include <cstring>
#include <utility>

#include "qxcore/platform/posix/display/sdl/desktop.h"

namespace platform::sdl {
namespace {

int Width(const RECT& rect) { return rect.right - rect.left; }
int Height(const RECT& rect) { return rect.bottom - rect.top; }
bool IsEmpty(const RECT& rect) { return rect.left >= rect.right || rect.top >= rect.bottom; }

RECT Common(const RECT& a, const RECT& b) {
  return {std::max(a.left, b.left), std::max(a.top, b.top), std::min(a.right, b.right), std::min(a.bottom, b.bottom)};
}

RECT Around(const RECT& a, const RECT& b) {
  if (IsEmpty(a)) return b;
  if (IsEmpty(b)) return a;
  return {std::min(a.left, b.left), std::min(a.top, b.top), std::max(a.right, b.right), std::max(a.bottom, b.bottom)};
}

RECT PlaceOf(SDL_Window* window) {
  int x = 0, y = 0, width = 0, height = 0;
  SDL_GetWindowPosition(window, &x, &y);
  SDL_GetWindowSize(window, &width, &height);
  return {x, y, x + width, y + height};
}

bool Same(const RECT& a, const RECT& b) {
  return a.left == b.left && a.top == b.top && a.right == b.right && a.bottom == b.bottom;
}

}  // namespace

ScreenWindow::ScreenWindow(const ShownWindow& shown, bool hasManager, SDL_Window* owner)
    : m_handle(shown.window),
      m_isFramed(hasManager && shown.hasCaption),
      m_isManaged(hasManager && !shown.isPopup),
      m_isPopup(shown.isPopup) {
  m_content = ContentOf(shown);
  Uint32 flags = SDL_WINDOW_HIDDEN;
  if (!m_isFramed) flags |= SDL_WINDOW_BORDERLESS;
  if (m_isPopup) flags |= SDL_WINDOW_POPUP_MENU | SDL_WINDOW_SKIP_TASKBAR;
  if (shown.canSize) flags |= SDL_WINDOW_RESIZABLE;
  m_window = SDL_CreateWindow(ToUtf8(shown.title).c_str(), m_content.left, m_content.top, std::max(Width(m_content), 1),
                              std::max(Height(m_content), 1), flags);
  if (m_window != nullptr && owner != nullptr && !m_isPopup) SDL_SetWindowModalFor(m_window, owner);
  if (m_window != nullptr) SetTitle(shown.title);
}

ScreenWindow::~ScreenWindow() {
  if (m_window != nullptr) SDL_DestroyWindow(m_window);
}

RECT ScreenWindow::ContentOf(const ShownWindow& shown) const { return m_isFramed ? shown.inside : shown.rect; }

bool ScreenWindow::Show(const ShownWindow& shown) {
  const RECT content = ContentOf(shown);
  m_frame = {content.left - shown.rect.left, content.top - shown.rect.top, shown.rect.right - content.right,
             shown.rect.bottom - content.bottom};
  ShowState(shown.state);
  const bool isIcon = m_isManaged && m_state == ShownWindow::State::Minimised;  // the manager knows where that is
  const bool hasMoved = !isIcon && ShowPlace(content);
  if (!m_isShown) SDL_ShowWindow(m_window);
  m_isShown = true;
  return hasMoved;
}

// The window manager has the states; without one they are sizes as any.
void ScreenWindow::ShowState(ShownWindow::State state) {
  const auto former = std::exchange(m_state, state);
  if (!m_isManaged || former == state) return;
  const Uint32 flags = SDL_GetWindowFlags(m_window);
  if (state == ShownWindow::State::Minimised) {
    if (!(flags & SDL_WINDOW_MINIMIZED)) SDL_MinimizeWindow(m_window);
  } else if (state == ShownWindow::State::Maximised) {
    if (!(flags & SDL_WINDOW_MAXIMIZED) || (flags & SDL_WINDOW_MINIMIZED)) SDL_MaximizeWindow(m_window);
  } else if (flags & (SDL_WINDOW_MINIMIZED | SDL_WINDOW_MAXIMIZED)) {
    SDL_RestoreWindow(m_window);
  }
}

// A maximised window lies where the window manager wants it; its events say where that is.
bool ScreenWindow::ShowPlace(const RECT& content) {
  const RECT former = std::exchange(m_content, content);
  if (m_isManaged && m_state == ShownWindow::State::Maximised) return false;
  const RECT place = PlaceOf(m_window);
  const int width = std::max(Width(content), 1), height = std::max(Height(content), 1);
  if (Width(place) != width || Height(place) != height) {
    SDL_SetWindowSize(m_window, width, height);
    m_hasAllPixels = false;
  }
  const bool isElsewhere = place.left != content.left || place.top != content.top;
  if (isElsewhere) SDL_SetWindowPosition(m_window, content.left, content.top);
  return isElsewhere && (former.left != content.left || former.top != content.top);
}

void ScreenWindow::Hide() {
  if (m_isShown) SDL_HideWindow(m_window);
  m_isShown = false;
  m_hasAllPixels = false;
}

void ScreenWindow::SetTitle(std::u16string_view title) {
  const std::string name = ToUtf8(title);
  SDL_SetWindowTitle(m_window, name.c_str());
  NameWindow(m_window, name);
}

bool ScreenWindow::TakePlace(RECT* whole) {
  if (!m_isShown || m_isPopup || (SDL_GetWindowFlags(m_window) & SDL_WINDOW_MINIMIZED)) return false;
  const RECT place = PlaceOf(m_window);
  if (Same(place, m_content)) return false;
  if (Width(place) != Width(m_content) || Height(place) != Height(m_content)) m_hasAllPixels = false;
  m_content = place;
  *whole = {place.left - m_frame.left, place.top - m_frame.top, place.right + m_frame.right,
            place.bottom + m_frame.bottom};
  return true;
}

// --- pixels ---

void ScreenWindow::Present(const ShownPixels& pixels, const RECT& changed) {
  if (!m_isShown) return;
  SDL_Surface* surface = SDL_GetWindowSurface(m_window);
  if (surface == nullptr || surface->format->BytesPerPixel != 4) return;
  const RECT all{0, 0, surface->w, surface->h};
  const RECT there{-m_frame.left, -m_frame.top, pixels.width - m_frame.left, pixels.height - m_frame.top};
  RECT part = m_hasAllPixels ? RECT{changed.left - m_frame.left, changed.top - m_frame.top,
                                    changed.right - m_frame.left, changed.bottom - m_frame.top}
                             : all;
  part = Common(Common(part, all), there);
  if (IsEmpty(part)) return;
  m_hasAllPixels = true;
  for (int y = part.top; y < part.bottom; ++y) {
    const std::uint32_t* from = pixels.pixels + static_cast<std::ptrdiff_t>(y + m_frame.top) * pixels.stride;
    auto* to = static_cast<Uint8*>(surface->pixels) + static_cast<std::ptrdiff_t>(y) * surface->pitch;
    std::memcpy(to + part.left * 4, from + part.left + m_frame.left, static_cast<std::size_t>(Width(part)) * 4);
  }
  m_changed = Around(m_changed, part);
}

void ScreenWindow::Flush() {
  if (IsEmpty(m_changed)) return;
  const SDL_Rect rect{m_changed.left, m_changed.top, Width(m_changed), Height(m_changed)};
  m_changed = {};
  SDL_UpdateWindowSurfaceRects(m_window, &rect, 1);
}

}  // namespace platform::sdl
