#include "qxcore/platform/posix/window/handle_table.h"

namespace platform::model {

std::mutex g_lock;

namespace {

constexpr std::uint32_t kChunk = 1024;
constexpr std::uint32_t kChunks = 64;  // a slot's number has sixteen bits
constexpr std::uint32_t kLastGeneration = 0x7FFF;

struct Slot {
  std::atomic<Thread*> thread{nullptr};
  std::atomic<std::uint32_t> handle{0};  // of the object that is in it; 0 while it is free
  void* object = nullptr;
  Kind kind = Kind::Free;
  std::uint16_t generation = 0;
  std::uint32_t nextFree = 0;
};

std::atomic<Slot*> g_chunks[kChunks];
std::uint32_t g_used = 1;  // slots ever used; number 0 stays empty
// The free slots in the order in which they became free, so that a number comes back as late as can be.
std::uint32_t g_firstFree = 0, g_lastFree = 0;

Slot* SlotAt(std::uint32_t number) {
  Slot* chunk = g_chunks[number / kChunk].load(std::memory_order_acquire);
  return chunk != nullptr ? &chunk[number % kChunk] : nullptr;
}

std::uint32_t TakeSlot() {
  if (g_used < kChunk * kChunks && (g_firstFree == 0 || g_used < kChunk)) {
    std::atomic<Slot*>& chunk = g_chunks[g_used / kChunk];
    if (chunk.load(std::memory_order_relaxed) == nullptr) {
      auto* slots = static_cast<Slot*>(Allocate(sizeof(Slot) * kChunk));
      for (std::uint32_t i = 0; i < kChunk; ++i) new (&slots[i]) Slot;
      chunk.store(slots, std::memory_order_release);
    }
    return g_used++;
  }
  if (g_firstFree == 0) throw std::bad_alloc();
  const std::uint32_t number = g_firstFree;
  g_firstFree = SlotAt(number)->nextFree;
  if (g_firstFree == 0) g_lastFree = 0;
  return number;
}

void GiveSlot(std::uint32_t number) {
  SlotAt(number)->nextFree = 0;
  if (g_lastFree != 0) SlotAt(g_lastFree)->nextFree = number;
  if (g_firstFree == 0) g_firstFree = number;
  g_lastFree = number;
}

Slot* SlotOf(Kind kind, const void* handle) {
  const auto value = reinterpret_cast<std::uintptr_t>(handle);
  if (value < 0x10000 || value > 0x7FFFFFFF) return nullptr;
  Slot* slot = SlotAt(value & 0xFFFF);
  const bool fits = slot != nullptr && slot->kind == kind && slot->handle.load(std::memory_order_relaxed) == value;
  return fits ? slot : nullptr;
}

}  // namespace

void* AddObject(Kind kind, void* object, Thread* thread) {
  const std::uint32_t number = TakeSlot();
  Slot& slot = *SlotAt(number);
  slot.generation = slot.generation == kLastGeneration ? 1 : slot.generation + 1;
  slot.object = object;
  slot.kind = kind;
  const std::uint32_t handle = static_cast<std::uint32_t>(slot.generation) << 16 | number;
  slot.handle.store(handle, std::memory_order_relaxed);
  slot.thread.store(thread, std::memory_order_release);
  return reinterpret_cast<void*>(static_cast<std::uintptr_t>(handle));
}

void* FindObject(Kind kind, const void* handle) {
  const Slot* slot = SlotOf(kind, handle);
  return slot != nullptr ? slot->object : nullptr;
}

void* RemoveObject(Kind kind, const void* handle) {
  Slot* slot = SlotOf(kind, handle);
  if (slot == nullptr) return nullptr;
  slot->thread.store(nullptr, std::memory_order_relaxed);
  slot->handle.store(0, std::memory_order_relaxed);
  slot->kind = Kind::Free;
  void* object = slot->object;
  slot->object = nullptr;
  GiveSlot(reinterpret_cast<std::uintptr_t>(handle) & 0xFFFF);
  return object;
}

Window* FindOwnWindow(HWND handle, const Thread* thread) {
  const auto value = reinterpret_cast<std::uintptr_t>(handle);
  if (value < 0x10000 || value > 0x7FFFFFFF) return nullptr;
  Slot* slot = SlotAt(value & 0xFFFF);
  // The order matters: once the slot is seen to be the caller's own, nobody else changes it.
  if (slot == nullptr || slot->thread.load(std::memory_order_acquire) != thread) return nullptr;
  return slot->handle.load(std::memory_order_relaxed) == value ? static_cast<Window*>(slot->object) : nullptr;
}

void VisitObjects(Kind kind, void (*visit)(void* context, void* object), void* context) {
  for (std::uint32_t number = 1; number < g_used; ++number) {
    const Slot* slot = SlotAt(number);
    if (slot->kind == kind) visit(context, slot->object);
  }
}

}  // namespace platform::model
