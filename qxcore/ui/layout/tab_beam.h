// STabBeam: a strip of tabs, with buttons that scroll it when the tabs do not fit.
//
// The beam belongs to a window, usually an STabWnd, and sends it WM_NOTIFY with an STabBeamNotify: kSTabChanging
// before the user's choice becomes the current tab, and kSTabChanged afterwards. What the program does by SetCurSel
// and the other functions is not notified.
//
// A mouse button held down on a scroll button goes on scrolling. With the focus, the arrows, Home and End choose
// another tab. Geometry: tab_strip.h. The spacing is pixels of the window's DPI and changes with it; so do the fonts
// and the buttons. For the user-interface thread.
#pragma once

#include <memory>

#include "qxcore/container/table_dumb.h"
#include "qxcore/graphics/dc.h"
#include "qxcore/graphics/font.h"
#include "qxcore/ui/layout/tab_strip.h"
#include "qxcore/ui/window/window.h"

class SAccessible;

// Codes of the notifications.
inline constexpr int kSTabChanging = 0x0501;  // a nonzero result keeps the former tab
inline constexpr int kSTabChanged = 0x0502;

// What a notification carries.
struct tagSTABBEAM {
  NMHDR m_header;  // the beam, its identifier, and the code
  int m_tab;       // the tab that the user chose
  int m_former;    // the current tab before; -1 for none
  SWnd* m_window;  // the chosen tab's window
};
// The record under its usual name.
using STabBeamNotify = tagSTABBEAM;

class QXCORE_API STabBeam : public SWnd {
  QXCORE_DECLARE_CREATABLE_CLASS(STabBeam)

 public:
  STabBeam();
  ~STabBeam() override;

  // --- virtual functions; they continue the list of SWnd ---

  // Inserts a tab in front of the one with this index, which may be the count. A negative width is measured: that of
  // the text and the spacing. The first tab becomes the current one; else the same tab stays current. Returns the
  // index, -1 for an invalid one.
  virtual int InsertTab(int index, LPCWSTR text, SWnd* window, int width = -1);
  // Removes a tab. If it was the current one, the next one is current, or the last. Returns 0 for an invalid index.
  virtual int DeleteTab(int index);
  // The tab of a window; -1 for none.
  virtual int FindTab(const SWnd* window);
  // Sets the width of a tab to that of its text and the spacing, and repaints the beam.
  virtual void AdjustTabSize(int index);

  using SWnd::Create;
  // Creates the beam as a child. Returns nonzero on success.
  int Create(SWnd* parent, DWORD style, UINT id);

  // The number of tabs, and the current one.
  int GetCount() const { return m_count; }
  int GetCurSel() const { return m_current; }  // -1 for none
  // Makes a tab current and visible. Returns 1; 0 for an invalid index and for the current tab.
  int SetCurSel(int index);
  // The first tab that is not scrolled out at the left.
  int GetFirstVisible() const { return m_first; }
  // Scrolls so that this tab is the first visible one; beyond the ends, the nearest.
  void SetFirstVisible(int index);
  // The last tab that is visible with all of its width; the first visible one at least.
  int GetLastVisible() const { return Strip().LastVisible(); }
  // Scrolls as little as needed to make a tab visible. Ignores an invalid index.
  void EnsureVisible(int index);
  // Shows two (previous, next) or four (first, previous, next, last) scroll buttons, or none.
  void SetScrollButtons(int show, int twoOnly);

