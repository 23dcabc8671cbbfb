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

void SHandleMap::SetPermanent(void* handle, SObject* object) { m_permanent.Add(handle, object); }

void SHandleMap::RemovePermanent(void* handle) { m_permanent.Remove(handle); }

void SHandleMap::RemoveTemporary(void* handle) { m_temporary.Remove(handle); }

// One at a time, so that a destructor may look into the map.
void SHandleMap::DeleteTempMap() {
  while (!m_temporary.empty()) {
    auto first = m_temporary.begin();
    SObject* object = first->m_value;
    m_temporary.Remove(first);
    DestroyTemporary(object);
  }
}
