// SCustomProgressCtrl: a progress bar that the library paints: a filled part, and the percentage in the middle.
//
// Positions are 64 bits wide, so that bytes of large files can be counted. Colours are the system's; nothing is erased
// that is painted over, and only what has changed is painted. For the user-interface thread.
#pragma once

#include <cstdint>

#include "qxcore/ui/window/window.h"

class QXCORE_API SCustomProgressCtrl : public SWnd {
  QXCORE_DECLARE_CREATABLE_CLASS(SCustomProgressCtrl)

 public:
  // All that the control shows.
  struct Status {
    std::int64_t m_low = 0;       // nothing is done
    std::int64_t m_high = 100;    // all is done
    std::int64_t m_position = 0;  // how far the work is
  };

  SCustomProgressCtrl() = default;
  ~SCustomProgressCtrl() override;

  using SWnd::Create;
  // Creates the control as a child. Returns nonzero on success.
  int Create(DWORD style, const SRect& rect, SWnd* parent, UINT id);

  // Sets the ends of the range; the position is moved into it. With `high` not above `low` nothing counts as done.
  void SetRange(std::int64_t low, std::int64_t high);
  // Sets the position, moved into the range. Returns the old one.
  std::int64_t SetPos(std::int64_t position);
  std::int64_t GetPos() const { return m_status.m_position; }
  // How much is done: 0 to 100, rounded down, so that 100 means all.
  int GetPercent() const;
  const Status& GetStatus() const { return m_status; }
  void SetStatus(const Status& status);  // the position is moved into the range

 protected:
  // Handlers of the control's messages.
  void OnPaint();
  int OnEraseBkgnd(SDC* dc);
  void OnSize(UINT type, int width, int height);
  void OnSysColorChange();
  LRESULT OnSetFont(WPARAM font, LPARAM redraw);
  LRESULT OnGetFont(WPARAM, LPARAM);

  QXCORE_DECLARE_MESSAGE_MAP()

 private:
  struct Shown {
    int m_fill;     // pixels of the filled part
    int m_percent;  // as text
    bool operator==(const Shown&) const = default;
  };
  Shown WhatToShow() const;
  double Done() const;

  Status m_status;
  HFONT m_font = nullptr;    // not owned; null is the default interface font
  Shown m_shown = {-1, -1};  // what was painted last, or will be
};
