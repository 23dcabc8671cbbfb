// Edges and the small pictures of controls, drawn with the public calls alone, in the system's colours.
#include <algorithm>

#include "qxcore/platform/win32.h"

namespace {

void Fill(HDC dc, int left, int top, int right, int bottom, int color) {
  RECT rect{left, top, right, bottom};
  if (left < right && top < bottom) FillRect(dc, &rect, GetSysColorBrush(color));
}

// --- edges: an outer and an inner ring of one pixel, each raised or sunken ---

// The colours of one ring: left and top, right and bottom.
struct Ring {
  int topLeft, bottomRight;
};

Ring OuterRing(UINT edge, UINT flags) {
  if (flags & BF_MONO) return {COLOR_WINDOWFRAME, COLOR_WINDOWFRAME};
  if (flags & BF_FLAT) return {COLOR_BTNSHADOW, COLOR_BTNSHADOW};
  if (edge & BDR_RAISEDOUTER) return {flags & BF_SOFT ? COLOR_BTNHIGHLIGHT : COLOR_3DLIGHT, COLOR_3DDKSHADOW};
  return {flags & BF_SOFT ? COLOR_3DDKSHADOW : COLOR_BTNSHADOW, COLOR_BTNHIGHLIGHT};
}

Ring InnerRing(UINT edge, UINT flags) {
  if (flags & BF_MONO) return {COLOR_WINDOW, COLOR_WINDOW};
  if (flags & BF_FLAT) return {COLOR_BTNFACE, COLOR_BTNFACE};
  if (edge & BDR_RAISEDINNER) return {flags & BF_SOFT ? COLOR_3DLIGHT : COLOR_BTNHIGHLIGHT, COLOR_BTNSHADOW};
  return {flags & BF_SOFT ? COLOR_BTNSHADOW : COLOR_3DDKSHADOW, COLOR_3DLIGHT};
}

// Draws the sides that the flags name and moves the rectangle's edges inside of them.
void DrawRing(HDC dc, RECT& rect, Ring ring, UINT flags) {
  if (flags & BF_TOP) Fill(dc, rect.left, rect.top, rect.right, rect.top + 1, ring.topLeft);
  if (flags & BF_LEFT) Fill(dc, rect.left, rect.top, rect.left + 1, rect.bottom, ring.topLeft);
  if (flags & BF_BOTTOM) Fill(dc, rect.left, rect.bottom - 1, rect.right, rect.bottom, ring.bottomRight);
  if (flags & BF_RIGHT) Fill(dc, rect.right - 1, rect.top, rect.right, rect.bottom, ring.bottomRight);
  rect.left += flags & BF_LEFT ? 1 : 0;
  rect.top += flags & BF_TOP ? 1 : 0;
  rect.right -= flags & BF_RIGHT ? 1 : 0;
  rect.bottom -= flags & BF_BOTTOM ? 1 : 0;
}

// --- marks, scaled to a square ---

// The breadth of a line that is one pixel in a control of the usual size.
int LineBreadth(const RECT& control) {
  constexpr int kUsualSize = 16;
  return std::max<int>(1, (std::min(control.right - control.left, control.bottom - control.top) + 4) / kUsualSize);
}

// A filled triangle that points up, down, left or right (the DFCS_SCROLL numbers).
void DrawArrow(HDC dc, const RECT& rect, UINT direction, int color) {
  int size = std::min(rect.right - rect.left, rect.bottom - rect.top);
  int depth = std::max(2, (size + 3) / 5);
  int x = (rect.left + rect.right) / 2, y = (rect.top + rect.bottom) / 2;
  bool vertical = direction == DFCS_SCROLLUP || direction == DFCS_SCROLLDOWN;
  bool widens = direction == DFCS_SCROLLDOWN || direction == DFCS_SCROLLRIGHT;
  for (int i = 0; i < depth; ++i) {
    int half = widens ? depth - 1 - i : i, at = i - depth / 2;
    if (vertical)
      Fill(dc, x - half, y + at, x + half + 1, y + at + 1, color);
    else
      Fill(dc, x + at, y - half, x + at + 1, y + half + 1, color);
  }
}

void DrawCheck(HDC dc, const RECT& rect, int color) {
  int size = std::min(rect.right - rect.left, rect.bottom - rect.top);
  int left = rect.left + (rect.right - rect.left - size) / 2, top = rect.top + (rect.bottom - rect.top - size) / 2;
  int thick = std::max(2, size / 5), down = std::max(1, size * 2 / 7), start = size / 6;
  for (int i = 0; i + 2 * start < size; ++i) {
    int x = left + start + i,
        y = top + size / 2 - thick / 2 + (i <= down ? i - down / 2 : down - down / 2 - (i - down));
    Fill(dc, x, y, x + 1, y + thick, color);
  }
}

void DrawDot(HDC dc, const RECT& rect, int color) {
  int size = std::min(rect.right - rect.left, rect.bottom - rect.top), dot = std::max(2, size / 3);
  int left = (rect.left + rect.right - dot) / 2, top = (rect.top + rect.bottom - dot) / 2;
  HGDIOBJ brush = SelectObject(dc, GetSysColorBrush(color)), pen = SelectObject(dc, GetStockObject(NULL_PEN));
  Ellipse(dc, left, top, left + dot + 1, top + dot + 1);
  SelectObject(dc, brush);
  SelectObject(dc, pen);
}

int MarkColor(UINT state) { return state & DFCS_INACTIVE ? COLOR_GRAYTEXT : COLOR_BTNTEXT; }

// --- the controls ---

void DrawPush(HDC dc, RECT* rect, UINT state) {
  UINT flags = BF_RECT | BF_MIDDLE | BF_ADJUST | (state & DFCS_FLAT ? BF_FLAT : 0) | (state & DFCS_MONO ? BF_MONO : 0);
  DrawEdge(dc, rect, state & DFCS_PUSHED ? EDGE_SUNKEN : EDGE_RAISED, flags | BF_SOFT);
}

void DrawScrollPart(HDC dc, RECT rect, UINT state) {
  if (state & DFCS_SCROLLSIZEGRIP) {
    // Diagonal ridges toward the bottom right corner.
    int broad = LineBreadth(rect), size = std::min(rect.right - rect.left, rect.bottom - rect.top);
    for (int step = 2 * broad; step < size - 2 * broad; step += 4 * broad) {
      for (int i = 0; i <= step; ++i) {
        int x = rect.right - 2 * broad - i, y = rect.bottom - 2 * broad - step + i;
        Fill(dc, x, y, x + 1, y + broad, COLOR_BTNSHADOW);
        Fill(dc, x, y - broad, x + 1, y, COLOR_BTNHIGHLIGHT);
      }
    }
    return;
  }
  DrawPush(dc, &rect, state);
  UINT direction = state & DFCS_SCROLLCOMBOBOX & 4 ? DFCS_SCROLLDOWN : state & 3;
  if (state & DFCS_PUSHED) OffsetRect(&rect, 1, 1);
  DrawArrow(dc, rect, direction, MarkColor(state));
}

void DrawBox(HDC dc, RECT rect, UINT state) {
  DrawEdge(dc, &rect, EDGE_SUNKEN, BF_RECT | BF_ADJUST | (state & DFCS_FLAT ? BF_FLAT : 0));
  bool plain = !(state & (DFCS_INACTIVE | DFCS_PUSHED));
  Fill(dc, rect.left, rect.top, rect.right, rect.bottom, plain ? COLOR_WINDOW : COLOR_BTNFACE);
  if (state & DFCS_CHECKED) DrawCheck(dc, rect, state & DFCS_INACTIVE ? COLOR_GRAYTEXT : COLOR_WINDOWTEXT);
}

void DrawRadio(HDC dc, RECT rect, UINT state) {
  bool plain = !(state & (DFCS_INACTIVE | DFCS_PUSHED));
  HGDIOBJ brush = SelectObject(dc, GetSysColorBrush(plain ? COLOR_WINDOW : COLOR_BTNFACE));
  HPEN ring = CreatePen(PS_SOLID, 1, GetSysColor(COLOR_BTNSHADOW));
  HGDIOBJ pen = SelectObject(dc, ring);
  Ellipse(dc, rect.left, rect.top, rect.right, rect.bottom);
  SelectObject(dc, pen);
  SelectObject(dc, brush);
  DeleteObject(ring);
  if (state & DFCS_CHECKED) DrawDot(dc, rect, state & DFCS_INACTIVE ? COLOR_GRAYTEXT : COLOR_WINDOWTEXT);
}

void DrawButton(HDC dc, RECT* rect, UINT state) {
  if (state & DFCS_BUTTONPUSH)
    DrawPush(dc, rect, state);
  else if (state & DFCS_BUTTONRADIO)
    DrawRadio(dc, *rect, state);
  else
    DrawBox(dc, *rect, state);
}

void DrawCaptionButton(HDC dc, RECT rect, UINT state) {
  int line = LineBreadth(rect), broad = 2 * line;
  DrawPush(dc, &rect, state);
  if (state & DFCS_PUSHED) OffsetRect(&rect, 1, 1);
  int color = MarkColor(state), margin = std::max(2, (rect.right - rect.left) / 5);
  InflateRect(&rect, -margin, -margin);
  int size = std::min(rect.right - rect.left, rect.bottom - rect.top);
  switch (state & 7) {
    case DFCS_CAPTIONCLOSE:
      for (int i = 0; i < size; ++i) {
        Fill(dc, rect.left + i, rect.top + i, rect.left + i + broad, rect.top + i + 1, color);
        Fill(dc, rect.left + i, rect.top + size - 1 - i, rect.left + i + broad, rect.top + size - i, color);
      }
      break;
    case DFCS_CAPTIONMIN:
      Fill(dc, rect.left, rect.bottom - broad, rect.right - broad, rect.bottom, color);
      break;
    default:
      Fill(dc, rect.left, rect.top, rect.right, rect.top + broad, color);
      for (int i = 0; i < line; ++i) {
        FrameRect(dc, &rect, GetSysColorBrush(color));
        InflateRect(&rect, -1, -1);
      }
  }
}

void DrawMenuMark(HDC dc, const RECT& rect, UINT state) {
  int color = state & DFCS_INACTIVE ? COLOR_GRAYTEXT : COLOR_MENUTEXT;
  if (state & DFCS_MENUCHECK)
    DrawCheck(dc, rect, color);
  else if (state & DFCS_MENUBULLET)
    DrawDot(dc, rect, color);
  else
    DrawArrow(dc, rect, DFCS_SCROLLRIGHT, color);
}

}  // namespace

