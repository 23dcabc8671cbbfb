#include "qxcore/ui/control/button.h"

QXCORE_IMPLEMENT_CREATABLE_CLASS(SButton, SWnd, 2)

SButton::~SButton() = default;

int SButton::Create(LPCWSTR text, DWORD style, const SRect& rect, SWnd* parent, UINT id) {
  return Create(WTEXT("Button"), text, style, rect, parent, id);
}

int SButton::GetCheck() const { return static_cast<int>(SendMessageW(BM_GETCHECK)); }
void SButton::SetCheck(int check) { SendMessageW(BM_SETCHECK, static_cast<WPARAM>(check)); }
UINT SButton::GetState() const { return static_cast<UINT>(SendMessageW(BM_GETSTATE)); }
void SButton::SetState(int pressed) { SendMessageW(BM_SETSTATE, static_cast<WPARAM>(pressed)); }
UINT SButton::GetButtonStyle() const { return GetStyle() & 0xFFFF; }
void SButton::SetButtonStyle(UINT style, int redraw) { SendMessageW(BM_SETSTYLE, style, redraw != 0); }
