// Rectangles and points of windows.

#include "qxcore/platform/posix/window/place.h"
#include "qxcore/platform/posix/window/tree.h"

using namespace platform::model;

namespace {

// The place of a client area on the screen; of the screen itself for null. False for an unknown handle.
bool ClientOrigin(HWND handle, POINT* origin) {
  *origin = {};
  if (handle == nullptr) return true;
  const Window* window = Expect(handle);
  if (window == nullptr) return false;
  const RECT client = ClientScreenRect(window);
  *origin = {client.left, client.top};
  return true;
}

}  // namespace

BOOL GetWindowRect(HWND handle, LPRECT rect) {
  const Guard guard;
  const Window* window = Expect(handle);
  if (window == nullptr) return FALSE;
  *rect = ScreenRect(window);
  return TRUE;
}

BOOL GetClientRect(HWND handle, LPRECT rect) {
  const Guard guard;
  const Window* window = Expect(handle);
  if (window == nullptr) return FALSE;
  *rect = window->style & WS_MINIMIZE && !IsRoot(window) ? RECT{} : AtOrigin(window->client);
  return TRUE;
}

int MapWindowPoints(HWND from, HWND to, LPPOINT points, UINT count) {
  const Guard guard;
  POINT source, target;
  if (!ClientOrigin(from, &source) || !ClientOrigin(to, &target)) return 0;
  const int dx = source.x - target.x, dy = source.y - target.y;
  for (UINT i = 0; i < count; ++i) {
    points[i].x += dx;
    points[i].y += dy;
  }
  return MAKELONG(dx, dy);
}

BOOL ClientToScreen(HWND handle, LPPOINT point) {
  const Guard guard;
  POINT origin;
  if (!ClientOrigin(handle, &origin)) return FALSE;
  *point = {point->x + origin.x, point->y + origin.y};
  return TRUE;
}

BOOL ScreenToClient(HWND handle, LPPOINT point) {
  const Guard guard;
  POINT origin;
  if (!ClientOrigin(handle, &origin)) return FALSE;
  *point = {point->x - origin.x, point->y - origin.y};
  return TRUE;
}

BOOL AdjustWindowRectEx(LPRECT rect, DWORD style, BOOL menu, DWORD exStyle) {
  const RECT frame = FrameWidths(style, exStyle);
  *rect = {rect->left - frame.left, rect->top - frame.top, rect->right + frame.right, rect->bottom + frame.bottom};
  if (menu) rect->top -= GetSystemMetrics(SM_CYMENU);
  return TRUE;
}

BOOL AdjustWindowRect(LPRECT rect, DWORD style, BOOL menu) { return AdjustWindowRectEx(rect, style, menu, 0); }
