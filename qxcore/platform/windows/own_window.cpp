#include "qxcore/platform/internal/own_window.h"

bool platform::IsOwnWindow(HWND window) noexcept {
  const DWORD error = GetLastError();
  const DWORD thread = GetWindowThreadProcessId(window, nullptr);
  if (thread == 0) SetLastError(error);
  return thread == GetCurrentThreadId();
}
