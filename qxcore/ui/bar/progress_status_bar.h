// SProgressStatusBar: a status bar that shows a progress and a Cancel button over its main pane while long work runs.
// ```cpp
// bar.StartProgress(1);
// for (int done = 0; done < 100; ++done) {
//   bar.GetProgressCtrl().SetPos(done);
//   // take messages here, or the button cannot be pressed
//   SProgressStatusBar::Status status;
//   bar.GetSetProgressStatus(&status, nullptr);
//   if (status.m_flags & SProgressStatusBar::kCancelRequested) break;
// }
// bar.EndProgress();
// ```
// While the progress can be cancelled, the button has the focus; Enter and Escape press it as Space does. Afterwards
// the focus returns to where it was. For the user-interface thread.
#pragma once

#include "qxcore/ui/bar/status_bar.h"
#include "qxcore/ui/control/button.h"
#include "qxcore/ui/control/progress_custom.h"

class QXCORE_API SProgressStatusBar : public SStatusBar {
  QXCORE_DECLARE_CREATABLE_CLASS(SProgressStatusBar)

 public:
  // The bits of Status::m_flags.
  enum : std::uint32_t { kInProgress = 1, kCancelAllowed = 2, kCancelRequested = 4 };

  // What GetSetProgressStatus exchanges.
  struct Status {
    SCustomProgressCtrl::Status m_progress;  // range and position of the progress
    std::uint32_t m_flags = 0;               // a sum of kInProgress, kCancelAllowed and kCancelRequested
  };

  SProgressStatusBar() = default;
  ~SProgressStatusBar() override;

  using SStatusBar::Create;
  // As SStatusBar::Create; also creates the progress control and the button, hidden. Returns nonzero on success.
  int Create(SWnd* parent, DWORD barStyle = 0, DWORD style = WS_CHILD | WS_VISIBLE, UINT id = kSStatusBarId);

  // Shows the progress; `cancellable`: with the button. Called again, it changes whether the work can be cancelled.
  void StartProgress(int cancellable);
  // Hides the progress and forgets it. Does nothing when none is shown.
  void EndProgress();
  int InProgress() const { return (m_flags & kInProgress) != 0; }
  // Stores the status in `get`, then takes over the one in `set`; either may be null. So one piece of work can keep
  // what another one around it shows, and bring it back.
  void GetSetProgressStatus(Status* get, const Status* set);
  // The control that shows the progress, for its range and position.
  SCustomProgressCtrl& GetProgressCtrl() { return m_progress; }

 protected:
  // --- handlers of the bar's messages and of the button's notifications; derived classes call them ---

  void OnSize(UINT type, int width, int height);
  void OnCancel();
  void OnCancelNotify(NMHDR* header, LRESULT* result);
  LRESULT OnDpiChanged(WPARAM wParam, LPARAM lParam);

  QXCORE_DECLARE_MESSAGE_MAP()

 private:
  // Notifies its parent when the pointer is over it, and takes Enter and Escape. It is only as high as its text, so it
  // draws itself with thin edges: the control's own would cover the text.
  class QXCORE_API CancelButton : public SButton {
   public:
    ~CancelButton() override;
    LRESULT WindowProc(UINT message, WPARAM wParam, LPARAM lParam) override;

   protected:
    void OnPaint();
    int OnEraseBkgnd(SDC*) { return 1; }
    int OnSetCursor(SWnd* window, UINT hit, UINT message);
    UINT OnGetDlgCode();
    void OnKeyDown(UINT key, UINT repeats, UINT flags);
    QXCORE_DECLARE_MESSAGE_MAP()
  };

  void SizeButton();
  void PlaceProgress();
  void HideButton();
  SRect GetProgressPane() const;

  SCustomProgressCtrl m_progress;
  CancelButton m_cancel;
  std::uint32_t m_flags = 0;
  HCURSOR m_savedCursor = nullptr;    // shown before the pointer came over the button
  HCURSOR m_currentCursor = nullptr;  // shown over the button
  HWND m_focusBefore = nullptr;       // had the focus before the button
};
