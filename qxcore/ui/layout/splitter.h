// SSplitterWnd: a window that is divided into rows and columns of panes by bars which the user can drag.
//
// A static splitter has a fixed grid; its panes are added by the program. A dynamic one begins with one pane, and the
// user splits it by dragging the split boxes at the ends of the shared scroll bars, or by a double click on them; its
// panes are made from a class record. Both are created as a child, usually in SFrameWnd::OnCreateClient:
// ```cpp
// m_splitter.CreateStatic(this, 1, 2, WS_CHILD | WS_VISIBLE, kSFirstPane);
// m_splitter.AddPane(0, 0, &STreeView::classSTreeView, SSize(200, 0), context);
// m_splitter.AddPane(0, 1, &STextView::classSTextView, SSize(0, 0), context);
// ```
// How sizes are found: pane_sizing.h. Sizes are pixels of the window's DPI; when that changes, thicknesses, minima
// and ideal sizes change with it.
//
// Keyboard: F6 and Shift+F6 go from pane to pane, through splitters and tab windows inside panes as well. F8 goes to
// the bars, one after the other: arrows move the bar, with Ctrl pixel by pixel, Home and End move it to the ends,
// Enter collapses the pane before it or opens it again, Escape puts everything back, Tab and F6 return to the pane.
// A double click on a bar does what Enter does; in a dynamic splitter it removes the pane before the bar, and so
// does dragging a pane below its minimum.
//
// A pane that is made from a class record deletes itself with its window, as views do. Adopted windows stay their
// owner's. For the user-interface thread.
#pragma once

#include <memory>

#include "qxcore/container/table_dumb.h"
#include "qxcore/ui/frame/create_context.h"
#include "qxcore/ui/layout/pane_sizing.h"
#include "qxcore/ui/window/window.h"

class SAccessible;
class SDeferredMoves;
class SView;

// The most rows, and the most columns.
inline constexpr int kSMaxPanes = 16;
// Identifiers of the children; a pane adds 16 times its row and its column, a scroll bar its column or row.
inline constexpr UINT kSPaneId = 0xE900;
inline constexpr UINT kSHorzScrollBarId = 0xEA00;
inline constexpr UINT kSVertScrollBarId = 0xEA10;
inline constexpr UINT kSSizeBoxId = 0xEA20;
// What HitTest returns; a bar adds the number of the row or column before it.
inline constexpr int kSHitNothing = 0;
inline constexpr int kSHitVertSplitBox = 1;  // at the top of the first vertical scroll bar
inline constexpr int kSHitHorzSplitBox = 2;  // at the left of the first horizontal scroll bar
inline constexpr int kSHitRowBar = 101;      // to 115
inline constexpr int kSHitColumnBar = 201;   // to 215

class QXCORE_API SSplitterWnd : public SWnd {
  QXCORE_DECLARE_CREATABLE_CLASS(SSplitterWnd)

 public:
  SSplitterWnd();
  ~SSplitterWnd() override;

  // The parts that OnDrawSplitter draws.
  enum SplitType : int {
    kSplitBox,           // a split box
    kSplitBar,           // a bar
    kSplitIntersection,  // where two bars cross
    kSplitBorder,        // the frame around all panes
  };

  // --- virtual functions; they continue the list of SWnd ---

