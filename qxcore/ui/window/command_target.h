// SCmdTarget: the base of everything that can receive commands.
//
// For the user-interface thread.
#pragma once

#include "qxcore/core/object.h"
#include "qxcore/ui/window/message_map.h"

// Who would handle a command; filled by OnCmdMsg when the caller only asks.
struct S_CMDHANDLERINFO {
  SCmdTarget* m_target;   // the object; not owned
  SMsgHandler m_handler;  // the handler in its message map
};

class QXCORE_API SCmdTarget : public SObject {
  QXCORE_DECLARE_CLASS(SCmdTarget)

 public:
  ~SCmdTarget() override;

  // Handles the command or notification `id` by this object's message maps, the most derived map first.
  // `code` is the notification code; with a message other than WM_COMMAND in its high word; or kSMsgUpdate to
  // update the command's user interface. `extra` is the SCmdUI of an update or the SMsgNotify of a
  // notification, else null. Returns nonzero when a handler was called, 0 when no map has a handler or an update
  // handler passed the question on (see SCmdUI::ContinueRouting). With `info` nothing is called: it is filled
  // with what would be, and 1 is returned.
  virtual int OnCmdMsg(UINT id, int code, void* extra, S_CMDHANDLERINFO* info);

  // Show the wait cursor, take it back, and show it again after something else changed the cursor. The calls
  // nest. They do nothing while there is no application object. See SWaitCursor for the scoped form.
  void BeginWaitCursor();
  void EndWaitCursor();
  void RestoreWaitCursor();

 protected:
  // The map of the object's class.
  virtual const SMsgMap* GetMessageMap() const;
  static const SMsgMap msgMap;  // the end of every chain; it has no entries
  static const SMsgEntry _msgEntries[];

 private:
  int CallCommandHandler(const SMsgEntry& entry, UINT id, void* extra);
};
