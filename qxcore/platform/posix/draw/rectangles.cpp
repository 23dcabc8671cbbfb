// Arithmetic of rectangles.
#include <algorithm>

#include "qxcore/platform/win32.h"

BOOL SetRect(RECT* rect, int left, int top, int right, int bottom) {
  if (!rect) return FALSE;
  *rect = {left, top, right, bottom};
  return TRUE;
}

BOOL SetRectEmpty(RECT* rect) { return SetRect(rect, 0, 0, 0, 0); }

BOOL CopyRect(RECT* to, const RECT* from) {
  if (!to || !from) return FALSE;
  *to = *from;
  return TRUE;
}

BOOL InflateRect(RECT* rect, int dx, int dy) {
  return rect && SetRect(rect, rect->left - dx, rect->top - dy, rect->right + dx, rect->bottom + dy);
}

BOOL OffsetRect(RECT* rect, int dx, int dy) {
  return rect && SetRect(rect, rect->left + dx, rect->top + dy, rect->right + dx, rect->bottom + dy);
}

BOOL IsRectEmpty(const RECT* rect) { return !rect || rect->left >= rect->right || rect->top >= rect->bottom; }

BOOL EqualRect(const RECT* a, const RECT* b) {
  return a && b && a->left == b->left && a->top == b->top && a->right == b->right && a->bottom == b->bottom;
}

BOOL PtInRect(const RECT* rect, POINT point) {
  return rect && point.x >= rect->left && point.x < rect->right && point.y >= rect->top && point.y < rect->bottom;
}

BOOL IntersectRect(RECT* to, const RECT* a, const RECT* b) {
  if (!to || !a || !b) return FALSE;
  RECT shared{std::max(a->left, b->left), std::max(a->top, b->top), std::min(a->right, b->right),
              std::min(a->bottom, b->bottom)};
  if (IsRectEmpty(a) || IsRectEmpty(b) || IsRectEmpty(&shared)) {
    SetRectEmpty(to);
    return FALSE;
  }
  *to = shared;
  return TRUE;
}

BOOL UnionRect(RECT* to, const RECT* a, const RECT* b) {
  if (!to || !a || !b) return FALSE;
  if (IsRectEmpty(a)) {
    *to = IsRectEmpty(b) ? RECT{} : *b;
  } else if (IsRectEmpty(b)) {
    *to = *a;
  } else {
    *to = {std::min(a->left, b->left), std::min(a->top, b->top), std::max(a->right, b->right),
           std::max(a->bottom, b->bottom)};
  }
  return !IsRectEmpty(to);
}

// Only a part that spans a whole side can be taken away.
BOOL SubtractRect(RECT* to, const RECT* from, const RECT* less) {
  if (!to || !from || !less) return FALSE;
  RECT rest = *from, cut;
  if (IntersectRect(&cut, from, less)) {
    bool wholeWidth = cut.left <= from->left && cut.right >= from->right;
    bool wholeHeight = cut.top <= from->top && cut.bottom >= from->bottom;
    if (wholeWidth && wholeHeight) {
      rest = RECT{};
    } else if (wholeWidth) {
      if (cut.top == from->top)
        rest.top = cut.bottom;
      else if (cut.bottom == from->bottom)
        rest.bottom = cut.top;
    } else if (wholeHeight) {
      if (cut.left == from->left)
        rest.left = cut.right;
      else if (cut.right == from->right)
        rest.right = cut.left;
    }
  }
  *to = rest;
  return !IsRectEmpty(to);
}