  // Lays out the panes, scroll bars and the size box anew. Call it after changing sizes.
  virtual void RecalcLayout();
  // Divides the row that lies at this distance from the top of the panes, with new panes below. Returns 1; 0 and
  // changes nothing when the splitter is static or has its most rows, when one of the two parts would be below the
  // row's minimum, or when a pane cannot be made.
  virtual int SplitRow(int before);
  // The same for a column, by the distance from the left.
  virtual int SplitColumn(int before);
  // Destroys the panes of a row and closes the gap. Does nothing for the only row and for an invalid number.
  virtual void DeleteRow(int row);
  // The same for a column.
  virtual void DeleteColumn(int column);
  // Destroys one pane; its place stays empty until AddPane.
  virtual void DeletePane(int row, int column);
  // Takes one pane out and leaves it alive, hidden and still a child, with the identifier 0.
  virtual void RemovePane(int row, int column);
  // Creates a scroll bar or the size box; `style` has the system's SBS_ bits. Returns nonzero on success.
  virtual int CreateScrollBarCtrl(DWORD style, UINT id);
  // The pane that has the focus, or that the frame's active view is; null for none. The numbers may be null.
  virtual SWnd* GetActivePane(int* row = nullptr, int* column = nullptr);
  // Moves the focus into a pane; `window` is the window in it that gets the focus, null for the pane.
  virtual void SetActivePane(int row, int column, SWnd* window = nullptr);
  // Nonzero when ActivateNext has another pane to go to.
  virtual int CanActivateNext(int backward = 0);
  // Moves the focus to the next pane, row by row, or to the one before; after the last comes the first.
  virtual void ActivateNext(int backward = 0);
  // Moves the focus to the bars; called again, to the next one. Returns 0 when there is no bar and no split box.
  virtual int DoKeyboardSplit();
  // Scrolls all panes that share a scroll bar with this one. `code` has the SB_ number for the horizontal bar in its
  // low byte and that for the vertical one in the next, 0xFF for none. Returns nonzero if there is such a bar; with
  // `scroll` 0 that is all it does.
  virtual int DoScroll(SView* view, UINT code, int scroll = 1);
  // The same by a distance in units of the scroll bars; nonzero if a position would change. The positions must not
  // go beyond 65,535.
  virtual int DoScrollBy(SView* view, SSize distance, int scroll = 1);
  // Draws a part; with a null context it invalidates it.
  virtual void OnDrawSplitter(SDC* dc, SplitType type, const SRect& rect);
  // Inverts the tracker on the screen, which lies over the panes; called once to show it and once to hide it.
  virtual void OnInvertTracker(const SRect& rect);

  // --- creation ---

  using SWnd::Create;
  // Creates a dynamic splitter with one pane of the context's view class. `minPane` is the minimum of each row and
  // column; WS_HSCROLL and WS_VSCROLL in `style` ask for shared scroll bars with split boxes. Returns nonzero on
  // success; 0 for a number of rows or columns outside of 1 to 16, without a class, and when a window cannot be made.
  int Create(SWnd* parent, int maxRows, int maxColumns, SIZE minPane, SCreateContext* context,
             DWORD style = WS_CHILD | WS_VISIBLE | WS_HSCROLL | WS_VSCROLL, UINT id = kSPaneId);
  // Creates a static splitter, whose panes are then added. Returns as Create.
  int CreateStatic(SWnd* parent, int rows, int columns, DWORD style = WS_CHILD | WS_VISIBLE, UINT id = kSPaneId);
  // Makes a pane of a class, with the ideal size of its row and column; a negative number leaves the ideal size as it
  // is. The pane that fills the grid lays everything out. A null context is the one of Create. Returns the pane; null
  // for an invalid or occupied place, a class that is no window, and when the window cannot be made.
  SWnd* AddPane(int row, int column, SClassInfo* paneClass, SIZE size, SCreateContext* context = nullptr);
  // The same with a window that exists; another splitter or tab window gives it up. Returns it, or null.
  SWnd* AddPane(int row, int column, SWnd* window, SIZE size);

  // --- panes ---

  // The present size of the grid.
  int GetRowCount() const { return m_rowCount; }
  int GetColumnCount() const { return m_columnCount; }
  // The pane at a place; null for none.
  SWnd* GetPane(int row, int column) const;
  // Nonzero for a pane of this splitter, and its place. The numbers may be null.
  int IsChildPane(const SWnd* window, int* row = nullptr, int* column = nullptr) const;
  // The identifier of the pane at a place.
  static UINT IdFromRowCol(int row, int column) { return kSPaneId + static_cast<UINT>(row * kSMaxPanes + column); }

  // --- sizes: see SPaneInfo::Set; pixels, unless the ratio is kept. Call RecalcLayout afterwards. ---

  // Set the ideal size, the minimum and whether the bar behind is fixed; an invalid number is ignored.
  void SetRowInfo(int row, int ideal, int minimum, int fixed = 0);
  void SetColumnInfo(int column, int ideal, int minimum, int fixed = 0);
  // The current size, the minimum and whether the bar behind is fixed. The pointers may be null.
  void GetRowInfo(int row, int* current, int* minimum, int* fixed = nullptr) const;
  void GetColumnInfo(int column, int* current, int* minimum, int* fixed = nullptr) const;
  // Nonzero: the ideal sizes are shares of the space, so that all panes grow and shrink together.
  void SetKeepPaneRatio(int keep) { m_keepRatio = keep != 0; }
  int GetKeepPaneRatio() const { return m_keepRatio; }
  // Collapses the pane before a bar to nothing, or gives it its former size back. `bar` is a code of HitTest; 0 is
  // returned for others.
  int ToggleBar(int bar);

