#include "qxcore/ui/app/internal/modal_record.h"

#include "qxcore/container/table_dumb.h"
#include "qxcore/core/exception.h"
#include "qxcore/ui/window/internal/guard.h"
#include "qxcore/ui/window/window.h"

static BOOL CALLBACK CollectEnabled(HWND window, LPARAM table) {
  return SGuarded(FALSE, [=] {
    if (::IsWindowEnabled(window)) reinterpret_cast<STableDumb<HWND>*>(table)->Add(window);
    return TRUE;
  });
}

// The enumeration only collects: what is called for a window may make and destroy others.
static STableDumb<HWND> EnabledTopLevelWindows() {
  STableDumb<HWND> windows;
  ::SetLastError(ERROR_SUCCESS);
  ::EnumThreadWindows(::GetCurrentThreadId(), &CollectEnabled, reinterpret_cast<LPARAM>(&windows));
  SWndThreadState::Get().ThrowException();
  if (::GetLastError() == ERROR_NOT_ENOUGH_MEMORY) throw SEOutOfMemory();
  return windows;
}

// The entry comes first, so that every window that was disabled stands in the record.
void SModalRecord::Disable(HWND window) {
  SWnd* object = SWnd::FromHandlePermanent(window);
  if (object != nullptr && !object->OnModalDisable(1)) return;
  if (!::IsWindow(window)) return;
  m_disabled.Add(window, 1);
  ::SetLastError(ERROR_SUCCESS);
  ::EnableWindow(window, FALSE);
  if (::GetLastError() == ERROR_NOT_ENOUGH_MEMORY) throw SEOutOfMemory();
}

void SModalRecord::DisableWindows(HWND ownerWindow, bool ownerOnly) {
  if (ownerWindow != nullptr && ::IsWindowEnabled(ownerWindow)) {
    m_first = ownerWindow;
    Disable(ownerWindow);
  }
  if (ownerOnly) return;
  const STableDumb<HWND> windows = EnabledTopLevelWindows();
  for (int i = 0; i < windows.GetCount(); ++i) {
    const HWND window = windows.GetConst(i);
    if (window != ownerWindow && ::IsWindowEnabled(window)) Disable(window);
  }
}

static void EnableAgain(HWND window) {
  if (!::IsWindow(window)) return;
  ::EnableWindow(window, TRUE);
  if (SWnd* object = SWnd::FromHandlePermanent(window)) object->OnModalDisable(0);
}

void SModalRecord::EnableWindows() {
  if (m_first != nullptr && m_disabled.Remove(m_first)) EnableAgain(m_first);
  while (!m_disabled.empty()) {
    auto first = m_disabled.begin();
    const HWND window = first->m_key;
    m_disabled.Remove(first);
    EnableAgain(window);
  }
}

// Swapping takes no memory where this record has disabled nothing of its own; else a window whose entry cannot be
// made is enabled now rather than never.
void SModalRecord::Inherit(SModalRecord& other) noexcept {
  if (m_first == nullptr) m_first = other.m_first;
  m_tellsFrames |= other.m_tellsFrames;
  if (m_disabled.empty()) {
    m_disabled.Swap(other.m_disabled);
    return;
  }
  for (const auto& entry : other.m_disabled) {
    try {
      m_disabled.Add(entry.m_key, 1);
    } catch (...) {
      EnableAgain(entry.m_key);
    }
  }
}
