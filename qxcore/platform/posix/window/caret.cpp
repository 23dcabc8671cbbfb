// The caret, one a thread. It counts how often it was hidden, and is painted by inverting.

#include "qxcore/platform/posix/window/controls.h"
#include "qxcore/platform/posix/window/send.h"

namespace platform::model {
namespace {

constexpr UINT kBlinkTime = 500;  // milliseconds

// Inverts the caret's pixels if it is on the screen.
void Invert(const Caret& caret) {
  if (caret.window == nullptr || caret.hidden > 0 || g_painter.caret == nullptr) return;
  g_painter.caret(caret.window, {caret.x, caret.y, caret.x + caret.width, caret.y + caret.height});
}

// Changes the caret of the thread between taking it off the screen and putting it back.
template <class Change>
BOOL ChangeCaret(HWND handle, Change change) {
  Thread* thread = CurrentThread();
  Caret before, after;
  {
    const Guard guard;
    if (thread->caret.window == nullptr || (handle != nullptr && handle != thread->caret.window))
      return Fail(ERROR_ACCESS_DENIED);
    before = thread->caret;
    change(thread->caret);
    after = thread->caret;
  }
  Invert(before);
  Invert(after);
  return TRUE;
}

}  // namespace
}  // namespace platform::model

using namespace platform::model;

// Without a bitmap's shape: a solid block (null) and a grey one (1) look alike.
BOOL CreateCaret(HWND handle, HBITMAP, int width, int height) {
  DestroyCaret();
  Thread* thread = CurrentThread();
  const Guard guard;
  if (Expect(handle) == nullptr) return FALSE;
  thread->caret = {handle,
                   0,
                   0,
                   width != 0 ? width : GetSystemMetrics(SM_CXBORDER),
                   height != 0 ? height : GetSystemMetrics(SM_CYBORDER),
                   1};
  return TRUE;
}

BOOL DestroyCaret() {
  return ChangeCaret(nullptr, [](Caret& caret) { caret = {}; });
}

BOOL ShowCaret(HWND window) {
  return ChangeCaret(window, [](Caret& caret) { caret.hidden = std::max(caret.hidden - 1, 0); });
}

BOOL HideCaret(HWND window) {
  return ChangeCaret(window, [](Caret& caret) { ++caret.hidden; });
}

BOOL SetCaretPos(int x, int y) {
  return ChangeCaret(nullptr, [&](Caret& caret) {
    caret.x = x;
    caret.y = y;
  });
}

BOOL GetCaretPos(LPPOINT point) {
  Thread* thread = CurrentThread();
  const Guard guard;
  *point = {thread->caret.x, thread->caret.y};
  return TRUE;
}

UINT GetCaretBlinkTime() { return kBlinkTime; }
