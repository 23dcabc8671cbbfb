// The cursor: the standard shapes, which a display knows by number.

#include "qxcore/platform/posix/display/display.h"
#include "qxcore/platform/posix/window/controls.h"
#include "qxcore/platform/posix/window/input.h"
#include "qxcore/platform/posix/window/queue.h"

namespace platform::model {
namespace {

// Handles of cursors and icons hold their number: nobody frees them.
constexpr ULONG_PTR kCursorBase = 0x40000000, kIconBase = 0x50000000;

constexpr WORD kCursors[] = {32512, 32513, 32514, 32515, 32516, 32642, 32643,
                             32644, 32645, 32646, 32648, 32649, 32650, 32651};
constexpr WORD kIcons[] = {32512, 32513, 32514, 32515, 32516};

template <std::size_t Count>
HICON Load(HINSTANCE instance, LPCWSTR name, const WORD (&known)[Count], ULONG_PTR base) {
  const auto number = reinterpret_cast<ULONG_PTR>(name);
  if (instance == nullptr)
    for (const WORD each : known)
      if (each == number) return reinterpret_cast<HICON>(base + number);
  return Fail<HICON>(ERROR_RESOURCE_NAME_NOT_FOUND);
}

std::atomic<int> g_shown{0};  // the count of ShowCursor

void ShowOnDisplay(HCURSOR cursor) {
  const auto value = reinterpret_cast<ULONG_PTR>(cursor);
  TheDisplay().SetCursor(value >= kCursorBase && g_shown >= 0 ? static_cast<int>(value - kCursorBase) : 0);
}

}  // namespace

HCURSOR LoadStandardCursor(LPCWSTR name) { return Load(nullptr, name, kCursors, kCursorBase); }

}  // namespace platform::model

using namespace platform::model;

HCURSOR LoadCursorW(HINSTANCE instance, LPCWSTR name) { return Load(instance, name, kCursors, kCursorBase); }

HICON LoadIconW(HINSTANCE instance, LPCWSTR name) { return Load(instance, name, kIcons, kIconBase); }

HCURSOR SetCursor(HCURSOR cursor) {
  Thread* thread = CurrentThread();
  HCURSOR old = nullptr;
  {
    const Guard guard;
    old = thread->cursor;
    thread->cursor = cursor;
  }
  if (old != cursor) ShowOnDisplay(cursor);
  return old;
}

HCURSOR GetCursor() {
  Thread* thread = CurrentThread();
  const Guard guard;
  return thread->cursor;
}

int ShowCursor(BOOL show) {
  const HCURSOR cursor = GetCursor();
  int shown = 0;
  {
    const Guard guard;
    shown = g_shown += show ? 1 : -1;
  }
  ShowOnDisplay(cursor);
  return shown;
}

BOOL GetCursorPos(LPPOINT point) {
  const Guard guard;
  *point = g_cursorPoint;
  return TRUE;
}

BOOL SetCursorPos(int x, int y) {
  CurrentThread();
  return OrNoMemory<BOOL>(FALSE, [&] {
    const Guard guard;
    ReportMouse(WM_MOUSEMOVE, {x, y}, 0);
    return TRUE;
  });
}

// The mouse is not held in: a display may not own it.
BOOL ClipCursor(const RECT*) { return TRUE; }
