// SStatusTexts: the messages that stand in a status bar's main pane for a while, and what stood there before each.
//
// A frame keeps one for kSMsgStatusText. For the user-interface thread.
#pragma once

#include "qxcore/container/table_mem.h"
#include "qxcore/ui/bar/status_bar.h"

class QXCORE_API SStatusTexts {
 public:
  // Shows a text for a user, any number that is the user's own; 0 while there are messages is the newest one's. A
  // user's further texts replace the first one. Throws SEOutOfMemory.
  void Show(SStatusBar& bar, LPARAM user, LPCWSTR text);
  // Ends a user's message: the text from before it stands there again, or stays kept for the messages that came
  // later. An unknown user's call ends the message of user 0, if there is one.
  void Restore(SStatusBar& bar, LPARAM user);

 private:
  struct Message {
    LPARAM m_user;
    SString m_before;  // what stood in the pane
  };
  int Find(LPARAM user) const;

  STableMem<Message> m_messages;  // the newest one last
};
