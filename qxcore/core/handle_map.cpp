#include "qxcore/core/handle_map.h"

SHandleMap::~SHandleMap() = default;

static SObject* Find(const SMap<void*, SObject*>& map, void* handle) {
  SObject* const* object = map.Retrieve(handle);
  return object != nullptr ? *object : nullptr;
}

SObject* SHandleMap::FromHandlePermanent(void* handle) const { return Find(m_permanent, handle); }

SObject* SHandleMap::FromHandleTemporary(void* handle) const { return Find(m_temporary, handle); }

SObject* SHandleMap::FromHandle(void* handle) {
  if (handle == nullptr) return nullptr;
  if (SObject* object = FromHandlePermanent(handle)) return object;
  if (SObject* object = FromHandleTemporary(handle)) return object;
  SObject* made = MakeTemporary(handle);
  try {
    m_temporary.Add(handle, made);
  } catch (...) {
    DestroyTemporary(made);
    throw;
  }
  return made;
}

void SHandleMap::SetPermanent(void* handle, SObject* object) {
  ++m_changes;
  m_permanent.Add(handle, object);
}

void SHandleMap::RemovePermanent(void* handle) {
  ++m_changes;
  m_permanent.Remove(handle);
}

void SHandleMap::DiscardTemporary(void* handle) {
  SObject* object = FromHandleTemporary(handle);
  if (object == nullptr) return;
  m_discarded.Add(object, object);
  m_temporary.Remove(handle);
}

// One at a time, so that a destructor may look into the map.
void SHandleMap::DestroyAll(SMap<void*, SObject*>& map) {
  while (!map.empty()) {
    auto first = map.begin();
    SObject* object = first->m_value;
    map.Remove(first);
    DestroyTemporary(object);
  }
}

void SHandleMap::DeleteTempMap() {
  DestroyAll(m_temporary);
  DestroyAll(m_discarded);
}
