// Which classes of controls the system has.

#include "qxcore/platform/posix/controls/rich_edit.h"
#include "qxcore/platform/posix/window/class.h"
#include "qxcore/platform/posix/window/controls.h"
#include "qxcore/platform/win32/rich_edit.h"

namespace platform::model {

void AddControlClasses() {
  const HCURSOR arrow = LoadStandardCursor(IDC_ARROW);
  AddSystemClass(WTEXT("Static"), CS_DBLCLKS | CS_PARENTDC, &DefWindowProcW, 0, arrow, nullptr);
  for (const LPCWSTR name : {MSFTEDIT_CLASS, RICHEDIT_CLASSW})
    AddSystemClass(name, CS_DBLCLKS, &rich::RichEditProcedure, sizeof(LONG_PTR), arrow, nullptr);
}

}  // namespace platform::model

// The classes are there from the start.
void InitCommonControls() {}
BOOL InitCommonControlsEx(const INITCOMMONCONTROLSEX* classes) {
  return classes != nullptr && classes->dwSize == sizeof *classes;
}
