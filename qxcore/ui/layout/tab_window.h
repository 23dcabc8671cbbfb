// STabWnd: a window that shows one of several windows at a time, with a strip of tabs along its bottom edge.
//
// Beside the strip lies a horizontal scroll bar, and at the right edge a vertical one, which serve the window that is
// shown: it gets their messages, and its GetScrollBarCtrl may return GetTabScrollBar. The user moves the border
// between strip and scroll bar with the mouse; a double click on it halves the width again.
// ```cpp
// m_tabs.Create(this, nullptr, context, WS_CHILD | WS_VISIBLE, kSFirstPane);
// m_tabs.AddTab(&STextView::classSTextView, WTEXT("readme.txt"), context);
// ```
// Keyboard: Ctrl+Tab and Ctrl+PageDown show the next tab, Ctrl+Shift+Tab and Ctrl+PageUp the one before; F6 goes from
// the window to the tabs and on, see SSplitterWnd; on the tabs the arrows, Home and End choose, Ctrl with the arrows
// moves the border, and Enter, Escape and Tab return to the window.
//
// When the user chooses a tab, the window gets the notifications of its beam, and passes them on to its own parent,
// which may refuse the change. A window that is made from a class record deletes itself, as views do; adopted windows
// stay their owner's. Sizes are pixels of the window's DPI and change with it. For the user-interface thread.
#pragma once

#include "qxcore/ui/frame/create_context.h"
#include "qxcore/ui/layout/tab_beam.h"

// Identifiers of the children; the windows of tabs are numbered from kSFirstTabId upward, past these.
inline constexpr UINT kSFirstTabId = 0xE900;
inline constexpr UINT kSTabHorzScrollBarId = 0xEA00;
inline constexpr UINT kSTabBeamId = 0xEA01;
inline constexpr UINT kSTabVertScrollBarId = 0xEA10;
inline constexpr UINT kSTabSizeBoxId = 0xEA20;
// Asks a tab window to change the current tab, as a user's choice: wParam is the index, or lParam the handle of the
// tab's window when it is not 0. The result is 1 when the tab changed.
inline constexpr UINT kSMsgTabSetCurrent = WM_USER + 1;

class QXCORE_API STabWnd : public SWnd {
  QXCORE_DECLARE_CREATABLE_CLASS(STabWnd)

 public:
  STabWnd();
  ~STabWnd() override;

  // --- virtual functions; they continue the list of SWnd ---

  // Lays out beam, scroll bars, size box and the shown window in one batch; with `redraw` everything is painted anew.
  virtual void RecalcLayout(int redraw = 1);

  using SWnd::Create;
  // Creates the window; `name` is its text, which is not shown. `context` is what InsertTab uses when it is given
  // none. Returns nonzero on success.
  int Create(SWnd* parent, LPCWSTR name, SCreateContext* context, DWORD style = WS_CHILD | WS_VISIBLE,
             UINT id = kSFirstTabId);

  // --- tabs ---

  // Makes a window of a class for a tab in front of the one with this index, which may be the count. `id` is the
  // window's identifier, 0 for the next free one. The first tab is shown; else what is shown stays. Returns the
  // window; null for an invalid index, a class that is no window, and when it cannot be made.
  SWnd* InsertTab(int index, SClassInfo* windowClass, LPCWSTR text, SCreateContext* context = nullptr, UINT id = 0);
  SWnd* AddTab(SClassInfo* windowClass, LPCWSTR text, SCreateContext* context = nullptr, UINT id = 0);
  // The same with a window that exists and that an object is bound to; another tab window or splitter gives it up.
  // Returns its index; -1 on failure.
  int InsertTab(int index, SWnd* window, LPCWSTR text);
  int AddTab(SWnd* window, LPCWSTR text);
  // Removes a tab and destroys its window; if it was shown, the next one is. Returns 0 for an invalid index.
  int DeleteTab(int index);
  // Removes a window's tab and leaves the window alive, hidden and still a child. Returns 0 when it has none.
  int DetachTab(SWnd* window);
  // Shows a tab, without notifications; with `focus`, its window gets the focus, which it also gets when the former
  // one had it. Returns 0 for an invalid index.
  int ActivateTab(int index, int focus = 1);
  // The window that is shown, and its index; null and -1 for none. The pointer may be null.
  SWnd* GetActiveTab(int* index = nullptr) const;
  // How many tabs there are, and which is which.
  int GetTabCount() const { return m_beam.GetCount(); }
  SWnd* GetTabWindow(int index) const { return m_beam.GetTabWindow(index); }  // null for an invalid index
  int GetTabIndex(SWnd* window) { return m_beam.FindTab(window); }            // -1 when it has no tab
  // A tab's text; empty and 0 for an invalid index. The second form cuts it to `capacity` - 1 characters and returns
  // the number copied.
  const SString& GetTabText(int index) const { return m_beam.GetTabText(index); }
  int GetTabText(int index, LPWSTR buffer, int capacity) const;
  int GetTabTextLength(int index) const { return m_beam.GetTabText(index).Length(); }
  int SetTabText(int index, LPCWSTR text) { return m_beam.SetTabText(index, text); }
  // The strip of tabs; it stays the window's.
  STabBeam* GetTabBeam() { return &m_beam; }

