// A handle of the platform's global memory, not owned unless a user says so.
// Threads: an object belongs to one thread at a time.
#pragma once

#include "qxcore/platform/export.h"
#include "qxcore/platform/win32.h"

class QXCORE_API SHGlobal {
 public:
  constexpr SHGlobal() = default;
  // Holds the handle, which stays its owner's.
  explicit constexpr SHGlobal(HGLOBAL handle) : m_handle(handle) {}

  // Allocates movable memory, forgetting the former handle; `flags` as GlobalAlloc takes them, to which
  // GMEM_MOVEABLE is added. Throws SEOutOfMemory.
  void Alloc(unsigned int flags, unsigned long size);
  // Resizes, keeping the content; unlock before. Throws SEOutOfMemory and keeps the memory as it was.
  void ReAlloc(unsigned long size, unsigned int flags);
  void* Lock() const;  // null for a null handle
  void Unlock() const;
  unsigned long Size() const;  // what the platform gave, at least what was asked for
  void Free();                 // frees the memory and forgets the handle
  void Attach(HGLOBAL handle) { m_handle = handle; }
  HGLOBAL Detach();
  operator HGLOBAL() const { return m_handle; }

 private:
  HGLOBAL m_handle = nullptr;
};
