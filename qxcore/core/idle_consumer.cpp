#include "qxcore/core/idle_consumer.h"

#include <new>

#include "qxcore/core/memory.h"

// A ring of its own, because the allocators behind the usual list nodes are idle consumers themselves. The ring
// cannot link the consumers to each other: one consumer may be registered several times.
struct SIdleConsumerList::Place {
  Place* m_next;
  Place* m_prev;
  SIdleConsumer* m_consumer;

  void LinkBefore(Place* before) {
    m_next = before;
    m_prev = before->m_prev;
    m_prev->m_next = m_next->m_prev = this;
  }
  void Unlink() {
    m_prev->m_next = m_next;
    m_next->m_prev = m_prev;
  }
};

// A pass of OnIdleAll that is under way, on the stack of its caller.
struct SIdleConsumerList::Walk {
  Place* m_next;  // the place to call next; moved on when that one leaves
  Walk* m_outer;
  bool m_ended;  // the storage is gone
};

struct SIdleConsumerList::Storage {
  Place m_end{&m_end, &m_end, nullptr};  // links the first and the last place into a ring
  int m_count = 0;
  Walk* m_walks = nullptr;

  Place* Front() { return m_end.m_next; }
  void MoveFrontToBack() {
    Place* front = Front();
    front->Unlink();
    front->LinkBefore(&m_end);
  }
  void Remove(Place* place) {
    for (Walk* walk = m_walks; walk != nullptr; walk = walk->m_outer) {
      if (walk->m_next == place) walk->m_next = place->m_next;
    }
    place->Unlink();
    SMemFree(place);
    --m_count;
  }
};

// Out of line, so that no compiler sees in a caller that the pointer is null.
SIdleConsumerList* SIdleConsumerList::Common() { return nullptr; }

// Takes the pointer as an argument, so that no compiler concludes from `this` that it is not null.
SIdleConsumerList::Fields& SIdleConsumerList::FieldsOf(SIdleConsumerList* list) {
  static constinit Fields common{0, nullptr};
  return list != nullptr ? list->m_fields : common;
}

void SIdleConsumerList::DropStorage(Fields& fields) {
  Storage* storage = fields.m_storage;
  if (storage == nullptr) return;
  fields.m_storage = nullptr;
  for (Walk* walk = storage->m_walks; walk != nullptr; walk = walk->m_outer) walk->m_ended = true;
  while (storage->m_count != 0) storage->Remove(storage->Front());
  SMemFree(storage);
}

SIdleConsumerList::~SIdleConsumerList() { DropStorage(m_fields); }

void SIdleConsumerList::Register(SIdleConsumer* consumer) {
  Fields& fields = FieldsOf(this);
  auto* place = static_cast<Place*>(SMemAlloc(sizeof(Place)));
  try {
    if (fields.m_storage == nullptr) fields.m_storage = new (SMemAlloc(sizeof(Storage))) Storage;
  } catch (...) {
    SMemFree(place);
    throw;
  }
  Storage* storage = fields.m_storage;
  new (place) Place{nullptr, nullptr, consumer};
  place->LinkBefore(&storage->m_end);
  ++storage->m_count;
  for (Walk* walk = storage->m_walks; walk != nullptr; walk = walk->m_outer) {
    if (walk->m_next == &storage->m_end) walk->m_next = place;
  }
}

void SIdleConsumerList::Unregister(SIdleConsumer* consumer) {
  Fields& fields = FieldsOf(this);
  Storage* storage = fields.m_storage;
  if (storage == nullptr) return;
  if (consumer == nullptr) return DropStorage(fields);
  Place* place = storage->Front();
  while (place != &storage->m_end && place->m_consumer != consumer) place = place->m_next;
  if (place != &storage->m_end) storage->Remove(place);
  if (storage->m_count == 0) DropStorage(fields);
}

int SIdleConsumerList::GetCount() const {
  const Storage* storage = FieldsOf(const_cast<SIdleConsumerList*>(this)).m_storage;
  return storage != nullptr ? storage->m_count : 0;
}

SIdleConsumer* SIdleConsumerList::GetNext() {
  Storage* storage = FieldsOf(this).m_storage;
  if (storage == nullptr) return nullptr;
  SIdleConsumer* front = storage->Front()->m_consumer;
  storage->MoveFrontToBack();
  return front;
}

int SIdleConsumerList::OnIdleAll(int count) {
  Storage* storage = FieldsOf(this).m_storage;
  if (count == 0 || storage == nullptr) return 0;

  // Held in an object, so that a consumer that throws leaves no walk behind.
  struct Pass : Walk {
    explicit Pass(Storage& passed) : Walk{passed.Front(), passed.m_walks, false}, m_storage(passed) {
      passed.m_walks = this;
    }
    ~Pass() {
      if (!m_ended) m_storage.m_walks = m_outer;
    }
    Storage& m_storage;
  } pass(*storage);

  int wantsMore = 0;
  while (!pass.m_ended && pass.m_next != &storage->m_end) {
    SIdleConsumer* consumer = pass.m_next->m_consumer;
    pass.m_next = pass.m_next->m_next;
    if (consumer->OnIdle(count) != 0) wantsMore = 1;
  }
  return wantsMore;
}

int SIdleConsumerList::OnIdleNext(int count) {
  Fields& fields = FieldsOf(this);
  if (fields.m_storage == nullptr) return 0;
  if (count != 0 || fields.m_cycle < 1) fields.m_cycle = fields.m_storage->m_count;
  if (fields.m_cycle == 0) return 0;
  SIdleConsumer* front = fields.m_storage->Front()->m_consumer;
  if (front->OnIdle(count) != 0) return 1;
  // The call may have removed the consumer; then there is nothing to move.
  Storage* storage = fields.m_storage;
  if (storage != nullptr && storage->Front()->m_consumer == front) storage->MoveFrontToBack();
  return --fields.m_cycle == 0 ? 1 : 0;
}

SIdleConsumer::SIdleConsumer(SIdleConsumerList* list) : m_idleList(list) { m_idleList->Register(this); }

SIdleConsumer::~SIdleConsumer() { m_idleList->Unregister(this); }

int SIdleConsumer::OnIdle(int) { return 0; }
