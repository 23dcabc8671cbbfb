// SWnd: the object of one window.
//
// An object is bound to a window by Create, CreateEx, Attach or SubclassWindow, receives its messages through the
// message map of its class, and is bound until the window has got its last message, WM_NCDESTROY; then
// PostNcDestroy is called, as the last call that the object receives. FromHandle makes a temporary object for a
// window that no object is bound to; it belongs to the framework, does not own the window, and lives until the
// application's next idle time, or until the message that is being handled has been, whichever is later.
//
// A handler that throws: the exception is kept while the system's functions return, and every function here that
// can send a message throws it on; see docs/windows.md. Functions that only pass on a system call have its results
// and its last-error value; with an object that has no window they fail as the system does for a null handle.
//
// For the user-interface thread. Messages of another thread may be posted and sent to the window's handle.
#pragma once

#include "qxcore/graphics/rect.h"
#include "qxcore/string/string.h"
#include "qxcore/ui/window/command_target.h"

class SDC;
class SDockSiteFrameWnd;
class SFrameWnd;
class SHandleMap;
class SMenu;
class SScrollBar;
struct SCreateContext;

// Flags of RunModalLoop.
enum : DWORD {
  kSModalNoIdle = 1,      // no idle work while the loop waits
  kSModalShowOnIdle = 2,  // the window is shown when the queue is empty for the first time
};

class QXCORE_API SWnd : public SCmdTarget {
  QXCORE_DECLARE_CREATABLE_CLASS(SWnd)

 public:
  SWnd() = default;
  SWnd(const SWnd&) = delete;
  SWnd& operator=(const SWnd&) = delete;
  // Leaves the handle map and destroys the window, if there still is one. What a handler throws meanwhile is
  // kept for the next call of the library that can throw it.
  ~SWnd() override;

  // --- virtual functions; their order is part of the binary interface ---

  // Creates a child window with CreateEx: `style` gets WS_CHILD, `id` is its identifier. Returns nonzero when a
  // window was made.
  virtual int Create(LPCWSTR className, LPCWSTR windowName, DWORD style, const SRect& rect, SWnd* parent, UINT id,
                     SCreateContext* context = nullptr);
  // Destroys the window. Returns what the system's function does; 0 without a window.
  virtual int DestroyWindow();
  // Called by RunModalLoop before each round: 0 ends the loop. Here: until EndModalLoop.
  virtual int ContinueModal();
  // Ends the innermost running modal loop of this object, which then returns `result`.
  virtual void EndModalLoop(int result);
  // Sees a message for this window or one of its children before it is dispatched. Nonzero takes it. Here: 0.
  virtual int PreTranslateMessage(MSG* message);
  // Grows a client rectangle to that of the window. `adjust`: nonzero to leave room for scroll bars, too.
  virtual void CalcWindowRect(RECT* rect, UINT adjust = 0);
  // The window's text. Lengths count characters without the NUL. SetWindowTextW returns nonzero on success; the
  // getters return the length of the text; the second one cuts it to `capacity` - 1 characters.
  virtual int SetWindowTextW(LPCWSTR text);
  virtual int GetWindowTextW(SString* text) const;
  virtual int GetWindowTextW(LPWSTR buffer, int capacity) const;
  virtual int GetWindowTextLengthW() const;
  // A scroll bar control that stands in for the window's own bar (SB_HORZ or SB_VERT), or null. Here: null.
  virtual SScrollBar* GetScrollBarCtrl(int bar) const;
  // Exchanges data with the controls: nonzero takes them from the controls and checks them, 0 shows them.
  // Returns nonzero on success. Here nothing is exchanged, and 1 is returned.
  virtual int UpdateData(int saveAndValidate = 1);
  // Makes the window read-only or writable: an edit control by EM_SETREADONLY, others by disabling them.
  virtual void SetReadOnly(int readOnly);
  // Nonzero while the window is read-only.
  virtual int IsReadOnly() const;
  // Called when a modal state disables the window (1) or enables it again (0). To stay enabled, return 0 to
  // OnModalDisable(1). Here: 1.
  virtual int OnModalDisable(int disable);
  // The window procedure that all windows of the class had before; null when each object keeps its own.
  virtual WNDPROC GetSuperWndProc() const;
  // Receives the procedure that the window had before. Here it becomes the object's own.
  virtual void SetSuperWndProc(WNDPROC procedure);
  // Handles a message: OnWndMsg, or DefWindowProcW when that returns 0.
  virtual LRESULT WindowProc(UINT message, WPARAM wParam, LPARAM lParam);
  // Handles a message by OnCommand, OnNotify or the message map. Returns 0 when nothing handled it; otherwise
  // *result is the message's result.
  virtual int OnWndMsg(UINT message, WPARAM wParam, LPARAM lParam, LRESULT* result);
  // May change what the window is created with; 0 refuses the creation. Here: without a class name, the
  // framework's own class is used.
  virtual int PreCreateWindow(CREATESTRUCTW* create);
  // Handles WM_COMMAND: offers it to the control that sent it, then to OnCmdMsg. Nonzero when it was handled.
  virtual int OnCommand(WPARAM wParam, LPARAM lParam);
  // The same for WM_NOTIFY.
  virtual int OnNotify(WPARAM wParam, LPARAM lParam, LRESULT* result);
  // Passes a message to the window procedure that the window had before, else to the system's.
  virtual LRESULT DefWindowProcW(UINT message, WPARAM wParam, LPARAM lParam);
  // The last call that an object receives for its window, or for its failed creation; it may delete the object.
  virtual void PostNcDestroy();
  // Offers a control a message that it sent to its parent. Nonzero when it was handled.
  virtual int OnChildNotify(UINT message, WPARAM wParam, LPARAM lParam, LRESULT* result);
  // Called after WM_KILLFOCUS when the window still exists; `newFocus` may be null. Here: nothing.
  virtual int SafeOnKillFocus(SWnd* newFocus);

