// Which classes of controls the system has.

#include "qxcore/platform/posix/window/class.h"
#include "qxcore/platform/posix/window/controls.h"

namespace platform::model {

void AddControlClasses() {
  const HCURSOR arrow = LoadStandardCursor(IDC_ARROW);
  AddSystemClass(WTEXT("Static"), CS_DBLCLKS | CS_PARENTDC, &DefWindowProcW, 0, arrow, nullptr);
}

}  // namespace platform::model