  // WS_HSCROLL and WS_VSCROLL. Set, scroll bars are made or destroyed and everything is laid out.
  DWORD GetScrollStyle() const { return m_scrollStyle; }
  void SetScrollStyle(DWORD style);
  // The scroll bar that a pane shares, for its GetScrollBarCtrl; null for none. `bar` is SB_HORZ or SB_VERT.
  SScrollBar* GetPaneScrollBar(const SWnd* pane, int bar) const;

  // The sizes as a line of text, independent of DPI and of the splitter's present size. They are the ideal ones, so
  // what is saved before the first layout is right as well.
  SString GetState() const;
  // Takes them back: a dynamic splitter makes and deletes rows and columns as needed. Returns 1; 0 and changes nothing
  // for a text that is invalid or belongs to another grid.
  int SetState(const SString& state);
  // What a screen reader or a test learns of the bars; the object must not outlive the window.
  std::unique_ptr<SAccessible> MakeAccessible();

  // The splitter itself, then, for identifiers from 0x8000 to 0xEFFF, its parent and the application.
  int OnCmdMsg(UINT id, int code, void* extra, S_CMDHANDLERINFO* info) override;
  int PreTranslateMessage(MSG* message) override;
  int PreCreateWindow(CREATESTRUCTW* create) override;
  // What neither a pane nor the splitter handles goes on to the parent.
  int OnCommand(WPARAM wParam, LPARAM lParam) override;
  int OnNotify(WPARAM wParam, LPARAM lParam, LRESULT* result) override;

 protected:
  // --- virtual functions ---

  // What lies at a point of the client area: one of kSHit...
  virtual int HitTest(SPoint point) const;
  // The tracker of a bar or split box, as it is before it is dragged; the limits within which its top left corner
  // may move are kept in m_limit.
  virtual void GetHitRect(int code, SRect* rect);
  // The area of the panes: the client area without the border and without the scroll bars.
  virtual void GetInsideRect(SRect* rect) const;
  // Draws the bars of panes that fill an area of this size.
  virtual void DrawAllSplitBars(SDC* dc, int insideWidth, int insideHeight);
  virtual void SetSplitCursor(int code);
  // Begins to drag what lies at the code. Does nothing for 0.
  virtual void StartTracking(int code);
  // Ends it; with `accept` the new place is taken.
  virtual void StopTracking(int accept);
  // Sizes a row so that the bar below it lies where the tracker's top is, and lays out.
  virtual void TrackRowSize(int y, int row);
  // The same for a column by the tracker's left.
  virtual void TrackColumnSize(int x, int column);

  int OnNcCreate(CREATESTRUCTW* create);
  void OnDestroy();
  void OnSize(UINT type, int width, int height);
  void OnPaint();
  int OnEraseBkgnd(SDC* dc);
  void OnLButtonDown(UINT flags, SPoint point);
  void OnLButtonDblClk(UINT flags, SPoint point);
  void OnLButtonUp(UINT flags, SPoint point);
  void OnMouseMove(UINT flags, SPoint point);
  int OnMouseWheel(UINT flags, short turn, SPoint point);
  int OnSetCursor(SWnd* window, UINT hit, UINT message);
  void OnKeyDown(UINT key, UINT repeat, UINT flags);
  void OnSetFocus(SWnd* oldFocus);
  void OnKillFocus(SWnd* newFocus);
  void OnCancelMode();
  void OnCaptureChanged(SWnd* window);
  void OnParentNotify(UINT message, LPARAM lParam);
  void OnHScroll(UINT code, UINT position, SScrollBar* bar);
  void OnVScroll(UINT code, UINT position, SScrollBar* bar);
  void OnSysCommand(UINT id, LPARAM lParam);
  void OnDisplayChange(UINT depth, int width, int height);
  void OnSysColorChange();
  LRESULT OnDpiChanged(WPARAM wParam, LPARAM lParam);
  LRESULT OnGetObject(WPARAM wParam, LPARAM lParam);

  // --- the geometry, pixels of the window's DPI; a derived class may set it before the window is created ---

  int m_barWidth = 7;      // the width of a split box and of an upright bar
  int m_barHeight = 7;     // the height of a split box and of a level bar
  int m_borderShareX = 0;  // how far a pane's own border reaches over the bars beside it
  int m_borderShareY = 0;  // the same for the bars above and below it
  int m_gapX = 7;          // between columns
  int m_gapY = 7;          // between rows
  int m_borderX = 2;       // inside the left and right edge of the client area
  int m_borderY = 2;       // inside its upper and lower edge

