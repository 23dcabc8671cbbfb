// SDL's published interface, as the display uses it.
#pragma once

#define SDL_MAIN_HANDLED
#include <SDL.h>

#include <string>
#include <string_view>

#include "qxcore/platform/posix/display/module.h"

namespace platform::sdl {

// SDL's texts are UTF-8. Unpaired surrogates and invalid bytes become U+FFFD.
std::string ToUtf8(std::u16string_view text);
std::u16string FromUtf8(std::string_view bytes);

// A key: its virtual number, and whether it is one of those that came to keyboards later.
struct Key {
  WORD number = 0;  // 0 for a key without one
  bool isExtended = false;
};
Key KeyOf(const SDL_Keysym& symbol);

// A standard cursor by its IDC_ number. SDL frees them at its end.
SDL_Cursor* CursorOf(int shape);

}  // namespace platform::sdl
