// Where input enters, and how it leaves the queue.

#include "qxcore/platform/posix/window/input.h"

#include "qxcore/platform/posix/display/display.h"
#include "qxcore/platform/posix/window/queue.h"
#include "qxcore/platform/posix/window/send.h"
#include "qxcore/platform/posix/window/tree.h"

namespace platform::model {
namespace {

BYTE g_asyncKeys[256];         // 0x80: down now; 0x01: pressed since the last question
HWND g_pressedOver = nullptr;  // the window below the mouse when a button was pressed that is down still

bool IsMouse(UINT message) { return message >= WM_MOUSEFIRST && message <= WM_MOUSELAST; }

// The visible window at a point, without regard to hit tests; null over the bare screen.
Window* WindowAt(Window* root, POINT point) {
  for (Window* window = root->firstChild; window != nullptr; window = window->next) {
    if (!window->IsVisible() || !Contains(window->window, point)) continue;
    if (window->style & WS_DISABLED && window->IsChild()) continue;
    const POINT inside{point.x - window->client.left, point.y - window->client.top};
    if (window->style & WS_DISABLED || !Contains(window->client, point)) return window;
    Window* below = WindowAt(window, inside);
    return below != nullptr ? below : window;
  }
  return nullptr;
}

// The thread that gets the mouse: whose window has it captured, or lies below it. Over the bare screen it is the one
// that has still to handle a press, for it may capture the mouse then, and has to hear of the release.
Thread* MouseThread(POINT point, Thread* reporter) {
  if (reporter->capture != nullptr && FindWindowObject(reporter->capture) != nullptr) return reporter;
  const Window* window = WindowAt(Desktop(), point);
  if (window == nullptr) window = FindWindowObject(g_pressedOver);
  return window != nullptr ? window->thread : nullptr;
}

// The thread that gets the keys: the one with the active window, the reporter before others.
Thread* KeyThread(Thread* reporter) {
  if (FindWindowObject(reporter->active) != nullptr || FindWindowObject(reporter->focus) != nullptr) return reporter;
  for (const Window* window = Desktop()->firstChild; window != nullptr; window = window->next)
    if (window->thread->active == window->handle) return window->thread;
  return reporter;
}

BYTE ButtonKey(UINT message) {
  switch (message) {
    case WM_LBUTTONDOWN:
    case WM_LBUTTONUP:
      return VK_LBUTTON;
    case WM_RBUTTONDOWN:
    case WM_RBUTTONUP:
      return VK_RBUTTON;
    case WM_MBUTTONDOWN:
    case WM_MBUTTONUP:
      return VK_MBUTTON;
    default:
      return 0;
  }
}

bool IsButtonUp(UINT message) { return message == WM_LBUTTONUP || message == WM_RBUTTONUP || message == WM_MBUTTONUP; }

void NoteKey(BYTE* keys, WORD key, bool isUp) {
  BYTE& state = keys[key & 0xFF];
  if (isUp) {
    state &= 0x7F;
  } else {
    if (!(state & 0x80)) state ^= 1;
    state |= 0x80;
  }
}

void Enqueue(Thread* thread, const MSG& message, UINT flag, WCHAR typed = 0) {
  thread->input.Push({message, typed});
  thread->changed |= flag;
  Wake(thread);
}

bool IsButtonDown() { return (g_asyncKeys[VK_LBUTTON] | g_asyncKeys[VK_RBUTTON] | g_asyncKeys[VK_MBUTTON]) & 0x80; }

// The key state as the thread sees it changes when it takes the message.
void NoteTaken(Thread* thread, const MSG& message) {
  if (IsMouse(message.message)) {
    if (const BYTE key = ButtonKey(message.message)) NoteKey(thread->keys, key, IsButtonUp(message.message));
  } else {
    NoteKey(thread->keys, static_cast<WORD>(message.wParam), message.message == WM_KEYUP);
  }
}

}  // namespace

WORD MouseKeys(const Thread* thread) {
  const auto down = [&](int key) { return thread->keys[key] & 0x80; };
  return static_cast<WORD>((down(VK_LBUTTON) ? MK_LBUTTON : 0) | (down(VK_RBUTTON) ? MK_RBUTTON : 0) |
                           (down(VK_MBUTTON) ? MK_MBUTTON : 0) | (down(VK_SHIFT) ? MK_SHIFT : 0) |
                           (down(VK_CONTROL) ? MK_CONTROL : 0));
}

void ReportMouse(UINT message, POINT point, int data) {
  g_cursorPoint = point;
  const bool isFirst = !IsButtonDown();
  if (const BYTE key = ButtonKey(message)) NoteKey(g_asyncKeys, key, IsButtonUp(message));
  if (isFirst && IsButtonDown()) g_pressedOver = HandleOf(WindowAt(Desktop(), point));
  Thread* thread = MouseThread(point, CurrentThread());
  if (!IsButtonDown()) g_pressedOver = nullptr;
  if (thread == nullptr) return;
  // A move replaces one that still waits.
  if (message == WM_MOUSEMOVE && !thread->input.IsEmpty()) {
    MSG& last = thread->input.At(thread->input.Count() - 1).message;
    if (last.message == WM_MOUSEMOVE) {
      last.pt = point;
      return;
    }
  }
  const WPARAM wParam = MAKEWPARAM(0, data);
  Enqueue(thread, {nullptr, message, wParam, 0, static_cast<DWORD>(Now()), point},
          message == WM_MOUSEMOVE ? QS_MOUSEMOVE : QS_MOUSEBUTTON);
}

void ReportKey(WORD key, WORD scan, bool isUp, bool isExtended, WCHAR typed) {
  NoteKey(g_asyncKeys, key, isUp);
  const LPARAM lParam =
      1 | static_cast<LPARAM>(scan) << 16 | (isExtended ? 1 << 24 : 0) | (isUp ? static_cast<LPARAM>(0xC0000000) : 0);
  Enqueue(KeyThread(CurrentThread()),
          {nullptr, isUp ? static_cast<UINT>(WM_KEYUP) : static_cast<UINT>(WM_KEYDOWN), key, lParam,
           static_cast<DWORD>(Now()), g_cursorPoint},
          QS_KEY, typed);
}

Hit HitTest(POINT point) {
  HWND handle = nullptr;
  {
    const Guard guard;
    handle = HandleOf(WindowAt(Desktop(), point));
  }
  // A window that calls itself transparent leaves the point to those below it.
  for (int rounds = 0; handle != nullptr && rounds < 1000; ++rounds) {
    const int part = static_cast<int>(Send(handle, WM_NCHITTEST, 0, PointParam(point.x, point.y)));
    if (part != HTTRANSPARENT) return {handle, part};
    const Guard guard;
    const Window* window = FindWindowObject(handle);
    if (window == nullptr) return {};
    const POINT origin = ParentOrigin(window);
    const POINT inside{point.x - origin.x, point.y - origin.y};
    const Window* next = window->next;
    while (next != nullptr && !(next->IsVisible() && Contains(next->window, inside))) next = next->next;
    handle = HandleOf(next != nullptr ? next : IsRoot(window->parent) ? nullptr : window->parent);
  }
  return {};
}

bool TakeInput(Thread* thread, MSG* message, const Filter& filter, bool remove) {
  for (std::size_t i = 0; i < thread->input.Count();) {
    const Input input = thread->input.At(i);
    const MSG& raw = input.message;
    MSG routed = raw;
    // What a filter shuts out before it is routed stays; the kind of message may still change.
    const bool isKey = !IsMouse(raw.message);
    const BYTE oldKey = isKey ? thread->keys[raw.wParam & 0xFF] : 0;
    NoteTaken(thread, raw);
    bool isTaken = false;
    {
      const Unguarded unguarded;
      isTaken = isKey ? RouteKey(&routed, remove) : RouteMouse(&routed, remove);
    }
    if (i >= thread->input.Count()) return false;  // a nested loop took it
    if (!isTaken) {
      thread->input.Remove(i);
      continue;
    }
    if (!filter.FitsMessage(routed.message) || !filter.FitsWindow(routed.hwnd)) {
      if (isKey) thread->keys[raw.wParam & 0xFF] = oldKey;
      ++i;
      continue;
    }
    *message = routed;
    if (isKey) thread->lastKey = {routed, input.typed};
    if (remove) {
      thread->input.Remove(i);
    } else if (isKey) {
      thread->keys[raw.wParam & 0xFF] = oldKey;
    }
    return true;
  }
  return false;
}

}  // namespace platform::model