  // --- creation and binding ---

  // Creates a window and binds it. Returns 0 when PreCreateWindow refuses or the system fails. Throws what a handler
  // threw meanwhile, and SECOMException when the creation hook cannot be installed. In all these cases there is no
  // window, and PostNcDestroy has been called once.
  int CreateEx(DWORD exStyle, LPCWSTR className, LPCWSTR windowName, DWORD style, int x, int y, int width, int height,
               HWND parent, HMENU menu, void* param = nullptr);
  // Binds an existing window without seeing its messages; 0 for a null handle. The window is destroyed with the
  // object unless it is detached. Throws SEOutOfMemory.
  int Attach(HWND window);
  // Releases the window, which lives on. Returns its handle.
  HWND Detach();
  // Binds an existing window and receives its messages; 0 for a null handle.
  int SubclassWindow(HWND window);
  // The same for the child with this identifier, bound to `child`; 0 when there is no such child.
  int SubclassChild(int id, SWnd* child);
  HWND GetSafeHwnd() const;  // the handle; null for a null object pointer, too

  // The object of a window: the permanent one, else a temporary one; null for a null handle.
  static SWnd* FromHandle(HWND window);
  // The permanent object, or null.
  static SWnd* FromHandlePermanent(HWND window);
  // Destroys all temporary objects.
  static void DeleteTempMap();
  // The map of all windows' objects.
  static SHandleMap& HandleMap();

  // --- messages ---

  LRESULT Default();  // passes the message that is being handled to DefWindowProcW
  // Offers a notification to this control's own message map. Nonzero when it was handled.
  int ReflectChildNotify(UINT message, WPARAM wParam, LPARAM lParam, LRESULT* result);
  // Offers the message that is being handled to the control with this handle, when it has a permanent object.
  static int ReflectLastMsg(HWND control, LRESULT* result);
  // Offers a message to PreTranslateMessage of its window and then of the parents, up to `stop`; nonzero when one
  // took it. Windows without an object are passed over; the walk ends at a window that is no child.
  static int WalkPreTranslateTree(HWND stop, MSG* message);
  LRESULT SendMessageW(UINT message, WPARAM wParam = 0, LPARAM lParam = 0) const;
  int PostMessageW(UINT message, WPARAM wParam = 0, LPARAM lParam = 0) const;
  // Sends a message to all children, to theirs as well when `deep` is nonzero, and only to windows with a
  // permanent object when `onlyPermanent` is nonzero (it goes on below the others).
  void SendMessageToDescendants(UINT message, WPARAM wParam = 0, LPARAM lParam = 0, int deep = 1,
                                int onlyPermanent = 0);

