// SSetStatusBarText: shows a message in the status bar's main pane, and the wait cursor, until the end of a block.
// ```cpp
// SSetStatusBarText message(WTEXT("Reading the file"));
// ```
// The text goes to the application's owner window by kSMsgStatusText; a frame with a status bar shows it there, and
// afterwards what stood there before. Messages nest. For the user-interface thread.
#pragma once

#include "qxcore/platform/export.h"
#include "qxcore/ui/app/modal_state.h"

class SModuleState;

class QXCORE_API SSetStatusBarText {
 public:
  // Shows the wait cursor alone; Set shows texts.
  SSetStatusBarText();
  // Shows a text; null shows none.
  explicit SSetStatusBarText(LPCWSTR text);
  // Shows a text from the string table of a module; null for the library's own. An unknown identifier shows none.
  SSetStatusBarText(UINT stringId, SModuleState* module);
  SSetStatusBarText(const SSetStatusBarText&) = delete;
  SSetStatusBarText& operator=(const SSetStatusBarText&) = delete;
  // Resets, if Reset was not called. What a handler throws meanwhile is kept for the next call that can throw it.
  ~SSetStatusBarText();

  // Shows another text as the newest message; null shows again what stood there before.
  static void Set(LPCWSTR text);
  // Disables the application's windows as well, by a modal state, until Reset.
  void StartModal();
  // Disables only the owner window, until Reset. Does nothing while no wait cursor is shown or it is disabled already.
  void DisableOwner();
  // Takes back all that this object started, and shows the former text again.
  void Reset();

 private:
  enum : unsigned { kModal = 0x02, kWaits = 0x20, kDisabledOwner = 0x40, kIsReset = 0x80 };
  void Begin();
  void Show(LPCWSTR text);
  void TakeBack();

  unsigned m_flags = 0;
  SModalState m_modal;
};