BOOL DrawEdge(HDC dc, RECT* rect, UINT edge, UINT flags) {
  if (!GetObjectType(dc)) return FALSE;
  RECT inner = *rect;
  if (edge & BDR_OUTER) DrawRing(dc, inner, OuterRing(edge, flags), flags);
  if (edge & BDR_INNER) DrawRing(dc, inner, InnerRing(edge, flags), flags);
  if (flags & BF_MIDDLE)
    Fill(dc, inner.left, inner.top, inner.right, inner.bottom, flags & BF_MONO ? COLOR_WINDOW : COLOR_BTNFACE);
  if (flags & BF_ADJUST) *rect = inner;
  return TRUE;
}

BOOL DrawFrameControl(HDC dc, RECT* rect, UINT type, UINT state) {
  if (!GetObjectType(dc)) return FALSE;
  RECT inner = *rect;
  switch (type) {
    case DFC_SCROLL:
      DrawScrollPart(dc, inner, state);
      break;
    case DFC_BUTTON:
      DrawButton(dc, &inner, state);
      break;
    case DFC_CAPTION:
      DrawCaptionButton(dc, inner, state);
      break;
    case DFC_MENU:
      DrawMenuMark(dc, inner, state);
      break;
    default:
      return FALSE;
  }
  if (state & DFCS_ADJUSTRECT) *rect = inner;
  return TRUE;
}

