// The cache in front of the lookup of messages. Every message asks it, so the test of a slot stands in the caller.
#pragma once

#include "qxcore/ui/window/message_map.h"

// What the last lookup that fell on a slot found, a missing entry included.
struct SMsgCacheSlot {
  UINT m_message;
  const SMsgEntry* m_entry;
  const SMsgMap* m_map;  // null while the slot was never used
};
extern SMsgCacheSlot g_msgCache[256];

inline const SMsgEntry* SFindInCache(const SMsgMap* map, UINT message) {
  SMsgCacheSlot& slot = g_msgCache[(reinterpret_cast<std::uintptr_t>(map) ^ message) & 0xFF];
  if (slot.m_message != message || slot.m_map != map) [[unlikely]]
    slot = {message, SFindMessageEntry(map, message), map};
  return slot.m_entry;
}
