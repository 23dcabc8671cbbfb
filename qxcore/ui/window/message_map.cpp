#include "qxcore/ui/window/message_map.h"

#include "qxcore/ui/window/internal/message_cache.h"

namespace {

constexpr std::uintptr_t kNoAddress = 0xFFFF;  // what a signature holds up to here is a number

// The range test of an entry, which serves identifiers and, with 0, window messages.
bool HoldsId(const SMsgEntry& entry, UINT id) { return entry.m_firstId <= id && id <= entry.m_lastId; }

bool IsRegisteredAs(const SMsgEntry& entry, UINT message) {
  return entry.m_signature.m_number > kNoAddress && *entry.m_signature.m_registered == message;
}

// The first entry of the chain of maps that fits, or null.
template <class Fits>
const SMsgEntry* FindEntry(const SMsgMap* map, Fits fits) {
  for (; map != nullptr; map = map->m_getBase()) {
    for (const SMsgEntry* entry = map->m_entries; entry->m_signature.m_number != 0; ++entry) {
      if (fits(*entry)) return entry;
    }
  }
  return nullptr;
}

}  // namespace

constinit SMsgCacheSlot g_msgCache[256] = {};

const SMsgEntry* SFindMessageEntry(const SMsgMap* map, UINT message) {
  if (message >= kSMsgRegistered) {
    return FindEntry(map, [message](const SMsgEntry& entry) {
      return entry.m_message == kSMsgRegistered && entry.m_code == 0 && HoldsId(entry, 0) &&
             IsRegisteredAs(entry, message);
    });
  }
  return FindEntry(map, [message](const SMsgEntry& entry) {
    return entry.m_message == message && entry.m_code == 0 && HoldsId(entry, 0);
  });
}

const SMsgEntry* SFindMessageEntryCached(const SMsgMap* map, UINT message) { return SFindInCache(map, message); }

const SMsgEntry* SFindCommandEntry(const SMsgMap* map, UINT message, UINT code, UINT id) {
  return FindEntry(map, [=](const SMsgEntry& entry) {
    return entry.m_message == message && entry.m_code == code && HoldsId(entry, id);
  });
}
