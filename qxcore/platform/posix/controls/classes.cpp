// Which classes of controls the system has.

#include "qxcore/platform/posix/controls/painting.h"
#include "qxcore/platform/posix/controls/rich_edit.h"
#include "qxcore/platform/posix/window/class.h"
#include "qxcore/platform/posix/window/controls.h"
#include "qxcore/platform/win32/rich_edit.h"

namespace platform::model {

void AddControlClasses() {
  using namespace platform::controls;
  InstallPainter();
  const HCURSOR arrow = LoadStandardCursor(IDC_ARROW), beam = LoadStandardCursor(IDC_IBEAM);
  constexpr UINT kRedraws = CS_DBLCLKS | CS_VREDRAW | CS_HREDRAW;
  const auto face = reinterpret_cast<HBRUSH>(static_cast<ULONG_PTR>(COLOR_3DFACE + 1));
  AddSystemClass(WTEXT("Button"), kRedraws | CS_PARENTDC, &ButtonProcedure, kStateBytes, arrow, nullptr);
  AddSystemClass(WTEXT("Static"), kRedraws | CS_PARENTDC, &StaticProcedure, kStateBytes, arrow, nullptr);
  AddSystemClass(WTEXT("Edit"), CS_DBLCLKS | CS_PARENTDC, &EditProcedure, kStateBytes, beam, nullptr);
  AddSystemClass(WTEXT("ScrollBar"), kRedraws | CS_PARENTDC, &ScrollBarProcedure, kStateBytes, arrow, nullptr);
  for (const LPCWSTR name : {MSFTEDIT_CLASS, RICHEDIT_CLASSW})
    AddSystemClass(name, CS_DBLCLKS, &rich::RichEditProcedure, kStateBytes, arrow, nullptr);
  AddSystemClass(PROGRESS_CLASSW, CS_GLOBALCLASS | CS_HREDRAW | CS_VREDRAW, &ProgressProcedure, kStateBytes, arrow,
                 nullptr);
  AddSystemClass(STATUSCLASSNAMEW, CS_GLOBALCLASS | CS_DBLCLKS | CS_VREDRAW, &StatusBarProcedure, kStateBytes, arrow,
                 face);
}

}  // namespace platform::model

// The classes are there from the start.
void InitCommonControls() {}
BOOL InitCommonControlsEx(const INITCOMMONCONTROLSEX* classes) {
  if (classes != nullptr && classes->dwSize == sizeof *classes) return TRUE;
  return platform::model::Fail(ERROR_INVALID_PARAMETER);
}
