#include "qxcore/ui/bar/ctrl_bar.h"

#include <algorithm>
#include <utility>

#include "qxcore/ui/app/ui_sys_data.h"
#include "qxcore/ui/bar/size_parent.h"
#include "qxcore/ui/window/message_entries.h"

QXCORE_IMPLEMENT_CREATABLE_CLASS(SCtrlBar, SWnd, 2)

QXCORE_IMPLEMENT_MESSAGE_MAP(SCtrlBar, SWnd, on<kSMsgSizeParent, &SCtrlBar::OnSizeParent>())

SCtrlBar::~SCtrlBar() = default;

void SCtrlBar::OnBarStyleChange(DWORD, DWORD) {}

SSize SCtrlBar::GetBarLayout(int, int) { return GetWindowRect().Size(); }

int SCtrlBar::GetCustomLayout(void*, SRect*, SSize*, int) { return 0; }

DWORD SCtrlBar::SetBarStyle(DWORD style) {
  const DWORD former = std::exchange(m_barStyle, style);
  OnBarStyleChange(former, style);
  return former;
}

void SCtrlBar::CalcNCOffsets(SRect* rect, int horizontal) const {
  const SUISysData& measures = *SGetUISysData();
  const bool isEdge = (m_barStyle & kSBarBorder3d) != 0;
  const int width = isEdge ? measures.m_edgeWidth : measures.m_borderWidth;
  const int height = isEdge ? measures.m_edgeHeight : measures.m_borderHeight;
  if (m_barStyle & kSBarBorderLeft) rect->left += width;
  if (m_barStyle & kSBarBorderTop) rect->top += height;
  if (m_barStyle & kSBarBorderRight) rect->right -= width;
  if (m_barStyle & kSBarBorderBottom) rect->bottom -= height;
  if (horizontal) {
    rect->Deflate(m_leftBorder, m_topBorder, m_rightBorder, m_bottomBorder);
  } else {
    rect->Deflate(m_topBorder, m_leftBorder, m_bottomBorder, m_rightBorder);
  }
}

// --- the bar's place in its frame ---

// The bar keeps its own size where the area is smaller; the area never gets smaller than nothing.
SRect SCtrlBar::TakeStrip(SRect* area, const SSize& size) const {
  SRect strip = *area;
  if (m_barStyle & kSBarAtTop) {
    strip.bottom = strip.top + size.cy;
    area->top = std::min(strip.bottom, std::max(area->top, area->bottom));
  } else if (m_barStyle & kSBarAtLeft) {
    strip.right = strip.left + size.cx;
    area->left = std::min(strip.right, std::max(area->left, area->right));
  } else if (m_barStyle & kSBarAtRight) {
    strip.left = strip.right - size.cx;
    area->right = std::max(strip.left, std::min(area->left, area->right));
  } else {
    strip.top = strip.bottom - size.cy;
    area->bottom = std::max(strip.top, std::min(area->top, area->bottom));
  }
  return strip;
}

LRESULT SCtrlBar::OnSizeParent(WPARAM, LPARAM lParam) {
  auto* layout = reinterpret_cast<SSizeParent*>(lParam);
  if ((GetStyle() & WS_VISIBLE) == 0) return 0;
  if (GetCustomLayout(&layout->m_batch, &layout->m_rect, &layout->m_used, layout->m_stretch)) return 0;

  const bool isVertical = (m_barStyle & kSBarAtTop) == 0 && (m_barStyle & (kSBarAtLeft | kSBarAtRight)) != 0;
  const SSize size = GetBarLayout(layout->m_stretch, !isVertical);
  SRect strip = TakeStrip(&layout->m_rect, size);
  if (isVertical) {
    layout->m_used.cx += size.cx;
    if (!layout->m_stretch) strip.bottom = std::min<int>(strip.bottom, strip.top + size.cy);
    layout->m_used.cy = std::max<int>(layout->m_used.cy, strip.Height());
  } else {
    layout->m_used.cy += size.cy;
    if (!layout->m_stretch) strip.right = std::min<int>(strip.right, strip.left + size.cx);
    layout->m_used.cx = std::max<int>(layout->m_used.cx, strip.Width());
  }
  if (layout->m_batch != nullptr) {
    layout->m_batch = ::DeferWindowPos(layout->m_batch, m_hWnd, nullptr, strip.left, strip.top, strip.Width(),
                                       strip.Height(), SWP_NOZORDER | SWP_NOACTIVATE);
  }
  return 0;
}
