// Mouse and keyboard of the tab beam.

#include "qxcore/ui/layout/tab_beam.h"
#include "qxcore/ui/window/thread_state.h"

static constexpr UINT_PTR kAutoMoveTimer = 1;
static constexpr UINT kFirstWait = 350;  // milliseconds until a held button begins to repeat
static constexpr UINT kRepeat = 75;      // and between two steps

void STabBeam::OnLButtonDown(UINT, SPoint point) {
  const int button = ScrollBtnHit(point, kSTabNoButton);
  if (button == kSTabNoButton) {
    if (m_buttons.At(point) == kSTabNoButton) SwitchToTab(point);
    return;
  }
  m_pressed = button;
  m_pointer = point;
  SetCapture();
  Scroll(button);
  SetTimer(kAutoMoveTimer, kFirstWait);
  Repaint();
}

// A second click soon after the first is one more click.
void STabBeam::OnLButtonDblClk(UINT flags, SPoint point) { OnLButtonDown(flags, point); }

void STabBeam::OnMouseMove(UINT, SPoint point) {
  if (m_pressed == kSTabNoButton) {
    Default();
    return;
  }
  const bool wasOn = m_buttons.At(m_pointer) == m_pressed;
  m_pointer = point;
  if (wasOn != (m_buttons.At(m_pointer) == m_pressed)) Repaint();
}

void STabBeam::OnLButtonUp(UINT, SPoint) { StopAutoMove(); }

void STabBeam::OnCaptureChanged(SWnd*) { StopAutoMove(); }

void STabBeam::StopAutoMove() {
  if (m_pressed == kSTabNoButton) return;
  m_pressed = kSTabNoButton;
  KillTimer(kAutoMoveTimer);
  if (::GetCapture() == m_hWnd) SSent(::ReleaseCapture());
  Repaint();
}

void STabBeam::OnTimer(UINT_PTR id) {
  if (id == kAutoMoveTimer && m_pressed != kSTabNoButton) {
    AutoMove(static_cast<UINT>(m_pressed));
  } else {
    Default();
  }
}

void STabBeam::AutoMove(UINT button) {
  if (ScrollBtnHit(m_pointer, static_cast<int>(button)) != kSTabNoButton) Scroll(static_cast<int>(button));
  SetTimer(kAutoMoveTimer, kRepeat);
}

// --- keyboard ---

UINT STabBeam::OnGetDlgCode() { return DLGC_WANTARROWS; }

void STabBeam::OnKeyDown(UINT key, UINT, UINT) {
  int target = m_current;
  switch (key) {
    case VK_LEFT:
    case VK_UP:
      target = std::max(m_current - 1, 0);
      break;
    case VK_RIGHT:
    case VK_DOWN:
      target = std::min(m_current + 1, m_count - 1);
      break;
    case VK_HOME:
      target = 0;
      break;
    case VK_END:
      target = m_count - 1;
      break;
    default:
      Default();
      return;
  }
  ChooseTab(target);
}

void STabBeam::OnSetFocus(SWnd* oldFocus) {
  SWnd::OnSetFocus(oldFocus);
  Repaint();
}

void STabBeam::OnKillFocus(SWnd* newFocus) {
  SWnd::OnKillFocus(newFocus);
  Repaint();
}
