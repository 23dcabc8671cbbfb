#include "qxcore/ui/frame/dialog.h"

#include "qxcore/ui/app/application.h"
#include "qxcore/ui/app/interaction_mode.h"
#include "qxcore/ui/app/modal_state.h"
#include "qxcore/ui/frame/data_exchange.h"
#include "qxcore/ui/frame/internal/dialog_template.h"
#include "qxcore/ui/window/internal/creation.h"
#include "qxcore/ui/window/internal/modal_loop.h"
#include "qxcore/ui/window/internal/resources.h"
#include "qxcore/ui/window/internal/route_up.h"
#include "qxcore/ui/window/message_entries.h"
#include "qxcore/ui/window/thread_state.h"

QXCORE_IMPLEMENT_CLASS(SDlg, SWnd, 2)

QXCORE_IMPLEMENT_MESSAGE_MAP(SDlg, SWnd, command<IDOK, &SDlg::OnOK>(), command<IDCANCEL, &SDlg::OnCancel>())

SDlg::~SDlg() = default;

void SDlg::PreInitDialog() {}

int SDlg::OnInitDialog() {
  UpdateData(0);
  return 1;
}

void SDlg::DoDataExchange(SDataExchange*) {}

void SDlg::OnOK() {
  if (UpdateData(1)) EndDialog(IDOK);
}

void SDlg::OnCancel() { EndDialog(IDCANCEL); }

// A second answer to a modal box changes nothing: its loop destroys it.
void SDlg::EndDialog(int result) {
  if (SModalLoop::Exists(this)) {
    EndModalLoop(result);
  } else {
    DestroyWindow();
  }
}

int SDlg::UpdateData(int saveAndValidate) {
  SDataExchange exchange(this, saveAndValidate);
  try {
    DoDataExchange(&exchange);
  } catch (const SDataExchangeFailed&) {
    return 0;
  }
  return 1;
}

// --- making the box ---

static const void* FindTemplate(LPCWSTR name) { return SFindResource(name, MAKEINTRESOURCEW(5)); }

int SDlg::CreateDlg(LPCWSTR templateName, SWnd* parent) {
  return CreateDlgIndirect(FindTemplate(templateName), parent);
}

// The messages go to the object; the dialog's own procedure leaves all to the system's class.
static INT_PTR CALLBACK LeaveToClass(HWND, UINT, WPARAM, LPARAM) { return FALSE; }

int SDlg::CreateDlgIndirect(const void* dialogTemplate, SWnd* parent) {
  if (dialogTemplate == nullptr) return 0;
  if (parent == nullptr) parent = SGetOwnerWnd();
  return SWindowCreation::Run(this, [=] {
    return ::CreateDialogIndirectParamW(SGetInstance(), static_cast<const DLGTEMPLATE*>(dialogTemplate),
                                        parent->GetSafeHwnd(), &LeaveToClass, 0);
  });
}

LRESULT SDlg::HandleInitDialog(WPARAM wParam, LPARAM lParam) {
  const HWND window = m_hWnd;
  PreInitDialog();
  const LRESULT result = OnInitDialog();
  const DLGPROC next = SWndThreadState::Get().m_dialogHook;
  if (next != nullptr) next(window, WM_INITDIALOG, wParam, lParam);
  return result;
}

// --- the modal box ---

namespace {

// Destroys the box when its loop has ended, however that came.
struct ModalBox {
  ModalBox() = default;
  ModalBox(const ModalBox&) = delete;
  ModalBox& operator=(const ModalBox&) = delete;
  ~ModalBox() {
    if (::IsWindow(window)) ::DestroyWindow(window);
  }
  HWND window = nullptr;
};

}  // namespace

// The loop is announced before the box is made, so that OnInitDialog can end it. The owner is enabled before the box
// goes, so that it gets the activation.
int SDlg::DoModal() {
  const void* dialogTemplate = m_template != nullptr ? m_template : FindTemplate(m_templateName);
  if (dialogTemplate == nullptr) return -1;
  if (!SIsInteractive()) g_ThrowAbortOnDlg(SDialogTemplateCaption(dialogTemplate), SString());
  int result = -1;
  {
    ModalBox box;
    SModalState modal(1);
    SModalLoop loop(this);
    if (!CreateDlgIndirect(dialogTemplate, m_parent)) return -1;
    box.window = m_hWnd;
    result = loop.Run(kSModalShowOnIdle);
    modal.Stop();
  }
  SWndThreadState::Get().ThrowException();
  return result;
}

int SDlg::PreTranslateMessage(MSG* message) { return m_hWnd != nullptr && SSent(::IsDialogMessageW(m_hWnd, message)); }

int SDlg::OnCmdMsg(UINT id, int code, void* extra, S_CMDHANDLERINFO* info) {
  return SWnd::OnCmdMsg(id, code, extra, info) || SRouteUp(*this, id, code, extra, info);
}
