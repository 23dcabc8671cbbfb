#include "qxcore/core/debug_counter.h"

#include <cstring>
#include <mutex>
#include <string_view>

#include "qxcore/core/memory.h"
#include "qxcore/platform/interlocked.h"

namespace {

struct Counter {
  Counter* m_next;
  const WCHAR* m_unit;
  const std::int32_t* m_value;

  WCHAR* Name() { return reinterpret_cast<WCHAR*>(this + 1); }
};

constinit platform::ShortLock g_lock;
constinit Counter* g_first = nullptr;

}  // namespace

int SDbgAddCounter(const WCHAR* name, const WCHAR* unit, const std::int32_t* value) noexcept {
  std::size_t nameBytes = (SStringView(name).size() + 1) * sizeof(WCHAR);
  auto* counter = static_cast<Counter*>(SMemTryAlloc(sizeof(Counter) + nameBytes));
  if (counter == nullptr) return 0;
  *counter = {nullptr, unit, value};
  std::memcpy(counter->Name(), name, nameBytes);
  std::lock_guard guard(g_lock);
  Counter** last = &g_first;
  while (*last != nullptr) last = &(*last)->m_next;
  *last = counter;
  return 1;
}

void SDbgRemoveCounter(const std::int32_t* value) noexcept {
  Counter* removed = nullptr;
  {
    std::lock_guard guard(g_lock);
    Counter** link = &g_first;
    while (*link != nullptr && (*link)->m_value != value) link = &(*link)->m_next;
    removed = *link;
    if (removed != nullptr) *link = removed->m_next;
  }
  SMemFree(removed);
}

int SDbgForEachCounter(void (*visit)(const WCHAR*, const WCHAR*, std::int32_t, void*), void* context) {
  std::lock_guard guard(g_lock);
  int count = 0;
  for (Counter* counter = g_first; counter != nullptr; counter = counter->m_next, ++count) {
    visit(counter->Name(), counter->m_unit, *counter->m_value, context);
  }
  return count;
}
