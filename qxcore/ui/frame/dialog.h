// SDlg: a dialog box made from a template, modal or modeless.
//
// DoModal shows the box, waits for the user and returns the identifier of the button; in a mode in which nobody is
// there it throws an STargetedException that names the box instead (see interaction_mode.h). The template comes from
// the resources, by name or MAKEINTRESOURCEW number, or from memory in the published binary layout.
// For the user-interface thread.
#pragma once

#include "qxcore/ui/window/window.h"

class SDataExchange;
class SModalState;

class QXCORE_API SDlg : public SWnd {
  QXCORE_DECLARE_CLASS(SDlg)

 public:
  // For a modeless box, see CreateDlg.
  SDlg() = default;
  // With the template of DoModal by name; a null parent is the application's owner window.
  explicit SDlg(LPCWSTR templateName, SWnd* parent = nullptr) : m_templateName(templateName), m_parent(parent) {}
  ~SDlg() override;

  // Makes the template of DoModal one in memory, which must live as long as it is used.
  void SetTemplate(const void* dialogTemplate) { m_template = dialogTemplate; }

  // --- virtual functions; they continue the list of SWnd ---

  // Shows the box until EndDialog. Returns what that was given, -1 when the box could not be made. Throws what a
  // handler threw, and an STargetedException where nobody is there to answer.
  virtual int DoModal();
  // Called before OnInitDialog, when the controls exist. Here: nothing.
  virtual void PreInitDialog();
  // Fills the controls; nonzero lets the system choose the control with the focus. Here: UpdateData(0), and 1. An
  // exception ends the box and is thrown on by DoModal or CreateDlg.
  virtual int OnInitDialog();
  // The default button: UpdateData(1), and when it succeeds EndDialog(IDOK).
  virtual void OnOK();
  // Escape, the close button, and the button with IDCANCEL: EndDialog(IDCANCEL).
  virtual void OnCancel();
  // Exchanges data with the controls; see data_exchange.h. Here: nothing.
  virtual void DoDataExchange(SDataExchange* exchange);

  // Makes a modeless box, which is shown if its template says so. Nonzero on success.
  int CreateDlg(LPCWSTR templateName, SWnd* parent = nullptr);
  int CreateDlgIndirect(const void* dialogTemplate, SWnd* parent = nullptr);
  // Ends DoModal with a result, also from OnInitDialog, when the box is not shown at all. The first call counts. A
  // modeless box is destroyed.
  void EndDialog(int result);

  int UpdateData(int saveAndValidate = 1) override;
  // The box itself, then, for identifiers from 0x8000 to 0xEFFF, its owner and the application.
  int OnCmdMsg(UINT id, int code, void* extra, S_CMDHANDLERINFO* info) override;
  int PreTranslateMessage(MSG* message) override;

  // The work of WM_INITDIALOG, called by the window procedure.
  LRESULT HandleInitDialog(WPARAM wParam, LPARAM lParam);

 protected:
  QXCORE_DECLARE_MESSAGE_MAP()

 private:
  LPCWSTR m_templateName = nullptr;  // not owned
  const void* m_template = nullptr;  // not owned; comes before the name
  SWnd* m_parent = nullptr;          // not owned
};