  // Runs a message loop until EndModalLoop, ContinueModal's 0, the end of the window or a quit, which is posted
  // again for the loop around. `flags`: kSModal... Returns what EndModalLoop was given, -1 when it was not called.
  int RunModalLoop(DWORD flags = 0);
  int IsRunningModalLoop() const;  // nonzero while a modal loop of this object runs

  // --- the tree ---

  SWnd* GetParent() const;                      // the parent, else the owner, else null
  SWnd* GetTopLevelParent() const;              // the outermost window above this one, owners included
  SWnd* GetTopLevelOwner() const;               // the end of the chain of owners
  SFrameWnd* GetParentFrame() const;            // the nearest frame above this one, or null
  SDockSiteFrameWnd* GetTopLevelFrame() const;  // the outermost such frame, or null
  SWnd* GetDlgItem(int id) const;               // the child with this identifier; may be temporary
  int GetDlgCtrlID() const;                     // this window's identifier
  int SetDlgCtrlID(int id);                     // sets it; returns the old one
  SWnd* SetParent(SWnd* parent);                // returns the old parent
  int IsChild(const SWnd* window) const;

  // --- thin wrappers: one system call each ---

  DWORD GetStyle() const;
  DWORD GetExStyle() const;
  // Take style bits away and set others; `flags` other than 0 are passed to SetWindowPos so that the frame is drawn
  // anew. Return 0 when nothing changed.
  int ModifyStyle(DWORD remove, DWORD add, UINT flags = 0);
  int ModifyStyleEx(DWORD remove, DWORD add, UINT flags = 0);
  int EnableWindow(int enable = 1);  // nonzero when it was disabled
  int IsWindowEnabled() const;
  int IsWindowVisible() const;
  int IsIconic() const;
  int IsZoomed() const;
  int ShowWindow(int show);
  int UpdateWindow();
  int MoveWindow(const SRect& rect, int repaint = 1);
  int SetWindowPos(HWND after, int x, int y, int width, int height, UINT flags);
  SRect GetClientRect() const;
  SRect GetWindowRect() const;
  void Invalidate(int erase = 1);
  void InvalidateRect(const RECT* rect, int erase = 1);
  void ClientToScreen(POINT* point) const;
  void ClientToScreen(RECT* rect) const;
  void ScreenToClient(POINT* point) const;
  void ScreenToClient(RECT* rect) const;
  int MapWindowPoints(SWnd* to, POINT* points, UINT count) const;  // `to` null: to the screen
  SWnd* SetFocus();                                                // returns the window that had it
  static SWnd* GetFocus();
  SWnd* SetCapture();
  static SWnd* GetCapture();
  UINT_PTR SetTimer(UINT_PTR id, UINT milliseconds);
  int KillTimer(UINT_PTR id);
  void SetFont(HFONT font, int redraw = 1);
  HFONT GetFont() const;
  HMENU GetMenuHandle() const;  // the window's menu, or null
  int SetMenu(HMENU menu);      // the former menu is not destroyed
  // A message box over this window, by the interaction mode; see SMessageBox.
  int MessageBoxW(LPCWSTR text, LPCWSTR caption = nullptr, UINT type = 0);

  // Scrolling. `bar` is SB_HORZ or SB_VERT; a bar's own control, see GetScrollBarCtrl, takes its place.
  int GetScrollPos(int bar) const;
  int SetScrollPos(int bar, int position, int redraw = 1);  // returns the old position
  void GetScrollRange(int bar, int* low, int* high) const;
  void SetScrollRange(int bar, int low, int high, int redraw = 1);
  int GetScrollInfo(int bar, SCROLLINFO* info, UINT mask = SIF_ALL) const;
  int SetScrollInfo(int bar, SCROLLINFO* info, int redraw = 1);
  int GetScrollLimit(int bar) const;  // the last position that a user can reach
  void ScrollWindow(int x, int y, const RECT* rect = nullptr, const RECT* clip = nullptr);
  int EnableScrollBar(int bar, UINT arrows = ESB_ENABLE_BOTH);
  void EnableScrollBarCtrl(int bar, int enable = 1);  // shows or hides the bar; a control is enabled or disabled
  int ShowScrollBar(int bar, int show = 1);

