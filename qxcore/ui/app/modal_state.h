// SModalState: while it lasts, the windows of the application are disabled, and its message loop drops input for the
// owner window.
// ```cpp
// SModalState modal(1);      // until the end of the block
// ```
// States nest, and may stop in any order: a window is enabled again when the last state that wants it disabled has
// stopped. Windows that were disabled before stay so. Process-wide, for the user-interface thread.
#pragma once

#include "qxcore/platform/export.h"
#include "qxcore/platform/win32.h"

struct IOleInPlaceFrame;

class QXCORE_API SModalState {
 public:
  SModalState() noexcept = default;
  explicit SModalState(int start);  // nonzero starts a state that disables the windows
  SModalState(const SModalState&) = delete;
  SModalState& operator=(const SModalState&) = delete;
  ~SModalState();  // stops; what a handler throws meanwhile is kept for the next call that can throw it

  // Starts the state. `disable`: whether the application's windows are disabled; `waitCursor`: whether the wait
  // cursor is shown; `ownerOnly`: only the owner window is disabled; `keepFrames`: in-place frames are not told.
  // A started state with the same choice of `disable` stays as it is; with another one it stops and starts again.
  // Throws SEOutOfMemory, and then the state is not started.
  void Start(int disable = 1, int waitCursor = 0, int ownerOnly = 0, int keepFrames = 0);
  // Stops the state and enables the windows that it disabled; those that inner states need disabled are left to them.
  void Stop();
  int IsActive() const { return (m_flags & kStarted) != 0; }  // nonzero between Start and Stop

  // The enabled flag of the innermost state that disables windows: 0, or 1 without such a state.
  static int State();

  // For in-place frames of embedded documents: Enable(0) disables the windows, as a state of its own, when windows
  // have come since the last time; Enable(1) takes that back. `frame`, which may be null, is the one that asks; it
  // is not told itself. Returns State() after the call.
  static int Enable(int enable, IOleInPlaceFrame* frame);
  // In-place frames that are disabled and enabled together with the application; not owned. Nonzero on success.
  static int Register(IOleInPlaceFrame* frame);
  static int Unregister(IOleInPlaceFrame* frame);

  // Notes that a window has come; called when one is attached to an object.
  static void WindowsChanged() noexcept;

 private:
  enum : unsigned { kDisable = 1, kStarted = 2, kWaitCursor = 4, kOwnerOnly = 8, kKeepFrames = 16 };
  void StopQuietly() noexcept;

  unsigned m_flags = 0;
};

static_assert(sizeof(SModalState) == 4, "the layout is public");
