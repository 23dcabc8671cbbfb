// One modal state that disables windows: its place in the list of states, and what it disabled.
#pragma once

#include "qxcore/container/map.h"
#include "qxcore/core/memory.h"
#include "qxcore/platform/win32.h"

class SModalState;

struct SModalRecord {
  explicit SModalRecord(SModalState* owner) : m_owner(owner) {}
  static void* operator new(std::size_t size) { return SMemAlloc(size); }
  static void operator delete(void* block) noexcept { SMemFree(block); }

  // Disables the owner window, then, unless that is all, the thread's other enabled top-level windows. An object may
  // keep its window enabled. Throws SEOutOfMemory; what was disabled so far stands in the record.
  void DisableWindows(HWND ownerWindow, bool ownerOnly);
  // Enables what the record disabled, the owner window first, so that the activation finds it. Windows that no
  // longer exist are passed over.
  void EnableWindows();
  // Takes over what another record disabled.
  void Inherit(SModalRecord& other) noexcept;

  SModalRecord* m_outer = nullptr;  // the state around this one
  SModalRecord* m_inner = nullptr;  // the state within
  int m_enabled = 0;                // what SModalState::State() says while this is the innermost record
  SModalState* m_owner;             // null for SModalState::Enable
  SMap<HWND, int> m_disabled;       // the windows that this state disabled
  HWND m_first = nullptr;           // the one of them that is enabled first
  bool m_tellsFrames = false;       // in-place frames were disabled with it

 private:
  void Disable(HWND window);
};
