// Work for the time in which the application has nothing else to do.
//
// An SIdleConsumer registers itself with an SIdleConsumerList, and the message loop hands out idle
// time through that list, to all consumers at once or to one after the other in rotation.
//
// A null list stands for the process-wide common list: every member function of SIdleConsumerList
// may be called through a null pointer and then works on the common list, on purpose.
//
// For the user-interface thread only; nothing is locked. A consumer may unregister (and delete) itself
// or others, and register new ones, while it is being called.
#pragma once

#include <cstdint>

#include "qxcore/platform/export.h"

class SIdleConsumerList;

class QXCORE_API SIdleConsumer {
 public:
  // Registers the new object at the back of the list; null means the common list. The list must outlive
  // the consumer. Throws SEOutOfMemory.
  explicit SIdleConsumer(SIdleConsumerList* list);
  SIdleConsumer(const SIdleConsumer&) = delete;
  SIdleConsumer& operator=(const SIdleConsumer&) = delete;

  virtual ~SIdleConsumer();  // unregisters

  // Called in idle time. `count` is what the idle loop passes on: how often it has been idle since the
  // last message. Returns non-zero when the consumer wants more idle time. The base version returns 0.
  virtual int OnIdle(int count);

 protected:
  SIdleConsumerList* GetIdleList() const { return m_idleList; }  // null outside of any list

 private:
  SIdleConsumerList* m_idleList;  // null for the common list
};

// Consumers in the order in which they are called.
class QXCORE_API SIdleConsumerList {
 public:
  constexpr SIdleConsumerList() noexcept = default;
  SIdleConsumerList(const SIdleConsumerList&) = delete;
  SIdleConsumerList& operator=(const SIdleConsumerList&) = delete;
  ~SIdleConsumerList();  // forgets the consumers that are left; they are not owned

  // The common list: always null, see above.
  static SIdleConsumerList* Common();

  // Appends the consumer, which is not owned. Throws SEOutOfMemory.
  void Register(SIdleConsumer* consumer);
  // Removes the first occurrence of the consumer; null removes all consumers.
  void Unregister(SIdleConsumer* consumer);

  int GetCount() const;
  // Moves the front consumer to the back and returns it; null for an empty list.
  SIdleConsumer* GetNext();

  // Calls every consumer with `count`, front to back; one that is registered meanwhile is called, too.
  // Returns 1 if any of them wants more time, else 0. A count of 0 calls nobody and returns 0.
  int OnIdleAll(int count);

  // Calls one consumer. The front one keeps its place as long as it wants more time (result 1); else it
  // goes to the back, and the result is 1 when with it every consumer of the cycle has been served, else
  // 0. A count other than 0 begins a new cycle.
  int OnIdleNext(int count);

 private:
  struct Place;
  struct Walk;
  struct Storage;
  struct Fields {
    std::int32_t m_cycle;  // consumers still to be served in the current cycle of OnIdleNext
    Storage* m_storage;    // exists only while a consumer is registered
  };
  static Fields& FieldsOf(SIdleConsumerList* list);
  static void DropStorage(Fields& fields);

  Fields m_fields{0, nullptr};
};
