#include "qxcore/ui/control/scroll_bar.h"

QXCORE_IMPLEMENT_CREATABLE_CLASS(SScrollBar, SWnd, 2)

SScrollBar::~SScrollBar() = default;

int SScrollBar::Create(DWORD style, const SRect& rect, SWnd* parent, UINT id) {
  return Create(WTEXT("ScrollBar"), nullptr, style, rect, parent, id);
}

int SScrollBar::GetPos() const { return GetScrollPos(SB_CTL); }
int SScrollBar::SetPos(int position, int redraw) { return SetScrollPos(SB_CTL, position, redraw); }
void SScrollBar::GetRange(int* low, int* high) const { GetScrollRange(SB_CTL, low, high); }
void SScrollBar::SetRange(int low, int high, int redraw) { SetScrollRange(SB_CTL, low, high, redraw); }
int SScrollBar::GetInfo(SCROLLINFO* info, UINT mask) const { return GetScrollInfo(SB_CTL, info, mask); }
int SScrollBar::SetInfo(SCROLLINFO* info, int redraw) { return SetScrollInfo(SB_CTL, info, redraw); }
int SScrollBar::EnableArrows(UINT arrows) { return EnableScrollBar(SB_CTL, arrows); }
