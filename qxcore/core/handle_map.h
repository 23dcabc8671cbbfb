// SHandleMap: finds the object that wraps a native handle.
//
// The permanent map holds objects that own or attached their handle. The temporary map holds wrappers that were
// made on demand for handles which no object owns; they belong to the map and live until the application's
// idle time. Each class of wrappers has one map.
//
// The maps are process-wide and belong to the user-interface thread; nothing is locked.
#pragma once

#include "qxcore/container/map.h"
#include "qxcore/platform/export.h"

class SObject;

class QXCORE_API SHandleMap {
 public:
  SHandleMap() noexcept = default;
  SHandleMap(const SHandleMap&) = delete;
  SHandleMap& operator=(const SHandleMap&) = delete;

  // The permanent object of the handle, else its temporary one, else a new temporary one; null for a null
  // handle. Throws SEOutOfMemory.
  SObject* FromHandle(void* handle);
  // The permanent object of the handle, or null.
  SObject* FromHandlePermanent(void* handle) const;
  // The temporary object of the handle, or null.
  SObject* FromHandleTemporary(void* handle) const;

  // Enters the permanent object of a handle, which is not owned; an earlier one is replaced. Throws
  // SEOutOfMemory.
  void SetPermanent(void* handle, SObject* object);
  // Takes the handle out of the permanent map; nothing happens when it is not there.
  void RemovePermanent(void* handle);
  // Makes the handle's temporary object unknown without destroying it before the others; does nothing for
  // a handle without one. Throws SEOutOfMemory and then changes nothing.
  void DiscardTemporary(void* handle);

  // Destroys all temporary objects, in the order of their handles, then the discarded ones.
  void DeleteTempMap();

  // Changes whenever the permanent map does: what was found in it stays true as long as this number does.
  unsigned GetPermanentChanges() const { return m_changes; }
  int GetPermanentCount() const { return m_permanent.GetCount(); }  // entries of the permanent map
  int GetTemporaryCount() const { return m_temporary.GetCount(); }  // entries of the temporary map

 protected:
  // Not virtual: a map is never deleted through this class. The derived class deletes its temporary objects before.
  ~SHandleMap();

  // Makes a wrapper that does not own the handle. Throws SEOutOfMemory.
  virtual SObject* MakeTemporary(void* handle) = 0;
  // Destroys one; the handle stays as it is.
  virtual void DestroyTemporary(SObject* object) = 0;

 private:
  void DestroyAll(SMap<void*, SObject*>& map);

  SMap<void*, SObject*> m_permanent;
  SMap<void*, SObject*> m_temporary;
  SMap<void*, SObject*> m_discarded;  // by the object itself
  unsigned m_changes = 0;
};
