#include "qxcore/core/idle_consumer.h"

#include <new>

#include "qxcore/container/list.h"
#include "qxcore/core/memory.h"

namespace {

// The allocators behind the usual list nodes are idle consumers themselves; the nodes that hold the
// consumers therefore come from the heap.
struct HeapNodes {
  static void* Alloc(std::size_t size, std::size_t) { return SMemAlloc(size); }
  static void Free(void* node, std::size_t, std::size_t) noexcept { SMemFree(node); }
};
using ConsumerRing = SList<SIdleConsumer*, HeapNodes>;

}  // namespace

// A pass of OnIdleAll that is under way, on the stack of its caller.
struct SIdleConsumerList::Walk {
  ConsumerRing::iterator m_next;  // the consumer to call next; moved on when that one leaves
  Walk* m_outer;
  bool m_ended;  // the storage is gone
};

struct SIdleConsumerList::Storage {
  ConsumerRing m_ring;
  Walk* m_walks = nullptr;
};

// Takes the pointer as an argument, so that no compiler concludes from `this` that it is not null.
// Out of line, so that no compiler sees in a caller that the pointer is null.
SIdleConsumerList* SIdleConsumerList::Common() { return nullptr; }

SIdleConsumerList::Fields& SIdleConsumerList::FieldsOf(SIdleConsumerList* list) {
  static constinit Fields common{0, nullptr};
  return list != nullptr ? list->m_fields : common;
}

void SIdleConsumerList::DropStorage(Fields& fields) {
  Storage* storage = fields.m_storage;
  if (storage == nullptr) return;
  fields.m_storage = nullptr;
  for (Walk* walk = storage->m_walks; walk != nullptr; walk = walk->m_outer) walk->m_ended = true;
  storage->~Storage();
  SMemFree(storage);
}

SIdleConsumerList::~SIdleConsumerList() { DropStorage(m_fields); }

void SIdleConsumerList::Register(SIdleConsumer* consumer) {
  Fields& fields = FieldsOf(this);
  if (fields.m_storage == nullptr) fields.m_storage = new (SMemAlloc(sizeof(Storage))) Storage;
  Storage* storage = fields.m_storage;
  try {
    auto place = storage->m_ring.AddBack(consumer);
    for (Walk* walk = storage->m_walks; walk != nullptr; walk = walk->m_outer) {
      if (walk->m_next == storage->m_ring.end()) walk->m_next = place;
    }
  } catch (...) {
    if (storage->m_ring.IsEmpty()) DropStorage(fields);
    throw;
  }
}

void SIdleConsumerList::Unregister(SIdleConsumer* consumer) {
  Fields& fields = FieldsOf(this);
  Storage* storage = fields.m_storage;
  if (storage == nullptr) return;
  if (consumer == nullptr) return DropStorage(fields);
  for (auto place = storage->m_ring.begin(); place != storage->m_ring.end(); ++place) {
    if (*place != consumer) continue;
    for (Walk* walk = storage->m_walks; walk != nullptr; walk = walk->m_outer) {
      if (walk->m_next == place) ++walk->m_next;
    }
    storage->m_ring.Erase(place);
    break;
  }
  if (storage->m_ring.IsEmpty()) DropStorage(fields);
}

int SIdleConsumerList::GetCount() const {
  const Storage* storage = FieldsOf(const_cast<SIdleConsumerList*>(this)).m_storage;
  return storage != nullptr ? storage->m_ring.GetCount() : 0;
}

SIdleConsumer* SIdleConsumerList::GetNext() {
  Storage* storage = FieldsOf(this).m_storage;
  if (storage == nullptr) return nullptr;
  SIdleConsumer* front = storage->m_ring.GetFront();
  storage->m_ring.MoveToBack(storage->m_ring.begin());
  return front;
}

int SIdleConsumerList::OnIdleAll(int count) {
  Storage* storage = FieldsOf(this).m_storage;
  if (count == 0 || storage == nullptr) return 0;

  // Held in an object, so that a consumer that throws leaves no walk behind.
  struct Pass : Walk {
    explicit Pass(Storage& passed) : Walk{passed.m_ring.begin(), passed.m_walks, false}, m_storage(passed) {
      passed.m_walks = this;
    }
    ~Pass() {
      if (!m_ended) m_storage.m_walks = m_outer;
    }
    Storage& m_storage;
  } pass(*storage);

  int wantsMore = 0;
  while (!pass.m_ended && pass.m_next != storage->m_ring.end()) {
    SIdleConsumer* consumer = *pass.m_next;
    ++pass.m_next;
    if (consumer->OnIdle(count) != 0) wantsMore = 1;
  }
  return wantsMore;
}

int SIdleConsumerList::OnIdleNext(int count) {
  Fields& fields = FieldsOf(this);
  if (fields.m_storage == nullptr) return 0;
  if (count != 0 || fields.m_cycle < 1) fields.m_cycle = fields.m_storage->m_ring.GetCount();
  if (fields.m_cycle == 0) return 0;
  SIdleConsumer* front = fields.m_storage->m_ring.GetFront();
  if (front->OnIdle(count) != 0) return 1;
  // The call may have removed the consumer; then there is nothing to move.
  Storage* storage = fields.m_storage;
  if (storage != nullptr && storage->m_ring.GetFront() == front) storage->m_ring.MoveToBack(storage->m_ring.begin());
  return --fields.m_cycle == 0 ? 1 : 0;
}

SIdleConsumer::SIdleConsumer(SIdleConsumerList* list) : m_idleList(list) { m_idleList->Register(this); }

SIdleConsumer::~SIdleConsumer() { m_idleList->Unregister(this); }

int SIdleConsumer::OnIdle(int) { return 0; }