// A frame of every second pixel from the corner on, inverted, so that drawing it again removes it.
BOOL DrawFocusRect(HDC dc, const RECT* rect) {
  static const BYTE kDots[16] = {0xAA, 0, 0x55, 0, 0xAA, 0, 0x55, 0, 0xAA, 0, 0x55, 0, 0xAA, 0, 0x55, 0};
  if (!GetObjectType(dc)) return FALSE;
  if (rect->right <= rect->left || rect->bottom <= rect->top) return TRUE;
  HBITMAP bitmap = CreateBitmap(8, 8, 1, 1, kDots);
  HBRUSH dots = CreatePatternBrush(bitmap);
  HGDIOBJ brush = SelectObject(dc, dots);
  COLORREF text = SetTextColor(dc, 0), background = SetBkColor(dc, 0xFFFFFF);
  POINT corner{rect->left, rect->top}, origin;
  LPtoDP(dc, &corner, 1);
  SetBrushOrgEx(dc, corner.x, corner.y, &origin);
  int width = rect->right - rect->left, height = rect->bottom - rect->top;
  PatBlt(dc, rect->left, rect->top, width, 1, PATINVERT);
  if (height > 1) PatBlt(dc, rect->left, rect->bottom - 1, width, 1, PATINVERT);
  if (height > 2) {
    PatBlt(dc, rect->left, rect->top + 1, 1, height - 2, PATINVERT);
    if (width > 1) PatBlt(dc, rect->right - 1, rect->top + 1, 1, height - 2, PATINVERT);
  }
  SetBrushOrgEx(dc, origin.x, origin.y, nullptr);
  SetTextColor(dc, text);
  SetBkColor(dc, background);
  SelectObject(dc, brush);
  DeleteObject(dots);
  return DeleteObject(bitmap);
}
