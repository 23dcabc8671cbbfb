// SFrameWnd: a frame window with a menu, accelerators, and a view that fills its client area.
//
// Commands go to the active view, then to the frame, then to the application. A frame is made with new and deletes
// itself with its window. The identifier of its client is kSFirstPane; control bars take their strips first, see
// RecalcLayout. For the user-interface thread.
#pragma once

#include "qxcore/ui/bar/size_parent.h"
#include "qxcore/ui/frame/create_context.h"
#include "qxcore/ui/window/window.h"

class SView;

// The identifier of the child that fills the client area.
inline constexpr UINT kSFirstPane = 0xE900;

// A frame window; see above.
class QXCORE_API SFrameWnd : public SWnd {
  QXCORE_DECLARE_CREATABLE_CLASS(SFrameWnd)

 public:
  SFrameWnd() = default;
  ~SFrameWnd() override;

  // --- virtual functions; they continue the list of SWnd ---

  // Loads the accelerators of the frame from the resources; 0 when the resources have none of this name.
  virtual int LoadAccelTable(LPCWSTR name);
  // The frame that is active; here this one.
  virtual SFrameWnd* GetActiveFrame();
  // Shows the frame and brings it to the top; `show` is a SW_ number, -1 the usual one.
  virtual void ActivateFrame(int show = -1);
  // The accelerators that are in force; here those of LoadAccelTable. They stay the frame's.
  virtual HACCEL GetDefaultAccelerator();
  // Makes what fills the client area, when the frame is created; 0 ends the creation. Here: the context's view.
  virtual int OnCreateClient(CREATESTRUCTW* create, SCreateContext* context);
  // Lays out the bars and the client; called when the size changes. Does nothing while it runs already.
  virtual void RecalcLayout();

  using SWnd::Create;
  // Creates the frame. A null class name is the framework's own class; `rect` may be m_rcDefault; the menu is loaded
  // by name from the resources; with a null name the frame has no menu. Returns nonzero on success; else PostNcDestroy
  // has been called, which deletes the object.
  int Create(LPCWSTR className, LPCWSTR title, DWORD style = WS_OVERLAPPEDWINDOW, const SRect& rect = m_rcDefault,
             SWnd* parent = nullptr, LPCWSTR menuName = nullptr, DWORD exStyle = 0, SCreateContext* context = nullptr);
  // Makes a view of the context's class as a child; null on failure. The first view becomes the active one.
  SWnd* CreateView(SCreateContext* context, UINT id = kSFirstPane);
  // The work of OnCreate: -1 ends the creation.
  int OnCreateHelper(CREATESTRUCTW* create, SCreateContext* context);

  SView* GetActiveView() const { return m_activeView; }  // null while no view is active
  // Makes a view of this frame, or null, the active one; with `notify` both views are told.
  void SetActiveView(SView* view, int notify = 1);
  // Takes over an accelerator table instead of loading one; the former one is destroyed.
  void SetAccelTable(HACCEL table);

  int OnCmdMsg(UINT id, int code, void* extra, S_CMDHANDLERINFO* info) override;
  int PreTranslateMessage(MSG* message) override;
  int PreCreateWindow(CREATESTRUCTW* create) override;
  int OnWndMsg(UINT message, WPARAM wParam, LPARAM lParam, LRESULT* result) override;

  static const SRect m_rcDefault;  // lets the system choose place and size

 protected:
  void PostNcDestroy() override;  // deletes the frame

  void OnSetFocus(SWnd* oldFocus);
  int OnCreate(CREATESTRUCTW* create);
  int OnEraseBkgnd(SDC* dc);
  void OnHScroll(UINT code, UINT position, SScrollBar* bar);
  void OnVScroll(UINT code, UINT position, SScrollBar* bar);
  int OnSetCursor(SWnd* window, UINT hit, UINT message);
  LRESULT OnRegMouseWheel(WPARAM wParam, LPARAM lParam);

  QXCORE_DECLARE_MESSAGE_MAP()

 private:
  friend class SView;
  bool PassToView();

  SView* m_activeView = nullptr;  // not owned
  HACCEL m_accelerators = nullptr;
  bool m_isInLayout = false;
};
