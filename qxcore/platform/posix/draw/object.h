// What a drawing handle names, and the table from handles to objects.
//
// A handle is a number: a slot, the kind, and the slot's generation, so that a stale one finds nothing. The table
// holds one reference to each object and every context one more to what is selected into it; so a selected object
// outlives its handle. Looking up takes no lock; entering and removing do.
//
// Where memory is short, std::bad_alloc is thrown inside and leaves no call: it fails with ERROR_NOT_ENOUGH_MEMORY.
#pragma once

#include <atomic>
#include <cstdint>
#include <new>
#include <utility>

#include "qxcore/platform/win32.h"

namespace draw {

constexpr DWORD kImageListType = 32;  // beside the OBJ_ numbers

class Object {
 public:
  explicit Object(DWORD type) : m_type(type) {}
  Object(const Object&) = delete;
  Object& operator=(const Object&) = delete;
  virtual ~Object() = default;

  // Null on failure, as the calls report it.
  static void* operator new(std::size_t size) noexcept;
  static void operator delete(void* block) noexcept;

  const DWORD m_type;        // an OBJ_ number
  bool m_permanent = false;  // a stock object: deleting it does nothing
  HANDLE m_handle = nullptr;
  std::atomic<int> m_references{0};
};

// A counted reference to an object; may be null.
template <class T>
class Ref {
 public:
  Ref() = default;
  Ref(T* object) : m_object(object) {
    if (object) object->m_references.fetch_add(1, std::memory_order_relaxed);
  }
  Ref(const Ref& other) : Ref(other.m_object) {}
  Ref(Ref&& other) noexcept : m_object(std::exchange(other.m_object, nullptr)) {}
  Ref& operator=(Ref other) noexcept {
    std::swap(m_object, other.m_object);
    return *this;
  }
  ~Ref() {
    if (m_object && m_object->m_references.fetch_sub(1, std::memory_order_acq_rel) == 1) delete m_object;
  }

  T* get() const { return m_object; }
  T* operator->() const { return m_object; }
  T& operator*() const { return *m_object; }
  explicit operator bool() const { return m_object != nullptr; }

 private:
  T* m_object = nullptr;
};

struct Slot {
  std::atomic<std::uint32_t> handle = 0;  // 0 when free
  Object* object = nullptr;
};
constexpr std::uint32_t kSlots = 0x10000;
extern Slot g_slots[kSlots];

inline Object* FindObject(HANDLE handle) {
  auto number = reinterpret_cast<std::uintptr_t>(handle);
  Slot& slot = g_slots[number % kSlots];
  return slot.handle.load(std::memory_order_acquire) == number ? slot.object : nullptr;
}

// The object of a handle if it is of the class T, else null with ERROR_INVALID_HANDLE.
template <class T>
T* Find(HANDLE handle) {
  Object* object = FindObject(handle);
  if (object && T::IsType(object->m_type)) [[likely]]
    return static_cast<T*>(object);
  SetLastError(ERROR_INVALID_HANDLE);
  return nullptr;
}

// Gives an object its handle; a null object (memory was short) and a full table give null and end the object.
HANDLE Enter(Object* object);
template <class Handle>
Handle EnterAs(Object* object) {
  return reinterpret_cast<Handle>(Enter(object));
}
// Takes the handle away from its object and returns the table's reference to it.
Ref<Object> Remove(HANDLE handle);

// Sets the last error and returns `result`.
template <class T>
T Fail(T result, DWORD error = ERROR_INVALID_PARAMETER) {
  SetLastError(error);
  return result;
}

// The result of a call for which memory is short.
template <class T>
T NoMemory(T result) {
  return Fail(result, ERROR_NOT_ENOUGH_MEMORY);
}

}  // namespace draw
