// Interaction modes: whether somebody is there to answer message boxes and dialogs.
//
// A program that is driven by a script sets a mode in which nothing waits for a person. A message box is then
// answered with its default button, or the operation is aborted with an STargetedException that names the box, so
// that the script reports what blocked it; dialogs are always aborted. See docs/unattended.md.
// ```cpp
// SetInteractiveMode unattended(kInteractiveAbort);   // until the end of the block
// ```
// The modes are process-wide and belong to the user-interface thread.
#pragma once

#include "qxcore/string/string.h"

// What happens to message boxes and dialogs.
enum InteractiveMode : int {
  kInteractiveDefault = 0,  // as the default mode says; as the default mode itself it means kInteractiveShow
  kInteractiveShow = 1,     // they are shown
  kInteractiveAnswer = 2,   // message boxes are answered with their default button, dialogs aborted
  kInteractiveAbort = 3,    // both are aborted
};

QXCORE_API InteractiveMode g_GetInteractionMode();      // the current mode; kInteractiveDefault at the start
QXCORE_API InteractiveMode g_GetDeftInteractionMode();  // the default mode; kInteractiveShow at the start

// The mode that is in force: the current one, or the default one where it says so. Never kInteractiveDefault.
QXCORE_API InteractiveMode SInteractionModeInForce();
// True when message boxes and dialogs are shown.
inline bool SIsInteractive() { return SInteractionModeInForce() == kInteractiveShow; }

// Sets a mode and puts the former one back when it ends. The two classes below say which mode it is.
class QXCORE_API SModeSetter {
 public:
  SModeSetter(const SModeSetter&) = delete;
  SModeSetter& operator=(const SModeSetter&) = delete;
  virtual ~SModeSetter();
  virtual void Set(InteractiveMode mode);  // sets another mode

 protected:
  explicit SModeSetter(InteractiveMode& mode);  // which mode it is; it has to outlive the object

 private:
  InteractiveMode& m_mode;
  InteractiveMode m_former;  // at construction
};

// For the current mode.
class QXCORE_API SetInteractiveMode : public SModeSetter {
 public:
  SetInteractiveMode();                               // changes nothing yet
  explicit SetInteractiveMode(InteractiveMode mode);  // sets the mode
};

// For the default mode.
class QXCORE_API SetDeftInteractiveMode : public SModeSetter {
 public:
  SetDeftInteractiveMode();                               // changes nothing yet
  explicit SetDeftInteractiveMode(InteractiveMode mode);  // sets the mode
};

// Passes the text to g_RaiseError and throws an STargetedException with it, for the targets "Scripting,DlgAbort".
[[noreturn]] QXCORE_API void g_ThrowAbort(const SString& text);

// The same with a message that names the dialog, quotes its text (which may be empty) and says what to do.
[[noreturn]] QXCORE_API void g_ThrowAbortOnDlg(const SString& title, const SString& text);
