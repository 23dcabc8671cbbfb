// SWaitCursor: shows the wait cursor until the end of a block. For the user-interface thread.
#pragma once

#include "qxcore/platform/export.h"
#include "qxcore/ui/app/modal_state.h"

class QXCORE_API SWaitCursor {
 public:
  SWaitCursor();  // shows it
  // `begin`: whether it is shown; `onlyFirst`: not when it is shown already; `modal`: the application's windows are
  // disabled as long.
  SWaitCursor(int begin, int onlyFirst, int modal);
  SWaitCursor(const SWaitCursor&) = delete;
  SWaitCursor& operator=(const SWaitCursor&) = delete;
  ~SWaitCursor();  // takes it back, if this object showed it

  void Restore();            // shows it again after something else changed the cursor
  static void ForceReset();  // takes all wait cursors back, whoever showed them

 private:
  SModalState m_modal;
  bool m_isShown = false;
};
