#include "qxcore/ui/frame/view.h"

#include "qxcore/graphics/window_dc.h"
#include "qxcore/ui/frame/frame.h"
#include "qxcore/ui/layout/shared_scroll_bar.h"
#include "qxcore/ui/window/message_entries.h"

QXCORE_IMPLEMENT_CLASS(SView, SWnd, 2)

QXCORE_IMPLEMENT_MESSAGE_MAP(SView, SWnd, on<WM_PAINT, &SView::OnPaint>(), on<WM_ERASEBKGND, &SView::OnEraseBkgnd>(),
                             on<WM_SETFOCUS, &SView::OnSetFocus>(), on<WM_MOUSEACTIVATE, &SView::OnMouseActivate>())

SView::~SView() {
  if (m_activeIn != nullptr) m_activeIn->m_activeView = nullptr;
}

void SView::PostNcDestroy() { delete this; }

int SView::Create(LPCWSTR className, LPCWSTR windowName, DWORD style, const SRect& rect, SWnd* parent, UINT id,
                  SCreateContext* context) {
  if (context != nullptr) m_document = context->m_document;
  return SWnd::Create(className, windowName, style, rect, parent, id, context);
}

int SView::OnCmdMsg(UINT id, int code, void* extra, S_CMDHANDLERINFO* info) {
  if (SWnd::OnCmdMsg(id, code, extra, info)) return 1;
  return m_document != nullptr && m_document->OnCmdMsg(id, code, extra, info);
}

int SView::PreCreateWindow(CREATESTRUCTW* create) {
  if (create->lpszClass == nullptr) {
    create->lpszClass = SRegisterWindowClass(CS_DBLCLKS | CS_HREDRAW | CS_VREDRAW, ::LoadCursorW(nullptr, IDC_ARROW),
                                             reinterpret_cast<HBRUSH>(static_cast<ULONG_PTR>(COLOR_WINDOW + 1)));
  }
  return SWnd::PreCreateWindow(create);
}

SScrollBar* SView::GetScrollBarCtrl(int bar) const { return SSharedScrollBar(this, bar); }

void SView::OnPaint() {
  SPaintDC dc(m_hWnd);
  if (dc.GetSafeHdc() != nullptr) OnDraw(&dc);
}

int SView::OnEraseBkgnd(SDC*) { return static_cast<int>(Default()); }

void SView::OnSetFocus(SWnd* oldFocus) {
  if (SFrameWnd* frame = GetParentFrame()) frame->SetActiveView(this);
  SWnd::OnSetFocus(oldFocus);
}

int SView::OnMouseActivate(SWnd* top, UINT hit, UINT message) {
  const int result = SWnd::OnMouseActivate(top, hit, message);
  if (result == MA_NOACTIVATE || result == MA_NOACTIVATEANDEAT) return result;
  if (SFrameWnd* frame = GetParentFrame()) frame->SetActiveView(this);
  return result;
}

void SView::OnActivateView(int activate, SView*, SView*) {
  if (activate && GetFocus() != this) SetFocus();
}
