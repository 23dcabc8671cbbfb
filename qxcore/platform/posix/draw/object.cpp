#include "qxcore/platform/posix/draw/object.h"

#include <mutex>
#include <new>

namespace draw {

constinit Slot g_slots[kSlots] = {};  // so that a program which draws nothing touches none of it

namespace {

std::mutex g_lock;
std::uint32_t g_used = 1;       // slots from here on were never used; slot 0 never is
std::uint16_t g_freed[kSlots];  // a stack of slots that became free
std::uint32_t g_freedCount = 0;
std::uint8_t g_generation[kSlots];

// 0 when the table is full.
std::uint32_t TakeSlot() {
  if (g_freedCount > 0) return g_freed[--g_freedCount];
  return g_used < kSlots ? g_used++ : 0;
}

std::uint32_t HandleNumber(std::uint32_t slot, DWORD type) {
  return std::uint32_t{++g_generation[slot]} << 24 | type << 16 | slot;
}

}  // namespace

void* Object::operator new(std::size_t size) noexcept { return ::operator new(size, std::nothrow); }

void Object::operator delete(void* block) noexcept { ::operator delete(block); }

HANDLE Enter(Object* object) {
  if (!object) return Fail<HANDLE>(nullptr, ERROR_NOT_ENOUGH_MEMORY);
  Ref<Object> keep(object);
  std::lock_guard guard(g_lock);
  std::uint32_t slot = TakeSlot();
  if (slot == 0) return Fail<HANDLE>(nullptr, ERROR_NOT_ENOUGH_MEMORY);
  std::uint32_t number = HandleNumber(slot, object->m_type);
  object->m_handle = reinterpret_cast<HANDLE>(std::uintptr_t{number});
  object->m_references.fetch_add(1, std::memory_order_relaxed);
  g_slots[slot].object = object;
  g_slots[slot].handle.store(number, std::memory_order_release);
  return object->m_handle;
}

Ref<Object> Remove(HANDLE handle) {
  std::lock_guard guard(g_lock);
  Object* object = FindObject(handle);
  if (!object) return Fail(Ref<Object>(), ERROR_INVALID_HANDLE);
  std::uint32_t slot = reinterpret_cast<std::uintptr_t>(handle) % kSlots;
  g_slots[slot].handle.store(0, std::memory_order_release);
  g_slots[slot].object = nullptr;
  g_freed[g_freedCount++] = static_cast<std::uint16_t>(slot);
  Ref<Object> removed(object);
  object->m_references.fetch_sub(1, std::memory_order_relaxed);
  return removed;
}

}  // namespace draw
