// From SDL's keys to virtual numbers: by the symbol that the keyboard's layout gives the key, and where that is no
// letter of ours, by the key's place on an American keyboard.

#include "qxcore/platform/posix/display/sdl/sdl.h"

namespace platform::sdl {
namespace {

struct Known {
  SDL_Keycode symbol;
  WORD number;
  bool isExtended = false;
};
constexpr Known kKnown[] = {
    {SDLK_RETURN, VK_RETURN},
    {SDLK_ESCAPE, VK_ESCAPE},
    {SDLK_BACKSPACE, VK_BACK},
    {SDLK_TAB, VK_TAB},
    {SDLK_SPACE, VK_SPACE},
    {SDLK_CAPSLOCK, VK_CAPITAL},
    {SDLK_PAUSE, VK_PAUSE},
    {SDLK_SCROLLLOCK, VK_SCROLL},
    {SDLK_NUMLOCKCLEAR, VK_NUMLOCK},
    {SDLK_PRINTSCREEN, VK_SNAPSHOT, true},
    {SDLK_INSERT, VK_INSERT, true},
    {SDLK_DELETE, VK_DELETE, true},
    {SDLK_HOME, VK_HOME, true},
    {SDLK_END, VK_END, true},
    {SDLK_PAGEUP, VK_PRIOR, true},
    {SDLK_PAGEDOWN, VK_NEXT, true},
    {SDLK_LEFT, VK_LEFT, true},
    {SDLK_RIGHT, VK_RIGHT, true},
    {SDLK_UP, VK_UP, true},
    {SDLK_DOWN, VK_DOWN, true},
    {SDLK_LSHIFT, VK_SHIFT},
    {SDLK_RSHIFT, VK_SHIFT},
    {SDLK_LCTRL, VK_CONTROL},
    {SDLK_RCTRL, VK_CONTROL, true},
    {SDLK_LALT, VK_MENU},
    {SDLK_LGUI, VK_LWIN, true},
    {SDLK_RGUI, VK_RWIN, true},
    {SDLK_APPLICATION, VK_APPS, true},
    {SDLK_MENU, VK_APPS, true},
    {SDLK_KP_ENTER, VK_RETURN, true},
    {SDLK_KP_PLUS, VK_ADD},
    {SDLK_KP_MINUS, VK_SUBTRACT},
    {SDLK_KP_MULTIPLY, VK_MULTIPLY},
    {SDLK_KP_DIVIDE, VK_DIVIDE, true},
    {SDLK_SEMICOLON, VK_OEM_1},
    {SDLK_EQUALS, VK_OEM_PLUS},
    {SDLK_PLUS, VK_OEM_PLUS},
    {SDLK_COMMA, VK_OEM_COMMA},
    {SDLK_MINUS, VK_OEM_MINUS},
    {SDLK_PERIOD, VK_OEM_PERIOD},
    {SDLK_SLASH, VK_OEM_2},
    {SDLK_BACKQUOTE, VK_OEM_3},
    {SDLK_LEFTBRACKET, VK_OEM_4},
    {SDLK_BACKSLASH, VK_OEM_5},
    {SDLK_RIGHTBRACKET, VK_OEM_6},
    {SDLK_QUOTE, VK_OEM_7},
};

// The keys of the number block, from 1 to 9, then 0 and the point: with and without the number lock.
constexpr WORD kBlock[] = {VK_END, VK_DOWN, VK_NEXT, VK_LEFT, VK_CLEAR, VK_RIGHT, VK_HOME, VK_UP, VK_PRIOR, VK_INSERT};

Key OfBlock(SDL_Scancode place, bool isLocked) {
  if (place == SDL_SCANCODE_KP_PERIOD) return {static_cast<WORD>(isLocked ? VK_DECIMAL : VK_DELETE)};
  const int at = place - SDL_SCANCODE_KP_1;
  if (!isLocked) return {kBlock[at]};
  return {static_cast<WORD>(VK_NUMPAD0 + (at + 1) % 10)};
}

WORD LetterOrDigit(SDL_Keycode symbol) {
  if (symbol >= SDLK_a && symbol <= SDLK_z) return static_cast<WORD>('A' + (symbol - SDLK_a));
  if (symbol >= SDLK_0 && symbol <= SDLK_9) return static_cast<WORD>('0' + (symbol - SDLK_0));
  return 0;
}

WORD ByPlace(SDL_Scancode place) {
  if (place >= SDL_SCANCODE_A && place <= SDL_SCANCODE_Z) return static_cast<WORD>('A' + (place - SDL_SCANCODE_A));
  if (place >= SDL_SCANCODE_1 && place <= SDL_SCANCODE_9) return static_cast<WORD>('1' + (place - SDL_SCANCODE_1));
  return place == SDL_SCANCODE_0 ? '0' : 0;
}

}  // namespace

Key KeyOf(const SDL_Keysym& key) {
  const SDL_Scancode place = key.scancode;
  if (place >= SDL_SCANCODE_KP_1 && place <= SDL_SCANCODE_KP_PERIOD) return OfBlock(place, key.mod & KMOD_NUM);
  if (place >= SDL_SCANCODE_F1 && place <= SDL_SCANCODE_F12)
    return {static_cast<WORD>(VK_F1 + place - SDL_SCANCODE_F1)};
  // The right Alt key is Alt where the layout has no third level on it.
  if (key.sym == SDLK_RALT) return {VK_MENU, true};
  if (const WORD number = LetterOrDigit(key.sym)) return {number};
  for (const Known& known : kKnown)
    if (known.symbol == key.sym) return {known.number, known.isExtended};
  return {ByPlace(place)};
}

}  // namespace platform::sdl
