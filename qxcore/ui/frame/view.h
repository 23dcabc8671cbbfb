// SView: a child window that shows something; derive from it and override OnDraw.
//
// A click makes a view the active one of its frame, which then offers it all commands first; the view passes those that
// it does not handle on to what it shows. A view is made with new, usually by a frame from an SCreateContext, and
// deletes itself with its window. For the user-interface thread.
#pragma once

#include "qxcore/ui/frame/create_context.h"
#include "qxcore/ui/window/window.h"

class QXCORE_API SView : public SWnd {
  QXCORE_DECLARE_CLASS(SView)

 public:
  SView() = default;
  ~SView() override;

  using SWnd::Create;
  // Creates the window as SWnd does; the view shows the context's document, if there is a context.
  int Create(LPCWSTR className, LPCWSTR windowName, DWORD style, const SRect& rect, SWnd* parent, UINT id,
             SCreateContext* context = nullptr) override;
  int PreCreateWindow(CREATESTRUCTW* create) override;
  // The view itself, then what it shows.
  int OnCmdMsg(UINT id, int code, void* extra, S_CMDHANDLERINFO* info) override;
  // The scroll bar that a splitter or tab window around the view shares with it; null if nothing shares one.
  SScrollBar* GetScrollBarCtrl(int bar) const override;

  // What the view shows, or null. It is not owned and must live as long as the view or until another one is set.
  SCmdTarget* GetDocument() const { return m_document; }
  void SetDocument(SCmdTarget* document) { m_document = document; }

  // Draws the view. The context's clip region is what must be drawn.
  virtual void OnDraw(SDC* dc) = 0;
  // Called when the view becomes (1) or ceases to be (0) its frame's active one. Here it takes the focus.
  virtual void OnActivateView(int activate, SView* active, SView* former);

 protected:
  void PostNcDestroy() override;  // deletes the view

  // Handlers of the view's messages; a derived class's own call them.
  void OnPaint();
  int OnEraseBkgnd(SDC* dc);
  void OnSetFocus(SWnd* oldFocus);
  int OnMouseActivate(SWnd* top, UINT hit, UINT message);

  QXCORE_DECLARE_MESSAGE_MAP()

 private:
  friend class SFrameWnd;
  SCmdTarget* m_document = nullptr;
  SFrameWnd* m_activeIn = nullptr;  // the frame whose active view this is, or null
};
