// What the model takes from the layers above it: the system's own classes and all painting. Without it nothing
// is painted and all logic runs.
#pragma once

#include <pixman.h>

#include "qxcore/platform/posix/display/display.h"
#include "qxcore/platform/posix/window/region.h"

namespace platform {

// Pixels that move by (dx, dy) to `to`, all on one surface.
struct MovedPixels {
  model::Region to;
  int dx = 0, dy = 0;
};

// What `controls` and `draw` fill in. A null entry means that nothing is painted. The functions run without the
// model's lock.
struct Painter {
  // A context for painting the window, its clip the given region (client coordinates) less what children and
  // siblings cover; and its end.
  HDC (*openContext)(HWND window, const pixman_region32_t* clip, UINT flags) = nullptr;
  void (*closeContext)(HWND window, HDC context) = nullptr;
  // Fills `rect` with a class's background brush.
  void (*eraseBackground)(HWND window, HDC context, HBRUSH brush) = nullptr;
  // The frame, caption, menu bar and scroll bars of a window.
  void (*nonClient)(HWND window) = nullptr;
  // Moves pixels of a window's client area.
  void (*copyPixels)(HWND window, const RECT& from, int dx, int dy) = nullptr;
  // Moves pixels on a top-level window's surface, which is made at least as large as `size` first. None of them is
  // written over before it was read. False when memory is out: then some may be lost.
  bool (*movePixels)(HWND top, void* surface, SIZE size, const MovedPixels* moves, std::size_t count) = nullptr;
  // Whether a context of the surface is open.
  bool (*isInUse)(void* surface) = nullptr;
  // A menu's popup window; the caret, drawn by inverting; the frame that is dragged.
  void (*popupMenu)(HWND window, HMENU menu) = nullptr;
  void (*caret)(HWND window, const RECT& rect) = nullptr;
  // The region behind a handle; null for an unknown one.
  pixman_region32_t* (*region)(HRGN region) = nullptr;
  // A new region handle with the given content, and its end.
  HRGN (*makeRegion)(const pixman_region32_t* region) = nullptr;
  void (*freeRegion)(HRGN region) = nullptr;
  // The brush that WM_CTLCOLOR messages answer by default.
  HBRUSH (*controlBrush)(HDC context, UINT message) = nullptr;
  // The width of a text in the menu or dialog font, and the font's height, in pixels.
  SIZE (*textSize)(LPCWSTR text, int count, bool isMenu) = nullptr;
  // The size of a text in the dialog font, broken into lines of at most `width` pixels.
  SIZE (*brokenTextSize)(LPCWSTR text, int width) = nullptr;
  // A font for a dialog, of the given height in pixels (negative: of the characters), and its dialog base units.
  HFONT (*dialogFont)(LPCWSTR face, int height, int weight, bool isItalic, SIZE* units) = nullptr;
  // The pixels of a top-level window; false before anything was drawn.
  bool (*pixels)(void* surface, ShownPixels* pixels) = nullptr;
  // The pixels of a top-level window are no longer needed.
  void (*freeSurface)(void* surface) = nullptr;
};
extern Painter g_painter;

namespace model {

// Registers the system's control classes. Under the lock; throws std::bad_alloc.
void AddControlClasses();
LRESULT CALLBACK MenuWindowProcedure(HWND window, UINT message, WPARAM wParam, LPARAM lParam);
HCURSOR LoadStandardCursor(LPCWSTR name);

}  // namespace model
}  // namespace platform
