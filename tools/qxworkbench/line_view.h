// The base of the workbench's views: a head above rows of one height, of which those that are visible are drawn.
//
// Each pixel is painted once, so that nothing flickers. Scrolling goes through the window's scroll bars, or through
// those that a tab window shares with it. Keys and wheel scroll; a derived class may take keys first.
#pragma once

#include "qxcore/graphics/dc.h"
#include "qxcore/ui/frame/view.h"

class LineView : public SView {
 public:
  LineView() = default;
  ~LineView() override = default;

  void OnDraw(SDC* dc) override;

  int FirstRow() const { return m_first; }
  // Rows that are visible whole, at least 1.
  int PageRows() const;
  void ScrollTo(int firstRow);

 protected:
  virtual int RowCount() const = 0;
  // Paints all of the rectangle, which is as wide as the window.
  virtual void DrawRow(SDC* dc, int row, const SRect& rect) = 0;
  virtual void DrawHead(SDC* dc, const SRect& rect) = 0;
  // In pixels at the window's DPI.
  virtual int HeadHeight() const = 0;
  virtual int ContentWidth() const { return 0; }  // 0: the view does not scroll sideways
  // Whether the scroll bars show this view's rows now; else they are set when it asks again.
  virtual bool HasScrollBars() const { return true; }
  // Chooses the font of the rows; called when the window is created and when its DPI or the settings change.
  virtual HFONT MakeFont(int dpi) = 0;

  // Call it when the number of rows or the width of the content has changed.
  void RowsChanged();
  // The scroll bars were somebody else's meanwhile.
  void SetScrollBarsAnew();
  void ShowRow(int row);  // scrolls as little as needed
  void InvalidateRow(int row);
  int RowAt(SPoint point) const;  // -1 for none
  int RowHeight() const { return m_rowHeight; }
  int Left() const { return m_left; }  // how far the content is scrolled to the left, in pixels
  int Scaled(int pixels) const { return ::MulDiv(pixels, m_dpi, 96); }
  HFONT Font() const { return m_font; }
  SRect RowsRect() const;

  int OnCreate(CREATESTRUCTW* create);
  int OnEraseBkgnd(SDC*) { return 1; }
  void OnSize(UINT type, int width, int height);
  void OnVScroll(UINT code, UINT position, SScrollBar* bar);
  void OnHScroll(UINT code, UINT position, SScrollBar* bar);
  int OnMouseWheel(UINT flags, short turn, SPoint point);
  void OnKeyDown(UINT key, UINT repeat, UINT flags);
  void OnSetFocus(SWnd* oldFocus);
  void OnKillFocus(SWnd* newFocus);
  void OnSysColorChange();
  void OnSettingChange(UINT what, LPCWSTR area);
  LRESULT OnDpiChanged(WPARAM wParam, LPARAM lParam);

  QXCORE_DECLARE_MESSAGE_MAP()

 private:
  void ReadFont();
  void SetLeft(int left);

  HFONT m_font = nullptr;  // the derived class's
  int m_dpi = 96;
  int m_rowHeight = 16;
  int m_characterWidth = 8;
  int m_first = 0;
  int m_left = 0;
  int m_wheel = 0;                                // what is left of turns of the wheel
  SCROLLINFO m_vertical = {}, m_horizontal = {};  // as they were set last
};
