#include "qxcore/platform/posix/display/sdl/sdl.h"

namespace platform::sdl {
namespace {

struct Shape {
  int number;
  SDL_SystemCursor cursor;
};
constexpr Shape kShapes[] = {
    {32512, SDL_SYSTEM_CURSOR_ARROW},     {32513, SDL_SYSTEM_CURSOR_IBEAM},    {32514, SDL_SYSTEM_CURSOR_WAIT},
    {32515, SDL_SYSTEM_CURSOR_CROSSHAIR}, {32642, SDL_SYSTEM_CURSOR_SIZENWSE}, {32643, SDL_SYSTEM_CURSOR_SIZENESW},
    {32644, SDL_SYSTEM_CURSOR_SIZEWE},    {32645, SDL_SYSTEM_CURSOR_SIZENS},   {32646, SDL_SYSTEM_CURSOR_SIZEALL},
    {32648, SDL_SYSTEM_CURSOR_NO},        {32649, SDL_SYSTEM_CURSOR_HAND},     {32650, SDL_SYSTEM_CURSOR_WAITARROW},
};

}  // namespace

SDL_Cursor* CursorOf(int number) {
  static SDL_Cursor* made[SDL_NUM_SYSTEM_CURSORS] = {};
  SDL_SystemCursor cursor = SDL_SYSTEM_CURSOR_ARROW;
  for (const Shape& shape : kShapes)
    if (shape.number == number) cursor = shape.cursor;
  if (made[cursor] == nullptr) made[cursor] = SDL_CreateSystemCursor(cursor);
  return made[cursor];
}

}  // namespace platform::sdl
