#include "qxcore/core/object.h"

#include "qxcore/core/memory.h"

// Both ends of the list are constant-initialised, so that records of any module may be made first.
constinit SClassInfo* g_pClassInfo = nullptr;
static constinit SClassInfo* g_pLastClassInfo = nullptr;

SClassInfo::SClassInfo(const char* className, unsigned long schema, unsigned int objectSize, SClassInfo* base,
                       SObject* (*create)())
    : m_className(className),
      m_schema(static_cast<std::uint32_t>(schema)),
      m_objectSize(objectSize),
      m_base(base),
      m_next(nullptr),
      m_create(create) {
  if (g_pClassInfo == nullptr) {
    g_pClassInfo = this;
  } else {
    g_pLastClassInfo->m_next = this;
  }
  g_pLastClassInfo = this;
}

SClassInfo::~SClassInfo() {
  SClassInfo* previous = nullptr;
  SClassInfo* record = g_pClassInfo;
  while (record != nullptr && record != this) {
    previous = record;
    record = record->m_next;
  }
  if (record == nullptr) return;
  if (previous == nullptr) {
    g_pClassInfo = m_next;
  } else {
    previous->m_next = m_next;
  }
  if (g_pLastClassInfo == this) g_pLastClassInfo = previous;
}

int SClassInfo::IsDerivedFrom(const SClassInfo* ancestor) const {
  for (const SClassInfo* info = m_base; info != nullptr; info = info->m_base) {
    if (info == ancestor) return 1;
  }
  return 0;
}

SObject* SClassInfo::CreateObject() const { return m_create != nullptr ? m_create() : nullptr; }

SClassInfo SObject::classSObject("SObject", 1, sizeof(SObject), nullptr, nullptr);

SClassInfo* SObject::GetClassInfoW() const { return &classSObject; }

SObject::~SObject() = default;

void* SObject::operator new(std::size_t size) { return SMemAlloc(size); }

void SObject::operator delete(void* block) noexcept { SMemFree(block); }

// Takes the pointer by value, so that no compiler concludes from `this` that it cannot be null.
static const SClassInfo* InfoOrNull(const SObject* object) {
  return object != nullptr ? object->GetClassInfoW() : nullptr;
}

int SObject::IsA(const SClassInfo* info) const {
  const SClassInfo* own = InfoOrNull(this);
  return own != nullptr && own == info;
}

int SObject::IsKindOf(const SClassInfo* info) const {
  const SClassInfo* own = InfoOrNull(this);
  return own != nullptr && (own == info || own->IsDerivedFrom(info));
}

int SObject::IsDerivedFrom(const SClassInfo* info) const {
  const SClassInfo* own = InfoOrNull(this);
  return own != nullptr && own->IsDerivedFrom(info);
}