  // The text, window and width of a tab; empty, null and 0 for an invalid index.
  const SString& GetTabText(int index) const;
  SWnd* GetTabWindow(int index) const;
  int GetTabWidth(int index) const { return IsTab(index) ? m_tabs[index]->m_width : 0; }
  // Sets the text and measures the tab. Returns 0 for an invalid index.
  int SetTabText(int index, LPCWSTR text);
  // Whether a tab is empty; it is then written in the font for empty tabs. New tabs are not.
  void SetTabEmpty(int index, int empty);
  int GetTabEmpty(int index) const;
  // The space between tabs, in pixels of the window's DPI, 0 to 65,535; beyond the ends, the nearest. All tabs are
  // measured anew.
  void SetSpacing(int spacing);
  int GetSpacing() const { return m_spacing; }
  // Where a tab is in the client area; its right part may be outside. Empty for an invalid index.
  SRect GetTabRect(int index) const;
  // Where a scroll button is; empty when it is not shown.
  SRect GetButtonRect(int button) const { return m_buttons.RectOf(button); }
  // The font of tabs with content; it stays the beam's.
  HFONT GetTextFont() const { return m_font; }
  // Chooses a tab as the user does, with notifications. Returns 0 when it is invalid, current, or was refused.
  int ChooseTab(int index);
  // What a screen reader or a test learns of the tabs; the object must not outlive the window.
  std::unique_ptr<SAccessible> MakeAccessible();

  int PreCreateWindow(CREATESTRUCTW* create) override;

 protected:
  // --- virtual functions ---

  virtual void DrawTab(SDC* dc, int index);
  virtual void DrawButton(SDC* dc, int button, int pressed);
  // Where a tab begins, 0 to the count.
  virtual int CalcTabOffset(int index);
  // The tab at x; -1 for none.
  virtual int CalcTabFromOffset(int x);
  // A step of the scrolling while the mouse is held down on a button: scrolls if the pointer is still on it, and
  // sets the timer for the next step.
  virtual void AutoMove(UINT button);
  // Chooses the tab under a point. Returns its index, -1 for none.
  virtual int SwitchToTab(SPoint point);
  // The scroll button at a point, if it can scroll; -1 for none. With `only` other than -1, for that button alone.
  virtual int ScrollBtnHit(SPoint point, int only);
  // Scrolls as an STabButton says; other numbers are ignored.
  virtual void Scroll(int button);

  int OnCreate(CREATESTRUCTW* create);
  void OnDestroy();
  void OnSize(UINT type, int width, int height);
  void OnPaint();
  int OnEraseBkgnd(SDC* dc);
  void OnLButtonDown(UINT flags, SPoint point);
  void OnLButtonUp(UINT flags, SPoint point);
  void OnLButtonDblClk(UINT flags, SPoint point);
  void OnMouseMove(UINT flags, SPoint point);
  void OnCaptureChanged(SWnd* window);
  void OnTimer(UINT_PTR id);
  void OnKeyDown(UINT key, UINT repeat, UINT flags);
  UINT OnGetDlgCode();
  void OnSetFocus(SWnd* oldFocus);
  void OnKillFocus(SWnd* newFocus);
  LRESULT OnSetFont(WPARAM wParam, LPARAM lParam);
  void OnSysColorChange();
  void OnWinIniChange(UINT what, LPCWSTR area);
  LRESULT OnDpiChanged(WPARAM wParam, LPARAM lParam);
  LRESULT OnGetObject(WPARAM wParam, LPARAM lParam);

  STableDumb<STab*> m_tabs;  // owned
  int m_count = 0;
  int m_current = -1;
  int m_first = 0;
  int m_spacing = 8;
  STabButtons m_buttons;
  SFont m_font;       // of tabs with content
  SFont m_emptyFont;  // of empty tabs

  QXCORE_DECLARE_MESSAGE_MAP()

 private:
  bool IsTab(int index) const { return index >= 0 && index < m_count; }
  STabStrip Strip() const;
  void Repaint();
  void MeasureAll();
  void ReadButtonSize();
  void MakeFonts(const LOGFONTW* given = nullptr);
  void ChangeDpi(int dpi);
  void StopAutoMove();
  LRESULT Notify(int code, int tab, int former);
  void DrawAll(SDC* dc);

  SDC m_measure;                     // for measuring texts
  HGDIOBJ m_measuredFont = nullptr;  // the font that is selected into it
  int m_dpi = 96;
  bool m_hasGivenFont = false;    // by WM_SETFONT
  int m_pressed = kSTabNoButton;  // the button that the mouse is held down on
  SPoint m_pointer;               // where the mouse is meanwhile
};