using namespace platform::model;

namespace {

void ReportMouseInput(const MOUSEINPUT& input) {
  POINT point = g_cursorPoint;
  const SIZE screen = platform::TheDisplay().ScreenSize();
  if (input.dwFlags & MOUSEEVENTF_MOVE) {
    if (input.dwFlags & MOUSEEVENTF_ABSOLUTE) {
      point = {static_cast<LONG>(static_cast<std::int64_t>(input.dx) * screen.cx >> 16),
               static_cast<LONG>(static_cast<std::int64_t>(input.dy) * screen.cy >> 16)};
    } else {
      point = {point.x + input.dx, point.y + input.dy};
    }
    point = {std::clamp<LONG>(point.x, 0, screen.cx - 1), std::clamp<LONG>(point.y, 0, screen.cy - 1)};
    ReportMouse(WM_MOUSEMOVE, point, 0);
  }
  struct Event {
    DWORD flag;
    UINT message;
  };
  static constexpr Event kEvents[] = {{MOUSEEVENTF_LEFTDOWN, WM_LBUTTONDOWN},   {MOUSEEVENTF_LEFTUP, WM_LBUTTONUP},
                                      {MOUSEEVENTF_RIGHTDOWN, WM_RBUTTONDOWN},  {MOUSEEVENTF_RIGHTUP, WM_RBUTTONUP},
                                      {MOUSEEVENTF_MIDDLEDOWN, WM_MBUTTONDOWN}, {MOUSEEVENTF_MIDDLEUP, WM_MBUTTONUP},
                                      {MOUSEEVENTF_WHEEL, WM_MOUSEWHEEL},       {MOUSEEVENTF_HWHEEL, WM_MOUSEHWHEEL}};
  for (const Event& event : kEvents)
    if (input.dwFlags & event.flag) ReportMouse(event.message, point, static_cast<int>(input.mouseData));
}

}  // namespace