  int m_maxRows = 0;                  // the most rows; in a static splitter those of its grid
  int m_maxColumns = 0;               // the same for columns
  int m_rowCount = 0;                 // the present rows
  int m_columnCount = 0;              // the present columns
  DWORD m_scrollStyle = 0;            // WS_HSCROLL and WS_VSCROLL
  STableDumb<SPaneInfo> m_columns;    // sizes of the columns
  STableDumb<SPaneInfo> m_rows;       // sizes of the rows
  SClassInfo* m_paneClass = nullptr;  // of panes made on demand; null in a static splitter
  SCreateContext m_context;           // what they are made from

  int m_isTracking = 0;   // a drag is in progress
  int m_trackedCode = 0;  // of what
  SRect m_tracker;        // where the tracker is
  SRect m_limit;          // where its top left corner may be

  STableDumb<HWND> m_panes;  // those that AddPane added
  int m_keepRatio = 0;

  QXCORE_DECLARE_MESSAGE_MAP()

 private:
  friend class SPaneFocus;
  class Bars;  // the accessible object

  // --- the half of the fields that belongs to one direction: rows, or columns ---
  STableDumb<SPaneInfo>& Table(bool rows) { return rows ? m_rows : m_columns; }
  const STableDumb<SPaneInfo>& Table(bool rows) const { return rows ? m_rows : m_columns; }
  STableDumb<int>& OpenSizes(bool rows) { return rows ? m_openRows : m_openColumns; }
  int Count(bool rows) const { return rows ? m_rowCount : m_columnCount; }
  int Gap(bool rows) const { return rows ? m_gapY : m_gapX; }
  int Border(bool rows) const { return rows ? m_borderY : m_borderX; }
  int Thickness(bool rows) const { return rows ? m_barHeight : m_barWidth; }
  bool CanGrow(bool rows) const { return rows ? m_rowCount < m_maxRows : m_columnCount < m_maxColumns; }

  // --- creation and panes ---
  int CreateWindowOf(SWnd* parent, DWORD style, UINT id);
  void MakeGrid(int rows, int columns, SIZE minPane);
  bool IsPlace(int row, int column) const;
  SWnd* EnterPane(SWnd* pane, SIZE size, int row, int column);
  void ForgetPane(HWND pane);
  void MakeScrollBars();
  void DestroyScrollBars();

  // --- lines: a row or a column with its panes and its scroll bar ---
  int Split(bool rows, int before);
  bool InsertLine(bool rows, int at);
  void RemoveLine(bool rows, int at);
  void RenumberLine(bool rows, int from, int to);
  void DeleteLine(bool rows, int at);
  bool GrowTo(bool rows, int count);
  void ShrinkTo(bool rows, int count);
  bool SetGrid(int rows, int columns);

  // --- geometry ---
  int Metric(int index) const;
  struct Grid;
  Grid LaidOut() const;
  void MoveChildren(SDeferredMoves& moves, UINT firstId, UINT lastId, const Grid& grid);
  SRect ChildRect(UINT id, const Grid& grid) const;
  SRect PaneRect(int row, int column, const Grid& grid) const;
  SRect ScrollBarRect(bool rows, int at, const Grid& grid) const;
  SRect BoxRect(int code, const SRect& inside) const;
  SRect BarRect(int code, const SRect& inside) const;
  int TrackerThickness(bool rows) const;
  void ScaleTo(int dpi);
  void InvalidateBar(int code);

  // --- tracking ---
  void MoveTracker(SPoint topLeft);
  void TrackSize(bool rows, int bar, int place, int begin, int end);
  void MoveBarTo(bool rows, int bar, int size);

  // --- keyboard ---
  bool HasBar(int code) const;
  int NextBar(int code) const;
  void EnterBar(int code);
  void LeaveBars();
  void EndUse();
  void CancelBars();
  bool OnBarKey(UINT key);
  void OpenBar(int code);
  void StepBar(int code, UINT key);
  bool GoToNextPane(bool backward);

  void ScrollLine(bool columns, int line, UINT code, UINT position);
  int ScrollPaneBy(bool columns, int line, int distance, int scroll);

  int m_dpi = 96;
  int m_wheelTurn = 0;                                  // of the wheel, less than a notch
  SPoint m_grab;                                        // the pointer's place in the tracker
  SRect m_trackedFrom;                                  // the tracker when the drag began
  int m_keyboardBar = 0;                                // the bar that has the keyboard; 0 for none
  HWND m_lastActive = nullptr;                          // the pane that had the focus last
  STableDumb<SPaneInfo> m_columnsBefore, m_rowsBefore;  // when the keyboard came to the bars
  STableDumb<int> m_openColumns, m_openRows;            // ideal sizes of collapsed panes, 0 for others
};
