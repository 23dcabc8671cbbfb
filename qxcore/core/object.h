// Run-time class records and the root of all polymorphic classes.
//
// Every class below SObject describes itself with one static SClassInfo record, named after the
// class ("classSFoo"). Type tests compare records by identity and walk the chain of bases. All
// records of the library and of every module that links to it hang in one list, g_pClassInfo.
//
// The list is not locked: records are made and ended while modules are loaded and unloaded, which
// the system serialises. Threads: the type tests may run in any thread.
#pragma once

#include <cstddef>
#include <cstdint>

#include "qxcore/platform/export.h"
#include "qxcore/platform/win32.h"

class SObject;

struct QXCORE_API SClassInfo {
  // Makes a record and appends it to the process-wide list. `className` must outlive the record,
  // `create` is null for a class that cannot be made without arguments.
  SClassInfo(const char* className, unsigned long schema, unsigned int objectSize, SClassInfo* base,
             SObject* (*create)());

  // A copy has the same six values, the link included, but does not stand in the list.
  SClassInfo(const SClassInfo& other) = default;
  SClassInfo& operator=(const SClassInfo& other) = default;

  // Takes the record out of the list; a record that is not in it leaves the list as it is.
  virtual ~SClassInfo();

  // 1 if `ancestor` is a proper ancestor of this class, else 0; a class does not derive from itself.
  int IsDerivedFrom(const SClassInfo* ancestor) const;

  // A new object of the class, owned by the caller, or null when the class has no factory.
  SObject* CreateObject() const;

  const char* m_className;     // exactly as the class is spelled; not owned
  std::uint32_t m_schema;      // for persistent formats of clients; the library never reads it
  std::uint32_t m_objectSize;  // bytes of one instance
  SClassInfo* m_base;          // null for SObject only; not owned
  SClassInfo* m_next;          // next record of the list
  SObject* (*m_create)();      // null when the class cannot be created dynamically
};

// Head of the list of all class records; null before the first one is made.
extern QXCORE_API SClassInfo* g_pClassInfo;

// The root: what every polymorphic object of the library can do.
class QXCORE_API SObject {
 public:
  // The record of SObject itself: schema 1, no base, no factory.
  static SClassInfo classSObject;

  // The record of the object's own class.
  virtual SClassInfo* GetClassInfoW() const;
  virtual ~SObject();

  // Objects live on the runtime's heap. Failure throws SEOutOfMemory.
  static void* operator new(std::size_t size);
  static void* operator new(std::size_t, void* where) noexcept { return where; }
  static void operator delete(void* block) noexcept;
  static void operator delete(void*, void*) noexcept {}

  // The three type tests may be called through a null object pointer and then return 0, on purpose:
  // a caller tests a pointer that may be null in one call.
  int IsA(const SClassInfo* info) const;            // 1 if the object's own class is `info`
  int IsKindOf(const SClassInfo* info) const;       // 1 if it is `info` or derives from it
  int IsDerivedFrom(const SClassInfo* info) const;  // 1 if it derives from `info`; 0 for its own class

 protected:
  SObject() = default;
  SObject(const SObject&) {}
  SObject& operator=(const SObject&) { return *this; }
};

static_assert(sizeof(SObject) == sizeof(void*), "the root has no fields");
static_assert(sizeof(void*) != 4 || sizeof(SClassInfo) == 28, "the layout is public");

// The object as the class T when it is one, else null; null stays null.
template <class T>
T* SObjectCast(SObject* object, const SClassInfo* info) {
  return object->IsKindOf(info) ? static_cast<T*>(object) : nullptr;
}

// Declares the class record and its query in a class body. Leaves the access at public.
#define QXCORE_DECLARE_CLASS(Class) \
 public:                            \
  static SClassInfo class##Class;   \
  SClassInfo* GetClassInfoW() const override;

// The same for a class that can be created from its record.
#define QXCORE_DECLARE_CREATABLE_CLASS(Class) \
  QXCORE_DECLARE_CLASS(Class)                 \
  static SObject* CreateObject();

// Defines what the two above declare; in one source file, at namespace level.
#define QXCORE_IMPLEMENT_CLASS(Class, Base, schema)                                           \
  SClassInfo Class::class##Class(#Class, schema, sizeof(Class), &Base::class##Base, nullptr); \
  SClassInfo* Class::GetClassInfoW() const { return &class##Class; }
// The same for a class that QXCORE_DECLARE_CREATABLE_CLASS declares.
#define QXCORE_IMPLEMENT_CREATABLE_CLASS(Class, Base, schema)                                              \
  SClassInfo Class::class##Class(#Class, schema, sizeof(Class), &Base::class##Base, &Class::CreateObject); \
  SClassInfo* Class::GetClassInfoW() const { return &class##Class; }                                       \
  SObject* Class::CreateObject() { return new Class; }