UINT SendInput(UINT count, LPINPUT inputs, int size) {
  if (size != sizeof(INPUT) || inputs == nullptr) return Fail<UINT>(ERROR_INVALID_PARAMETER);
  CurrentThread();
  return OrNoMemory<UINT>(0, [&] {
    const Guard guard;
    Desktop();
    for (UINT i = 0; i < count; ++i) {
      if (inputs[i].type == INPUT_MOUSE) {
        ReportMouseInput(inputs[i].mi);
      } else if (inputs[i].type == INPUT_KEYBOARD) {
        const KEYBDINPUT& key = inputs[i].ki;
        const bool isCharacter = key.dwFlags & KEYEVENTF_UNICODE;
        ReportKey(isCharacter ? static_cast<WORD>(VK_PACKET) : key.wVk, key.wScan, key.dwFlags & KEYEVENTF_KEYUP,
                  key.dwFlags & KEYEVENTF_EXTENDEDKEY);
      }
    }
    return count;
  });
}

short GetKeyState(int key) {
  Thread* thread = CurrentThread();
  const Guard guard;
  const BYTE state = thread->keys[key & 0xFF];
  return static_cast<short>((state & 0x80 ? 0xFF80 : 0) | (state & 1));
}

short GetAsyncKeyState(int key) {
  const Guard guard;
  return static_cast<short>(g_asyncKeys[key & 0xFF] & 0x80 ? 0x8000 : 0);
}

BOOL GetKeyboardState(BYTE* state) {
  Thread* thread = CurrentThread();
  const Guard guard;
  std::copy_n(thread->keys, 256, state);
  return TRUE;
}

BOOL SetKeyboardState(BYTE* state) {
  Thread* thread = CurrentThread();
  const Guard guard;
  std::copy_n(state, 256, thread->keys);
  return TRUE;
}

HWND WindowFromPoint(POINT point) {
  const Guard guard;
  return HandleOf(WindowAt(Desktop(), point));
}

HWND ChildWindowFromPointEx(HWND parent, POINT point, UINT flags) {
  const Guard guard;
  const Window* window = Expect(parent);
  if (window == nullptr || !Contains(AtOrigin(window->client), point)) return nullptr;
  for (const Window* child = window->firstChild; child != nullptr; child = child->next) {
    if (!Contains(child->window, point)) continue;
    if ((flags & CWP_SKIPINVISIBLE) && !child->IsVisible()) continue;
    if ((flags & CWP_SKIPDISABLED) && (child->style & WS_DISABLED)) continue;
    if ((flags & CWP_SKIPTRANSPARENT) && (child->exStyle & WS_EX_TRANSPARENT)) continue;
    return child->handle;
  }
  return parent;
}

HWND ChildWindowFromPoint(HWND parent, POINT point) { return ChildWindowFromPointEx(parent, point, CWP_ALL); }
