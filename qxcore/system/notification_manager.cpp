#include "qxcore/system/notification_manager.h"

#include <algorithm>
#include <cstdint>

#include "qxcore/container/comparers.h"
#include "qxcore/container/map.h"
#include "qxcore/container/table_dumb.h"
#include "qxcore/string/string.h"

namespace {

struct Registration {
  ISNotificationSink* sink;
  int kind;
  void* context;  // null for any

  // Whether an event about, or a request for, the given context concerns this registration.
  bool Concerns(const void* other) const { return context == nullptr || other == nullptr || context == other; }
};

// The registrations of one kind, in the order of calls.
struct KindRecord {
  STableDumb<Registration> table;
  std::int32_t firstCount = 0;  // registrations ever added with AdviseFirst
  std::int32_t lastCount = 0;   // and with AdviseLast
};

using Kinds = STableDumb<int>;  // sorted

struct Manager {
  SMap<SString, int, SAscStrCas> names;
  SMap<int, KindRecord> kinds;
  SMap<ISNotificationSink*, Kinds> sinks;
  int lastKind = 0;
};

// Never destroyed: static objects may unregister at the very end.
Manager& Instance() {
  static Manager& manager = *new Manager;
  return manager;
}

// False when it is there already.
bool AddKind(Kinds& kinds, int kind) {
  const int* place = std::lower_bound(kinds.cbegin(), kinds.cend(), kind);
  if (place != kinds.cend() && *place == kind) return false;
  kinds.Insert(static_cast<int>(place - kinds.cbegin()), kind);
  return true;
}

void RemoveKind(Kinds& kinds, int kind) {
  const int* place = std::lower_bound(kinds.cbegin(), kinds.cend(), kind);
  if (place != kinds.cend() && *place == kind) kinds.Remove(static_cast<int>(place - kinds.cbegin()));
}

// Removes the sink's registrations for which `goes` is true; the kind's record goes with the last one.
struct Removal {
  int removed = 0;
  int kept = 0;
};
template <class Goes>
Removal RemoveFromKind(int kind, ISNotificationSink* sink, Goes goes) {
  Removal result;
  KindRecord* record = Instance().kinds.Retrieve(kind);
  if (record == nullptr) return result;
  for (int i = 0; i < record->table.GetCount();) {
    const Registration& one = record->table.GetConst(i);
    if (one.sink != sink) {
      ++i;
    } else if (goes(one)) {
      record->table.Remove(i);
      ++result.removed;
    } else {
      ++result.kept;
      ++i;
    }
  }
  if (record->table.IsEmpty()) Instance().kinds.Remove(kind);
  return result;
}

enum class Place { kFirst, kOrdinary, kLast };

int IndexFor(const KindRecord& record, Place place) {
  const int count = record.table.GetCount();
  switch (place) {
    case Place::kFirst:
      return 0;
    case Place::kOrdinary:
      return (std::max)(count - record.lastCount, 0);
    default:
      return count;
  }
}

// Adds to the table of a kind, whose record exists if and only if it has registrations.
void AddToKind(const Registration& registration, Place place) {
  Manager& manager = Instance();
  KindRecord& record = manager.kinds[registration.kind];
  try {
    record.table.Insert(IndexFor(record, place), registration);
  } catch (...) {
    if (record.table.IsEmpty()) manager.kinds.Remove(registration.kind);
    throw;
  }
  record.firstCount += place == Place::kFirst;
  record.lastCount += place == Place::kLast;
}

int Register(const Registration& registration, Place place) {
  Manager& manager = Instance();
  const bool isNewSink = !manager.sinks.Contains(registration.sink);
  bool isNewKind = false;
  try {
    isNewKind = AddKind(manager.sinks[registration.sink], registration.kind);
    AddToKind(registration, place);
  } catch (...) {
    if (isNewKind) RemoveKind(manager.sinks[registration.sink], registration.kind);
    if (isNewSink) manager.sinks.Remove(registration.sink);
    throw;
  }
  if (isNewSink && registration.sink != nullptr) registration.sink->AddRef();
  return 1;
}

// A copy of a kind's table, for one pass. It shares nothing with the table, so that taking registrations
// away never needs memory; a few registrations fit without any.
class Snapshot {
 public:
  explicit Snapshot(const STableDumb<Registration>& table) : m_count(table.GetCount()), m_first(m_few) {
    if (m_count > kFew) {
      m_many.CopyArray(table.GetArray(), m_count);
      m_first = m_many.cbegin();
    } else {
      std::copy(table.cbegin(), table.cend(), m_few);
    }
  }
  const Registration* begin() const { return m_first; }
  const Registration* end() const { return m_first + m_count; }
  int GetCount() const { return m_count; }

 private:
  static constexpr int kFew = 32;
  int m_count;
  const Registration* m_first;
  Registration m_few[kFew];
  STableDumb<Registration> m_many;
};

}  // namespace

int SNotificationManager::NotificationKind(const WCHAR* name) {
  Manager& manager = Instance();
  const SString key(name);
  if (const int* kind = manager.names.Retrieve(key)) return *kind;
  manager.names.Add(key, manager.lastKind + 1);
  return ++manager.lastKind;
}

int SNotificationManager::Advise(ISNotificationSink* sink, int kind, void* context) {
  return Register({sink, kind, context}, Place::kOrdinary);
}
int SNotificationManager::AdviseFirst(ISNotificationSink* sink, int kind, void* context) {
  return Register({sink, kind, context}, Place::kFirst);
}
int SNotificationManager::AdviseLast(ISNotificationSink* sink, int kind, void* context) {
  return Register({sink, kind, context}, Place::kLast);
}

int SNotificationManager::Unadvise(ISNotificationSink* sink, int kind, void* context) {
  Kinds* kinds = Instance().sinks.Retrieve(sink);
  if (kinds == nullptr) return 0;
  const Removal result =
      RemoveFromKind(kind, sink, [context](const Registration& one) { return one.Concerns(context); });
  if (result.kept == 0) RemoveKind(*kinds, kind);
  return result.removed != 0;
}

int SNotificationManager::UnadviseAll(ISNotificationSink* sink) {
  Manager& manager = Instance();
  const Kinds* found = manager.sinks.Retrieve(sink);
  if (found == nullptr) return 0;
  const Kinds kinds = *found;
  for (int kind : kinds) RemoveFromKind(kind, sink, [](const Registration&) { return true; });
  if (manager.sinks.Remove(sink) && sink != nullptr) sink->Release();
  return 1;
}

int SNotificationManager::Notify(int kind, void* context, unsigned long data) {
  if (kind < 1) return 0;
  const KindRecord* record = Instance().kinds.Retrieve(kind);
  if (record == nullptr) return 0;
  const Snapshot pass(record->table);
  for (const Registration& one : pass) {
    if (one.Concerns(context) && one.sink != nullptr) one.sink->OnNotification(kind, context, data);
  }
  return pass.GetCount();
}
