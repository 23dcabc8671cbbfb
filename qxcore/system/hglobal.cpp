#include "qxcore/system/hglobal.h"

#include "qxcore/core/exception.h"
#include "qxcore/core/internal/memory_failures.h"

void SHGlobal::Alloc(unsigned int flags, unsigned long size) {
  HGLOBAL made = SMemMustFail() ? nullptr : GlobalAlloc(flags | GMEM_MOVEABLE, size);
  if (made == nullptr) throw SEOutOfMemory();
  m_handle = made;
}

void SHGlobal::ReAlloc(unsigned long size, unsigned int flags) {
  HGLOBAL resized = SMemMustFail() ? nullptr : GlobalReAlloc(m_handle, size, flags);
  if (resized == nullptr) throw SEOutOfMemory();
  m_handle = resized;
}

void* SHGlobal::Lock() const { return m_handle != nullptr ? GlobalLock(m_handle) : nullptr; }
void SHGlobal::Unlock() const {
  if (m_handle != nullptr) GlobalUnlock(m_handle);
}
unsigned long SHGlobal::Size() const {
  return m_handle != nullptr ? static_cast<unsigned long>(GlobalSize(m_handle)) : 0;
}
void SHGlobal::Free() {
  if (m_handle != nullptr) GlobalFree(Detach());
}
HGLOBAL SHGlobal::Detach() {
  HGLOBAL handle = m_handle;
  m_handle = nullptr;
  return handle;
}
