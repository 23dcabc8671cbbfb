// What the window model asks of drawing: contexts, backgrounds, regions, sizes of texts, the caret.
#include "qxcore/platform/posix/draw/move_pixels.h"
#include "qxcore/platform/posix/draw/window_surface.h"
#include "qxcore/platform/posix/window/controls.h"

using namespace draw;

namespace {

HDC OpenContext(HWND window, const pixman_region32_t* clip, UINT flags) {
  return OpenWindow(window, (flags & DCX_WINDOW) != 0, clip);
}

void CloseContext(HWND window, HDC context) { ReleaseDC(window, context); }

void EraseBackground(HWND, HDC context, HBRUSH brush) {
  RECT all;
  if (GetClipBox(context, &all) != NULLREGION) FillRect(context, &all, brush);
}

void CopyPixels(HWND window, const RECT& from, int dx, int dy) {
  HDC dc = GetDC(window);
  BitBlt(dc, from.left + dx, from.top + dy, from.right - from.left, from.bottom - from.top, dc, from.left, from.top,
         SRCCOPY);
  ReleaseDC(window, dc);
}

void InvertCaret(HWND window, const RECT& rect) {
  HDC dc = GetDC(window);
  InvertRect(dc, &rect);
  ReleaseDC(window, dc);
}

pixman_region32_t* RegionOf(HRGN handle) {
  auto* region = Find<RegionObject>(handle);
  return region ? region->m_area.Pixman() : nullptr;
}

HRGN MakeRegion(const pixman_region32_t* content) try {
  return EnterAs<HRGN>(new RegionObject(Area(content)));
} catch (const std::bad_alloc&) {
  return NoMemory(HRGN{});
}

void FreeRegion(HRGN region) { DeleteObject(region); }

// Edit fields and lists have the window's colours, all else the face of a button.
HBRUSH ControlBrush(HDC context, UINT message) {
  bool field = message == WM_CTLCOLOREDIT || message == WM_CTLCOLORLISTBOX;
  SetTextColor(context, GetSysColor(field ? COLOR_WINDOWTEXT : COLOR_BTNTEXT));
  SetBkColor(context, GetSysColor(field ? COLOR_WINDOW : COLOR_BTNFACE));
  return GetSysColorBrush(message == WM_CTLCOLORSCROLLBAR ? COLOR_SCROLLBAR : field ? COLOR_WINDOW : COLOR_BTNFACE);
}

SIZE TextSize(LPCWSTR text, int count, bool) {
  SIZE size{};
  HDC dc = GetDC(nullptr);
  SelectObject(dc, GetStockObject(DEFAULT_GUI_FONT));
  GetTextExtentPoint32W(dc, text, count, &size);
  ReleaseDC(nullptr, dc);
  return size;
}

SIZE BrokenTextSize(LPCWSTR text, int width) {
  RECT rect{0, 0, width, 0};
  HDC dc = GetDC(nullptr);
  SelectObject(dc, GetStockObject(DEFAULT_GUI_FONT));
  DrawTextW(dc, text, -1, &rect, DT_CALCRECT | DT_WORDBREAK | DT_NOPREFIX);
  ReleaseDC(nullptr, dc);
  return {rect.right, rect.bottom};
}

// The base units are the average width of the 52 letters, rounded, and the line's height.
HFONT DialogFont(LPCWSTR face, int height, int weight, bool isItalic, SIZE* units) {
  constexpr int kLetters = 52;
  static const WCHAR kAlphabet[] = WTEXT("ABCDEFGHIJKLMNOPQRSTUVWXYZabcdefghijklmnopqrstuvwxyz");
  HFONT font = CreateFontW(height, 0, 0, 0, weight, isItalic, 0, 0, DEFAULT_CHARSET, 0, 0, 0, 0, face);
  HDC dc = GetDC(nullptr);
  SelectObject(dc, font);
  SIZE letters{};
  GetTextExtentPoint32W(dc, kAlphabet, kLetters, &letters);
  ReleaseDC(nullptr, dc);
  *units = {(letters.cx / (kLetters / 2) + 1) / 2, letters.cy};
  return font;
}

bool PixelsOf(void* window, platform::ShownPixels* pixels) {
  const Surface* surface = WindowSurface(window);
  if (!surface) return false;
  *pixels = {surface->pixels, surface->stride, surface->width, surface->height};
  return true;
}

// Before main, as the model's other tables.
[[maybe_unused]] const bool g_installed = [] {
  platform::Painter& painter = platform::g_painter;
  painter.openContext = OpenContext;
  painter.closeContext = CloseContext;
  painter.eraseBackground = EraseBackground;
  painter.copyPixels = CopyPixels;
  painter.caret = InvertCaret;
  painter.region = RegionOf;
  painter.makeRegion = MakeRegion;
  painter.freeRegion = FreeRegion;
  painter.controlBrush = ControlBrush;
  painter.textSize = TextSize;
  painter.brokenTextSize = BrokenTextSize;
  painter.dialogFont = DialogFont;
  painter.pixels = PixelsOf;
  painter.movePixels = MovePixels;
  painter.isInUse = IsSurfaceInUse;
  painter.freeSurface = FreeWindowSurface;
  return true;
}();

}  // namespace
