// Drawing. Each part is drawn once, and cut out of what is still to be drawn, so that nothing flickers.

#include "qxcore/graphics/window_dc.h"
#include "qxcore/ui/layout/internal/edges.h"
#include "qxcore/ui/layout/splitter.h"

int SSplitterWnd::OnEraseBkgnd(SDC*) { return 1; }

void SSplitterWnd::OnSysColorChange() {
  SWnd::OnSysColorChange();
  if (m_hWnd != nullptr) InvalidateRect(nullptr, 0);
}

void SSplitterWnd::OnPaint() {
  SPaintDC dc(m_hWnd);
  if (dc.GetSafeHdc() == nullptr) return;
  SRect inside;
  GetInsideRect(&inside);
  const SRect client = GetClientRect();
  OnDrawSplitter(&dc, kSplitBorder, client);
  dc.IntersectClipRect(
      SRect(client.left + m_borderX, client.top + m_borderY, client.right - m_borderX, client.bottom - m_borderY));
  for (const int code : {kSHitVertSplitBox, kSHitHorzSplitBox}) {
    if (!HasBar(code)) continue;
    OnDrawSplitter(&dc, kSplitBox, BoxRect(code, inside));
    dc.ExcludeClipRect(BoxRect(code, inside));
  }
  DrawAllSplitBars(&dc, inside.Width(), inside.Height());
  SFillWithSystemColor(dc, client, COLOR_3DFACE);
}

void SSplitterWnd::DrawAllSplitBars(SDC* dc, int insideWidth, int insideHeight) {
  const SRect inside(SPoint(m_borderX, m_borderY), SSize(insideWidth, insideHeight));
  const auto draw = [this, dc](SplitType type, const SRect& rect) {
    if (dc != nullptr && rect.IsEmpty()) return;
    OnDrawSplitter(dc, type, rect);
    if (dc != nullptr) dc->ExcludeClipRect(rect);
  };
  for (int column = 0; column + 1 < m_columnCount; ++column) {
    const SRect upright = BarRect(kSHitColumnBar + column, inside);
    for (int row = 0; row + 1 < m_rowCount; ++row) {
      draw(kSplitIntersection, upright & BarRect(kSHitRowBar + row, inside));
    }
    draw(kSplitBar, upright & inside);
  }
  for (int row = 0; row + 1 < m_rowCount; ++row) draw(kSplitBar, BarRect(kSHitRowBar + row, inside) & inside);
}

// The light comes from the top left. A bar has edges along its sides, a box all around; the bar that has the keyboard
// is filled with the colour of selections.
void SSplitterWnd::OnDrawSplitter(SDC* dc, SplitType type, const SRect& rect) {
  if (dc == nullptr) {
    InvalidateRect(rect, 0);
    return;
  }
  const int edge = std::max(m_dpi / 96, 1);
  if (type == kSplitBorder) {
    const SRect second = SDrawEdges(*dc, rect, m_borderX / 2, m_borderY / 2, COLOR_3DSHADOW, COLOR_3DHILIGHT);
    SDrawEdges(*dc, second, m_borderX - m_borderX / 2, m_borderY - m_borderY / 2, COLOR_3DDKSHADOW, COLOR_3DLIGHT);
    return;
  }
  const bool isUpright = rect.Height() > rect.Width();
  SRect face = rect;
  if (type == kSplitBox) face = SDrawEdges(*dc, rect, edge, edge, COLOR_3DHILIGHT, COLOR_3DSHADOW);
  if (type == kSplitBar) {
    face = SDrawEdges(*dc, rect, isUpright ? edge : 0, isUpright ? 0 : edge, COLOR_3DHILIGHT, COLOR_3DSHADOW);
  }
  SRect inside;
  GetInsideRect(&inside);
  const SRect keyboard = !HasBar(m_keyboardBar)         ? SRect()
                         : m_keyboardBar >= kSHitRowBar ? BarRect(m_keyboardBar, inside)
                                                        : BoxRect(m_keyboardBar, inside);
  SFillWithSystemColor(*dc, face, keyboard.Contains(rect) ? COLOR_HIGHLIGHT : COLOR_3DFACE);
}

void SSplitterWnd::OnInvertTracker(const SRect& rect) {
  SClientDC dc(m_hWnd);
  if (dc.GetSafeHdc() != nullptr) dc.PatBlt(rect, DSTINVERT);
}
