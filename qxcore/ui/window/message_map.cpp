#include "qxcore/ui/window/message_map.h"

namespace {

constexpr std::uintptr_t kNoAddress = 0xFFFF;  // what a signature holds up to here is a number

// The range test of an entry, which serves identifiers and, with 0, window messages.
bool HoldsId(const SMsgEntry& entry, UINT id) { return entry.m_firstId <= id && id <= entry.m_lastId; }

bool IsRegisteredAs(const SMsgEntry& entry, UINT message) {
  return entry.m_signature.m_number > kNoAddress && *entry.m_signature.m_registered == message;
}

// The first entry of the chain of maps that fits; null when there is none.
template <class Fits>
const SMsgEntry* FindEntry(const SMsgMap* map, Fits fits) {
  for (; map != nullptr; map = map->m_getBase()) {
    for (const SMsgEntry* entry = map->m_entries; entry->m_signature.m_number != 0; ++entry) {
      if (fits(*entry)) return entry;
    }
  }
  return nullptr;
}

// One slot of the cache: what the last lookup that fell on it found, a missing entry included.
struct CacheSlot {
  UINT m_message;
  const SMsgEntry* m_entry;
  const SMsgMap* m_map;  // null while the slot was never used
};
constinit CacheSlot g_cache[256] = {};

}  // namespace

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

const SMsgEntry* SFindMessageEntryCached(const SMsgMap* map, UINT message) {
  CacheSlot& slot = g_cache[(reinterpret_cast<std::uintptr_t>(map) ^ message) & 0xFF];
  if (slot.m_message != message || slot.m_map != map) [[unlikely]]
    slot = {message, SFindMessageEntry(map, message), map};
  return slot.m_entry;
}

const SMsgEntry* SFindCommandEntry(const SMsgMap* map, UINT message, UINT code, UINT id) {
  return FindEntry(map, [=](const SMsgEntry& entry) {
    return entry.m_message == message && entry.m_code == code && HoldsId(entry, id);
  });
}
