#include "qxcore/platform/posix/window/handle_table.h"

namespace platform::model {

std::mutex g_lock;
std::atomic<Slot*> g_chunks[kChunks];

namespace {

constexpr std::uint32_t kLastGeneration = 0x7FFF;

std::uint32_t g_used = 1;  // slots ever used; number 0 stays empty
// The free slots in the order in which they became free, so that a number comes back as late as can be.
std::uint32_t g_firstFree = 0, g_lastFree = 0;

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

void* RemoveObject(Kind kind, const void* handle) {
  Slot* slot = FindSlot(kind, handle);
  if (slot == nullptr) return nullptr;
  slot->thread.store(nullptr, std::memory_order_relaxed);
  slot->handle.store(0, std::memory_order_relaxed);
  slot->kind = Kind::Free;
  void* object = slot->object;
  slot->object = nullptr;
  GiveSlot(reinterpret_cast<std::uintptr_t>(handle) & 0xFFFF);
  return object;
}

void VisitObjects(Kind kind, void (*visit)(void* context, void* object), void* context) {
  for (std::uint32_t number = 1; number < g_used; ++number) {
    const Slot* slot = SlotAt(number);
    if (slot->kind == kind) visit(context, slot->object);
  }
}

}  // namespace platform::model
