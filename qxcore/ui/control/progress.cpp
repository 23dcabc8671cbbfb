#include "qxcore/ui/control/progress.h"

QXCORE_IMPLEMENT_CREATABLE_CLASS(SProgressCtrl, SWnd, 2)

SProgressCtrl::~SProgressCtrl() = default;

int SProgressCtrl::Create(DWORD style, const SRect& rect, SWnd* parent, UINT id) {
  return Create(WTEXT("msctls_progress32"), nullptr, style, rect, parent, id);
}

void SProgressCtrl::SetRange(int low, int high) { SendMessageW(PBM_SETRANGE32, static_cast<WPARAM>(low), high); }
int SProgressCtrl::SetPos(int position) {
  return static_cast<int>(SendMessageW(PBM_SETPOS, static_cast<WPARAM>(position)));
}
int SProgressCtrl::GetPos() const { return static_cast<int>(SendMessageW(PBM_GETPOS)); }
int SProgressCtrl::OffsetPos(int by) { return static_cast<int>(SendMessageW(PBM_DELTAPOS, static_cast<WPARAM>(by))); }
int SProgressCtrl::SetStep(int step) { return static_cast<int>(SendMessageW(PBM_SETSTEP, static_cast<WPARAM>(step))); }
int SProgressCtrl::StepIt() { return static_cast<int>(SendMessageW(PBM_STEPIT)); }
