// The text of a window: the messages that read and write it, and their default answers.

#include "qxcore/platform/posix/display/display.h"
#include "qxcore/platform/posix/window/default_proc.h"
#include "qxcore/platform/posix/window/send.h"

namespace platform::model {

bool SetText(HWND handle, LPCWSTR text) {
  return OrNoMemory<bool>(false, [&] {
    const Guard guard;
    Window* window = FindWindowObject(handle);
    if (window == nullptr) return false;
    if (text != nullptr) {
      window->text = text;
    } else {
      window->text.clear();
    }
    return true;
  });
}

LRESULT DefaultSetText(HWND handle, LPCWSTR text) {
  if (!SetText(handle, text)) return FALSE;
  if (IsTopLevel(handle)) TheDisplay().SetTitle(handle, text != nullptr ? text : u"");
  PaintFrame(handle);
  return TRUE;
}

LRESULT DefaultGetText(HWND handle, WPARAM capacity, LPWSTR buffer) {
  const Guard guard;
  const Window* window = FindWindowObject(handle);
  if (window == nullptr || capacity == 0) return 0;
  const std::size_t count = std::min<std::size_t>(window->text.size(), capacity - 1);
  std::copy_n(window->text.data(), count, buffer);
  buffer[count] = 0;
  return static_cast<LRESULT>(count);
}

LRESULT DefaultGetTextLength(HWND handle) {
  const Guard guard;
  const Window* window = FindWindowObject(handle);
  return window != nullptr ? static_cast<LRESULT>(window->text.size()) : 0;
}

}  // namespace platform::model

using namespace platform::model;

BOOL SetWindowTextW(HWND window, LPCWSTR text) {
  if (!IsWindow(window)) return Fail(ERROR_INVALID_WINDOW_HANDLE);
  return Send(window, WM_SETTEXT, 0, reinterpret_cast<LPARAM>(text)) != 0;
}

int GetWindowTextW(HWND window, LPWSTR text, int capacity) {
  if (capacity <= 0 || text == nullptr) return 0;
  text[0] = 0;
  if (!IsWindow(window)) return Fail<int>(ERROR_INVALID_WINDOW_HANDLE);
  return static_cast<int>(Send(window, WM_GETTEXT, static_cast<WPARAM>(capacity), reinterpret_cast<LPARAM>(text)));
}

int GetWindowTextLengthW(HWND window) {
  if (!IsWindow(window)) return Fail<int>(ERROR_INVALID_WINDOW_HANDLE);
  return static_cast<int>(Send(window, WM_GETTEXTLENGTH));
}
