// Drawing of tabs and scroll buttons, in the system's colours.

#include "qxcore/graphics/brush.h"
#include "qxcore/graphics/pen.h"
#include "qxcore/ui/layout/internal/buffered_paint.h"
#include "qxcore/ui/layout/internal/edges.h"
#include "qxcore/ui/layout/tab_beam.h"

void STabBeam::Repaint() {
  if (m_hWnd != nullptr) InvalidateRect(nullptr, 0);
}

void STabBeam::OnSize(UINT, int, int) { Repaint(); }

int STabBeam::OnEraseBkgnd(SDC*) { return 1; }

void STabBeam::OnSysColorChange() {
  SWnd::OnSysColorChange();
  Repaint();
}

void STabBeam::OnPaint() {
  SBufferedPaint paint(m_hWnd);
  if (SDC* dc = paint.Get()) DrawAll(dc);
}

// From the right to the left, so that each tab lies over the next one; the current tab lies over all.
void STabBeam::DrawAll(SDC* dc) {
  const SRect client = GetClientRect();
  const int line = std::max(m_dpi / 96, 1);
  SFillWithSystemColor(*dc, client, COLOR_3DFACE);
  SFillWithSystemColor(*dc, SRect(client.left, client.top, client.right, client.top + line), COLOR_3DDKSHADOW);
  const STabStrip strip = Strip();
  int end = m_first;
  std::int64_t right = strip.m_origin;
  for (; end < m_count && right < client.right; ++end) right += std::int64_t{m_tabs[end]->m_width} + m_spacing;
  for (int i = 0; i < m_count; ++i) {
    if (i < m_first || i >= end) m_tabs[i]->m_drawn = m_tabs[i]->m_textArea = SRect();
  }
  const int saved = dc->SaveDC();
  dc->IntersectClipRect(SRect(strip.m_origin, client.top, client.right, client.bottom));
  for (int i = end; i-- > m_first;) {
    if (i != m_current) DrawTab(dc, i);
  }
  if (m_current >= m_first && m_current < end) DrawTab(dc, m_current);
  dc->RestoreDC(saved);
  for (int button = kSTabToFirst; button <= kSTabToLast; ++button) {
    const bool isPressed = button == m_pressed && m_buttons.At(m_pointer) == button;
    if (!m_buttons.RectOf(button).IsEmpty()) DrawButton(dc, button, isPressed);
  }
}

// A tab hangs from the line at the top; the current one is open towards the window above.
void STabBeam::DrawTab(SDC* dc, int index) {
  STab& tab = *m_tabs[index];
  const bool isCurrent = index == m_current;
  const int line = std::max(m_dpi / 96, 1);
  const SRect rect = GetTabRect(index);
  tab.m_drawn = rect;
  tab.m_textArea = SRect(rect.left + m_spacing, rect.top, rect.right - m_spacing, rect.bottom - line);

  const int slant = std::min(m_spacing, rect.Height() / 2);
  const SPen pen(PS_SOLID, line, ::GetSysColor(COLOR_3DDKSHADOW));
  const int top = isCurrent ? rect.top - line : rect.top;
  const POINT corners[] = {{rect.left, top},
                           {rect.left + slant, rect.bottom - line},
                           {rect.right - slant - line, rect.bottom - line},
                           {rect.right - line, top}};
  {
    const SSelectObject withPen(*dc, pen.GetSafeHandle());
    const SSelectObject withBrush(*dc, ::GetSysColorBrush(isCurrent ? COLOR_WINDOW : COLOR_3DFACE));
    dc->Polygon(corners, 4);
  }
  const int textColor = !tab.m_hasContent ? COLOR_GRAYTEXT : isCurrent ? COLOR_WINDOWTEXT : COLOR_BTNTEXT;
  const SSelectObject withFont(*dc, tab.m_hasContent ? m_font.GetSafeHandle() : m_emptyFont.GetSafeHandle());
  dc->SetBkMode(TRANSPARENT);
  dc->SetTextColor(::GetSysColor(textColor));
  dc->DrawTextW(tab.m_text, tab.m_textArea, DT_CENTER | DT_VCENTER | DT_SINGLELINE | DT_NOPREFIX | DT_END_ELLIPSIS);
  if (isCurrent && ::GetFocus() == m_hWnd) {
    SRect focus = tab.m_textArea;
    focus.Deflate(line, 2 * line);
    dc->FrameRect(focus, ::GetSysColorBrush(COLOR_HIGHLIGHT));
  }
}

// A triangle that points to where the button goes; at "first" and "last", against a line.
static void DrawArrow(SDC& dc, const SRect& face, int button, int color) {
  const bool isBack = button == kSTabToFirst || button == kSTabToPrevious;
  const bool hasLine = button == kSTabToFirst || button == kSTabToLast;
  const int size = std::max(face.Width() / 4, 2);
  const int thickness = std::max(size / 3, 1);
  const SPoint center = face.CenterPoint();
  const int tip = isBack ? center.x - size / 2 : center.x + size / 2;
  const int away = isBack ? 1 : -1;
  for (int i = 0; i < size; ++i) {
    const int x = tip + away * i;
    SFillWithSystemColor(dc, SRect(x, center.y - i, x + 1, center.y + i + 1), color);
  }
  if (!hasLine) return;
  const int x = isBack ? tip - 2 * thickness : tip + thickness + 1;
  SFillWithSystemColor(dc, SRect(x, center.y - size + 1, x + thickness, center.y + size), color);
}

void STabBeam::DrawButton(SDC* dc, int button, int pressed) {
  const int line = std::max(m_dpi / 96, 1);
  SRect face = SDrawEdges(*dc, m_buttons.RectOf(button), line, line, pressed ? COLOR_3DDKSHADOW : COLOR_3DHILIGHT,
                          pressed ? COLOR_3DHILIGHT : COLOR_3DDKSHADOW);
  SFillWithSystemColor(*dc, face, COLOR_3DFACE);
  if (pressed) face.Offset(line, line);
  DrawArrow(*dc, face, button, STabCanScroll(Strip(), button) ? COLOR_BTNTEXT : COLOR_GRAYTEXT);
}
