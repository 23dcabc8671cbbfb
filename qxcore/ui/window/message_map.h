// Message maps: the tables by which a class says which member function handles which message or command.
//
// A map is static and constant, and is found by its address: the cache in front of the lookup compares
// addresses. Entries are made with the functions of message_entries.h, which check the handler's shape when
// they are compiled; see there for an example.
#pragma once

#include <cstddef>
#include <cstdint>

#include "qxcore/platform/export.h"
#include "qxcore/platform/win32.h"

class SCmdTarget;

// Calls a handler with a message's or a command's arguments. For a window message these are its own wParam
// and lParam; for a command wParam is the identifier and lParam the `extra` argument of OnCmdMsg. Returns
// the handler's result, or 0 when it has none.
using SMsgHandler = LRESULT (*)(SCmdTarget* target, WPARAM wParam, LPARAM lParam);

// How a handler is called: the number of a shape, or for a message registered by name the address of the
// variable that holds its number.
union SMsgSignature {
  std::uintptr_t m_number;   // 1 to 52, see message_shapes.h; 0 ends a list of entries
  const UINT* m_registered;  // in entries whose message is kSMsgRegistered
};

// One entry of a message map. The first entry that fits wins.
struct SMsgEntry {
  std::uint32_t m_message;    // WM_COMMAND for commands, kSMsgRegistered for messages registered by name
  std::uint32_t m_code;       // the notification code; kSMsgUpdate for update handlers; else 0
  std::uint32_t m_firstId;    // the range of command identifiers, both ends included; 0 for window messages
  std::uint32_t m_lastId;     // not below m_firstId
  SMsgSignature m_signature;  // how the handler is called
  SMsgHandler m_handler;      // what is called
};

static_assert(sizeof(void*) != 4 || sizeof(SMsgEntry) == 24, "six fields of 32 bits");

// The map of one class.
struct SMsgMap {
  const SMsgMap* (*m_getBase)();  // returns the map of the base class; null at SCmdTarget
  const SMsgEntry* m_entries;     // ends at the first entry whose signature is 0
};

// The message of entries for messages that are registered by name.
inline constexpr UINT kSMsgRegistered = 0xC000;
// The code that asks for an update of a command's user interface, as OnCmdMsg takes it.
inline constexpr int kSMsgUpdate = -1;
// What is added to a parent's notification when it is offered to the control that sent it.
inline constexpr UINT kSMsgReflected = 0xBC00;
// The message that wakes the loop for idle work; it is never dispatched.
inline constexpr UINT kSMsgIdleKick = 0x036A;

// Finds the entry that handles a window message in the map or in those of its base classes, without the
// cache; null when no map handles it. A message of kSMsgRegistered or more is matched by its registered number.
QXCORE_API const SMsgEntry* SFindMessageEntry(const SMsgMap* map, UINT message);

// The same through the process-wide cache of 256 entries, for the user-interface thread.
QXCORE_API const SMsgEntry* SFindMessageEntryCached(const SMsgMap* map, UINT message);

// Finds the entry that handles a command or notification: equal message and code, and a range of identifiers
// that holds `id`; null when no map handles it.
QXCORE_API const SMsgEntry* SFindCommandEntry(const SMsgMap* map, UINT message, UINT code, UINT id);

// Declares a class's message map in its body. Leaves the access at protected.
#define QXCORE_DECLARE_MESSAGE_MAP()          \
 protected:                                   \
  static const SMsgMap msgMap;                \
  static const SMsgEntry _msgEntries[];       \
  static const SMsgMap* _GetBaseMessageMap(); \
  const SMsgMap* GetMessageMap() const override;

// Defines it in one source file: QXCORE_IMPLEMENT_MESSAGE_MAP(Class, Base, entry, entry, ...).
#define QXCORE_IMPLEMENT_MESSAGE_MAP(Class, Base, ...)                                          \
  constinit const SMsgMap Class::msgMap = {&Class::_GetBaseMessageMap, &Class::_msgEntries[0]}; \
  const SMsgMap* Class::_GetBaseMessageMap() { return &Base::msgMap; }                          \
  const SMsgMap* Class::GetMessageMap() const { return &msgMap; }                               \
  constinit const SMsgEntry Class::_msgEntries[] = {__VA_ARGS__ __VA_OPT__(, ) SMsgEntry{}};
