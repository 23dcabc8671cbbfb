// Which classes of controls the system has.

#include "qxcore/platform/posix/controls/control.h"
#include "qxcore/platform/posix/controls/painting.h"
#include "qxcore/platform/posix/controls/rich_edit.h"
#include "qxcore/platform/posix/window/class.h"
#include "qxcore/platform/posix/window/controls.h"
#include "qxcore/platform/posix/window/send.h"
#include "qxcore/platform/win32/rich_edit.h"

namespace platform::controls {

void NotifyCommand(HWND control, UINT code) {
  model::Send(GetParent(control), WM_COMMAND, MAKEWPARAM(GetDlgCtrlID(control), code),
              reinterpret_cast<LPARAM>(control));
}

}  // namespace platform::controls

namespace platform::model {

void AddControlClasses() {
  using namespace platform::controls;
  InstallPainter();
  const HCURSOR arrow = LoadStandardCursor(IDC_ARROW), beam = LoadStandardCursor(IDC_IBEAM);
  constexpr int kState = sizeof(LONG_PTR);
  constexpr UINT kRedraws = CS_DBLCLKS | CS_VREDRAW | CS_HREDRAW;
  const auto face = reinterpret_cast<HBRUSH>(static_cast<ULONG_PTR>(COLOR_3DFACE + 1));
  AddSystemClass(WTEXT("Button"), kRedraws | CS_PARENTDC, &ButtonProcedure, kState, arrow, nullptr);
  AddSystemClass(WTEXT("Static"), kRedraws | CS_PARENTDC, &StaticProcedure, kState, arrow, nullptr);
  AddSystemClass(WTEXT("Edit"), CS_DBLCLKS | CS_PARENTDC, &EditProcedure, kState, beam, nullptr);
  AddSystemClass(WTEXT("ScrollBar"), kRedraws | CS_PARENTDC, &ScrollBarProcedure, kState, arrow, nullptr);
  for (const LPCWSTR name : {MSFTEDIT_CLASS, RICHEDIT_CLASSW})
    AddSystemClass(name, CS_DBLCLKS, &rich::RichEditProcedure, sizeof(LONG_PTR), arrow, nullptr);
  AddSystemClass(PROGRESS_CLASSW, CS_GLOBALCLASS | CS_HREDRAW | CS_VREDRAW, &ProgressProcedure, kRecordBytes, arrow,
                 nullptr);
  AddSystemClass(STATUSCLASSNAMEW, CS_GLOBALCLASS | CS_DBLCLKS | CS_VREDRAW, &StatusBarProcedure, kRecordBytes, arrow,
                 face);
}

}  // namespace platform::model

// The classes are there from the start.
void InitCommonControls() {}
BOOL InitCommonControlsEx(const INITCOMMONCONTROLSEX* classes) {
  if (classes != nullptr && classes->dwSize == sizeof *classes) return TRUE;
  return platform::model::Fail(ERROR_INVALID_PARAMETER);
}
