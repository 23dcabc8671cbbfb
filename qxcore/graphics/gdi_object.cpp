#include "qxcore/graphics/gdi_object.h"

#include <utility>

#include "qxcore/graphics/internal/wrapper_map.h"

QXCORE_IMPLEMENT_CREATABLE_CLASS(SGdiObject, SObject, 1)

using ObjectMap = TWrapperMap<SGdiObject, &SGdiObject::m_hObject>;

SGdiObject::SGdiObject() : m_map(&ObjectMap::Instance()) {}

SGdiObject::SGdiObject(HGDIOBJ object) : SGdiObject() { Attach(object); }

SGdiObject::~SGdiObject() { DeleteObject(); }

SGdiObject* SGdiObject::FromHandle(HGDIOBJ object) {
  return static_cast<SGdiObject*>(ObjectMap::Instance().FromHandle(object));
}

SGdiObject* SGdiObject::FromHandlePermanent(HGDIOBJ object) {
  return static_cast<SGdiObject*>(ObjectMap::Instance().FromHandlePermanent(object));
}

void SGdiObject::DeleteTempMap() { ObjectMap::Instance().DeleteTempMap(); }

int SGdiObject::Attach(HGDIOBJ object) {
  if (!object) return 0;
  if (object == m_hObject) return 1;
  m_map->SetPermanent(object, this);
  DeleteObject();
  m_hObject = object;
  return 1;
}

HGDIOBJ SGdiObject::Detach() {
  HGDIOBJ object = std::exchange(m_hObject, nullptr);
  if (object) m_map->RemovePermanent(object);
  return object;
}

int SGdiObject::DeleteObject() {
  HGDIOBJ object = Detach();
  return object && ::DeleteObject(object) ? 1 : 0;
}

static HGDIOBJ HandleOrNull(const SGdiObject* object) { return object != nullptr ? object->m_hObject : nullptr; }

HGDIOBJ SGdiObject::GetSafeHandle() const { return HandleOrNull(this); }

int SGdiObject::Hold(HGDIOBJ made) {
  DeleteObject();
  try {
    return Attach(made);
  } catch (...) {
    ::DeleteObject(made);
    throw;
  }
}
