#include "qxcore/ui/window/command_target.h"

#include "qxcore/ui/app/application.h"
#include "qxcore/ui/window/command_ui.h"

QXCORE_IMPLEMENT_CLASS(SCmdTarget, SObject, 2)

constinit const SMsgEntry SCmdTarget::_msgEntries[] = {SMsgEntry{}};
constinit const SMsgMap SCmdTarget::msgMap = {[]() -> const SMsgMap* { return nullptr; }, &SCmdTarget::_msgEntries[0]};

SCmdTarget::~SCmdTarget() = default;

const SMsgMap* SCmdTarget::GetMessageMap() const { return &msgMap; }

int SCmdTarget::OnCmdMsg(UINT id, int code, void* extra, S_CMDHANDLERINFO* info) {
  UINT message = WM_COMMAND;
  UINT notification = static_cast<UINT>(code);
  if (code != kSMsgUpdate) {
    if (notification >> 16 != 0) message = notification >> 16;
    notification &= 0xFFFF;
  }
  const SMsgEntry* entry = SFindCommandEntry(GetMessageMap(), message, notification, id);
  if (entry == nullptr) return 0;
  if (info != nullptr) {
    *info = {this, entry->m_handler};
    return 1;
  }
  return CallCommandHandler(*entry, id, extra);
}

// An entry whose shape is not that of a command, or that needs a record which is missing, handles nothing.
int SCmdTarget::CallCommandHandler(const SMsgEntry& entry, UINT id, void* extra) {
  const LPARAM lParam = reinterpret_cast<LPARAM>(extra);
  switch (entry.m_signature.m_number) {
    case 2:
    case 4:
      entry.m_handler(this, id, lParam);
      return 1;
    case 47:
      return extra != nullptr && static_cast<SCmdUI*>(extra)->CallHandler(entry.m_handler, this, id);
    case 49:
    case 50:
      if (extra == nullptr) return 0;
      entry.m_handler(this, id, lParam);
      return 1;
    default:
      return 0;
  }
}

static void ChangeWaitCursor(int change) {
  if (SWinApp* app = SGetApp()) app->DoWaitCursor(change);
}

void SCmdTarget::BeginWaitCursor() { ChangeWaitCursor(1); }
void SCmdTarget::EndWaitCursor() { ChangeWaitCursor(-1); }
void SCmdTarget::RestoreWaitCursor() { ChangeWaitCursor(0); }