  // What is shown while there is no tab: a text, or a window, which stays its owner's; with `redraw` at once.
  void SetNoTabText(LPCWSTR text);
  void SetNoTabWnd(SWnd* window, int redraw = 1);

  // Shows or hides the scroll bar SB_HORZ or SB_VERT, or both with SB_BOTH.
  void ShowScrollBar(UINT bar, int show);
  // The scroll bar that the shown window uses; null while it is hidden. `bar` is SB_HORZ or SB_VERT.
  SScrollBar* GetTabScrollBar(int bar) const;
  // The next identifier for a tab's window; it is used up.
  UINT GetNextID();
  // The width of the beam while there is a horizontal scroll bar, in pixels.
  int GetBeamWidth() const { return m_beamWidth; }
  void SetBeamWidth(int width);

  // The shown tab, the first visible one and the share of the beam as a line of text.
  SString GetState() const;
  // Takes them back at any size; the shown tab is then visible. Returns 0 and changes nothing for an invalid text; tabs
  // that do not exist are left alone.
  int SetState(const SString& state);

  int OnCmdMsg(UINT id, int code, void* extra, S_CMDHANDLERINFO* info) override;
  int PreTranslateMessage(MSG* message) override;
  int PreCreateWindow(CREATESTRUCTW* create) override;
  int OnCommand(WPARAM wParam, LPARAM lParam) override;
  int OnNotify(WPARAM wParam, LPARAM lParam, LRESULT* result) override;

 protected:
  // The beam's notifications: `record` is the header of an STabBeamNotify.
  void OnTabChanging(NMHDR* record, LRESULT* result);
  void OnTabChanged(NMHDR* record, LRESULT* result);
  LRESULT OnTabSetCurrent(WPARAM wParam, LPARAM lParam);

  int OnCreate(CREATESTRUCTW* create);
  void OnDestroy();
  void OnSize(UINT type, int width, int height);
  void OnPaint();
  int OnEraseBkgnd(SDC* dc);
  void OnLButtonDown(UINT flags, SPoint point);
  void OnLButtonDblClk(UINT flags, SPoint point);
  void OnLButtonUp(UINT flags, SPoint point);
  void OnMouseMove(UINT flags, SPoint point);
  void OnCaptureChanged(SWnd* window);
  void OnCancelMode();
  int OnSetCursor(SWnd* window, UINT hit, UINT message);
  void OnSetFocus(SWnd* oldFocus);
  void OnParentNotify(UINT message, LPARAM lParam);
  void OnHScroll(UINT code, UINT position, SScrollBar* bar);
  void OnVScroll(UINT code, UINT position, SScrollBar* bar);
  void OnSysCommand(UINT id, LPARAM lParam);
  void OnSysColorChange();
  void OnSettingChange(UINT what, LPCWSTR area);
  LRESULT OnDpiChanged(WPARAM wParam, LPARAM lParam);

  // Bits of m_flags.
  enum : std::uint32_t { kHasScrollBars = 1, kWantsHorz = 2, kWantsVert = 4 };

  STabBeam m_beam;
  int m_gap = 6;     // between beam and horizontal scroll bar
  int m_vertWidth;   // of the vertical scroll bar
  int m_horzHeight;  // of the horizontal scroll bar
  int m_beamHeight;  // a little higher than the scroll bar
  UINT m_nextId = kSFirstTabId;
  UINT m_firstId = kSFirstTabId;
  std::uint32_t m_flags = kWantsHorz | kWantsVert;
  int m_beamWidth = 0;        // 0 until the first layout
  int m_beamHundredfold = 0;  // the same value times 100
  SString m_noTabText;
  SWnd* m_noTabWnd = nullptr;  // not owned

  QXCORE_DECLARE_MESSAGE_MAP()

 private:
  friend class SPaneFocus;
  struct Places;

  void ReadMetrics(int dpi);
  void MakeScrollBars();
  Places FindPlaces() const;
  void KeepShare(int clientWidth);
  SWnd* ShownWindow() const;
  int EnterTab(int index, SWnd* window, LPCWSTR text);
  void RemoveTab(int index);
  void ActivateView(SWnd* window);
  void ShowCurrent(bool focus);
  bool HoldsFocus(HWND window) const;
  void PassToShown(UINT message, UINT code, UINT position, SScrollBar* bar);
  SRect GripRect() const;
  void StopDrag();
  bool OnTabKey(UINT key);
  bool OnBeamKey(UINT key);
  bool GoToNextStop(bool backward);

  SCreateContext m_context;
  HWND m_shown = nullptr;  // the window that is visible above the beam
  int m_dpi = 96;
  int m_shareOfBeam = 0;    // a hundredfold width of the beam,
  int m_shareOfClient = 0;  // and the client width that it belongs to; 0 until the first layout
  bool m_isDragging = false;
  int m_grab = 0;  // from the beam's edge to the pointer
};