  void CreateSolidCaret(int width, int height);
  void CreateGrayCaret(int width, int height);
  void ShowCaret();
  void HideCaret();
  static void SetCaretPos(const POINT& point);
  void DragAcceptFiles(int accept = 1);  // whether files dropped on the window come as WM_DROPFILES

 protected:
  // --- handlers of the base message map; most pass the message on with Default() ---

  void OnActivate(UINT state, SWnd* other, int minimized);
  void OnActivateApp(int active, DWORD thread);
  void OnCancelMode();
  void OnClose();
  int OnCreate(CREATESTRUCTW* create);
  void OnDestroy();
  void OnEnable(int enable);
  void OnEndSession(int ending);
  int OnQueryEndSession();
  void OnEnterIdle(UINT why, SWnd* who);
  int OnHelpInfo(HELPINFO* info);
  void OnInitMenuPopup(SMenu* menu, UINT index, int isSystemMenu);
  void OnKillFocus(SWnd* newFocus);
  void OnMenuSelect(UINT id, UINT flags, HMENU menu);
  int OnMouseActivate(SWnd* top, UINT hit, UINT message);
  int OnNcActivate(int active);
  int OnNcCalcSize(int calcValid, NCCALCSIZE_PARAMS* sizes);
  int OnNcCreate(CREATESTRUCTW* create);
  void OnNcDestroy();
  LRESULT OnNcHitTest(SPoint point);
  void OnNcButton(UINT hit, SPoint point);  // all buttons on the non-client area
  void OnNcMouseMove(UINT hit, SPoint point);
  void OnNcPaint();
  void OnParentNotify(UINT message, LPARAM lParam);
  void OnSetFocus(SWnd* oldFocus);
  void OnShowWindow(int show, UINT why);
  void OnSysCommand(UINT id, LPARAM lParam);
  void OnDisplayChange(UINT depth, int width, int height);
  // A top-level window reads the interface's metrics again and passes the change to its descendants.
  void OnSysColorChange();
  LRESULT OnDpiChanged(WPARAM wParam, LPARAM lParam);
  // For a class whose sizes follow the DPI, as the handler of WM_DPICHANGED_AFTERPARENT: below a window that is not the
  // library's, sends the window the WM_DPICHANGED that nobody else passes on.
  LRESULT OnDpiChangedAfterParent(WPARAM wParam, LPARAM lParam);
  void OnSettingChange(UINT what, LPCWSTR area);
  void OnFontChange();
  void OnThemeChanged();
  void OnTimeChange();
  // Offered to the control that they are about, then passed on.
  void OnDrawItem(int id, DRAWITEMSTRUCT* item);
  void OnMeasureItem(int id, MEASUREITEMSTRUCT* item);
  void OnDeleteItem(int id, DELETEITEMSTRUCT* item);
  int OnCompareItem(int id, COMPAREITEMSTRUCT* item);
  int OnVKeyToItem(UINT key, SWnd* list, UINT index);
  int OnCharToItem(UINT key, SWnd* list, UINT index);
  void OnHScroll(UINT code, UINT position, SScrollBar* bar);
  void OnVScroll(UINT code, UINT position, SScrollBar* bar);

  QXCORE_DECLARE_MESSAGE_MAP()

 public:
  HWND m_hWnd = nullptr;  // null while unattached

 protected:
  WNDPROC m_superWndProc = nullptr;  // the procedure of a window that had one of its own

 private:
  friend struct SWindowCreation;
  int CallMapped(const SMsgEntry& entry, WPARAM wParam, LPARAM lParam, LRESULT* result);
  void LeaveHandleMap();
  int DestroyUnowned(HWND window);
  void PassOnAppearance(int dpi = 0);
};

static_assert(sizeof(void*) != 4 || sizeof(SWnd) == 12, "the layout is public");

// Registers a window class of the framework's procedure with these attributes, once, and returns its name, which
// lives as long as the process. Throws SECOMException when the system refuses it.
QXCORE_API LPCWSTR SRegisterWindowClass(UINT classStyle, HCURSOR cursor = nullptr, HBRUSH background = nullptr,
                                        HICON icon = nullptr);

// The window procedure of all windows that the framework owns.
QXCORE_API LRESULT CALLBACK SWindowProcedure(HWND window, UINT message, WPARAM wParam, LPARAM lParam);
